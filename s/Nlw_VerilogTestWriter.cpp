// The test fixture file: its commented head, the fixture module, the port
// registers and wires, the unit under test and the waveform dumps.
#include "Nlw_VerilogTestWriter.h"

#include <string>

#include "Nlw_VerilogWriter.h"
#include "framework/Nlw_Params.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "port/UT.h"

namespace {

const char* const kRule =
    "////////////////////////////////////////////////////////////////////////////////";
const char* const kSeparator = "//             ";

const char* const kNoVornixError =
    " The VORNIX environment variable must be set for this program towork. Please check your "
    "environment to ensure that it is setup properly to use the Vornix tools\n";

// Text placed between the quotes of a Verilog string literal: a quote or a
// backslash in a file name must not end the literal early or start an
// escape sequence, and a line break must not split it.
std::string StringLiteralText(const std::string& text) {
    std::string out;
    out.reserve(text.size());
    for (char c : text) {
        switch (c) {
            case '"':
            case '\\':
                out += '\\';
                out += c;
                break;
            case '\n':
                out += "\\n";
                break;
            case '\r':
                out += "\\r";
                break;
            default:
                out += c;
        }
    }
    return out;
}

const char* KindOf(int direction) {
    return direction == NLW_DIR_INPUT ? "reg" : "wire";
}

}  // namespace

Nlw_VerilogTestWriter::Nlw_VerilogTestWriter(Nlw_NetlistWriter* nlw, const char* fileName,
                                             Port::Stream::Access access)
    : Nlw_Writer(nlw, fileName, access) {}

Nlw_VerilogTestWriter::~Nlw_VerilogTestWriter() = default;

void Nlw_VerilogTestWriter::WriteView(Nlw_NlView* view, unsigned char flag) {
    (void)flag;
    WriteTestHeader();
    Nlw_NlBlock* root = view ? view->GetRootMacro() : nullptr;
    if (root == nullptr) {
        NLW_MSG().issueInternal("Nlw_VerilogTestWriter: the design has no root module.\n");
        return;
    }
    WriteBlock(root);
}

void Nlw_VerilogTestWriter::WriteBlock(Nlw_NlBlock* root) {
    UpIndent();
    WriteIL("module test;");
    UpIndent();
    WriteRegistersAndWires(root);
    WriteUUT(root);
    WriteTimeShm(root);
    WriteVcd(root);
    WriteDisplay(root);
    WriteStimulus(root);
    DownIndent();
    WriteIL("endmodule");
    DownIndent();
}

// ---------------------------------------------------------------------------
// File head

void Nlw_VerilogTestWriter::WriteTestHeader() {
    Nlw_NetlistWriter* nlw = GetNlw();
    Nlw_Params* params = GetParams();
    const std::string appName = Nlw_Util::CommentText(nlw->GetApplicationName());
    const std::string appVersion = Nlw_Util::CommentText(nlw->GetApplicationVersion());
    const Nlw_Design* design = nlw->GetDesign();

    Nlw_VerilogWriter::WriteNoticeAndEmblem(this, nullptr);

    WriteL(kSeparator);
    WriteL(vorform("// Command: %s", Nlw_Util::CommentText(params->GetCommandLine()).c_str()));
    WriteL(vorform("// Design Name: %s",
                   Nlw_Util::CommentText(design ? design->GetName() : nullptr).c_str()));
    WriteL(kSeparator);
    WriteL("// Purpose:    ");
    WriteL(vorform("//     Vornix TestFixture Template produced by program %s %s", appName.c_str(),
                   appVersion.c_str()));
    WriteL(kSeparator);
    WriteL(vorform("//     ATTENTION: This file was created by %s and may therefore be ",
                   appName.c_str()));
    WriteL(vorform("//     overwritten by subsequent runs of %s. Vornix recommends that you ",
                   appName.c_str()));
    WriteL("//     copy this file to a new name, or 'paste' this text into another file, ");
    WriteL("//     to avoid accidental loss of data.");
    WriteL(kSeparator);
    WriteL(kRule);
    WriteL("");

    WriteChipwideInclude();

    WriteL(params->GetWritePsTimePrecision() ? "`timescale 1 ns/1 ps" : "`timescale 1 ns/10 ps");
    WriteL("");
}

