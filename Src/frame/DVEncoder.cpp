#include "frame/DVEncoder.h"

#include "mc_enc_dv/mc_enc_dv.h"

#include <mutex>
#include <pthread.h>

namespace PK {
namespace {

constinit std::mutex sMutex;
// Guarded by sMutex, as is every call of an encoder that takes no calls at once.
constinit mc_enc_dv::Handle sDVEncoder = nullptr;

// The encoder takes memory and converts under this lock: it must be taken before the locks of those, whose handlers are
// registered by constructors of priority 101. What is registered last comes first.
[[gnu::constructor(102)]] void FollowForks() {
    constexpr auto goOn = [] { sMutex.unlock(); };
    pthread_atfork([] { sMutex.lock(); }, goOn, goOn);
}

} // namespace

void OpenDVEncoder() noexcept {
    const std::scoped_lock lock(sMutex);
    if (sDVEncoder == nullptr) sDVEncoder = mc_enc_dv::Open();
}

void CloseDVEncoder() noexcept {
    const std::scoped_lock lock(sMutex);
    if (sDVEncoder != nullptr) mc_enc_dv::Close(sDVEncoder);
    sDVEncoder = nullptr;
}

int32_t RunDVEncoder(const DVEncoderJob& job) noexcept {
    std::unique_lock lock(sMutex);
    if (sDVEncoder == nullptr) sDVEncoder = mc_enc_dv::Open();
    mc_enc_dv::Handle encoder = sDVEncoder;
    if (mc_enc_dv::IsReentrant()) lock.unlock();
    return mc_enc_dv::Encode(encoder, job.pixels, job.rowBytes, job.dst, job.dstBytes, job.width, job.height,
                             0, job.flags, job.fourcc, 0, 0);
}

} // namespace PK
