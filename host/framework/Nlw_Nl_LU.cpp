// The host legalizer's walk: legal forms from the format, keywords, length
// limits and unique names per Verilog scope.
#include "framework/Nlw_Nl_LU.h"

#include <cstdio>
#include <cstring>
#include <exception>
#include <string_view>
#include <system_error>
#include <thread>
#include <unordered_map>
#include <vector>

#if defined(__SSE2__)
#include <emmintrin.h>
#endif

#include "framework/Nlw_NameTable.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_NlBuilder.h"

namespace {

constexpr size_t kMax = Nlw_Nl_LU::kMaxNameLength;

// Names are compared as Verilog reads them: an escaped name "\a " is the
// identifier a, the same as a plain a.
bool IsEscapedForm(std::string_view name) {
    return name.size() >= 2 && name.front() == '\\' && name.back() == ' ';
}

std::string_view KeyOf(std::string_view name) {
    return IsEscapedForm(name) ? name.substr(1, name.size() - 2) : name;
}

// A blank, tab, line break or other control character inside a name ends an
// escaped identifier early or breaks the line it stands on, whatever the
// format's own rules let through (an escaped name's closing blank aside).
// A backtick is legal in an escaped identifier, but preprocessors read it
// as the start of a macro name inside one too.
bool IsBreaking(unsigned char c) {
    return c <= ' ' || c == 0x7f || c == '`';
}

// Asked of every name in the design: sixteen characters at a time.
bool HasBreakingCharacter(std::string_view name) {
    const std::string_view inner = KeyOf(name);
    const unsigned char* p = reinterpret_cast<const unsigned char*>(inner.data());
    size_t i = 0;
#if defined(__SSE2__)
    const __m128i space = _mm_set1_epi8(' ');
    const __m128i del = _mm_set1_epi8(0x7f);
    const __m128i backtick = _mm_set1_epi8('`');
    for (; i + 16 <= inner.size(); i += 16) {
        const __m128i c = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p + i));
        // c <= ' ' as unsigned bytes: the smaller of the two is c itself.
        const __m128i low = _mm_cmpeq_epi8(_mm_min_epu8(c, space), c);
        const __m128i hit =
            _mm_or_si128(low, _mm_or_si128(_mm_cmpeq_epi8(c, del), _mm_cmpeq_epi8(c, backtick)));
        if (_mm_movemask_epi8(hit) != 0) return true;
    }
#endif
    for (; i < inner.size(); ++i)
        if (IsBreaking(p[i])) return true;
    return false;
}

std::string ReplaceBreakingCharacters(std::string_view name) {
    std::string text(name);
    const size_t first = IsEscapedForm(name) ? 1 : 0;
    const size_t end = IsEscapedForm(name) ? text.size() - 1 : text.size();
    for (size_t i = first; i < end; ++i)
        if (IsBreaking(static_cast<unsigned char>(text[i]))) text[i] = '_';
    return text;
}

// The longest member index text a bus can need, such as "[-2147483648]".
size_t IndexTextLength(const Nlw_NlBus* bus) {
    const size_t a = std::to_string(bus->GetMSB(0)).size();
    const size_t b = std::to_string(bus->GetLSB(0)).size();
    return 2 + (a > b ? a : b);
}

size_t BusLimit(const Nlw_NlBus* bus) {
    return kMax - IndexTextLength(bus);
}

// A long name keeps its beginning and gets a hash of the whole, so that
// names differing only after the cut stay apart.
std::string Shorten(std::string_view name, size_t limit) {
    uint64_t h = 1469598103934665603ull;  // FNV-1a
    for (unsigned char c : name) {
        h ^= c;
        h *= 1099511628211ull;
    }
    char hex[17];
    std::snprintf(hex, sizeof hex, "%016llx", static_cast<unsigned long long>(h));
    const bool escaped = IsEscapedForm(name);
    const std::string_view inner = KeyOf(name);
    size_t keep = limit - 17 - (escaped ? 2 : 0);
    if (keep > 2000) keep = 2000;
    std::string text(inner.substr(0, keep));
    text += '_';
    text += hex;
    return escaped ? "\\" + text + " " : text;
}

