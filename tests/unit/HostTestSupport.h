// Helpers shared by the host service tests: scratch directories, files,
// environment settings and minimal writer classes.
#pragma once

#include <unistd.h>

#include <cstdio>

#include "TestFiles.h"
#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Writer.h"

namespace hosttest {

using namespace nlwtest;

// Names in dir, one per line, sorted.
inline std::string ListDir(const std::string& dir) {
    std::string out;
    FILE* p = ::popen(("ls -A '" + dir + "'").c_str(), "r");
    char line[512];
    while (p && std::fgets(line, sizeof line, p)) out += line;
    if (p) ::pclose(p);
    return out;
}

// Keeps expected messages off the terminal while capturing them.
class QuietCapture : public Port_MsgCapture {
public:
    QuietCapture() { Port_MsgManager::Instance().SetConsole(false); }
    ~QuietCapture() override { Port_MsgManager::Instance().SetConsole(true); }
    size_t Count(Port_MsgLevel level) const { return Texts(level).size(); }
};

// A netlist writer with the format operations stubbed out.
class StubNetlistWriter : public Nlw_NetlistWriter {
public:
    HelpFunction GetHelp() override { return nullptr; }
    const char** GetReservedWords() override { return nullptr; }
    unsigned char IsEscaped(const char*) override { return 0; }
    const char* Escape(const char* name, unsigned char) override { return name; }
    const char* GetRangeString(Nlw_NlBus*) override { return ""; }
    const char* GetIndexesString(DARRAY_Util_INT32*) override { return ""; }
    void WriteDesign() override {}
    void WriteHeader(Nlw_Writer*) override {}
    unsigned char AddIfSimulatableProperty(Nlw_NlBlock*, Vdm_Property*, Vdm_Property*) override {
        return 0;
    }
};

// A file writer that writes nothing of its own.
class PlainWriter : public Nlw_Writer {
public:
    using Nlw_Writer::Nlw_Writer;
    void WriteView(Nlw_NlView*, unsigned char) override {}
    void WriteBlock(Nlw_NlBlock*) override {}
};

}  // namespace hosttest
