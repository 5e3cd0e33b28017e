// Our frames as FFmpeg reads them, beside those of its own encoder.

#include <PixelKiln/PixelKiln.h>

#include "support/TestPictures.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <iterator>
#include <string>
#include <unistd.h>
#include <vector>

namespace {

using Bytes = std::vector<uint8_t>;

enum class Chroma { k411, k420, k422 };

struct Format {
    const char* name;
    PK_PixelFormat stream;
    Chroma chroma;
    bool isDVCPRO;
    int32_t width, height;
    const char* rate;
};

constexpr Format kFormats[] = {
    {"DV25_525", PK_PixelFormat_NTSCDV25, Chroma::k411, false, 720, 480, "30000/1001"},
    {"DV25_625", PK_PixelFormat_PALDV25, Chroma::k420, false, 720, 576, "25"},
    {"DVCPRO_625", PK_PixelFormat_PALDV25, Chroma::k411, true, 720, 576, "25"},
    {"DV50_525", PK_PixelFormat_NTSCDV50, Chroma::k422, false, 720, 480, "30000/1001"},
    {"DV50_625", PK_PixelFormat_PALDV50, Chroma::k422, false, 720, 576, "25"},
    {"DV100_720p60", PK_PixelFormat_NTSC_DV100_720p, Chroma::k422, false, 960, 720, "60000/1001"},
    {"DV100_720p50", PK_PixelFormat_PAL_DV100_720p, Chroma::k422, false, 960, 720, "50"},
    {"DV100_1080i60", PK_PixelFormat_NTSC_DV100_1080i, Chroma::k422, false, 1280, 1080, "30000/1001"},
    {"DV100_1080i50", PK_PixelFormat_PAL_DV100_1080i, Chroma::k422, false, 1440, 1080, "25"},
};

const char* PlanesOf(const Format& format) {
    return format.chroma == Chroma::k411 ? "yuv411p" : format.chroma == Chroma::k420 ? "yuv420p" : "yuv422p";
}

/// The three planes that a format codes, one behind the other.
struct Planes {
    Bytes bytes;
    size_t luma;
};

/// Chroma of 4:1:1 lies on the first of four pixels, chroma of 4:2:0 between two lines of a field.
Planes PlanesOfPicture(const Format& format, const Bytes& yuyv) {
    const auto at = [&](int32_t line, int32_t pair, int32_t byte) -> int32_t {
        const int32_t place = 2 * format.width * line + 4 * std::max(pair, 0) + byte;
        return yuyv[static_cast<size_t>(place)];
    };
    Bytes bytes;
    for (size_t i = 0; i < yuyv.size(); i += 2) bytes.push_back(yuyv[i]);
    const size_t luma = bytes.size();
    for (const int32_t byte : {1, 3})
        for (int32_t y = 0; y < (format.chroma == Chroma::k420 ? format.height / 2 : format.height); ++y)
            for (int32_t x = 0; x < format.width / (format.chroma == Chroma::k411 ? 4 : 2); ++x) {
                const int32_t line = y / 2 * 4 + y % 2;
                const int32_t code =
                    format.chroma == Chroma::k411
                        ? (at(y, 2 * x - 1, byte) + 2 * at(y, 2 * x, byte) + at(y, 2 * x + 1, byte) + 2) >> 2
                    : format.chroma == Chroma::k420 ? (at(line, x, byte) + at(line + 2, x, byte) + 1) >> 1
                                                    : at(y, x, byte);
                bytes.push_back(static_cast<uint8_t>(code));
            }
    return {bytes, luma};
}

/// A folder for the files of a test.
class Folder {
public:
    Folder() : fPath(testing::TempDir() + "pixelkiln-dv-" + std::to_string(getpid())) {
        std::filesystem::create_directories(fPath);
    }
    ~Folder() { std::filesystem::remove_all(fPath); }
    Folder(const Folder&) = delete;
    Folder& operator=(const Folder&) = delete;

