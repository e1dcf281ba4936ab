// Parsing modules in a second thread while others are read: parsing is
// about half the work of reading a module, and modules are parsed
// independently of each other. Work that touches nothing shared is done
// with a module by the thread that parsed it.
#include <utility>

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

namespace {

// A thread's parser keeps the memory of the largest module it has parsed; one
// very large module does not keep it for the rest of the read.
constexpr size_t kKeepCapacity = size_t(2) << 20;

}  // namespace

ParseAhead::ParseAhead(Design& d, const std::vector<uint32_t>& order, Work work)
    : d_(d),
      order_(order),
      work_(std::move(work)),
      errors_(order.size(), simdjson::SUCCESS),
      done_(order.size(), kPending) {
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
    simdjson::dom::parser& parser = parsers_[thread];
    if (parser.capacity() > kKeepCapacity) parser = simdjson::dom::parser();
    simdjson::dom::element root;
    errors_[k] = parser
                     .parse(reinterpret_cast<const uint8_t*>(d_.text + ranges_[k].first),
                            ranges_[k].second - ranges_[k].first, false)
                     .get(root);
    Module& m = d_.modules[order_[k]];
    const bool object = !errors_[k] && !root.get_object().get(m.json);
    if (object && work_) work_(k, thread);
    // The document goes with the parser's next module.
    m.json = simdjson::dom::object();
    std::lock_guard<std::mutex> lock(mutex_);
    done_[k] = object || errors_[k] ? kParsed : kNoObject;
}

void ParseAhead::Run() {
    std::unique_lock<std::mutex> lock(mutex_);
    while (!stop_ && claimed_ < order_.size()) {
        const size_t k = claimed_++;
        lock.unlock();
        Parse(k, 1);
        changed_.notify_all();
        lock.lock();
    }
}

void ParseAhead::Open(size_t k) {
    if (!thread_.joinable()) {
        Parse(k, 0);
    } else {
        std::unique_lock<std::mutex> lock(mutex_);
        // Module k itself when the thread has not taken it; while the thread
        // works on it, the next ones. The two threads share the modules by
        // how fast each goes.
        while (done_[k] == kPending) {
            if (claimed_ < order_.size()) {
                const size_t j = claimed_++;
                lock.unlock();
                Parse(j, 0);
                lock.lock();
            } else {
                changed_.wait(lock, [&] { return done_[k] != kPending; });
            }
        }
    }
    if (errors_[k] == simdjson::MEMALLOC) throw std::bad_alloc();
    if (errors_[k]) OpenFailed(d_);
    if (done_[k] == kNoObject)
        Fail("module '" + std::string(d_.modules[order_[k]].name) + "': expected an object");
}

}  // namespace nlw_json
