// The Verilog netlist writer object: the host constructs it and calls
// WriteDesign once per design.
#pragma once

#include "../host/Nlw_NetlistWriter.h"

class Nlw_Writer;

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
    const char* Escape(const char* name, unsigned char isBused) override;
    const char* GetRangeString(Nlw_NlBus* bus) override;
    const char* GetIndexesString(DARRAY_Util_INT32* indexes) override;
    void WriteDesign() override;
    void WriteHeader(Nlw_Writer* writer) override;
    unsigned char AddIfSimulatableProperty(Nlw_NlBlock* block, Vdm_Property* property,
                                           Vdm_Property* list) override;

    static void Help();
    [[noreturn]] static void TesselHelp();

    static const char* const kQdb2verSynopsis;
    static const char* const kTesselSynopsis;

private:
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
};
