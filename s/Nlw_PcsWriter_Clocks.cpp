// Clock component records of the translation file: the tracer that walks
// from a clock component's input back to the top-level port feeding it, and
// the records of clock multiplexers, clock buffers and clock managers.
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <cstring>

#include "Nlw_PcsWriter.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "port/UT.h"

namespace {

// How a traced cell passes the clock from its input to its output.
enum class Stage {
    Buffer,        // follows "I"
    Inverter,      // follows "I", inverting
    ClockBuffer,   // follows "I", a clock device
    ClockManager,  // follows "CLKIN", a clock device; some outputs invert
    ClockMux,      // follows "I0" (else "I1"), a clock device
    InvertingMux,  // the same, always inverting
};

struct TracedCell {
    const char* type;
    Stage stage;
};

// Cell types are matched exactly, with case: a type spelled otherwise is
// not a cell the tracer knows how to pass.
const TracedCell kTracedCells[] = {
    {"V_BUF", Stage::Buffer},
    {"V_TRI", Stage::Buffer},
    {"V_IBUFDS", Stage::Buffer},
    {"V_INV", Stage::Inverter},
    {"V_CKBUF", Stage::ClockBuffer},
    {"V_CLKDLL", Stage::ClockManager},
    {"V_CLKDLLE", Stage::ClockManager},
    {"V_DCM", Stage::ClockManager},
    {"V_DCM_ADV", Stage::ClockManager},
    {"V_BUFGMUX", Stage::ClockMux},
    {"V_BUFGMUX_1", Stage::InvertingMux},
};

const TracedCell* FindTracedCell(const char* type) {
    if (type == nullptr) return nullptr;
    for (const TracedCell& cell : kTracedCells)
        if (std::strcmp(cell.type, type) == 0) return &cell;
    return nullptr;
}

// Clock manager outputs whose clock is the input's turned upside down.
bool IsInvertingClockOutput(const char* name) {
    return UT_STR::ICompare(name, "CLK180") == 0 || UT_STR::ICompare(name, "CLK270") == 0 ||
           UT_STR::ICompare(name, "CLK2X180") == 0;
}

// Property values read under a type other than the one they were stored
// with: an integer or boolean read as a float is widened, a float read as an
// integer is truncated toward zero (saturating at the 32-bit limits, a NaN
// reading 0), a text holding a number reads as that number, and a property
// that holds no text reads as the empty text.
double TextNumber(const char* text) {
    if (text == nullptr) return 0;
    char* end = nullptr;
    const double value = std::strtod(text, &end);
    return end == text ? 0 : value;
}

// A bit vector of the design file (yosys writes integer parameters as 32-bit
// binary strings, so -5 is 111...1011): its low 32 bits as a signed number,
// x and z reading 0, as the preparation pass reads them.
int32_t BitsValue(const Vdm_Property* p) {
    uint32_t v = 0;
    for (const char* c = p->GetString(); c && *c; ++c) v = (v << 1) | (*c == '1' ? 1u : 0u);
    return static_cast<int32_t>(v);
}

double FloatValue(const Vdm_Property* p) {
    switch (p->GetType()) {
        case VDM_PROP_BITS:
            return BitsValue(p);
        case VDM_PROP_FLOAT:
            return p->GetFloat();
        case VDM_PROP_INT:
        case VDM_PROP_BOOL:
            return p->GetInt32();
        default:
            return TextNumber(p->GetString());
    }
}

int32_t Truncate(double value) {
    if (std::isnan(value)) return 0;
    if (value >= 2147483647.0) return INT32_MAX;
    if (value <= -2147483648.0) return INT32_MIN;
    return static_cast<int32_t>(value);
}

int32_t IntValue(const Vdm_Property* p) {
    switch (p->GetType()) {
        case VDM_PROP_INT:
        case VDM_PROP_BOOL:
            return p->GetInt32();
        case VDM_PROP_FLOAT:
            return Truncate(p->GetFloat());
        case VDM_PROP_BITS:
            return BitsValue(p);
        default:
            return Truncate(TextNumber(p->GetString()));
    }
}

// A text attribute that arrives as a number is written as that number.
const char* TextValue(const Vdm_Property* p) {
    if (p->GetType() == VDM_PROP_BITS) return vorform("%d", static_cast<int>(BitsValue(p)));
    if (const char* text = p->GetString()) return text;
    switch (p->GetType()) {
        case VDM_PROP_INT:
            return vorform("%d", static_cast<int>(p->GetInt32()));
        case VDM_PROP_FLOAT:
            return vorform("%g", p->GetFloat());
        case VDM_PROP_BOOL:
            return p->GetBool() ? "TRUE" : "FALSE";
        default:
            return "";
    }
}

enum class ValueKind { Float, Int, Text };

// Clock manager attributes, in the order they are written. The input divider
// is known to the constraint translator by the frequency synthesizer's name.
struct Attribute {
    const char* property;
    const char* name;
    ValueKind kind;
};

const Attribute kAttributes[] = {
    {"CLKDV_DIVIDE", "CLKDV_DIVIDE", ValueKind::Float},
    {"CLK_FEEDBACK", "CLK_FEEDBACK", ValueKind::Text},
    {"CLKFX_DIVIDE", "CLKFX_DIVIDE", ValueKind::Int},
    {"CLKFX_MULTIPLY", "CLKFX_MULTIPLY", ValueKind::Int},
    {"CLKIN_DIVIDE_BY_2", "CLKFX_DIVIDE_BY_2", ValueKind::Text},
    {"CLKIN_PERIOD", "CLKIN_PERIOD", ValueKind::Text},
    {"CLKOUT_PHASE_SHIFT", "CLKOUT_PHASE_SHIFT", ValueKind::Text},
    {"DLL_FREQUENCY_MODE", "DLL_FREQUENCY_MODE", ValueKind::Text},
    {"DFS_FREQUENCY_MODE", "DFS_FREQUENCY_MODE", ValueKind::Text},
    {"DSS_MODE", "DSS_MODE", ValueKind::Text},
    {"DUTY_CYCLE_CORRECTION", "DUTY_CYCLE_CORRECTION", ValueKind::Text},
    {"MAXPERCLKIN", "MAXPERCLKIN", ValueKind::Int},
    {"MAXPERPSCLK", "MAXPERPSCLK", ValueKind::Int},
    {"PHASE_SHIFT", "PHASE_SHIFT", ValueKind::Int},
};

const char* AttributeValue(const Vdm_Property* p, ValueKind kind) {
    switch (kind) {
        case ValueKind::Float:
            return vorform("%.1f", FloatValue(p));
        case ValueKind::Int:
            return vorform("%d", IntValue(p));
        case ValueKind::Text:
        default:
            return TextValue(p);
    }
}

const char* DirectionWord(int direction) {
    switch (direction) {
        case NLW_DIR_INPUT:
            return "INPUT|";
        case NLW_DIR_OUTPUT:
            return "OUTPUT|";
        case NLW_DIR_INOUT:
            return "BIDIR|";
        default:
            return nullptr;
    }
}

}  // namespace

