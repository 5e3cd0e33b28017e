#pragma once

// The two ends of a pipe of frames: a PNG, raw frames or a Y4M stream.

#include "FramePlan.h"
#include "NumberedName.h"
#include "RawFrames.h"
#include "Y4M.h"

#include <optional>

namespace tool {

class FrameInput {
public:
    /// Refuses what can be seen from the beginning of the file.
    FrameInput(const FramePlan& plan, const std::string& name);

    /// As far as it is known; else 0.
    int64_t FrameCount() const;

    /// The next frame, in the format of --from; null at the end. Valid until the next one is read.
    const Frame* Next();

    /// The one that was read last.
    const Frame& Last() const { return fConverted ? *fConverted : *fFrame; }

    /// What a stream told; of raw frames the format alone.
    const Y4MHead& Head() const { return fHead; }

private:
    bool ReadNext();

    const FramePlan& fPlan;
    std::string fName;
    Y4MHead fHead;
    std::optional<RawReader> fRaw;
    std::optional<Y4MReader> fStream;
    std::optional<Frame> fFrame, fConverted;
    bool fIsAtEnd = false;
};

/// All frames into one file of raw frames or one stream, or each into a PNG.
class FrameOutput {
public:
    /// \param head  of what is read: of a stream, its rate and fields go on, and of 4:2:0 what the output leaves open.
    FrameOutput(const FramePlan& plan, const std::string& name, const Y4MHead& head = {});

    /// What a frame is taken to on its way into the file; \p asItIs where nothing decides.
    PK_PixelFormat FormatFor(Size size, PK_PixelFormat asItIs) const;

    void Write(const Frame& frame);

    /// Throws if the frames of an input that has several would write over each other.
    void RequireRoomForSeveral() const;

    /// Such as "BGRA_4444_8u", and the size where it is not that of the input.
    std::string Summary(const Frame& input) const;

    /// Gives the files their names and tells how many frames were written.
    int64_t Finish();

private:
    void WriteAsPng();
    void WriteAsRaw();
    void WriteToStream();

    const FramePlan& fPlan;
    NumberedName fName;
    Y4MHead fHead;
    std::optional<Frame> fConverted;
    std::optional<OutputFile> fRawFile;
    std::optional<Y4MWriter> fStream;
    int64_t fFrameCount = 0;
};

} // namespace tool
