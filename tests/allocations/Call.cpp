#include "allocations/Call.h"

#include "support/Random.h"

#include <PixelKiln/PixelFormat.h>

namespace PKAllocations {

std::vector<Family::Add>& Family::Register() {
    static std::vector<Add> families;
    return families;
}

Family::Family(Add add) {
    Register().push_back(add);
}

Calls Family::AllCalls() {
    Calls calls;
    for (const Add add : Register()) add(calls);
    return calls;
}

std::vector<uint8_t> Content(size_t bytes) {
    static const std::vector<uint8_t> period = PKTest::Random(71).Bytes(65521);
    std::vector<uint8_t> content(bytes);
    for (size_t i = 0; i < bytes; ++i) content[i] = period[i % period.size()];
    return content;
}

Image::Image(PK_PixelFormat theFormat)
    : format(theFormat), rowBytes(PK_PixelFormatRowBytes(format, kWidth)),
      bytes(Content(static_cast<size_t>(PK_PixelFormatSize(format, kWidth, kHeight)))) {}

} // namespace PKAllocations
