// The bodies of the probes of the box blur's quotients.

#include "filters/BoxDivisorProbes.h"

#include "filters/BoxDivisors.h"

namespace PK::PK_TARGET {
namespace {

template <class Divisor>
void DivideAll(const int32_t* numerators, int32_t* quotients, int64_t count, int64_t divisor) {
    const Divisor by(divisor);
    for (int64_t i = 0; i < count; i += kLanes) Store(quotients + i, by.Quotient(LoadInts(numerators + i)));
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PKTest::BoxDivisorProbes& PKTest::BoxDivisorProbes::For<PK::Target::PK_TARGET>() {
    using namespace PK::PK_TARGET;
    static constexpr BoxDivisorProbes probes = {DivideAll<SmallDivisor>, DivideAll<LargeDivisor>,
                                                SmallDivisor::kLargest};
    return probes;
}
