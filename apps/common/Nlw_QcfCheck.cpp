// -qcf: the names a physical constraints file constrains, checked against
// the design.
//
// The file is a list of statements, each ended by ";"; "#" starts a comment
// that runs to the end of the line. A statement that begins with NET, INST
// or PIN (any case) constrains the name that follows the keyword, in double
// quotes or bare: a net (a signal of any module, by its own name or its path
// from the top joined with "/"), an instance (likewise), or a port of the top
// module. A "*" in a name stands for any run of characters. Other statements
// (timing groups, configuration) name nothing to check.
#include <cctype>
#include <cstring>
#include <fstream>
#include <sstream>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <vector>

#include "Nlw_HostSteps.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "port/UT.h"

namespace {

struct DesignNames {
    std::unordered_set<std::string> nets, insts, pins;
};

void AddNamed(std::unordered_set<std::string>& set, const std::string& path, const char* name,
              const char* aka) {
    if (name && *name) {
        set.insert(name);
        if (!path.empty()) set.insert(path + "/" + name);
    }
    if (aka && *aka) set.insert(aka);
}

DesignNames Collect(const Nlw_NlView& view) {
    DesignNames names;
    std::unordered_map<const Nlw_NlBlock*, std::string> paths;
    const Nlw_NlBlock* root = view.GetRootMacro();
    for (const Nlw_NlBlock* macro : view.GetMacros()) {
        if (macro == nullptr || !macro->IsMacro()) continue;
        std::string path;
        if (macro != root && macro->GetParent()) {
            const std::string& up = paths[macro->GetParent()];
            path = up.empty() ? macro->GetInstanceName() : up + "/" + macro->GetInstanceName();
        }
        paths[macro] = path;
        for (const Nlw_NlSignal* s : macro->GetSignals()) {
            AddNamed(names.nets, path, s->GetModelName(), s->GetAka());
            AddNamed(names.nets, path, s->GetWritableName(), nullptr);
        }
        if (const UT_DARRAY<Nlw_NlBus*>* buses = macro->GetSignalBuses())
            for (const Nlw_NlBus* bus : *buses)
                if (bus) AddNamed(names.nets, path, bus->GetWritableName(), bus->GetAka());
        for (const Nlw_NlBlock* child : macro->GetChildren())
            AddNamed(names.insts, path, child->GetInstanceName(), child->GetAka());
    }
    if (root) {
        for (const Nlw_NlPin& pin : root->GetPins())
            AddNamed(names.pins, "", pin.GetWritableName(), pin.GetAka());
        if (const UT_DARRAY<Nlw_NlPinBus*>* buses = root->GetPinBuses())
            for (const Nlw_NlPinBus* bus : *buses)
                if (bus) AddNamed(names.pins, "", bus->GetWritableName(), bus->GetAka());
    }
    // A port is also the net it stands for.
    names.nets.insert(names.pins.begin(), names.pins.end());
    return names;
}

bool Exists(const std::unordered_set<std::string>& set, const std::string& name) {
    if (name.find('*') == std::string::npos) return set.count(name) > 0;
    for (const std::string& n : set)
        if (UT_STR::IMatch(n.c_str(), name.c_str())) return true;
    return false;
}

}  // namespace

bool Nlw_CheckQcfFile(const Nlw_NlView& view, const char* fileName) {
    Port_MsgManData msg = Port_MsgManData::createObject("NetListWriters");
    std::ifstream in(fileName, std::ios::binary);
    std::stringstream text;
    if (!in || !(text << in.rdbuf())) {
        msg.issueError("Cannot read QCF file '%s'.\n", fileName);
        return false;
    }
    const DesignNames names = Collect(view);
    const std::string body = text.str();
    // Walks the statements, keeping the line each one starts on.
    size_t pos = 0;
    int line = 1;
    while (pos < body.size()) {
        std::string statement;
        int startLine = 0;
        for (; pos < body.size() && body[pos] != ';'; ++pos) {
            char c = body[pos];
            if (c == '#') {
                while (pos < body.size() && body[pos] != '\n') ++pos;
                if (pos == body.size()) break;
                c = '\n';
            }
            if (c == '\n') ++line;
            if (!startLine && !std::isspace(static_cast<unsigned char>(c))) startLine = line;
            statement += c;
        }
        ++pos;
        std::istringstream words(statement);
        std::string keyword;
        if (!(words >> keyword)) continue;
        for (char& c : keyword) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
        const std::unordered_set<std::string>* set = keyword == "NET"    ? &names.nets
                                                     : keyword == "INST" ? &names.insts
                                                     : keyword == "PIN"  ? &names.pins
                                                                         : nullptr;
        if (set == nullptr) continue;
        words >> std::ws;
        std::string name;
        if (words.peek() == '"') {
            words.get();
            std::getline(words, name, '"');
        } else {
            words >> name;
        }
        if (!name.empty() && !Exists(*set, name))
            msg.issueWarning("QCF file '%s' line %d: %s '%s' is not in the design.\n", fileName,
                             startLine, keyword.c_str(), name.c_str());
    }
    return true;
}
