// Everything that the library takes from its host goes through the host that the project brings, and comes back.

#include "CountingHost.h"
#include "frame/Task.h"

#include <PixelKiln/PixelKiln.h>

#include <cstdio>
#include <vector>

namespace {

int sFailures = 0;

void Expect(bool isRight, const char* what) {
    if (isRight) return;
    std::printf("not so: %s\n", what);
    ++sFailures;
}

} // namespace

int main() {
    const host::Counts& count = host::Count();
    PK_Initialize();
    Expect(count.settings >= 2, "a start reads the settings");
    Expect(count.executors == 1 && count.executorsLetGo == 0, "a start takes an executor");

    void* base = nullptr;
    uint64_t size = 0;
    Expect(PK_AllocateTransientMemoryBlock(1000, &base, &size) != nullptr, "a block can be had");
    Expect(count.allocations == 1, "a block is the host's");
    PK_FreeTransientMemoryBlock(base, size);
    Expect(count.blocksGivenBack == 1, "a block is given back to the host");

    struct FourParts final : PK::Threading::Task {
        int32_t GetPartCount() const override { return 4; }
        void RunPart(int32_t) const override {}
    };
    PK::Threading::RunTaskOnAllProcessors(FourParts());
    Expect(count.tasks == 1 && count.parts == 4, "tasks run on the host's threads");

    const int32_t width = 40000; // rows that no stack has room for
    const std::vector<uint8_t> pixels(size_t{4} * width, 0x80);
    std::vector<uint8_t> samples(size_t{4} * width);
    Expect(PK_Convert(pixels.data(), 4 * width, PK_PixelFormat_BGRA_4444_8u, samples.data(), 4 * width,
                      PK_PixelFormat_V210_422_10u, width, 1, 1) == PK_Success,
           "a conversion succeeds");
    Expect(count.allocations > 1, "scratch is the host's");
    Expect(count.allocations == count.blocksGivenBack, "scratch is given back to the host");

    const host::Counts before = count;
    const auto blur = [&](int32_t side, int32_t rows) {
        PK_GaussianBlur(pixels.data(), 4 * side, side, rows, PK_PixelFormat_BGRA_4444_8u, samples.data(),
                        4 * side, side, rows, PK_PixelFormat_BGRA_4444_8u, 2, 2, false, false, 3, 4);
    };
    blur(33, 32);
    blur(32, 33);
    Expect(count.tasks == before.tasks,
           "an image that is not larger than 32 is blurred by the calling thread");
    blur(33, 33);
    Expect(count.tasks == before.tasks + 2, "rows and columns of a larger one are a task each");
    Expect(count.parts == before.parts + 4, "of bands of 32 rows, and of strips of 128 bytes");

    PK_Terminate();
    Expect(count.executorsLetGo == 1, "a stop lets the executor go");
    if (sFailures == 0) std::puts("the library runs on the host of the project that includes it");
    return sFailures == 0 ? 0 : 1;
}
