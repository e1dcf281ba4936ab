// The design reader's working data: each module of the netlist JSON digested
// into compact tables (ports, named nets, cells, connections, parameters)
// that the unfolding and flattening builders turn into model objects.
//
// The tables keep their own copies of the texts they need (a text pool), so
// the parsed document, which is several times the size of the file, can be
// released before the model is built.
#pragma once

#include <simdjson.h>

#include <condition_variable>
#include <cstdint>
#include <deque>
#include <exception>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <thread>
#include <unordered_map>
#include <vector>

#include "framework/Nlw_NameTable.h"
#include "model/Nlw_NlBuilder.h"
#include "reader/Nlw_CellLibrary.h"
#include "reader/Nlw_JsonReader.h"

namespace nlw_json {

// A fault of the input. Thrown inside the reader and reported once by Load.
struct ReadError {
    std::string text;
};
[[noreturn]] void Fail(std::string text);

// yosys marks a public name with a leading backslash; its netlist JSON
// drops the mark only where the rest is a simple identifier, so "\\1st" in
// the file is the RTL's \1st and the name is "1st". Internal names begin
// with "$" and carry no mark.
inline std::string_view PublicName(std::string_view name) {
    return name.size() > 1 && name[0] == '\\' ? name.substr(1) : name;
}

// A NUL-terminated text of the pool (or a literal); never null.
using Text = const char*;

// Stable copies of texts, allocated in large chunks and released together.
class TextPool {
public:
    Text Keep(std::string_view s);

private:
    std::vector<std::unique_ptr<char[]>> chunks_;
    char* cur_ = nullptr;
    size_t left_ = 0;
};

// Net references: a local net number (>= 0) or a constant bit.
enum : int32_t { kConst0 = -1, kConst1 = -2, kConstX = -3, kConstZ = -4 };
// "1'b0", "1'b1", "1'bx" or "1'bz".
const char* ConstName(int32_t ref);

constexpr uint32_t kNone = 0xFFFFFFFFu;

// A parameter or attribute value as the file gives it. The text of a value
// just read may lie in the document; a stored one lies in the pool.
enum class ValueKind : uint8_t { Bits, String, Int, Float, Bool };
struct Value {
    ValueKind kind = ValueKind::String;
    std::string_view text;  // Bits: 0 1 x z, most significant first; String
    int64_t i = 0;          // Int, Bool
    double d = 0;           // Float
};
struct Param {
    Text name = "";
    ValueKind kind = ValueKind::String;
    Text text = "";
    int64_t i = 0;
    double d = 0;
};

struct Port {
    Text name = "";
    int dir = NLW_DIR_UNTYPED;
    uint32_t width = 0;
    int32_t msb = 0, lsb = 0;  // bus range; a port of one bit is scalar
    uint32_t bitFirst = 0;     // its bits in Module::refs, least significant first
    uint32_t pinPos = 0;       // position of its first pin on a block
    Text pinName = "";         // "PINNAME" or "LOC" of its net, for pads
    bool IsBus() const { return width > 1; }
    // Pin position of bit i: bus members are stored from msb to lsb.
    uint32_t BitPos(uint32_t i) const { return pinPos + (IsBus() ? width - 1 - i : 0); }
};

// One connection of a cell: the pin (library type pin or module port) and
// its bits in Module::refs. The pin is kUnresolved until the cell's type is
// known (see ResolveCells).
constexpr uint32_t kUnresolved = 0xFFFFFFFFu;
struct Conn {
    uint32_t slot = 0;
    uint32_t bitFirst = 0;
    uint32_t width = 0;
};

// What few cells carry: the attributes the writers read.
struct CellExtra {
    Text aka = "";       // from "hdlname", joined with "/"
    Text pinName = "";   // "PINNAME" (or "LOC" for a pad)
    Text typeAttr = "";  // "TYPE"
};

struct Cell {
    Text name = "";
    Text typeName = "";  // as the file names it, less yosys's public mark
    uint32_t type = 0;   // LibVariant, or module when macro
    uint32_t connFirst = 0, connCount = 0;
    uint32_t paramFirst = 0, paramCount = 0;
    uint32_t extra = kNone;  // in Module::extras
    bool macro = false;
    bool marked = false;       // the file gives the name with the public mark
    bool speculative = false;  // pins matched to the library's while the type may be a module
};

// A bus of named nets (a multi-bit port or net name that names some nets).
struct NetBus {
    Text name = "";
    int32_t msb = 0, lsb = 0;
    Text aka = "";
    uint8_t flags = 0;  // NameFlags of the name
};

// Net attributes that mark a name as one the user knows (the translation
// file lists such nets).
enum NameFlags : uint8_t { kNameRecovered = 1, kUserVisible = 2 };

// The name a net of a module gets.
struct NetName {
    int32_t bus = -1;   // NetBus index, or -1 for a scalar
    int32_t index = 0;  // bus index
    Text name = "";     // scalar name
    Text aka = "";      // scalar also-known-as name
    uint32_t rank = 0;  // lower is preferred: class, then file order
    uint8_t flags = 0;  // scalar NameFlags
};

// A constant bit of a named bus ("bits": [7, 8, "1"]): the bus member is
// made and assigned the constant, so the declared wire reads what the
// design says. pos is the bit's place in Module::refs.
struct ConstMember {
    int32_t bus = 0;
    int32_t index = 0;
    int32_t ref = kConst0;
    uint32_t pos = 0;
};

// A net of the top module marked as the global set/reset or tristate.
struct GlobalNet {
    bool setReset = false;
    int32_t ref = 0;
    int32_t conn = 3;
    int32_t floatVal = 0;
};

// A cell's "port_directions" entry, kept for a cell whose type may gain
// pins or pin directions from its instances.
struct DirEntry {
    Text key = "";  // as the file gives it
    int dir = NLW_DIR_UNTYPED;
    bool isString = false;
};
struct CellDirs {
    uint32_t cell = 0;
    uint32_t first = 0, count = 0;  // in Module::dirEntries
};

struct Module {
    std::string_view name;  // nameText
    Text nameText = "";
    // Where the module's object lies in the text, and the object while it
    // is the one parsed (see ParseAhead).
    size_t textBegin = 0, textEnd = 0;
    simdjson::dom::object json;
    bool blackbox = false;
    bool topAttr = false;
    bool reachable = false;
    Nlw_NlType* nlType = nullptr;
    Text part = "";
    std::vector<Port> ports;
    std::unordered_map<std::string_view, uint32_t> portIndex;
    uint32_t numPins = 0;  // pins of an instance: the ports' bits
    // Modules this one instantiates, in cell order (repeats kept out).
    std::vector<uint32_t> children;

