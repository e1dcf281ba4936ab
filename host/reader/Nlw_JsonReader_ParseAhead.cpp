// Parsing the next module in a thread of its own while this one is read:
// parsing is about half the work of reading a module, and modules are
// parsed independently of each other.
#include <utility>

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

ParseAhead::ParseAhead(Design& d, const std::vector<uint32_t>& order, bool share)
    : d_(d), order_(order), share_(share) {
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

void ParseAhead::Parse(size_t k) {
    Slot& s = slots_[k % 2];
    s.error = s.parser
                  .parse(reinterpret_cast<const uint8_t*>(d_.text + ranges_[k].first),
                         ranges_[k].second - ranges_[k].first, false)
                  .get(s.root);
}

void ParseAhead::Run() {
    // Shared, the thread takes the even places and slot 0; the caller the
    // odd places and slot 1.
    const size_t step = share_ ? 2 : 1;
    for (size_t k = 0; k < order_.size(); k += step) {
        {
            // Slot k % 2 is free once module k - 2 is let go.
            std::unique_lock<std::mutex> lock(mutex_);
            changed_.wait(lock, [&] { return stop_ || k < released_ + 2; });
            if (stop_) return;
        }
        Parse(k);
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
        Parse(k);
    } else if (share_ && k % 2 == 1) {
        {
            std::lock_guard<std::mutex> lock(mutex_);
            released_ = k;  // the thread may go on to k + 1 meanwhile
        }
        changed_.notify_all();
        Parse(k);
    } else {
        std::unique_lock<std::mutex> lock(mutex_);
        released_ = k;  // every module before k is done with
        changed_.notify_all();
        changed_.wait(lock, [&] { return parsed_ > k; });
    }
    const Slot& s = slots_[k % 2];
    if (s.error == simdjson::MEMALLOC) throw std::bad_alloc();
    if (s.error) OpenFailed(d_);
    if (s.root.get_object().get(m.json))
        Fail("module '" + std::string(m.name) + "': expected an object");
}

}  // namespace nlw_json
