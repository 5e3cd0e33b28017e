#include "scale/ScaleTrace.h"

#include "frame/TraceSite.h"

namespace PK {
namespace {

constinit TraceSite sSite = {"PK.ScaleConvert", 5, false};

std::string Describe(const ScaleImage& image) {
    return std::to_string(image.width) + " x " + std::to_string(image.height) + " " +
           PK_PixelFormatName(image.format) + ", field " + std::to_string(image.field);
}

} // namespace

const char* TraceTextOfQuality(int32_t quality) {
    return quality == 2 ? "Low" : "High";
}

std::string DescribeScale(const ScaleCall& call, ScaleRoute route) {
    std::string text = Describe(call.source) + ", to " + Describe(call.destination);
    if (call.renderField != 0) text += ", rendered field " + std::to_string(call.renderField);
    return text + ", quality " + TraceTextOfQuality(call.quality) + ": " + NameOf(route);
}

void TraceScale(const ScaleCall& call, ScaleRoute route) noexcept {
    try {
        if (sSite.IsOn()) sSite.Write(DescribeScale(call, route));
    } catch (...) {
        return;
    }
}

} // namespace PK