// ---------------------------------------------------------------------------
// The tracer

Nlw_NlPin* Nlw_PcsWriter::GetInputPin(Nlw_NlBlock* block, const Port::String& name) {
    if (block == nullptr) return nullptr;
    for (Nlw_NlPin& pin : block->GetPins())
        if (pin.IsInput() && name.Compare(pin.GetWritableName(), 1) == 0) return &pin;
    return nullptr;
}

void Nlw_PcsWriter::UpdateCompClockDevice(Nlw_PcsComp& comp, Nlw_NlBlock* block, Nlw_NlPin* pin) {
    if (comp.clockDevice != nullptr) return;
    comp.clockDevice = block;
    comp.clockDevicePin = pin;
}

// Each step takes the signal on the pin and looks, in the signal's pin order,
// for either a top-level input port (the answer) or a driver the tracer can
// pass; the first passable driver whose input exists decides the whole
// trace. The walk is a loop rather than a recursion so that a long chain of
// buffers cannot exhaust the stack, and a step that starts again from a pin
// already visited is a loop in the netlist: it ends the trace with no port.
Nlw_NlPin* Nlw_PcsWriter::GetPrimaryClock(Nlw_NlPin* pin, Nlw_PcsComp& comp) {
    visited_.clear();
    for (Nlw_NlPin* from = pin;;) {
        lastPrimaryClock_ = nullptr;
        if (from == nullptr || !visited_.insert(from).second) return nullptr;
        Nlw_NlSignal* signal = from->GetSignal();
        if (signal == nullptr) return nullptr;

        Nlw_NlPin* next = nullptr;
        for (Nlw_NlPin* p : signal->GetPins()) {
            Nlw_NlBlock* owner = p->GetParent();
            if (p->IsInput() && owner != nullptr && owner == owner->GetView()->GetRootMacro()) {
                lastPrimaryClock_ = p;
                comp.primaryClock = p;
                return p;
            }
            // An output port of the enclosing module, seen from inside, takes
            // the signal out rather than driving it.
            if (!p->IsOutput() || p->IsParentPin(signal)) continue;
            const TracedCell* cell = FindTracedCell(owner ? owner->GetTypeName() : nullptr);
            if (cell == nullptr) continue;

            Nlw_NlPin* input = nullptr;
            switch (cell->stage) {
                case Stage::Buffer:
                    input = GetInputPin(owner, "I");
                    break;
                case Stage::Inverter:
                    comp.inverted = !comp.inverted;
                    input = GetInputPin(owner, "I");
                    break;
                case Stage::ClockBuffer:
                    input = GetInputPin(owner, "I");
                    UpdateCompClockDevice(comp, owner, p);
                    break;
                case Stage::ClockManager:
                    if (IsInvertingClockOutput(p->GetWritableName()))
                        comp.inverted = !comp.inverted;
                    input = GetInputPin(owner, "CLKIN");
                    UpdateCompClockDevice(comp, owner, p);
                    break;
                case Stage::ClockMux:
                case Stage::InvertingMux:
                    input = GetInputPin(owner, "I0");
                    if (input == nullptr) input = GetInputPin(owner, "I1");
                    UpdateCompClockDevice(comp, owner, p);
                    if (cell->stage == Stage::InvertingMux) comp.inverted = !comp.inverted;
                    break;
            }
            if (input != nullptr) {
                next = input;
                break;
            }
        }
        // A found input decides the trace even when it leads nowhere.
        if (next == nullptr) return nullptr;
        from = next;
    }
}

