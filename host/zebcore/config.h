#pragma once

/// \file
/// How the host is told of a violated contract.

#include <cstdint>

namespace zebcore::config {

/// A text that takes the place of a mark in an error message. Contract checks pass default-built ones only,
/// which replace nothing.
struct ReplacementValue {};

/// Raises an error with the host. May return, and the caller then goes on.
/// \param level     severity, 0 being an ordinary error.
/// \param message   "key=text"; the text is for people.
/// \param code      number of the error.
/// \param category  number of its category.
/// \param report    whether the user should hear of it.
void ThrowError(int32_t level, const char* message, uint32_t code, int32_t category, bool report,
                const ReplacementValue& value0, const ReplacementValue& value1,
                const ReplacementValue& value2, const ReplacementValue& value3);

} // namespace zebcore::config
