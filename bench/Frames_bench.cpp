// Whole frames through the exported interface, each work against memcpy and against the peers that this build
// found, as a Markdown table.
//
//   pixelkiln_frame_bench [PART_OF_A_NAME]

#include "frames/Peer.h"
#include "frames/Timing.h"
#include "frames/Works.h"

#include <PixelKiln/PixelKiln.h>

#include <algorithm>
#include <cstdio>
#include <cstring>

namespace FrameBench {

std::vector<Peer>& AllPeers() {
    static std::vector<Peer> peers;
    return peers;
}

namespace {

constexpr int kRounds = 15;
constexpr double kLevel = 0.95; // repeated runs differ by so much

struct PeerResult {
    std::string name;
    Likeness likeness;
    double seconds;
    std::string difference;
};

struct Result {
    std::string name;
    double megapixels;
    double seconds;
    double memcpySeconds;
    double bytes;
    std::vector<PeerResult> peers; // the fastest first
};

Run Convert(const Image& source, const Rows& rows, const Image& destination) {
    return [&source, rows, &destination] {
        const PK_Result result =
            PK_Convert(rows.first, rows.rowBytes, source.format, destination.bytes.get(),
                       destination.rowBytes, destination.format, source.size.width, source.size.height, 1);
        if (result == PK_Success) return;
        std::fprintf(stderr, "%s to %s failed: %d\n", PK_PixelFormatName(source.format),
                     PK_PixelFormatName(destination.format), result);
        std::exit(1);
    };
}

Run ConvertAsStored(const Image& source, const Image& destination) {
    return Convert(source, {source.bytes.get(), source.rowBytes}, destination);
}

// With the rows of the source in the other order.
Run ConvertTurnedOver(const Image& source, const Image& destination) {
    return Convert(source, {source.Row(source.size.height - 1), -source.rowBytes}, destination);
}

std::string DifferenceText(const Peer& peer, const Image& ours, const Image& theirs) {
    if (peer.likeness != Likeness::Same) return "-";
    char text[32];
    std::snprintf(text, sizeof text, "%.3g", LargestDifference(ours, theirs));
    return text;
}

std::vector<Peer> PeersOf(const Work& work) {
    std::vector<Peer> peers;
    for (const Peer& peer : AllPeers())
        if (peer.source == work.source && peer.destination == work.destination) peers.push_back(peer);
    if (PK_IsOriginTopLeft(work.source) != PK_IsOriginTopLeft(work.destination))
        peers.push_back({work.source, work.destination, "ours, both images walked upward in memory",
                         Likeness::Part, ConvertTurnedOver});
    return peers;
}

Result Measure(const Work& work, const std::string& name, Size size) {
    const Image source = MakePicture(work.source, size);
    const Image destination(work.destination, size);
    const size_t bytes = source.packedBytes + destination.packedBytes;
    const Bytes copyFrom = Allocate(bytes / 2);
    const Bytes copyTo = Allocate(bytes / 2);

    const std::vector<Peer> peers = PeersOf(work);
    std::vector<Image> peerDestinations;
    std::vector<Run> contenders = {
        ConvertAsStored(source, destination),
        [&] { std::memcpy(copyTo.get(), copyFrom.get(), bytes / 2); },
    };
    peerDestinations.reserve(peers.size());
    for (const Peer& peer : peers) {
        peerDestinations.emplace_back(work.destination, size);
        contenders.push_back(peer.prepare(source, peerDestinations.back()));
    }
    const std::vector<double> seconds = MeasureInTurns(contenders, kRounds);

    const double megapixels = size.width * size.height * 1e-6;
    Result result = {name, megapixels, seconds[0], seconds[1], static_cast<double>(bytes), {}};
    for (size_t i = 0; i < peers.size(); ++i)
        result.peers.push_back({peers[i].name, peers[i].likeness, seconds[i + 2],
                                DifferenceText(peers[i], destination, peerDestinations[i])});
    std::sort(result.peers.begin(), result.peers.end(),
              [](const PeerResult& a, const PeerResult& b) { return a.seconds < b.seconds; });
    return result;
}

const PeerResult* FastestWholePeer(const Result& result) {
    for (const PeerResult& peer : result.peers)
        if (peer.likeness != Likeness::Part) return &peer;
    return nullptr;
}

const char* MetOrMissed(double share, double aim) {
    return share >= aim ? "met" : "**missed**";
}

const char* Verdict(Aim aim, const Result& result) {
    const double shareOfMemcpy = result.memcpySeconds / result.seconds;
    if (aim == Aim::Copy) return MetOrMissed(shareOfMemcpy, 0.95);
    if (aim == Aim::CopyInCache) return "-";
    if (aim == Aim::ByteMove) return MetOrMissed(shareOfMemcpy, 0.8);
    const PeerResult* const peer = FastestWholePeer(result);
    return peer == nullptr ? "-" : MetOrMissed(peer->seconds / result.seconds, kLevel);
}

void PrintPeer(const PeerResult& peer, const Result& ours) {
    std::printf(" %s | %.0f | %.2f | %s |\n", peer.name.c_str(), ours.megapixels / peer.seconds,
                peer.seconds / ours.seconds, peer.difference.c_str());
}

void Print(Aim aim, const Result& result) {
    std::printf("| %s | %.0f | %.1f | %.2f | %s |", result.name.c_str(), result.megapixels / result.seconds,
                result.bytes / result.seconds * 1e-9, result.memcpySeconds / result.seconds,
                Verdict(aim, result));
    if (result.peers.empty()) std::printf(" - | - | - | - |\n");
    for (size_t i = 0; i < result.peers.size(); ++i) {
        if (i != 0) std::printf("| | | | | |");
        PrintPeer(result.peers[i], result);
    }
    std::fflush(stdout);
}

void PrintAll(const char* partOfName) {
    std::puts("| Conversion | Mpixel/s | GB/s | Share of memcpy | Aim | Peer | Peer Mpixel/s | Ratio | "
              "Difference |");
    std::puts("|---|--:|--:|--:|---|---|--:|--:|--:|");
    const auto measure = [&](const Work& work, const std::string& name, Size size) {
        if (name.find(partOfName) != std::string::npos) Print(work.aim, Measure(work, name, size));
    };
    for (const Work& work : kWorks) {
        measure(work, work.name, kHD);
        if (work.sizes == Sizes::HDAndUHD) measure(work, std::string(work.name) + ", 3840 x 2160", kUHD);
    }
}

} // namespace

} // namespace FrameBench

int main(int argc, char** argv) {
    PK_Initialize();
    FrameBench::PrintAll(argc > 1 ? argv[1] : "");
    PK_Terminate();
    return 0;
}