// Sets an object's writable name; the first rename keeps the original name
// as the also-known-as name when bridging and the object has none.
template <class T>
void Rename(T* object, const std::string& name, bool bridge) {
    const char* old = object->GetWritableName();
    if (name == old) return;
    if (bridge && object->GetAka() == nullptr) object->SetAka(old);
    object->SetWritableName(name.c_str());
}

void RenameType(Nlw_NlType* type, const std::string& name, bool bridge) {
    const char* old = type->GetName();
    if (name == old) return;
    if (bridge && type->GetAka() == nullptr) type->SetAka(old);
    type->SetName(name.c_str());
}

// One Verilog namespace. Each taken name may name one object that is
// allowed to share it (a port's own inside signal).
class Scope {
public:
    explicit Scope(bool keywords) : keywords_(keywords) {}
    void Reserve(size_t n) { taken_.Reserve(n); }

    // Takes the stored name for who when it is free (or shared with who);
    // sharer may take the same name later. Otherwise fills out with the
    // first free "name_N" and returns false: the caller renames the object
    // and calls Take with its new stored name.
    bool Claim(const char* stored, const void* who, const void* sharer, size_t limit,
               std::string& out) {
        const std::string_view name(stored);
        const std::string_view key = KeyOf(name);
        const bool plain = key.size() == name.size();
        if (!IsKeyword(key, plain)) {
            const std::pair<const void*, bool> entry = taken_.Insert(key, sharer);
            if (entry.second || (who != nullptr && entry.first == who)) return true;
        }
        // Suffixes below the counter were tried and found taken; taken names
        // stay taken, so the search resumes there.
        uint32_t& n = next_[std::string(key)];
        for (n = n ? n : 1;; ++n) {
            const std::string suffix = "_" + std::to_string(n);
            const size_t room = limit - suffix.size() - (plain ? 0 : 2);
            std::string stem(key.substr(0, room));
            out = plain ? stem + suffix : "\\" + stem + suffix + " ";
            if (IsFree(KeyOf(out), plain, who)) {
                ++n;
                return false;
            }
        }
    }

    // Takes a name that must stay as it is (stored for the scope's life).
    void Take(const char* stored, const void* sharer) {
        taken_.Insert(KeyOf(std::string_view(stored)), sharer);
    }

private:
    bool IsKeyword(std::string_view key, bool plain) const {
        return plain && keywords_ && Nlw_Nl_SpkCache::IsKeyword(key.data(), key.size());
    }
    bool IsFree(std::string_view key, bool plain, const void* who) const {
        if (IsKeyword(key, plain)) return false;
        const Nlw_NameTable::Slot* slot = taken_.Find(key);
        return slot == nullptr || (who != nullptr && slot->sharer == who);
    }

    bool keywords_;
    Nlw_NameTable taken_;
    std::unordered_map<std::string, uint32_t> next_;
};

// The signal bus that a port bus may share its name with: the inside bus
// of the same range whose members are the port's inside signals.
const Nlw_NlBus* InsideBus(const Nlw_NlPinBus* bus) {
    const Nlw_NlPin* first = bus->GetPinMember(bus->GetMSB(0));
    const Nlw_NlPin* last = bus->GetPinMember(bus->GetLSB(0));
    if (!first || !last || !first->GetChildSignal() || !last->GetChildSignal()) return nullptr;
    const Nlw_NlBus* inside = first->GetChildSignal()->GetBus();
    if (inside == nullptr || inside->GetMSB(0) != bus->GetMSB(0) ||
        inside->GetLSB(0) != bus->GetLSB(0))
        return nullptr;
    if (inside->GetSignalMember(bus->GetMSB(0)) != first->GetChildSignal() ||
        inside->GetSignalMember(bus->GetLSB(0)) != last->GetChildSignal())
        return nullptr;
    return inside;
}

// Members carry their bus's name and their index. Most already do, so the
// name is built in one reused buffer and the member renamed only when it
// differs.
template <class Bus, class GetMember>
void FollowBus(const Bus* bus, bool bridge, GetMember member) {
    const int64_t low = bus->GetMSB(0) < bus->GetLSB(0) ? bus->GetMSB(0) : bus->GetLSB(0);
    const int64_t high = bus->GetMSB(0) < bus->GetLSB(0) ? bus->GetLSB(0) : bus->GetMSB(0);
    std::string name;
    for (int64_t i = low; i <= high; ++i) {
        if (auto* object = member(bus, static_cast<int32_t>(i))) {
            Nlw_NlMemberName(name, bus->GetWritableName(), i);
            Rename(object, name, bridge);
        }
    }
}

