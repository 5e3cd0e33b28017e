// Colour spaces: objects that answer for the first time, so that all they calculate and keep is made in the call.

#include "allocations/Call.h"

#include <PixelKiln/ColorSpace.h>

#include <cstring>
#include <span>
#include <type_traits>

namespace {

using namespace PKAllocations;
using namespace PK;

constexpr Memory kObjects = TakesNone("keeps what it calculates in the object");
constexpr Memory kNumbers = TakesNone("gives numbers");
constexpr int32_t kPixels = 1021;
constexpr size_t kRowFloats = size_t{4} * kPixels;
constexpr size_t kBlockBytes = 10 * kRowFloats * sizeof(float);

std::vector<float> SourceRow() {
    std::vector<float> row(kRowFloats);
    for (size_t i = 0; i < row.size(); ++i) row[i] = static_cast<float>(i % 997) / 900 - 0.05f;
    return row;
}

/// Writes answers one behind the other.
class Answers {
public:
    explicit Answers(uint8_t* block) : fNext(block) {}

    void Put(const void* bytes, size_t size) {
        std::memcpy(fNext, bytes, size);
        fNext += size;
    }
    void Put(const CSMatrix& matrix) { Put(matrix.m, sizeof matrix.m); }
    void Put(float value) { Put(&value, sizeof value); }

