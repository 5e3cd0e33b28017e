#pragma once

// A file, or standard input, that is read from its beginning to its end.

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <memory>
#include <optional>
#include <string>

namespace tool {

/// Failures name the file.
class InputFile {
public:
    /// \param name  - is standard input.
    explicit InputFile(const std::string& name);

    /// As failures name it.
    const std::string& Name() const { return fName; }

    /// All bytes of a regular file; none of a pipe, where that shows only at its end.
    std::optional<int64_t> Size() const { return fSize; }

    /// As many bytes as are left, up to \p bytes.
    size_t Read(void* to, size_t bytes);

    /// The line without its end; none at the end of the file, and of lines longer than \p most none either.
    std::optional<std::string> ReadLine(size_t most);

private:
    struct Close {
        void operator()(FILE* file) const;
    };

    std::string fName;
    std::unique_ptr<FILE, Close> fFile;
    std::optional<int64_t> fSize;
};

} // namespace tool
