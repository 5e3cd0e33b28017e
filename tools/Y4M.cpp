#include "Y4M.h"

#include "DensePlanes.h"
#include "Failure.h"
#include "Numbers.h"
#include "SamplePlanes.h"

#include <charconv>
#include <sstream>

namespace tool {
namespace {

constexpr size_t kLongestLine = 4096;
constexpr char kMagic[] = "YUV4MPEG2";

PK_PixelFormat FormatOf444(bool is709) {
    return is709 ? PK_PixelFormat_VUYX_4444_8u_709 : PK_PixelFormat_VUYX_4444_8u;
}

size_t FrameBytes(const Y4MHead& head) {
    return HasSamplePlanes(head.format) ? SamplePlanesBytes(head.format, head.width, head.height)
                                        : DenseBytes(head.width, head.height);
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
        fHead.format = Format();
        return fHead;
    }

private:
    PK_PixelFormat Format() const {
        if (fChroma == "420") return fVideo.Format();
        if (fVideo.isFullRange) Refuse("is C" + fChroma + " of the full range, which only 4:2:0 is read in");
        return fChroma == "422" ? UYVYOf(fVideo.is709) : FormatOf444(fVideo.is709);
    }

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
        if (value != "420" && value != "420jpeg" && value != "420mpeg2" && value != "422" && value != "444")
            Refuse("has the colour space C" + value +
                   "; of those, 420, 420jpeg, 420mpeg2, 422 and 444 are read");
        fVideo.isCentred = value != "420mpeg2";
        fChroma = value.substr(0, 3);
    }

    [[noreturn]] void Refuse(const std::string& what) const {
        throw Failure(kExitFile, "the stream '" + fName + "' " + what);
    }

    std::string fName, fMatrix;
    std::string fChroma = "420"; ///< where no word tells, and so centred
    Y4MHead fHead{0, 0, "25:1", "1:1", 0, PK_PixelFormat_Invalid};
    Video420 fVideo{.isCentred = true};
};

std::string HeadText(const Y4MHead& head) {
    constexpr char kInterlacing[] = {'p', 't', 'b'};
    const std::optional<Video420> video = Video420Of(head.format);
    const char* const samples = Is422(head.format) ? "422" : "444";
    const char* const chroma = !video ? samples : video->isCentred ? "420jpeg" : "420mpeg2";
    const char* const range = video && video->isFullRange ? "FULL" : "LIMITED";
    return Formatted("%s W%d H%d F%s I%c A%s C%s XCOLORRANGE=%s\n", kMagic, head.width, head.height,
                     head.rate.c_str(), kInterlacing[head.field], head.aspect.c_str(), chroma, range);
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
    fBytes.resize(FrameBytes(fHead));
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
    if (HasSamplePlanes(fHead.format))
        FromSamplePlanes(fBytes, frame);
    else
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
    if (Is422(fFormat)) {
        AppendSamplePlanes(frame, bytes);
    } else if (fFormat == PK_PixelFormat_Invalid) {
        AppendSamplePlanes(Converted(frame, FormatOf444(Is709("", frame.PixelSize())), kDefaultQuality),
                           bytes);
    } else {
        const std::vector<uint8_t> planes = ToDense(frame, RowPacking::Planes);
        bytes.append(planes.begin(), planes.end());
    }
    fFile.Write(bytes.data(), bytes.size());
}

} // namespace tool
