// Helpers of the design reader tests: loading JSON text or files, a private
// installation with chosen data files, running yosys, and model lookups.
#pragma once

#include <gtest/gtest.h>
#include <stdlib.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "ModelText.h"
#include "TestFiles.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "reader/Nlw_JsonReader.h"

namespace readertest {

using nlwtest::Exists;
using nlwtest::ReadFile;
using nlwtest::TempDir;
using nlwtest::WriteFile;

// An installation root of the test's own, with the data files given (a
// name and its text each), made the only installation while it lives.
struct DataFile {
    std::string name, text;
};
using DataFiles = std::vector<DataFile>;

class Installation {
public:
    explicit Installation(const DataFiles& files = {}) {
        for (const DataFile& f : files) dir_.File("data/" + f.name, f.text);
        dir_.Dir("data");
        vornix_.Set(dir_.path().c_str());
    }
    const std::string& path() const { return dir_.path(); }

private:
    TempDir dir_;
    nlwtest::ScopedEnv vornix_{"VORNIX", nullptr};
};

// A small library of cells the tests know by heart.
inline std::string TestCells() {
    return nlwtest::Data("cells/test_cells.dat");
}

// A loaded design with the messages the load gave.
struct Loaded {
    std::unique_ptr<Nlw_NlView> view = std::make_unique<Nlw_NlView>();
    std::unique_ptr<Nlw_Design> design;
    bool ok = false;
    std::vector<std::string> errors, warnings;

    Nlw_NlBlock* root() const { return view->GetRootMacro(); }
};

// Loads through read, which is given the view and design to fill.
template <typename Read>
Loaded Load(Read read) {
    Loaded l;
    Port_MsgCapture capture;
    l.ok = read(*l.view, l.design);
    l.errors = capture.Texts(Port_MsgLevel::Error);
    l.warnings = capture.Texts(Port_MsgLevel::Warning);
    return l;
}

inline Loaded LoadText(const std::string& json, Nlw_ReadOptions options = {},
                       const char* name = "test.json") {
    return Load([&](Nlw_NlView& view, std::unique_ptr<Nlw_Design>& design) {
        return Nlw_JsonReader::LoadText(json, name, options, view, design);
    });
}

inline Loaded LoadFile(const std::string& path, Nlw_ReadOptions options = {}) {
    return Load([&](Nlw_NlView& view, std::unique_ptr<Nlw_Design>& design) {
        return Nlw_JsonReader::Load(path.c_str(), options, view, design);
    });
}

// The loaded design and the load's messages, for a golden file.
inline std::string Text(const Loaded& l) {
    std::string out = nlwtest::ModelText(*l.view);
    for (const std::string& e : l.errors) out += "error: " + e;
    for (const std::string& w : l.warnings) out += "warning: " + w;
    return out;
}

inline bool HaveYosys() {
    static const int status = std::system("yosys -V >/dev/null 2>&1");
    return status == 0;
}

// Synthesizes Verilog with yosys into a netlist JSON file in dir; script is
// the yosys commands run between reading and writing.
inline std::string Synthesize(const TempDir& dir, const std::string& verilog,
                              const std::string& script) {
    WriteFile(dir / "design.v", verilog);
    std::string json = dir / "design.json";
    std::string cmd = "cd '" + dir.path() + "' && yosys -q -p 'read_verilog design.v; " + script +
                      "; write_json design.json' > yosys.log 2>&1";
    EXPECT_EQ(std::system(cmd.c_str()), 0) << ReadFile(dir / "yosys.log");
    return json;
}

// Lookups by writable name; linear, for tests only.
inline Nlw_NlBlock* Child(const Nlw_NlBlock* parent, const std::string& name) {
    for (Nlw_NlBlock* c : parent->GetChildren())
        if (name == c->GetInstanceName()) return c;
    return nullptr;
}

inline Nlw_NlPinBus* PinBus(const Nlw_NlBlock* block, const std::string& name) {
    if (const UT_DARRAY<Nlw_NlPinBus*>* buses = block->GetPinBuses())
        for (Nlw_NlPinBus* b : *buses)
            if (name == b->GetWritableName()) return b;
    return nullptr;
}

// The name of the signal on a pin (outside), "" when none.
inline std::string NetOf(const Nlw_NlBlock* block, const std::string& pin) {
    Nlw_NlPin* p = block->GetPinByAlias(pin.c_str());
    if (!p) return "<no pin " + pin + ">";
    return p->GetSignal() ? p->GetSignal()->GetWritableName() : "";
}

// The name of a port's inside signal, "" when none.
inline std::string InsideOf(const Nlw_NlBlock* macro, const std::string& port) {
    Nlw_NlPin* p = macro->GetPinByAlias(port.c_str());
    if (!p) return "<no port " + port + ">";
    return p->GetChildSignal() ? p->GetChildSignal()->GetWritableName() : "";
}

inline int TieOf(const Nlw_NlBlock* block, const std::string& pin) {
    Nlw_NlPin* p = block->GetPinByAlias(pin.c_str());
    const Vdm_Property* t = p ? p->GetPropertyByName("TIEOFF") : nullptr;
    return t ? t->GetInt32() : -1;
}

inline bool Contains(const std::string& text, const std::string& part) {
    return text.find(part) != std::string::npos;
}

}  // namespace readertest
