#include "reader/Nlw_Liberty.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <sstream>

#include "port/Port.h"

namespace {

struct LibError {
    int line;
    std::string text;
};

// One group of the file: "type (args) { attributes and groups }". Simple
// attributes ("name : value ;") and complex ones ("name (args) ;") are both
// kept as name and value text.
struct Group {
    std::string type;
    std::vector<std::string> args;
    std::vector<std::pair<std::string, std::string>> attrs;
    std::vector<Group> groups;
    int line = 0;

    const std::string* Attr(const char* name) const {
        for (const auto& a : attrs)
            if (a.first == name) return &a.second;
        return nullptr;
    }
};

class LibParser {
public:
    explicit LibParser(const std::string& text) : p_(text.c_str()), end_(p_ + text.size()) {}

    Group ParseFile() {
        Group top;
        ParseStatement(top);
        Skip();
        if (p_ < end_) throw LibError{line_, "text follows the library group"};
        if (top.groups.empty() || top.groups[0].type != "library")
            throw LibError{1, "the file holds no library group"};
        return std::move(top.groups[0]);
    }

private:
    void Skip() {
        while (p_ < end_) {
            if (*p_ == '\n') {
                ++line_;
                ++p_;
            } else if (*p_ == ' ' || *p_ == '\t' || *p_ == '\r' ||
                       (*p_ == '\\' && p_ + 1 < end_ && (p_[1] == '\n' || p_[1] == '\r'))) {
                ++p_;
            } else if (*p_ == '/' && p_ + 1 < end_ && p_[1] == '*') {
                p_ += 2;
                while (p_ + 1 < end_ && !(p_[0] == '*' && p_[1] == '/')) {
                    if (*p_ == '\n') ++line_;
                    ++p_;
                }
                if (p_ + 1 >= end_) throw LibError{line_, "a comment does not end"};
                p_ += 2;
            } else if (*p_ == '/' && p_ + 1 < end_ && p_[1] == '/') {
                while (p_ < end_ && *p_ != '\n') ++p_;
            } else {
                break;
            }
        }
    }

    // A word, or a quoted string without its quotes.
    std::string Word() {
        Skip();
        if (p_ >= end_) throw LibError{line_, "the file ends early"};
        if (*p_ == '"') {
            const char* s = ++p_;
            while (p_ < end_ && *p_ != '"') {
                if (*p_ == '\n') ++line_;
                ++p_;
            }
            if (p_ >= end_) throw LibError{line_, "a quoted string does not end"};
            return std::string(s, p_++);
        }
        const char* s = p_;
        while (p_ < end_ && !std::strchr(" \t\r\n(){}:;,\"", *p_)) ++p_;
        if (s == p_) throw LibError{line_, std::string("unexpected '") + *p_ + "'"};
        return std::string(s, p_);
    }

    bool Next(char c) {
        Skip();
        if (p_ < end_ && *p_ == c) {
            ++p_;
            return true;
        }
        return false;
    }

    void ParseStatement(Group& parent) {
        const int line = line_;
        std::string name = Word();
        if (Next(':')) {
            std::string value = Word();
            // Expressions such as "A & B" run on to the semicolon.
            while (!Next(';')) {
                Skip();
                if (p_ >= end_ || *p_ == '}') throw LibError{line_, "expected ';'"};
                value += ' ' + Word();
            }
            parent.attrs.emplace_back(std::move(name), std::move(value));
            return;
        }
        if (!Next('(')) throw LibError{line_, "expected ':' or '(' after '" + name + "'"};
        std::vector<std::string> args;
        for (;;) {
            if (Next(')')) break;
            if (!args.empty()) Next(',');
            if (Next(')')) break;
            args.push_back(Word());
        }
        if (Next('{')) {
            Group g;
            g.type = std::move(name);
            g.args = std::move(args);
            g.line = line;
            while (!Next('}')) {
                Skip();
                if (p_ >= end_) throw LibError{line_, "group '" + g.type + "' does not end"};
                ParseStatement(g);
            }
            parent.groups.push_back(std::move(g));
            return;
        }
        Next(';');
        std::string value;
        for (const std::string& a : args) value += (value.empty() ? "" : ",") + a;
        parent.attrs.emplace_back(std::move(name), std::move(value));
    }

