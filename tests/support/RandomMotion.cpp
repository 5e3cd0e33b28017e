#include "support/RandomMotion.h"

#include "convert/RasterFormats.h"

#include <PixelKiln/Lifecycle.h>
#include <PixelKiln/Motion.h>

#include <array>
#include <cmath>
#include <iterator>
#include <sstream>

namespace PKTest {
namespace {

using namespace PK;
using PKReference::MotionArguments;

int32_t Between(Random& random, int32_t least, int32_t most) {
    return least + static_cast<int32_t>(random.Below(static_cast<uint32_t>(most - least + 1)));
}

float Between(Random& random, float least, float most) {
    return least + (most - least) * static_cast<float>(random.Next()) * 0x1p-32f;
}

bool OneIn(Random& random, uint32_t count) {
    return random.Below(count) == 0;
}

template <class Values>
auto Pick(Random& random, const Values& values) {
    return values[random.Below(static_cast<uint32_t>(std::size(values)))];
}

PK_PixelFormat PickPacked4444(Random& random) {
    PK_PixelFormat format;
    do format = Pick(random, kRasterFormats);
    while (!IsPacked4444(format));
    return format;
}

/// Pixels that cannot be parted: a row's pixels go on in groups of so many.
int32_t GroupOf(PK_PixelFormat format) {
    return IsV210(format) ? 6 : Is422(format) ? 2 : 1;
}

struct Size {
    int32_t width, height;
};

/// One in eight is high enough for bands, and as many are wide enough for more than one block of columns.
Size DrawSize(Random& random) {
    if (OneIn(random, 8)) return {Between(random, 1, 8), Between(random, 33, 110)};
    if (OneIn(random, 8)) return {Between(random, 120, 300), Between(random, 1, 3)};
    return {Between(random, 1, 32), Between(random, 1, 32)};
}

bool IsWhole(const MotionArguments& a) {
    return a.crop.left == 0 && a.crop.top == 0 && a.crop.right == a.sourceWidth &&
           a.crop.bottom == a.sourceHeight;
}

} // namespace

struct RandomMotion::Formats {
    explicit Formats(Random& random)
        : source(PickPacked4444(random)), destination(Pick(random, kRasterFormats)) {
        if (OneIn(random, 2)) destination = PickPacked4444(random);
        if (OneIn(random, 6)) source = PK_PixelFormat_BGRP_4444_32f_Linear; // that of the highest quality
        sourceSize = DrawSize(random);
        destinationSize = OneIn(random, 3) ? sourceSize : DrawSize(random);
        isOfGroups = GroupOf(destination) > 1 && OneIn(random, 2);
        if (!isOfGroups) return;
        sourceSize.width = 6 * Between(random, 1, 3);
        destinationSize.width = 24;
    }
    PK_PixelFormat source, destination;
    Size sourceSize, destinationSize;
    bool isOfGroups;
};

RandomMotion::RandomMotion(Random& random) : RandomMotion(Formats(random), random) {}

RandomMotion::RandomMotion(const Formats& formats, Random& random)
    : source(formats.source, formats.sourceSize.width, formats.sourceSize.height, random),
      destination(formats.destination, formats.destinationSize.width, formats.destinationSize.height, random),
      fArguments{} {
    MotionArguments& a = fArguments;
    const bool hasFields = OneIn(random, 2);
    a.sourceField = hasFields ? Between(random, 0, 2) : 0;
    a.destinationField = hasFields ? Between(random, 0, 2) : 0;
    a.renderField = OneIn(random, 2) ? 0 : Between(random, 0, 2);
    a.crop = {0, 0, source.width, source.height};
    a.aspectNum = a.aspectDen = 1;
    a.opacity = OneIn(random, 3) ? Between(random, 0.05f, 1.0f) : 1;
    a.composites = OneIn(random, 3);
    // Those that go up and down in one piece: where a mode leaps, so does what the last bit of a sum makes of it.
    a.mode = OneIn(random, 2) ? PK_BlendMode_Normal
                              : Pick(random, std::array{PK_BlendMode_Multiply, PK_BlendMode_Screen,
                                                        PK_BlendMode_Darken, PK_BlendMode_Difference});
    a.softness = OneIn(random, 2) ? 0 : static_cast<double>(Between(random, 0.0f, 1.0f));
    a.smoothEdges = OneIn(random, 2);
    a.quality = OneIn(random, 10) ? Between(random, 6, 7) : Between(random, 0, 5);
    if (source.format == PK_PixelFormat_BGRP_4444_32f_Linear && OneIn(random, 2)) a.quality = 5;
    a.inLinear = OneIn(random, 2);
    a.blursInLinear = OneIn(random, 4);
    if (formats.isOfGroups)
        DrawGroups(random);
    else if (GroupOf(destination.format) > 1)
        DrawCover(random);
    else if (OneIn(random, 4))
        DrawWholePlace(random);
    else
        DrawPlace(random);
    const bool isScaled = a.scale.x != 1 || a.scale.y != 1;
    if (isScaled && source.format != PK_PixelFormat_BGRP_4444_32f_Linear && a.quality == 5) a.quality = 4;
}

void RandomMotion::DrawPlace(Random& random) {
    static constexpr float kScales[] = {0.125f, 0.25f, 0.5f, 0.75f, 1, 1.5f, 2, 3};
    MotionArguments& a = fArguments;
    if (OneIn(random, 3)) {
        a.aspectNum = 1 + random.Below(40);
        a.aspectDen = 1 + random.Below(40);
    }
    const auto scale = [&random] {
        return OneIn(random, 2) ? Pick(random, kScales) : std::exp(Between(random, -1.8f, 1.2f));
    };
    const auto place = [&random]() -> PK_Point {
        if (OneIn(random, 3)) return {0.5f, 0.5f};
        return {Between(random, -0.1f, 1.1f), Between(random, -0.1f, 1.1f)};
    };
    a.scale = {scale(), scale()};
    if (OneIn(random, 3)) a.scale.y = a.scale.x;
    a.anchor = place();
    a.position = place();
    if (OneIn(random, 2)) a.rotation = static_cast<double>(Between(random, -360.0f, 360.0f));
    if (OneIn(random, 8)) a.rotation = Pick(random, std::array{0.04, 0.06}); // none, and the least
    if (OneIn(random, 8)) {
        // A whole row may run along an edge, beside it or not by the last bit of its place: the edge has to fade.
        a.rotation = Pick(random, std::array{90.0, 180.0, -90.0});
        a.smoothEdges = true;
    }
    if (OneIn(random, 2)) DrawCrop(random);
}

void RandomMotion::DrawCrop(Random& random) {
    PK_Rect& crop = fArguments.crop;
    crop.left = Between(random, 0, source.width - 1);
    crop.right = Between(random, crop.left + 1, source.width);
    crop.top = Between(random, 0, source.height - 1);
    crop.bottom = Between(random, crop.top + 1, source.height);
}

/// Unscaled, some pixels beside where it would lie, or so little from it that they count as whole: copied row by row, or as
/// an image.
void RandomMotion::DrawWholePlace(Random& random) {
    MotionArguments& a = fArguments;
    a.scale = {1, 1};
    a.anchor = {0.5f, 0.5f};
    const auto offWhole = [&]() -> float {
        if (!OneIn(random, 3)) return 0;
        a.smoothEdges = false; // they would have an alpha of this size, by which nothing is to be divided
        return Pick(random, std::array{-6e-5f, -4e-5f, 4e-5f, 6e-5f});
    };
    const auto beside = [&](int32_t from, int32_t to) {
        const auto pixels = static_cast<float>(OneIn(random, 2) ? Between(random, -5, 5) : 0);
        return (static_cast<float>(from) / 2 + pixels + offWhole()) / static_cast<float>(to);
    };
    a.position = {beside(source.width, destination.width), 1 - beside(source.height, destination.height)};
    if (OneIn(random, 2)) a.softness = 0;
    if (OneIn(random, 2)) DrawCrop(random);
    if (OneIn(random, 2)) a.destinationField = a.sourceField;
}

/// All columns of the destination are drawn to.
void RandomMotion::DrawCover(Random& random) {
    MotionArguments& a = fArguments;
    DrawPlace(random);
    a.rotation = 0;
    a.crop = {0, 0, source.width, source.height};
    a.anchor.x = a.position.x = 0.5f;
    a.scale.x = static_cast<float>(destination.width) / static_cast<float>(source.width) *
                Between(random, 1.05f, 2.0f);
}

/// Columns in whole groups, at numbers that have no error: sixes of a width of 24. A blurred image has a margin.
void RandomMotion::DrawGroups(Random& random) {
    MotionArguments& a = fArguments;
    DrawPlace(random);
    a.rotation = 0;
    a.crop = {0, 0, source.width, source.height};
    a.scale.x = static_cast<float>(Between(random, 1, 2));
    a.anchor.x = 0;
    a.position.x = static_cast<float>(Between(random, -1, 3)) / 4;
    a.smoothEdges = false;
}

MotionArguments RandomMotion::With(PaddedPicture& to) const {
    MotionArguments a = fArguments;
    a.source = source.Row(0);
    a.sourceRowBytes = source.RowBytes();
    a.sourceWidth = source.width;
    a.sourceHeight = source.height;
    a.sourceFormat = source.format;
    a.destination = to.Row(0);
    a.destinationRowBytes = to.RowBytes();
    a.destinationWidth = to.width;
    a.destinationHeight = to.height;
    a.destinationFormat = to.format;
    return a;
}

PK_Result CallMotion(const MotionArguments& a) {
    PK_SetDebugFlag(0, a.blursInLinear);
    const PK_Rect* const crop = IsWhole(a) ? nullptr : &a.crop;
    if (a.composites && a.mode != PK_BlendMode_Normal)
        return PK_MotionWithBlendMode(
            a.source, a.sourceRowBytes, a.sourceWidth, a.sourceHeight, a.sourceFormat, a.sourceField, crop,
            a.destination, a.destinationRowBytes, a.destinationWidth, a.destinationHeight,
            a.destinationFormat, a.destinationField, a.aspectNum, a.aspectDen, a.position, a.anchor, a.scale,
            a.rotation, a.opacity, a.softness, a.smoothEdges, a.renderField, a.mode, a.quality, a.inLinear);
    return PK_Motion(a.source, a.sourceRowBytes, a.sourceWidth, a.sourceHeight, a.sourceFormat, a.sourceField,
                     crop, a.destination, a.destinationRowBytes, a.destinationWidth, a.destinationHeight,
                     a.destinationFormat, a.destinationField, a.aspectNum, a.aspectDen, a.position, a.anchor,
                     a.scale, a.rotation, a.opacity, a.composites, a.softness, a.smoothEdges, a.renderField,
                     a.quality, a.inLinear);
}

std::string Describe(const MotionArguments& a) {
    std::ostringstream text;
    text.precision(9);
    const auto image = [&text](PK_PixelFormat format, int32_t width, int32_t height, int32_t field) {
        text << PK_PixelFormatName(format) << ' ' << width << " x " << height << ", field " << field;
    };
    image(a.sourceFormat, a.sourceWidth, a.sourceHeight, a.sourceField);
    text << ", crop " << a.crop.left << ' ' << a.crop.top << ' ' << a.crop.right << ' ' << a.crop.bottom
         << ", to ";
    image(a.destinationFormat, a.destinationWidth, a.destinationHeight, a.destinationField);
    text << ", aspect " << a.aspectNum << '/' << a.aspectDen << ", position " << a.position.x << ' '
         << a.position.y << ", anchor " << a.anchor.x << ' ' << a.anchor.y << ", scale " << a.scale.x << ' '
         << a.scale.y << ", rotation " << a.rotation << ", opacity " << a.opacity << ", composites "
         << a.composites << ", mode " << a.mode << ", softness " << a.softness << ", smooth edges "
         << a.smoothEdges << ", drawn field " << a.renderField << ", quality " << a.quality << ", in linear "
         << a.inLinear << ", blurred in linear " << a.blursInLinear;
    return text.str();
}

} // namespace PKTest
