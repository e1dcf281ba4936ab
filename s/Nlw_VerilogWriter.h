// Writes one Verilog netlist file: preamble, cell models, module
// definitions, chipwide module.
#pragma once

#include <map>
#include <string>
#include <unordered_set>

#include "../host/Nlw_NetlistWriter.h"
#include "../host/Nlw_Writer.h"

// Case-insensitive hashing and equality of property names.
struct Nlw_ICaseHash {
    size_t operator()(const Port::String& s) const;
};
struct Nlw_ICaseEqual {
    bool operator()(const Port::String& a, const Port::String& b) const;
};

class Nlw_VerilogWriter : public Nlw_Writer {
public:
    Nlw_VerilogWriter(Nlw_NetlistWriter* nlw, const char* fileName, Port::Stream::Access access);
    Nlw_VerilogWriter(const Nlw_VerilogWriter& other);
    Nlw_VerilogWriter& operator=(const Nlw_VerilogWriter& other);
    ~Nlw_VerilogWriter() override;

    void WriteView(Nlw_NlView* view, unsigned char flag) override;
    void WriteBlock(Nlw_NlBlock* block) override;
    unsigned char IsExternalProperty(Vdm_Property* property, Nlw_NlBlock* block) override;
    using Nlw_Writer::IsExternalProperty;

    void WriteMHBlock(Nlw_NlBlock* block);
    void WriteChipwideModule();
    void WriteMHHeader(Nlw_NlBlock* block);

    void WriteModuleHeader(Nlw_NlBlock* block);
    void WriteModuleBody(Nlw_NlBlock* block);
    void WriteModuleEnd(Nlw_NlBlock* block);

    // Parameter emission.
    void WriteInlineParamStatements(Nlw_NlBlock* block);
    void WriteExternalProperties(Vdm_Property* list, Nlw_NlBlock* block);
    void WriteDefparamStatements(Nlw_NlBlock* block);

    // Read access for tests.
    const std::multimap<Port::String, Port::String>& GetBigEndingTimcellMap() const {
        return bigEndingTimcellMap_;
    }
    const std::multimap<Port::String, Port::String>& GetRecursiveInclusionMap() const {
        return recursiveInclusionMap_;
    }
    bool IsHexStringProperty(Vdm_Property* property, Nlw_NlBlock* block);
    bool IsBitStringProperty(Vdm_Property* property, Nlw_NlBlock* block);

private:
    using NameSet = std::unordered_set<Port::String, Nlw_ICaseHash, Nlw_ICaseEqual>;

    // Preamble.
    void WriteNewHeader(Nlw_NlBlock* block);
    void WriteLibrarySearch(const char* libraryName);
    void WriteSdfAnnotate(Nlw_NlBlock* block);
    // Ports, wires, instances.
    void WriteModulePortList(Nlw_NlBlock* block);
    void WriteIOPortDeclarations(Nlw_NlBlock* block);
    void WriteWireDeclarations(Nlw_NlBlock* block);
    void WriteWireAssignments(Nlw_NlBlock* block);
    void WriteComponentInstantiationStatements(Nlw_NlBlock* block);
    void WritePortMaps(Nlw_NlBlock* instance);
    // Tables.
    void InitHexStringPropertyTable();
    void InitBitStringPropertyTable();
    void InitBigEndingTimcellMap();
    void InitRecursiveInclusionMap();
    bool IsStringPropertyOfKind(Vdm_Property* property, Nlw_NlBlock* block, const char* marker,
                                const NameSet& table);
    // Cell models.
    void WriteIsmList(Nlw_NlBlock* block, UT_NCH_CACHE& cache);

    NameSet hexStringPropertyTable_;
    NameSet bitStringPropertyTable_;
    std::multimap<Port::String, Port::String> bigEndingTimcellMap_;
    std::multimap<Port::String, Port::String> recursiveInclusionMap_;
};
