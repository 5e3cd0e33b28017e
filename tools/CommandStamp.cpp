// pixelkiln stamp: a number burnt into every frame.

#include "Commands.h"
#include "Numbers.h"
#include "Operations.h"

namespace tool {

void Burn(Frame& frame, const Stamp& stamp) {
    const PK_Result result = PK_PrintNum(frame.Pixels(), frame.RowBytes(), frame.Format(), frame.Width(),
                                         frame.Height(), stamp.number, stamp.digit, stamp.at, !stamp.hex);
    Require(result, "stamp", frame);
}

void RunStamp(const StampOptions& options) {
    const std::vector<double> at = ParseNumbers(options.at, 2, "a place X,Y");
    Stamp stamp = {
        options.number, {static_cast<float>(at[0]), static_cast<float>(at[1])}, options.digit, options.hex};
    PipeFramesInTheirFormat(options, [&](const Frame& frame) {
        Frame stamped = Copied(frame);
        Burn(stamped, stamp);
        // Each frame counts on, from the greatest number to the least.
        stamp.number = static_cast<int32_t>(static_cast<uint32_t>(stamp.number) + 1);
        return stamped;
    });
}

} // namespace tool
