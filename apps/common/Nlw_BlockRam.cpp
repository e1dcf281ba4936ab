// -bd and -bx: block RAM contents from and to memory files.
//
// A block RAM is an instance of a cell whose type begins with "V_RAMB" (any
// case). Its contents are the INIT_00, INIT_01, ... parameters that the
// installation's parameter table defines for the type, INIT_00 holding the
// least significant bits; a word is as wide as the cell's widest output bus,
// so word i is bits [W*i +: W] of {..., INIT_01, INIT_00}.
//
// Memory files are in the form $readmemh reads: hexadecimal words separated
// by white space, "@<hex>" moving to a word address, "//" and "#" starting a
// comment. A -bd file replaces the words it gives and leaves the others.
#include <cctype>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <map>
#include <set>
#include <sstream>
#include <string>
#include <vector>

#include "Nlw_HostSteps.h"
#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Writer.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "port/UT.h"

namespace {

struct InitParam {
    std::string name;
    int width = 0;
};

struct BlockRam {
    Nlw_NlBlock* block = nullptr;
    std::string path;  // instance path from the top, joined with "/"
    std::vector<InitParam> params;
    int wordWidth = 1;
    std::vector<bool> bits;  // all contents, bit 0 first

    size_t Depth() const { return bits.size() / static_cast<size_t>(wordWidth); }
};

int HexValue(char c) {
    if (c >= '0' && c <= '9') return c - '0';
    c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return c >= 'a' && c <= 'f' ? c - 'a' + 10 : -1;
}

// The bits of a Verilog literal "<w>'h<hex>" or "<w>'b<bits>", least
// significant first, width bits; what cannot be read counts as 0.
std::vector<bool> LiteralBits(const char* text, int width) {
    std::vector<bool> bits(static_cast<size_t>(width), false);
    const char* tick = text ? std::strchr(text, '\'') : nullptr;
    if (tick == nullptr || tick[1] == '\0') return bits;
    const bool hex = tick[1] == 'h' || tick[1] == 'H';
    const int step = hex ? 4 : 1;
    std::string digits;
    for (const char* p = tick + 2; *p; ++p)
        if (*p != '_') digits += *p;
    size_t bit = 0;
    for (size_t i = digits.size(); i-- > 0 && bit < bits.size();) {
        const int v = hex ? HexValue(digits[i]) : digits[i] == '1' ? 1 : 0;
        for (int k = 0; k < step && bit < bits.size(); ++k, ++bit)
            bits[bit] = v > 0 && (v >> k) & 1;
    }
    return bits;
}

std::string HexText(const std::vector<bool>& bits, size_t first, int width) {
    std::string text;
    for (int d = (width + 3) / 4 - 1; d >= 0; --d) {
        int v = 0;
        for (int k = 3; k >= 0; --k) {
            const int bit = d * 4 + k;
            v = v * 2 + (bit < width && bits[first + static_cast<size_t>(bit)] ? 1 : 0);
        }
        text += "0123456789ABCDEF"[v];
    }
    return text;
}

bool IsInitName(const std::string& name) {
    return name.size() == 7 && UT_STR::INCompare(name.c_str(), "INIT_", 5) == 0 &&
           HexValue(name[5]) >= 0 && HexValue(name[6]) >= 0;
}

Vdm_Property* FindElement(Vdm_Property* list, const char* name) {
    if (list == nullptr) return nullptr;
    for (Vdm_Property* e : list->GetElements())
        if (UT_STR::ICompare(e->GetName(), name) == 0) return e;
    return nullptr;
}

// Every block RAM of the view with its contents as the netlist will write
// them (its parameters, or the table's defaults).
std::vector<BlockRam> FindBlockRams(Nlw_NetlistWriter& nlw) {
    std::vector<BlockRam> rams;
    Nlw_NlView* view = nlw.GetView();
    if (view == nullptr) return rams;
    std::map<const Nlw_NlBlock*, std::string> paths;
    for (Nlw_NlBlock* macro : view->GetMacros()) {
        if (macro == nullptr || !macro->IsMacro()) continue;
        std::string path;
        if (macro->GetParent()) {
            const std::string& up = paths[macro->GetParent()];
            path = (up.empty() ? "" : up + "/") + macro->GetInstanceName();
        }
        paths[macro] = path;
        for (Nlw_NlBlock* child : macro->GetChildren()) {
            if (child->IsMacro() || UT_STR::INCompare(child->GetTypeName(), "V_RAMB", 6) != 0)
                continue;
            auto defs = nlw.simPropTable.find(Port::String(child->GetTypeName()));
            if (defs == nlw.simPropTable.end()) continue;
            BlockRam ram;
            ram.block = child;
            ram.path = (path.empty() ? "" : path + "/") + child->GetInstanceName();
            std::vector<std::vector<bool>> parts;
            for (const Nlw_Property& def : *defs->second) {
                const std::string name = def.GetName().c_str();
                if (!IsInitName(name)) continue;
                const int width = std::atoi(def.GetDefault().c_str());
                if (width <= 0) continue;
                const Vdm_Property* given =
                    FindElement(child->GetExternalProperties(), name.c_str());
                parts.push_back(
                    LiteralBits(given ? given->GetString() : def.GetDefault().c_str(), width));
                ram.params.push_back({name, width});
            }
            if (ram.params.empty()) continue;
            for (const std::vector<bool>& p : parts)
                ram.bits.insert(ram.bits.end(), p.begin(), p.end());
            if (const UT_DARRAY<Nlw_NlPinBus*>* buses = child->GetPinBuses())
                for (const Nlw_NlPinBus* bus : *buses)
                    if (bus && bus->GetDirection() == NLW_DIR_OUTPUT &&
                        bus->GetWidth() > ram.wordWidth)
                        ram.wordWidth = bus->GetWidth();
            rams.push_back(std::move(ram));
        }
    }
    return rams;
}

// Reads a memory file into the RAM's words; false with the problem in error.
bool ReadMemoryFile(const std::string& file, BlockRam& ram, std::string& error) {
    std::ifstream in(file, std::ios::binary);
    std::stringstream text;
    if (!in || !(text << in.rdbuf())) {
        error = "cannot be read";
        return false;
    }
    const std::string body = text.str();
    size_t address = 0;
    int line = 1;
    for (size_t pos = 0; pos < body.size();) {
        const char c = body[pos];
        if (c == '\n') ++line;
        if (std::isspace(static_cast<unsigned char>(c))) {
            ++pos;
            continue;
        }
        if (c == '#' || body.compare(pos, 2, "//") == 0) {
            while (pos < body.size() && body[pos] != '\n') ++pos;
            continue;
        }
        size_t end = pos;
        while (end < body.size() && !std::isspace(static_cast<unsigned char>(body[end]))) ++end;
        std::string word = body.substr(pos, end - pos);
        pos = end;
        const bool isAddress = word[0] == '@';
        if (isAddress) word.erase(0, 1);
        std::vector<int> digits;
        for (char d : word)
            if (d != '_') digits.push_back(HexValue(d));
        bool good = !digits.empty();
        for (int d : digits) good = good && d >= 0;
        if (!good) {
            error = "line " + std::to_string(line) + ": '" + word + "' is not a hexadecimal " +
                    (isAddress ? "address" : "word");
            return false;
        }
        if (isAddress) {
            address = 0;
            for (int d : digits) {
                address = address * 16 + static_cast<size_t>(d);
                if (address > ram.Depth()) break;
            }
            continue;
        }
        if (address >= ram.Depth()) {
            error = "line " + std::to_string(line) + ": word " + std::to_string(address) +
                    " is past the end of block RAM '" + ram.path + "' (" +
                    std::to_string(ram.Depth()) + " words)";
            return false;
        }
        const size_t first = address * static_cast<size_t>(ram.wordWidth);
        size_t bit = 0;
        for (size_t i = digits.size(); i-- > 0;)
            for (int k = 0; k < 4; ++k, ++bit) {
                const bool one = (digits[i] >> k) & 1;
                if (bit < static_cast<size_t>(ram.wordWidth))
                    ram.bits[first + bit] = one;
                else if (one) {
                    error = "line " + std::to_string(line) + ": '" + word + "' is wider than " +
                            std::to_string(ram.wordWidth) + " bits";
                    return false;
                }
            }
        for (; bit < static_cast<size_t>(ram.wordWidth); ++bit) ram.bits[first + bit] = false;
        ++address;
    }
    return true;
}

// Writes the RAM's contents back into its INIT parameters.
void StoreContents(const BlockRam& ram) {
    Vdm_Property* list = ram.block->GetExternalProperties();
    if (list == nullptr) {
        ram.block->SetExternalProperties(Vdm_Property::NewList("NLW_EXTERNAL_PROPERTIES"));
        list = ram.block->GetExternalProperties();
    }
    size_t first = 0;
    for (const InitParam& p : ram.params) {
        const std::string text = std::to_string(p.width) + "'h" + HexText(ram.bits, first, p.width);
        first += static_cast<size_t>(p.width);
        if (Vdm_Property* e = FindElement(list, p.name.c_str()))
            e->SetString(text.c_str());
        else
            list->CreatePropertyString(p.name.c_str(), text.c_str());
    }
}

bool Matches(const BlockRam& ram, const std::string& tag) {
    const char* aka = ram.block->GetAka();
    return tag == ram.path || tag == ram.block->GetInstanceName() || (aka && tag == aka);
}

// A memory file for one RAM: a comment head, then one word per line.
class MemoryFileWriter : public Nlw_Writer {
public:
    using Nlw_Writer::Nlw_Writer;
    void WriteView(Nlw_NlView*, unsigned char) override {}
    void WriteBlock(Nlw_NlBlock*) override {}
    void WriteRam(const BlockRam& ram) {
        WriteL(vorform("// %s: %s, %zu words of %d bits", ram.path.c_str(),
                       ram.block->GetTypeName(), ram.Depth(), ram.wordWidth));
        for (size_t w = 0; w < ram.Depth(); ++w)
            WriteL(
                HexText(ram.bits, w * static_cast<size_t>(ram.wordWidth), ram.wordWidth).c_str());
    }
};

// A file name made of the RAM's path: characters other than letters,
// digits, "_", "-" and "." become "_", "/" becomes ".".
std::string FileStem(const std::string& path) {
    std::string stem = path;
    for (char& c : stem) {
        if (c == '/')
            c = '.';
        else if (!std::isalnum(static_cast<unsigned char>(c)) && c != '_' && c != '-' && c != '.')
            c = '_';
    }
    if (stem.empty() || stem[0] == '.') stem.insert(0, "_");
    return stem;
}

}  // namespace

