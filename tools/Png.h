#pragma once

// PNG files in and out. Sample values are taken as they are: no gamma or profile of the file is applied.

#include "Frame.h"
#include "OutputFile.h"

#include <string>

namespace tool {

/// By its name: whether a file is to be read or written as PNG.
bool IsPngName(const std::string& name);

/// Gives BGRA_4444_8u for samples of up to 8 bits and BGRA_4444_32f for 16, opaque where the file has no
/// alpha.
Frame ReadPng(const std::string& name);

/// Writes BGRA_4444_8u with 8 bits a sample or BGRA_4444_32f with 16, without alpha if every pixel is opaque.
/// Does not commit the file.
void WritePng(const Frame& picture, OutputFile& file);

/// The same under a name, committed.
void WritePng(const Frame& picture, const std::string& name);

} // namespace tool
