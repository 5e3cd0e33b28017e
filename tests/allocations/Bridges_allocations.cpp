// Bridges to codecs, and planes that are copied and reduced.

#include "allocations/Call.h"

#include <PixelKiln/PixelKiln.h>

#include <array>

namespace {

using namespace PKAllocations;

constexpr Memory kRows = TakesNone("goes from row to row of what it is given");
constexpr int32_t kV210Bytes = (kWidth + 5) / 6 * 16;
constexpr size_t kRoom = size_t{16} * kWidth * kHeight; // for any image here

std::vector<uint8_t> Rows(int32_t rowBytes, int32_t rows = kHeight) {
    return Content(static_cast<size_t>(rowBytes) * static_cast<size_t>(rows));
}

struct RowBridge {
    const char* name;
    decltype(&PK_ConvertRGB_444_8uToBGRA_4444_8u) convert;
    int32_t sourceRowBytes, destinationRowBytes;
};

constexpr RowBridge kRowBridges[] = {
    {"PK_ConvertRGB_444_8uToBGRA_4444_8u", PK_ConvertRGB_444_8uToBGRA_4444_8u, 3 * kWidth, 4 * kWidth},
    {"PK_ConvertUYVY_422_10uToV210_422_10u", PK_ConvertUYVY_422_10uToV210_422_10u, 4 * kWidth, kV210Bytes},
    {"PK_Convert_j2k_V210_To_10_Bits_Within_UYVY16u", PK_Convert_j2k_V210_To_10_Bits_Within_UYVY16u,
     kV210Bytes, 4 * kWidth},
    {"PK_Convert_j2k_BGR16u_To_RGB_444_10u", PK_Convert_j2k_BGR16u_To_RGB_444_10u, 6 * kWidth, 4 * kWidth},
    {"PK_Convert_j2k_RGB_444_10u_To_10_Bits_Within_BGR16u",
     PK_Convert_j2k_RGB_444_10u_To_10_Bits_Within_BGR16u, 4 * kWidth, 6 * kWidth},
};

void AddRowBridges(Calls& calls) {
    for (const RowBridge& bridge : kRowBridges)
        calls.push_back({{bridge.name},
                         kRows,
                         std::vector<uint8_t>(kRoom),
                         [bridge, source = Rows(bridge.sourceRowBytes)](uint8_t* block) {
                             return bridge.convert(source.data(), bridge.sourceRowBytes, block,
                                                   bridge.destinationRowBytes, kWidth, kHeight);
                         }});
    const std::vector<uint8_t> source = Rows(8 * kWidth), block(kRoom);
    calls.push_back({{"PK_Convert_DNxHD16u_To_RGB_444_10u"}, kRows, block, [source](uint8_t* to) {
                         return PK_Convert_DNxHD16u_To_RGB_444_10u(source.data(), to, kWidth, kHeight);
                     }});
    calls.push_back({{"PK_Convert_RGB_444_10u_To_DNxHD16u"}, kRows, block, [source](uint8_t* to) {
                         return PK_Convert_RGB_444_10u_To_DNxHD16u(source.data(), to, kWidth, kHeight);
                     }});
    calls.push_back({{"PK_ConvertRGB_444_16u_To_XRGB_4444_15u"}, kRows, block, [source](uint8_t* to) {
                         PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source.data(), to, kWidth, kHeight);
                         return PK_Success;
                     }});
}

void AddInPlaceBridges(Calls& calls) {
    calls.push_back(
        {{"PK_Convert_j2k_UYVY_422_32f_Offset_In_Place"}, kRows, Rows(8 * kWidth), [](uint8_t* block) {
             return PK_Convert_j2k_UYVY_422_32f_Offset_In_Place(block, 8 * kWidth, kWidth, kHeight);
         }});
    calls.push_back(
        {{"PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place"}, kRows, Rows(16 * kWidth), [](uint8_t* block) {
             return PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place(block, 16 * kWidth, kWidth, kHeight);
         }});
    calls.push_back({{"PK_Scale16uBufferTo15uSIMD"}, kRows, Rows(8 * kWidth), [](uint8_t* block) {
                         return PK_Scale16uBufferTo15uSIMD(block, 8 * kWidth, kWidth, kHeight, true);
                     }});
}

/// Three planes of any samples, twice as long as a row needs.
struct SourcePlanes {
    static constexpr int32_t kRowBytes[3] = {4 * kWidth, 4 * kWidth, 4 * kWidth};

    std::array<const void*, 3> Pointers() const { return {samples.data(), samples.data(), samples.data()}; }

    std::vector<uint8_t> samples = Rows(kRowBytes[0]);
};

struct PlanarBridge {
    const char* name;
    decltype(&PK_ConvertW210toV210) convert;
};

