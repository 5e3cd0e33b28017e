// Pixel buffers and blocks, without their addresses; planes and rectangles as offsets; copies and flips.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"

#include <PixelKiln/Buffers.h>

#include <algorithm>
#include <limits>

namespace {

using namespace PKResults;

constexpr int32_t kLargest = std::numeric_limits<int32_t>::max();

/// How far a pointer lies from another: addresses themselves are no result.
void AddOffset(Line& line, const void* from, const void* to) {
    line.results.Add(reinterpret_cast<uintptr_t>(to) - reinterpret_cast<uintptr_t>(from));
}

/// The size that is allocated goes by rand(), and what lies in the memory is undefined.
void AddAllocation(Line& line, PK_Result result, const void* base, const void* first, uint64_t wanted,
                   uint64_t size) {
    line.results.Add(result);
    line.results.Add(base != nullptr);
    line.results.Add(first != nullptr);
    line.results.Add(reinterpret_cast<uintptr_t>(first) % 16);
    line.results.Add(size >= wanted);
    line.results.Add(size == 0);
}

struct Allocator {
    const char* name;
    decltype(&PK_AllocatePixelBuffer) allocate;
    decltype(&PK_FreePixelBuffer) free;

    void Use(Line& line, PK_PixelFormat format, Nulls nulls, int32_t width, int32_t height) const {
        char place = 0;
        void *base = &place, *pixels = &place;
        int32_t rowBytes = 77;
        uint64_t size = 77;
        const PK_Result result = allocate(format, width, height, nulls(0, &base), nulls(1, &pixels),
                                          nulls(2, &rowBytes), nulls(3, &size));
        const auto wanted = static_cast<uint64_t>(PK_PixelFormatSize(format, width, height));
        if (base == &place) base = nullptr; // was not given
        if (pixels == &place) pixels = nullptr;
        AddAllocation(line, result, base, pixels, result == PK_Success ? wanted : 0, size);
        line.results.Add(rowBytes);
        line.results.Add(free(format, base, size));
    }
};

constexpr Allocator kAllocators[] = {
    {"pixels", PK_AllocatePixelBuffer, PK_FreePixelBuffer},
    {"transient-pixels", PK_AllocateTransientPixelBuffer, PK_FreeTransientPixelBuffer}};

void AddPixelBuffers(Lines& lines, const Allocator& allocator) {
    const std::string name = allocator.name;
    const auto add = [&](PK_PixelFormat format) {
        lines.Add(name + "/" + NameOf(format), [&](Line& line) {
            for (const int32_t width : {0, 1, 45, 720}) allocator.Use(line, format, Nulls::None(), width, 13);
            for (const int32_t width : {200000000, kLargest})
                if (format >> 24 == 0) allocator.Use(line, format, Nulls::None(), width, 100);
        });
    };
    std::ranges::for_each(kRasters, add);
    std::ranges::for_each(kStreams, add);
    std::ranges::for_each(kStrangers, add);
    AddOddCalls(lines, name, 4, [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        allocator.Use(line, PK_PixelFormat_BGRA_4444_8u, nulls, width, height);
    });
}

void AddBlocks(Lines& lines) {
    lines.Add("block", [](Line& line) {
        for (const uint64_t size : {uint64_t{0}, uint64_t{1}, uint64_t{100}, uint64_t{1000000}, ~uint64_t{0}})
            for (int which = 0; which < 3; ++which) {
                const Nulls nulls = Nulls::Only(which); // of which the third is none of these
                void* base = nullptr;
                uint64_t allocated = 0;
                const void* first =
                    PK_AllocateTransientMemoryBlock(size, nulls(0, &base), nulls(1, &allocated));
                AddAllocation(line, PK_Success, base, first, first == nullptr ? 0 : size, allocated);
                PK_FreeTransientMemoryBlock(base, allocated);
            }
    });
}

void FindPlanes(Line& line, Nulls nulls, int32_t width, int32_t height) {
    uint8_t block[1];
    void* planes[3] = {block, block, block};
    int32_t rowBytes[3] = {77, 77, 77};
    uint8_t* const first = nulls(0, &block[0]);
    line.results.Add(PK_GetPlanarBuffers(first, PK_PixelFormat_YUV_420_MPEG2_FIELD, width, height,
                                         nulls(1, planes), nulls(2, rowBytes)));
    for (size_t i = 0; i < 3; ++i) {
        AddOffset(line, planes[i] == block ? block : first, planes[i]);
        line.results.Add(rowBytes[i]);
    }
}

void AddPlanes(Lines& lines) {
    lines.Add("planes", [](Line& line) {
        for (const int32_t width : {0, 1, 2, 127, 128, 129, 720, 1921, 100000, kLargest})
            for (const int32_t height : {0, 1, 31, 32, 33, 480, 1081, 60000, kLargest})
                FindPlanes(line, Nulls::None(), width, height);
    });
    AddOddCalls(lines, "planes", 3, FindPlanes);
}

void AddRectangles(Lines& lines) {
    const auto clip = [](Line& line, PK_PixelFormat format, Nulls nulls, int32_t rowBytes, int32_t left,
                         int32_t top) {
        uint8_t image[1];
        void* clipped = image;
        line.results.Add(PK_ClipBufferToRect(nulls(0, &image[0]), rowBytes, 100, 100, format, left, top,
                                             nulls(1, &clipped)));
        AddOffset(line, clipped == image ? image : nulls(0, &image[0]), clipped);
    };
    const auto add = [&](PK_PixelFormat format) {
        lines.Add("rectangle/" + NameOf(format), [&](Line& line) {
            for (const int32_t rowBytes : {400, -400, 1613, 0})
                for (const int32_t left : {0, 1, 17, -3, 100000})
                    for (const int32_t top : {0, 1, 9, -2, 70000})
                        clip(line, format, Nulls::None(), rowBytes, left, top);
        });
    };
    std::ranges::for_each(kRasters, add);
    std::ranges::for_each(kStreams, add);
    std::ranges::for_each(kStrangers, add);
    for (const int which : {0, 1})
        lines.Add("rectangle/odd/null-" + std::to_string(which), [&](Line& line) {
            clip(line, PK_PixelFormat_BGRA_4444_8u, Nulls::Only(which), 400, 3, 2);
        });
}

void AddCopies(Lines& lines) {
    const auto copy = [](Line& line, size_t bytes, Nulls nulls, size_t told) {
        Image source(bytes, 1, kSpread, line.random), destination(bytes, 1, {5, 0, false}, line.random);
        line.results.Add(PK_CopyMemory(nulls(0, destination.First()), nulls(1, source.First()), told));
        destination.AddTo(line.results);
    };
    for (const size_t bytes : {size_t{0}, size_t{1}, size_t{63}, size_t{64}, size_t{4097}, size_t{524287},
                               size_t{524288}, size_t{1000003}})
        lines.Add("copy/" + std::to_string(bytes),
                  [&](Line& line) { copy(line, bytes, Nulls::None(), bytes); });
    for (const uint64_t told : {uint64_t{0}, uint64_t{9}})
        for (const int which : {0, 1})
            lines.Add("copy/odd/null-" + std::to_string(which) + "/" + std::to_string(told),
                      [&](Line& line) { copy(line, 9, Nulls::Only(which), told); });
}

struct Shape {
    int32_t width, height;
    Walk walk;
};

void Flip(Line& line, PK_PixelFormat format, const Shape& shape) {
    Image image(size_t{16} * static_cast<size_t>(shape.width), shape.height, shape.walk, line.random);
    line.results.Add(PK_FlipInPlace(image.First(), image.Step(), shape.width, shape.height, format));
    image.AddTo(line.results);
}

void AddFlips(Lines& lines) {
    constexpr Shape shapes[] = {{1, 2, kTight},    {5, 1, kTight},    {7, 3, kSpread},
                                {33, 6, kUpwards}, {101, 5, kSpread}, {0, 4, kTight}};
    const auto add = [&](PK_PixelFormat format) {
        lines.Add("flip/" + NameOf(format), [&](Line& line) {
            for (const Shape& shape : shapes) Flip(line, format, shape);
        });
    };
    std::ranges::for_each(kRasters, add);
    std::ranges::for_each(kStreams, add);
    std::ranges::for_each(kStrangers, add);
    lines.Add("flip/wide", [](Line& line) { // with scratch that is not the stack's
        Flip(line, PK_PixelFormat_BGRA_4444_32f, {17001, 3, kTight});
    });
    AddOddCalls(lines, "flip", 1, [](Line& line, Nulls nulls, int32_t width, int32_t height) {
        constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
        Image image(kFormat, kOddWidth, kOddHeight, kTight, line.random);
        line.results.Add(PK_FlipInPlace(nulls(0, image.First()), image.Step(), width, height, kFormat));
        image.AddTo(line.results);
    });
}

void AddBuffers(Lines& lines) {
    for (const Allocator& allocator : kAllocators) AddPixelBuffers(lines, allocator);
    AddBlocks(lines);
    AddPlanes(lines);
    AddRectangles(lines);
    AddCopies(lines);
    AddFlips(lines);
}

const Family sBuffers("buffers", AddBuffers);

} // namespace
