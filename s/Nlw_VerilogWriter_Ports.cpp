// A module's ports: the name list of the module header and the direction
// declarations that open the module body. Scalar ports always come before
// bus ports.
#include "Nlw_VerilogWriter.h"
#include "framework/Nlw_Params.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"

namespace {

const char* DirectionWord(int direction) {
    switch (direction) {
        case NLW_DIR_INPUT:
            return "input ";
        case NLW_DIR_OUTPUT:
            return "output ";
        case NLW_DIR_INOUT:
            return "inout ";
        default:
            return nullptr;
    }
}

}  // namespace

void Nlw_VerilogWriter::WriteModulePortList(Nlw_NlBlock* block) {
    Nlw_NetlistWriter* nlw = GetNlw();
    int count = 0;
    auto writeName = [&](const char* name) {
        if (count++ == 0)
            WriteI("");
        else
            Write(", ", 0, 0);
        Write(nlw->Escape(name, 0), 0, 0);
    };

    for (Nlw_NlPin& pin : block->GetPins()) {
        if (pin.IsVisible() && !pin.IsBused()) writeName(pin.GetWritableName());
    }
    if (const UT_DARRAY<Nlw_NlPinBus*>* buses = block->GetPinBuses()) {
        for (Nlw_NlPinBus* bus : *buses) {
            if (bus && bus->IsValid()) writeName(bus->GetWritableName());
        }
    }
    if (count > 0) WriteL("");
}

void Nlw_VerilogWriter::WriteIOPortDeclarations(Nlw_NlBlock* block) {
    Nlw_NetlistWriter* nlw = GetNlw();

    for (Nlw_NlPin& pin : block->GetPins()) {
        if (!pin.IsVisible() || pin.IsBused()) continue;
        const char* word = DirectionWord(pin.GetDirection());
        if (!word) {
            NLW_MSG().issueInternal("Nlw_VerilogWriter: Notype %s detected.\n",
                                    pin.ToString().c_str());
            continue;
        }
        line_ = word;
        line_ += nlw->Escape(pin.GetWritableName(), 0);
        line_ += ';';
        AppendAkaComment(line_, pin.GetAka());
        WriteIL(line_.c_str());
    }

    if (const UT_DARRAY<Nlw_NlPinBus*>* buses = block->GetPinBuses()) {
        for (Nlw_NlPinBus* bus : *buses) {
            if (!bus || !bus->IsValid()) continue;
            const char* word = DirectionWord(bus->GetDirection());
            if (!word) {
                NLW_MSG().issueInternal("Nlw_VerilogWriter: Notype %s detected.\n",
                                        bus->ToString().c_str());
                continue;
            }
            line_ = word;
            line_ += nlw->GetRangeString(bus);
            line_ += ' ';
            line_ += nlw->Escape(bus->GetWritableName(), 0);
            line_ += ';';
            AppendAkaComment(line_, bus->GetAka());
            WriteIL(line_.c_str());
        }
    }

    // Opens the region that the module end closes: in a black-box model the
    // body is hidden from synthesis.
    if (IsBlackBoxMode()) {
        WriteIL("");
        WriteIL("// synthesis translate_off");
        WriteIL("");
    }
}