    /// A row that the caller of this fills.
    float* Row() {
        auto* row = reinterpret_cast<float*>(fNext);
        fNext += kRowFloats * sizeof(float);
        return row;
    }

private:
    uint8_t* fNext;
};

void AskAll(const ColorSpace& space, const float* source, Answers& answers) {
    for (const bool clip : {false, true}) {
        space.ConvertPixelsFromRec709(source, answers.Row(), kPixels, clip);
        space.ConvertPixelsToRec709(source, answers.Row(), kPixels, clip);
    }
    space.CompressPixelsToSDR(source, answers.Row(), kPixels, 1, 1.2f, 0.7f);
    answers.Put(space.Primaries(), 6 * sizeof(float));
    answers.Put(space.WhitePoint(), 2 * sizeof(float));
    answers.Put(space.LuminanceCoeffs(), 3 * sizeof(float));
    answers.Put(space.LinearToEOTF(0.3f));
    answers.Put(space.EOTFToLinear(0.7f));
    answers.Put(space.RGBtoXYZ());
    answers.Put(space.XYZtoRGB());
}

/// What a class inherits is exported under the name of the class that it is of.
template <class Space, class Owner, class Result, class... Arguments>
constexpr bool IsOwn(Result (Owner::*)(Arguments...) const) {
    return std::is_same_v<Space, Owner>;
}

template <class Space>
Names NamesOf(const std::string& name) {
    const std::string prefix = "PK::" + name + "::";
    Names names = {prefix + name, prefix + "operator="};
    const auto add = [&](bool isOwn, const char* function) {
        if (isOwn) names.push_back(prefix + function);
    };
    add(IsOwn<Space>(&Space::Primaries), "Primaries");
    add(IsOwn<Space>(&Space::WhitePoint), "WhitePoint");
    add(IsOwn<Space>(&Space::LuminanceCoeffs), "LuminanceCoeffs");
    add(IsOwn<Space>(&Space::LinearToEOTF), "LinearToEOTF");
    add(IsOwn<Space>(&Space::EOTFToLinear), "EOTFToLinear");
    add(IsOwn<Space>(&Space::ConvertPixelsFromRec709), "ConvertPixelsFromRec709");
    add(IsOwn<Space>(&Space::ConvertPixelsToRec709), "ConvertPixelsToRec709");
    add(IsOwn<Space>(&Space::CompressPixelsToSDR), "CompressPixelsToSDR");
    return names;
}

template <class Space, class... Arguments>
void AddSpace(Calls& calls, const char* name, Arguments... arguments) {
    calls.push_back({NamesOf<Space>(name), kObjects, std::vector<uint8_t>(kBlockBytes),
                     [=, source = SourceRow()](uint8_t* block) {
                         const Space space(arguments...);
                         const Space copy(space);
                         Space assigned(arguments...);
                         assigned = copy;
                         Answers answers(block);
                         AskAll(assigned, source.data(), answers);
                         return PK_Success;
                     }});
}

constexpr float kPrimaries[6] = {0.713f, 0.293f, 0.165f, 0.83f, 0.128f, 0.044f};

void AddSpaces(Calls& calls) {
    AddSpace<SRGBColorSpace>(calls, "SRGBColorSpace");
    AddSpace<GammaColorSpace>(calls, "GammaColorSpace", 0.5f);
    AddSpace<Rec709ColorSpace>(calls, "Rec709ColorSpace");
    AddSpace<Rec2020ColorSpace>(calls, "Rec2020ColorSpace");
    AddSpace<DCIP3ColorSpace>(calls, "DCIP3ColorSpace", kIlluminantD60);
    AddSpace<HLGColorSpace>(calls, "HLGColorSpace");
    for (const bool normalized : {false, true}) {
        AddSpace<PQColorSpace>(calls, "PQColorSpace", true, normalized);
        AddSpace<PQColorSpace>(calls, "PQColorSpace", std::data(kPrimaries), normalized);
    }
}

void AddShared(Calls& calls) {
    calls.push_back({{"PK::ColorSpace::ColorSpace", "PK::ColorSpace::operator=",
                      "PK::ColorSpace::WorkingSpace", "PK::ColorSpace::RGBtoXYZ", "PK::ColorSpace::XYZtoRGB",
                      "PK::ColorSpace::CalculateMatrices", "PK::ColorSpace::CalculateLumaCoeffs"},
                     TakesNone("the shared objects are static"),
                     std::vector<uint8_t>(7 * kBlockBytes),
                     [source = SourceRow()](uint8_t* block) {
                         for (uint32_t which = 0; which < 7; ++which) {
                             Answers answers(block + which * kBlockBytes);
                             AskAll(ColorSpace::WorkingSpace(static_cast<PK_WorkingSpace>(which)),
                                    source.data(), answers);
                         }
                         return PK_Success;
                     }});
    calls.push_back({{"PK::Rec2020ColorSpace::ConvertPixelsFromYUVtoRGB",
                      "PK::Rec2020ColorSpace::ConvertPixelsFromRGBtoYUV", "PK::ClampFloatPixels"},
                     TakesNone("goes from pixel to pixel"),
                     std::vector<uint8_t>(kBlockBytes),
                     [source = SourceRow()](uint8_t* block) {
                         const Rec2020ColorSpace space;
                         Answers answers(block);
                         space.ConvertPixelsFromYUVtoRGB(source.data(), answers.Row(), kPixels);
                         space.ConvertPixelsFromRGBtoYUV(source.data(), answers.Row(), kPixels);
                         ClampFloatPixels(source.data(), answers.Row(), 1, kRowFloats * sizeof(float), 0, 1);
                         return PK_Success;
                     }});
}

void AddMatrices(Calls& calls) {
    calls.push_back(
        {{"PK::CSMatrix::CSMatrix", "PK::CSMatrix::operator*", "PK::CSMatrix::Transposed",
          "PK::CSMatrix::Inverted", "PK::ColorSpace::Illuminant", "PK::ColorSpace::CalculateConversionMatrix",
          "PK::ColorSpace::CalculateAdaptationMatrix"},
         kNumbers,
         std::vector<uint8_t>(kBlockBytes),
         [](uint8_t* block) {
             const CSMatrix conversion =
                 ColorSpace::CalculateConversionMatrix(Rec709ColorSpace(), Rec2020ColorSpace());
             const CSMatrix adaptation = ColorSpace::CalculateAdaptationMatrix(
                 ColorSpace::Illuminant(kIlluminantD50), ColorSpace::Illuminant(kIlluminantD65));
             bool isRegular = false;
             Answers answers(block);
             answers.Put(CSMatrix());
             answers.Put((conversion * adaptation).Transposed().Inverted(&isRegular));
             return isRegular ? PK_Success : PK_ErrFailed;
         }});
}

const Family sSpaces(AddSpaces), sShared(AddShared), sMatrices(AddMatrices);

} // namespace
