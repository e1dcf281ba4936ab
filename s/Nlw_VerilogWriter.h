// Writes one Verilog netlist file: preamble, cell models, module
// definitions, chipwide module.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <unordered_set>
#include <vector>

#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Writer.h"

// Case-insensitive hashing and equality of property names.
struct Nlw_ICaseHash {
    size_t operator()(const Port::String& s) const;
};
struct Nlw_ICaseEqual {
    bool operator()(const Port::String& a, const Port::String& b) const;
};
// Case-insensitive ordering that can be asked with a plain C string, so a
// lookup by a block's type name needs no temporary string.
struct Nlw_ICaseOrder {
    using is_transparent = void;
    bool operator()(const std::string& a, const std::string& b) const;
    bool operator()(const std::string& a, const char* b) const;
    bool operator()(const char* a, const std::string& b) const;
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

    // Writes the `uselib directive for the installation's verilog/src/<libraryName>
    // directory to writer, or reports why it cannot.
    static void WriteLibrarySearch(Nlw_Writer* writer, const char* libraryName);

    // Writes the head every file of this library opens with: a rule, the
    // notice line, a rule, and the emblem whose labels name the vendor, the
    // application's version and name, fileName (when not null) and the time
    // stamp.
    static void WriteNoticeAndEmblem(Nlw_Writer* writer, const char* fileName);

    // Read access for tests.
    const std::multimap<Port::String, Port::String>& GetBigEndingTimcellMap() const {
        return bigEndingTimcellMap_;
    }
    const std::multimap<Port::String, Port::String>& GetRecursiveInclusionMap() const {
        return recursiveInclusionMap_;
    }
    bool IsHexStringProperty(Vdm_Property* property, Nlw_NlBlock* block);
    bool IsBitStringProperty(Vdm_Property* property, Nlw_NlBlock* block);
    size_t GetHexStringPropertyCount() const { return hexStringPropertyTable_.size(); }
    size_t GetBitStringPropertyCount() const { return bitStringPropertyTable_.size(); }

private:
    using NameSet = std::unordered_set<Port::String, Nlw_ICaseHash, Nlw_ICaseEqual>;
    using NameMap = std::multimap<Port::String, Port::String>;

    // One entry of the big-ending map as it applies to a cell type: every
    // bus of the cell, or the bus of that name.
    struct BusOrderRule {
        bool allBuses;
        Port::String busName;
    };

    // Preamble.
    void WriteNewHeader(Nlw_NlBlock* block);
    void WriteSdfAnnotate(Nlw_NlBlock* block);
    // Ports, wires, instances.
    void WriteModulePortList(Nlw_NlBlock* block);
    void WriteIOPortDeclarations(Nlw_NlBlock* block);
    void WriteWireDeclarations(Nlw_NlBlock* block);
    void WriteWireAssignments(Nlw_NlBlock* block);
    void WriteChipwideDrives(Nlw_NlBlock* block);
    // Appends the one-bit literal of a constant: 0 and 1, and the reader's
    // 2 for "x" and 3 for "z".
    static void AppendBitLiteral(std::string& out, int value);
    void WriteComponentInstantiationStatements(Nlw_NlBlock* block);
    // Writes the module definitions of blocks in order, on two threads when
    // they are many (Nlw_VerilogWriter_Blocks.cpp).
    void WriteBlocks(Nlw_NlView* view, const std::vector<Nlw_NlBlock*>& blocks);
    // written: connection lines already begun before the port map (bit-init
    // lines), which the separator rule continues.
    void WritePortMaps(Nlw_NlBlock* instance, int written = 0);
    void ApplyBigEndingOrder(Nlw_NlBlock* instance);
    // Tables.
    void InitHexStringPropertyTable();
    void InitBitStringPropertyTable();
    void InitBigEndingTimcellMap();
    void InitRecursiveInclusionMap();
    void InitNameSet(NameSet& table, const char* key);
    void InitNameMap(NameMap& map, const char* key, bool trace);
    void BuildTypeIndexes();
    bool IsStringPropertyOfKind(Vdm_Property* property, Nlw_NlBlock* block, const char* marker,
                                const NameSet& table);
    // Parameters: the inline or defparam text of one element into line_;
    // false when its type cannot be written.
    // A parameter text of the preparation pass read back as the typed value
    // it stands for: vector digits (hexadecimal or binary), a string or a
    // number; false for any other text.
    struct RawParam {
        enum Kind { Hex, Bits, String, Number } kind = String;
        std::string digits;  // vector digits, or the string's characters
        const char* literal = "";
    };
    static bool DecodeLiteral(const char* text, RawParam& raw);
    // Appends the typed formatting of a raw value to the line.
    void AppendRawValue(const RawParam& raw, Vdm_Property* element, Nlw_NlBlock* block);
    bool FormatParam(Vdm_Property* element, Nlw_NlBlock* block, bool typed, bool inlineForm,
                     const char* instance);
    // Cell models.
    void WriteIsmList(Nlw_NlBlock* block, UT_NCH_CACHE& cache);
    // Whether the installation has a model folder and a cell library (or the
    // view knows library cells without one).
    bool HasCellModels(Nlw_NlView* view) const;
    bool CopyModelFile(const char* libraryName, const char* model);

    // Appends " // AKA:<aka>" when also-known-as comments are asked and aka
    // is set; line breaks in aka become blanks so the comment stays on its
    // line.
    void AppendAkaComment(std::string& out, const char* aka) const;
    bool IsBlackBoxMode() const;

    // The error issued when no installation root is known.
    static const char* const kNoVornixError;

    NameSet hexStringPropertyTable_;
    NameSet bitStringPropertyTable_;
    NameMap bigEndingTimcellMap_;
    NameMap recursiveInclusionMap_;

    // The two maps by type name ignoring case, in map order, so that each
    // instance finds its entries with one lookup.
    std::map<std::string, std::vector<BusOrderRule>, Nlw_ICaseOrder> bigEndingByType_;
    std::map<std::string, std::vector<Port::String>, Nlw_ICaseOrder> inclusionByType_;

    // The property output filter handed to the base; shared by copies.
    std::shared_ptr<Vdh_PropOutFilter> propFilter_;

    // Scratch texts and index tuple reused for every line.
    std::string line_;
    std::string alias_;
    DARRAY_Util_INT32 tuple_;

    // Escaped pin names of the last types written, by the name's address:
    // instances of a type share their pins' names, and names stay put while
    // the netlist is written.
    struct PinNameText {
        const char* name = nullptr;
        std::string text;
    };
    PinNameText pinNames_[256];
    const std::string& EscapedPinName(const char* name);
};
