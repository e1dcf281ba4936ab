#include "Nlw_MessageStyle.h"

namespace {

// "LEVEL:domain - text" on one line.
std::string OneLine(const Port_Msg& msg) {
    std::string line = std::string(Port_MsgLevelName(msg.level)) + ":" + msg.domain + " - ";
    std::string text = msg.text;
    while (!text.empty() && (text.back() == '\n' || text.back() == ' ')) text.pop_back();
    for (char& c : text)
        if (c == '\n' || c == '\r') c = ' ';
    return line + text + "\n";
}

bool IsProblem(Port_MsgLevel level) {
    return level == Port_MsgLevel::Warning || level == Port_MsgLevel::Error ||
           level == Port_MsgLevel::Internal;
}

}  // namespace

Nlw_MessageStyle::Nlw_MessageStyle(const std::string& style, bool debug)
    : style_(style), debug_(debug) {
    Port_MsgManager& manager = Port_MsgManager::Instance();
    if (style_ == "qflow" || style_ == "silent") manager.SetConsole(false);
    manager.AddSink(this);
}

Nlw_MessageStyle::~Nlw_MessageStyle() {
    Port_MsgManager& manager = Port_MsgManager::Instance();
    manager.RemoveSink(this);
    manager.SetConsole(true);
    if (wrapLog_) std::fclose(wrapLog_);
}

bool Nlw_MessageStyle::OpenWrapLog(const char* path) {
    wrapLog_ = std::fopen(path, "a");
    return wrapLog_ != nullptr;
}

void Nlw_MessageStyle::Receive(const Port_Msg& msg) {
    const bool debugTrace = msg.level == Port_MsgLevel::Debug;
    if (wrapLog_ && !debugTrace) {
        const std::string line = OneLine(msg);
        std::fwrite(line.data(), 1, line.size(), wrapLog_);
    }
    if (debugTrace && !debug_) return;
    if (style_ == "qflow") {
        const std::string line = OneLine(msg);
        std::fwrite(line.data(), 1, line.size(), stdout);
    } else if (style_ == "silent" && IsProblem(msg.level)) {
        std::fflush(stdout);
        const std::string line = OneLine(msg);
        std::fwrite(line.data(), 1, line.size(), stderr);
    }
}
