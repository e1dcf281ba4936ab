// Instance statements: cell type, parameters, instance name and the port map
// that connects every pin by name.
#include <cstring>

#include "Nlw_VerilogWriter.h"
#include "framework/Nlw_Params.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "port/UT.h"

namespace {

// The constant a pin is tied to when it has no signal, or null.
inline Vdm_Property* TieOff(const Nlw_NlPin* pin) {
    return pin->GetPropertyByName("TIEOFF");
}

void AppendInt(std::string& out, long value) {
    out += std::to_string(value);
}

}  // namespace

void Nlw_VerilogWriter::AppendBitLiteral(std::string& out, int value) {
    out += "1'b";
    if (value == 2)
        out += 'x';
    else if (value == 3)
        out += 'z';
    else
        AppendInt(out, value);
}

void Nlw_VerilogWriter::WriteComponentInstantiationStatements(Nlw_NlBlock* block) {
    Nlw_NetlistWriter* nlw = GetNlw();
    const bool defparamMode = Port_Env::GetEnv("NLW_VERILOG_DEFPARM") != nullptr;
    // Pin name texts are kept while one module's instances are written.
    for (PinNameText& slot : pinNames_) slot.name = nullptr;

    for (Nlw_NlBlock* child : block->GetChildren()) {
        if (!child || !nlw->IsInstantiatable(child)) continue;

        // Every leaf with parameters gets its defparam lines: cells outside
        // the library (yosys's own, black boxes) are as parametrised as the
        // library's, and would otherwise fall back to their defaults.
        if (defparamMode && !child->IsMacro())
            WriteExternalProperties(FindExternalProperties(child->GetDataBlock()), child);

        line_ = nlw->Escape(child->GetTypeName(), 0);
        line_ += ' ';
        WriteIText(line_);

        if (!defparamMode) WriteInlineParamStatements(child);
        line_ = nlw->Escape(child->GetInstanceName(), 0);
        line_ += " (";
        AppendAkaComment(line_, child->GetAka());
        if (defparamMode)
            WriteL(line_.c_str());
        else
            WriteIL(line_.c_str());

        UpIndent();
        // Constant inputs of the cell: the last character drives I0. Each
        // line but the last ends with its comma at once; the last one gets
        // its comma only when a port connection follows, so that an instance
        // without connections does not end its list with a comma.
        int connections = 0;
        if (Vdm_Property* bitInit = child->GetPropertyByName("NLW_BIT_INIT")) {
            const char* bits = bitInit->GetString();
            const size_t length = bits ? std::strlen(bits) : 0;
            for (size_t i = 0; i < length; ++i) {
                line_ = ".I";
                AppendInt(line_, static_cast<long>(i));
                line_ += "(1'b";
                line_ += bits[length - 1 - i];
                line_ += i + 1 < length ? ")," : ")";
                if (i + 1 < length)
                    WriteIL(line_.c_str());
                else
                    WriteIText(line_);
                ++connections;
            }
        }
        WritePortMaps(child, connections);
        DownIndent();
        WriteIL(");");
    }
}

void Nlw_VerilogWriter::ApplyBigEndingOrder(Nlw_NlBlock* instance) {
    auto found = bigEndingByType_.find(instance->GetTypeName());
    if (found == bigEndingByType_.end()) return;
    const UT_DARRAY<Nlw_NlPinBus*>* buses = instance->GetPinBuses();
    if (!buses) return;
    for (const BusOrderRule& rule : found->second) {
        for (Nlw_NlPinBus* bus : *buses) {
            if (!bus) continue;
            if (!rule.allBuses &&
                UT_STR::ICompare(rule.busName.c_str(), bus->GetWritableName()) != 0)
                continue;
            for (int d = 0; d < bus->GetDimension(); ++d) bus->SetOrder(d, BUS_ORDER_LSB_FIRST);
            if (!rule.allBuses) break;
        }
    }
}

const std::string& Nlw_VerilogWriter::EscapedPinName(const char* name) {
    // Names lie a few bytes apart: the address is mixed before it is cut.
    const uint64_t mixed = uint64_t(reinterpret_cast<uintptr_t>(name)) * 0x9E3779B97F4A7C15ull;
    PinNameText& slot = pinNames_[mixed >> 56];
    if (slot.name != name) {
        slot.text = GetNlw()->Escape(name, 0);
        slot.name = name;
    }
    return slot.text;
}

void Nlw_VerilogWriter::WritePortMaps(Nlw_NlBlock* instance, int written) {
    Nlw_NetlistWriter* nlw = GetNlw();
    int count = written;
    auto separator = [&]() {
        if (count++ > 0) WriteText(",\n", 2);
    };

    for (Nlw_NlPin& pin : instance->GetPins()) {
        if (!pin.IsVisible() || pin.IsBused()) continue;
        if (Nlw_NlSignal* signal = pin.GetSignal()) {
            separator();
            line_ = '.';
            line_ += EscapedPinName(pin.GetWritableName());
            line_ += '(';
            line_ += nlw->Escape(signal->GetWritableName(), signal->IsBused() ? 1 : 0);
            line_ += ')';
            WriteIText(line_);
        } else if (Vdm_Property* tie = TieOff(&pin)) {
            separator();
            line_ = '.';
            line_ += EscapedPinName(pin.GetWritableName());
            line_ += '(';
            AppendBitLiteral(line_, tie->GetInt32());
            line_ += ')';
            WriteIText(line_);
        }
    }

    if (instance->IsTimcell() && !bigEndingByType_.empty()) ApplyBigEndingOrder(instance);

    if (const UT_DARRAY<Nlw_NlPinBus*>* buses = instance->GetPinBuses()) {
        for (Nlw_NlPinBus* bus : *buses) {
            if (!bus || !bus->IsValid()) continue;
            separator();
            const int dimensions = bus->GetDimension();
            tuple_.Clear();
            for (int d = 0; d < dimensions; ++d)
                tuple_.Add(bus->GetOrder(d) != 0 ? bus->GetLSB(d) : bus->GetMSB(d));

            const char* busName = bus->GetWritableName();
            line_ = '.';
            line_ += nlw->Escape(busName, 0);
            const size_t head = line_.size();
            bool first = true, anyBit = false;
            while (bus->HasMore(tuple_)) {
                line_ += first ? "({" : ", ";
                first = false;
                alias_ = busName;
                alias_ += nlw->GetIndexesString(&tuple_);
                Nlw_NlPin* bit = instance->GetPinByAlias(alias_.c_str());
                Vdm_Property* tie = nullptr;
                if (bit && bit->GetSignal()) {
                    Nlw_NlSignal* signal = bit->GetSignal();
                    line_ += nlw->Escape(signal->GetWritableName(), signal->IsBused() ? 1 : 0);
                    anyBit = true;
                } else if (bit && (tie = TieOff(bit))) {
                    AppendBitLiteral(line_, tie->GetInt32());
                    anyBit = true;
                } else {
                    // No net and no constant: the bit floats. The reader gives
                    // open bits of an output a net of their own when other
                    // bits are connected; here only an input can be left.
                    line_ += "1'bz";
                }
                bus->Next(tuple_, dimensions - 1);
            }
            // A bus without any connected bit is left unconnected: a list of
            // constants would not be legal on an output.
            if (!anyBit) {
                line_.resize(head);
                first = true;
            }
            line_ += first ? "()" : "})";
            WriteIText(line_);
        }
    }

    if (count > 0) WriteL("");
}
