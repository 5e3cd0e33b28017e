#pragma once

// The numbers of std::rand(), whose sequence the library shares with the rest of the process.

namespace PK {

/// The next number. Safe from all threads.
int SharedRandom() noexcept;

/// std::srand().
void SeedSharedRandom(unsigned seed) noexcept;

/// Many numbers, with one lock for all. Nothing else is locked while there is one.
class SharedRandoms {
public:
    SharedRandoms() noexcept;
    ~SharedRandoms();
    SharedRandoms(const SharedRandoms&) = delete;
    SharedRandoms& operator=(const SharedRandoms&) = delete;

    int Next() noexcept;
};

} // namespace PK