void FollowPinBus(const Nlw_NlPinBus* bus, bool bridge) {
    FollowBus(bus, bridge, [](const Nlw_NlPinBus* b, int32_t i) { return b->GetPinMember(i); });
}

void FollowSignalBus(const Nlw_NlBus* bus, bool bridge) {
    FollowBus(bus, bridge, [](const Nlw_NlBus* b, int32_t i) { return b->GetSignalMember(i); });
}

}  // namespace

Nlw_Nl_LU::Nlw_Nl_LU(Nlw_NlView* view, bool types, bool names, bool cellPins, bool bridge)
    : view_(view), types_(types), names_(names), cellPins_(cellPins), bridge_(bridge) {}

bool Nlw_Nl_LU::Prepare(const char* name, bool isBused, bool keywords, size_t limit,
                        std::string& out, bool formatRule) {
    std::string text;
    bool changed = false;
    // An empty name would be written as nothing at all.
    if (*name == '\0') {
        out = "unnamed";
        return true;
    }
    if (formatRule && !IsLegal(name, isBused)) {
        Port::String legal = Legalize(name, isBused);
        if (legal.str() != name) {
            text.swap(legal.str());
            changed = true;
        }
    }
    std::string_view current = changed ? std::string_view(text) : std::string_view(name);
    if (HasBreakingCharacter(current)) {
        text = ReplaceBreakingCharacters(current);
        changed = true;
        current = text;
    }
    if (keywords && UsesEscapedNames() &&
        Nlw_Nl_SpkCache::IsKeyword(current.data(), current.size())) {
        text = "\\" + std::string(current) + " ";
        changed = true;
        current = text;
    }
    if (current.size() > limit) {
        text = Shorten(current, limit);
        changed = true;
    }
    if (changed) out.swap(text);
    return changed;
}

void Nlw_Nl_LU::Process() {
    if (view_ == nullptr) return;
    if (types_) ProcessTypes();
    if (cellPins_) ProcessCellPins();
    if (names_) ProcessMacros();
}

// Each macro's names are its own: a macro renames its instances, ports,
// nets and buses and nothing of any other macro. So the macros of a large
// view are shared by two threads, the names the second gives kept apart
// until the view goes.
void Nlw_Nl_LU::ProcessMacros() {
    const auto& macros = view_->GetMacros();
    auto weight = [](const Nlw_NlBlock* m) {
        return 1 + m->GetChildren().size() + m->GetPinCount() + m->GetSignals().size();
    };
    size_t total = 0;
    for (const Nlw_NlBlock* m : macros) total += weight(m);
    const bool two =
        AnswersOnTwoThreads() && macros.size() > 1 && Nlw_Util::WriteOnTwoThreads(total);
    size_t cut = macros.size();
    if (two) {
        // The first half by weight here, the rest on the second thread.
        size_t sum = 0;
        for (cut = 0; cut + 1 < macros.size() && sum < total / 2; ++cut) sum += weight(macros[cut]);
    }
    std::exception_ptr failure;
    std::thread helper;
    if (cut < macros.size()) {
        try {
            helper = std::thread([&] {
                try {
                    Nlw_NlView::ThreadTexts texts(*view_);
                    for (size_t i = cut; i < macros.size(); ++i) ProcessMacro(macros[i]);
                } catch (...) {
                    failure = std::current_exception();
                }
            });
        } catch (const std::system_error&) {
            cut = macros.size();  // no thread to be had: this one does it all
        }
    }
    try {
        for (size_t i = 0; i < cut; ++i) ProcessMacro(macros[i]);
    } catch (...) {
        if (helper.joinable()) helper.join();
        throw;
    }
    if (helper.joinable()) helper.join();
    if (failure) std::rethrow_exception(failure);
}

