#pragma once

// What the library does about a caller inside it that breaks a contract.

#include <cstdint>

namespace PK {

/// Tells the host, and stops in a debugger that is there if the host wants that. Returns as far as the host's error does:
/// the caller goes on, or gives up where going on would do harm.
/// \param line  the number by which hosts know the check; it need not be that of the text.
void ReportContractViolation(const char* expression, const char* sourcePath, const char* function,
                             int32_t line);

} // namespace PK
