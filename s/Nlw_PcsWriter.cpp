// The translation file: header, port, net and instance records, and the
// design kind. Clock component records are in Nlw_PcsWriter_Clocks.cpp.
#include "Nlw_PcsWriter.h"

#include "framework/Nlw_Util.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "port/UT.h"

namespace {

// "aka?writable" when there is an also-known-as name, else "writable".
Port::String PairedName(const char* aka, const char* writable) {
    Port::String name;
    if (aka) {
        name = aka;
        name += "?";
    }
    name += writable;
    return name;
}

bool HasVisibilityProperty(const Vdm_PropertyHolder* holder) {
    return holder->GetPropertyByName("NAME_RECOVERED") != nullptr ||
           holder->GetPropertyByName("USER_VISIBLE") != nullptr;
}

}  // namespace

Nlw_PcsWriter::Nlw_PcsWriter(Nlw_NetlistWriter* nlw, const char* fileName,
                             Port::Stream::Access access)
    : Nlw_Writer(nlw, fileName, access) {}

Nlw_PcsWriter::~Nlw_PcsWriter() = default;

void Nlw_PcsWriter::WriteView(Nlw_NlView* view, unsigned char /*flag*/) {
    WritePcsHeader();
    if (view == nullptr) {
        WriteIL("DESIGN#FLAT;");
        return;
    }
    WriteTopModuleInfo(view->GetRootMacro());

    Nlw_NetlistWriter* nlw = GetNlw();
    const UT_DARRAY<Nlw_NlBlock*>& macros = view->GetMacros();
    for (size_t i = macros.GetCount(); i-- > 0;) {
        Nlw_NlBlock* macro = macros[i];
        if (macro == nullptr || !macro->IsMacro()) continue;
        if (macro->GetParent() == nullptr) WriteNetInfo(macro);
        for (Nlw_NlBlock* child : macro->GetChildren()) {
            if (nlw->IsInstantiatable(child) && child->IsTimcell()) WriteBlock(child);
        }
    }
    WriteIL(view->GetNumMacros() < 2 ? "DESIGN#FLAT;" : "DESIGN#HIERARCHICAL;");
}

void Nlw_PcsWriter::WriteBlock(Nlw_NlBlock* block) {
    WriteInstanceInfo(block);
}

void Nlw_PcsWriter::WritePcsHeader() {
    Nlw_NetlistWriter* nlw = GetNlw();
    const Nlw_Design* design = nlw->GetDesign();
    // The header lines are comments: a line break in a host text must not
    // end one early.
    WriteIL(vorform("// Vornix qcf2dcf translation file produced by %s application (version %s)",
                    Nlw_Util::CommentText(nlw->GetApplicationName()).c_str(),
                    Nlw_Util::CommentText(nlw->GetApplicationVersion()).c_str()));
    WriteIL("// This file is to be used with the qcf2sdc translator program that converts a");
    WriteIL("// Vornix QCF file to Synopsys SDC file. This file should not be modified.");
    WriteIL("");
    WriteIL(vorform("// Design name: %s",
                    Nlw_Util::CommentText(design ? design->GetName() : "").c_str()));
    WriteL("");
}

void Nlw_PcsWriter::WriteTopModuleInfo(Nlw_NlBlock* block) {
    if (block == nullptr || block->GetParent() != nullptr) return;
    for (Nlw_NlPin& pin : block->GetPins()) {
        if (!pin.IsVisible()) continue;
        const char* word = nullptr;
        switch (pin.GetDirection()) {
            case NLW_DIR_INPUT:
                word = ",INPUT|";
                break;
            case NLW_DIR_OUTPUT:
                word = ",OUTPUT|";
                break;
            case NLW_DIR_INOUT:
                word = ",BIDIR|";
                break;
            default:
                NLW_MSG().issueInternal("Nlw_VerilogWriter: Notype %s detected.\n",
                                        pin.ToString().c_str());
                continue;
        }
        Port::String record("MODULE#");
        record += block->GetWritableName();
        record += word;
        record += GetPortName(&pin);
        record += ";";
        WriteIL(record);
    }
}

