#pragma once

// Other libraries on the same work. Each file of peers/ is compiled in where its library is installed, and
// adds its entries before main begins.

#include "frames/Image.h"

#include <functional>
#include <initializer_list>
#include <string>
#include <vector>

namespace FrameBench {

using Run = std::function<void()>;

/// How a peer's work compares with ours.
enum class Likeness {
    Same,        ///< The same formats, so that its result can be held against ours.
    OtherLayout, ///< The same step to or from another layout: planes, other bits, rows in the other
                 ///< direction.
    Part,        ///< Less than we do, or less exact; shown, but no aim.
};

struct Peer {
    PK_PixelFormat source;
    PK_PixelFormat destination;
    std::string name; ///< With what it does otherwise than asked, in brackets.
    Likeness likeness;
    /// Prepares everything that lasts longer than one frame and gives back what converts one. A peer of
    /// another layout brings its own planes instead of one of the images, or of both.
    Run (*prepare)(const Image& source, const Image& destination);
};

/// All peers of this build.
std::vector<Peer>& AllPeers();

/// Adds peers while the program starts.
struct AddPeers {
    AddPeers(std::initializer_list<Peer> peers) {
        AllPeers().insert(AllPeers().end(), peers.begin(), peers.end());
    }
};

} // namespace FrameBench
