#include "results/Spaces.h"

namespace PKResults {

namespace {

using namespace PK;

// Wide primaries; and three on a line, which have no matrix.
constexpr float kWide[] = {0.713f, 0.293f, 0.165f, 0.83f, 0.128f, 0.044f, 0.32168f, 0.33767f, 0};
constexpr float kFlat[] = {0.1f, 0.1f, 0.2f, 0.2f, 0.3f, 0.3f, 0.31271f, 0.32902f, 0};

struct Spaces {
    SRGBColorSpace srgb;
    GammaColorSpace gamma, steep{2.2f}, flat{1};
    Rec709ColorSpace rec709;
    Rec2020ColorSpace rec2020;
    HLGColorSpace hlg;
    DCIP3ColorSpace p3[6] = {kIlluminantD50, kIlluminantD55, kIlluminantD60,
                             kIlluminantDCI, kIlluminantD65, kIlluminantD75};
    PQColorSpace pq{false, false}, pqNormalised{false, true}, pqP3{true, false}, pqP3Normalised{true, true};
    PQColorSpace pqWide{std::data(kWide), false}, pqWideNormalised{std::data(kWide), true};
    OwnSpace wide{std::data(kWide)}, line{std::data(kFlat)};
};

std::vector<NamedSpace> Name(const Spaces& spaces) {
    std::vector<NamedSpace> named = {{"srgb", &spaces.srgb},
                                     {"gamma", &spaces.gamma},
                                     {"gamma-2.2", &spaces.steep},
                                     {"gamma-1", &spaces.flat},
                                     {"rec709", &spaces.rec709},
                                     {"rec2020", &spaces.rec2020},
                                     {"hlg", &spaces.hlg},
                                     {"pq", &spaces.pq},
                                     {"pq-normalised", &spaces.pqNormalised},
                                     {"pq-p3", &spaces.pqP3},
                                     {"pq-p3-normalised", &spaces.pqP3Normalised},
                                     {"pq-wide", &spaces.pqWide},
                                     {"pq-wide-normalised", &spaces.pqWideNormalised},
                                     {"own-wide", &spaces.wide},
                                     {"own-flat", &spaces.line}};
    for (const DCIP3ColorSpace& p3 : spaces.p3)
        named.push_back({"p3-" + std::to_string(&p3 - spaces.p3), &p3});
    for (uint32_t which = 0; which < 8; ++which)
        named.push_back({"shared-" + std::to_string(which),
                         &ColorSpace::WorkingSpace(static_cast<PK_WorkingSpace>(which))});
    return named;
}

} // namespace

const std::vector<NamedSpace>& AllSpaces() {
    static const Spaces spaces;
    static const std::vector<NamedSpace> named = Name(spaces);
    return named;
}

} // namespace PKResults
