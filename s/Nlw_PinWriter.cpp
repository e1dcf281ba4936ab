// The signal/pin map file: a short header, then for every pad cell met in a
// depth-first walk of the hierarchy its signal (the port its pad net
// reaches, with the instance path), the pad's direction and the package pin.
#include "Nlw_PinWriter.h"

#include <memory>
#include <string>
#include <vector>

#include "framework/Nlw_Util.h"
#include "model/Nlw_Nl.h"
#include "port/PM.h"
#include "port/Port.h"
#include "port/UT.h"

namespace {

bool IsRootMacro(const Nlw_NlBlock* block) {
    const Nlw_NlView* view = block->GetView();
    return view != nullptr && view->GetRootMacro() == block;
}

// The pin of the pad type: where the cell meets the package pin.
Nlw_NlPin* GetPadPin(const Nlw_NlBlock* block) {
    for (Nlw_NlPin& pin : block->GetPins())
        if (pin.GetPinType() == NLW_PINTYPE_PAD) return &pin;
    return nullptr;
}

// Header texts are comments: a line break inside a name must not start a
// line of its own.
std::string HeaderText(const char* text) {
    return Nlw_Util::CommentText(text);
}
std::string HeaderTextOrNull(const char* text) {
    return text ? Nlw_Util::CommentText(text) : std::string("NULL");
}

}  // namespace

const char* const Nlw_PinWriter::kFamilyPrefix = "VX";

Nlw_PinWriter::Nlw_PinWriter(Nlw_NetlistWriter* nlw, const char* fileName,
                             Port::Stream::Access access)
    : Nlw_Writer(nlw, fileName, access) {}

Nlw_PinWriter::~Nlw_PinWriter() = default;

const char* Nlw_PinWriter::StripFamilyPrefix(const char* device) {
    if (device == nullptr) return nullptr;
    if (UT_STR::INCompare(device, kFamilyPrefix, 2) == 0) return device + 2;
    if (UT_STR::INCompare(device, kFamilyPrefix, 1) == 0) return device + 1;
    return device;
}

void Nlw_PinWriter::WriteView(Nlw_NlView* view, unsigned char) {
    if (view == nullptr || view->GetRootMacro() == nullptr) return;
    WriteBlock(view->GetRootMacro());
}

// The walk keeps its own stack: the reader accepts hierarchies of any depth,
// and a recursive walk would run out of stack on a deep one.
void Nlw_PinWriter::WriteBlock(Nlw_NlBlock* block) {
    if (block == nullptr) return;
    if (!block->IsMacro()) {
        WritePad(block);
        return;
    }
    struct Frame {
        Nlw_NlBlock* block;
        size_t next;
    };
    std::vector<Frame> stack;
    EnterMacro(block);
    stack.push_back({block, 0});
    while (!stack.empty()) {
        Frame& top = stack.back();
        const std::vector<Nlw_NlBlock*>& children = top.block->GetChildren();
        if (top.next == children.size()) {
            Nlw_NlBlock* done = top.block;
            stack.pop_back();
            LeaveMacro(done);
            continue;
        }
        Nlw_NlBlock* child = children[top.next++];
        if (child == nullptr) continue;
        if (child->IsMacro()) {
            EnterMacro(child);
            stack.push_back({child, 0});
        } else {
            WritePad(child);
        }
    }
}

void Nlw_PinWriter::EnterMacro(Nlw_NlBlock* block) {
    // The root macro is the design itself and adds nothing to the path.
    if (IsRootMacro(block)) return;
    if (!path_.empty()) path_ += '/';
    path_ += UT_STR::OrEmpty(block->GetWritableName());
}

void Nlw_PinWriter::LeaveMacro(Nlw_NlBlock* block) {
    if (!IsRootMacro(block)) StripFromParentChain(block);
}

void Nlw_PinWriter::StripFromParentChain(Nlw_NlBlock* block) {
    const size_t pathLen = path_.size();
    const size_t nameLen = UT_STR::Len(block->GetWritableName());
    // Entering the block added its name, and a "/" when the path was not
    // empty then; a path no longer than the name therefore held nothing else.
    if (pathLen <= nameLen)
        path_.clear();
    else
        path_.resize(pathLen - nameLen - 1);
}

Nlw_NlPin* Nlw_PinWriter::FindParentPort(Nlw_NlSignal* signal) {
    auto found = portOfSignal_.find(signal);
    if (found != portOfSignal_.end()) return found->second;
    Nlw_NlPin* port = nullptr;
    for (Nlw_NlPin* pin : signal->GetPins()) {
        if (pin->IsParentPin(signal)) {
            port = pin;
            break;
        }
    }
    portOfSignal_.emplace(signal, port);
    return port;
}

void Nlw_PinWriter::WritePad(Nlw_NlBlock* block) {
    if (block->GetPrimType() != NLW_PRIM_PAD) return;
    const char* pinName = Nlw_Util::GetStringProp(block, "PINNAME");
    Nlw_NlPin* padPin = GetPadPin(block);
    if (pinName == nullptr || padPin == nullptr) return;
    Nlw_NlSignal* signal = padPin->GetSignal();
    if (signal == nullptr) return;

    // The header comes with the first accepted pad, even when its signal
    // turns out to reach no port, so a design without pads gets an empty
    // file.
    if (pinCount_ == 0) WritePinHeader();
    ++pinCount_;

    Nlw_NlPin* port = FindParentPort(signal);
    if (port == nullptr) return;
    const char* portName = UT_STR::OrEmpty(port->GetWritableName());
    const char* signalName =
        path_.empty() ? vorform("%s", portName) : vorform("%s/%s", path_.c_str(), portName);
    // The direction is the pad pin's, not the port's.
    WriteL(vorform("%-20s\t%-10s\t%-10s", signalName, Nlw_Util::ToString(padPin->GetDirection()),
                   pinName));
}

void Nlw_PinWriter::WritePinHeader() {
    Nlw_NetlistWriter* nlw = GetNlw();
    const Nlw_Design* design = nlw->GetDesign();
    WriteIL(vorform("// Vornix signal/pin map file produced by program %s %s",
                    HeaderText(nlw->GetApplicationName()).c_str(),
                    HeaderText(nlw->GetApplicationVersion()).c_str()));
    WriteIL(vorform("// Date: %s", HeaderText(Nlw_Util::GetTimeStampString(1)).c_str()));
    WriteIL(
        vorform("// Design name: %s", HeaderText(design ? design->GetName() : nullptr).c_str()));
    WriteL("");

    Nlw_NlView* view = nlw->GetView();
    std::unique_ptr<PM_PIC> pic(Nlw_Util::CreatePicSpec(view, true));
    if (pic) {
        WriteIL(
            vorform("// Part %s", HeaderTextOrNull(StripFamilyPrefix(pic->get_device())).c_str()));
        WriteIL(vorform("// Package %s", HeaderTextOrNull(pic->get_package()).c_str()));
        WriteIL(vorform("// Speed %s", HeaderTextOrNull(pic->get_speed()).c_str()));
    } else {
        WriteIL(vorform("// Device: %s",
                        HeaderTextOrNull(view ? view->GetPartName() : nullptr).c_str()));
    }
    WriteL("");
}
