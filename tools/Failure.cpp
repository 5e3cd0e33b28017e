#include "Failure.h"

#include <cerrno>
#include <cstring>

namespace tool {

void ThrowFileFailure(const std::string& what, int error) {
    if (error == EPIPE) throw BrokenPipe();
    const char* advice = "";
    if (error == ENOSPC || error == EDQUOT) advice = "; free some space or write to another disk";
    if (error == EACCES || error == EPERM || error == EROFS)
        advice = "; check the permissions of the file and of its folder";
    if (error == ENOENT) advice = "; check the name";
    throw Failure(kExitFile, what + ": " + std::strerror(error) + advice);
}

} // namespace tool
