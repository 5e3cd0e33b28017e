#pragma once

// The formats of DV as files of frames have them: one DIF frame after the other, with nothing between.

#include <PixelKiln/PixelKiln.h>

#include <cstdint>
#include <string>

namespace tool {

inline constexpr int32_t kDIFBlockBytes = 80, kSequenceBlocks = 150;
inline constexpr int32_t kSequenceBytes = kDIFBlockBytes * kSequenceBlocks;

struct DVKind {
    PK_PixelFormat format;
    int32_t width, height;
    int32_t channels;
    int32_t type;           ///< STYPE of the VAUX source pack
    bool is625;             ///< of 50 fields or frames a second, with 12 sequences a channel rather than 10
    const char* rate;       ///< frames a second, as streams have it
    int32_t field;          ///< the earlier one, as Y4MHead has it
    const char* aspect;     ///< of a pixel
    const char* wideAspect; ///< the same of a picture of 16:9, where there is a choice

    int32_t Sequences() const { return is625 ? 12 : 10; } ///< of a channel
    int32_t Bytes() const { return channels * Sequences() * kSequenceBytes; }
    bool Is709() const { return (format & 0x200) != 0; }
    bool IsProgressive() const { return field == 0; }
};

/// By name or number. Throws a usage Failure for what is no format of DV.
const DVKind& ParseDVKind(const std::string& name);

/// What a frame tells of itself in its first sequence; null if it does not.
const DVKind* DVKindOf(const uint8_t* frame);

/// Such as "NTSCDV25, 720x480, 30000/1001 frames a second".
std::string DVKindText(const DVKind& kind);

} // namespace tool
