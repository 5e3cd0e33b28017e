// What colour spaces tell of themselves: chromaticities, transfer functions, matrices; and copies of objects, which
// must tell the same.

#include "results/Lines.h"
#include "results/Spaces.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <utility>

namespace {

using namespace PKResults;
using namespace PK;

void AddMatrix(Line& line, const CSMatrix& matrix) {
    line.results.AddBytes(matrix.m, sizeof matrix.m);
}

void AddDescription(Line& line, const ColorSpace& space) {
    line.results.AddBytes(space.Primaries(), 6 * sizeof(float));
    line.results.AddBytes(space.WhitePoint(), 2 * sizeof(float));
    line.results.AddBytes(space.LuminanceCoeffs(), 3 * sizeof(float));
    AddMatrix(line, space.RGBtoXYZ());
    AddMatrix(line, space.XYZtoRGB());
}

void AddTransfer(Line& line, const ColorSpace& space) {
    for (const float value :
         {0.0f, -0.0f, 1e-45f, 1e-30f, 0.0031308f, 0.04045f, 1.0f, 2.0f, 1e30f, HUGE_VALF, -0.3f, -7.0f}) {
        line.results.Add(space.LinearToEOTF(value));
        line.results.Add(space.EOTFToLinear(value));
    }
    for (int i = 0; i < 4000; ++i) {
        const float value = line.random.Between(-0.2f, 1.2f) * (i % 8 == 0 ? 90.0f : 1.0f);
        line.results.Add(space.LinearToEOTF(value));
        line.results.Add(space.EOTFToLinear(value));
    }
}

void AddSpace(Lines& lines, const NamedSpace& named) {
    lines.Add(named.name + "/description", [&](Line& line) { AddDescription(line, *named.space); });
    lines.Add(named.name + "/transfer", [&](Line& line) { AddTransfer(line, *named.space); });
    for (const NamedSpace& other : AllSpaces())
        lines.Add(named.name + "/matrix/" + other.name, [&](Line& line) {
            AddMatrix(line, ColorSpace::CalculateConversionMatrix(*named.space, *other.space));
        });
}

void AddIlluminants(Lines& lines) {
    for (uint32_t from = 0; from < 6; ++from)
        for (uint32_t to = 0; to < 6; ++to)
            lines.Add("adaptation/" + std::to_string(from) + "/" + std::to_string(to), [&](Line& line) {
                const float* whites[] = {ColorSpace::Illuminant(static_cast<PK_Illuminant>(from)),
                                         ColorSpace::Illuminant(static_cast<PK_Illuminant>(to))};
                for (const float* white : whites) line.results.AddBytes(white, 2 * sizeof(float));
                AddMatrix(line, ColorSpace::CalculateAdaptationMatrix(whites[0], whites[1]));
            });
}

void AddMatrices(Lines& lines) {
    lines.Add("matrix/identity", [](Line& line) { AddMatrix(line, {}); });
    lines.Add("matrix/arithmetic", [](Line& line) {
        for (int i = 0; i < 200; ++i) {
            CSMatrix a, b;
            for (float& x : a.m) x = line.random.Between(-2, 2);
            for (float& x : b.m) x = line.random.Between(-2, 2);
            bool ok = false;
            AddMatrix(line, a * b);
            AddMatrix(line, a.Transposed());
            AddMatrix(line, a.Inverted(&ok));
            AddMatrix(line, b.Inverted());
            line.results.Add(ok);
        }
    });
    lines.Add("matrix/singular", [](Line& line) {
        for (const float last : {9.0f, 9.0000005f, 9.000001f, 9.01f}) {
            CSMatrix matrix;
            const float numbers[] = {1, 2, 3, 4, 5, 6, 7, 8, last};
            std::copy(std::begin(numbers), std::end(numbers), matrix.m);
            bool ok = true;
            AddMatrix(line, matrix.Inverted(&ok));
            line.results.Add(ok);
        }
    });
}

/// A copy, what it was assigned and moved to, made before and after the object has calculated its matrices.
template <class Space>
void AddCopies(Lines& lines, const std::string& name, const Space& model, Space other) {
    lines.Add("copies/" + name, [&](Line& line) {
        const Space fresh(model);
        AddDescription(line, Space(fresh));
        AddDescription(line, fresh);
        Space copy(fresh);
        Space moved(std::move(copy));
        AddDescription(line, moved);
        other = fresh;
        AddDescription(line, other);
        other = std::move(moved);
        AddDescription(line, other);
        AddTransfer(line, other);
    });
}

void AddAllCopies(Lines& lines) {
    constexpr float primaries[] = {0.713f, 0.293f, 0.165f, 0.83f, 0.128f, 0.044f};
    AddCopies(lines, "srgb", SRGBColorSpace(), SRGBColorSpace());
    AddCopies(lines, "gamma", GammaColorSpace(0.37f), GammaColorSpace());
    AddCopies(lines, "rec709", Rec709ColorSpace(), Rec709ColorSpace());
    AddCopies(lines, "rec2020", Rec2020ColorSpace(), Rec2020ColorSpace());
    AddCopies(lines, "p3", DCIP3ColorSpace(kIlluminantDCI), DCIP3ColorSpace());
    AddCopies(lines, "hlg", HLGColorSpace(), HLGColorSpace());
    AddCopies(lines, "pq", PQColorSpace(true, true), PQColorSpace(false, false));
    AddCopies(lines, "pq-wide", PQColorSpace(std::data(primaries), false), PQColorSpace(true, true));
}

void AddNumbers(Lines& lines) {
    for (const NamedSpace& named : AllSpaces()) AddSpace(lines, named);
    AddIlluminants(lines);
    AddMatrices(lines);
    AddAllCopies(lines);
}

const Family sColourNumbers("colour-numbers", AddNumbers, Family::Choice::kProcessor);

} // namespace
