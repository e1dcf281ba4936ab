// Parsing modules in a second thread while others are read: parsing is
// about half the work of reading a module, and modules are parsed
// independently of each other. Work that touches nothing shared is done
// with a module by the thread that parsed it.
#include <utility>

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

namespace {

// A slot's parser keeps the memory of the largest module it has parsed; one
// very large module does not keep it for the rest of the read.
constexpr size_t kKeepCapacity = size_t(2) << 20;

}  // namespace

ParseAhead::ParseAhead(Design& d, const std::vector<uint32_t>& order, Work work)
    : d_(d), order_(order), work_(std::move(work)), done_(order.size(), 0) {
    // The thread reads the places only: the modules themselves change.
    ranges_.reserve(order_.size());
    for (uint32_t i : order_) ranges_.emplace_back(d.modules[i].textBegin, d.modules[i].textEnd);
    // The parser picks its implementation on first use; that is done here,
    // before a second thread may ask for it too.
    (void)simdjson::get_active_implementation();
    if (order_.size() > 1) thread_ = std::thread([this] { Run(); });
}

ParseAhead::~ParseAhead() {
    {
        std::lock_guard<std::mutex> lock(mutex_);
        stop_ = true;
    }
    changed_.notify_all();
    if (thread_.joinable()) thread_.join();
}

void ParseAhead::Parse(size_t k, int thread) {
    Slot& s = slots_[k % kSlots];
    if (s.parser.capacity() > kKeepCapacity) s.parser = simdjson::dom::parser();
    s.error = s.parser
                  .parse(reinterpret_cast<const uint8_t*>(d_.text + ranges_[k].first),
                         ranges_[k].second - ranges_[k].first, false)
                  .get(s.root);
    // A module that does not parse as an object is reported by Open.
    Module& m = d_.modules[order_[k]];
    if (s.error || s.root.get_object().get(m.json)) return;
    if (work_) work_(k, thread);
}

bool ParseAhead::Claimable() const {
    return claimed_ < order_.size() && claimed_ < released_ + kSlots;
}

void ParseAhead::Run() {
    std::unique_lock<std::mutex> lock(mutex_);
    for (;;) {
        // Module k's slot is free once module k - kSlots is let go.
        changed_.wait(lock, [&] { return stop_ || claimed_ >= order_.size() || Claimable(); });
        if (stop_ || claimed_ >= order_.size()) return;
        const size_t k = claimed_++;
        lock.unlock();
        Parse(k, 1);
        lock.lock();
        done_[k] = 1;
        changed_.notify_all();
    }
}

void ParseAhead::Open(size_t k) {
    Module& m = d_.modules[order_[k]];
    if (!thread_.joinable()) {
        Parse(k, 0);
    } else {
        std::unique_lock<std::mutex> lock(mutex_);
        released_ = k;  // every module before k is done with
        changed_.notify_all();
        // Module k itself when the thread has not taken it; while the thread
        // works on it, the next ones the slots allow. The two threads share
        // the modules by how fast each goes.
        while (!done_[k]) {
            if (Claimable()) {
                const size_t j = claimed_++;
                lock.unlock();
                Parse(j, 0);
                lock.lock();
                done_[j] = 1;
            } else {
                changed_.wait(lock, [&] { return done_[k] != 0; });
            }
        }
    }
    const Slot& s = slots_[k % kSlots];
    if (s.error == simdjson::MEMALLOC) throw std::bad_alloc();
    if (s.error) OpenFailed(d_);
    if (s.root.get_object().get(m.json))
        Fail("module '" + std::string(m.name) + "': expected an object");
}

}  // namespace nlw_json
