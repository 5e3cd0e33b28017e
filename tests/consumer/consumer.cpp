// White in BGRA is V 128, U 128, Y 235 in VUYA: told by a program that knows only the installed package.

#include <PixelKiln/PixelKiln.h>

#include <cstdio>
#include <cstring>

int main() {
    PK_Initialize();
    const uint8_t white[4] = {255, 255, 255, 255};
    uint8_t converted[4] = {};
    const PK_Result result =
        PK_Convert(white, 4, PK_PixelFormat_BGRA_4444_8u, converted, 4, PK_PixelFormat_VUYA_4444_8u, 1, 1, 4);
    PK_Terminate();
    const uint8_t expected[4] = {128, 128, 235, 255};
    if (result != PK_Success || std::memcmp(converted, expected, 4) != 0) {
        std::printf("result %d: V %u U %u Y %u A %u\n", static_cast<int>(result), converted[0], converted[1],
                    converted[2], converted[3]);
        return 1;
    }
    std::puts("the installed package converts");
    return 0;
}