    std::vector<int32_t> refs;
    std::vector<Cell> cells;
    std::vector<CellExtra> extras;
    std::vector<Conn> conns;
    std::vector<Param> params;
    uint32_t numNets = 0;
    std::vector<NetName> nets;
    std::vector<NetBus> buses;
    std::vector<ConstMember> constMembers;
    std::vector<GlobalNet> globals;
    // Some pad cell at or below this module needs its port's pin name.
    bool padsBelow = false;
    bool ownPads = false;

    // Left by the reading of the module for the resolution of its cells
    // (ResolveCells), in cell and connection order: the pins not resolved
    // yet, by connection; the directions of the cells that may need them;
    // the "LOC" attributes, which name a package pin only on a pad.
    std::vector<std::pair<uint32_t, Text>> pinKeys;
    std::vector<DirEntry> dirEntries;
    std::vector<CellDirs> cellDirs;
    std::vector<std::pair<uint32_t, std::string>> locs;
    // The first fault of the module's attributes, ports and children, and
    // the first of the rest of its content, raised in file order.
    std::exception_ptr listFault, digestFault;

    const CellExtra& ExtraOf(const Cell& c) const {
        static const CellExtra none;
        return c.extra == kNone ? none : extras[c.extra];
    }
};

// A library cell type: its pins are the union of what its definitions and
// its instances' connections give.
struct LibType {
    Text name = "";
    const Nlw_CellDef* def = nullptr;
    int32_t blackbox = -1;  // module that describes it
    struct Pin {
        Text name = "";
        int dir = NLW_DIR_UNTYPED;
        // A pin a definition gives has its range; the others take the width
        // each instance connects (see LibVariant).
        bool fixedRange = false;
        uint32_t width = 1;
        int32_t msb = 0, lsb = 0;
        bool bus = false;
        bool pad = false;
    };
    std::vector<Pin> pins;
    std::unordered_map<std::string_view, uint32_t> pinIndex;
    int32_t padPin = -1;
    bool pad = false;
    bool flexible = false;  // some pin takes its width from the instances
    // The layouts met so far: widths per pin (trailing scalars dropped) to
    // the LibVariant.
    std::map<std::vector<uint32_t>, uint32_t> variants;
};

// One pin layout of a library type. Types that are not in the cell library
// are often parametric (a lookup table of 2 inputs next to one of 4): each
// width of each open pin the instances connect makes a model type of its
// own, so that every instance's pins are exactly as wide as its connections.
struct LibVariant {
    uint32_t base = 0;  // the LibType
    std::vector<uint32_t> signature;
    Nlw_NlType* type = nullptr;
    // Per pin of the base type: position of its first pin on an instance,
    // width, and whether it is a bus (whose members run from msb to lsb).
    std::vector<uint32_t> pos, width;
    std::vector<uint8_t> bus;
    uint32_t BitPos(uint32_t pin, uint32_t i) const {
        return pos[pin] + (bus[pin] ? width[pin] - 1 - i : 0);
    }
};

// Where in the document a fault is; the text is made only for a message.
struct Where {
    std::string_view module, cell, section, key;
    std::string Text() const;
};

// A named net of a module as the file lists it.
struct NetEntry {
    nlw_json::Text name = "";
    bool hidden = false;
    uint32_t bitFirst = 0, width = 0;  // in Module::refs
    int32_t msb = 0, lsb = 0;
    nlw_json::Text aka = "";
    int32_t port = -1;  // the port of the same name
    uint8_t flags = 0;  // NameFlags
};

// The work space of naming nets, kept from module to module: a design may
// hold very many small modules.
struct NameCandidate {
    Text name;
    uint32_t bitFirst, width;
    int32_t msb, lsb;
    Text aka;
    uint32_t rank;
    uint8_t flags;
};
// How the connections of cells of one type are matched while a module is
// read (see ReadCellTexts).
struct CellType {
    std::string_view file;  // the type as the file gives it, in the pool
    Text name = "";         // less the public mark, in the pool
    // The library's definition when each of its pins has a direction: then
    // pins are matched while reading.
    const Nlw_CellDef* def = nullptr;
    // The name names a module too: a black box (whose pins are then the
    // library's) or not (whose are its ports).
    bool speculative = false;
    // Whether cells of the type keep their directions for later.
    bool keepDirs = false;
};

struct NameScratch {
    // Each module's cell names, checked for repeats; the table is kept.
    Nlw_NameTable cellNames;
    // The cell types met so far, by name as the file gives it: a type is
    // looked up once per reading thread, not at each change of type from
    // cell to cell. A scratch serves reads of one kind (speculating or not).
    Nlw_NameTable typeIndex;
    std::deque<CellType> types;
    // Children of the module being read, by module: stamp[child] is the
    // reading module's number + 1 once listed.
    std::vector<uint32_t> stamp;
    std::vector<NetEntry> entries;
    std::vector<NameCandidate> cands;
    std::vector<Text> portAka;
    std::vector<uint8_t> portFlags;
    std::vector<uint32_t> rank, winBit;
    std::vector<int32_t> winner, busOf, bitMap;
};

struct Design {
    std::string fileName;
    Nlw_ReadOptions options;
    // The text of the file, padded for the parser, while it is read.
    const char* text = nullptr;
    size_t textLen = 0;
    bool exactSplit = false;
    simdjson::dom::parser parser;
    TextPool pool;
    // Texts kept by the second thread that reads modules.
    TextPool threadPool;
    std::vector<Module> modules;
    std::unordered_map<std::string_view, uint32_t> moduleIndex;
    std::vector<LibType> types;
    std::vector<LibVariant> variants;
    std::unordered_map<std::string_view, uint32_t> typeIndex;
    std::vector<uint32_t> signature;  // work space
    Nlw_CellLibrary cellLib;
    // Why the cell library could not be used: reported after the faults of
    // the hierarchy, though the library is read before the modules.
    std::string cellLibError;
    uint32_t top = 0;
    // Modules reachable from the top, each after every module it instantiates.
    std::vector<uint32_t> bottomUp;
    NameScratch scratch, threadScratch;

