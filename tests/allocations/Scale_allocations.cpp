// Images scaled and converted.

#include "allocations/Call.h"

#include <PixelKiln/PixelKiln.h>

namespace {

using namespace PKAllocations;

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kUYVY = PK_PixelFormat_UYVY_422_8u,
                         kPlanes = PK_PixelFormat_YUV_420_MPEG2_FRAME;

struct Scaling {
    PK_PixelFormat source, destination;
    int32_t sourceWidth, sourceHeight, width, height, quality;
    Memory memory;
    int32_t sourceField = 0, destinationField = 0, renderField = 0;
};

constexpr Scaling kScalings[] = {
    {kUYVY, kBGRA, kWidth, kHeight, kWidth, kHeight, 2, TakesNone("converts in one pass")},
    {kUYVY, PK_PixelFormat_VUYP_4444_8u, 2 * kWidth, 4, kWidth, 2, 2,
     TakesNone("halves rows where they belong")},
    {kUYVY, kBGRA, 2 * kWidth, 4, kWidth, 2, 2, TakesOrRefuses("a halved row above 256 KiB")},
    {kPlanes, kPlanes, kWidth, 4, kWidth, 2, 2, TakesNone("copies lines"), 1, 1},
    {kUYVY, kUYVY, kWidth, 4, kWidth, 2, 2, TakesNone("copies one field"), 2},
    {kUYVY, kUYVY, 30, 20, 25, 20, 2, TakesOrRefuses("the source in a format of motion")},
    {kUYVY, kBGRA, 30, 20, 30, 20, 4, TakesOrRefuses("the source in a format of motion"), 1, 2, 2},
    {kBGRA, kBGRA, 30, 20, 40, 30, 5, TakesOrRefuses("the source in light, and tables of weights")},
    {kPlanes, kBGRA, 64, 48, 30, 20, 4, TakesOrRefuses("the decoded image, and the blurred one")},
    {kPlanes, PK_PixelFormat_VUYX_4444_8u, 64, 48, 32, 24, 2, TakesNone("decodes to the destination")},
    {kBGRA, kPlanes, 30, 20, 64, 48, 2, TakesOrRefuses("the image to be encoded")},
    {PK_PixelFormat_NTSCDV50, kBGRA, 720, 480, 360, 240, 2, TakesOrRefuses("the decoded image")},
    {kBGRA, PK_PixelFormat_NTSCDV50, 30, 20, 720, 480, 2, TakesOrRefuses("the image to be encoded")},
};

std::vector<uint8_t> ContentOf(PK_PixelFormat format, int32_t width, int32_t height) {
    return Content(static_cast<size_t>(PK_PixelFormatSize(format, width, height)));
}

void AddScalings(Calls& calls) {
    for (const Scaling& job : kScalings) {
        const int32_t step = PK_PixelFormatRowBytes(job.source, job.sourceWidth);
        const int32_t to = PK_PixelFormatRowBytes(job.destination, job.width);
        const auto scale = [=, source =
                                   ContentOf(job.source, job.sourceWidth, job.sourceHeight)](uint8_t* block) {
            if (job.renderField == 0)
                return PK_ScaleConvert(source.data(), step, job.sourceWidth, job.sourceHeight, job.source,
                                       job.sourceField, block, to, job.width, job.height, job.destination,
                                       job.destinationField, job.quality);
            return PK_ScaleConvertOneField(source.data(), step, job.sourceWidth, job.sourceHeight, job.source,
                                           job.sourceField, block, to, job.width, job.height, job.destination,
                                           job.destinationField, job.quality, job.renderField);
        };
        calls.push_back({{job.renderField == 0 ? "PK_ScaleConvert" : "PK_ScaleConvertOneField"},
                         job.memory,
                         ContentOf(job.destination, job.width, job.height),
                         scale});
    }
}

void AddPlanes(Calls& calls) {
    constexpr int32_t kSide = 32;
    calls.push_back({{"PK_ScaleConvertPlanar"},
                     TakesOrRefuses("the decoded image"),
                     ContentOf(kBGRA, kSide, kSide),
                     [y = Content(kSide * kSide), c = Content(kSide * kSide / 4)](uint8_t* block) {
                         const void* const planes[3] = {y.data(), c.data(), c.data()};
                         const int32_t rowBytes[3] = {kSide, kSide / 2, kSide / 2};
                         return PK_ScaleConvertPlanar(planes, rowBytes, kSide, kSide, kPlanes, 0, block,
                                                      4 * kSide, kSide, kSide, kBGRA, 0, 2);
                     }});
}

const Family sScalings(AddScalings);
const Family sPlanes(AddPlanes);

} // namespace
