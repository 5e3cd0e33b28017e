#include "support/KernelRows.h"

#include "convert/Fusion.h"
#include "reference/ReferenceKernels.h"
#include "support/FloatEnvironment.h"
#include "support/Samples.h"
#include "support/Walk.h"

#include <PixelKiln/PixelFormat.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>

namespace PKTest {
namespace {

using namespace PK;

PK_PixelFormat FormatOfSource(Kernel kernel) {
    return Info(kernel).operands.source.format;
}
PK_PixelFormat FormatOfDestination(Kernel kernel) {
    return Info(kernel).operands.destination.format;
}

void RunReference(Kernel kernel, bool vectorRule, const void* source, void* destination, int32_t width) {
    const KernelRow& row = Info(kernel);
    const int quality = kernel == Kernel::Upsample422To444Float32Row_Interpolate ? 4 : 0;
    reference::Run(row.name, FormatOfSource(kernel), FormatOfDestination(kernel), vectorRule, source,
                   destination, width, quality);
}

/// The pixels of a row of so many bytes; twelve pixels are whole units of every format.
int32_t WidthOf(Kernel kernel, size_t bytes) {
    return static_cast<int32_t>(bytes * 12 / SourceBytes(kernel, 12));
}

/// What the rules give of a row: the plain one, and the one of the vector bodies.
struct ExpectedRows {
    Bytes plain, vector;

    ExpectedRows(Kernel kernel, const void* source, int32_t width)
        : plain(DestinationBytes(kernel, width)), vector(plain.size()) {
        RunExpected(kernel, false, source, plain.data(), width);
        if (Info(kernel).agreement.kind == Agreement::Exact)
            vector = plain;
        else
            RunExpected(kernel, true, source, vector.data(), width);
    }

    void Check(Kernel kernel, Target target, const uint8_t* actual) const {
        const Bytes& expected = HasVectorRule(kernel, target) ? vector : plain;
        if (std::memcmp(expected.data(), actual, expected.size()) == 0) return;
        ASSERT_EQ("", FirstDifference(FormatOfDestination(kernel), expected.size(), expected.data(), actual,
                                      UnitsOff(kernel)));
    }
};

Bytes AwkwardRow(Kernel kernel, int32_t width) {
    Bytes row(SourceBytes(kernel, width));
    Random random(static_cast<uint64_t>(kernel) + 1);
    FillSamples(FormatOfSource(kernel), row.data(), row.size(), random);
    return row;
}

} // namespace

std::string Describe(Kernel kernel) {
    const auto name = [](PK_PixelFormat format) {
        return format == PK_PixelFormat_RGB_444_10u ? "RGB_444_10u" : PK_PixelFormatName(format);
    };
    return std::string(Info(kernel).name) + " from " + name(FormatOfSource(kernel)) + " to " +
           name(FormatOfDestination(kernel));
}

std::vector<Target> TargetsWithBody(Kernel kernel) {
    std::vector<Target> targets = TargetsOfThisProcessor();
    std::erase_if(targets, [kernel](Target target) { return !Body(kernel, target); });
    return targets;
}

bool HasVectorRule(Kernel kernel, Target target) {
    const auto& agreement = Info(kernel).agreement;
    return agreement.kind == Agreement::Declared && target >= agreement.from;
}

int64_t UnitsOff(Kernel kernel) {
    return kernel == Kernel::GammaToLinearRow || kernel == Kernel::LinearToGammaRow ? 1 : 0;
}

size_t SourceBytes(Kernel kernel, int32_t width) {
    return static_cast<size_t>(PK_PixelFormatPackedRowBytes(FormatOfSource(kernel), width));
}

size_t DestinationBytes(Kernel kernel, int32_t width) {
    return static_cast<size_t>(PK_PixelFormatPackedRowBytes(FormatOfDestination(kernel), width));
}

void RunExpected(Kernel kernel, bool vectorRule, const void* source, void* destination, int32_t width) {
    for (const Fusion& fusion : Fusions()) {
        if (fusion.fused != kernel) continue;
        Bytes from, to(static_cast<size_t>(width) * 16);
        for (const Kernel part : fusion.parts) {
            const bool first = part == fusion.parts.front(), last = part == fusion.parts.back();
            RunReference(part, vectorRule, first ? source : from.data(), last ? destination : to.data(),
                         width);
            from = to;
        }
        return;
    }
    RunReference(kernel, vectorRule, source, destination, width);
}

void ExpectReference(Kernel kernel, const void* source, size_t bytes) {
    const int32_t width = WidthOf(kernel, bytes);
    const ExpectedRows expected(kernel, source, width);
    Bytes actual(DestinationBytes(kernel, width));
    ForEachBody(kernel, [&](Target target, RowKernel body) {
        body(source, actual.data(), width);
        expected.Check(kernel, target, actual.data());
    });
}

void ExpectReferenceInPlace(Kernel kernel) {
    constexpr int32_t kWidth = 101;
    const Bytes source = AwkwardRow(kernel, kWidth);
    const ExpectedRows expected(kernel, source.data(), kWidth);
    ForEachBody(kernel, [&](Target target, RowKernel body) {
        Bytes row = source;
        body(row.data(), row.data(), kWidth);
        expected.Check(kernel, target, row.data());
    });
}

void ExpectReferenceInEveryRoundingMode(Kernel kernel) {
    const Bytes source = AwkwardRow(kernel, 20000);
    for (const uint32_t mode : {kRoundDown, kRoundUp, kRoundToZero}) {
        SCOPED_TRACE(testing::Message() << "MXCSR bits " << mode);
        const FloatEnvironment environment(mode);
        ExpectReference(kernel, source);
        if (testing::Test::HasFatalFailure()) return;
    }
}

void ExpectReferenceForAllCodes(Kernel kernel) {
    Bytes source(65536 * 4);
    Walk walk;
    for (unsigned third = 0; third < 256; ++third) {
        if (walk.LeavesOut()) continue;
        for (unsigned i = 0; i < 65536; ++i) {
            source[4 * i] = static_cast<uint8_t>(i);
            source[4 * i + 1] = static_cast<uint8_t>(i >> 8);
            source[4 * i + 2] = static_cast<uint8_t>(third);
            source[4 * i + 3] = static_cast<uint8_t>(7 * i + (i >> 8) + third);
        }
        ASSERT_NO_FATAL_FAILURE(ExpectReference(kernel, source));
    }
}

Floats CodeBordersAtEveryPlace(int codes, float scale, float zero) {
    constexpr float kInfinity = std::numeric_limits<float>::infinity();
    constexpr float kDenormal = std::numeric_limits<float>::denorm_min();
    Floats row;
    const auto add = [&row](float value) { row.insert(row.end(), 4, value); };
    for (const float value : {0.0f, -0.0f, kDenormal, -kDenormal}) add(value);
    for (int code = -2; code <= codes + 1; ++code) {
        const float border = (static_cast<float>(code) + 0.5f - zero) / scale;
        const float below = std::nextafter(border, -kInfinity), above = std::nextafter(border, kInfinity);
        for (const float value :
             {std::nextafter(below, -kInfinity), below, border, above, std::nextafter(above, kInfinity)})
            add(value);
    }
    return row;
}

} // namespace PKTest
