#pragma once

// How the program ends: its exit codes, and the exception that carries one together with the sentence for the
// person at the terminal.

#include <stdexcept>
#include <string>

namespace tool {

enum ExitCode : int {
    kExitOK = 0,
    kExitFailed = 1, // the library refused the operation, or a comparison went beyond its limit
    kExitUsage = 2,
    kExitFile = 3,
};

class Failure : public std::runtime_error {
public:
    Failure(ExitCode code, const std::string& sentence) : std::runtime_error(sentence), fCode(code) {}

    ExitCode Code() const { return fCode; }

private:
    ExitCode fCode;
};

/// The reader of our output has gone; nothing is left to say to it.
class BrokenPipe {};

/// Throws for a failed system call on a file.
/// \param what  such as "cannot write 'x.png'".
[[noreturn]] void ThrowFileFailure(const std::string& what, int error);

} // namespace tool
