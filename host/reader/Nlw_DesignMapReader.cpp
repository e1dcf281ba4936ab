// The design map reader: parsed whole with simdjson, checked record by
// record against the loaded design before anything is kept.
#include "reader/Nlw_DesignMapReader.h"

#include <simdjson.h>
#include <sys/stat.h>

#include <cerrno>
#include <cstring>
#include <string>
#include <unordered_map>

#include "port/Port.h"

namespace {

struct MapError {
    std::string text;
};

[[noreturn]] void Fail(const std::string& text) {
    throw MapError{text};
}

std::string GetString(simdjson::dom::object record, const char* field, size_t index,
                      bool required) {
    simdjson::dom::element value;
    if (record[field].get(value) != simdjson::SUCCESS) {
        if (!required) return std::string();
        Fail("record " + std::to_string(index) + " has no \"" + field + "\"");
    }
    std::string_view text;
    if (value.get(text) != simdjson::SUCCESS || text.empty())
        Fail("record " + std::to_string(index) + ": \"" + field + "\" is not a name");
    return std::string(text);
}

// The modules of the view by type name, with the cells and nets of their
// first block, made on demand: every block of a type has the same names.
class DesignIndex {
public:
    explicit DesignIndex(Nlw_NlView& view) : view_(view) {}

    const Nlw_NlBlock* FindModule(const std::string& name) {
        auto it = blocks_.find(name);
        if (it != blocks_.end()) return it->second;
        const Nlw_NlBlock* found = nullptr;
        for (Nlw_NlBlock* block : view_.GetMacros())
            if (block && block->IsMacro() && name == block->GetTypeName()) {
                found = block;
                break;
            }
        blocks_.emplace(name, found);
        return found;
    }
    const Nlw_NlBlock* FindCell(const Nlw_NlBlock* module, const std::string& name) const {
        for (Nlw_NlBlock* child : module->GetChildren())
            if (name == child->GetWritableName()) return child;
        return nullptr;
    }
    const Nlw_NlSignal* FindNet(const Nlw_NlBlock* module, const std::string& name) const {
        for (Nlw_NlSignal* signal : module->GetSignals())
            if (name == signal->GetWritableName() || name == signal->GetModelName()) return signal;
        return nullptr;
    }

private:
    Nlw_NlView& view_;
    std::unordered_map<std::string, const Nlw_NlBlock*> blocks_;
};

AnnoVacuum ReadRecord(simdjson::dom::element element, size_t index, DesignIndex& design) {
    const std::string at = "record " + std::to_string(index);
    simdjson::dom::object record;
    if (element.get(record) != simdjson::SUCCESS) Fail(at + " is not an object");
    AnnoVacuum out;
    const std::string kind = GetString(record, "kind", index, true);
    const std::string module = GetString(record, "module", index, true);
    const Nlw_NlBlock* block = design.FindModule(module);
    if (block == nullptr) Fail(at + ": unknown module '" + module + "'");
    out.module = block->GetType();
    const std::string reg = GetString(record, "register", index, false);
    const std::string net = GetString(record, "net", index, false);
    if (reg.empty() == net.empty()) Fail(at + ": give exactly one of \"register\" and \"net\"");
    if (!net.empty() && kind != "renamed") Fail(at + ": only a \"renamed\" record names a net");
    out.original = reg.empty() ? net : reg;

    if (kind == "constant") {
        out.kind = AnnoVacuum::Constant;
        simdjson::dom::element value;
        int64_t number = -1;
        if (record["value"].get(value) != simdjson::SUCCESS ||
            value.get(number) != simdjson::SUCCESS || (number != 0 && number != 1))
            Fail(at + ": \"value\" must be 0 or 1");
        out.value = number ? '1' : '0';
    } else if (kind == "merged" || kind == "renamed") {
        out.kind = kind == "merged" ? AnnoVacuum::Merged : AnnoVacuum::Renamed;
        const std::string target =
            GetString(record, out.kind == AnnoVacuum::Merged ? "into" : "to", index, true);
        if (!net.empty()) {
            out.net = design.FindNet(block, target);
            if (out.net == nullptr)
                Fail(at + ": unknown net '" + target + "' in module '" + module + "'");
        } else {
            out.cell = design.FindCell(block, target);
            if (out.cell == nullptr || out.cell->IsMacro())
                Fail(at + ": unknown register '" + target + "' in module '" + module + "'");
        }
    } else {
        Fail(at + ": unknown kind '" + kind + "' (constant, merged or renamed)");
    }
    return out;
}

void ReadDocument(const simdjson::padded_string& text, Nlw_NlView& view,
                  std::vector<AnnoVacuum>& records) {
    simdjson::dom::parser parser;
    simdjson::dom::element root;
    if (auto error = parser.parse(text).get(root))
        Fail(std::string("not a design map file: malformed JSON (") +
             simdjson::error_message(error) + ")");
    simdjson::dom::object top;
    std::string_view format;
    if (root.get(top) != simdjson::SUCCESS || top["format"].get(format) != simdjson::SUCCESS ||
        format != Nlw_DesignMapReader::kFormat)
        Fail(std::string("not a design map file: no \"format\": \"") +
             Nlw_DesignMapReader::kFormat + "\"");
    int64_t version = 0;
    if (top["version"].get(version) != simdjson::SUCCESS)
        Fail("design map without a version number");
    if (version != Nlw_DesignMapReader::kVersion)
        Fail("design map version " + std::to_string(version) + " is not supported (this " +
             "program reads version " + std::to_string(Nlw_DesignMapReader::kVersion) + ")");
    simdjson::dom::array list;
    if (top["records"].get(list) != simdjson::SUCCESS) Fail("no \"records\" list");
    DesignIndex design(view);
    std::vector<AnnoVacuum> read;
    size_t index = 0;
    for (simdjson::dom::element element : list)
        read.push_back(ReadRecord(element, index++, design));
    records.insert(records.end(), read.begin(), read.end());
}

bool Run(const simdjson::padded_string& text, const char* fileName, Nlw_NlView& view,
         std::vector<AnnoVacuum>& records) {
    try {
        ReadDocument(text, view, records);
        return true;
    } catch (const MapError& e) {
        NLW_MSG().issueError("%s: %s\n", fileName, e.text.c_str());
    } catch (const std::bad_alloc&) {
        NLW_MSG().issueError("%s: not enough memory to read the design map\n", fileName);
    }
    return false;
}

}  // namespace

