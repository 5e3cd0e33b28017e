#pragma once

// A file that appears whole or not at all.

#include <cstddef>
#include <string>

namespace tool {

/// Writes beside the final name and takes that name on Commit. Whatever ends the program earlier, an error
/// or a signal, leaves the old file as it was and nothing new behind. A name that is no regular file (a
/// device, a pipe, "-" for standard output) is written directly. One instance at a time.
class OutputFile {
public:
    explicit OutputFile(const std::string& name);
    ~OutputFile();
    OutputFile(const OutputFile&) = delete;
    OutputFile& operator=(const OutputFile&) = delete;

    void Write(const void* data, size_t bytes);
    void Commit();

private:
    std::string Complaint() const { return "cannot write '" + fName + "'"; }
    void OpenBeside();

    std::string fName;
    std::string fTarget;    // the final name with links followed
    std::string fTemporary; // empty when the target is written directly
    int fFile = -1;
};

/// Removes the unfinished file, too, when a signal ends the program. Call once at the start.
void CleanUpOnSignals();

} // namespace tool
