#include "support/DVFrames.h"

#include <fstream>
#include <iterator>
#include <stdexcept>

namespace PKTest {

std::vector<uint8_t> ReadDVFrame(const std::string& name) {
    const std::string path = PIXELKILN_MEDIA_DIR "/dv/" + name + ".dif";
    std::ifstream file(path, std::ios::binary);
    if (!file) throw std::runtime_error(path + " cannot be read");
    return {std::istreambuf_iterator<char>(file), {}};
}

} // namespace PKTest
