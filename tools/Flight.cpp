#include "Flight.h"

#include "NumberedName.h"
#include "Png.h"
#include "Terminal.h"
#include "Y4M.h"

#include <optional>

namespace tool {
namespace {

void PlaceAt(const Flight& flight, int32_t frame, const Frame& picture, Frame& back) {
    const int32_t earlier = flight.start.destinationField, fields = earlier == 0 ? 1 : 2;
    const int32_t steps = fields * flight.frames - 1;
    for (int32_t field = 0; field < fields; ++field) {
        const int32_t step = fields * frame + field;
        Placing placing = Between(flight.start, flight.end, steps > 0 ? double(step) / steps : 0);
        if (fields > 1) placing.renderField = field == 0 ? earlier : 3 - earlier;
        Place(picture, placing, back);
    }
}

} // namespace

void Fly(const Flight& flight, const Frame& picture, const Frame& back, const std::string& output) {
    const NumberedName names(output);
    const PK_PixelFormat pngFormat =
        flight.pngDepth == 16 ? PK_PixelFormat_BGRA_4444_32f : PK_PixelFormat_BGRA_4444_8u;
    std::optional<Y4MWriter> stream;
    if (!IsPngName(output))
        stream.emplace(output, Y4MHead{.width = back.Width(),
                                       .height = back.Height(),
                                       .rate = std::to_string(flight.framesASecond) + ":1",
                                       .field = flight.start.destinationField});
    Progress progress("frames", flight.frames);
    for (int32_t i = 0; i < flight.frames; ++i) {
        Frame frame = Converted(back, stream ? back.Format() : pngFormat, kDefaultQuality);
        PlaceAt(flight, i, picture, frame);
        if (stream)
            stream->Write(frame);
        else
            WritePng(frame, names.At(i));
        progress.Advance();
    }
    if (stream) stream->Commit();
}

} // namespace tool
