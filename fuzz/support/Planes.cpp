#include "support/Planes.h"

namespace PKFuzz {

Planes::Planes(const RowsLayout (&extents)[3], ByteStream& stream) {
    for (int i = 0; i < 3; ++i) {
        const size_t rows = extents[i].rowLength == 0 ? 0 : extents[i].rows;
        const SourceImage& plane =
            memory.emplace_back(DrawLayout(stream, extents[i].rowLength, rows), stream);
        const bool isNull = stream.OneIn(64);
        hasNull = hasNull || (isNull && rows != 0);
        sources[i] = pointers[i] = isNull ? nullptr : plane.Pixels();
        rowBytes[i] = plane.RowBytes();
    }
}

void Planes::CheckPadding() const {
    for (const SourceImage& plane : memory) plane.CheckPadding();
}

void Planes::CheckStay() const {
    for (const SourceImage& plane : memory) plane.CheckStays();
}

} // namespace PKFuzz
