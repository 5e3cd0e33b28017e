#pragma once

// The decoding curves of the HDR signals as tables, made at first use and kept. They are small enough for the first-level
// cache, where two powers a channel would take far longer.

namespace PK {

inline constexpr int kPQDecodeEntries = 4096;
inline constexpr int kHLGDecodeEntries = 2048;

/// Linear values, 1 for 100 cd/m2, of the signals i / 4095.
const float* PQDecodeTable();

/// Scene light from 0 to 1 of the signals i / 2047.
const float* HLGDecodeTable();

/// The index for a signal, which is limited to 0 to 1; NaN is 0.
inline int SignalIndex(float signal, int entries) {
    const float x = signal > 0 ? (signal < 1 ? signal : 1.0f) : 0.0f;
    return static_cast<int>(x * static_cast<float>(entries - 1));
}

} // namespace PK
