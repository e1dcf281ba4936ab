// The last two blocks of the test fixture: the column header with the port
// monitor, and the stimulus of the global set/reset and tristate signals.
#include <algorithm>
#include <cstdint>
#include <cstring>
#include <string>

#include "Nlw_VerilogTestWriter.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"

namespace {

// The first 13 character positions of every header row belong to the time
// column, whose label stands at position 12.
constexpr size_t kTimeColumnWidth = 13;

// Appends one label character as it must stand inside the $display string
// so that it prints as exactly that one character: a backslash or a quote
// is escaped, a percent sign doubled (it would start a format), and a
// control character written as an octal escape.
void AppendHeaderChar(std::string& row, char c) {
    const unsigned char u = static_cast<unsigned char>(c);
    if (c == '\\' || c == '"') {
        row += '\\';
        row += c;
    } else if (c == '%') {
        row += "%%";
    } else if (u < 0x20 || u == 0x7f) {
        Port_AppendFormat(row, "\\%03o", static_cast<unsigned>(u));
    } else {
        row += c;
    }
}

}  // namespace

// The monitor prints a bus in hexadecimal, one digit per four bits. A bus
// whose most significant index is below its least significant one (an
// ascending range such as [0 : 7]) prints as many digits as a descending
// bus of the same number of bits.
int Nlw_VerilogTestWriter::GetBusColumns(const Nlw_NlBus* bus) {
    int64_t n = static_cast<int64_t>(bus->GetMSB(0)) - bus->GetLSB(0) + 1;
    if (n <= 0) n = static_cast<int64_t>(bus->GetLSB(0)) - bus->GetMSB(0) + 1;
    return static_cast<int>(n / 4 + (n % 4 != 0 ? 1 : 0));
}

void Nlw_VerilogTestWriter::AddHeaderLabel(const char* label, size_t column, int width) {
    // The grid has kMaxHeaderRows rows: a longer label keeps only its first
    // kMaxHeaderRows characters in the header.
    const size_t length = std::min(std::strlen(label), kMaxHeaderRows);
    const size_t pad = width > 1 ? static_cast<size_t>(width) : 1;
    for (size_t j = 0; j < length; ++j) {
        // A row first used by this label starts blank under every earlier
        // column, so that the columns stay aligned.
        if (j == rows_.size()) rows_.emplace_back(kTimeColumnWidth + column, ' ');
        AppendHeaderChar(rows_[j], label[j]);
        rows_[j].append(pad - 1, ' ');
    }
    for (size_t j = length; j < rows_.size(); ++j) rows_[j].append(pad, ' ');
}

void Nlw_VerilogTestWriter::WriteDisplay(Nlw_NlBlock* root) {
    Nlw_NetlistWriter* nlw = GetNlw();

    rows_.clear();
    for (const char* c = "Time"; *c != '\0'; ++c) {
        rows_.emplace_back(kTimeColumnWidth - 2, ' ');
        rows_.back() += *c;
        rows_.back() += ' ';
    }
    size_t column = 0;
    ForEachPort(
        root,
        [&](Nlw_NlPin& pin) {
            AddHeaderLabel(pin.GetWritableName(), column, 1);
            column += 1;
        },
        [&](Nlw_NlPinBus& bus) {
            const int width = GetBusColumns(&bus);
            line_ = bus.GetWritableName();
            line_ += nlw->GetRangeString(&bus);
            AddHeaderLabel(line_.c_str(), column, width);
            column += static_cast<size_t>(width);
        });

    WriteIL("initial begin");
    UpIndent();
    for (const std::string& row : rows_) {
        line_ = "$display(\"";
        line_ += row;
        line_ += "\");";
        WriteIL(line_.c_str());
    }
    rows_.clear();
    rows_.shrink_to_fit();

    WriteI("$monitor(\"%t\",$realtime,,");
    int count = 0;
    ForEachPort(
        root,
        [&](Nlw_NlPin& pin) {
            if (count++ > 0) Write(",", 0, 0);
            Write(nlw->Escape(pin.GetWritableName(), 0), 0, 0);
        },
        [&](Nlw_NlPinBus& bus) {
            if (count++ > 0) Write(",", 0, 0);
            Write(vorform("\"%%h\",%s", nlw->Escape(bus.GetWritableName(), 0)), 0, 0);
        });
    WriteL(");");
    DownIndent();
    WriteIL("end");
}

// A global signal with connection value 3 is driven through the fixture's
// own register of its name; with 0 or 2 through the port it refers to.
// Other values, and a signal whose floating value is -1, drive nothing.
const char* Nlw_VerilogTestWriter::GetDriveName(Nlw_NlSignal* signal, const char* connProperty) {
    if (signal == nullptr) return nullptr;
    if (Nlw_Util::GetInt32Prop(signal->GetNetwork(), "VL_FLOATVAL") == -1) return nullptr;
    const int32_t conn = Nlw_Util::GetInt32Prop(signal, connProperty, -1);
    const char* name = nullptr;
    if (conn == 3) {
        name = signal->GetWritableName();
    } else if (conn == 0 || conn == 2) {
        if (Nlw_NlPin* pin = signal->GetRefPin()) name = pin->GetWritableName();
    }
    // Escaped as the fixture declares the register or port.
    return name ? GetNlw()->Escape(name, 0) : nullptr;
}

void Nlw_VerilogTestWriter::WriteStimulus(Nlw_NlBlock* root) {
    Nlw_NlView* view = root->GetView();
    Nlw_NlSignal* setReset = view ? view->GetSetReset() : nullptr;
    Nlw_NlSignal* tristate = view ? view->GetTristate() : nullptr;
    const int32_t setResetFloat =
        setReset ? Nlw_Util::GetInt32Prop(setReset->GetNetwork(), "VL_FLOATVAL") : 0;
    const int32_t tristateFloat =
        tristate ? Nlw_Util::GetInt32Prop(tristate->GetNetwork(), "VL_FLOATVAL") : 0;

    // The escaped names live in a shared buffer: keep copies.
    const char* name = GetDriveName(setReset, "NLW_SETRESET_CONN");
    const std::string setResetName = name ? name : "";
    name = GetDriveName(tristate, "NLW_TRISTATE_CONN");
    const std::string tristateName = name ? name : "";

    WriteIL("initial begin");
    UpIndent();
    UpIndent();
    // The set/reset starts active, opposite to its floating value, and is
    // released after 100 time units; the tristate keeps its floating value.
    if (!setResetName.empty())
        WriteIL(vorform("%s = %d;", setResetName.c_str(), setResetFloat == 0 ? 1 : 0));
    if (!tristateName.empty())
        WriteIL(vorform("%s = %d;", tristateName.c_str(), static_cast<int>(tristateFloat)));
    DownIndent();
    if (setReset != nullptr) {
        WriteIL("#100");
        UpIndent();
        if (!setResetName.empty())
            WriteIL(vorform("%s = %d;", setResetName.c_str(), setResetFloat != 0 ? 1 : 0));
        DownIndent();
    }
    WriteIL("#1000 $stop;");
    WriteIL("// #1000 $finish;");
    DownIndent();
    WriteIL("end");
}
