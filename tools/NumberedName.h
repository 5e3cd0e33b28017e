#pragma once

// File names such as frame-%04d.png, which stand for one file a frame.

#include <cstdint>
#include <string>

namespace tool {

class NumberedName {
public:
    explicit NumberedName(const std::string& name);

    bool IsNumbered() const { return fLength > 0; }

    /// The name for one frame; the name itself if it is not numbered.
    std::string At(int64_t index) const;

private:
    std::string fName;
    size_t fStart = 0; ///< where %04d stands
    size_t fLength = 0;
    size_t fDigits = 0;
};

} // namespace tool
