#pragma once

// What every run holds the library to.

#include <PixelKiln/Types.h>

#include <cstdint>
#include <string>
#include <vector>

namespace PKFuzz {

/// Has every call told on the error stream before it is made: the way to read a failure again.
void SetVerbose(bool verbose);

/// Keeps the words for the failure to come, if any. They name the call and its arguments.
void SetCall(std::string words);

/// Ends the process unless the condition holds.
void Check(bool holds, const char* rule);

/// Ends the process unless the bytes are the same; tells the first that differs.
void CheckSame(const std::vector<uint8_t>& expected, const std::vector<uint8_t>& actual, const char* rule);

/// The arguments of a call decide its result; tells both.
void CheckResult(PK_Result expected, PK_Result actual);

/// The result must be one of the named codes.
void CheckIsNamed(PK_Result result);

} // namespace PKFuzz
