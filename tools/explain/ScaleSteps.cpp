#include "ScaleSteps.h"

#include "Numbers.h"
#include "Terminal.h"

#include "primitives/Dispatch.h"
#include "scale/HalfSize.h"
#include "scale/MotionPlan.h"

namespace tool {
namespace {

using PK::ScaleCall;
using PK::ScaleImage;
using PK::ScaleRoute;

class Steps {
public:
    explicit Steps(const ScaleCall& call) { Walk(call); }

    std::vector<ScaleStep> Take() { return std::move(fSteps); }

private:
    void Add(const std::string& what, const ScaleImage& leaves) {
        fSteps.push_back({PK::NameOf(fRoute), what, leaves});
    }

    void Walk(const ScaleCall& call) {
        fRoute = PK::ChooseScaleRoute(call);
        const ScaleImage& to = call.destination;
        switch (fRoute) {
        case ScaleRoute::Conversion:
            return Add("PK_Convert", to);
        case ScaleRoute::HalfSize:
            return AddHalving(call);
        case ScaleRoute::FieldOfPlanes:
            return Add("copy every second line", to);
        case ScaleRoute::OneField: {
            const ScaleCall rest = PK::AfterOneField(call);
            const bool isSecond = PK::FieldBeginsAtSecondRow(call.source.format, call.source.field);
            Add(isSecond ? "rows 1, 3, ... in memory" : "rows 0, 2, ... in memory", rest.source);
            return Walk(rest);
        }
        case ScaleRoute::StraightDecoding:
            return Add("decode", to);
        case ScaleRoute::Decoding: {
            const ScaleCall rest = PK::AfterDecoding(call, PK::DecodeTargetOf(call));
            if (PK::IsStream(rest.source.format)) return Add("refused: there is no decoder", call.source);
            Add("decode", rest.source);
            return Walk(rest);
        }
        case ScaleRoute::Motion:
            return AddMotion(call);
        }
    }

    void AddHalving(const ScaleCall& call) {
        const PK::Halving halving = PK::HalvingOf(call.source.format);
        const int32_t last = call.source.height - (call.source.field == 1 ? 2 : 1);
        ScaleImage halved = call.destination;
        halved.format = halving.format;
        Add(std::string(halving.kernelName) + " from row " + std::to_string(last) + " up, body " +
                PK::TargetName(PK::BestTarget()),
            halved);
        if (halved.format != call.destination.format) Add("convert rows", call.destination);
    }

    void AddMotion(const ScaleCall& call) {
        const PK::MotionPlan plan = PK::PlanMotion(call);
        ScaleImage source = call.source;
        source.format = plan.format;
        if (plan.convertsSource) Add("PK_Convert", source);
        if (plan.takesField) {
            const bool isSecond = source.field == 1;
            source = PK::AfterOneField(call).source;
            source.format = plan.format;
            Add(isSecond ? "rows 1, 3, ... in memory" : "rows 0, 2, ... in memory", source);
        }
        ScaleImage placed = call.destination;
        if (plan.rendersToBuffer) placed.format = plan.format;
        Add("PK_Motion" + Formatted(", scale %g x %g", plan.scale.x, plan.scale.y), placed);
        if (plan.rendersToBuffer) Add("PK_Convert", call.destination);
    }

    ScaleRoute fRoute{};
    std::vector<ScaleStep> fSteps;
};

} // namespace

std::vector<ScaleStep> DescribeScale(const ScaleCall& call) {
    return Steps(call).Take();
}

} // namespace tool
