#pragma once

// A value of the process that may be written while other threads read it. Each read sees some value that was written, and
// orders nothing else; it costs what a plain read costs.

#include <atomic>

namespace PK {

template <class T>
class Relaxed {
public:
    constexpr Relaxed(T value = {}) noexcept : fValue(value) {}

    operator T() const noexcept { return fValue.load(std::memory_order_relaxed); }
    T operator=(T value) noexcept {
        fValue.store(value, std::memory_order_relaxed);
        return value;
    }

private:
    std::atomic<T> fValue;
    static_assert(std::atomic<T>::is_always_lock_free);
};

} // namespace PK
