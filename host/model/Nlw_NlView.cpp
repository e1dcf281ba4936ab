// The view: storage of every model object, type lookup and destruction.
#include <sys/mman.h>

#include <cstdlib>
#include <cstring>
#include <memory>
#include <mutex>
#include <new>
#include <vector>

#include "model/Nlw_NlBuilder.h"

namespace {

// What is left of the regions handed over, cut in whole chunks.
struct Donation {
    std::shared_ptr<char> owner;
    char* next;
    size_t left;
};
std::mutex donationsMutex;
std::vector<Donation>& Donations() {
    static std::vector<Donation> list;
    return list;
}

}  // namespace

void Nlw_NlArena::Donate(std::shared_ptr<char> region, size_t size) {
    if (!region) return;
    const uintptr_t at = reinterpret_cast<uintptr_t>(region.get());
    const size_t pad = (kChunk - at % kChunk) % kChunk;
    if (size < pad + kChunk) return;
    const size_t usable = (size - pad) / kChunk * kChunk;
    std::lock_guard<std::mutex> lock(donationsMutex);
    Donations().push_back(Donation{std::move(region), nullptr, usable});
    Donations().back().next = Donations().back().owner.get() + pad;
}

void Nlw_NlArena::DropDonations() {
    std::lock_guard<std::mutex> lock(donationsMutex);
    Donations().clear();
}

std::shared_ptr<char> Nlw_NlArena::NewChunk(size_t size) {
    const size_t rounded = (size + kChunk - 1) / kChunk * kChunk;
    {
        std::lock_guard<std::mutex> lock(donationsMutex);
        std::vector<Donation>& list = Donations();
        for (size_t i = 0; i < list.size(); ++i) {
            Donation& d = list[i];
            if (d.left < rounded) continue;
            char* p = d.next;
            d.next += rounded;
            d.left -= rounded;
            std::shared_ptr<char> chunk(d.owner, p);  // keeps the region alive
            if (d.left < kChunk) list.erase(list.begin() + static_cast<std::ptrdiff_t>(i));
            return chunk;
        }
    }
    void* p = std::aligned_alloc(kChunk, rounded);
    if (p == nullptr) throw std::bad_alloc();
#ifdef MADV_HUGEPAGE
    ::madvise(p, rounded, MADV_HUGEPAGE);  // advice only: failure changes nothing
#endif
    return std::shared_ptr<char>(static_cast<char*>(p), [](char* c) { std::free(c); });
}

void* Nlw_NlArena::Allocate(size_t size, size_t align) {
    if (size == 0) size = 1;
    bytes_ += size;
    // A large request gets a chunk of its own so that the current chunk's
    // remainder is not wasted.
    if (size > kChunk / 4) {
        chunks_.emplace_back(NewChunk(size + align));
        char* p = chunks_.back().get();
        const uintptr_t misalign = reinterpret_cast<uintptr_t>(p) % align;
        return misalign ? p + (align - misalign) : p;
    }
    uintptr_t pad = reinterpret_cast<uintptr_t>(cur_) % align;
    if (pad) pad = align - pad;
    if (cur_ == nullptr || left_ < size + pad) {
        chunks_.emplace_back(NewChunk(kChunk));
        cur_ = chunks_.back().get();
        left_ = kChunk;
        pad = reinterpret_cast<uintptr_t>(cur_) % align;
        if (pad) pad = align - pad;
    }
    char* p = cur_ + pad;
    cur_ += pad + size;
    left_ -= pad + size;
    return p;
}

namespace {

// The arena a ThreadTexts gives this thread's texts to, if any.
thread_local Nlw_NlArena* threadTexts = nullptr;
std::mutex threadArenasMutex;

}  // namespace

Nlw_NlView::ThreadTexts::ThreadTexts(Nlw_NlView& view) : previous_(threadTexts) {
    std::lock_guard<std::mutex> lock(threadArenasMutex);
    view.threadArenas_.push_back(std::make_unique<Nlw_NlArena>());
    threadTexts = view.threadArenas_.back().get();
}

Nlw_NlView::ThreadTexts::~ThreadTexts() {
    threadTexts = previous_;
}

