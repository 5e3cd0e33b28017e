// first_uses [NAME]: does one of the first uses, or lists them.

#include "stress/first_uses/FirstUse.h"

#include <algorithm>
#include <array>
#include <atomic>
#include <cstdio>
#include <thread>

namespace PKStress {

FirstUse::FirstUse(const char* name, std::function<Meeting()> prepare, int rounds)
    : fName(name), fPrepare(std::move(prepare)), fRounds(rounds) {
    All().push_back(this);
}

std::vector<const FirstUse*>& FirstUse::All() {
    static std::vector<const FirstUse*> all;
    return all;
}

namespace {

constexpr size_t kThreads = 4;

/// Lets the threads go at the same moment: who is there spins, for who sleeps comes too late.
class Gate {
public:
    void ArriveAndWait() {
        fArrived.fetch_add(1, std::memory_order_relaxed);
        while (fArrived.load(std::memory_order_relaxed) < kThreads) std::this_thread::yield();
    }

private:
    std::atomic<size_t> fArrived = 0; // relaxed: nothing but the use itself may order the threads
};

/// \return whether all threads got the same.
bool Meet(const Meeting& meeting) {
    std::array<Answer, kThreads> answers;
    std::vector<std::thread> threads;
    Gate gate;
    for (size_t i = 0; i < kThreads; ++i)
        threads.emplace_back([&, i] {
            gate.ArriveAndWait();
            answers[i] = meeting(i);
        });
    for (std::thread& thread : threads) thread.join();
    return !answers[0].empty() && std::ranges::count(answers, answers[0]) == kThreads;
}

bool Do(const FirstUse& use) {
    for (int i = 0; i < use.Rounds(); ++i)
        if (!Meet(use.Prepare())) return false;
    return true;
}

} // namespace
} // namespace PKStress

int main(int count, char** arguments) {
    using namespace PKStress;
    for (const FirstUse* use : FirstUse::All()) {
        if (count < 2)
            std::printf("%.*s\n", static_cast<int>(use->Name().size()), use->Name().data());
        else if (use->Name() == arguments[1])
            return Do(*use) ? 0 : 1;
    }
    return count < 2 ? 0 : 2;
}