    const char* File() const { return fileName.c_str(); }
    // Lets the document go once every module is digested; the names and
    // indexes that point into it go with it.
    void ReleaseDocument();
};

// Finding and parsing the modules (Nlw_JsonReader_Split.cpp). SplitModules
// lists the modules of the text with their names and places; ParseAhead
// (below) parses them into m.json. Unless Design::exactSplit, the places are
// judged by the layout, and any fault met shows as GuessFailed, from either,
// before the module list is done with; the list is then made again,
// exactly, and the modules read again.
struct GuessFailed {};
void SplitModules(Design& d);
// The fault of a module's text: while the places are judged by the layout,
// GuessFailed; else the message a parse of the whole text gives.
[[noreturn]] void OpenFailed(Design& d);

// Parses the modules of a list on two threads, each with a parser of its
// own, ahead of the one being opened (Nlw_JsonReader_ParseAhead.cpp).
class ParseAhead {
public:
    // Done with the k-th module of the order as soon as it is parsed, by the
    // thread that parsed it (0: the caller's, 1: the other), while its json
    // is valid. It must not throw.
    using Work = std::function<void(size_t k, int thread)>;
    // order: the modules to be opened, in the order they will be.
    ParseAhead(Design& d, const std::vector<uint32_t>& order, Work work = nullptr);
    ~ParseAhead();
    ParseAhead(const ParseAhead&) = delete;
    ParseAhead& operator=(const ParseAhead&) = delete;
    // Waits until the k-th module of the order is parsed and worked on
    // (parsing it, or a later one, itself meanwhile), and raises the fault
    // of its text if it has one.
    void Open(size_t k);

private:
    void Run();
    // Parses module k and does the work with it.
    void Parse(size_t k, int thread);

