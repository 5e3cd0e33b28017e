#pragma once

// What a DV frame says of the shape of its picture: the VAUX source control packs of its sequences, read and written.

#include <cstdint>

namespace PK {

/// How a picture is to be shown. The standards write it in two fields of the pack, in one way for type 0 (525 lines, and
/// all of the professional formats) and in another for consumer streams of 625 lines.
enum class DVAspect : int8_t {
    kNone = -1, ///< The frame does not say.
    k4x3,
    kLetterbox16x9, ///< A wide picture between black bars in a frame of 4:3.
    k16x9,
    kLetterbox14x9,
    k14x9,
};

/// A view of a frame, which owns nothing.
class CDVFrame {
public:
    /// \param size  bytes of the frame; 0 where its header is to tell.
    explicit CDVFrame(const uint8_t* frame, int32_t size = 0) : fFrame(frame), fSize(size) {}

    /// DIF sequences of all channels. 525 and 625 lines have 10 and 12 in a frame of DV25, of which the header tells.
    int32_t SequenceCount() const;

    /// What most sequences say; of those that are named equally often the first of the list.
    DVAspect VoteOnAspect() const;

    /// Has a frame of this size say an aspect in every sequence that has a pack; kNone changes nothing. The other bits of
    /// the packs stay.
    static void WriteAspect(uint8_t* frame, int32_t size, DVAspect aspect);

private:
    const uint8_t* fFrame;
    int32_t fSize;
};

} // namespace PK
