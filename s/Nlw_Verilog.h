// The Verilog netlist writer object: the host constructs it and calls
// WriteDesign once per design.
#pragma once

#include "framework/Nlw_NetlistWriter.h"

class Nlw_Writer;
struct Nlw_MhfFiles;

class Nlw_Verilog : public Nlw_NetlistWriter {
public:
    Nlw_Verilog();
    explicit Nlw_Verilog(const char* applicationName);
    Nlw_Verilog(const Nlw_Verilog& other);
    Nlw_Verilog& operator=(const Nlw_Verilog& other);
    ~Nlw_Verilog() override;

    HelpFunction GetHelp() override;
    const char** GetReservedWords() override;
    unsigned char IsEscaped(const char* name) override;
    // The results of Escape, GetRangeString and GetIndexesString live in one
    // process-wide buffer per operation: a result stays valid until the same
    // operation is called again.
    const char* Escape(const char* name, unsigned char isBused) override;
    const char* GetRangeString(Nlw_NlBus* bus) override;
    const char* GetIndexesString(DARRAY_Util_INT32* indexes) override;
    void WriteDesign() override;
    void WriteHeader(Nlw_Writer* writer) override;
    unsigned char AddIfSimulatableProperty(Nlw_NlBlock* block, Vdm_Property* property,
                                           Vdm_Property* list) override;

    static void Help();
    [[noreturn]] static void TesselHelp();

    // The character rule of a simple Verilog identifier: letters and the
    // underscore anywhere, digits and the dollar sign anywhere but first.
    // Bytes above 127 are never part of one.
    static bool IsSimpleIdentifierChar(unsigned char c, bool first) {
        if ((c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || c == '_') return true;
        return !first && ((c >= '0' && c <= '9') || c == '$');
    }

    static const char* const kQdb2verSynopsis;
    static const char* const kTesselSynopsis;

private:
    // Lets the unit tests reach the private drivers and header blocks.
    friend struct Nlw_VerilogTestPeer;

    void WriteSdfFile();
    void WriteSdfMHFile();
    void WritePinFile();
    void WriteVerilogTestFile();
    void WriteAssertionFile();
    void WriteVerilogMHFile();
    void WriteChipwideFile();
    void WriteISMFile();
    void WriteMHFInfoFile();
    void WriteVerilogFile();
    void WritePcsFile();
    void PrintInfoMessage();
    void WriteSimHeader(Nlw_Writer* writer);
    void WriteEcnHeader(Nlw_Writer* writer);
    void WriteStaHeader(Nlw_Writer* writer);
    void WriteParams(Nlw_Writer* writer);
    bool IsChipwideNeeded();
    void IssueChipwideNotice();

    // Output file names, all derived from the netlist file name.
    const char* GetOutputName() const;
    std::string GetOutputRoot() const;
    std::string GetOutputDirectory() const;
    std::string GetRootFileName(const char* suffix) const;
    std::string GetSdfFileName() const;
    std::string GetSdfMHPrefix() const;
    std::string GetAssertionFileName() const;
    std::string GetMHNetlistFileName(const Nlw_NlBlock* block) const;
    std::string GetSdfMHFileName(const Nlw_NlBlock* block) const;
    bool GetWritesSdf() const;
    Nlw_MhfFiles GetMHFiles() const;
    const char* GetDesignName() const;
};