void Nlw_PcsWriter::WriteNetInfo(Nlw_NlBlock* macro) {
    for (Nlw_NlSignal* signal : macro->GetSignals()) {
        // The also-known-as name decides, but the model name is written.
        if (!IsVisible(signal) || signal->GetAka() == nullptr) continue;
        WriteIL(vorform("NET#%s?%s;", signal->GetModelName(), signal->GetWritableName()));
    }
}

void Nlw_PcsWriter::WriteInstanceInfo(Nlw_NlBlock* block) {
    if (block == nullptr || !block->IsTimcell()) return;
    const char* type = block->GetTypeName();
    if (type == nullptr || *type == '\0') return;
    if (UT_STR::INCompare(type, "V_RAMB", 6) == 0) {
        WriteBlockramInfo(block);
    } else if (UT_STR::_ICompare(type, "V_DCM") == 0 || UT_STR::_ICompare(type, "V_DCM_ADV") == 0) {
        WriteDcmInfo(block);
    } else if (UT_STR::_ICompare(type, "V_BUFGMUX") == 0 ||
               UT_STR::_ICompare(type, "V_BUFGMUX_1") == 0) {
        WriteBufgmuxInfo(block);
    } else if (UT_STR::_ICompare(type, "V_CKBUF") == 0) {
        WriteCkbufInfo(block);
    } else if (UT_STR::_ICompare(type, "V_FDDRCPE") == 0 ||
               UT_STR::_ICompare(type, "V_FDDRRSE") == 0) {
        WriteDualrateflopInfo(block);
    } else {
        WriteRenameInfo(block);
    }
}

void Nlw_PcsWriter::WriteRenameInfo(Nlw_NlBlock* block) {
    const char* aka = block->GetAka();
    if (aka == nullptr) return;
    WriteIL(vorform("INST#%s=%s?%s;", block->GetTypeName(), aka, block->GetWritableName()));
}

// Block RAMs are always listed, with or without an also-known-as name.
void Nlw_PcsWriter::WriteBlockramInfo(Nlw_NlBlock* block) {
    const char* aka = block->GetAka();
    if (aka)
        WriteIL(vorform("INST#%s=%s?%s;", block->GetTypeName(), aka, block->GetWritableName()));
    else
        WriteIL(vorform("INST#%s=%s;", block->GetTypeName(), block->GetWritableName()));
}

// Listed exactly as block RAMs are.
void Nlw_PcsWriter::WriteDualrateflopInfo(Nlw_NlBlock* block) {
    WriteBlockramInfo(block);
}

Port::String Nlw_PcsWriter::GetCellName(Nlw_NlBlock* block) {
    if (block == nullptr) return Port::String();
    return PairedName(block->GetAka(), block->GetWritableName());
}

Port::String Nlw_PcsWriter::GetPortName(Nlw_NlPin* pin) {
    if (pin == nullptr) return Port::String();
    return PairedName(pin->GetAka(), pin->GetWritableName());
}

Port::String Nlw_PcsWriter::GetNetName(Nlw_NlSignal* signal) {
    if (signal == nullptr) return Port::String();
    return PairedName(signal->GetAka(), signal->GetWritableName());
}

Port::String Nlw_PcsWriter::GetTypeName(Nlw_NlBlock* block) {
    if (block == nullptr) return Port::String();
    return Port::String(block->GetTypeName());
}

// A net is worth naming when the host shows it and either the net itself or
// its hierarchical network carries a name-keeping property.
bool Nlw_PcsWriter::IsVisible(Nlw_NlSignal* signal) {
    if (signal == nullptr || !signal->IsVisible()) return false;
    if (HasVisibilityProperty(signal)) return true;
    const Nlw_NlNetwork* network = signal->GetNetwork();
    return network != nullptr && HasVisibilityProperty(network);
}
