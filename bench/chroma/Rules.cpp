#include "Rules.h"

#include "Library.h"

namespace ChromaBench {
namespace {

Video Decode(const Video& planes, const Kind& kind) {
    return ToPixels(Decoded(planes, kind, PK_PixelFormat_VUYX_4444_8u));
}

Video AsFields(const Video& planes) {
    return Decode(planes, kFields);
}

Video AsFrames(const Video& planes) {
    return Decode(planes, kLeft);
}

Video FieldsExchanged(const Video& video) {
    return Interleaved(FieldOf(video, 1), FieldOf(video, 0));
}

/// Each field with the weights of the other.
Video AsOtherField(const Video& planes) {
    return FieldsExchanged(Decode(FieldsExchanged(planes), kFields));
}

Video AsCentred(const Video& planes) {
    return Decode(planes, {"", true, true});
}

constexpr Rule kRules[] = {{"right", AsFields},
                           {"as frames", AsFrames},
                           {"by the other field's rule", AsOtherField},
                           {"as centred chroma", AsCentred}};

} // namespace

std::span<const Rule> AllRules() {
    return kRules;
}

} // namespace ChromaBench
