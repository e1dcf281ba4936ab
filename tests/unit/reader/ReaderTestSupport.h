// Helpers of the design reader tests: loading JSON text or files, a private
// installation with chosen data files, and model lookups.
#pragma once

#include <unistd.h>

#include <memory>

#include "ModelText.h"
#include "TestFiles.h"
#include "model/Nlw_Nl.h"
#include "reader/Nlw_JsonReader.h"

namespace readertest {

using namespace nlwtest;

// An installation root of the test's own, with the data files given (a
// name and its text each), made the only installation while it lives.
using DataFiles = std::vector<std::pair<std::string, std::string>>;

class Installation {
public:
    explicit Installation(const DataFiles& files = {}) {
        for (const auto& [name, text] : files) dir_.File("data/" + name, text);
        dir_.Dir("data");
        vornix_.Set(dir_.Path().c_str());
    }
    const std::string& Path() const { return dir_.Path(); }

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

// Lookups by writable name; linear, for tests only.
inline Nlw_NlBlock* Child(const Nlw_NlBlock* parent, const std::string& name) {
    for (Nlw_NlBlock* c : parent->GetChildren())
        if (name == c->GetInstanceName()) return c;
    return nullptr;
}

// The name of the signal on a pin (outside), "" when none.
inline std::string NetOf(const Nlw_NlBlock* block, const std::string& pin) {
    Nlw_NlPin* p = block->GetPinByAlias(pin.c_str());
    if (!p) return "<no pin " + pin + ">";
    return p->GetSignal() ? p->GetSignal()->GetWritableName() : "";
}

inline bool Contains(const std::string& text, const std::string& part) {
    return text.find(part) != std::string::npos;
}

}  // namespace readertest
