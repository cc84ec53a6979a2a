#pragma once
// Runs independent tasks 0..count-1 on worker threads and hands their results to the calling
// thread in task order, so that the merged result is the same as a sequential run.

#include <algorithm>
#include <atomic>
#include <cstddef>
#include <exception>
#include <functional>
#include <memory>
#include <system_error>
#include <thread>
#include <vector>

// Starts a thread running `work`; throws (std::system_error) when the system refuses one.
using CThreadStarter = std::function<std::thread(std::function<void()>)>;

inline std::thread StartThread(std::function<void()> work) {
    return std::thread(std::move(work));
}

// The number of worker threads to use for `requested` (0: one per core).
inline int WorkerCount(int requested) {
    if (requested > 0)
        return requested;
    return std::max(1u, std::thread::hardware_concurrency());
}

// Calls task(i, worker) for every i on `threads` workers (worker = 0 .. threads - 1, so tasks
// can keep per-worker state) and consume(i, result) on this thread for i = 0, 1, ... in order.
// When consume returns false, tasks not yet started are skipped and the result is false. An
// exception of a task is rethrown here when its result is due, after the results before it; one
// of consume is rethrown once the workers have stopped.
//
// Workers take runs of consecutive tasks, a sixteenth of their share at a time: tasks of a few
// microseconds would otherwise spend more time handing their results over than working.
//
// Workers are started with `start`; when the system refuses a thread, the work goes on with the
// workers already started, or on this thread alone when it refused the first.
template <class Result>
bool RunInOrder(int threads, std::size_t count, const std::function<Result(std::size_t, int)>& task,
                const std::function<bool(std::size_t, Result&)>& consume,
                const CThreadStarter& start = StartThread) {
    auto runHere = [&] {
        for (std::size_t i = 0; i < count; ++i) {
            Result result = task(i, 0);
            if (!consume(i, result))
                return false;
        }
        return true;
    };
    if (threads <= 1 || count <= 1)
        return runHere();
    const std::size_t run =
        std::max<std::size_t>(1, count / (static_cast<std::size_t>(threads) * 16));
    const std::size_t runs = (count + run - 1) / run;
    struct CSlot {
        std::vector<Result> results;  // of the run's first tasks, up to a failed one
        std::exception_ptr error;
        std::atomic<bool> ready{false};
    };
    std::unique_ptr<CSlot[]> slots(new CSlot[runs]);
    std::atomic<std::size_t> next{0};
    std::atomic<bool> stop{false};
    auto work = [&](int worker) {
        for (;;) {
            const std::size_t r = next.fetch_add(1);
            if (r >= runs || stop.load(std::memory_order_relaxed))
                return;
            CSlot& slot = slots[r];
            const std::size_t end = std::min(count, (r + 1) * run);
            try {
                for (std::size_t i = r * run; i < end && !stop.load(std::memory_order_relaxed); ++i)
                    slot.results.push_back(task(i, worker));
            } catch (...) {
                slot.error = std::current_exception();
            }
            slot.ready.store(true, std::memory_order_release);
            slot.ready.notify_one();
        }
    };
    std::vector<std::thread> workers;
    const int wanted = static_cast<int>(std::min<std::size_t>(threads, runs));
    workers.reserve(wanted);
    try {
        for (int t = 0; t < wanted; ++t)
            workers.push_back(start([&work, t] { work(t); }));
    } catch (const std::system_error&) {
        // Refused by the system: the workers already started do the work.
    } catch (...) {
        stop.store(true);
        for (auto& worker : workers)
            worker.join();
        throw;
    }
    if (workers.empty())
        return runHere();

    bool completed = true;
    std::exception_ptr error;
    try {
        for (std::size_t r = 0; r < runs && completed && !error; ++r) {
            CSlot& slot = slots[r];
            slot.ready.wait(false, std::memory_order_acquire);
            for (std::size_t k = 0; k < slot.results.size() && completed; ++k)
                completed = consume(r * run + k, slot.results[k]);
            if (completed && slot.error)
                error = slot.error;
            slot.results.clear();
        }
    } catch (...) {
        // A failing consume (out of memory) must not leave the workers running.
        error = std::current_exception();
    }
    stop.store(true);
    // Runs already taken finish their current task; their results are dropped.
    for (auto& worker : workers)
        worker.join();
    if (error)
        std::rethrow_exception(error);
    return completed;
}
