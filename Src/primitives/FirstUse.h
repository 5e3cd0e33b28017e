#pragma once

// Values that are calculated at first need and then kept.

#include <atomic>
#include <cstddef>
#include <mutex>
#include <new>
#include <type_traits>

namespace PK {

/// Held while such a value is written, and over a fork: a child never meets one that a thread which it lacks was writing.
std::mutex& FirstUseMutex();

/// A value for the whole process. Unlike a function-local static it can be used in a child that was forked while another
/// thread made it. For static objects, constant-initialised.
template <class Value>
class FirstUse {
public:
    /// The value, made by the first call. Threads that meet in it each make the same, and one of them keeps it.
    template <class Make>
    const Value& Get(Make make) {
        if (!fIsKept.load(std::memory_order_acquire)) Keep(make());
        return *std::launder(reinterpret_cast<const Value*>(fBytes));
    }

private:
    static_assert(std::is_trivially_copyable_v<Value>,
                  "copied under the lock, where nothing may take it again");

    void Keep(const Value& value) {
        const std::scoped_lock lock(FirstUseMutex());
        if (fIsKept.load(std::memory_order_relaxed)) return;
        new (fBytes) Value(value);
        fIsKept.store(true, std::memory_order_release);
    }

    alignas(Value) std::byte fBytes[sizeof(Value)]{};
    std::atomic<bool> fIsKept{false};
};

} // namespace PK