void Nlw_Nl_LU::ProcessTypes() {
    const bool keywords = Nlw_Nl_SpkCache::IsBuilt();
    Scope scope(keywords);
    scope.Reserve(view_->GetTypes().size() + reservedTypes_.size());
    for (const std::string& reserved : reservedTypes_) scope.Take(reserved.c_str(), nullptr);
    // Library cell types keep their names, which name their models. A cell
    // type no model can have (a black box "my cell", an empty name, a name
    // of 300 000 characters) is made legal and unique like a module type.
    std::string name;
    std::vector<Nlw_NlType*> renamedCells;
    for (Nlw_NlType* type : view_->GetTypes()) {
        if (type->IsModule()) continue;
        if (Prepare(type->GetName(), false, keywords, kMax, name, false)) {
            RenameType(type, name, bridge_);
            renamedCells.push_back(type);
        } else {
            scope.Take(type->GetName(), nullptr);
        }
    }
    for (Nlw_NlType* type : renamedCells)
        if (!scope.Claim(type->GetName(), nullptr, nullptr, kMax, name)) {
            RenameType(type, name, bridge_);
            scope.Take(type->GetName(), nullptr);
        }
    for (Nlw_NlType* type : view_->GetTypes()) {
        if (!type->IsModule()) continue;
        if (Prepare(type->GetName(), false, keywords, kMax, name)) RenameType(type, name, bridge_);
        if (!scope.Claim(type->GetName(), nullptr, nullptr, kMax, name)) {
            RenameType(type, name, bridge_);
            scope.Take(type->GetName(), nullptr);
        }
    }
}

// A global signal is written under its name as it stands (a constant such as
// 1'b0, or a hierarchical reference) and never declared: it keeps its name
// and takes none from the module's namespace.
static bool IsGlobalSignal(const Nlw_NlSignal* s) {
    return s->GetPropertyByName("NLW_GLOBAL_SIGNAL") != nullptr;
}

void Nlw_Nl_LU::ProcessMacro(Nlw_NlBlock* macro) {
    const bool keywords = Nlw_Nl_SpkCache::IsBuilt();
    const UT_DARRAY<Nlw_NlPinBus*>* pinBuses = macro->GetPinBuses();
    const UT_DARRAY<Nlw_NlBus*>* signalBuses = macro->GetSignalBuses();
    std::string name;

    // The format's legal forms, in the order of the walk. Bus members are
    // asked as bus bits; keywords and length concern their bus's name.
    for (Nlw_NlBlock* child : macro->GetChildren())
        if (Prepare(child->GetWritableName(), false, keywords, kMax, name))
            Rename(child, name, bridge_);
    for (Nlw_NlPin& pin : macro->GetPins())
        if (Prepare(pin.GetWritableName(), pin.IsBused(), keywords && !pin.IsBused(), kMax, name))
            Rename(&pin, name, bridge_);
    if (pinBuses)
        for (Nlw_NlPinBus* bus : *pinBuses)
            if (Prepare(bus->GetWritableName(), false, keywords, BusLimit(bus), name))
                Rename(bus, name, bridge_);
    for (Nlw_NlSignal* s : macro->GetSignals())
        if (!IsGlobalSignal(s) &&
            Prepare(s->GetWritableName(), s->IsBused(), keywords && !s->IsBused(), kMax, name))
            Rename(s, name, bridge_);
    if (signalBuses)
        for (Nlw_NlBus* bus : *signalBuses)
            if (Prepare(bus->GetWritableName(), false, keywords, BusLimit(bus), name))
                Rename(bus, name, bridge_);

    // Unique declared names. Ports come first, so that the module's
    // interface changes least; then nets; instances yield to both.
    Scope scope(keywords);
    scope.Reserve(macro->GetPinCount() + macro->GetSignals().size() + macro->GetChildren().size());
    auto claim = [&](auto* object, const void* who, const void* sharer, size_t limit) {
        if (!scope.Claim(object->GetWritableName(), who, sharer, limit, name)) {
            Rename(object, name, bridge_);
            scope.Take(object->GetWritableName(), sharer);
        }
    };
    for (Nlw_NlPin& pin : macro->GetPins())
        if (!pin.IsBused()) claim(&pin, nullptr, pin.GetChildSignal(), kMax);
    if (pinBuses)
        for (Nlw_NlPinBus* bus : *pinBuses) claim(bus, nullptr, InsideBus(bus), BusLimit(bus));
    for (Nlw_NlSignal* s : macro->GetSignals())
        if (!s->IsBused() && !IsGlobalSignal(s)) claim(s, s, nullptr, kMax);
    if (signalBuses)
        for (Nlw_NlBus* bus : *signalBuses) claim(bus, bus, nullptr, BusLimit(bus));
    for (Nlw_NlBlock* child : macro->GetChildren()) claim(child, nullptr, nullptr, kMax);

    if (pinBuses)
        for (Nlw_NlPinBus* bus : *pinBuses) FollowPinBus(bus, bridge_);
    if (signalBuses)
        for (Nlw_NlBus* bus : *signalBuses) FollowSignalBus(bus, bridge_);
}

