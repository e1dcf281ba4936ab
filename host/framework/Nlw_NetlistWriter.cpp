// The netlist writer base: defaults of the format operations, device data,
// text padding and the simulatable property table.
#include "framework/Nlw_NetlistWriter.h"

#include <cstring>
#include <unordered_set>

#ifndef NLW_VERSION
#define NLW_VERSION "0.0"
#endif

bool Nlw_ICaseLess::operator()(const Port::String& a, const Port::String& b) const {
    return UT_STR::ICompare(a.c_str(), b.c_str()) < 0;
}
bool Nlw_ICaseLess::operator()(const char* a, const Port::String& b) const {
    return UT_STR::ICompare(a, b.c_str()) < 0;
}
bool Nlw_ICaseLess::operator()(const Port::String& a, const char* b) const {
    return UT_STR::ICompare(a.c_str(), b) < 0;
}

const char* Nlw_Property::ParameterName(const char* propertyName) {
    // Asked for every parameter of every cell: the length rules out most.
    const size_t length = propertyName ? std::strlen(propertyName) : 0;
    if ((length == 9 && UT_STR::ICompare(propertyName, "INITSTATE") == 0) ||
        (length == 8 && UT_STR::ICompare(propertyName, "INIT_BIT") == 0))
        return "INIT";
    return propertyName;
}

const Nlw_Property* Nlw_Property::Find(const std::vector<Nlw_Property>& defs,
                                       const char* parameterName) {
    for (const Nlw_Property& def : defs)
        if (UT_STR::ICompare(def.GetName().c_str(), parameterName) == 0) return &def;
    return nullptr;
}

Nlw_NetlistWriter::Nlw_NetlistWriter() = default;

Nlw_NetlistWriter::Nlw_NetlistWriter(const Nlw_NetlistWriter& other)
    : appName_(other.appName_),
      usage_(other.usage_),
      ext_(other.ext_),
      params_(other.params_),
      view_(other.view_),
      design_(other.design_),
      typeLib_(other.typeLib_),
      timing_(other.timing_),
      pic_(other.pic_),
      devkey_(other.devkey_),
      isVornixCore_(other.isVornixCore_),
      annoVacuums_(other.annoVacuums_) {
    CopySimPropTable(other);
}

Nlw_NetlistWriter& Nlw_NetlistWriter::operator=(const Nlw_NetlistWriter& other) {
    if (this == &other) return *this;
    appName_ = other.appName_;
    usage_ = other.usage_;
    ext_ = other.ext_;
    params_ = other.params_;
    view_ = other.view_;
    design_ = other.design_;
    typeLib_ = other.typeLib_;
    timing_ = other.timing_;
    pic_ = other.pic_;
    devkey_ = other.devkey_;
    isVornixCore_ = other.isVornixCore_;
    annoVacuums_ = other.annoVacuums_;
    CopySimPropTable(other);
    return *this;
}

Nlw_NetlistWriter::~Nlw_NetlistWriter() = default;

void Nlw_NetlistWriter::CopySimPropTable(const Nlw_NetlistWriter& other) {
    // Lists the other writer owns are copied; lists the host put into the
    // table itself are shared, as they were.
    std::unordered_set<const std::vector<Nlw_Property>*> owned;
    for (const auto& list : other.simPropStorage_) owned.insert(list.get());
    std::vector<std::unique_ptr<std::vector<Nlw_Property>>> storage;
    Nlw_SimPropTable table;
    for (const auto& entry : other.simPropTable) {
        std::vector<Nlw_Property>* list = entry.second;
        if (owned.count(list)) {
            storage.push_back(std::make_unique<std::vector<Nlw_Property>>(*list));
            list = storage.back().get();
        }
        table.emplace(entry.first, list);
    }
    simPropStorage_ = std::move(storage);
    simPropTable = std::move(table);
}

// ---- Format defaults ---------------------------------------------------------

unsigned char Nlw_NetlistWriter::IsLegal(const char*, unsigned char) {
    return 1;
}

const char* Nlw_NetlistWriter::Legalize(const char* name, unsigned char) {
    return name;
}

unsigned char Nlw_NetlistWriter::IsDefinable(Nlw_NlBlock*) {
    return 1;
}

unsigned char Nlw_NetlistWriter::IsInstantiatable(Nlw_NlBlock* block) {
    if (!block) return 0;
    return block->GetPropertyByName("NLW_NOT_INSTANTIATABLE") ? 0 : 1;
}

