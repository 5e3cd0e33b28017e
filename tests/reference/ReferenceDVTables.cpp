#include "reference/ReferenceDVTables.h"

#include <fstream>
#include <map>
#include <sstream>
#include <stdexcept>

namespace PKTest {
namespace {

/// The lines of a file behind its heading.
std::vector<std::vector<std::string>> Lines(const std::string& name) {
    const std::string path = std::string(PIXELKILN_TEST_DATA_DIR "/dv/") + name + ".csv";
    std::ifstream file(path);
    if (!file) throw std::runtime_error(path + " cannot be read");
    std::vector<std::vector<std::string>> lines;
    std::string line;
    std::getline(file, line);
    while (std::getline(file, line)) {
        std::vector<std::string>& fields = lines.emplace_back();
        std::istringstream stream(line);
        for (std::string field; std::getline(stream, field, ',');) fields.push_back(field);
    }
    return lines;
}

std::array<int, 64> Column(const std::string& name, size_t column) {
    std::array<int, 64> values{};
    for (const auto& line : Lines(name))
        values.at(static_cast<size_t>(std::stoi(line.at(0)))) = std::stoi(line.at(column));
    return values;
}

unsigned Key(const std::string& bits) {
    return static_cast<unsigned>(std::stoul("1" + bits, nullptr, 2));
}

std::string Binary(int value, int length) {
    std::string bits;
    for (int i = length - 1; i >= 0; --i) bits += (value >> i & 1) != 0 ? '1' : '0';
    return bits;
}

const std::map<std::pair<int, int>, std::string>& Words() {
    static const auto words = [] {
        std::map<std::pair<int, int>, std::string> all; // amplitude 0 with a run: zeros only
        for (const auto& line : Lines("vlc"))
            if (line[0] != "eob") all[{std::stoi(line[1]), std::stoi(line[2])}] = line[3];
        return all;
    }();
    return words;
}

std::string Word(int run, int amplitude) {
    const auto word = Words().find({run, amplitude});
    return word == Words().end() ? "" : word->second;
}

using Places = std::map<std::array<int, 4>, DVPlace>;

Places ReadPlaces(const std::string& name) {
    static const std::map<std::string, DVShape> shapes = {
        {"unused", DVShape::kUnused},   {"411_32x8", DVShape::k411}, {"edge16x16", DVShape::kEdgeOf411},
        {"420_16x16", DVShape::k420},   {"422_16x8", DVShape::k422}, {"hd_16x16", DVShape::kHD},
        {"hd_32x8", DVShape::kHalfRow},
    };
    Places places;
    for (const auto& line : Lines("placement_" + name)) {
        DVPlace place{shapes.at(line.at(7)), 0, 0};
        if (place.shape != DVShape::kUnused) place = {place.shape, std::stoi(line[5]), std::stoi(line[6])};
        places[{std::stoi(line[0]), std::stoi(line[1]), std::stoi(line[2]), std::stoi(line[3])}] = place;
    }
    return places;
}

constexpr std::array<DVLayout, 9> kLayouts = {{
    {"411_525", PK_PixelFormat_NTSCDV25, 720, 480, 4, 1, 1, 10, false, false},
    {"411_625", PK_PixelFormat_PALDV25, 720, 576, 4, 1, 1, 12, false, false},
    {"420_625", PK_PixelFormat_PALDV25, 720, 576, 2, 2, 1, 12, false, false},
    {"422_525", PK_PixelFormat_NTSCDV50, 720, 480, 2, 1, 2, 10, false, false},
    {"422_625", PK_PixelFormat_PALDV50, 720, 576, 2, 1, 2, 12, false, false},
    {"720p60", PK_PixelFormat_NTSC_DV100_720p, 960, 720, 2, 1, 2, 10, true, false},
    {"720p50", PK_PixelFormat_PAL_DV100_720p, 960, 720, 2, 1, 2, 12, true, false},
    {"1080i60", PK_PixelFormat_NTSC_DV100_1080i, 1280, 1080, 2, 1, 4, 10, true, true},
    {"1080i50", PK_PixelFormat_PAL_DV100_1080i, 1440, 1080, 2, 1, 4, 12, true, true},
}};

} // namespace

const DVLayout& LayoutOf(DVKind kind) {
    return kLayouts.at(static_cast<size_t>(kind));
}

int PlaceOfSegment(int channel, int sequence, int segment, const DVLayout& layout) {
    const int block = 150 * (channel * layout.sequences + sequence) + 7 + 5 * segment + segment / 3;
    return 80 * block;
}

DVPlace PlaceOf(DVKind kind, int channel, int sequence, int segment, int macroblock) {
    static std::array<Places, kDVKinds.size()> all;
    Places& places = all.at(static_cast<size_t>(kind));
    if (places.empty()) places = ReadPlaces(LayoutOf(kind).name);
    return places.at({channel, sequence, segment, macroblock});
}

const std::unordered_map<unsigned, DVCode>& DVCodes() {
    static const auto codes = [] {
        std::unordered_map<unsigned, DVCode> all;
        for (const auto& line : Lines("vlc")) {
            const auto is = line[0] == "eob"        ? DVCode::Is::kEnd
                            : line[0] == "run_only" ? DVCode::Is::kZeros
                                                    : DVCode::Is::kLevel;
            all[Key(line[3])] = {is, is == DVCode::Is::kEnd ? 0 : std::stoi(line[1]),
                                 is == DVCode::Is::kLevel ? std::stoi(line[2]) : 0};
        }
        for (int run = 0; run < 64; ++run)
            all[Key("1111110" + Binary(run, 6))] = {DVCode::Is::kZeros, run, 0};
        for (int amplitude = 0; amplitude < 256; ++amplitude)
            all[Key("1111111" + Binary(amplitude, 8))] = {DVCode::Is::kLevel, 0, amplitude};
        return all;
    }();
    return codes;
}

std::string BitsOfLevel(int run, int amplitude) {
    return amplitude == 0 ? "" : Word(run, amplitude);
}
std::string BitsOfZeros(int run) {
    return Word(run, 0);
}

const std::array<DVScanPlace, 64>& DVScan(bool is248) {
    const auto read = [](const char* name) {
        std::array<DVScanPlace, 64> scan{};
        for (const auto& line : Lines(name))
            scan.at(static_cast<size_t>(std::stoi(line[0]))) = {std::stoi(line[1]),
                                                                std::stoi(line.at(name[5] == '8' ? 4 : 5))};
        return scan;
    };
    static const std::array<DVScanPlace, 64> scans[2] = {read("scan_88"), read("scan_248")};
    return scans[is248];
}

int DVAreaShift(int area, int classNumber, int qno) {
    static const auto shifts = [] {
        std::map<std::array<int, 3>, int> all;
        for (const auto& line : Lines("area_shift"))
            for (int i = 0; i < 4; ++i)
                all[{i, std::stoi(line[0]), std::stoi(line[1])}] =
                    std::stoi(line.at(static_cast<size_t>(2 + i)));
        return all;
    }();
    return shifts.at({area, classNumber, qno});
}

const std::array<int, 64>& DVFactors(bool is248) {
    static const std::array<int, 64> factors[2] = {Column("weights_88", 6), Column("weights_248", 6)};
    return factors[is248];
}

const std::array<int, 64>& DV100Table(bool is1080, bool isChroma) {
    static const std::array<int, 64> tables[2][2] = {
        {Column("dv100_quant_720_luma", 4), Column("dv100_quant_720_chroma", 4)},
        {Column("dv100_quant_1080_luma", 4), Column("dv100_quant_1080_chroma", 4)}};
    return tables[is1080][isChroma];
}

int DV100Step(int qno) {
    static const std::vector<int> steps = [] {
        std::vector<int> all;
        for (const auto& line : Lines("dv100_step")) all.push_back(std::stoi(line.at(1)));
        return all;
    }();
    return steps.at(static_cast<size_t>(qno));
}

} // namespace PKTest
