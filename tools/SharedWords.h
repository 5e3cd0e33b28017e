#pragma once

// What several commands are told.

#include "FramePipe.h"
#include "Words.h"

namespace tool {

void AddQuality(Words& words, int32_t& quality);

/// As many as the machine has processors, unless it is told.
void AddThreads(Words& words, int32_t& threads);

struct ListOptions {
    bool csv = false;
};
void AddListing(Words& words, ListOptions& options);

/// What raw input frames do not tell.
void AddRawFrames(Words& words, PipeOptions& options);

/// For commands that write frames.
void AddOutput(Words& words, PipeOptions& options);

/// The same for those that are told the name of the output in a way of their own.
void AddOutputForm(Words& words, PipeOptions& options);

/// For commands from frames to frames.
void AddFrames(Words& words, PipeOptions& options);

/// The same where they have a format of choice.
void AddPipe(Words& words, PipeOptions& options);

/// For commands that do something to the picture: AddPipe, --to as they take it, and notes.
void AddOperation(Words& words, PipeOptions& options);

/// The same with a second picture, which the frames meet in their format.
void AddMix(Words& words, PipeOptions& options, std::string& second);

} // namespace tool
