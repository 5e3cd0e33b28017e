// Two frames of DV, whole and damaged, made one.

#include "support/DVFrames.h"

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/ImageMemory.h"
#include "support/Switches.h"

#include <PixelKiln/DV.h>

namespace {

using namespace PKFuzz;

struct Request {
    PK_PixelFormat format; ///< of the frames
    bool isDV25;           ///< PK_MergeDV
    int32_t frameBytes;
    PK_PixelFormat told; ///< to PK_MergeDVCPRO
    int32_t quality;
};

Request Draw(ByteStream& stream) {
    Request request{};
    request.format = DrawDVFormat(stream);
    const bool is525 = request.format == PK_PixelFormat_NTSCDV25;
    request.isDV25 = (is525 || request.format == PK_PixelFormat_PALDV25) && stream.Bool();
    request.frameBytes = is525 ? 120000 : stream.BetweenOrAny(144000, 144000, 2);
    if (!is525 && request.frameBytes == 120000) request.frameBytes = 0;
    request.told = stream.OneIn(16) ? DrawFormat(stream) : request.format;
    request.quality = stream.OneIn(4) ? 5 : stream.BetweenOrAny(0, 4, 16);
    return request;
}

bool IsDV(PK_PixelFormat format) {
    for (const PK_PixelFormat known :
         {PK_PixelFormat_NTSCDV25, PK_PixelFormat_PALDV25, PK_PixelFormat_NTSCDV50, PK_PixelFormat_PALDV50,
          PK_PixelFormat_NTSC_DV100_720p, PK_PixelFormat_PAL_DV100_720p, PK_PixelFormat_NTSC_DV100_1080i,
          PK_PixelFormat_PAL_DV100_1080i})
        if (format == known) return true;
    return false;
}

PK_Result Merge(const Request& request, const void* a, const void* b, void* to) {
    return request.isDV25 ? PK_MergeDV(a, b, to, request.frameBytes, request.quality)
                          : PK_MergeDVCPRO(a, b, to, request.told, request.quality);
}

void FuzzMerge(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream);
    Request request = Draw(stream);
    // The frames are as large as what they are told to be.
    if (IsDV(request.told)) request.format = request.told;
    const DVFrame first = DrawDVFrame(stream, request.format), second = DrawDVFrame(stream, request.format);
    const size_t bytes = first.bytes.size();
    SetCall((request.isDV25 ? "PK_MergeDV of " : "PK_MergeDVCPRO of ") + Words(request.told) + ", " +
            std::to_string(request.frameBytes) + " bytes, quality " + std::to_string(request.quality));
    const RowsLayout layout = {bytes, 1, 0};
    ImageMemory a(layout, stream), b(layout, stream), apart(layout, stream);
    a.SetRows(first.bytes);
    b.SetRows(second.bytes);
    const bool isNull[] = {stream.OneIn(64), stream.OneIn(64), stream.OneIn(64)};
    const auto or0 = [&](size_t which, const ImageMemory& memory) {
        return isNull[which] ? nullptr : memory.Pixels();
    };

    PK_Result expected = PK_Success;
    if (!request.isDV25 && !IsDV(request.told))
        expected = PK_ErrBadSrcFormat;
    else if (isNull[0] || isNull[1] || isNull[2])
        expected = PK_ErrFailed;
    else if (!HasGoodHeader(first) || !HasGoodHeader(second))
        expected = PK_ErrBadDVFormat;
    const std::vector<uint8_t> untouched(bytes, 0x55);
    apart.SetRows(untouched);
    CheckResult(expected, CallIn(state, [&] { return Merge(request, or0(0, a), or0(1, b), or0(2, apart)); }));
    for (const ImageMemory* memory : {&a, &b, &apart}) memory->CheckPadding();
    CheckSame(first.bytes, a.Rows(), "the first frame stays");
    CheckSame(second.bytes, b.Rows(), "the second frame stays");
    if (expected != PK_Success) return CheckSame(untouched, apart.Rows(), "a refused call writes nothing");

    ImageMemory& inPlace = stream.Bool() ? a : b;
    CheckResult(PK_Success,
                CallIn(state, [&] { return Merge(request, a.Pixels(), b.Pixels(), inPlace.Pixels()); }));
    CheckSame(apart.Rows(), inPlace.Rows(), "the same in place");
}

const Family sFamily('J', "merge-dv", FuzzMerge);

} // namespace
