#pragma once

// The variable-length code of DV, the same in all formats: a run of zeros and the amplitude that ends it, then a sign bit
// (1 = negative) where there is an amplitude. Source: IEC 61834-2, SMPTE 314M and 370M.

#include <cstdint>

namespace PK {

/// A code word of the list.
struct DVCode {
    uint8_t run;
    uint8_t amplitude; ///< 0 for a run alone, which stands for one zero more: it leads to the next place
    uint8_t length;    ///< bits, without the sign
};

inline constexpr uint8_t kEndOfBlockRun = 255;

/// In the order of the code words: each is the one before plus 1, and the zeros that its length is more. The first is 00.
inline constexpr DVCode kDVCodes[] = {
    {0, 1, 2},   {0, 2, 3},   {kEndOfBlockRun, 0, 4},
    {1, 1, 4},   {0, 3, 4},   {0, 4, 4},
    {2, 1, 5},   {1, 2, 5},   {0, 5, 5},
    {0, 6, 5},   {3, 1, 6},   {4, 1, 6},
    {0, 7, 6},   {0, 8, 6},   {5, 1, 7},
    {6, 1, 7},   {2, 2, 7},   {1, 3, 7},
    {1, 4, 7},   {0, 9, 7},   {0, 10, 7},
    {0, 11, 7},  {7, 1, 8},   {8, 1, 8},
    {9, 1, 8},   {10, 1, 8},  {3, 2, 8},
    {4, 2, 8},   {2, 3, 8},   {1, 5, 8},
    {1, 6, 8},   {1, 7, 8},   {0, 12, 8},
    {0, 13, 8},  {0, 14, 8},  {0, 15, 8},
    {0, 16, 8},  {0, 17, 8},  {11, 1, 9},
    {12, 1, 9},  {13, 1, 9},  {14, 1, 9},
    {5, 2, 9},   {6, 2, 9},   {3, 3, 9},
    {4, 3, 9},   {2, 4, 9},   {2, 5, 9},
    {1, 8, 9},   {0, 18, 9},  {0, 19, 9},
    {0, 20, 9},  {0, 21, 9},  {0, 22, 9},
    {5, 3, 10},  {3, 4, 10},  {3, 5, 10},
    {2, 6, 10},  {1, 9, 10},  {1, 10, 10},
    {1, 11, 10}, {0, 0, 11},  {1, 0, 11},
    {6, 3, 11},  {4, 4, 11},  {3, 6, 11},
    {1, 12, 11}, {1, 13, 11}, {1, 14, 11},
    {2, 0, 12},  {3, 0, 12},  {4, 0, 12},
    {5, 0, 12},  {7, 2, 12},  {8, 2, 12},
    {9, 2, 12},  {10, 2, 12}, {7, 3, 12},
    {8, 3, 12},  {4, 5, 12},  {3, 7, 12},
    {2, 7, 12},  {2, 8, 12},  {2, 9, 12},
    {2, 10, 12}, {2, 11, 12}, {1, 15, 12},
    {1, 16, 12}, {1, 17, 12},
};

/// Behind the list: a prefix of seven bits, and a number of so many bits.
struct DVEscape {
    uint8_t prefix;
    uint8_t bits;
    uint8_t first; ///< the least number that an encoder writes so
};
inline constexpr DVEscape kDVRunEscape = {0x7e, 6, 6};        ///< a run alone, up to 61
inline constexpr DVEscape kDVAmplitudeEscape = {0x7f, 8, 23}; ///< an amplitude without a run, up to 255

inline constexpr int32_t kDVEscapePrefixBits = 7;

} // namespace PK
