// A counting semaphore with counted acquisition and time-outs, on a mutex and a condition
// variable.
#pragma once

#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <mutex>
#include <optional>
#include <string>

class Semaphore {
public:
    using Deadline = std::optional<std::chrono::steady_clock::time_point>;

    Semaphore(int32_t count, const char* name);
    Semaphore(const Semaphore&) = delete;
    Semaphore& operator=(const Semaphore&) = delete;

    // Takes count units at once; waits until they are all there or the deadline passes (no
    // deadline waits forever). Returns false on time-out, having taken nothing.
    bool Acquire(int32_t count, Deadline deadline);
    void Release(int32_t count);

    // Units available now, or minus the units blocked threads are waiting for.
    int32_t Count() const;
    // Threads blocked in Acquire right now.
    int32_t Waiting() const;
    const std::string& Name() const { return fName; }

private:
    mutable std::mutex fLock;
    std::condition_variable fChanged;
    int32_t fCount;
    int32_t fWanted = 0; // units asked for by blocked threads
    int32_t fWaiting = 0;
    std::string fName;
};
