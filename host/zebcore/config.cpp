// Bundled errors of the host: they are traced, and the caller goes on.

#include "zebcore/config.h"

#include "zebcore/debug.h"

#include <string_view>

namespace zebcore::config {

void ThrowError(int32_t level, const char* message, uint32_t code, int32_t category, bool report,
                const ReplacementValue&, const ReplacementValue&, const ReplacementValue&,
                const ReplacementValue&) {
    if (!report) return;
    std::string_view text = message;
    text.remove_prefix(text.find('=') + 1); // without a key the whole: npos + 1 is 0
    debug::Trace("error " + std::to_string(code) + " (category " + std::to_string(category) + ", level " +
                 std::to_string(level) + "): " + std::string(text) + "\n");
}

} // namespace zebcore::config
