#include "DVFile.h"

#include "Failure.h"

namespace tool {

DVFile::DVFile(const std::string& name, const std::string& format)
    : fFile(name), fBeginning(static_cast<size_t>(kSequenceBytes)) {
    fBeginning.resize(fFile.Read(fBeginning.data(), fBeginning.size()));
    if (fBeginning.empty()) throw Failure(kExitFile, "'" + Name() + "' holds no frame");
    if (!format.empty()) {
        fKind = &ParseDVKind(format);
        return;
    }
    fKind = fBeginning.size() == static_cast<size_t>(kSequenceBytes) ? DVKindOf(fBeginning.data()) : nullptr;
    if (fKind == nullptr)
        throw Failure(kExitFile, "'" + Name() +
                                     "' does not begin with a frame of DV that tells its format; if it is "
                                     "one, name the format with --from, such as --from PALDV25");
}

int64_t DVFile::FrameCount() const {
    return fFile.Size().value_or(0) / fKind->Bytes();
}

std::vector<uint8_t> DVFile::NextPart() {
    const size_t had = fBeginning.size();
    std::vector<uint8_t> frame = std::move(fBeginning);
    fBeginning.clear();
    frame.resize(static_cast<size_t>(fKind->Bytes()));
    frame.resize(had + fFile.Read(frame.data() + had, frame.size() - had));
    return frame;
}

std::optional<std::vector<uint8_t>> DVFile::Next() {
    std::vector<uint8_t> frame = NextPart();
    if (frame.empty()) return std::nullopt;
    if (frame.size() != static_cast<size_t>(fKind->Bytes()))
        throw Failure(kExitFile, "'" + Name() + "' ends within a frame, " + std::to_string(frame.size()) +
                                     " bytes into " + std::to_string(fKind->Bytes()));
    return frame;
}

} // namespace tool
