// The module definitions of a large design, formatted on two threads.
//
// The blocks are cut into runs of about the same size. This thread writes
// the even runs straight to the file; a copy of the writer formats the odd
// runs into memory on a second thread, and this thread writes each one out
// in its turn. Messages of the second thread are kept and issued when its
// run is written, so the file and the messages are those of one thread. The
// model is only read meanwhile: its name indexes are built beforehand, and
// the text operations' result buffers are per thread.
#include <algorithm>
#include <condition_variable>
#include <cstring>
#include <exception>
#include <mutex>
#include <system_error>
#include <thread>
#include <typeinfo>

#include "Nlw_VerilogWriter.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_Nl.h"

namespace {

size_t Weight(const Nlw_NlBlock* block) {
    return 1 + block->GetChildren().size() + block->GetPinCount();
}

// The runs [first, last) of blocks, each of about target weight.
std::vector<std::pair<size_t, size_t>> Runs(const std::vector<Nlw_NlBlock*>& blocks,
                                            size_t target) {
    std::vector<std::pair<size_t, size_t>> runs;
    size_t first = 0, weight = 0;
    for (size_t i = 0; i < blocks.size(); ++i) {
        weight += Weight(blocks[i]);
        if (weight >= target || i + 1 == blocks.size()) {
            runs.emplace_back(first, i + 1);
            first = i + 1;
            weight = 0;
        }
    }
    return runs;
}

}  // namespace

void Nlw_VerilogWriter::WriteBlocks(Nlw_NlView* view, const std::vector<Nlw_NlBlock*>& blocks) {
    size_t total = 0;
    for (const Nlw_NlBlock* block : blocks) total += Weight(block);
    const bool forced = Nlw_Util::WriteThreadsAsked() == 2;
    // A class of its own may write blocks its own way; its copy would not.
    const bool two =
        typeid(*this) == typeid(Nlw_VerilogWriter) && Nlw_Util::WriteOnTwoThreads(total);
    // Runs of about 1/48 of the whole, and no smaller than an eighth of the
    // size that takes two threads: the second thread is never far behind,
    // and what waits in memory is small.
    const size_t target = forced ? 1 : std::max<size_t>(total / 48, 6250);
    const std::vector<std::pair<size_t, size_t>> runs =
        two ? Runs(blocks, target) : std::vector<std::pair<size_t, size_t>>();
    if (runs.size() < 2) {
        for (Nlw_NlBlock* block : blocks) WriteBlock(block);
        return;
    }
    view->BuildNameIndexes();

    // Two slots, so that the second thread formats one run while this one
    // writes out the other.
    struct Slot {
        explicit Slot(const Nlw_VerilogWriter& from) : writer(from) { writer.CollectText(); }
        Nlw_VerilogWriter writer;
        Port_MsgDeferral messages;
        bool full = false;
    };
    Slot slots[2] = {Slot(*this), Slot(*this)};
    std::mutex mutex;
    std::condition_variable changed;
    bool stop = false;
    std::exception_ptr failure;

    auto format = [&]() {
        for (size_t r = 1, n = 0; r < runs.size(); r += 2, ++n) {
            Slot& slot = slots[n % 2];
            {
                std::unique_lock<std::mutex> lock(mutex);
                changed.wait(lock, [&] { return stop || !slot.full; });
                if (stop) return;
            }
            try {
                slot.writer.CollectText();
                slot.messages.Keep();
                for (size_t i = runs[r].first; i < runs[r].second; ++i)
                    slot.writer.WriteBlock(blocks[i]);
                slot.messages.Stop();
            } catch (...) {
                slot.messages.Stop();
                std::lock_guard<std::mutex> lock(mutex);
                failure = std::current_exception();
                slot.full = true;
                changed.notify_all();
                return;
            }
            {
                std::lock_guard<std::mutex> lock(mutex);
                slot.full = true;
            }
            changed.notify_all();
        }
    };
    std::thread helper;
    try {
        helper = std::thread(format);
    } catch (const std::system_error&) {
        for (Nlw_NlBlock* block : blocks) WriteBlock(block);
        return;
    }
    // Stops and joins the second thread however this one leaves.
    struct Join {
        std::thread& thread;
        std::mutex& mutex;
        std::condition_variable& changed;
        bool& stop;
        ~Join() {
            {
                std::lock_guard<std::mutex> lock(mutex);
                stop = true;
            }
            changed.notify_all();
            if (thread.joinable()) thread.join();
        }
    } join{helper, mutex, changed, stop};

    for (size_t r = 0, n = 0; r < runs.size(); ++r) {
        if (r % 2 == 0) {
            for (size_t i = runs[r].first; i < runs[r].second; ++i) WriteBlock(blocks[i]);
            continue;
        }
        Slot& slot = slots[n++ % 2];
        {
            std::unique_lock<std::mutex> lock(mutex);
            changed.wait(lock, [&] { return slot.full; });
            if (failure) std::rethrow_exception(failure);
        }
        AppendTextOf(slot.writer);
        slot.messages.Replay();
        {
            std::lock_guard<std::mutex> lock(mutex);
            slot.full = false;
        }
        changed.notify_all();
    }
}
