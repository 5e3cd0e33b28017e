#include "support/Photograph.h"

#include <png.h>

#include <stdexcept>

namespace PKTest {

Photograph ReadPhotograph(const std::string& name) {
    png_image image{};
    image.version = PNG_IMAGE_VERSION;
    const std::string path = PIXELKILN_MEDIA_DIR "/" + name;
    if (!png_image_begin_read_from_file(&image, path.c_str()))
        throw std::runtime_error(path + ": " + image.message);
    image.format = PNG_FORMAT_BGRA;
    Photograph photograph{static_cast<int32_t>(image.width), static_cast<int32_t>(image.height),
                          std::vector<uint8_t>(PNG_IMAGE_SIZE(image))};
    if (!png_image_finish_read(&image, nullptr, photograph.pixels.data(), 0, nullptr))
        throw std::runtime_error(path + ": " + image.message);
    return photograph;
}

} // namespace PKTest
