// A module's internal nets: wire declarations and the assign statement that
// joins each port to its net where the two names differ.
#include <cstring>

#include "Nlw_VerilogWriter.h"
#include "framework/Nlw_Params.h"
#include "model/Nlw_Nl.h"

void Nlw_VerilogWriter::WriteWireDeclarations(Nlw_NlBlock* block) {
    Nlw_NetlistWriter* nlw = GetNlw();

    for (Nlw_NlSignal* signal : block->GetSignals()) {
        if (!signal || !signal->IsVisible() || signal->IsBused()) continue;
        line_ = "wire ";
        line_ += nlw->Escape(signal->GetWritableName(), 0);
        line_ += ';';
        AppendAkaComment(line_, signal->GetAka());
        WriteIL(line_.c_str());
    }

    if (const UT_DARRAY<Nlw_NlBus*>* buses = block->GetSignalBuses()) {
        for (Nlw_NlBus* bus : *buses) {
            if (!bus || !bus->IsValid()) continue;
            line_ = "wire ";
            line_ += nlw->GetRangeString(bus);
            line_ += ' ';
            line_ += nlw->Escape(bus->GetWritableName(), 0);
            line_ += ';';
            AppendAkaComment(line_, bus->GetAka());
            WriteIL(line_.c_str());
        }
    }
}

void Nlw_VerilogWriter::WriteWireAssignments(Nlw_NlBlock* block) {
    Nlw_NetlistWriter* nlw = GetNlw();
    int count = 0;
    std::string pinSide;

    for (Nlw_NlPin& pin : block->GetPins()) {
        if (!pin.IsVisible()) continue;
        Nlw_NlSignal* signal = pin.GetChildSignal();
        if (!signal) continue;
        if (std::strcmp(pin.GetWritableName(), signal->GetWritableName()) == 0) continue;

        const int direction = pin.GetDirection();
        // An inout port only needs the assignment when something inside
        // drives its net.
        if (direction != NLW_DIR_INPUT && direction != NLW_DIR_OUTPUT && !signal->FindDriverPin())
            continue;

        // Global signals are named exactly as the chipwide module names them.
        const bool global = signal->GetPropertyByName("NLW_GLOBAL_SIGNAL") != nullptr;
        pinSide = nlw->Escape(pin.GetWritableName(), pin.IsBused() ? 1 : 0);
        const char* signalSide =
            global ? signal->GetWritableName()
                   : nlw->Escape(signal->GetWritableName(), signal->IsBused() ? 1 : 0);

        if (count++ == 0) {
            WriteIL("assign");
            UpIndent();
        } else {
            WriteL(",");
        }
        const bool input = direction == NLW_DIR_INPUT;
        line_ = input ? signalSide : pinSide.c_str();
        line_ += " = ";
        WriteI(line_.c_str());
        Write(input ? pinSide.c_str() : signalSide, 0, 0);
    }

    // Nets the design holds constant (a register bit found constant, say):
    // the declared wire reads the constant, not z.
    for (Nlw_NlSignal* signal : block->GetSignals()) {
        if (!signal || !signal->IsVisible()) continue;
        const Vdm_Property* constant = signal->GetPropertyByName("NLW_CONSTANT");
        if (!constant) continue;
        if (count++ == 0) {
            WriteIL("assign");
            UpIndent();
        } else {
            WriteL(",");
        }
        line_ = nlw->Escape(signal->GetWritableName(), signal->IsBused() ? 1 : 0);
        line_ += " = ";
        AppendBitLiteral(line_, constant->GetInt32());
        WriteI(line_.c_str());
    }

    if (count > 0) {
        WriteL(";");
        DownIndent();
    }
    WriteChipwideDrives(block);
}

// A net the host brought out as the port of a global signal (marked with
// "NLW_CHIPWIDE_NET") drives that net of the chipwide module, which every
// cell model reads. The chipwide net is active high; a global whose
// network floats at 1 is active low and is inverted.
void Nlw_VerilogWriter::WriteChipwideDrives(Nlw_NlBlock* block) {
    Nlw_NetlistWriter* nlw = GetNlw();
    const Nlw_NlView* view = block->GetView();
    if (view == nullptr) return;
    for (Nlw_NlSignal* signal : {view->GetSetReset(), view->GetTristate()}) {
        if (signal == nullptr || signal->GetParent() != block) continue;
        const Vdm_Property* target = signal->GetPropertyByName("NLW_CHIPWIDE_NET");
        if (target == nullptr || target->GetString() == nullptr) continue;
        const Nlw_NlNetwork* network = signal->GetNetwork();
        const Vdm_Property* floatVal =
            network ? network->GetPropertyByName("VL_FLOATVAL") : nullptr;
        const bool activeLow = floatVal != nullptr && floatVal->GetInt32() == 1;
        line_ = "assign chipwide.";
        line_ += target->GetString();
        line_ += activeLow ? " = ~" : " = ";
        line_ += nlw->Escape(signal->GetWritableName(), signal->IsBused() ? 1 : 0);
        line_ += ';';
        WriteIL(line_.c_str());
    }
}
