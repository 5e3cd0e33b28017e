// OpenColorIO's processor for the CPU, with its default optimisation, on the same pixels: channels in the order B, G, R,
// A, for which the matrices are turned round.

#include "operations/Operation.h"

#include <OpenColorIO/OpenColorIO.h>

#include <array>

namespace OperationBench {
namespace {

namespace OCIO = OCIO_NAMESPACE;

using Matrix = std::array<double, 9>;

constexpr Matrix kToRec2020 = {0.627404, 0.329283, 0.043313, 0.069097, 0.919541,
                               0.011362, 0.016391, 0.088013, 0.895595};
constexpr Matrix kFromRec2020 = {1.660491,  -0.587641, -0.072850, -0.124550, 1.132900,
                                 -0.008349, -0.018151, -0.100579, 1.118730};
constexpr Matrix kToP3 = {0.822462, 0.177538, 0, 0.033194, 0.966806, 0, 0.017083, 0.072397, 0.910520};
constexpr Matrix kFromP3 = {1.224940, -0.224940, 0, -0.042057, 1.042057, 0, -0.019638, -0.078636, 1.098274};

OCIO::ConstTransformRcPtr Power(double exponent) {
    const OCIO::ExponentTransformRcPtr transform = OCIO::ExponentTransform::Create();
    const double values[] = {exponent, exponent, exponent, 1};
    transform->setValue(values);
    transform->setNegativeStyle(OCIO::NEGATIVE_MIRROR);
    return transform;
}

OCIO::ConstTransformRcPtr Multiply(const Matrix& rgb) {
    double values[16] = {};
    for (int row = 0; row < 3; ++row)
        for (int column = 0; column < 3; ++column)
            values[4 * row + column] = rgb[static_cast<size_t>(3 * (2 - row) + 2 - column)];
    values[15] = 1;
    const OCIO::MatrixTransformRcPtr transform = OCIO::MatrixTransform::Create();
    transform->setMatrix(values);
    return transform;
}

template <bool kEncode>
OCIO::ConstTransformRcPtr PQCurve() {
    const OCIO::BuiltinTransformRcPtr transform = OCIO::BuiltinTransform::Create();
    transform->setStyle("CURVE - LINEAR_to_ST-2084");
    transform->setDirection(kEncode ? OCIO::TRANSFORM_DIR_FORWARD : OCIO::TRANSFORM_DIR_INVERSE);
    return transform;
}

Run Apply(const uint8_t* source, uint8_t* destination,
          std::initializer_list<OCIO::ConstTransformRcPtr> steps) {
    const OCIO::GroupTransformRcPtr group = OCIO::GroupTransform::Create();
    for (const auto& step : steps) group->appendTransform(step->createEditableCopy());
    const OCIO::ConstCPUProcessorRcPtr processor =
        OCIO::Config::CreateRaw()->getProcessor(group)->getDefaultCPUProcessor();
    return [=] {
        const OCIO::PackedImageDesc from(const_cast<uint8_t*>(source), kWidth, kHeight, 4);
        OCIO::PackedImageDesc to(destination, kWidth, kHeight, 4);
        processor->apply(from, to);
    };
}

template <const Matrix& kMatrix, int kInTenths, int kOutTenths>
Run Gamma(const uint8_t* source, uint8_t* destination) {
    return Apply(source, destination, {Power(kInTenths / 10.0), Multiply(kMatrix), Power(10.0 / kOutTenths)});
}

Run ToPQ(const uint8_t* source, uint8_t* destination) {
    return Apply(source, destination, {Power(2.4), Multiply(kToRec2020), PQCurve<true>()});
}

Run FromPQ(const uint8_t* source, uint8_t* destination) {
    return Apply(source, destination, {PQCurve<false>(), Multiply(kFromRec2020), Power(1 / 2.4)});
}

const AddPeers add = {
    {"Rec. 709 to Rec. 2020", "OpenColorIO", false, Gamma<kToRec2020, 24, 24>},
    {"Rec. 2020 to Rec. 709", "OpenColorIO", false, Gamma<kFromRec2020, 24, 24>},
    {"Rec. 709 to P3", "OpenColorIO", false, Gamma<kToP3, 24, 26>},
    {"P3 to Rec. 709", "OpenColorIO", false, Gamma<kFromP3, 26, 24>},
    {"Rec. 709 to PQ", "OpenColorIO", false, ToPQ},
    {"PQ to Rec. 709", "OpenColorIO", false, FromPQ},
};

} // namespace
} // namespace OperationBench
