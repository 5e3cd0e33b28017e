#include "reference/ReferenceBoxBlur.h"

#include <algorithm>

namespace PKTest {
namespace {

constexpr int32_t kRenormalise = 16;

/// What lies in the window of one pixel of a line.
class Window {
public:
    explicit Window(const BoxLine& line) : fLine(line) {}

    void Enter(int64_t i) {
        if (IsInLine(i)) fWhole.push_back(i);
    }
    void Leave(int64_t i) { std::erase(fWhole, i); }
    void SetEdges(std::vector<int64_t> edges) {
        std::erase_if(edges, [&](int64_t i) { return !IsInLine(i); });
        fEdges = edges;
    }
    int64_t Count() const { return static_cast<int64_t>(fWhole.size()); }
    int64_t EdgeCount() const { return static_cast<int64_t>(fEdges.size()); }
    int64_t Sum(size_t byte) const { return SumOf(fWhole, byte); }
    int64_t EdgeSum(size_t byte) const { return SumOf(fEdges, byte); }

private:
    bool IsInLine(int64_t i) const { return i < static_cast<int64_t>(fLine.size()); }
    int64_t SumOf(const std::vector<int64_t>& places, size_t byte) const {
        int64_t sum = 0;
        for (const int64_t i : places) sum += fLine[static_cast<size_t>(i)][byte];
        return sum;
    }

    const BoxLine& fLine;
    std::vector<int64_t> fWhole, fEdges; // places in the line
};

/// Takes the window from pixel x - 1 to pixel x. Where sections run into each other, the first counts.
void MoveTo(int64_t x, int64_t length, int64_t size, Window& window) {
    const int64_t left = x - size, right = x + size;
    if (x <= size - 1) {
        window.Enter(right - 1);
        window.SetEdges({right});
    } else if (x == size) {
        window.Leave(0);
        window.Enter(right - 1);
        window.SetEdges({right});
    } else if (x <= length - size - 3) {
        window.Leave(left);
        window.Enter(right - 1);
        window.SetEdges({left, right});
    } else if (x <= length - size - 1) {
        window.Leave(left);
        window.SetEdges({left, right});
    } else {
        window.Leave(left);
        window.SetEdges({left});
    }
}

} // namespace

ReferenceBox ReferenceBoxOf(double radius) {
    if (!(radius > 0)) radius = 0;
    const auto whole = static_cast<int64_t>(radius);
    return {whole + 1, static_cast<int64_t>((radius - static_cast<double>(whole)) * 255.0)};
}

BoxLine ReferenceBoxPass(const BoxLine& line, const ReferenceBox& box, int32_t flags) {
    if (box.size == 1 && box.weight == 0) return line;
    Window window(line);
    for (int64_t i = 0; i <= box.size - 2; ++i) window.Enter(i);
    BoxLine result = line;
    for (size_t x = 0; x < line.size(); ++x) {
        MoveTo(static_cast<int64_t>(x), static_cast<int64_t>(line.size()), box.size, window);
        const int64_t whole = (flags & kRenormalise) != 0 ? 255 * window.Count() : 510 * box.size - 255;
        const int64_t divisor = whole + box.weight * window.EdgeCount();
        for (size_t byte = 0; byte < 4; ++byte)
            if ((flags >> byte & 1) != 0 && divisor != 0) {
                const int64_t sum = 255 * window.Sum(byte) + box.weight * window.EdgeSum(byte) + 128;
                result[x][byte] = static_cast<uint8_t>(std::min<int64_t>(255, sum / divisor));
            }
    }
    return result;
}

} // namespace PKTest
