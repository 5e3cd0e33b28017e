#include "ColourSpaces.h"

#include "Failure.h"
#include "Numbers.h"
#include "Terminal.h"

#include <algorithm>
#include <cctype>
#include <cmath>
#include <functional>

namespace tool {
namespace {

using Shared = std::shared_ptr<const PK::ColorSpace>;

Space WithSRGBPrimaries(Shared conversion) {
    return {{}, std::move(conversion), true, true, true, ToneRangeOutput::Encoded};
}

Space Hub(Shared conversion) {
    return {{}, std::move(conversion), true, false, false, ToneRangeOutput::Encoded};
}

Space PowerLaw(float gamma) {
    return {{}, std::make_shared<PK::GammaColorSpace>(gamma), true, false, false, ToneRangeOutput::None};
}

Space WideGamut(Shared conversion) {
    return {{}, std::move(conversion), false, true, true, ToneRangeOutput::Linear};
}

Space P3(PK::PK_Illuminant white) {
    return WideGamut(std::make_shared<PK::DCIP3ColorSpace>(white));
}

Space PQ(bool useP3, bool normalised) {
    const auto conversion = std::make_shared<PK::PQColorSpace>(useP3, normalised);
    return {{}, conversion, false, false, true, ToneRangeOutput::None};
}

Space HLG() {
    return {{}, std::make_shared<PK::HLGColorSpace>(), false, false, false, ToneRangeOutput::None};
}

struct NamedSpace {
    const char* name;
    std::function<Space()> make;
};

const std::vector<NamedSpace>& NamedSpaces() {
    static const std::vector<NamedSpace> spaces = {
        {"srgb", [] { return WithSRGBPrimaries(std::make_shared<PK::SRGBColorSpace>()); }},
        {"rec709", [] { return Hub(std::make_shared<PK::Rec709ColorSpace>()); }},
        {"rec2020", [] { return WideGamut(std::make_shared<PK::Rec2020ColorSpace>()); }},
        {"p3", [] { return P3(PK::kIlluminantD65); }},
        {"p3-d60", [] { return P3(PK::kIlluminantD60); }},
        {"p3-dci", [] { return P3(PK::kIlluminantDCI); }},
        {"pq", [] { return PQ(false, false); }},
        {"pq-p3", [] { return PQ(true, false); }},
        {"pq-normalised", [] { return PQ(false, true); }},
        {"pq-p3-normalised", [] { return PQ(true, true); }},
        {"hlg", HLG},
    };
    return spaces;
}

constexpr const char* kAlias = "p3-d65"; // what p3 is short for
constexpr const char* kGammaPrefix = "gamma:";

std::string LowerCase(std::string text) {
    for (char& c : text) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return text;
}

float ParseGamma(const std::string& name, const std::string& text) {
    const char* next = text.c_str();
    const auto gamma = static_cast<float>(ParseNumber(next));
    if (*next == '\0' && std::isfinite(gamma) && gamma > 0) return gamma;
    throw Failure(kExitUsage,
                  "'" + name + "' needs an exponent above 0 from linear to encoded, such as gamma:0.45");
}

} // namespace

Space ParseSpace(const std::string& text) {
    const std::string name = LowerCase(text);
    Space space;
    if (name.starts_with(kGammaPrefix)) {
        space = PowerLaw(ParseGamma(text, name.substr(std::string(kGammaPrefix).size())));
    } else {
        const auto& spaces = NamedSpaces();
        const auto found = std::ranges::find(spaces, name == kAlias ? "p3" : name, &NamedSpace::name);
        if (found == spaces.end())
            throw Failure(kExitUsage, "'" + text + "' is no colour space; there are " + SpaceNames());
        space = found->make();
    }
    space.name = name;
    return space;
}

std::string SpaceNames() {
    std::vector<std::string> names;
    for (const NamedSpace& space : NamedSpaces()) names.emplace_back(space.name);
    names.emplace_back("gamma:0.45");
    return Join(names, ", ");
}

} // namespace tool
