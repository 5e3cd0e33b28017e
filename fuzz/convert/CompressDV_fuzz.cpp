// The encoders of DV on pictures of drawn formats, sizes and layouts into frames of drawn byte counts: what their result
// codes promise, and that nothing is written but a whole frame.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Input.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"
#include "dv/DVFormat.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/DV.h>

#include <iterator>
#include <string>
#include <vector>

namespace {

using namespace PKFuzz;

enum Way : uint32_t { kConvert, kDVCPRO, kWithOffset, kWays };

struct Request {
    uint32_t way;
    const PK::DVFormat* stream;
    PK_PixelFormat pixels;
    Size size;
    int32_t bytes, offset, quality;
    bool isNull;
};

/// Mostly pixels that an encoder takes, of the size of a frame.
Request DrawRequest(ByteStream& stream) {
    constexpr PK_PixelFormat kPixels[] = {PK_PixelFormat_YUYV_422_8u, PK_PixelFormat_YUYV_422_8u_709,
                                          PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_VUYA_4444_8u,
                                          PK_PixelFormat_BGRA_4444_8u};
    Request request{};
    request.way = stream.Below(kWays);
    request.stream = &PK::kDVFormats[stream.Below(std::size(PK::kDVFormats))];
    request.pixels = stream.OneIn(8) ? DrawFormat(stream) : kPixels[stream.Below(std::size(kPixels))];
    const int32_t part = stream.OneIn(3) ? 2 : 1;
    request.size = {request.stream->width / part, request.stream->height / part};
    if (stream.OneIn(8)) request.size.width = stream.Between(-1, 1500);
    if (stream.OneIn(8)) request.size.height = stream.Between(-1, 1100);
    request.bytes = request.stream->FrameBytes();
    if (stream.OneIn(8)) request.bytes = stream.Between(0, request.bytes);
    request.offset = stream.Between(-1, 4);
    request.quality = stream.Between(-1, 6);
    request.isNull = stream.OneIn(32);
    return request;
}

std::string WordsOfCall(const Request& request) {
    return "encode " + Words(request.pixels) + ", " + Words(request.size) + " to " +
           Words(request.stream->stream) + " in " + std::to_string(request.bytes) + " bytes, way " +
           std::to_string(request.way) + ", offset " + std::to_string(request.offset) + ", quality " +
           std::to_string(request.quality);
}

PK_Result Call(const Request& request, const Input& input, uint8_t* frame) {
    const PK_PixelFormat stream = request.stream->stream;
    const auto [width, height] = request.size;
    if (request.way == kConvert)
        return PK_Convert(input.Pixels(), input.RowBytes(), request.pixels, frame, request.bytes, stream,
                          width, height, request.quality);
    if (request.way == kDVCPRO)
        return PK_CompressDVCPROPAL25(input.Pixels(), input.RowBytes(), request.pixels, width, height, frame,
                                      request.bytes, stream, request.quality);
    return PK_CompressDV100720pWithChannelOffset(input.Pixels(), input.RowBytes(), request.pixels, width,
                                                 height, frame, request.bytes, request.offset, stream,
                                                 request.quality);
}

void FuzzCompressDV(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream);
    const Request request = DrawRequest(stream);
    if (!PK::IsRasterFormat(request.pixels)) return;
    SetCall(WordsOfCall(request));

    const Input input(stream, request.pixels, request.size);
    // DV50 by conversion looks at no count.
    const bool needsNoCount = request.way == kConvert && request.stream->sampling == PK::DVSampling::k422;
    const int32_t room = needsNoCount ? request.stream->FrameBytes() : request.bytes;
    ImageMemory frame({static_cast<size_t>(room), 1, 0}, stream);
    const std::vector<uint8_t> untouched(static_cast<size_t>(room), stream.Byte());
    frame.SetRows(untouched);
    const PK_Result result =
        CallIn(state, [&] { return Call(request, input, request.isNull ? nullptr : frame.Pixels()); });
    CheckIsNamed(result);
    input.memory.CheckStays();
    frame.CheckPadding();
    if (result != PK_Success) {
        CheckSame(untouched, frame.Rows(), "a refused frame is not written");
        return;
    }
    const std::vector<uint8_t> bytes = frame.Rows();
    Check(room == request.stream->FrameBytes() && bytes[0] == 0x1f, "a frame is written whole");
    for (size_t at = 0; at < bytes.size(); at += 80) {
        constexpr size_t kSequence = 12000;
        Check(at % kSequence == 0 ? bytes[at] == 0x1f : bytes[at] != 0x1f, "blocks have their IDs");
    }
}

const Family sFamily('j', "compress-dv", FuzzCompressDV);

} // namespace
