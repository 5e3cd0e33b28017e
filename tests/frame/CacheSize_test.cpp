// The largest unified cache, or the values that stand in for it.

#include "frame/CacheSize.h"

#include "support/FlagScope.h"

#include <gtest/gtest.h>
#include <unistd.h>

using namespace PK;
using PKTest::FlagScope;

namespace {

long Unknown(int) {
    return 0;
}
long Refused(int) {
    return -1;
}
long FourLevels(int name) {
    return name == _SC_LEVEL4_CACHE_SIZE ? 0x8000000 : 0x2000000;
}
long ThreeLevels(int name) {
    return name == _SC_LEVEL3_CACHE_SIZE ? 0x2000000 : name == _SC_LEVEL2_CACHE_SIZE;
}
long TwoLevels(int name) {
    return name == _SC_LEVEL2_CACHE_SIZE ? 0x40000 : 0;
}
long CodeAndDataOnly(int name) {
    return name == _SC_LEVEL1_DCACHE_SIZE || name == _SC_LEVEL1_ICACHE_SIZE ? 0x8000 : 0;
}

void ExpectCache(long (*systemValue)(int), int32_t level, uint64_t bytes) {
    DetectCache(systemValue);
    EXPECT_EQ(sLargestCacheLevel, level);
    EXPECT_EQ(sLargestCacheBytes, bytes);
    EXPECT_EQ(LargestCacheBytes(), bytes);
}

} // namespace

TEST(CacheSize, IsThatOfTheHighestLevel) {
    const FlagScope flags;
    ExpectCache(FourLevels, 4, 0x8000000);
    ExpectCache(ThreeLevels, 3, 0x2000000);
    ExpectCache(TwoLevels, 2, 0x40000);
}

TEST(CacheSize, GoesByTheFlagsWhereTheSystemDoesNotTell) {
    const FlagScope flags;
    for (auto systemValue : {Unknown, Refused, CodeAndDataOnly}) {
        FlagScope::ClearAll();
        ExpectCache(systemValue, 0, 0);
        sCPUHasSSE2 = 1;
        ExpectCache(systemValue, 2, 0x100000);
        sCPUHasAVX2 = 1;
        ExpectCache(systemValue, 3, 0x300000);
        sCPUHasAVX2 = 0;
        sCPUHasAVX = 1;
        ExpectCache(systemValue, 3, 0x300000);
    }
}
