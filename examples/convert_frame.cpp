// Converts a white HD frame to 10-bit 4:2:2 and prints its first word: U 512, Y 940 and V 512, 10 bits each.

#include <PixelKiln/PixelKiln.h>

#include <cstdio>
#include <vector>

int main() {
    PK_Initialize();
    const int32_t width = 1920, height = 1080, quality = 4;
    const PK_PixelFormat from = PK_PixelFormat_BGRA_4444_8u, to = PK_PixelFormat_V210_422_10u;
    const std::vector<uint8_t> picture(PK_PixelFormatSize(from, width, height), 0xff);
    std::vector<uint32_t> frame(PK_PixelFormatSize(to, width, height) / 4);
    const PK_Result result =
        PK_Convert(picture.data(), PK_PixelFormatRowBytes(from, width), from, frame.data(),
                   PK_PixelFormatRowBytes(to, width), to, width, height, quality);
    std::printf("result %d, first word 0x%08x\n", result, frame[0]); // result 0, first word 0x200eb200
    PK_Terminate();
    return result == PK_Success ? 0 : 1;
}
