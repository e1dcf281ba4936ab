// The delays of a design, carried onto the model: what a timing file said,
// kept as references to blocks and pins, so that a timing writer can name
// them as the netlist writes them (after legalizing) rather than as the
// place-and-route tool spelled them.
#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

class Nlw_NlBlock;
class Nlw_NlPin;

// One delay or limit value: minimum, typical and maximum in picoseconds. A
// field left empty in the file ("(1::3)", "()") is absent.
struct Nlw_Rvalue {
    double v[3] = {0, 0, 0};
    uint8_t present = 0;  // bit i set: v[i] was given
};

enum class Nlw_TimingKind : uint8_t {
    // Delays.
    IoPath,        // pin1 input (with edge1) to pin2 output of one cell
    Port,          // pin1, an input of a cell
    Interconnect,  // pin1 driver to pin2 load
    // Timing checks: pin1 is the first port as the file writes it (the data
    // or checked signal), pin2 the reference (absent for WIDTH and PERIOD).
    Setup,
    Hold,
    SetupHold,
    Recovery,
    Removal,
    RecRem,
    Skew,
    Width,
    Period,
    NoChange,
};

enum Nlw_Edge : uint8_t { NLW_EDGE_NONE = 0, NLW_EDGE_POS = 1, NLW_EDGE_NEG = 2 };

struct Nlw_TimingEntry {
    Nlw_TimingKind kind = Nlw_TimingKind::IoPath;
    uint8_t edge1 = NLW_EDGE_NONE;
    uint8_t edge2 = NLW_EDGE_NONE;
    uint8_t numValues = 0;  // rvalues from firstValue in Nlw_Timing::values
    uint32_t firstValue = 0;
    Nlw_NlPin* pin1 = nullptr;
    Nlw_NlPin* pin2 = nullptr;
};

class Nlw_Timing {
public:
    static bool IsCheck(Nlw_TimingKind kind) { return kind >= Nlw_TimingKind::Setup; }
    // The SDF keyword of a kind ("IOPATH", "SETUPHOLD").
    static const char* Keyword(Nlw_TimingKind kind);

    // Entries in the order they were read (cell by cell, delays before
    // checks within a cell).
    std::vector<Nlw_TimingEntry> entries;
    std::vector<Nlw_Rvalue> values;
    // Where the delays came from: the timing file's name, or "nominal".
    std::string source;
    bool nominal = false;

    // How net delays are written. Interconnect: INTERCONNECT entries (the
    // default). Port: a PORT delay on each driven input. IoPath: each net
    // delay added to the IOPATH delays that start at the driven input, for
    // simulators that read neither INTERCONNECT nor PORT (Icarus Verilog
    // before release 13).
    enum class NetMode : uint8_t { Interconnect, Port, IoPath };
    NetMode netMode = NetMode::Interconnect;

    // The macro block a pin is seen from: a leaf cell's parent, or the macro
    // itself for a port of a macro (an interconnect end at a module port is
    // met from inside the module).
    static Nlw_NlBlock* GetScope(const Nlw_NlPin* pin);
    // The macro block whose timing file holds an entry: the scope of the
    // entry's cell, and for an interconnect the innermost block enclosing
    // both ends. Null when the entry has no pin.
    static Nlw_NlBlock* GetOwner(const Nlw_TimingEntry& e);
    // The entries owned by a macro block, in entry order (made on first use
    // for all blocks at once, so that writing one file per block stays
    // linear).
    const std::vector<uint32_t>& GetEntriesOf(const Nlw_NlBlock* macro);

private:
    std::unordered_map<const Nlw_NlBlock*, std::vector<uint32_t>> byOwner_;
    bool ownersMade_ = false;
};
