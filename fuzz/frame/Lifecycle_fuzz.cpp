// Start, stop, switches and queries in any order, against a model of their rules.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Switches.h"

#include <PixelKiln/Lifecycle.h>
#include <PixelKiln/PixelFormat.h>

namespace {

using namespace PKFuzz;

class Model {
public:
    void Start() {
        if (++fOpenCalls != 1) return;
        const Switches found = SwitchesAfterStart();
        for (uint32_t which = 0; which < kSwitchCount; ++which)
            fSwitches[which] = fSwitches[which] || found[which];
    }
    void Stop() { --fOpenCalls; }
    void Set(uint32_t which, bool on) {
        if (which < kSwitchCount) fSwitches[which] = on;
    }

    int OpenCalls() const { return fOpenCalls; }
    bool IsOn(uint32_t which) const { return fSwitches[which]; }

private:
    int fOpenCalls = 1;
    Switches fSwitches = SwitchesAfterStart();
};

void CheckQueries(const Model& model) {
    Check(PK_hasSSE4() == model.IsOn(kSwitchSSE4), "PK_hasSSE4 tells switch 6");
    Check(PK_hasAVX() == model.IsOn(kSwitchAVX), "PK_hasAVX tells switch 8");
    Check(PK_hasAVX2() == model.IsOn(kSwitchAVX2), "PK_hasAVX2 tells switch 9");
    Check(PK_IsOriginTopLeft(PK_PixelFormat_BGRA_4444_8u) == model.IsOn(kSwitchTopLeft),
          "switch 10 turns the origin");
}

void Start(Model& model) {
    SetCall("PK_Initialize with " + std::to_string(model.OpenCalls()) + " open calls");
    Check(PK_Initialize() == PK_Success, "PK_Initialize succeeds");
    model.Start();
}

void Stop(Model& model) {
    SetCall("PK_Terminate with " + std::to_string(model.OpenCalls()) + " open calls");
    Check(PK_Terminate() == PK_Success, "PK_Terminate succeeds");
    model.Stop();
}

void Switch(Model& model, ByteStream& stream) {
    const uint32_t which = stream.OneIn(4) ? stream.U32() : stream.Below(kSwitchCount + 2);
    const int32_t value = MayBeOn(which) ? stream.AnyI32() : 0;
    SetCall("PK_SetDebugFlag(" + std::to_string(which) + ", " + std::to_string(value) + ")");
    Check(PK_SetDebugFlag(which, value) == PK_Success, "PK_SetDebugFlag succeeds");
    model.Set(which, value != 0);
}

void FuzzLifecycle(ByteStream& stream) {
    Model model;
    const uint32_t state = DrawFloatState(stream);
    for (int32_t calls = stream.Between(1, 24); calls > 0; --calls) {
        CallIn(state, [&] {
            switch (stream.Below(4)) {
            case 0:
                return Start(model);
            case 1:
                return Stop(model);
            default:
                return Switch(model, stream);
            }
        });
        CheckQueries(model);
    }
    while (model.OpenCalls() < 1) Start(model);
    while (model.OpenCalls() > 1) Stop(model);
    CheckQueries(model);
}

const Family sFamily('l', "lifecycle", FuzzLifecycle);

} // namespace
