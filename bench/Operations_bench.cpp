// Operations on whole frames through the exported interface, each in turns with memcpy or memset and with the
// peers that this build found, as a Markdown table.
//
//   pixelkiln_operation_bench [PART_OF_A_NAME]

#include "frames/Image.h"
#include "frames/RandomSamples.h"
#include "frames/Timing.h"
#include "operations/Operation.h"

#include <PixelKiln/Lifecycle.h>

#include <algorithm>
#include <cstdio>
#include <cstring>

namespace OperationBench {

std::vector<Operation>& AllOperations() {
    static std::vector<Operation> operations;
    return operations;
}

std::vector<Peer>& AllPeers() {
    static std::vector<Peer> peers;
    return peers;
}

namespace {

using FrameBench::Allocate;
using FrameBench::Bytes;

constexpr int kRounds = 15;

struct PeerResult {
    const char* name;
    double seconds;
    int difference; // negative where none can be told
    bool setsAim;
};

struct Result {
    double seconds;
    double memorySeconds;          // of memcpy or memset
    std::vector<PeerResult> peers; // the fastest first
};

Bytes MakeSource(const Operation& operation) {
    Bytes source = Allocate(operation.bytesRead + operation.bytesWritten);
    const size_t bytes = operation.bytesRead;
    std::mt19937 random(1);
    if (operation.samples == Samples::Floats)
        FrameBench::FillRandom(random, reinterpret_cast<float*>(source.get()), bytes / 4, 0, 1);
    else if (operation.samples == Samples::Words10)
        FrameBench::FillRandom(random, reinterpret_cast<uint16_t*>(source.get()), bytes / 2, 0, 1024);
    else
        FrameBench::FillRandom(random, source.get(), bytes, 0, 256);
    return source;
}

int LargestDifference(const uint8_t* a, const uint8_t* b, size_t bytes) {
    int largest = 0;
    for (size_t i = 0; i < bytes; ++i) largest = std::max(largest, std::abs(a[i] - b[i]));
    return largest;
}

// Half of the bytes are read and half are written, or all are written.
Run MemoryRun(const Operation& operation, uint8_t* to, const uint8_t* from) {
    const size_t bytes = operation.bytesRead + operation.bytesWritten;
    if (operation.bytesRead == 0) return [=] { std::memset(to, 128, bytes); };
    return [=] { std::memcpy(to, from, bytes / 2); };
}

Result Measure(const Operation& operation) {
    const size_t bytes = operation.bytesRead + operation.bytesWritten;
    const Bytes source = MakeSource(operation);
    const Bytes copyFrom = Allocate(bytes);
    std::vector<Bytes> destinations;
    const auto newDestination = [&] {
        destinations.push_back(Allocate(operation.bytesWritten));
        if (operation.bytesRead >= operation.bytesWritten) // what works in place finds its samples there
            std::memcpy(destinations.back().get(), source.get(), operation.bytesWritten);
        return destinations.back().get();
    };
    std::vector<Run> contenders = {operation.prepare(source.get(), newDestination())};
    std::vector<Peer> peers;
    for (const Peer& peer : AllPeers()) {
        if (std::strcmp(peer.operation, operation.name) != 0) continue;
        peers.push_back(peer);
        contenders.push_back(peer.prepare(source.get(), newDestination()));
    }
    const Bytes copyTo = Allocate(bytes);
    contenders.push_back(MemoryRun(operation, copyTo.get(), copyFrom.get()));
    const std::vector<double> seconds = FrameBench::MeasureInTurns(contenders, kRounds);

    Result result = {seconds.front(), seconds.back(), {}};
    for (size_t i = 0; i < peers.size(); ++i) {
        const int difference =
            peers[i].isComparable
                ? LargestDifference(destinations[0].get(), destinations[i + 1].get(), operation.bytesWritten)
                : -1;
        result.peers.push_back({peers[i].name, seconds[i + 1], difference, peers[i].setsAim});
    }
    std::sort(result.peers.begin(), result.peers.end(),
              [](const PeerResult& a, const PeerResult& b) { return a.seconds < b.seconds; });
    return result;
}

std::string Verdict(const Operation& operation, const Result& result) {
    const bool againstPeer = operation.against == Against::Peer;
    const auto fastest = std::ranges::find(result.peers, true, &PeerResult::setsAim);
    if (operation.against == Against::Nothing || (againstPeer && fastest == result.peers.end())) return "-";
    const double reference = againstPeer ? fastest->seconds : result.memorySeconds;
    char text[32];
    std::snprintf(text, sizeof text, "%g, %s", operation.share,
                  reference / result.seconds >= operation.share ? "met" : "**missed**");
    return text;
}

void Print(const Operation& operation, const Result& result) {
    const auto bytes = static_cast<double>(operation.bytesRead + operation.bytesWritten);
    std::printf("| %s | %.3f | %.1f | %.2f | %s |", operation.name, result.seconds * 1e3,
                bytes / result.seconds * 1e-9, result.memorySeconds / result.seconds,
                Verdict(operation, result).c_str());
    if (result.peers.empty()) std::printf(" - | - | - | - |\n");
    for (const PeerResult& peer : result.peers) {
        if (&peer != result.peers.data()) std::printf("| | | | | |");
        const std::string difference = peer.difference < 0 ? "-" : std::to_string(peer.difference);
        std::printf(" %s | %.3f | %.2f | %s |\n", peer.name, peer.seconds * 1e3,
                    peer.seconds / result.seconds, difference.c_str());
    }
    std::fflush(stdout);
}

void PrintAll(const char* partOfName) {
    std::puts("| Operation | ms | GB/s | Share of memory | Aim | Peer | Peer ms | Ratio | Difference |");
    std::puts("|---|--:|--:|--:|---|---|--:|--:|--:|");
    for (const Operation& operation : AllOperations())
        if (std::strstr(operation.name, partOfName) != nullptr) Print(operation, Measure(operation));
}

} // namespace
} // namespace OperationBench

int main(int argc, char** argv) {
    PK_Initialize();
    OperationBench::PrintAll(argc > 1 ? argv[1] : "");
    PK_Terminate();
    return 0;
}
