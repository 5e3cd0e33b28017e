#include "Y4M.h"

#include "DensePlanes.h"
#include "Failure.h"
#include "Numbers.h"

#include <charconv>
#include <sstream>

namespace tool {
namespace {

constexpr size_t kLongestLine = 4096;
constexpr char kMagic[] = "YUV4MPEG2";

PK_PixelFormat FormatOf444(const Frame& frame) {
    return Is709("", frame.PixelSize()) ? PK_PixelFormat_VUYX_4444_8u_709 : PK_PixelFormat_VUYX_4444_8u;
}

/// Reads the words of a head.
class HeadParser {
public:
    HeadParser(const std::string& name, const std::string& matrix) : fName(name), fMatrix(matrix) {}

    Y4MHead Parse(const std::string& line) {
        std::istringstream words(line.substr(sizeof kMagic - 1));
        for (std::string word; words >> word;) Take(word[0], word.substr(1));
        if (fHead.width <= 0 || fHead.height <= 0) Refuse("tells no size");
        fVideo.is709 = Is709(fMatrix, {fHead.width, fHead.height});
        fHead.format = fVideo.Format();
        return fHead;
    }

private:
    void Take(char tag, const std::string& value) {
        switch (tag) {
        case 'W':
            fHead.width = Number(value);
            return;
        case 'H':
            fHead.height = Number(value);
            return;
        case 'F':
            fHead.rate = value;
            return;
        case 'A':
            fHead.aspect = value;
            return;
        case 'I':
            return TakeInterlacing(value);
        case 'C':
            return TakeChroma(value);
        case 'X':
            if (value == "COLORRANGE=FULL") fVideo.isFullRange = true;
            return;
        default:
            return;
        }
    }

    int32_t Number(const std::string& value) const {
        int32_t number = 0;
        const auto [end, error] = std::from_chars(value.data(), value.data() + value.size(), number);
        if (error != std::errc() || end != value.data() + value.size())
            Refuse("tells '" + value + "' for a size");
        return number;
    }

    void TakeInterlacing(const std::string& value) {
        if (value == "m")
            Refuse(
                "is of mixed frames (Im), some interlaced and some not, which take chroma in different ways");
        fHead.field = value == "t" ? 1 : value == "b" ? 2 : 0;
        fVideo.areFields = fHead.field != 0;
    }

    void TakeChroma(const std::string& value) {
        if (value == "420paldv")
            Refuse("has the chroma of DV in PAL (C420paldv), of which U and V lie on different rows; nothing "
                   "here "
                   "takes that");
        if (value != "420" && value != "420jpeg" && value != "420mpeg2")
            Refuse("has the colour space C" + value + "; of those, 420, 420jpeg and 420mpeg2 are read");
        fVideo.isCentred = value != "420mpeg2";
    }

    [[noreturn]] void Refuse(const std::string& what) const {
        throw Failure(kExitFile, "the stream '" + fName + "' " + what);
    }

    std::string fName, fMatrix;
    Y4MHead fHead{0, 0, "25:1", "1:1", 0, PK_PixelFormat_Invalid};
    Video420 fVideo{.isCentred = true}; // where no word tells
};

std::string HeadText(const Y4MHead& head) {
    constexpr char kInterlacing[] = {'p', 't', 'b'};
    const std::optional<Video420> video = Video420Of(head.format);
    const char* const chroma = !video ? "444" : video->isCentred ? "420jpeg" : "420mpeg2";
    const char* const range = video && video->isFullRange ? "FULL" : "LIMITED";
    return Formatted("%s W%d H%d F%s I%c A%s C%s XCOLORRANGE=%s\n", kMagic, head.width, head.height,
                     head.rate.c_str(), kInterlacing[head.field], head.aspect.c_str(), chroma, range);
}

void AppendPlanesOf444(const Frame& frame, std::string& bytes) {
    const Frame pixels = Converted(frame, FormatOf444(frame), kDefaultQuality);
    constexpr int kPlanes[] = {2, 1, 0}; // Y, U, V of V, U, Y, X
    for (const int plane : kPlanes)
        for (int32_t y = 0; y < pixels.Height(); ++y) {
            const uint8_t* const from = pixels.Row(y) + plane;
            for (int32_t x = 0; x < pixels.Width(); ++x) bytes += static_cast<char>(from[4 * x]);
        }
}

} // namespace

bool IsY4MName(const std::string& name) {
    return name.ends_with(".y4m");
}

Y4MReader::Y4MReader(const std::string& name, const std::string& matrix) : fFile(name) {
    const std::optional<std::string> line = fFile.ReadLine(kLongestLine);
    if (!line || !line->starts_with(kMagic))
        throw Failure(kExitFile, "'" + fFile.Name() + "' is no Y4M stream");
    fHead = HeadParser(fFile.Name(), matrix).Parse(*line);
    fBytes.resize(DenseBytes(fHead.width, fHead.height));
}

bool Y4MReader::Read(Frame& frame) {
    const std::optional<std::string> line = fFile.ReadLine(kLongestLine);
    if (!line && !fHasFrames) throw Failure(kExitFile, "the stream '" + fFile.Name() + "' holds no frame");
    if (!line) return false;
    if (!line->starts_with("FRAME"))
        throw Failure(kExitFile, "the stream '" + fFile.Name() + "' has no frame where one should begin");
    const size_t got = fFile.Read(fBytes.data(), fBytes.size());
    if (got != fBytes.size())
        throw Failure(kExitFile, "the stream '" + fFile.Name() + "' ends within a frame, " +
                                     std::to_string(got) + " bytes into " + std::to_string(fBytes.size()));
    FromDense(fBytes, RowPacking::Planes, frame);
    fHasFrames = true;
    return true;
}

Y4MWriter::Y4MWriter(const std::string& name, const Y4MHead& head) : fFile(name), fFormat(head.format) {
    const std::string text = HeadText(head);
    fFile.Write(text.data(), text.size());
}

void Y4MWriter::Write(const Frame& frame) {
    std::string bytes = "FRAME\n";
    if (fFormat == PK_PixelFormat_Invalid) {
        AppendPlanesOf444(frame, bytes);
    } else {
        const std::vector<uint8_t> planes = ToDense(frame, RowPacking::Planes);
        bytes.append(planes.begin(), planes.end());
    }
    fFile.Write(bytes.data(), bytes.size());
}

} // namespace tool
