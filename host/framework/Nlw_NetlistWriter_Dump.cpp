// The netlist dump: a plain-text listing of the view as the host holds it,
// written before any format touches the names.
#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Util.h"
#include "framework/Nlw_Writer.h"

namespace {

const char* NameOr(const Nlw_NlSignal* s) {
    return s ? s->GetWritableName() : "-";
}

class Nlw_NlwFileWriter : public Nlw_Writer {
public:
    Nlw_NlwFileWriter(Nlw_NetlistWriter* nlw, const char* fileName)
        : Nlw_Writer(nlw, fileName, Port::Stream::Replace) {}

    void WriteView(Nlw_NlView* view, unsigned char) override {
        Nlw_Design* design = GetNlw()->GetDesign();
        const char* part = view->GetPartName();
        WriteL(vorform("# Netlist dump of design %s", design ? design->GetName() : "-"));
        WriteL(vorform("# Part: %s", part ? part : "-"));
        WriteL(vorform("# Macros: %zu", view->GetNumMacros()));
        for (Nlw_NlBlock* macro : view->GetMacros()) WriteBlock(macro);
    }

    void WriteBlock(Nlw_NlBlock* block) override {
        const Nlw_NlBlock* parent = block->GetParent();
        WriteL("");
        WriteL(vorform("macro %s %s parent %s", block->GetTypeName(), block->GetWritableName(),
                       parent ? parent->GetWritableName() : "-"));
        UpIndent();
        for (const Nlw_NlPin& port : block->GetPins())
            WriteIL(vorform("port %s %s %s", port.GetWritableName(),
                            Nlw_Util::ToString(port.GetDirection()),
                            NameOr(port.GetChildSignal())));
        for (const Nlw_NlSignal* signal : block->GetSignals())
            WriteIL(vorform("signal %s", signal->GetWritableName()));
        for (const Nlw_NlBlock* child : block->GetChildren()) {
            WriteIL(vorform("instance %s %s", child->GetTypeName(), child->GetWritableName()));
            UpIndent();
            for (const Nlw_NlPin& pin : child->GetPins())
                WriteIL(vorform("pin %s %s %s", pin.GetWritableName(),
                                Nlw_Util::ToString(pin.GetDirection()), NameOr(pin.GetSignal())));
            DownIndent();
        }
        DownIndent();
        WriteL("end");
    }
};

}  // namespace

void Nlw_NetlistWriter::WriteNlwFile() {
    const char* output = params_ ? params_->GetOutputFileName() : nullptr;
    if (!view_ || !output) {
        NLW_MSG().issueWarning("No view or output file name; the netlist dump is not written.\n");
        return;
    }
    std::string name = UT_PATH::ExternalPath((UT_PATH::GetRoot(output) + ".nlw").c_str());
    NLW_MSG().issueStatus("Writing netlist dump file '%s' ...\n", name.c_str());
    Nlw_NlwFileWriter writer(this, name.c_str());
    writer.WriteView(view_, 0);
}
