#pragma once

// The numbers of the two HDR signals, as SMPTE ST 2084 and ITU-R BT.2100 have them.

namespace PK::PQ {

inline constexpr float kM1 = 0.1593017578125f, kM2 = 78.84375f;
inline constexpr float kC1 = 0.8359375f, kC2 = 18.8515625f, kC3 = 18.6875f;
inline constexpr float kInverseM1 = 6.277395f, kInverseM2 = 0.012683313f;
inline constexpr float kLinearScale = 0.01f;         ///< 1.0 is 100 of 10000 cd/m2.
inline constexpr float kSignalOf100 = 0.50807786f;   ///< The signal of 100 cd/m2.
inline constexpr float kPerSignalOf100 = 1.9682022f; ///< Its reciprocal.

} // namespace PK::PQ

namespace PK::HLG {

inline constexpr float kA = 0.17883277f, kInverseA = 5.5918164f;
inline constexpr float kB12 = 0.02372241f; ///< b / 12
inline constexpr float kC = 1.0042934f;    ///< a ln 12 + c, since scene light is scaled to 1 and not to 12
inline constexpr float kSquareRootEnd = 0.083333336f;   ///< 1 / 12
inline constexpr float kLinearScale = 0.1f;             ///< 1.0 is 100 of 1000 cd/m2.
inline constexpr float kPeak = 10;                      ///< 1000 cd/m2
inline constexpr float kInverseOOTFExponent = 1.0f / 6; ///< 1 / 1.2 - 1, but for the sign
inline constexpr float kOOTFExponent = 0.2f;            ///< 1.2 - 1
inline constexpr float kLeastLuminancePower = 0.0001f;  ///< keeps black from division by 0
constexpr float kLuma[3] = {0.2627f, 0.678f, 0.0593f};

} // namespace PK::HLG