    const char* p_;
    const char* end_;
    int line_ = 1;
};

// The first number of a scalar table's values.
bool TableValue(const Group& table, double scale, double& out) {
    const std::string* values = table.Attr("values");
    if (values == nullptr) return false;
    char* rest = nullptr;
    const double v = std::strtod(values->c_str(), &rest);
    if (rest == values->c_str()) return false;
    out = v * scale;
    return true;
}

void AddArcs(const Group& pin, double scale, std::vector<Nlw_LibertyArc>& arcs) {
    for (const std::string& pinName : pin.args) {
        for (const Group& t : pin.groups) {
            if (t.type != "timing") continue;
            const std::string* related = t.Attr("related_pin");
            if (related == nullptr) continue;
            const std::string* typeAttr = t.Attr("timing_type");
            const std::string type = typeAttr ? *typeAttr : "combinational";
            Nlw_LibertyArc arc;
            arc.pin = pinName;
            const bool falling = type.find("falling") != std::string::npos;
            arc.edge = falling ? NLW_EDGE_NEG : NLW_EDGE_POS;
            if (type == "combinational") {
                arc.edge = NLW_EDGE_NONE;
            } else if (type.rfind("setup_", 0) == 0) {
                arc.kind = Nlw_TimingKind::Setup;
            } else if (type.rfind("hold_", 0) == 0) {
                arc.kind = Nlw_TimingKind::Hold;
            } else if (type.rfind("recovery_", 0) == 0) {
                arc.kind = Nlw_TimingKind::Recovery;
            } else if (type.rfind("removal_", 0) == 0) {
                arc.kind = Nlw_TimingKind::Removal;
            } else if (type == "clear" || type == "preset") {
                // The shipped cells' asynchronous controls act on their
                // rising edge, as their specify blocks say.
                arc.edge = NLW_EDGE_POS;
            } else if (type != "rising_edge" && type != "falling_edge") {
                continue;
            }
            const bool check = arc.kind != Nlw_TimingKind::IoPath;
            for (const Group& table : t.groups) {
                if (table.type == (check ? "rise_constraint" : "cell_rise"))
                    arc.hasRise = TableValue(table, scale, arc.rise);
                if (table.type == (check ? "fall_constraint" : "cell_fall"))
                    arc.hasFall = TableValue(table, scale, arc.fall);
            }
            if (!arc.hasRise && !arc.hasFall) continue;
            // A related pin list names several inputs of one arc.
            std::istringstream names(*related);
            std::string name;
            while (names >> name) {
                arc.related = name;
                arcs.push_back(arc);
            }
        }
    }
}

}  // namespace

bool Nlw_Liberty::LoadText(const char* fileName, const std::string& text) {
    try {
        Group lib = LibParser(text).ParseFile();
        double scale = 1000.0;  // Liberty's default time unit is 1ns
        if (const std::string* unit = lib.Attr("time_unit")) {
            if (*unit == "1ps")
                scale = 1;
            else if (*unit == "10ps")
                scale = 10;
            else if (*unit == "100ps")
                scale = 100;
            else if (*unit != "1ns")
                throw LibError{lib.line, "time_unit '" + *unit + "' is not supported"};
        }
        for (const Group& cell : lib.groups) {
            if (cell.type != "cell" || cell.args.empty()) continue;
            std::vector<Nlw_LibertyArc>& arcs = cells_[cell.args[0]];
            for (const Group& pin : cell.groups)
                if (pin.type == "pin" || pin.type == "bus") AddArcs(pin, scale, arcs);
        }
    } catch (const LibError& e) {
        NLW_MSG().issueError("%s:%d: %s\n", fileName, e.line, e.text.c_str());
        cells_.clear();
        return false;
    }
    return true;
}

bool Nlw_Liberty::Load(const char* fileName) {
    std::ifstream in(fileName, std::ios::binary);
    if (!in) {
        NLW_MSG().issueError("%s: cannot read the Liberty file: %s\n", fileName,
                             std::strerror(errno));
        return false;
    }
    std::ostringstream text;
    text << in.rdbuf();
    return LoadText(fileName, text.str());
}

const std::vector<Nlw_LibertyArc>* Nlw_Liberty::FindCell(const std::string& name) const {
    auto it = cells_.find(name);
    return it == cells_.end() ? nullptr : &it->second;
}
