// Reads the installation's cell library file.
#include <cerrno>
#include <climits>
#include <cstdlib>
#include <cstring>
#include <unordered_set>

#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "reader/Nlw_CellLibrary.h"

namespace {

std::vector<std::string> Tokens(const std::string& line) {
    std::vector<std::string> out;
    size_t i = 0, n = line.size();
    while (i < n) {
        while (i < n && (line[i] == ' ' || line[i] == '\t' || line[i] == '\r')) ++i;
        if (i >= n || line[i] == '#') break;
        size_t b = i;
        while (i < n && line[i] != ' ' && line[i] != '\t' && line[i] != '\r' && line[i] != '#') ++i;
        out.emplace_back(line, b, i - b);
    }
    return out;
}

int ParseDirection(const std::string& word) {
    if (word == "input") return NLW_DIR_INPUT;
    if (word == "output") return NLW_DIR_OUTPUT;
    if (word == "inout") return NLW_DIR_INOUT;
    return -1;
}

bool ParseIndex(const std::string& text, int32_t& value) {
    if (text.empty()) return false;
    errno = 0;
    char* end = nullptr;
    long long v = std::strtoll(text.c_str(), &end, 10);
    if (errno != 0 || *end != '\0' || v < INT32_MIN || v > INT32_MAX) return false;
    value = static_cast<int32_t>(v);
    return true;
}

}  // namespace

bool Nlw_CellLibrary::Load(const char* path, std::string& error) {
    std::string text, reason;
    if (!Port::File::readAll(path, text, &reason)) {
        error = std::string(path ? path : "") + ": " + (reason.empty() ? "cannot read" : reason);
        return false;
    }
    return Parse(text, path, error);
}

bool Nlw_CellLibrary::Parse(const std::string& text, const char* origin, std::string& error) {
    const std::string where = origin ? origin : "";
    Nlw_CellDef* cell = nullptr;
    // Pin names of the cell being read, to refuse a pin given twice.
    std::unordered_set<std::string> pinNames;
    size_t lineNo = 0, pos = 0;
    auto fail = [&](const std::string& what) {
        error = where + ":" + std::to_string(lineNo) + ": " + what;
        return false;
    };
    while (pos <= text.size()) {
        size_t end = text.find('\n', pos);
        if (end == std::string::npos) end = text.size();
        ++lineNo;
        std::vector<std::string> tok = Tokens(text.substr(pos, end - pos));
        pos = end + 1;
        if (tok.empty()) continue;
        const std::string& kw = tok[0];
        if (kw == "cell") {
            if (tok.size() < 3 || tok.size() > 4) return fail("expected 'cell NAME CLASS [pad]'");
            if (tok[2] != "timcell" && tok[2] != "funcell")
                return fail("unknown cell class '" + tok[2] + "' (timcell or funcell)");
            if (tok.size() == 4 && tok[3] != "pad") return fail("unexpected '" + tok[3] + "'");
            if (index_.count(tok[1])) return fail("cell '" + tok[1] + "' is defined twice");
            index_.emplace(tok[1], cells_.size());
            cells_.emplace_back();
            cell = &cells_.back();
            cell->name = tok[1];
            cell->timcell = tok[2] == "timcell";
            cell->funcell = tok[2] == "funcell";
            cell->pad = tok.size() == 4;
            pinNames.clear();
        } else if (kw == "pin" || kw == "bus") {
            if (!cell) return fail("'" + kw + "' before the first 'cell'");
            Nlw_CellPinDef pin;
            size_t fixed = kw == "pin" ? 3 : 5;
            if (tok.size() < fixed || tok.size() > fixed + 1)
                return fail(kw == "pin" ? "expected 'pin NAME DIR [pad]'"
                                        : "expected 'bus NAME DIR MSB LSB'");
            pin.name = tok[1];
            pin.dir = ParseDirection(tok[2]);
            if (pin.dir < 0)
                return fail("unknown direction '" + tok[2] + "' (input, output or inout)");
            if (kw == "bus") {
                pin.bus = true;
                if (!ParseIndex(tok[3], pin.msb) || !ParseIndex(tok[4], pin.lsb))
                    return fail("bad bus range '" + tok[3] + " " + tok[4] + "'");
                // Every bit becomes a pin of every instance: a width beyond
                // this is a fault of the file, not a cell.
                const int64_t width =
                    (pin.msb > pin.lsb ? int64_t(pin.msb) - pin.lsb : int64_t(pin.lsb) - pin.msb) +
                    1;
                if (width > kMaxBusWidth)
                    return fail("bus '" + pin.name + "' is " + std::to_string(width) +
                                " bits wide; at most " + std::to_string(kMaxBusWidth) +
                                " bits are allowed");
            }
            if (tok.size() == fixed + 1) {
                if (tok[fixed] != "pad") return fail("unexpected '" + tok[fixed] + "'");
                pin.pad = true;
            }
            if (!pinNames.insert(pin.name).second)
                return fail("pin '" + pin.name + "' of cell '" + cell->name + "' is given twice");
            cell->pins.push_back(std::move(pin));
        } else {
            return fail("unknown keyword '" + kw + "'");
        }
    }
    return true;
}

const Nlw_CellDef* Nlw_CellLibrary::Find(const std::string& name) const {
    auto it = index_.find(name);
    return it == index_.end() ? nullptr : &cells_[it->second];
}