bool Nlw_DesignMapReader::Load(const char* fileName, Nlw_NlView& view,
                               std::vector<AnnoVacuum>& records) {
    const char* name = fileName ? fileName : "";
    struct stat info;
    if (::stat(name, &info) != 0) {
        NLW_MSG().issueError("%s: cannot read the design map file: %s\n", name,
                             std::strerror(errno));
        return false;
    }
    // A device or pipe could never end; a huge file is no design map.
    if (!S_ISREG(info.st_mode) || static_cast<size_t>(info.st_size) > kMaxFileSize) {
        NLW_MSG().issueError("%s: not a design map file: %s\n", name,
                             S_ISREG(info.st_mode) ? "larger than 256 MB" : "not a regular file");
        return false;
    }
    simdjson::padded_string text;
    if (auto error = simdjson::padded_string::load(name).get(text)) {
        NLW_MSG().issueError("%s: cannot read the design map file: %s\n", name,
                             simdjson::error_message(error));
        return false;
    }
    return Run(text, name, view, records);
}

bool Nlw_DesignMapReader::LoadText(const std::string& text, const char* fileName, Nlw_NlView& view,
                                   std::vector<AnnoVacuum>& records) {
    return Run(simdjson::padded_string(text), fileName ? fileName : "", view, records);
}