// Includes the chipwide module of the first installation root that holds
// it, so that the fixture can reach the device's global signals. Without
// any root the user is told why; a root list without the file simply gives
// no include.
void Nlw_VerilogTestWriter::WriteChipwideInclude() {
    const Port::PathList& roots = Port::VornixPath::GetInstance();
    if (roots.size() == 0) {
        NLW_MSG().issueError("%s", kNoVornixError);
        return;
    }
    for (size_t i = 0; i < roots.size(); ++i) {
        const char* root = roots[i];
        if (!Port::File::exist(root) || !Port::File::isdir(root)) continue;
        const char* file = vorform("%s/verilog/src/chipwide.v", root);
        if (!Port::File::exist(file) || Port::File::isdir(file)) continue;
        std::string path = UT_PATH::ExternalPath(file);
        // Simulators on every platform read forward slashes in an include.
        if (Port_Env::IsNt()) {
            for (char& c : path) {
                if (c == '\\') c = '/';
            }
        }
        WriteL(vorform("`include \"%s\"", path.c_str()));
        return;
    }
}

// ---------------------------------------------------------------------------
// Declarations and the unit under test

void Nlw_VerilogTestWriter::WriteRegistersAndWires(Nlw_NlBlock* root) {
    Nlw_NetlistWriter* nlw = GetNlw();
    ForEachPort(
        root,
        [&](Nlw_NlPin& pin) {
            WriteIL(vorform("%s %s;", KindOf(pin.GetDirection()),
                            nlw->Escape(pin.GetWritableName(), 0)));
        },
        [&](Nlw_NlPinBus& bus) {
            WriteIL(vorform("%s %s %s;", KindOf(bus.GetDirection()), nlw->GetRangeString(&bus),
                            nlw->Escape(bus.GetWritableName(), 0)));
        });

    Nlw_NlView* view = root->GetView();
    if (view == nullptr) return;
    WriteGlobalRegister(view->GetSetReset(), "NLW_SETRESET_CONN");
    WriteGlobalRegister(view->GetTristate(), "NLW_TRISTATE_CONN");
}

// A global signal that reaches the design only through the chipwide module
// (connection value 3) gets a register of its own that drives the chipwide
// net of the same name.
void Nlw_VerilogTestWriter::WriteGlobalRegister(Nlw_NlSignal* signal, const char* connProperty) {
    if (signal == nullptr || Nlw_Util::GetInt32Prop(signal, connProperty, -1) != 3) return;
    // Escaping leaves a simple identifier as it is and keeps any other name
    // a single Verilog identifier.
    const std::string name = GetNlw()->Escape(signal->GetWritableName(), 0);
    WriteIL(vorform("reg %s;", name.c_str()));
    WriteIL(vorform("assign chipwide.%s = %s;", name.c_str(), name.c_str()));
}

void Nlw_VerilogTestWriter::WriteUUT(Nlw_NlBlock* root) {
    Nlw_NetlistWriter* nlw = GetNlw();
    WriteI(nlw->Escape(root->GetTypeName(), 0));
    const char* instanceName = GetParams()->GetRootInstanceName();
    WriteL(vorform(" %s (", nlw->Escape(instanceName ? instanceName : "uut", 0)));

    UpIndent();
    int count = 0;
    auto connect = [&](const char* portName) {
        if (count++ > 0) WriteL(",");
        const char* n = nlw->Escape(portName, 0);
        WriteI(vorform(".%s (%s)", n, n));
    };
    ForEachPort(
        root, [&](Nlw_NlPin& pin) { connect(pin.GetWritableName()); },
        [&](Nlw_NlPinBus& bus) { connect(bus.GetWritableName()); });
    WriteL("");
    DownIndent();
    WriteIL(");");
}

// ---------------------------------------------------------------------------
// Waveform dumps

void Nlw_VerilogTestWriter::WriteTimeShm(Nlw_NlBlock* root) {
    (void)root;
    if (!GetParams()->GetWriteShm()) return;
    WriteDumpBlock(".shm", "$shm_open", "$shm_probe(\"AS\");");
}

void Nlw_VerilogTestWriter::WriteVcd(Nlw_NlBlock* root) {
    (void)root;
    if (!GetParams()->GetWriteVcd()) return;
    WriteDumpBlock(".vcd", "$dumpfile", "$dumpvars(0, test);");
}

// One initial block that sets the time format, opens the dump file named
// after the output file's root with the suffix through the open task, and
// starts probing.
void Nlw_VerilogTestWriter::WriteDumpBlock(const char* suffix, const char* openTask,
                                           const char* probeLine) {
    WriteIL("initial begin");
    UpIndent();
    WriteIL("$timeformat(-9,3,\"ns\",12);");
    const char* output = GetParams()->GetOutputFileName();
    const std::string root = UT_PATH::GetRoot(output ? output : "");
    const std::string name = UT_PATH::ExternalPath(vorform("%s%s", root.c_str(), suffix));
    line_ = openTask;
    line_ += "(\"";
    line_ += StringLiteralText(name);
    line_ += "\");";
    WriteIL(line_.c_str());
    WriteIL(probeLine);
    DownIndent();
    WriteIL("end");
}
