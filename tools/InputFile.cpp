#include "InputFile.h"

#include "Failure.h"

#include <cerrno>
#include <sys/stat.h>

namespace tool {

void InputFile::Close::operator()(FILE* file) const {
    if (file != stdin) std::fclose(file);
}

InputFile::InputFile(const std::string& name)
    : fName(name == "-" ? "standard input" : name),
      fFile(name == "-" ? stdin : std::fopen(name.c_str(), "rb")) {
    if (!fFile) ThrowFileFailure("cannot read '" + fName + "'", errno);
    struct stat file;
    if (fstat(fileno(fFile.get()), &file) != 0) ThrowFileFailure("cannot read '" + fName + "'", errno);
    if (S_ISDIR(file.st_mode)) ThrowFileFailure("cannot read '" + fName + "'", EISDIR);
    if (S_ISREG(file.st_mode)) fSize = file.st_size;
}

size_t InputFile::Read(void* to, size_t bytes) {
    errno = 0;
    const size_t got = std::feof(fFile.get()) ? 0 : std::fread(to, 1, bytes, fFile.get());
    if (std::ferror(fFile.get())) ThrowFileFailure("cannot read '" + fName + "'", errno);
    return got;
}

std::optional<std::string> InputFile::ReadLine(size_t most) {
    std::string line;
    char next;
    while (Read(&next, 1) == 1) {
        if (next == '\n') return line;
        if (line.size() == most) return std::nullopt;
        line += next;
    }
    return std::nullopt;
}

} // namespace tool
