// Takes a highlight of 400 cd/m2 from PQ to standard video, clipped and with its tone range compressed.

#include <PixelKiln/ColorSpace.h>

#include <cstdio>

int main() {
    const PK::PQColorSpace pq(/*useP3=*/false, /*normalized=*/false);
    const PK::ColorSpace& rec709 = PK::ColorSpace::WorkingSpace(PK::kWorkingSpaceRec709);
    const float linear = 4; // 1 is 100 cd/m2
    const float signal = pq.LinearToEOTF(linear);
    const float picture[4] = {signal, signal, signal, 1}; // B, G, R, A
    float hub[4];
    float compressed[4];
    pq.ConvertPixelsToRec709(picture, hub, 1, /*gamutClip=*/false);
    rec709.CompressPixelsToSDR(hub, compressed, 1, /*exposure=*/10, /*slope=*/1.5F, /*knee=*/0.7F);
    std::printf("PQ %.3f, Rec. 709 %.3f, compressed %.3f\n", static_cast<double>(signal),
                static_cast<double>(hub[1]),
                static_cast<double>(compressed[1])); // PQ 0.653, Rec. 709 1.781, compressed 0.979
    return 0;
}