const char* Nlw_NlArena::Copy(const char* text, size_t len) {
    if (threadTexts != nullptr && threadTexts != this) return threadTexts->Copy(text, len);
    char* p = static_cast<char*>(Allocate(len + 1, 1));
    if (len) std::memcpy(p, text, len);
    p[len] = '\0';
    return p;
}

// Type lookup by name: the first type of each name, rebuilt after renames.
struct Nlw_NlView::TypeIndex {
    std::unordered_map<std::string_view, Nlw_NlType*> byName;
    size_t indexed = 0;  // types_[0, indexed) are in byName
    bool stale = false;
};

Nlw_NlView::Nlw_NlView() : arena_(new Nlw_NlArena), typeIndex_(new TypeIndex) {}

void Nlw_NlView::DestroyBlock(Nlw_NlBlock* block) {
    for (Nlw_NlPin& pin : block->GetPins()) pin.~Nlw_NlPin();
    delete block->extProps_;
    if (block->macro_) {
        for (Nlw_NlSignal* s : block->macro_->signals) s->~Nlw_NlSignal();
        delete block->macro_;
    }
    block->~Nlw_NlBlock();
}

Nlw_NlView::~Nlw_NlView() {
    // Every macro is on the macro list and every leaf is a child of exactly
    // one macro, so each block is destroyed once. Buses hold nothing that
    // needs destruction.
    for (Nlw_NlBlock* macro : macros_) {
        for (Nlw_NlBlock* child : macro->macro_->children)
            if (!child->IsMacro()) DestroyBlock(child);
        DestroyBlock(macro);
    }
    for (Nlw_NlNetwork* n : networks_) n->~Nlw_NlNetwork();
    for (Nlw_NlType* t : types_) delete t;
}

const char* Nlw_NlView::Intern(const char* text) {
    if (text == nullptr) return "";
    return arena_->Copy(text, std::strlen(text));
}

const char* Nlw_NlView::Intern(const char* text, size_t len) {
    if (text == nullptr) return "";
    return arena_->Copy(text, len);
}

Nlw_NlType* Nlw_NlView::FindType(const char* name) const {
    if (name == nullptr) return nullptr;
    TypeIndex& index = *typeIndex_;
    if (index.stale) {
        index.byName.clear();
        index.indexed = 0;
        index.stale = false;
    }
    for (; index.indexed < types_.size(); ++index.indexed) {
        Nlw_NlType* t = types_[index.indexed];
        index.byName.emplace(t->name_, t);
    }
    auto it = index.byName.find(name);
    return it == index.byName.end() ? nullptr : it->second;
}

// Types

Nlw_NlType::~Nlw_NlType() = default;

void Nlw_NlType::SetName(const char* name) {
    name_ = view_->Intern(name);
    view_->typeIndex_->stale = true;
}

void Nlw_NlType::SetAka(const char* aka) {
    aka_ = aka ? view_->Intern(aka) : nullptr;
}

void Nlw_NlType::SetFileBaseName(const char* base) {
    fileBase_ = base ? view_->Intern(base) : nullptr;
}

int Nlw_NlType::FindPinDef(const char* name) const {
    if (name == nullptr) return -1;
    const std::string_view key(name);
    if (pinDefs_.size() <= Nlw_NlNameIndex::kDirect) {
        for (size_t i = 0; i < pinDefs_.size(); ++i)
            if (key == pinDefs_[i].name) return static_cast<int>(i);
        return -1;
    }
    Nlw_NlNameIndex& index = *index_;
    if (!index.pinsBuilt) {
        index.pins.clear();
        for (size_t i = 0; i < pinDefs_.size(); ++i)
            index.pins.emplace(pinDefs_[i].name, static_cast<uint32_t>(i));
        index.pinsBuilt = true;
    }
    auto it = index.pins.find(key);
    return it == index.pins.end() ? -1 : static_cast<int>(it->second);
}

void Nlw_NlView::BuildNameIndexes() const {
    FindType("");
    for (const Nlw_NlType* type : types_) type->FindPinDef("");
    for (const Nlw_NlBlock* macro : macros_) {
        macro->GetPinByAlias("");
        macro->FindPinBus("", 0);
        // A library type's bus index is built through any of its instances.
        for (const Nlw_NlBlock* child : macro->GetChildren())
            if (!child->IsMacro() && child->GetPinBuses()) child->FindPinBus("", 0);
    }
}
