#pragma once

// The options of a pipe with all words understood, so that what is wrong with them is said before any work.

#include "FramePipe.h"
#include "VideoFormats.h"

namespace tool {

enum class FileKind { Raw, Png, Y4M };

struct FramePlan {
    FileKind in, out;
    FileFormat from;          ///< none for a picture or stream that is taken as it is
    FileFormat to;            ///< none for one that is written as it is
    PK_PixelFormat pngFormat; ///< what an output PNG is written from
    Size size;                ///< of raw frames
    int32_t quality;
    std::string matrix;
};

/// Throws usage Failures.
FramePlan PlanPipe(const PipeOptions& options);

/// The part of it that WriteMadeFrame needs.
FramePlan PlanOutput(const PipeOptions& options);

} // namespace tool
