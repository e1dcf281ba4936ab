// Time stamps, property access, direction texts and the type library.
#include "framework/Nlw_Util.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <thread>

#include "framework/Nlw_Nl_LU.h"
#include "model/Nlw_Nl.h"
#include "port/PM.h"
#include "port/Port.h"

// ---- Type library --------------------------------------------------------

Ldm_TypeBlock::~Ldm_TypeBlock() {
    for (auto& group : groups_)
        for (Vdm_Property* def : group.second) delete def;
}

const std::vector<Vdm_Property*>& Ldm_TypeBlock::GetPropertyCItr(const char* group) const {
    static const std::vector<Vdm_Property*> kNone;
    if (!group) return kNone;
    // A block type has a handful of groups.
    for (const auto& g : groups_)
        if (g.first == group) return g.second;
    return kNone;
}

void Ldm_TypeBlock::AddDefinition(const char* group, Vdm_Property* def) {
    if (!def) return;
    const std::string name = group ? group : "";
    for (auto& g : groups_) {
        if (g.first == name) {
            g.second.push_back(def);
            return;
        }
    }
    groups_.emplace_back(name, std::vector<Vdm_Property*>{def});
}

Ldm_TypeLib::~Ldm_TypeLib() {
    for (Ldm_TypeBlock* b : blocks_) delete b;
}

Ldm_TypeBlock* Ldm_TypeLib::GetBlockByName(const char* name) const {
    if (!name) return nullptr;
    auto it = byName_.find(name);
    return it == byName_.end() ? nullptr : it->second;
}

Ldm_TypeBlock* Ldm_TypeLib::AddBlock(const char* name) {
    const std::string key = name ? name : "";
    auto it = byName_.find(key);
    if (it != byName_.end()) return it->second;
    auto* block = new Ldm_TypeBlock(key.c_str());
    blocks_.push_back(block);
    byName_.emplace(key, block);
    return block;
}

// ---- Nlw_Util ------------------------------------------------------------

namespace {

struct TimeStampState {
    bool fixed = false;
    std::string fixedText;
    std::string envText;
    std::string localText;
};

TimeStampState& Stamp() {
    static TimeStampState state;
    return state;
}

}  // namespace

const char* Nlw_Util::GetTimeStampString(int flag) {
    (void)flag;
    TimeStampState& st = Stamp();
    if (st.fixed) return st.fixedText.c_str();
    if (const char* env = Port_Env::GetEnv("NLW_TIMESTAMP")) {
        st.envText = env;
        return st.envText.c_str();
    }
    if (st.localText.empty()) {
        std::time_t now = std::time(nullptr);
        std::tm local{};
        localtime_r(&now, &local);
        char text[64];
        if (std::strftime(text, sizeof text, "%a %b %e %H:%M:%S %Y", &local) == 0) text[0] = '\0';
        st.localText = text;
    }
    return st.localText.c_str();
}

void Nlw_Util::SetFixedTimeStamp(const char* text) {
    TimeStampState& st = Stamp();
    st.fixed = text != nullptr;
    st.fixedText = text ? text : "";
}

int32_t Nlw_Util::GetInt32Prop(const Vdm_PropertyHolder* h, const char* name, int32_t dflt) {
    const Vdm_Property* p = h ? h->GetPropertyByName(name) : nullptr;
    if (!p) return dflt;
    if (p->GetType() == VDM_PROP_INT) return p->GetInt32();
    if (p->GetType() != VDM_PROP_STRING) return dflt;
    const char* text = p->GetString();
    if (!text || !*text) return dflt;
    char* end = nullptr;
    errno = 0;
    long long v = std::strtoll(text, &end, 10);
    // Only a whole decimal number that fits counts.
    if (errno != 0 || *end != '\0' || v < INT32_MIN || v > INT32_MAX) return dflt;
    if (!(text[0] == '-' || text[0] == '+' || (text[0] >= '0' && text[0] <= '9'))) return dflt;
    return static_cast<int32_t>(v);
}

const char* Nlw_Util::GetStringProp(const Vdm_PropertyHolder* h, const char* name) {
    const Vdm_Property* p = h ? h->GetPropertyByName(name) : nullptr;
    return p && p->GetType() == VDM_PROP_STRING ? p->GetString() : nullptr;
}

const char* Nlw_Util::ToString(int direction) {
    switch (direction) {
        case NLW_DIR_INPUT:
            return "INPUT";
        case NLW_DIR_OUTPUT:
            return "OUTPUT";
        case NLW_DIR_INOUT:
            return "BIDIR";
        default:
            return "UNKNOWN";
    }
}

PM_PIC* Nlw_Util::CreatePicSpec(Nlw_NlView* view, bool flag) {
    const char* part = view ? view->GetPartName() : nullptr;
    if (!part) return nullptr;
    return new PM_PIC(part, flag, PM_PARTNAME_DEFAULT);
}

std::string Nlw_Util::CommentText(const char* text) {
    std::string out = text ? text : "";
    // A comment is one token to some readers: a name of 300 000 characters
    // overflows their buffers.
    if (out.size() > Nlw_Nl_LU::kMaxNameLength) {
        out.resize(2000);
        out += "...";
    }
    for (char& c : out) {
        const unsigned char u = static_cast<unsigned char>(c);
        if ((u < ' ' && u != '\t') || u == 0x7f) c = ' ';
    }
    return out;
}

int Nlw_Util::WriteThreadsAsked() {
    const char* asked = Port_Env::GetEnv("NLW_WRITE_THREADS");
    if (asked == nullptr) return 0;
    return std::strcmp(asked, "1") == 0 ? 1 : std::strcmp(asked, "2") == 0 ? 2 : 0;
}

bool Nlw_Util::WriteOnTwoThreads(size_t work) {
    constexpr size_t kTwoThreadsFrom = 50000;
    const int asked = WriteThreadsAsked();
    return asked == 2 ||
           (asked == 0 && work >= kTwoThreadsFrom && std::thread::hardware_concurrency() > 1);
}
