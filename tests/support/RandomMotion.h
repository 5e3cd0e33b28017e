#pragma once

// Random calls of PK_Motion, in the words of its restatement.

#include "reference/ReferenceMotion.h"
#include "support/PaddedPicture.h"

#include <string>

namespace PKTest {

/// Two images and how one is placed in the other.
struct RandomMotion {
    explicit RandomMotion(Random& random);

    /// What is asked for, with the source of this and some destination like that of this.
    PKReference::MotionArguments With(PaddedPicture& to) const;

    PaddedPicture source, destination;

private:
    struct Formats;
    RandomMotion(const Formats& formats, Random& random);

    void DrawPlace(Random& random);
    void DrawCrop(Random& random);
    void DrawWholePlace(Random& random);
    void DrawCover(Random& random);
    void DrawGroups(Random& random);

    PKReference::MotionArguments fArguments;
};

/// The exported call.
PK_Result CallMotion(const PKReference::MotionArguments& arguments);

std::string Describe(const PKReference::MotionArguments& arguments);

} // namespace PKTest
