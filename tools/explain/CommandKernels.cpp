// pixelkiln kernels: the register of kernels.

#include "Command.h"
#include "Formats.h"
#include "SharedWords.h"
#include "Terminal.h"
#include "explain/TargetNames.h"
#include "register/KernelRegister.h"

namespace tool {
namespace {

const char* ShapeText(PK::Shape shape) {
    switch (shape) {
    case PK::Shape::Row:
        return "row";
    case PK::Shape::RowWithConstants:
        return "row, constants";
    case PK::Shape::TwoRows:
        return "two rows";
    case PK::Shape::TwoRowsWithConstants:
        return "two rows, constants";
    case PK::Shape::SeveralRows:
        return "several rows";
    case PK::Shape::Area:
        break;
    }
    return "area";
}

const char* SampleText(PK::Samples samples) {
    switch (samples) {
    case PK::Samples::Bits:
        return "bits";
    case PK::Samples::Bytes:
        return "u8";
    case PK::Samples::Words:
        return "u16";
    case PK::Samples::SignedWords:
        return "s16";
    case PK::Samples::Integers:
        return "s32";
    case PK::Samples::Floats:
        break;
    }
    return "f32";
}

int SampleBytes(PK::Samples samples) {
    switch (samples) {
    case PK::Samples::Bits:
    case PK::Samples::Bytes:
        return 1;
    case PK::Samples::Words:
    case PK::Samples::SignedWords:
        return 2;
    default:
        return 4;
    }
}

/// The format, or samples of an element such as "4 x u16".
std::string OperandText(const PK::Operand& operand) {
    if (operand.bytes == 0) return "-";
    if (operand.format != PK_PixelFormat_Invalid) return FormatName(operand.format);
    return std::to_string(operand.bytes / SampleBytes(operand.samples)) + " x " + SampleText(operand.samples);
}

std::string AgreementText(PK::Agreement agreement) {
    if (agreement.kind == PK::Agreement::Exact) return "exact";
    return std::string("declared from ") + PK::TargetName(agreement.from);
}

void Run(const ListOptions& options) {
    Table table({"family", "kernel", "shape", "from", "to", "agreement", "chosen", "bodies"});
    for (const PK::KernelRow& row : PK::KernelRegister()) {
        const auto bodies =
            TargetNames(row.offer, [&](PK::Target target) { return row.body(target) != nullptr; });
        const auto enabled = TargetNames(row.offer, [&](PK::Target target) {
            return row.body(target) != nullptr && PK::IsEnabled(target, row.offer);
        });
        table.Add({row.family, row.name, ShapeText(row.shape), OperandText(row.operands.source),
                   OperandText(row.operands.destination), AgreementText(row.agreement),
                   enabled.empty() ? "none" : enabled.back(), bodies.empty() ? "none" : Join(bodies, " ")});
    }
    Print(options.csv ? table.CSV() : table.Aligned());
}

const Command sKernels(Group::Listings, "kernels", "List the kernels and the bodies chosen here", AddListing,
                       Run);

} // namespace
} // namespace tool
