#pragma once

// Text for standard output: tables, styles on a terminal, and the progress bar.

#include <chrono>
#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

namespace tool {

/// Writes to standard output and throws if that fails.
void Print(const std::string& text);

/// The text in bold, or dimmed, where standard output is a terminal that wants colours; else as it is.
std::string Bold(const std::string& text);
std::string Dim(const std::string& text);

std::string Join(const std::vector<std::string>& words, const char* between);

class Table {
public:
    explicit Table(std::vector<std::string> heads) : fHeads(std::move(heads)) {}

    void Add(std::vector<std::string> row) { fRows.push_back(std::move(row)); }

    /// Columns aligned for reading: numbers to the right, the rest to the left.
    std::string Aligned() const;

    /// Comma-separated values with a line of heads.
    std::string CSV() const;

private:
    std::vector<std::string> fHeads;
    std::vector<std::vector<std::string>> fRows;
};

/// A bar on standard error, shown only on a terminal and only once the work has taken a moment.
class Progress {
public:
    /// \param total  steps of the work; 0 if not known.
    Progress(std::string what, int64_t total);
    ~Progress();
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;

    void Advance();

private:
    void Draw();

    std::string fWhat;
    int64_t fTotal;
    int64_t fDone = 0;
    bool fIsTerminal;
    bool fIsDrawn = false;
    std::chrono::steady_clock::time_point fNextDrawing;
};

} // namespace tool
