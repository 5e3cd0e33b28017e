// A value is made at its first use and kept, also where the process forks in the middle of that.

#include "primitives/FirstUse.h"

#include "support/Child.h"

#include <gtest/gtest.h>
#include <latch>
#include <thread>

using PK::FirstUse;

namespace {

struct Pair {
    int first, second;
};

} // namespace

TEST(FirstUse, MakesTheValueOnce) {
    static constinit FirstUse<Pair> sPair;
    int made = 0;
    const auto make = [&made] { return Pair{++made, 7}; };
    const Pair& pair = sPair.Get(make);
    EXPECT_EQ(&sPair.Get(make), &pair);
    EXPECT_EQ(pair.first, 1);
    EXPECT_EQ(pair.second, 7);
    EXPECT_EQ(made, 1);
}

TEST(FirstUse, KeepsTheValueOfTheFirstWhenThreadsMeet) {
    static constinit FirstUse<Pair> sPair;
    const Pair* inner = nullptr;
    const Pair& outer = sPair.Get([&inner] {
        std::thread([&inner] { inner = &sPair.Get([] { return Pair{1, 2}; }); }).join();
        return Pair{3, 4};
    });
    EXPECT_EQ(&outer, inner);
    EXPECT_EQ(outer.first, 1);
    EXPECT_EQ(outer.second, 2);
}

TEST(FirstUse, IsAtHandInAChildForkedWhileAnotherThreadMakesTheValue) {
    static constinit FirstUse<Pair> sPair;
    std::latch isMaking(1), isForked(1);
    std::thread maker([&] {
        sPair.Get([&] {
            isMaking.count_down();
            isForked.wait();
            return Pair{1, 2};
        });
    });
    isMaking.wait();
    EXPECT_EQ(PKTest::EndOfChild([] { return sPair.Get([] { return Pair{3, 4}; }).second == 4 ? 0 : 1; }), 0);
    isForked.count_down();
    maker.join();
    EXPECT_EQ(sPair.Get([] { return Pair{5, 6}; }).second, 2);
}
