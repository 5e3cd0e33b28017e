#include "frame/Contract.h"

#include "zebcore/config.h"
#include "zebcore/debug.h"

namespace PK {
namespace {

// Hosts tell the error by these.
constexpr char kMessage[] =
    "$$$/zebcore/utility/Error/Contract/InputContractViolation=An input contract violation has occurred!";
constexpr uint32_t kCode = 105;
constexpr int32_t kCategory = 25;

} // namespace

void ReportContractViolation(const char* expression, const char* sourcePath, const char* function,
                             int32_t line) {
    using namespace zebcore;
    if (debug::BreakAfterContractDialog(expression, sourcePath, function, line) &&
        debug::IsDebuggerAttached())
        __asm__ volatile("int3");
    const config::ReplacementValue none;
    config::ThrowError(0, kMessage, kCode, kCategory, true, none, none, none, none);
}

} // namespace PK
