// The message styles of -intstyle and the appended log of --wraplog.
#pragma once

#include <cstdio>
#include <string>

#include "port/Port.h"

// While it lives, presents the run's messages in a style: "qde" leaves the
// console as it is (every message, status lines as they are); "silent" shows
// only warnings and errors; "qflow" writes every message as one line
// "LEVEL:domain - text" on standard output, line breaks inside the text
// turned into blanks, for scripts to read. A wrap log, when given, gets every
// message but debug traces appended in the log file's form.
class Nlw_MessageStyle : public Port_MsgSink {
public:
    Nlw_MessageStyle(const std::string& style, bool debug);
    ~Nlw_MessageStyle() override;
    Nlw_MessageStyle(const Nlw_MessageStyle&) = delete;
    Nlw_MessageStyle& operator=(const Nlw_MessageStyle&) = delete;
    // Opens the wrap log for appending; false when it cannot be opened.
    bool OpenWrapLog(const char* path);
    void Receive(const Port_Msg& msg) override;

private:
    std::string style_;
    bool debug_;
    std::FILE* wrapLog_ = nullptr;
};
