#include "dv/EncodeDV.h"

#include "dv/DIFStructure.h"
#include "dv/DV100SegmentCompressor.h"
#include "frame/FloatMode.h"

namespace PK {
namespace {

/// Walks a frame, segment by segment.
class FrameEncoder {
public:
    FrameEncoder(const DVFormat& format, const DVPicture& picture, const DVPolicy& policy)
        : fFormat(format), fPicture(picture, policy.sampleBits),
          fMayBeOfFields(policy.fields == DVPolicy::Fields::WhereSmoother && !format.isProgressive) {}

    /// \param take  takes the blocks of a macroblock to the compressor: (macroblock, place).
    template <class Take>
    void Run(int32_t firstChannel, uint8_t* frame, SegmentCompressor& compressor, const Take& take) const {
        for (int32_t channel = 0; channel < fFormat.channels; ++channel)
            for (int32_t sequence = 0; sequence < fFormat.Sequences(); ++sequence) {
                for (int32_t segment = 0; segment < kSegmentsOfSequence; ++segment)
                    Segment(firstChannel + channel, sequence, segment, frame, compressor, take);
                frame += kSequenceBytes;
            }
    }

    bool TakeMacroblock(const DVPlace& place, int16_t* blocks) const {
        return fPicture.Take(place, fMayBeOfFields, blocks);
    }

private:
    template <class Take>
    void Segment(int32_t channel, int32_t sequence, int32_t segment, uint8_t* bytes,
                 SegmentCompressor& compressor, const Take& take) const {
        uint8_t* const blocks = bytes + SegmentOffset(segment);
        DVPlace places[kMacroblocksOfSegment];
        if (PlaceSegment(fFormat, channel, sequence, segment, places)) {
            for (int32_t i = 0; i < kMacroblocksOfSegment; ++i) take(i, places[i]);
            compressor.Compress(blocks);
        } else {
            WriteEmptySegment(blocks);
        }
    }

    /// Grey, for the sequences that carry no picture.
    void WriteEmptySegment(uint8_t* segment) const {
        for (int32_t i = 0; i < kMacroblocksOfSegment; ++i) {
            uint8_t* const macroblock = segment + kDIFBlockBytes * i;
            macroblock[3] = 0;
            for (const DVArea& area : AreasOfMacroblock(fFormat.BlocksOfMacroblock())) {
                // A DC of 0, mode 0, class 0 and the end of the block.
                macroblock[area.offset] = 0;
                macroblock[area.offset + 1] = 0x06;
            }
        }
    }

    const DVFormat& fFormat;
    DVMacroblockSource fPicture;
    bool fMayBeOfFields;
};

void EncodeSegments(const FrameEncoder& encoder, const DVFormat& format, int32_t firstChannel,
                    const DVPolicy& policy, uint8_t* frame) {
    SegmentCompressor compressor(policy, format.sampling == DVSampling::k422);
    encoder.Run(firstChannel, frame, compressor, [&](int32_t macroblock, const DVPlace& place) {
        encoder.TakeMacroblock(place, compressor.Samples(macroblock, 0));
    });
}

void EncodeHDSegments(const FrameEncoder& encoder, const DVFormat& format, int32_t firstChannel,
                      const DVPolicy& policy, uint8_t* frame) {
    DV100SegmentCompressor compressor(policy, format.isProgressive);
    encoder.Run(firstChannel, frame, compressor, [&](int32_t macroblock, const DVPlace& place) {
        const bool isOfFields = encoder.TakeMacroblock(place, compressor.Samples(macroblock, 0));
        compressor.SetIsOfFields(macroblock, isOfFields);
    });
}

} // namespace

void EncodeDV(const DVFormat& format, const DVPicture& picture, int32_t firstChannel, const DVPolicy& policy,
              uint8_t* frame) {
    const InitialFloatMode mode; // by which transforms round: a picture has one frame, whoever asks for it
    WriteDIFStructure(format, firstChannel, frame);
    const FrameEncoder encoder(format, picture, policy);
    if (format.IsHD())
        EncodeHDSegments(encoder, format, firstChannel, policy, frame);
    else
        EncodeSegments(encoder, format, firstChannel, policy, frame);
}

} // namespace PK
