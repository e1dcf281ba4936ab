// The message manager, its console and log presentation, and message sources.
#include <algorithm>
#include <cstdlib>

#include "port/Port.h"

namespace {

// Formats a message text; messages never go through the vorform ring so
// that issuing one leaves the caller's vorform results alone.
std::string FormatMessage(const char* format, va_list args) {
    std::string out;
    Port_AppendFormatV(out, format, args);
    return out;
}

// Writes "prefix + text" with exactly one line end after the text.
void Emit(FILE* out, const std::string& prefix, const std::string& text) {
    std::fwrite(prefix.data(), 1, prefix.size(), out);
    std::fwrite(text.data(), 1, text.size(), out);
    if (text.empty() || text.back() != '\n') std::fputc('\n', out);
}

}  // namespace

const char* Port_MsgLevelName(Port_MsgLevel level) {
    switch (level) {
        case Port_MsgLevel::Debug:
            return "DEBUG";
        case Port_MsgLevel::Status:
            return "STATUS";
        case Port_MsgLevel::Info:
            return "INFO";
        case Port_MsgLevel::Warning:
            return "WARNING";
        case Port_MsgLevel::Error:
            return "ERROR";
        case Port_MsgLevel::Internal:
            return "INTERNAL_ERROR";
    }
    return "MESSAGE";
}

Port_MsgManager& Port_MsgManager::Instance() {
    static Port_MsgManager manager;
    return manager;
}

namespace {
// The deferral keeping this thread's messages, if any.
thread_local Port_MsgDeferral* tlDeferral = nullptr;
}  // namespace

void Port_MsgDeferral::Keep() {
    if (keeping_) return;
    outer_ = tlDeferral;
    tlDeferral = this;
    keeping_ = true;
}

void Port_MsgDeferral::Stop() {
    if (!keeping_) return;
    tlDeferral = outer_;
    keeping_ = false;
}

Port_MsgDeferral::~Port_MsgDeferral() {
    Stop();
}

void Port_MsgDeferral::Replay() {
    Stop();
    std::vector<Port_Msg> kept;
    kept.swap(kept_);
    for (const Port_Msg& msg : kept)
        Port_MsgManager::Instance().Issue(msg.level, msg.domain.c_str(), msg.text);
}

void Port_MsgManager::Issue(Port_MsgLevel level, const char* domain, const std::string& text) {
    const char* dom = domain ? domain : "";
    if (tlDeferral) {
        tlDeferral->kept_.push_back(Port_Msg{level, dom, text});
        return;
    }
    ++counts_[static_cast<int>(level)];
    if (console_) ShowOnConsole(level, dom, text);
    if (log_) WriteToLog(level, dom, text);
    if (!sinks_.empty()) {
        Port_Msg msg{level, dom, text};
        // A sink may remove itself while receiving; walk a copy.
        std::vector<Port_MsgSink*> sinks = sinks_;
        for (Port_MsgSink* sink : sinks) sink->Receive(msg);
    }
}

void Port_MsgManager::ShowOnConsole(Port_MsgLevel level, const char* domain,
                                    const std::string& text) {
    switch (level) {
        case Port_MsgLevel::Debug:
            if (debug_) Emit(stderr, "DEBUG: ", text);
            break;
        case Port_MsgLevel::Status:
            if (!quiet_) Emit(stdout, "", text);
            break;
        case Port_MsgLevel::Info:
            // Info goes with the progress lines so that the two stay in order.
            Emit(stdout, std::string("INFO:") + domain + " - ", text);
            break;
        case Port_MsgLevel::Warning:
        case Port_MsgLevel::Error:
        case Port_MsgLevel::Internal:
            // Keep earlier progress lines ahead of the problem on a terminal.
            std::fflush(stdout);
            Emit(stderr, std::string(Port_MsgLevelName(level)) + ":" + domain + " - ", text);
            break;
    }
}

void Port_MsgManager::WriteToLog(Port_MsgLevel level, const char* domain, const std::string& text) {
    if (level == Port_MsgLevel::Debug)
        Emit(log_, "DEBUG: ", text);
    else
        Emit(log_, std::string(Port_MsgLevelName(level)) + ":" + domain + " - ", text);
}

void Port_MsgManager::ResetCounts() {
    std::fill(std::begin(counts_), std::end(counts_), 0);
}

bool Port_MsgManager::OpenLog(const char* path) {
    CloseLog();
    if (!path) return false;
    log_ = std::fopen(path, "w");
    return log_ != nullptr;
}

void Port_MsgManager::CloseLog() {
    if (log_) std::fclose(log_);
    log_ = nullptr;
}

void Port_MsgManager::AddSink(Port_MsgSink* sink) {
    if (sink && std::find(sinks_.begin(), sinks_.end(), sink) == sinks_.end())
        sinks_.push_back(sink);
}

void Port_MsgManager::RemoveSink(Port_MsgSink* sink) {
    sinks_.erase(std::remove(sinks_.begin(), sinks_.end(), sink), sinks_.end());
}

void Port_MsgManager::Flush() {
    std::fflush(stdout);
    std::fflush(stderr);
    if (log_) std::fflush(log_);
}

Port_MsgCapture::Port_MsgCapture() {
    Port_MsgManager::Instance().AddSink(this);
}

Port_MsgCapture::~Port_MsgCapture() {
    Port_MsgManager::Instance().RemoveSink(this);
}

std::vector<std::string> Port_MsgCapture::Texts(Port_MsgLevel level) const {
    std::vector<std::string> texts;
    for (const Port_Msg& m : msgs)
        if (m.level == level) texts.push_back(m.text);
    return texts;
}

Port_MsgManData Port_MsgManData::createObject(const char* domain, const char* source, int line,
                                              const char* revision) {
    // The origin in the sources is not shown to users.
    (void)source;
    (void)line;
    (void)revision;
    return Port_MsgManData(domain);
}

#define NLW_ISSUE_AT(level)                         \
    va_list args;                                   \
    va_start(args, format);                         \
    std::string text = FormatMessage(format, args); \
    va_end(args);                                   \
    Port_MsgManager::Instance().Issue(level, domain_.c_str(), text)

void Port_MsgManData::issueStatus(const char* format, ...) {
    NLW_ISSUE_AT(Port_MsgLevel::Status);
}
void Port_MsgManData::issueInfo(const char* format, ...) {
    NLW_ISSUE_AT(Port_MsgLevel::Info);
}
void Port_MsgManData::issueWarning(const char* format, ...) {
    NLW_ISSUE_AT(Port_MsgLevel::Warning);
}
void Port_MsgManData::issueError(const char* format, ...) {
    NLW_ISSUE_AT(Port_MsgLevel::Error);
}
void Port_MsgManData::issueInternal(const char* format, ...) {
    NLW_ISSUE_AT(Port_MsgLevel::Internal);
}

#undef NLW_ISSUE_AT

void Port_MsgManData::debugStub(const char* format, ...) {
    va_list args;
    va_start(args, format);
    std::string text = FormatMessage(format, args);
    va_end(args);
    Port_MsgManager::Instance().Issue(Port_MsgLevel::Debug, "", text);
}

void Port_MsgDispatcher::exit(int code) {
    Port_MsgManager& manager = Port_MsgManager::Instance();
    manager.Flush();
    manager.CloseLog();
    std::exit(code);
}
