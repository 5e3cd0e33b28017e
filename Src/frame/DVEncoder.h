#pragma once

// The host's encoder of DV25: one for the process, and one frame at a time unless it takes more.

#include <cstdint>

namespace PK {

/// Opens it for the library's lifetime, and closes it.
void OpenDVEncoder() noexcept;
void CloseDVEncoder() noexcept;

/// What of a frame to encode; as mc_enc_dv::Encode takes it.
struct DVEncoderJob {
    const void* pixels;
    int32_t rowBytes;
    void* dst;
    int32_t dstBytes;
    int32_t width, height;
    int32_t flags;
    uint32_t fourcc;
};

/// Encodes, if the encoder wants it so when those before have ended; opens the encoder if the library has not been started.
/// \return the bytes that were written.
int32_t RunDVEncoder(const DVEncoderJob& job) noexcept;

} // namespace PK