constexpr PlanarBridge kPlanarBridges[] = {
    {"PK_ConvertW210toV210", PK_ConvertW210toV210},
    {"PK_TempConvertW210toV210ToReplacePanasonicLTDebayering",
     PK_TempConvertW210toV210ToReplacePanasonicLTDebayering},
    {"PK_QuarterScaleConvertW210toV210", PK_QuarterScaleConvertW210toV210},
};

void AddPlanarBridges(Calls& calls) {
    const SourcePlanes planes;
    const std::vector<uint8_t> block(kRoom);
    for (const PlanarBridge& bridge : kPlanarBridges)
        calls.push_back({{bridge.name}, kRows, block, [=](uint8_t* to) {
                             return bridge.convert(planes.Pointers().data(), SourcePlanes::kRowBytes, kWidth,
                                                   kHeight, to, kV210Bytes);
                         }});
    calls.push_back({{"PK_ConvertW210toQuarterResVUYX_8u"}, kRows, block, [planes](uint8_t* to) {
                         return PK_ConvertW210toQuarterResVUYX_8u(planes.Pointers().data(),
                                                                  SourcePlanes::kRowBytes, kWidth, kHeight,
                                                                  to, 2 * kWidth, 2);
                     }});
}

void AddPlanes(Calls& calls) {
    const SourcePlanes planes;
    const std::vector<uint8_t> block(kRoom);
    constexpr int32_t kRowBytes[3] = {kWidth, kWidth, kWidth};
    const auto planesOf = [](uint8_t* to) {
        return std::array<void*, 3>{to, to + kRoom / 4, to + kRoom / 2};
    };
    calls.push_back({{"PK_CopyPlanar_8u"}, kRows, block, [=](uint8_t* to) {
                         return PK_CopyPlanar_8u(planes.Pointers().data(), SourcePlanes::kRowBytes,
                                                 planesOf(to).data(), kRowBytes, kWidth, kHeight);
                     }});
    calls.push_back({{"PK_QuarterScalePlanar420_8u"}, kRows, block, [=](uint8_t* to) {
                         return PK_QuarterScalePlanar420_8u(planes.Pointers().data(), SourcePlanes::kRowBytes,
                                                            planesOf(to).data(), kRowBytes, kWidth, kHeight,
                                                            2);
                     }});
    calls.push_back({{"PK_QuarterScalePlanar_8uAndConvertTo422_8u"}, kRows, block, [=](uint8_t* to) {
                         return PK_QuarterScalePlanar_8uAndConvertTo422_8u(
                             planes.Pointers().data(), SourcePlanes::kRowBytes, to, 2 * kWidth + 2, kWidth,
                             kHeight, true, 1);
                     }});
}

Call Decode(PK_PixelFormat to, Memory memory) {
    const auto bytes = static_cast<size_t>(PK_PixelFormatSize(to, kWidth, kHeight));
    return {{"PK::DecompressYUV_420_8u"},
            memory,
            std::vector<uint8_t>(bytes),
            [to, planes = SourcePlanes()](uint8_t* block) {
                return PK::DecompressYUV_420_8u(planes.Pointers().data(), SourcePlanes::kRowBytes, kWidth,
                                                kHeight, PK_PixelFormat_YUV_420_MPEG4_FRAME, block,
                                                PK_PixelFormatRowBytes(to, kWidth), kWidth, kHeight, to, 0,
                                                4);
            }};
}

void AddDecodings(Calls& calls) {
    calls.push_back(Decode(PK_PixelFormat_UYVY_422_8u, TakesNone("decodes rows where they belong")));
    calls.push_back(Decode(PK_PixelFormat_VUYP_4444_32f_709, TakesOrRefuses("rows between passes")));
}

template <int kMember>
Call SurfaceToPlanes(const std::vector<uint8_t>& block, int32_t width, int32_t height) {
    const size_t luma = static_cast<size_t>(width) * static_cast<size_t>(height);
    return {{"PK_ConvertNV12toYV12_SSE4<" + std::to_string(kMember) + ">"},
            TakesNone("has its scratch on the stack"),
            block,
            [=, surface = Content(3 * luma * (1 + kMember))](uint8_t* to) {
                void* const planes[3] = {to, to + luma, to + 2 * luma};
                const int32_t rowBytes[3] = {width, width, width};
                PK_ConvertNV12toYV12_SSE4<kMember>(surface.data(), width,
                                                   surface.data() + luma * (1 + kMember), width, planes,
                                                   rowBytes, width, height);
                return PK_Success;
            }};
}

void AddSurfaces(Calls& calls) {
    const std::vector<uint8_t> block(size_t{3} * kWidth * kHeight);
    calls.push_back(SurfaceToPlanes<0>(block, kWidth, kHeight));
    calls.push_back(SurfaceToPlanes<1>(block, kWidth / 40, 40 * kHeight)); // in bands
}

const Family sRowBridges(AddRowBridges), sInPlaceBridges(AddInPlaceBridges), sPlanarBridges(AddPlanarBridges),
    sPlanes(AddPlanes), sSurfaces(AddSurfaces);

} // namespace
