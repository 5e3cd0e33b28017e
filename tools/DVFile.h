#pragma once

// A file of DV frames, read one by one.

#include "DVFormats.h"
#include "InputFile.h"

#include <optional>
#include <string>
#include <vector>

namespace tool {

class DVFile {
public:
    /// \param name    - is standard input.
    /// \param format  as an option names it; empty where the first frame is to tell. Throws a Failure if it does not.
    DVFile(const std::string& name, const std::string& format);

    const std::string& Name() const { return fFile.Name(); }
    const DVKind& Kind() const { return *fKind; }

    /// Whole frames in the file; 0 if that shows only at its end, as with a pipe.
    int64_t FrameCount() const;

    /// The next frame, or what the file has of it; empty at the end.
    std::vector<uint8_t> NextPart();

    /// The next whole frame; none at the end. Throws a Failure for part of one.
    std::optional<std::vector<uint8_t>> Next();

private:
    InputFile fFile;
    std::vector<uint8_t> fBeginning; ///< what was read to know the format
    const DVKind* fKind;
};

} // namespace tool
