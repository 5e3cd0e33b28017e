#include "Formats.h"

#include "Failure.h"
#include "Terminal.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <numeric>
#include <string_view>
#include <tuple>

namespace tool {
namespace {

constexpr PK_PixelFormat kFieldBits = 0x1fff; // all fields below the stream kind
constexpr PK_PixelFormat kStreamKinds = 12;
constexpr int kStreamShift = 24;

// The library names every format of its catalogue but this one.
constexpr const char* kRGB10Name = "RGB_444_10u";

auto FamilyOrder(PK_PixelFormat format) {
    const auto field = [format](PK_PixelFormat mask) { return format & mask; };
    const bool planar = IsPlanar(format);
    return std::tuple(field(0x30), planar ? field(0x800) == 0 : field(0x1) != 0, field(0x1c0), field(0x2),
                      field(0x600), field(0x1000), field(0xff000000), field(0xc));
}

// Asking the library for every number it could name keeps the catalogue in one place.
std::vector<PK_PixelFormat> FindNamedFormats() {
    const std::string_view unknown = PK_PixelFormatName(0x00ffe000);
    std::vector<PK_PixelFormat> formats = {PK_PixelFormat_RGB_444_10u};
    for (PK_PixelFormat kind = 0; kind <= kStreamKinds; ++kind)
        for (PK_PixelFormat fields = 0; fields <= kFieldBits; ++fields) {
            const PK_PixelFormat format = kind << kStreamShift | fields;
            if (format != PK_PixelFormat_Invalid && format != PK_PixelFormat_RGB_444_10u &&
                PK_PixelFormatName(format) != unknown)
                formats.push_back(format);
        }
    std::sort(formats.begin(), formats.end(),
              [](PK_PixelFormat a, PK_PixelFormat b) { return FamilyOrder(a) < FamilyOrder(b); });
    return formats;
}

std::string Lower(std::string_view text) {
    std::string lower(text);
    for (char& c : lower) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return lower;
}

size_t EditDistance(std::string_view a, std::string_view b) {
    std::vector<size_t> row(b.size() + 1);
    std::iota(row.begin(), row.end(), size_t{0});
    for (size_t i = 0; i < a.size(); ++i) {
        size_t diagonal = row[0];
        row[0] = i + 1;
        for (size_t j = 0; j < b.size(); ++j) {
            const size_t replaced = diagonal + (a[i] != b[j]);
            diagonal = row[j + 1];
            row[j + 1] = std::min({replaced, row[j] + 1, diagonal + 1});
        }
    }
    return row[b.size()];
}

// A question with up to three names: those that hold the text first, then those that few typing errors lead
// to. Empty if none is near.
std::string DidYouMean(const std::string& lower) {
    constexpr size_t kCount = 3;
    const size_t near = std::max<size_t>(2, lower.size() / 3);
    std::vector<std::pair<size_t, std::string>> ranked;
    for (const PK_PixelFormat format : Catalogue()) {
        const std::string name = FormatName(format);
        const bool holds = Lower(name).find(lower) != std::string::npos;
        const size_t distance = holds ? 0 : EditDistance(lower, Lower(name));
        if (distance <= near) ranked.emplace_back(distance, name);
    }
    if (ranked.empty()) return "";
    std::stable_sort(ranked.begin(), ranked.end(),
                     [](const auto& a, const auto& b) { return a.first < b.first; });
    std::vector<std::string> names;
    for (size_t i = 0; i < std::min(kCount, ranked.size()); ++i) names.push_back(ranked[i].second);
    return "; did you mean " + Join(names, " or ");
}

} // namespace

const std::vector<PK_PixelFormat>& Catalogue() {
    static const std::vector<PK_PixelFormat> formats = FindNamedFormats();
    return formats;
}

std::vector<PK_PixelFormat> RasterFormats() {
    std::vector<PK_PixelFormat> formats = Catalogue();
    std::erase_if(formats, [](PK_PixelFormat format) { return !IsRaster(format); });
    return formats;
}

std::string FormatName(PK_PixelFormat format) {
    return format == PK_PixelFormat_RGB_444_10u ? kRGB10Name : PK_PixelFormatName(format);
}

PK_PixelFormat ParseFormat(const std::string& text) {
    const std::string lower = Lower(text);
    PK_PixelFormat number = 0;
    const bool isNumber = lower.starts_with("0x");
    if (isNumber) {
        const char* end = lower.data() + lower.size();
        const auto [stop, error] = std::from_chars(lower.data() + 2, end, number, 16);
        if (error != std::errc() || stop != end) number = 0;
    }
    for (const PK_PixelFormat format : Catalogue())
        if (isNumber ? format == number : Lower(FormatName(format)) == lower) return format;
    if (isNumber)
        throw Failure(kExitUsage, "no pixel format has the number " + text +
                                      "; 'pixelkiln formats' lists those that exist");
    throw Failure(kExitUsage, "there is no pixel format '" + text + "'" + DidYouMean(lower) +
                                  "; 'pixelkiln formats' lists all");
}

bool IsRaster(PK_PixelFormat format) {
    return format >> kStreamShift == 0;
}

bool IsPlanar(PK_PixelFormat format) {
    return (format & 0x30) == 0x30;
}

bool IsFourBytesAPixel(PK_PixelFormat format) {
    constexpr int32_t kPair = 2; // pixels: 4:2:2 formats have four bytes a pair
    return IsRaster(format) && format != PK_PixelFormat_RGB_444_10u &&
           PK_PixelFormatPackedRowBytes(format, kPair) == 4 * kPair;
}

} // namespace tool
