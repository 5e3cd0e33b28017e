#pragma once

// A way to scale, ours or another library's, entered in a list before main begins, so that a peer's file is compiled in
// only where its library is installed.

#include "Grey.h"

#include <initializer_list>

namespace Scaling {

struct Scaler {
    const char* name;
    /// All of the picture to all of another size.
    Grey (*scale)(const Grey& from, int32_t width, int32_t height);
    bool isShown = true; ///< in the pictures, too
};

inline std::vector<Scaler>& AllScalers() {
    static std::vector<Scaler> scalers;
    return scalers;
}

struct AddScalers {
    AddScalers(std::initializer_list<Scaler> scalers) {
        AllScalers().insert(AllScalers().end(), scalers.begin(), scalers.end());
    }
};

} // namespace Scaling