bool Nlw_LoadBlockRamData(Nlw_NetlistWriter& nlw,
                          const std::vector<Nlw_CommandLine::BramData>& data) {
    Port_MsgManData msg = Port_MsgManData::createObject("NetListWriters");
    std::vector<BlockRam> rams = FindBlockRams(nlw);
    std::set<size_t> tagged;
    for (const Nlw_CommandLine::BramData& d : data)
        for (size_t r = 0; r < rams.size(); ++r)
            if (!d.tag.empty() && Matches(rams[r], d.tag)) tagged.insert(r);
    std::set<size_t> changed;
    for (const Nlw_CommandLine::BramData& d : data) {
        size_t used = 0;
        for (size_t r = 0; r < rams.size(); ++r) {
            if (d.tag.empty() ? tagged.count(r) > 0 : !Matches(rams[r], d.tag)) continue;
            std::string error;
            if (!ReadMemoryFile(d.file, rams[r], error)) {
                msg.issueError("Block RAM data file '%s': %s.\n", d.file.c_str(), error.c_str());
                return false;
            }
            changed.insert(r);
            ++used;
        }
        if (used == 0)
            msg.issueWarning("Block RAM data file '%s'%s%s%s fills no block RAM of the design.\n",
                             d.file.c_str(), d.tag.empty() ? "" : " (tag '", d.tag.c_str(),
                             d.tag.empty() ? "" : "')");
    }
    for (size_t r : changed) StoreContents(rams[r]);
    return true;
}

bool Nlw_WriteBlockRamFiles(Nlw_NetlistWriter& nlw, const char* dir) {
    Port_MsgManData msg = Port_MsgManData::createObject("NetListWriters");
    std::vector<BlockRam> rams = FindBlockRams(nlw);
    if (rams.empty()) {
        msg.issueWarning("Option '-bx': the design has no block RAM; no memory file is written.\n");
        return true;
    }
    std::error_code ec;
    std::filesystem::create_directories(dir, ec);
    if (ec || !std::filesystem::is_directory(dir)) {
        msg.issueError("Cannot make the block RAM directory '%s'.\n", dir);
        return false;
    }
    std::set<std::string> used;
    for (const BlockRam& ram : rams) {
        std::string stem = FileStem(ram.path);
        for (int k = 1; !used.insert(stem).second; ++k)
            stem = FileStem(ram.path) + "_" + std::to_string(k);
        const std::string file = std::string(dir) + "/" + stem + ".mem";
        msg.issueStatus("Writing block RAM contents file '%s' ...\n", file.c_str());
        MemoryFileWriter writer(&nlw, file.c_str(), nlw.GetParams()->GetOutputFileMode());
        writer.WriteRam(ram);
    }
    return true;
}