void Nlw_NetlistWriter::PrepPin(Nlw_NlPin*) {}

void Nlw_NetlistWriter::PrepNetwork(Nlw_NlNetwork*) {}

// ---- Run data ----------------------------------------------------------------

PM_PIC* Nlw_NetlistWriter::GetPmPic() {
    if (!pic_) {
        const char* part = view_ ? view_->GetPartName() : nullptr;
        pic_ = std::make_shared<PM_PIC>(part ? part : "", true, PM_PARTNAME_DEFAULT);
    }
    return pic_.get();
}

PM_DEVKEY* Nlw_NetlistWriter::GetDevkey() {
    if (!devkey_) devkey_ = std::make_shared<PM_DEVKEY>("device.key", GetPmPic(), 0, 1, 1);
    return devkey_.get();
}

const char* Nlw_NetlistWriter::GetApplicationVersion() const {
    return NLW_VERSION;
}

void Nlw_NetlistWriter::PadOrTrim(size_t count, Port::String& text, const char* fill) {
    std::string& s = text.str();
    if (s.size() > count) {
        s.erase(0, s.size() - count);
    } else if (s.size() < count) {
        const char f = fill && *fill ? fill[0] : '0';
        s.insert(0, count - s.size(), f);
    }
}

// ---- Simulatable property table ------------------------------------------------

namespace {

bool IsSimPropType(const std::string& type) {
    static const char* const kTypes[] = {"BL", "F", "I", "S", "HV", "BV"};
    for (const char* t : kTypes)
        if (UT_STR::ICompare(type.c_str(), t) == 0) return true;
    return false;
}

// The fields of a line; a field that begins with '#' starts a comment.
std::vector<std::string> Fields(const std::string& line) {
    std::vector<std::string> fields;
    size_t pos = 0;
    for (;;) {
        pos = line.find_first_not_of(" \t\r", pos);
        if (pos == std::string::npos || line[pos] == '#') break;
        size_t end = line.find_first_of(" \t\r", pos);
        if (end == std::string::npos) end = line.size();
        fields.push_back(line.substr(pos, end - pos));
        pos = end;
    }
    return fields;
}

}  // namespace

std::vector<Nlw_Property>* Nlw_NetlistWriter::SimPropList(const char* cellType) {
    auto it = simPropTable.find(Port::String(cellType));
    if (it != simPropTable.end()) return it->second;
    simPropStorage_.push_back(std::make_unique<std::vector<Nlw_Property>>());
    std::vector<Nlw_Property>* list = simPropStorage_.back().get();
    simPropTable.emplace(Port::String(cellType), list);
    return list;
}

void Nlw_NetlistWriter::AddSimProperty(const char* cellType, const char* name, const char* type,
                                       const char* dflt) {
    SimPropList(cellType)->emplace_back(name, type, dflt);
}

bool Nlw_NetlistWriter::LoadSimPropTable(const char* path) {
    if (!path || !Port::File::exist(path)) return false;
    std::string content, error;
    if (!Port::File::readAll(path, content, &error)) {
        NLW_MSG().issueError("Cannot read simulatable property file '%s': %s\n", path,
                             error.c_str());
        return false;
    }
    // The whole file is checked before anything enters the table.
    std::vector<std::vector<std::string>> rows;
    size_t pos = 0;
    int lineNo = 0;
    while (pos < content.size()) {
        size_t end = content.find('\n', pos);
        if (end == std::string::npos) end = content.size();
        std::vector<std::string> fields = Fields(content.substr(pos, end - pos));
        pos = end + 1;
        ++lineNo;
        if (fields.empty()) continue;
        if (fields.size() != 4) {
            NLW_MSG().issueError(
                "Malformed line %d in simulatable property file '%s': expected CELLTYPE PARAM "
                "TYPE DEFAULT.\n",
                lineNo, path);
            return false;
        }
        if (!IsSimPropType(fields[2])) {
            NLW_MSG().issueError(
                "Malformed line %d in simulatable property file '%s': unknown type '%s' (BL, F, "
                "I, S, HV or BV expected).\n",
                lineNo, path, fields[2].c_str());
            return false;
        }
        rows.push_back(std::move(fields));
    }
    for (const auto& r : rows)
        AddSimProperty(r[0].c_str(), r[1].c_str(), r[2].c_str(), r[3].c_str());
    return true;
}
