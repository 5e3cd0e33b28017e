#pragma once

// Frames from a file to a file, PNG, raw or a Y4M stream, with something done to each on the way.

#include "Frame.h"

#include <functional>
#include <string>

namespace tool {

/// What every command that reads frames and writes frames is told.
struct PipeOptions {
    std::string input;
    std::string output;
    std::string from;
    std::string to;
    std::string size;
    std::string matrix;
    int32_t quality = kDefaultQuality;
    int32_t pngDepth = 8;
    bool packed = false;
    bool quiet = false;
};

/// Reads a size such as 1920x1080. Throws a usage Failure.
Size ParseSize(const std::string& text);

/// Whether no line about the work is wanted: asked for, or the frames themselves go to standard output.
bool IsSilent(const PipeOptions& options);

/// What becomes of a frame of the format of --from, before it is taken to that of --to.
using Step = std::function<Frame(const Frame&)>;

/// The step that changes a copy of the frame.
Step OnCopy(std::function<void(Frame&)> change);

/// Takes every frame of the input through the step, if there is one, to the output and prints a line about it. A step is
/// given frames of planar 4:2:0 in a raster format.
void PipeFrames(const PipeOptions& options, const Step& step);

/// What becomes of a frame of any format, 4:2:0 too, on its way to the format that it is written in.
using StepTo = std::function<Frame(const Frame& frame, PK_PixelFormat to)>;

/// The same by a step that makes frames of this size and of the format that they are written in.
void PipeFramesTo(const PipeOptions& options, Size size, const StepTo& step);

/// The same where the output keeps the format of the input unless --to tells another.
void PipeFramesInTheirFormat(PipeOptions options, const Step& step);

/// Gives pixels to a new frame, of the format of --to.
using Make = std::function<void(Frame&)>;

/// Writes one frame that is made and not read. Of the options, input and from are not looked at.
void WriteMadeFrame(const PipeOptions& options, const Make& make);

} // namespace tool
