#include "dv/DIFStructure.h"

#include <algorithm>
#include <cstring>

namespace PK {
namespace {

constexpr int32_t kIDBytes = 3;

/// The sections of a sequence as the first byte of an ID names them: its upper three bits, and below them the bits that
/// streams have there.
enum Section : uint8_t { kHeader = 0x1f, kSubcode = 0x3f, kVAUX = 0x56, kAudio = 0x76, kVideo = 0x96 };

constexpr int32_t kSubcodeBlocks = 2, kVAUXBlocks = 3, kAudioBlocks = 9, kVideoBlocksPerAudio = 15;

/// A sequence of a frame, and the block that is written next.
class SequenceWriter {
public:
    SequenceWriter(const DVFormat& format, int32_t channel, int32_t sequence, uint8_t* bytes)
        : fFormat(format), fSequence(sequence), fBlock(bytes) {
        // Channels 0 and 1 are told from 2 and 3 by FSP, the two of a pair by FSC.
        const int32_t isOdd = channel & 1, isOfFirstPair = channel < 2 ? 1 : 0;
        fSecondIDByte = static_cast<uint8_t>(sequence << 4 | isOdd << 3 | isOfFirstPair << 2 | 3);
    }

    void Write() {
        Header();
        for (int32_t i = 0; i < kSubcodeBlocks; ++i) Subcode(i);
        for (int32_t i = 0; i < kVAUXBlocks; ++i) VAUX(i);
        for (int32_t i = 0; i < kAudioBlocks; ++i) {
            Next(kAudio, i);
            for (int32_t k = 0; k < kVideoBlocksPerAudio; ++k) Next(kVideo, kVideoBlocksPerAudio * i + k);
        }
    }

private:
    /// A block of ones but for its ID.
    uint8_t* Next(Section section, int32_t number) {
        uint8_t* const block = fBlock;
        std::memset(block, 0xff, kDIFBlockBytes);
        block[0] = section;
        block[1] = fSecondIDByte;
        block[2] = static_cast<uint8_t>(number);
        fBlock += kDIFBlockBytes;
        return block;
    }

    /// The application ID of the track, of audio, of video and of subcode: 0 for consumer DV of 625 lines, whose chroma
    /// is 4:2:0, else 1.
    void Header() {
        uint8_t* const block = Next(kHeader, 0);
        const uint8_t application = fFormat.sampling == DVSampling::k420 ? 0 : 1;
        constexpr uint8_t kIsValid = 0x78; // and ones
        block[3] = static_cast<uint8_t>(fFormat.is625 ? 0xbf : 0x3f);
        block[4] = static_cast<uint8_t>(0xf8 | application);
        std::fill_n(block + 5, 3, static_cast<uint8_t>(kIsValid | application));
    }

    /// Six sync blocks of eight bytes. The first of a sequence has a time code of 0 frames, without which readers say that
    /// one is missing; the others have no pack.
    void Subcode(int32_t number) {
        uint8_t* const block = Next(kSubcode, number);
        constexpr int32_t kSyncBlocks = 6, kSyncBlockBytes = 8;
        const bool isInFirstHalf = fSequence < fFormat.Sequences() / 2;
        for (int32_t i = 0; i < kSyncBlocks; ++i) {
            uint8_t* const sync = block + kIDBytes + kSyncBlockBytes * i;
            sync[0] = isInFirstHalf ? 0x8f : 0x0f;
            sync[1] = static_cast<uint8_t>(0xf0 | (kSyncBlocks * number + i));
        }
        constexpr uint8_t kTimeCode[] = {0x13, 0, 0, 0, 0};
        if (number == 0) std::memcpy(block + kIDBytes + 3, kTimeCode, sizeof kTimeCode);
    }

    /// The packs of the source and of its control stand at all places where a reader may look for them.
    void VAUX(int32_t number) {
        uint8_t* const block = Next(kVAUX, number);
        const auto type = static_cast<uint8_t>(0xc0 | (fFormat.is625 ? 0x20 : 0) | fFormat.type);
        // Frames, both fields, the first field first, a new picture, interlaced: as general encoders have it for all.
        const auto displayMode = static_cast<uint8_t>(fFormat.IsHD() ? 2 : 0); // 16:9 and 4:3
        const uint8_t packs[] = {
            0x60, 0xff, 0xff, type, 0xff, 0x61, 0x3f, static_cast<uint8_t>(0xc8 | displayMode), 0xfc, 0xff};
        constexpr int32_t kPackBytes = 5, kPlaces[] = {0, 9};
        for (const int32_t place : kPlaces)
            std::memcpy(block + kIDBytes + kPackBytes * place, packs, sizeof packs);
    }

    const DVFormat& fFormat;
    int32_t fSequence;
    uint8_t* fBlock;
    uint8_t fSecondIDByte;
};

} // namespace

void WriteDIFStructure(const DVFormat& format, int32_t firstChannel, uint8_t* frame) {
    for (int32_t channel = 0; channel < format.channels; ++channel)
        for (int32_t sequence = 0; sequence < format.Sequences(); ++sequence) {
            SequenceWriter(format, firstChannel + channel, sequence, frame).Write();
            frame += kSequenceBytes;
        }
}

} // namespace PK
