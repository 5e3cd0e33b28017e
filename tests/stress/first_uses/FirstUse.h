#pragma once

// First uses: what the library makes when it is first asked for and then keeps, asked for by several threads at once.
//
//     const FirstUse sPQTable("pq-table", Once([] { return Floats(PQDecodeTable(), kPQDecodeEntries); }));
//
// A process has only one first use of what it keeps for all. So the program does one of them, and is started again and
// again by first_uses.sh; what each object keeps for itself meets its first use many times in one process.

#include <cstddef>
#include <functional>
#include <string_view>
#include <vector>

namespace PKStress {

using Answer = std::vector<float>;

/// What each thread does with its number, all at the same moment, and all must get the same answer.
using Meeting = std::function<Answer(size_t thread)>;

class FirstUse {
public:
    /// \param prepare  makes a meeting, on one thread, without using what the threads are to use first.
    /// \param rounds   meetings in one process.
    FirstUse(const char* name, std::function<Meeting()> prepare, int rounds = 1);

    std::string_view Name() const { return fName; }
    int Rounds() const { return fRounds; }
    Meeting Prepare() const { return fPrepare(); }

    static std::vector<const FirstUse*>& All();

private:
    const char* fName;
    std::function<Meeting()> fPrepare;
    int fRounds;
};

/// A meeting in which all threads do the same, and for which there is nothing to prepare.
template <class Use>
std::function<Meeting()> Once(Use use) {
    return [use] { return [use](size_t) { return use(); }; };
}

} // namespace PKStress
