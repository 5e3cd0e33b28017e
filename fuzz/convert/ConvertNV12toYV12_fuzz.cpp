// Surfaces of interleaved chroma to planes, whole or one field, in memory that ends where the arguments say.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Input.h"
#include "support/Planes.h"
#include "support/Switches.h"

#include <PixelKiln/Planar.h>

#include <algorithm>
#include <string>

namespace {

using namespace PKFuzz;

Size DrawSize(ByteStream& stream) {
    return {stream.BetweenOrAny(0, stream.OneIn(8) ? 17000 : 299, 32), stream.BetweenOrAny(0, 70, 32)};
}

/// As far as memory is made for it: sizes that are not drawn from a range are refused, or given no memory.
bool IsSmall(Size size) {
    return size.width <= 17000 && size.height <= 70;
}

/// Every `step`th byte of a row, from `first` on, of every row or every other one.
std::vector<uint8_t> Taken(const std::vector<uint8_t>& rows, size_t rowLength, size_t rowStep, size_t first,
                           size_t step) {
    std::vector<uint8_t> taken;
    for (size_t row = 0; row * rowLength < rows.size(); row += rowStep)
        for (size_t k = first; k < rowLength; k += step) taken.push_back(rows[row * rowLength + k]);
    return taken;
}

void FuzzSurfaces(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream);
    Size size = DrawSize(stream);
    if (!IsSmall(size)) (size.width > 17000 ? size.height : size.width) = stream.Between(-1, 0);
    const bool isField = stream.Bool();
    SetCall((isField ? "a field, " : "a surface, ") + Words(size));
    const auto width = static_cast<size_t>(std::max(size.width, 0));
    const auto height = static_cast<size_t>(std::max(size.height, 0));
    const bool hasPixels = size.width > 0 && size.height > 0;
    const size_t pairs = hasPixels ? width / 2 : 0, pairRows = hasPixels ? height / 2 : 0;
    const size_t rowStep = isField ? 2 : 1;
    const auto reached = [&](size_t rowLength, size_t rows) {
        return RowsLayout{rowLength, rowLength == 0 || rows == 0 ? 0 : (rows - 1) * rowStep + 1};
    };
    const Planes from({reached(hasPixels ? width : 0, height), reached(2 * pairs, pairRows), {}}, stream);
    const Planes to({{hasPixels ? width : 0, height}, {pairs, pairRows}, {pairs, pairRows}}, stream);
    std::vector<uint8_t> before[3];
    for (size_t i = 0; i < 3; ++i) before[i] = to.memory[i].Rows();
    CallIn(state, [&] {
        const auto convert = isField ? PK_ConvertNV12toYV12_SSE4<1> : PK_ConvertNV12toYV12_SSE4<0>;
        convert(from.sources[0], from.rowBytes[0], from.sources[1], from.rowBytes[1], to.pointers,
                to.rowBytes, size.width, size.height);
        return PK_Success;
    });
    from.CheckStay();
    to.CheckPadding();
    if (from.hasNull || to.hasNull) {
        for (size_t i = 0; i < 3; ++i) CheckSame(before[i], to.memory[i].Rows(), "a null leaves all planes");
        return;
    }
    const std::vector<uint8_t>& chroma = from.memory[1].Content();
    CheckSame(Taken(from.memory[0].Content(), std::max<size_t>(width, 1), rowStep, 0, 1), to.memory[0].Rows(),
              "luma is copied");
    for (size_t i = 0; i < 2; ++i)
        CheckSame(Taken(chroma, std::max<size_t>(2 * pairs, 1), rowStep, i, 2), to.memory[1 + i].Rows(),
                  "pairs are parted");
}

const Family sFamily('N', "nv12", FuzzSurfaces);

} // namespace
