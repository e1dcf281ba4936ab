// A set of names, each with the object it may be shared with: open
// addressing over a flat array keeps a lookup to about one probe, and the
// stored hash spares reading the names of other entries. The names are not
// copied: their text must outlive the use. Used where a node per name would
// cost an allocation each, a million times in a large design (the
// legalizer's scopes, the reader's check for repeated cell names).
#pragma once

#include <cstdint>
#include <cstring>
#include <functional>
#include <string_view>
#include <utility>
#include <vector>

class Nlw_NameTable {
public:
    struct Slot {
        uint64_t hash = 0;
        const char* data = nullptr;  // null: empty
        size_t len = 0;
        const void* sharer = nullptr;
    };

    void Reserve(size_t n) {
        if (2 * n > slots_.size()) Rehash(CapacityFor(n));
    }
    // Empties the table, keeping its storage, with room for n names.
    void Reset(size_t n) {
        slots_.assign(CapacityFor(n), Slot{});
        count_ = 0;
    }
    // The sharer of key's entry, inserted with sharer when absent; second
    // tells whether it was inserted.
    std::pair<const void*, bool> Insert(std::string_view key, const void* sharer) {
        if (key.data() == nullptr) key = std::string_view("", 0);  // null marks an empty slot
        if (2 * (count_ + 1) > slots_.size()) Rehash(CapacityFor(count_ + 1));
        const uint64_t h = std::hash<std::string_view>{}(key);
        Slot& slot = slots_[Probe(key, h)];
        if (slot.data) return {slot.sharer, false};
        slot = {h, key.data(), key.size(), sharer};
        ++count_;
        return {sharer, true};
    }
    // The entry of key, or null when it is absent.
    const Slot* Find(std::string_view key) const {
        if (slots_.empty()) return nullptr;
        const Slot& slot = slots_[Probe(key, std::hash<std::string_view>{}(key))];
        return slot.data ? &slot : nullptr;
    }

private:
    static size_t CapacityFor(size_t n) {
        size_t capacity = 16;
        while (capacity < 2 * n) capacity *= 2;
        return capacity;
    }
    size_t Probe(std::string_view key, uint64_t h) const {
        const size_t mask = slots_.size() - 1;
        for (size_t i = h & mask;; i = (i + 1) & mask) {
            const Slot& slot = slots_[i];
            if (slot.data == nullptr) return i;
            if (slot.hash == h && slot.len == key.size() &&
                std::memcmp(slot.data, key.data(), key.size()) == 0)
                return i;
        }
    }
    void Rehash(size_t capacity) {
        std::vector<Slot> old(capacity);
        old.swap(slots_);
        const size_t mask = capacity - 1;
        for (const Slot& slot : old) {
            if (slot.data == nullptr) continue;
            size_t i = slot.hash & mask;
            while (slots_[i].data) i = (i + 1) & mask;
            slots_[i] = slot;
        }
    }

    std::vector<Slot> slots_;
    size_t count_ = 0;
};
