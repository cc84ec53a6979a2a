#pragma once
// Runs independent tasks 0..count-1 on worker threads and hands their results to the calling
// thread in task order, so that the merged result is the same as a sequential run.

#include <algorithm>
#include <atomic>
#include <cstddef>
#include <exception>
#include <functional>
#include <memory>
#include <optional>
#include <thread>
#include <vector>

// The number of worker threads to use for `requested` (0: one per core).
inline int WorkerCount(int requested) {
    if (requested > 0)
        return requested;
    return std::max(1u, std::thread::hardware_concurrency());
}

// Calls task(i, worker) for every i on `threads` workers (worker = 0 .. threads - 1, so tasks
// can keep per-worker state) and consume(i, result) on this thread for i = 0, 1, ... in order.
// When consume returns false, tasks not yet started are skipped and the result is false. An
// exception of a task is rethrown here when its result is due.
template <class Result>
bool RunInOrder(int threads, std::size_t count, const std::function<Result(std::size_t, int)>& task,
                const std::function<bool(std::size_t, Result&)>& consume) {
    if (threads <= 1 || count <= 1) {
        for (std::size_t i = 0; i < count; ++i) {
            Result result = task(i, 0);
            if (!consume(i, result))
                return false;
        }
        return true;
    }
    struct CSlot {
        std::optional<Result> result;
        std::exception_ptr error;
        std::atomic<bool> ready{false};
    };
    std::unique_ptr<CSlot[]> slots(new CSlot[count]);
    std::atomic<std::size_t> next{0};
    std::atomic<bool> stop{false};
    auto work = [&](int worker) {
        for (;;) {
            const std::size_t i = next.fetch_add(1);
            if (i >= count || stop.load(std::memory_order_relaxed))
                return;
            try {
                slots[i].result.emplace(task(i, worker));
            } catch (...) {
                slots[i].error = std::current_exception();
            }
            slots[i].ready.store(true, std::memory_order_release);
            slots[i].ready.notify_one();
        }
    };
    std::vector<std::thread> workers;
    const int used = static_cast<int>(std::min<std::size_t>(threads, count));
    for (int t = 0; t < used; ++t)
        workers.emplace_back(work, t);

    bool completed = true;
    std::exception_ptr error;
    for (std::size_t i = 0; i < count; ++i) {
        slots[i].ready.wait(false, std::memory_order_acquire);
        if (slots[i].error) {
            error = slots[i].error;
        } else if (consume(i, *slots[i].result)) {
            slots[i].result.reset();
            continue;
        }
        completed = false;
        break;
    }
    stop.store(true);
    // Tasks already taken finish; their results are dropped.
    for (auto& worker : workers)
        worker.join();
    if (error)
        std::rethrow_exception(error);
    return completed;
}
