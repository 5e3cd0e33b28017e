// Every row kernel of the library in slow, plain scalar code, to hold the fast ones against.
//
// Single precision, every product and sum rounded, in the order in which a formula is written; nothing is
// fused. "Nearest" follows the current rounding mode, and a NaN gives 0 wherever integers come out.
#pragma once

#include <cstdint>
#include <string_view>

namespace reference {

// Converts one row with the named kernel. The formats choose the member of its family (depth, order,
// structure, matrix).
//
// vectorMember asks for the rule of the vector bodies where it differs from the plain one:
//   Upsample422To444Row and the kernels that contain it: chroma averages round up (SSSE3 and higher);
//   Expand8uTo15uRow: a rounded product, but for the pixels that start before the first 16-byte boundary of
//   the destination (SSE2 and higher). So dst must lie at the same offset from such a boundary as the tested
//   destination.
// quality counts for Upsample422To444Float32Row only: above 1 chroma is interpolated.
//
// A 4:2:2 row is read and written to the end of its last pair, a V210 row to the end of its last group,
// nothing beyond. Rows may be unaligned and must not overlap. Throws std::invalid_argument if there is no
// such kernel or member.
void Run(std::string_view kernel, uint32_t sourceFormat, uint32_t destinationFormat, bool vectorMember,
         const void* src, void* dst, int32_t width, int quality = 0);

// Bytes that the pixels of a row occupy; 0 for a format without rows.
int64_t RowLength(uint32_t format, int32_t width);

} // namespace reference
