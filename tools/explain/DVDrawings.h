#pragma once

// Drawings of how a frame of DV is built.

#include <string>

namespace tool {

/// A frame, a sequence and a video block, to their parts.
void DrawDVSequence(const std::string& name);

/// Where the macroblocks of a sequence and of one segment lie in the pictures of six formats.
void DrawDVPlacement(const std::string& name);

/// How the bits of a segment fill its areas in three passes.
void DrawDVPasses(const std::string& name);

} // namespace tool