    Design& d_;
    std::vector<uint32_t> order_;
    std::vector<std::pair<size_t, size_t>> ranges_;  // of the text, per module of the order
    simdjson::dom::parser parsers_[2];               // per thread
    Work work_;
    // Per module of the order, written before it is marked done.
    std::vector<simdjson::error_code> errors_;
    // Guarded by mutex_:
    enum : uint8_t { kPending, kParsed, kNoObject };
    std::vector<uint8_t> done_;  // per module of the order
    size_t claimed_ = 0;         // modules of the order taken by either thread
    bool stop_ = false;
    std::mutex mutex_;
    std::condition_variable changed_;
    std::thread thread_;
};

// Parses the whole text; a fault ends the load with its message.
void ParseWhole(Design& d);
[[noreturn]] void FailParse(const Design& d, simdjson::error_code err);

// Reading the document (Nlw_JsonReader_Modules.cpp, Nlw_JsonReader_Cells.cpp).
// The module list with every module's attributes, ports and children.
void ReadModuleList(Design& d);
// Reads a module just parsed: its attributes, ports and children, then its
// named nets and cells into its tables, and names its nets. It touches
// nothing but the module, the pool and the scratch given, and reads the
// module list and the cell library, so modules are read so on two threads.
// Faults are kept in the module (listFault, digestFault). A connection to a
// library cell is matched to its pin here; one whose pin depends on other
// modules is left kUnresolved.
//
// A library cell's name may also name a module of the file, whose black box
// attribute is known only when every module is read; with speculate, its
// connections are matched to the library's pins all the same (Cell::
// speculative), and ResolveCells asks for the module to be read again
// without when the module turns out to be no black box.
void ReadModule(const Design& d, Module& m, uint32_t self, TextPool& pool, NameScratch& scratch,
                bool speculate = true);
void ReadCellTexts(const Design& d, Module& m, simdjson::dom::object cells, TextPool& pool,
                   NameScratch& scratch, bool speculate);
// Drops the black boxes from the module's children, once every module's
// attributes are read.
void DropBlackboxChildren(const Design& d, Module& m);
// Resolves, in file order, the types of a module's cells (library types are
// numbered, and a type the library does not define gains pins, in the
// order they are met) and their connections left kUnresolved; raises the
// module's digest fault once the cells before it are resolved. False, with
// nothing done, when the module must be read again (see ReadModule).
bool ResolveCells(Design& d, Module& m);
uint32_t ReadBits(simdjson::dom::element e, Module& m, const Where& where);
Value ReadValue(simdjson::dom::element e, TextPool& pool, const Where& where);
// A value as text: strings as they stand, bits and numbers in decimal.
std::string_view ValueText(const Value& v, TextPool& pool);
// True for a value that reads as a non-zero number or a non-empty string
// other than "0".
bool ValueIsTrue(const Value& v);
bool ValueToInt(const Value& v, int64_t& out);
// "a b c" as "a/b/c", in the pool.
Text JoinPath(std::string_view hdlname, TextPool& pool);

// Naming the nets of a module (Nlw_JsonReader_Nets.cpp).
void NameNets(Module& m, NameScratch& s, TextPool& pool);

// Hierarchy (Nlw_JsonReader_Hierarchy.cpp): cycles, top, reachable order,
// and the cells of every module the top reaches resolved.
void ResolveHierarchy(Design& d);
// Reads the installation's cell library before the modules are read; a
// fault of it is kept in Design::cellLibError.
void LoadCellLibrary(Design& d);

// Library types (Nlw_JsonReader_Types.cpp).
uint32_t FindOrAddLibType(Design& d, std::string_view name);
// The layout of a leaf cell whose connections are read.
uint32_t FindOrAddVariant(Design& d, uint32_t type, const Module& m, const Cell& c);
void CreateLibTypes(Design& d, Nlw_NlBuilder& b);

// Model building shared by both builders (Nlw_JsonReader_Build.cpp).
// The block's properties: the cell's parameters in file order, then the
// attributes the writers read ("PINNAME", "TYPE"), then, when there were
// such, the parameter count (Nlw_JsonReader::GetParameterCount).
void AddBlockProperties(const Module& m, const Cell& c, const LibType* lt, Text padPinName,
                        Nlw_NlBlock* block);
// The library types, the module type of the top and the view's device.
Nlw_NlBlock* CreateTop(Design& d, Nlw_NlBuilder& b);
Nlw_NlType* ModuleType(Module& m, Nlw_NlBuilder& b);
// Marks the top module's global nets; signals[ref] is the top's signal of
// a net (null for a net tied to a constant).
void ApplyGlobals(const Module& top, Nlw_NlBuilder& b, Nlw_NlBlock* root,
                  const std::vector<Nlw_NlSignal*>& signals);
// A constant on a pin of a leaf or module instance: 0, 1 and x on an input
// (or untyped) pin become its tie-off (TIEOFF 0, 1, 2); an output or inout
// pin is left unconnected, since Verilog connects those only to nets; z
// stays unconnected.
void TieConstant(Nlw_NlBuilder& b, Nlw_NlPin* pin, int32_t ref);
// The constant members of the module's named buses (buses[k] is the bus
// made for NetBus k, null when none): each is made and marked
// "NLW_CONSTANT" (0, 1, 2 for x). Lists them by their place in Module::refs.
void MakeConstMembers(Nlw_NlBuilder& b, const Module& m, const std::vector<Nlw_NlBus*>& buses,
                      std::vector<std::pair<uint32_t, Nlw_NlSignal*>>& made);
// The inside signal of a constant bit (at pos in Module::refs) of port p:
// none for an input, whose value the module does not read; the port's own
// constant bus member when there is one; else the global constant signal.
Nlw_NlSignal* PortConstSignal(Nlw_NlBuilder& b, Nlw_NlBlock* block, const Port& p, uint32_t pos,
                              int32_t ref,
                              const std::vector<std::pair<uint32_t, Nlw_NlSignal*>>& members,
                              Nlw_NlSignal* (&cache)[4]);
// Gives every open bit of a partly connected output or inout bus of an
// instance a net of its own ("nlw_open_<k>"), so the bus is written as a
// list of nets.
void ConnectOpenOutputs(Nlw_NlView& view);
// The invisible global signal that stands for a constant port bit.
Nlw_NlSignal* ConstSignal(Nlw_NlBuilder& b, Nlw_NlBlock* block, int32_t ref,
                          Nlw_NlSignal* (&cache)[4]);
void AddPorts(Nlw_NlBuilder& b, const Module& m, Nlw_NlBlock* block);
// The local net on the pad pin of a pad cell, or kConstX when none.
int32_t PadPinRef(const Module& m, const Cell& c, const LibType& lt);

// A leaf for a library cell. net(ref, ref) gives the signal of a local net,
// or null after turning ref into the constant the net is tied to.
template <typename NetFn>
Nlw_NlBlock* CreateLeafCell(Nlw_NlBuilder& b, const Module& m, const Cell& c, const LibVariant& v,
                            const LibType& lt, Nlw_NlBlock* parent, const char* name,
                            Text padPinName, NetFn net) {
    Nlw_NlBlock* leaf = b.CreateLeaf(parent, v.type, name);
    const CellExtra& x = m.ExtraOf(c);
    if (*x.aka) leaf->SetAka(x.aka);
    for (uint32_t k = 0; k < c.connCount; ++k) {
        const Conn& cn = m.conns[c.connFirst + k];
        for (uint32_t i = 0; i < cn.width; ++i) {
            int32_t ref = m.refs[cn.bitFirst + i];
            Nlw_NlSignal* s = ref >= 0 ? net(ref, ref) : nullptr;
            Nlw_NlPin* pin = leaf->GetPin(v.BitPos(cn.slot, i));
            if (s)
                b.Connect(pin, s);
            else
                TieConstant(b, pin, ref);
        }
    }
    AddBlockProperties(m, c, &lt, padPinName, leaf);
    return leaf;
}

// Puts the NameFlags of a net's name on its signal as the properties
// "NAME_RECOVERED" and "USER_VISIBLE".
inline void AddNameFlags(Nlw_NlSignal* s, uint8_t flags) {
    if (flags & kNameRecovered) s->AddProperty(Vdm_Property::NewInt("NAME_RECOVERED", 1));
    if (flags & kUserVisible) s->AddProperty(Vdm_Property::NewInt("USER_VISIBLE", 1));
}

// Refuses a design whose unfolded hierarchy would not fit in memory, before
// any of it is built.
void CheckUnfoldedSize(const Design& d);
// The two builders.
void BuildUnfolded(Design& d, Nlw_NlView& view);
void BuildFlat(Design& d, Nlw_NlView& view);

// Locates the first syntax fault of a JSON text (Nlw_JsonReader_Syntax.cpp):
// its byte offset, or npos when the text has none this check finds.
size_t FindSyntaxError(const char* text, size_t len);

}  // namespace nlw_json
