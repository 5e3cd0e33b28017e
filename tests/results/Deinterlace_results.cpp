// One field rebuilt from the other.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/Rounding.h"

#include <PixelKiln/Deinterlace.h>

#include <algorithm>

namespace {

using namespace PKResults;

struct Shape {
    int32_t width, height;
    Walk source, destination;
};

constexpr Shape kShapes[] = {{1, 4, kTight, kTight},
                             {2, 5, kTight, kSpread},
                             {7, 6, kSpread, kTight},
                             {33, 7, kUpwards, kSpread},
                             {101, 4, kTight, kUpwards}};

struct Rebuilding {
    PK_PixelFormat source, destination;
    int32_t field, quality;
    Content content = Content::kEdges;
    RoundingMode rounding = RoundingMode::kNearest;

    void Make(Line& line, const Shape& shape) const {
        Image from(source, shape.width, shape.height, shape.source, line.random);
        Image image(destination, shape.width, shape.height, shape.destination, line.random);
        from.Fill(source, content, line.random);
        const Rounding mode(rounding);
        line.results.Add(PK_DeinterlaceCopy(from.First(), from.Step(), source, image.First(), image.Step(),
                                            destination, shape.width, shape.height, field, quality));
        if (IsFloat(destination)) image.UniteNaNs(); // infinities make them
        image.AddTo(line.results);
    }

    void MakeInPlace(Line& line, const Shape& shape) const {
        Image image(source, shape.width, shape.height, shape.source, line.random);
        image.Fill(source, content, line.random);
        const Rounding mode(rounding);
        line.results.Add(
            PK_Deinterlace(image.First(), image.Step(), source, shape.width, shape.height, field, quality));
        if (IsFloat(source)) image.UniteNaNs();
        image.AddTo(line.results);
    }
};

void AddFormat(Lines& lines, PK_PixelFormat format) {
    const PK_PixelFormat sources[] = {PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_UYVY_422_8u_709,
                                      PK_PixelFormat_V210_422_10u, PK_PixelFormat_PRGB_4444_15u,
                                      PK_PixelFormat_VUYA_4444_32f};
    for (const int32_t quality : {3, 4})
        for (const int32_t field : {0, 1, 2}) {
            const std::string name =
                NameOf(format) + "/quality-" + std::to_string(quality) + "/field-" + std::to_string(field);
            lines.Add(name, [&](Line& line) {
                for (const Shape& shape : kShapes)
                    Rebuilding{format, format, field, quality}.MakeInPlace(line, shape);
            });
            for (const PK_PixelFormat source : sources)
                lines.Add(name + "/" + NameOf(source), [&](Line& line) {
                    for (const Shape& shape : kShapes)
                        Rebuilding{source, format, field, quality}.Make(line, shape);
                });
            lines.Add(name + "/down", [&](Line& line) {
                for (const Shape& shape : kShapes)
                    Rebuilding{format, format, field, quality, Content::kOrdinary, RoundingMode::kDown}
                        .MakeInPlace(line, shape);
            });
        }
}

void AddHeights(Lines& lines) {
    for (const int32_t quality : {0, 3, 4, 5})
        lines.Add("heights/quality-" + std::to_string(quality), [&](Line& line) {
            for (int32_t height = 0; height < 9; ++height)
                for (const int32_t field : {-1, 0, 1, 2})
                    Rebuilding{PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRP_4444_8u, field, quality}
                        .MakeInPlace(line, {9, height, kTight, kTight});
        });
    for (const int32_t quality : {3, 4})
        lines.Add("wide/quality-" + std::to_string(quality), [&](Line& line) {
            Rebuilding{PK_PixelFormat_V210_422_10u, PK_PixelFormat_BGRA_4444_8u, 0, quality}.Make(
                line, {17001, 4, kTight, kTight});
        });
}

void AddOdd(Lines& lines) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
    const auto copy = [](Line& line, PK_PixelFormat from, PK_PixelFormat to, Nulls nulls, int32_t width,
                         int32_t height) {
        constexpr size_t kLength = size_t{16} * kOddWidth;
        Image source(kLength, kOddHeight, kTight, line.random),
            image(kLength, kOddHeight, kTight, line.random);
        for (const int32_t quality : {3, 4})
            line.results.Add(PK_DeinterlaceCopy(nulls(0, source.First()), source.Step(), from,
                                                nulls(1, image.First()), image.Step(), to, width, height, 0,
                                                quality));
        image.AddTo(line.results);
    };
    AddOddCalls(lines, "deinterlace", 2, [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        copy(line, kFormat, kFormat, nulls, width, height);
    });
    const auto addFormat = [&](PK_PixelFormat format) {
        lines.Add("deinterlace/odd/" + NameOf(format), [&](Line& line) {
            copy(line, format, kFormat, Nulls::None(), kOddWidth, kOddHeight);
            copy(line, kFormat, format, Nulls::None(), kOddWidth, kOddHeight);
            copy(line, format, format, Nulls::None(), kOddWidth, kOddHeight);
        });
    };
    std::ranges::for_each(kStrangers, addFormat);
    std::ranges::for_each(kStreams, addFormat);
}

void AddDeinterlacing(Lines& lines) {
    for (const PK_PixelFormat format : kRasters) AddFormat(lines, format);
    AddHeights(lines);
    AddOdd(lines);
}

const Family sDeinterlace("deinterlace", AddDeinterlacing);

} // namespace