    std::string operator/(const std::string& name) const { return fPath + "/" + name; }

private:
    std::string fPath;
};

void Write(const std::string& name, const Bytes& bytes) {
    std::ofstream(name, std::ios::binary)
        .write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
}

Bytes Read(const std::string& name) {
    std::ifstream file(name, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

/// \return what it says, but for the remark on a stream whose length is told by its bytes.
std::string RunFFmpeg(const std::string& arguments, const Folder& folder) {
    const std::string log = folder / "log";
    const std::string command = "ffmpeg -nostdin -v warning -y " + arguments + " 2>" + log;
    if (std::system(command.c_str()) != 0) ADD_FAILURE() << command;
    std::ifstream lines(log);
    std::string said;
    for (std::string line; std::getline(lines, line);)
        if (line.find("Estimating duration from bitrate") == std::string::npos) said += line + "\n";
    return said;
}

double ToDecibels(double squares, size_t count) {
    constexpr double kNone = 99;
    return squares == 0 ? kNone : 10 * std::log10(255.0 * 255 * static_cast<double>(count) / squares);
}

struct Quality {
    double all, luma, chroma;
};

Quality QualityOf(const Planes& planes, const uint8_t* decoded) {
    double luma = 0, chroma = 0;
    for (size_t i = 0; i < planes.bytes.size(); ++i) {
        const double difference = planes.bytes[i] - decoded[i];
        (i < planes.luma ? luma : chroma) += difference * difference;
    }
    const size_t count = planes.bytes.size();
    return {ToDecibels(luma + chroma, count), ToDecibels(luma, planes.luma),
            ToDecibels(chroma, count - planes.luma)};
}

PK_Result Encode(const Format& format, const Bytes& yuyv, int32_t quality, uint8_t* frame,
                 int32_t frameBytes) {
    const bool isHD = format.height > 576;
    const PK_PixelFormat pixels = isHD ? PK_PixelFormat_YUYV_422_8u_709 : PK_PixelFormat_YUYV_422_8u;
    if (format.isDVCPRO)
        return PK_CompressDVCPROPAL25(yuyv.data(), 2 * format.width, pixels, format.width, format.height,
                                      frame, frameBytes, format.stream, quality);
    return PK_Convert(yuyv.data(), 2 * format.width, pixels, frame, frameBytes, format.stream, format.width,
                      format.height, quality);
}

class FFmpegEncoder : public testing::TestWithParam<Format> {
protected:
    void SetUp() override {
        if (std::system("ffmpeg -version >/dev/null 2>&1") != 0)
            GTEST_SKIP() << "the program ffmpeg is not there to compare with";
        PK_Initialize();
    }
    void TearDown() override { PK_Terminate(); }

    const Format& fFormat = GetParam();
    Folder fFolder;
    std::vector<PKTest::TestPicture> fPictures = PKTest::TestPictures(fFormat.width, fFormat.height);

    /// All pictures as one stream, read by FFmpeg.
    Bytes Ours(int32_t quality) {
        const auto frameBytes = static_cast<int32_t>(PK_PixelFormatSize(fFormat.stream, 0, 0));
        Bytes stream(static_cast<size_t>(frameBytes) * fPictures.size());
        for (size_t i = 0; i < fPictures.size(); ++i)
            EXPECT_EQ(Encode(fFormat, fPictures[i].yuyv, quality,
                             stream.data() + static_cast<size_t>(frameBytes) * i, frameBytes),
                      PK_Success);
        Write(fFolder / "ours.dv", stream);
        const std::string said =
            RunFFmpeg("-i " + (fFolder / "ours.dv") + " -f rawvideo " + (fFolder / "ours.yuv"), fFolder);
        EXPECT_EQ(said, "");
        return Read(fFolder / "ours.yuv");
    }

    Bytes Theirs(const std::vector<Planes>& planes) {
        Bytes all;
        for (const Planes& of : planes) all.insert(all.end(), of.bytes.begin(), of.bytes.end());
        Write(fFolder / "planes.yuv", all);
        const std::string size = std::to_string(fFormat.width) + "x" + std::to_string(fFormat.height);
        RunFFmpeg(std::string("-f rawvideo -pix_fmt ") + PlanesOf(fFormat) + " -s " + size + " -r " +
                      fFormat.rate + " -i " + (fFolder / "planes.yuv") + " -c:v dvvideo " +
                      (fFormat.height == 720 ? "" : "-flags +ildct ") + "-f dv " + (fFolder / "theirs.dv"),
                  fFolder);
        RunFFmpeg("-i " + (fFolder / "theirs.dv") + " -f rawvideo " + (fFolder / "theirs.yuv"), fFolder);
        return Read(fFolder / "theirs.yuv");
    }

    std::vector<Planes> AllPlanes() const {
        std::vector<Planes> planes;
        for (const PKTest::TestPicture& picture : fPictures)
            planes.push_back(PlanesOfPicture(fFormat, picture.yuyv));
        return planes;
    }
};

INSTANTIATE_TEST_SUITE_P(Formats, FFmpegEncoder, testing::ValuesIn(kFormats),
                         [](const auto& test) { return std::string(test.param.name); });

TEST_P(FFmpegEncoder, IsNotBetterThanOurs) {
    const std::vector<Planes> planes = AllPlanes();
    const Bytes ours = Ours(5), theirs = Theirs(planes);
    const size_t frame = planes[0].bytes.size();
    ASSERT_EQ(ours.size(), frame * planes.size());
    ASSERT_GE(theirs.size(), frame * planes.size());
    std::printf("%-14s %-20s %21s   %21s\n", fFormat.name, "PSNR in dB", "ours: all luma chroma", "FFmpeg's");
    for (size_t i = 0; i < planes.size(); ++i) {
        const Quality our = QualityOf(planes[i], ours.data() + frame * i);
        const Quality their = QualityOf(planes[i], theirs.data() + frame * i);
        std::printf("%-14s %-20s %9.2f %5.2f %5.2f   %9.2f %5.2f %5.2f\n", "", fPictures[i].name.c_str(),
                    our.all, our.luma, our.chroma, their.all, their.luma, their.chroma);
        EXPECT_GE(our.all, their.all - 0.35) << fPictures[i].name;
        EXPECT_GE(our.luma, their.luma - 1.5) << fPictures[i].name;
        EXPECT_GE(our.chroma, their.chroma - 1.5) << fPictures[i].name;
    }
}

TEST_P(FFmpegEncoder, ReadsWhatIsPlainlyEncoded) {
    const std::vector<Planes> planes = AllPlanes();
    const Bytes ours = Ours(0);
    const size_t frame = planes[0].bytes.size();
    ASSERT_EQ(ours.size(), frame * planes.size());
    for (size_t i = 0; i < planes.size(); ++i) {
        const std::string& name = fPictures[i].name;
        const double least = name == "noise" ? 10 : name == "colours in motion" ? 27 : 35;
        EXPECT_GE(QualityOf(planes[i], ours.data() + frame * i).all, least) << name;
    }
}

/// 4:2:2, which our decoder gives as it is coded: the other formats' chroma is interpolated.
TEST_P(FFmpegEncoder, ReadsOurFramesAsWeDo) {
    if (fFormat.chroma != Chroma::k422) return;
    const Bytes theirs = Ours(5), stream = Read(fFolder / "ours.dv");
    const auto frameBytes = static_cast<size_t>(PK_PixelFormatSize(fFormat.stream, 0, 0));
    const PK_PixelFormat pixels =
        fFormat.height > 576 ? PK_PixelFormat_YUYV_422_8u_709 : PK_PixelFormat_YUYV_422_8u;
    for (size_t i = 0; i < fPictures.size(); ++i) {
        Bytes yuyv(fPictures[i].yuyv.size());
        ASSERT_EQ(PK_Convert(stream.data() + frameBytes * i, 0, fFormat.stream, yuyv.data(),
                             2 * fFormat.width, pixels, fFormat.width, fFormat.height, 4),
                  PK_Success);
        const Bytes ours = PlanesOfPicture(fFormat, yuyv).bytes;
        int32_t greatest = 0;
        for (size_t k = 0; k < ours.size(); ++k)
            greatest = std::max(greatest, std::abs(int32_t{ours[k]} - theirs[ours.size() * i + k]));
        // The coarsest steps, which only noise takes, make most of where each of the two rounds.
        EXPECT_LE(greatest, fPictures[i].name == "noise" ? 3 : 2) << fPictures[i].name;
    }
}

/// The second frame of a pair, behind the first.
TEST_P(FFmpegEncoder, ReadsPairsOf720Lines) {
    if (fFormat.height != 720) return;
    const auto frameBytes = static_cast<int32_t>(PK_PixelFormatSize(fFormat.stream, 0, 0));
    Bytes stream(2 * static_cast<size_t>(frameBytes));
    for (const int32_t i : {0, 1})
        ASSERT_EQ(PK_CompressDV100720pWithChannelOffset(
                      fPictures[static_cast<size_t>(i)].yuyv.data(), 2 * fFormat.width,
                      PK_PixelFormat_YUYV_422_8u_709, fFormat.width, fFormat.height,
                      stream.data() + i * frameBytes, frameBytes, 2 * i, fFormat.stream, 5),
                  PK_Success);
    Write(fFolder / "pair.dv", stream);
    EXPECT_EQ(RunFFmpeg("-i " + (fFolder / "pair.dv") + " -f rawvideo " + (fFolder / "pair.yuv"), fFolder),
              "");
    const Bytes decoded = Read(fFolder / "pair.yuv");
    const std::vector<Planes> planes = AllPlanes();
    ASSERT_EQ(decoded.size(), 2 * planes[0].bytes.size());
    for (const size_t i : {0, 1})
        EXPECT_GE(QualityOf(planes[i], decoded.data() + decoded.size() / 2 * i).all, 35);
}

} // namespace