void Nlw_Nl_LU::ProcessCellPins() {
    const bool keywords = Nlw_Nl_SpkCache::IsBuilt();
    // The original pin names of each renamed type, by position.
    std::unordered_map<const Nlw_NlType*, std::vector<const char*>> renamed;
    std::string name;
    for (Nlw_NlType* type : view_->GetTypes()) {
        if (type->IsModule()) continue;
        std::vector<Nlw_NlType::PinDef>& defs = type->pinDefs_;
        std::vector<const char*> original;
        original.reserve(defs.size());
        for (const Nlw_NlType::PinDef& def : defs) original.push_back(def.name);
        auto setDef = [&](Nlw_NlType::PinDef& def, const std::string& text) {
            def.name = view_->Intern(text.c_str());
        };
        for (Nlw_NlType::PinDef& def : defs)
            if (Prepare(def.name, def.bus != nullptr, keywords && !def.bus, kMax, name))
                setDef(def, name);
        for (Nlw_NlPinBus* bus : type->pinBuses_)
            if (Prepare(bus->GetWritableName(), false, keywords, BusLimit(bus), name))
                Rename(bus, name, false);

        Scope scope(keywords);
        for (Nlw_NlType::PinDef& def : defs) {
            if (def.bus) continue;
            if (!scope.Claim(def.name, nullptr, nullptr, kMax, name)) {
                setDef(def, name);
                scope.Take(def.name, nullptr);
            }
        }
        for (Nlw_NlPinBus* bus : type->pinBuses_) {
            if (!scope.Claim(bus->GetWritableName(), nullptr, nullptr, BusLimit(bus), name)) {
                Rename(bus, name, false);
                scope.Take(bus->GetWritableName(), nullptr);
            }
            // Members lie at fixed positions of the definitions.
            const int64_t low = bus->msb_ < bus->lsb_ ? bus->msb_ : bus->lsb_;
            std::string member;
            for (int64_t i = 0; i < bus->GetWidth(); ++i) {
                Nlw_NlMemberName(member, bus->GetWritableName(), low + i);
                Nlw_NlType::PinDef& def = defs[bus->firstPinPos_ + bus->posStep_ * i];
                if (member != def.name) setDef(def, member);
            }
        }
        bool changed = false;
        for (size_t i = 0; i < defs.size() && !changed; ++i) changed = defs[i].name != original[i];
        if (!changed) continue;
        type->index_->pinsBuilt = false;
        renamed.emplace(type, std::move(original));
    }
    if (renamed.empty()) return;

    // Instances take the definitions' names; the originals serve as their
    // also-known-as names without a copy per instance.
    for (Nlw_NlBlock* macro : view_->GetMacros()) {
        for (Nlw_NlBlock* child : macro->GetChildren()) {
            if (child->IsMacro()) continue;
            auto it = renamed.find(child->GetType());
            if (it == renamed.end()) continue;
            const std::vector<Nlw_NlType::PinDef>& defs = child->GetType()->pinDefs_;
            for (size_t i = 0; i < child->GetPinCount() && i < defs.size(); ++i) {
                Nlw_NlPin* pin = child->GetPin(i);
                if (std::strcmp(pin->name_, defs[i].name) == 0) continue;
                if (bridge_ && pin->aka_ == nullptr) pin->aka_ = it->second[i];
                pin->name_ = defs[i].name;
            }
        }
    }
}
