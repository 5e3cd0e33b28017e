#include "NumberedName.h"

#include "Failure.h"

#include <charconv>

namespace tool {

NumberedName::NumberedName(const std::string& name) : fName(name) {
    constexpr size_t kMaximalDigits = 20;
    const size_t start = name.find('%');
    if (start == std::string::npos) return;
    const size_t end = name.find_first_not_of("0123456789", start + 1);
    if (end == std::string::npos || name[end] != 'd') return;
    fStart = start;
    fLength = end + 1 - start;
    const auto digits = std::from_chars(name.data() + start + 1, name.data() + end, fDigits);
    if (digits.ec == std::errc::result_out_of_range || fDigits > kMaximalDigits)
        throw Failure(kExitUsage, "'" + name + "' asks for numbers of more than 20 digits; use fewer");
    if (name.find('%', end) != std::string::npos)
        throw Failure(kExitUsage, "'" + name + "' has more than one place for a number; leave one");
}

std::string NumberedName::At(int64_t index) const {
    if (!IsNumbered()) return fName;
    std::string digits = std::to_string(index);
    if (digits.size() < fDigits) digits.insert(0, fDigits - digits.size(), '0');
    return std::string(fName).replace(fStart, fLength, digits);
}

} // namespace tool
