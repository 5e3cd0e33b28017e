#include "support/BodiesRun.h"

#include "register/KernelRegister.h"
#include "support/Targets.h"

#include <PixelKiln/PixelFormat.h>

#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <set>

namespace PKTest {
namespace {

using namespace PK;

std::string Words(const KernelRow& kernel, Target target) {
    return Describe(kernel) + ", " + TargetName(target);
}

std::set<std::string>& Run() {
    static std::set<std::string> bodies;
    return bodies;
}

class BodiesFile : public testing::Environment {
public:
    void TearDown() override {
        const char* name = std::getenv("PIXELKILN_BODIES_RUN");
        if (name == nullptr) return;
        std::ofstream file(name, std::ios::app);
        for (const Offer offer : {Offer::flags, Offer::processor})
            for (const Target target : TargetsOf(offer))
                Tell(file, target == TargetsOfThisProcessor(offer).back(),
                     std::string(offer == Offer::flags ? "exported calls" : "colour spaces") + ", " +
                         TargetName(target));
        for (const KernelRow& kernel : KernelRegister())
            for (const Target target : TargetsOf(kernel.offer))
                if (kernel.body(target))
                    Tell(file, Run().contains(Words(kernel, target)), Words(kernel, target));
        EXPECT_TRUE(file.flush()) << name;
    }

private:
    static void Tell(std::ofstream& file, bool ran, const std::string& what) {
        file << (ran ? "ran\t" : "not run\t") << what << '\n';
    }
};

const testing::Environment* const sBodiesFile = testing::AddGlobalTestEnvironment(new BodiesFile);

std::string FormatName(PK_PixelFormat format) {
    return format == PK_PixelFormat_RGB_444_10u ? "RGB_444_10u" : PK_PixelFormatName(format);
}

} // namespace

void NoteBodyRun(const KernelRow& kernel, Target target) {
    Run().insert(Words(kernel, target));
}

std::string Describe(const KernelRow& kernel) {
    std::string text = std::string(kernel.family) + " " + kernel.name;
    const Operands& operands = kernel.operands;
    if (operands.source.format != PK_PixelFormat_Invalid)
        text += " from " + FormatName(operands.source.format);
    if (operands.destination.format != PK_PixelFormat_Invalid)
        text += " to " + FormatName(operands.destination.format);
    return text;
}

} // namespace PKTest
