#pragma once

/// \file
/// The host's encoder of DV25, which the library reaches by the numbers 30, 31 and 32 of its functions.
///
/// The library opens it once, when it starts or at its first frame, and closes it when it stops. Unless IsReentrant says
/// otherwise it encodes one frame at a time, whatever the number of threads that ask for it, and holds a lock over the call: an
/// encoder needs none. It may call the library's exported functions, but none that encodes DV25, starts or stops it.

#include <PixelKiln/Types.h>

#include <cstdint>

namespace mc_enc_dv {

/// What the host's encoder is to itself.
using Handle = void*;

/// A pixel kind by its four letters.
constexpr uint32_t FourCC(const char (&letters)[5]) {
    uint32_t code = 0;
    for (int32_t i = 3; i >= 0; --i) code = code << 8 | static_cast<uint8_t>(letters[i]);
    return code;
}

/// The pixel kinds, rows from the top of the picture; of 8 bits, BT.601 and video range where they are YUV.
inline constexpr uint32_t kYUYV = FourCC("YuYv");
inline constexpr uint32_t kUYVY = FourCC("UyVy");
inline constexpr uint32_t kVUYA = FourCC("VUYA");
inline constexpr uint32_t kBGRA = FourCC("BGRA");

/// Flags of Encode.
enum : int32_t {
    kFast = 0x2,          ///< A quick result rather than a good one.
    kDVCPRO = 0x8,        ///< SMPTE 314M: chroma of 625 lines is 4:1:1 rather than 4:2:0.
    kAlways = 0x10000,    ///< Set in every call.
    kHasAlpha = 0x100000, ///< The fourth channel counts: what is transparent goes over black.
};

/// Number 30. Opens the encoder.
Handle Open() noexcept;

/// Number 31. Closes it.
void Close(Handle encoder) noexcept;

/// Number 32. Encodes one frame.
/// \param pixels    the first row of the picture.
/// \param rowBytes  from one row to the next below it, of either sign.
/// \param dst       receives the frame.
/// \param dstBytes  room there is: 120000 for 525 lines, 144000 for 625.
/// \param width     720, or 360 for a picture that is to be doubled both ways.
/// \param height    480 or 240 for 525 lines, 576 or 288 for 625.
/// \param flags     see above.
/// \param fourcc    kYUYV, kUYVY, kVUYA or kBGRA.
/// The arguments without a name are 0.
/// \return the bytes written; another number than dstBytes where the frame could not be made, and a negative one to say by a
///         PK_Result why, as PK_ErrOutOfMemory.
int32_t Encode(Handle encoder, const void* pixels, int32_t rowBytes, void* dst, int32_t dstBytes,
               int32_t width, int32_t height, int32_t, int32_t flags, uint32_t fourcc, int32_t,
               int32_t) noexcept;

/// Whether frames may be encoded at once, also while the encoder is closed: it keeps nothing from one to another.
bool IsReentrant() noexcept;

} // namespace mc_enc_dv
