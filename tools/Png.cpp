#include "Png.h"

#include "Failure.h"

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <csetjmp>
#include <cstdio>
#include <cstring>
#include <memory>
#include <png.h>
#include <vector>

namespace tool {
namespace {

constexpr float kWhite16 = 65535.0f;

// libpng reports an error by a jump. So every function that calls it holds plain values only, and what must
// be destroyed is owned by its caller; a failure of ours waits here until the jump has been taken.
struct Session {
    char message[256] = "";
    OutputFile* output = nullptr;
    std::exception_ptr outputFailure;
};

void KeepMessage(png_structp png, png_const_charp message) {
    auto* session = static_cast<Session*>(png_get_error_ptr(png));
    std::snprintf(session->message, sizeof(session->message), "%s", message);
    png_longjmp(png, 1);
}

void IgnoreWarning(png_structp, png_const_charp) {}

class Reader {
public:
    explicit Reader(Session& session)
        : fPng(png_create_read_struct(PNG_LIBPNG_VER_STRING, &session, KeepMessage, IgnoreWarning)),
          fInfo(png_create_info_struct(fPng)) {}
    ~Reader() { png_destroy_read_struct(&fPng, &fInfo, nullptr); }
    Reader(const Reader&) = delete;
    Reader& operator=(const Reader&) = delete;

    bool ReadHeader(FILE* file) {
        if (setjmp(png_jmpbuf(fPng))) return false;
        png_init_io(fPng, file);
        png_read_info(fPng, fInfo);
        png_set_expand(fPng);
        png_set_gray_to_rgb(fPng);
        png_set_bgr(fPng);
        png_set_add_alpha(fPng, Is16Bit() ? 0xffff : 0xff, PNG_FILLER_AFTER);
        if (Is16Bit()) png_set_swap(fPng);
        png_set_interlace_handling(fPng);
        png_read_update_info(fPng, fInfo);
        return true;
    }

    bool ReadRows(png_bytepp rows) {
        if (setjmp(png_jmpbuf(fPng))) return false;
        png_read_image(fPng, rows);
        png_read_end(fPng, nullptr);
        return true;
    }

    bool Is16Bit() const { return png_get_bit_depth(fPng, fInfo) == 16; }
    int32_t Width() const { return static_cast<int32_t>(png_get_image_width(fPng, fInfo)); }
    int32_t Height() const { return static_cast<int32_t>(png_get_image_height(fPng, fInfo)); }

private:
    png_structp fPng;
    png_infop fInfo;
};

void WriteBytes(png_structp png, png_bytep data, size_t bytes) {
    auto* session = static_cast<Session*>(png_get_io_ptr(png));
    bool failed = false;
    try {
        session->output->Write(data, bytes);
    } catch (...) {
        session->outputFailure = std::current_exception();
        failed = true;
    }
    if (failed) png_error(png, "write");
}

void NothingToFlush(png_structp) {}

class Writer {
public:
    explicit Writer(Session& session)
        : fSession(session),
          fPng(png_create_write_struct(PNG_LIBPNG_VER_STRING, &session, KeepMessage, IgnoreWarning)),
          fInfo(png_create_info_struct(fPng)) {}
    ~Writer() { png_destroy_write_struct(&fPng, &fInfo); }
    Writer(const Writer&) = delete;
    Writer& operator=(const Writer&) = delete;

    /// \param rows  B, G, R, A from the top of the picture.
    bool Write(int32_t width, int32_t height, bool is16Bit, bool opaque, png_bytepp rows) {
        if (setjmp(png_jmpbuf(fPng))) return false;
        png_set_write_fn(fPng, &fSession, WriteBytes, NothingToFlush);
        png_set_IHDR(fPng, fInfo, static_cast<png_uint_32>(width), static_cast<png_uint_32>(height),
                     is16Bit ? 16 : 8, opaque ? PNG_COLOR_TYPE_RGB : PNG_COLOR_TYPE_RGB_ALPHA,
                     PNG_INTERLACE_NONE, PNG_COMPRESSION_TYPE_DEFAULT, PNG_FILTER_TYPE_DEFAULT);
        png_write_info(fPng, fInfo);
        png_set_bgr(fPng);
        if (opaque) png_set_filler(fPng, 0, PNG_FILLER_AFTER);
        if (is16Bit) png_set_swap(fPng);
        png_write_image(fPng, rows);
        png_write_end(fPng, nullptr);
        return true;
    }

private:
    Session& fSession;
    png_structp fPng;
    png_infop fInfo;
};

struct CloseFile {
    void operator()(FILE* file) const { std::fclose(file); }
};
using InputFile = std::unique_ptr<FILE, CloseFile>;

InputFile OpenPng(const std::string& name) {
    InputFile file(std::fopen(name.c_str(), "rb"));
    const std::string complaint = "cannot read '" + name + "'";
    if (!file) ThrowFileFailure(complaint, errno);
    png_byte signature[8] = {};
    errno = 0;
    const size_t got = std::fread(signature, 1, sizeof(signature), file.get());
    if (std::ferror(file.get())) ThrowFileFailure(complaint, errno);
    if (png_sig_cmp(signature, 0, sizeof(signature)) != 0)
        throw Failure(kExitFile, complaint + (got == 0 ? ": the file is empty" : ": it is not a PNG file") +
                                     "; give a PNG, or raw frames under another name with --from and --size");
    std::rewind(file.get());
    return file;
}

std::vector<png_bytep> RowPointers(uint8_t* top, int64_t rowBytes, int32_t height) {
    std::vector<png_bytep> rows(static_cast<size_t>(height));
    for (int32_t y = 0; y < height; ++y) rows[static_cast<size_t>(y)] = top + y * rowBytes;
    return rows;
}

// The rows of a picture from the top, wherever its format keeps the top.
std::vector<png_bytep> RowPointers(Frame& picture) {
    const int64_t step = PK_IsOriginTopLeft(picture.Format()) ? picture.RowBytes() : -picture.RowBytes();
    return RowPointers(picture.Row(0), step, picture.Height());
}

struct Samples16 {
    Samples16(int32_t width, int32_t height)
        : rowSamples(size_t{4} * static_cast<size_t>(width)),
          values(rowSamples * static_cast<size_t>(height)) {}

