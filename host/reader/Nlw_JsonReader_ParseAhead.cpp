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
constexpr size_t kKeepCapacity = size_t(16) << 20;

}  // namespace

ParseAhead::ParseAhead(Design& d, const std::vector<uint32_t>& order, bool share, Work work)
    : d_(d), order_(order), share_(share), work_(std::move(work)) {
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

void ParseAhead::Run() {
    // Shared, the thread takes the even places; the caller the odd ones.
    const size_t step = share_ ? 2 : 1;
    for (size_t k = 0; k < order_.size(); k += step) {
        {
            // Module k's slot is free once module k - kSlots is let go.
            std::unique_lock<std::mutex> lock(mutex_);
            changed_.wait(lock, [&] { return stop_ || k < released_ + kSlots; });
            if (stop_) return;
        }
        Parse(k, 1);
        {
            std::lock_guard<std::mutex> lock(mutex_);
            parsed_ = k + 1;
        }
        changed_.notify_all();
    }
}

void ParseAhead::Open(size_t k) {
    Module& m = d_.modules[order_[k]];
    if (!thread_.joinable()) {
        Parse(k, 0);
    } else if (share_ && k % 2 == 1) {
        {
            std::lock_guard<std::mutex> lock(mutex_);
            released_ = k;  // the thread may go on meanwhile
        }
        changed_.notify_all();
        Parse(k, 0);
    } else {
        std::unique_lock<std::mutex> lock(mutex_);
        released_ = k;  // every module before k is done with
        changed_.notify_all();
        changed_.wait(lock, [&] { return parsed_ > k; });
    }
    const Slot& s = slots_[k % kSlots];
    if (s.error == simdjson::MEMALLOC) throw std::bad_alloc();
    if (s.error) OpenFailed(d_);
    if (s.root.get_object().get(m.json))
        Fail("module '" + std::string(m.name) + "': expected an object");
}

}  // namespace nlw_json
