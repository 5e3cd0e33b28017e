#include "OutputFile.h"

#include "Failure.h"

#include <cerrno>
#include <climits>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <sys/stat.h>
#include <tuple>
#include <unistd.h>

namespace tool {
namespace {

constexpr int kEndingSignals[] = {SIGINT, SIGTERM, SIGHUP, SIGQUIT};

// What the signal handler removes; a plain array, since a handler may use little else.
char sUnfinished[PATH_MAX];
volatile std::sig_atomic_t sHasUnfinished = 0;

extern "C" void RemoveUnfinishedAndEnd(int signal) {
    if (sHasUnfinished) unlink(sUnfinished);
    std::signal(signal, SIG_DFL);
    std::raise(signal);
}

// Keeps the ending signals away while the file and the record of it change together.
class HeldSignals {
public:
    HeldSignals() {
        sigset_t signals;
        sigemptyset(&signals);
        for (const int signal : kEndingSignals) sigaddset(&signals, signal);
        sigprocmask(SIG_BLOCK, &signals, &fBefore);
    }
    ~HeldSignals() { sigprocmask(SIG_SETMASK, &fBefore, nullptr); }
    HeldSignals(const HeldSignals&) = delete;
    HeldSignals& operator=(const HeldSignals&) = delete;

private:
    sigset_t fBefore;
};

mode_t PermissionsOf(const struct stat* existing) {
    if (existing != nullptr) return existing->st_mode & 07777;
    const mode_t mask = umask(0);
    umask(mask);
    return 0666 & ~mask;
}

} // namespace

void CleanUpOnSignals() {
    for (const int signal : kEndingSignals)
        if (std::signal(signal, RemoveUnfinishedAndEnd) == SIG_IGN) std::signal(signal, SIG_IGN);
}

OutputFile::OutputFile(const std::string& name) : fName(name == "-" ? "standard output" : name) {
    if (name == "-") {
        fFile = dup(STDOUT_FILENO);
        if (fFile < 0) ThrowFileFailure(Complaint(), errno);
        return;
    }
    struct stat existing;
    const bool exists = stat(name.c_str(), &existing) == 0;
    if (exists && S_ISDIR(existing.st_mode)) ThrowFileFailure(Complaint(), EISDIR);
    // The rename would get around the permissions of a file that exists.
    if (exists && access(name.c_str(), W_OK) != 0) ThrowFileFailure(Complaint(), errno);
    if (exists && !S_ISREG(existing.st_mode)) {
        fFile = open(name.c_str(), O_WRONLY | O_CLOEXEC);
        if (fFile < 0) ThrowFileFailure(Complaint(), errno);
        return;
    }
    fTarget = exists ? std::filesystem::canonical(name).string() : name;
    OpenBeside();
    // A file system without permissions refuses; the file is whole all the same.
    std::ignore = fchmod(fFile, PermissionsOf(exists ? &existing : nullptr));
}

void OutputFile::OpenBeside() {
    const std::filesystem::path target(fTarget);
    std::string pattern = (target.parent_path() / ".pixelkiln.XXXXXX").string();
    if (pattern.size() >= sizeof(sUnfinished)) ThrowFileFailure(Complaint(), ENAMETOOLONG);
    const HeldSignals held;
    fFile = mkostemp(pattern.data(), O_CLOEXEC);
    if (fFile < 0) ThrowFileFailure(Complaint(), errno);
    fTemporary = pattern;
    std::memcpy(sUnfinished, pattern.c_str(), pattern.size() + 1);
    sHasUnfinished = 1;
}

OutputFile::~OutputFile() {
    if (fFile >= 0) close(fFile);
    if (fTemporary.empty()) return;
    const HeldSignals held;
    unlink(fTemporary.c_str());
    sHasUnfinished = 0;
}

void OutputFile::Write(const void* data, size_t bytes) {
    const char* next = static_cast<const char*>(data);
    while (bytes > 0) {
        const ssize_t written = write(fFile, next, bytes);
        if (written < 0 && errno == EINTR) continue;
        if (written < 0) ThrowFileFailure(Complaint(), errno);
        next += written;
        bytes -= static_cast<size_t>(written);
    }
}

void OutputFile::Commit() {
    const int file = fFile;
    fFile = -1;
    if (close(file) != 0) ThrowFileFailure(Complaint(), errno);
    if (fTemporary.empty()) return;
    const HeldSignals held;
    if (rename(fTemporary.c_str(), fTarget.c_str()) != 0) ThrowFileFailure(Complaint(), errno);
    fTemporary.clear();
    sHasUnfinished = 0;
}

} // namespace tool
