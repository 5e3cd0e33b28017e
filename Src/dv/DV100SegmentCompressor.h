#pragma once

// The compression of a video segment of DV100.

#include "dv/SegmentCompressor.h"

namespace PK {

class DV100SegmentCompressor final : public SegmentCompressor {
public:
    DV100SegmentCompressor(const DVPolicy& policy, bool is720p);

    /// Whether a macroblock's samples are those of fields: the upper of its pieces those of the upper one.
    void SetIsOfFields(int32_t macroblock, bool isOfFields) { fAreOfFields[macroblock] = isOfFields; }

    void Compress(uint8_t* segment) override;

private:
    Quantiser QuantiserOf(const DVBlock& block, int32_t step, bool isTooLarge) const override;
    int32_t FinestStep() const override;

    bool fIs720p;
    bool fAreOfFields[kMacroblocksOfSegment]{};
};

} // namespace PK