// ---------------------------------------------------------------------------
// Component records

bool Nlw_PcsWriter::IsTopLevel(const Nlw_NlBlock* block) {
    const Nlw_NlBlock* parent = block ? block->GetParent() : nullptr;
    return parent != nullptr && parent == block->GetView()->GetRootMacro();
}

Port::String Nlw_PcsWriter::GetComponentHead(Nlw_NlBlock* block) {
    Port::String head("INST#");
    head += GetTypeName(block);
    head += "=";
    head += GetCellName(block);
    return head;
}

void Nlw_PcsWriter::WriteBufgmuxInfo(Nlw_NlBlock* block) {
    if (!IsTopLevel(block)) return;
    Nlw_PcsComp comp(block);
    Port::String field;
    if (Nlw_NlPin* i0 = GetInputPin(block, "I0")) {
        if (Nlw_NlPin* port = GetPrimaryClock(i0, comp)) {
            field = "INPUT|I0{";
            field += GetPortName(port);
            field += "}=";
            field += GetNetName(i0->GetSignal());
        }
    }
    if (Nlw_NlPin* i1 = GetInputPin(block, "I1")) {
        if (Nlw_NlPin* port = GetPrimaryClock(i1, comp)) {
            field += field.empty() ? "INPUT|" : ",";
            field += "I1{";
            field += GetPortName(port);
            field += "}=";
            field += GetNetName(i1->GetSignal());
        }
    }
    if (field.empty()) return;
    WriteIL(GetComponentHead(block) + "," + field + ";");
}

void Nlw_PcsWriter::WriteCkbufInfo(Nlw_NlBlock* block) {
    if (!IsTopLevel(block)) return;
    Nlw_PcsComp comp(block);
    Nlw_NlPin* input = GetInputPin(block, "I");
    Nlw_NlPin* port = input ? GetPrimaryClock(input, comp) : nullptr;
    if (port == nullptr) return;
    // With several outputs the last one names the buffer's output.
    Port::String field;
    for (Nlw_NlPin& pin : block->GetPins()) {
        if (!pin.IsVisible() || pin.IsBused() || !pin.IsOutput()) continue;
        field = "OUTPUT|";
        field += pin.GetWritableName();
        field += "{";
        field += GetPortName(port);
        field += "}=";
        field += GetNetName(pin.GetSignal());
    }
    if (field.empty()) return;
    WriteIL(GetComponentHead(block) + "," + field + ";");
}

void Nlw_PcsWriter::WriteDcmInfo(Nlw_NlBlock* block) {
    if (!IsTopLevel(block)) return;
    Nlw_PcsComp comp(block);
    Nlw_NlPin* input = GetInputPin(block, "CLKIN");
    Nlw_NlPin* port = input ? GetPrimaryClock(input, comp) : nullptr;
    const Port::String head = GetComponentHead(block);

    for (Nlw_NlPin& pin : block->GetPins()) {
        if (!pin.IsVisible() || pin.IsBused()) continue;
        const char* word = DirectionWord(pin.GetDirection());
        if (word == nullptr) continue;
        Port::String record = head;
        record += ",";
        record += word;
        record += pin.GetWritableName();
        if (port != nullptr && std::strcmp(pin.GetWritableName(), "CLKIN") == 0) {
            record += "{";
            record += GetPortName(port);
            record += "}";
        }
        record += "=";
        record += GetNetName(pin.GetSignal());
        record += ";";
        WriteIL(record);
    }

    // Only the attributes the block carries; nothing stands in for the others.
    for (const Attribute& attribute : kAttributes) {
        const Vdm_Property* property = block->GetPropertyByName(attribute.property);
        if (property == nullptr) continue;
        Port::String record = head;
        record += ",ATTRIB|";
        record += attribute.name;
        record += "=";
        record += AttributeValue(property, attribute.kind);
        record += ";";
        WriteIL(record);
    }
}
