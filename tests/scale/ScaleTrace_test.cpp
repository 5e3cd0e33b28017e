// What the trace is told of scale-and-convert calls.

#include "zebcore/debug.h"
#include "zebcore/threads.h"

#include <PixelKiln/ScaleConvert.h>

#include <gtest/gtest.h>

#include <string>

namespace {

constexpr PK_PixelFormat kUYVY = PK_PixelFormat_UYVY_422_8u, kBGRA = PK_PixelFormat_BGRA_4444_8u;

std::string sTraced;

class ScaleTrace : public testing::Test {
protected:
    ScaleTrace() {
        sTraced.clear();
        zebcore::debug::SetTraceSink([](const char* text) { sTraced += text; });
    }
    ~ScaleTrace() override {
        zebcore::debug::SetTraceSink(nullptr);
        zebcore::debug::ClearTraceLevel("PK.ScaleConvert");
    }

    static std::string Line(const std::string& text) {
        return "<" + std::to_string(zebcore::threads::GetCurrentThreadID()) + "> <PK.ScaleConvert> <5> " +
               text + "\n";
    }

    PK_Result Scale(int32_t field, int32_t width, int32_t quality) {
        return PK_ScaleConvert(fFrom, 64, 4, 4, kUYVY, field, fTo, 64, width, 2, kBGRA, 0, quality);
    }

    uint8_t fFrom[16][64] = {}, fTo[16][64];
};

TEST_F(ScaleTrace, IsSilentAtFirst) {
    ASSERT_EQ(Scale(1, 2, 2), PK_Success);
    EXPECT_EQ(sTraced, "");
}

TEST_F(ScaleTrace, TellsTheRoute) {
    zebcore::debug::SetTraceLevel("PK.ScaleConvert", 5);
    ASSERT_EQ(Scale(1, 2, 2), PK_Success);
    EXPECT_EQ(sTraced,
              Line("4 x 4 UYVY_422_8u, field 1, to 2 x 2 BGRA_4444_8u, field 0, quality Low: half size"));
    sTraced.clear();
    ASSERT_EQ(Scale(2, 4, 1), PK_Success);
    EXPECT_EQ(
        sTraced,
        Line("4 x 4 UYVY_422_8u, field 2, to 4 x 2 BGRA_4444_8u, field 0, quality High: one field") +
            Line("4 x 2 UYVY_422_8u, field 0, to 4 x 2 BGRA_4444_8u, field 0, quality High: conversion"));
    sTraced.clear();
    ASSERT_EQ(PK_ScaleConvertOneField(fFrom, 64, 4, 4, kUYVY, 0, fTo, 64, 4, 4, kBGRA, 1, 5, 2), PK_Success);
    EXPECT_EQ(sTraced, Line("4 x 4 UYVY_422_8u, field 0, to 4 x 4 BGRA_4444_8u, field 1, rendered field 2, "
                            "quality High: motion"));
    zebcore::debug::SetTraceLevel("PK.ScaleConvert", 4);
    sTraced.clear();
    ASSERT_EQ(Scale(1, 2, 2), PK_Success);
    EXPECT_EQ(sTraced, "");
}

} // namespace
