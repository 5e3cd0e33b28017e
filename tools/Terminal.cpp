#include "Terminal.h"

#include "Failure.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <string_view>
#include <unistd.h>

namespace tool {
namespace {

constexpr std::chrono::milliseconds kBeforeFirstDrawing{400};
constexpr std::chrono::milliseconds kBetweenDrawings{100};

bool IsStyled() {
    const char* terminal = std::getenv("TERM");
    return isatty(STDOUT_FILENO) && std::getenv("NO_COLOR") == nullptr && terminal != nullptr &&
           std::string_view(terminal) != "dumb";
}

std::string Styled(const char* code, const std::string& text) {
    static const bool isStyled = IsStyled();
    return isStyled ? "\033[" + std::string(code) + "m" + text + "\033[0m" : text;
}

bool IsNumber(const std::string& text) {
    return !text.empty() && text.find_first_not_of("0123456789.") == std::string::npos;
}

std::string CSVLine(std::vector<std::string> cells) {
    for (std::string& cell : cells)
        if (cell.find_first_of(", ") != std::string::npos) cell = "\"" + cell + "\"";
    return Join(cells, ",") + "\n";
}

} // namespace

void Print(const std::string& text) {
    if (std::fputs(text.c_str(), stdout) < 0 || std::fflush(stdout) != 0)
        ThrowFileFailure("cannot write to standard output", errno);
}

std::string Bold(const std::string& text) {
    return Styled("1", text);
}

std::string Dim(const std::string& text) {
    return Styled("2", text);
}

std::string Join(const std::vector<std::string>& words, const char* between) {
    std::string text;
    for (const std::string& word : words) text += (&word == words.data() ? "" : between) + word;
    return text;
}

std::string Table::Aligned() const {
    std::vector<size_t> widths;
    for (size_t column = 0; column < fHeads.size(); ++column) {
        size_t width = fHeads[column].size();
        for (const auto& row : fRows) width = std::max(width, row[column].size());
        widths.push_back(width);
    }
    const auto line = [&](const std::vector<std::string>& cells) {
        std::string text;
        for (size_t column = 0; column < cells.size(); ++column) {
            const std::string space(widths[column] - cells[column].size(), ' ');
            const bool toTheRight = IsNumber(fRows.empty() ? "" : fRows.front()[column]);
            text += (column == 0 ? "" : "  ") + (toTheRight ? space + cells[column] : cells[column] + space);
        }
        text.erase(text.find_last_not_of(' ') + 1);
        return text;
    };
    std::string text = Bold(line(fHeads)) + "\n";
    for (const auto& row : fRows) text += line(row) + "\n";
    return text;
}

std::string Table::CSV() const {
    std::string text = CSVLine(fHeads);
    for (const auto& row : fRows) text += CSVLine(row);
    return text;
}

Progress::Progress(std::string what, int64_t total)
    : fWhat(std::move(what)), fTotal(total), fIsTerminal(isatty(STDERR_FILENO)),
      fNextDrawing(std::chrono::steady_clock::now() + kBeforeFirstDrawing) {}

Progress::~Progress() {
    if (fIsDrawn) std::fputs("\r\033[K", stderr);
}

void Progress::Advance() {
    ++fDone;
    if (!fIsTerminal || std::chrono::steady_clock::now() < fNextDrawing) return;
    Draw();
    fNextDrawing = std::chrono::steady_clock::now() + kBetweenDrawings;
}

void Progress::Draw() {
    constexpr int64_t kBarWidth = 30;
    fIsDrawn = true;
    const auto done = static_cast<long long>(fDone);
    if (fTotal == 0) {
        std::fprintf(stderr, "\r\033[K%s %lld", fWhat.c_str(), done);
        return;
    }
    const int64_t filled = kBarWidth * fDone / fTotal;
    const std::string bar = std::string(static_cast<size_t>(filled), '#') +
                            std::string(static_cast<size_t>(kBarWidth - filled), '.');
    std::fprintf(stderr, "\r\033[K%s [%s] %lld/%lld", fWhat.c_str(), bar.c_str(), done,
                 static_cast<long long>(fTotal));
}

} // namespace tool
