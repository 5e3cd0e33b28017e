// Encoders and decoders of DV, beside each other and beside starts and stops.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/PixelKiln.h>

namespace {

using namespace PKStress;

struct Encoding {
    PK_PixelFormat from, to;
    int32_t width, height, quality;
};

constexpr Encoding kEncodings[] = {
    {PK_PixelFormat_YUYV_422_8u, PK_PixelFormat_NTSCDV25, 720, 480, 4},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_NTSCDV25, 360, 240, 2},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_PALDV25, 360, 288, 4},
    {PK_PixelFormat_YUYV_422_8u, PK_PixelFormat_NTSCDV50, 720, 480, 5},
    {PK_PixelFormat_YUYV_422_8u_709, PK_PixelFormat_NTSC_DV100_720p, 960, 720, 0},
};

Call DVCPRO(PKTest::Random& random) {
    constexpr PK_PixelFormat kFrom = PK_PixelFormat_UYVY_422_8u, kTo = PK_PixelFormat_PALDV25;
    return {RandomImage(kTo, 720, 576, random),
            [source = RandomImage(kFrom, 360, 288, random)](uint8_t* frame) {
                return PK_CompressDVCPROPAL25(source.data(), PK_PixelFormatRowBytes(kFrom, 360), kFrom, 360,
                                              288, frame, 144000, kTo, 4);
            }};
}

Call SecondOfPair(PKTest::Random& random) {
    constexpr PK_PixelFormat kFrom = PK_PixelFormat_YUYV_422_8u_709, kTo = PK_PixelFormat_PAL_DV100_720p;
    return {
        RandomImage(kTo, 960, 720, random), [source = RandomImage(kFrom, 960, 720, random)](uint8_t* frame) {
            return PK_CompressDV100720pWithChannelOffset(source.data(), PK_PixelFormatRowBytes(kFrom, 960),
                                                         kFrom, 960, 720, frame, 288000, 2, kTo, 0);
        }};
}

/// Of bytes that are no picture's, at a quarter of the size or the whole.
Call Decoding(PK_PixelFormat from, PK_PixelFormat to, int32_t width, int32_t height, PKTest::Random& random) {
    std::vector<uint8_t> frame = RandomImage(from, width, height, random);
    for (const size_t byte : {4u, 5u, 6u, 7u}) frame[byte] = 0x79; // a good header
    return {RandomImage(to, width, height, random), [=](uint8_t* pixels) {
                return PK_Convert(frame.data(), 0, from, pixels, PK_PixelFormatRowBytes(to, width), to, width,
                                  height, 2);
            }};
}

Call Black(PKTest::Random& random) {
    constexpr PK_PixelFormat kTo = PK_PixelFormat_NTSCDV25;
    return {RandomImage(kTo, 720, 480, random),
            [](uint8_t* frame) { return PK_FillWithOpaqueBlack(frame, 0, 720, 480, kTo); }};
}

std::function<bool()> PrepareDV() {
    PKTest::Random random(31);
    constexpr PK_PixelFormat k25 = PK_PixelFormat_NTSCDV25, k100 = PK_PixelFormat_NTSC_DV100_720p;
    std::vector<Call> calls = {DVCPRO(random),
                               SecondOfPair(random),
                               Black(random),
                               Decoding(k25, PK_PixelFormat_BGRA_4444_8u, 720, 480, random),
                               Decoding(k25, PK_PixelFormat_UYVY_422_8u, 180, 120, random),
                               Decoding(k100, PK_PixelFormat_YUYV_422_8u_709, 960, 720, random)};
    for (const Encoding& job : kEncodings)
        calls.push_back(
            {RandomImage(job.to, job.width, job.height, random),
             [job, source = RandomImage(job.from, job.width, job.height, random)](uint8_t* frame) {
                 return PK_Convert(source.data(), PK_PixelFormatRowBytes(job.from, job.width), job.from,
                                   frame, static_cast<int32_t>(PK_PixelFormatSize(job.to, 0, 0)), job.to,
                                   job.width, job.height, job.quality);
             }});
    return Repeat(calls);
}

const Operation sDV("dv", PrepareDV);

} // namespace
