// unload LIBRARY: the library leaves nothing behind in a process that loads it for a while: no memory that it kept, no
// thread, no handler of forks, whether or not it was stopped before.

#include <PixelKiln/Buffers.h>
#include <PixelKiln/Lifecycle.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <dlfcn.h>
#include <filesystem>
#include <iterator>
#include <malloc.h>
#include <sys/wait.h>
#include <unistd.h>

extern "C" [[gnu::weak]] size_t
__sanitizer_get_current_allocated_bytes(); // sanitizers have a heap of their own

namespace {

constexpr uint64_t kBytes = 64 << 20;

size_t BytesInUse() {
    if (__sanitizer_get_current_allocated_bytes != nullptr) return __sanitizer_get_current_allocated_bytes();
    const struct mallinfo2 info = mallinfo2();
    return info.uordblks + info.hblkhd;
}

ptrdiff_t Threads() {
    return std::distance(std::filesystem::directory_iterator("/proc/self/task"), {});
}

void Expect(bool condition, const char* rule) {
    if (condition) return;
    std::fprintf(stderr, "not so: %s\n", rule);
    std::exit(1);
}

class Library {
public:
    explicit Library(const char* path) : fPath(path), fHandle(dlopen(path, RTLD_NOW | RTLD_LOCAL)) {
        Expect(fHandle != nullptr, "the library can be loaded");
    }
    ~Library() {
        dlclose(fHandle);
        Expect(dlopen(fPath, RTLD_NOW | RTLD_NOLOAD) == nullptr, "the library is unloaded");
    }
    Library(const Library&) = delete;
    Library& operator=(const Library&) = delete;

    template <class Function>
    Function* Find(const char* name) const {
        return reinterpret_cast<Function*>(dlsym(fHandle, name));
    }

private:
    const char* fPath;
    void* fHandle;
};

void UseAndUnload(const char* path, bool isStopped) {
    const size_t before = BytesInUse();
    {
        const Library library(path);
        const auto initialize = library.Find<decltype(PK_Initialize)>("PK_Initialize");
        const auto terminate = library.Find<decltype(PK_Terminate)>("PK_Terminate");
        const auto allocate =
            library.Find<decltype(PK_AllocateTransientMemoryBlock)>("PK_AllocateTransientMemoryBlock");
        const auto free = library.Find<decltype(PK_FreeTransientMemoryBlock)>("PK_FreeTransientMemoryBlock");
        initialize();
        void* base = nullptr;
        uint64_t size = 0;
        Expect(allocate(kBytes, &base, &size) != nullptr, "there is memory");
        free(base, size);
        Expect(BytesInUse() >= before + kBytes, "a block that was given back is kept");
        if (isStopped) terminate();
    }
    Expect(BytesInUse() < before + kBytes / 64, "what was kept is given back");
}

bool ForksAChild() {
    const pid_t child = fork();
    if (child == 0) _exit(0);
    int status = 0;
    return waitpid(child, &status, 0) == child && WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

} // namespace

int main(int count, char** arguments) {
    if (count != 2) return 2;
    const ptrdiff_t threads = Threads();
    for (const bool isStopped : {true, false}) {
        UseAndUnload(arguments[1], isStopped);
        Expect(ForksAChild(), "the process can fork");
    }
    for (int i = 0; i < 1000 && Threads() != threads; ++i)
        usleep(1000); // one that ended is still seen for a moment
    Expect(Threads() == threads, "no thread is left");
    return 0;
}