    std::vector<png_bytep> Rows() {
        return RowPointers(reinterpret_cast<uint8_t*>(values.data()), static_cast<int64_t>(rowSamples * 2),
                           static_cast<int32_t>(values.size() / rowSamples));
    }
    uint16_t* Row(int32_t y) { return values.data() + static_cast<size_t>(y) * rowSamples; }

    size_t rowSamples;
    std::vector<uint16_t> values;
};

void Widen(Samples16& samples, Frame& picture) {
    for (int32_t y = 0; y < picture.Height(); ++y) {
        auto* row = reinterpret_cast<float*>(picture.Row(y));
        for (size_t i = 0; i < samples.rowSamples; ++i)
            row[i] = static_cast<float>(samples.Row(y)[i]) / kWhite16;
    }
}

void Narrow(const Frame& picture, Samples16& samples) {
    for (int32_t y = 0; y < picture.Height(); ++y) {
        const auto* row = reinterpret_cast<const float*>(picture.Row(y));
        for (size_t i = 0; i < samples.rowSamples; ++i) {
            const float inRange = row[i] > 0.0f ? std::min(row[i], 1.0f) : 0.0f; // NaN gives black
            samples.Row(y)[i] = static_cast<uint16_t>(inRange * kWhite16 + 0.5f);
        }
    }
}

template <typename Sample>
bool IsOpaque(const std::vector<png_bytep>& rows, int32_t width, Sample opaque) {
    for (const png_bytep bytes : rows) {
        const auto* row = reinterpret_cast<const Sample*>(bytes);
        for (int32_t x = 0; x < width; ++x)
            if (row[4 * x + 3] != opaque) return false;
    }
    return true;
}

} // namespace

bool IsPngName(const std::string& name) {
    constexpr size_t kLength = 4;
    if (name.size() < kLength) return false;
    std::string ending = name.substr(name.size() - kLength);
    for (char& c : ending) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return ending == ".png";
}

Frame ReadPng(const std::string& name) {
    const InputFile file = OpenPng(name);
    Session session;
    Reader reader(session);
    const auto damaged = [&] {
        return Failure(kExitFile, "cannot read '" + name + "': the PNG ends too early or is damaged (" +
                                      session.message + "); get a whole copy of it");
    };
    if (!reader.ReadHeader(file.get())) throw damaged();
    Frame picture(reader.Is16Bit() ? PK_PixelFormat_BGRA_4444_32f : PK_PixelFormat_BGRA_4444_8u,
                  reader.Width(), reader.Height());
    if (!reader.Is16Bit()) {
        std::vector<png_bytep> rows = RowPointers(picture);
        if (!reader.ReadRows(rows.data())) throw damaged();
        return picture;
    }
    Samples16 samples(picture.Width(), picture.Height());
    std::vector<png_bytep> rows = samples.Rows();
    if (!reader.ReadRows(rows.data())) throw damaged();
    Widen(samples, picture);
    return picture;
}

void WritePng(const Frame& picture, OutputFile& file) {
    const bool is16Bit = picture.Format() == PK_PixelFormat_BGRA_4444_32f;
    Samples16 samples(is16Bit ? picture.Width() : 0, is16Bit ? picture.Height() : 0);
    if (is16Bit) Narrow(picture, samples);
    // libpng reads the rows only, but takes pointers to write through.
    std::vector<png_bytep> rows = is16Bit ? samples.Rows() : RowPointers(const_cast<Frame&>(picture));
    const bool opaque = is16Bit ? IsOpaque<uint16_t>(rows, picture.Width(), 0xffff)
                                : IsOpaque<uint8_t>(rows, picture.Width(), 0xff);
    Session session;
    session.output = &file;
    Writer writer(session);
    if (writer.Write(picture.Width(), picture.Height(), is16Bit, opaque, rows.data())) return;
    if (session.outputFailure) std::rethrow_exception(session.outputFailure);
    throw Failure(kExitFailed, std::string("libpng cannot write the picture: ") + session.message);
}

void WritePng(const Frame& picture, const std::string& name) {
    OutputFile file(name);
    WritePng(picture, file);
    file.Commit();
}

} // namespace tool
