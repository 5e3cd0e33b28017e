#pragma once

// What the help says below the options of a command.

namespace tool {

inline constexpr const char* kExitCodes =
    "Exit codes:\n"
    "  0  done\n"
    "  1  the library refuses the operation, or a comparison is above its limit\n"
    "  2  wrong usage: an option, a size or the name of a format\n"
    "  3  a file cannot be read or written, or is not what it should be\n";

inline constexpr const char* kConvertNotes =
    "A name that ends in .png is a PNG file; all others hold raw frames, and - stands for standard input or\n"
    "output. Raw frames follow each other with nothing between. Their rows are padded as in memory, or have\n"
    "no padding with --packed, and the first row in the file is the first in memory: for a format that\n"
    "'pixelkiln formats' lists with first row 'bottom', the bottom row of the picture.\n"
    "A PNG is taken in BGRA, with 16 bits a sample as float, and --from takes it on to that format first. "
    "On\n"
    "the way to a PNG the picture goes through the format of --to, so that its losses show. Profiles and\n"
    "gamma notes of a PNG are not applied.\n\n"
    "Examples:\n"
    "  pixelkiln convert photo.png photo.v210 --to V210_422_10u\n"
    "  pixelkiln convert photo.v210 photo.png --from V210_422_10u --size 512x512\n"
    "  pixelkiln convert clip.yuv frame-%04d.png --from UYVY_422_8u --size 720x576 --packed\n";

inline constexpr const char* kFillNotes =
    "A PNG is written from the format of --to, so that its losses show. 4:2:2 formats are filled in whole\n"
    "pairs of pixels, and V210 with R,G,B,A in whole groups of six: what is left of a row stays 0.\n\n"
    "Examples:\n"
    "  pixelkiln fill black.v210 --size 1920x1080 --to V210_422_10u --colour black\n"
    "  pixelkiln fill orange.png --size 640x360 --colour 255,128,0,255\n";

inline constexpr const char* kOperationNotes =
    "Files are named and read as by 'pixelkiln convert'. The work is done in the format of --from; a PNG\n"
    "without it is BGRA, with 16 bits a sample as float. Directions and places are those of the picture as\n"
    "one sees it, from its top left corner.\n";

inline constexpr const char* kColourNotes =
    "Files are named and read as by 'pixelkiln convert'; raw frames are BGRA_4444_32f. Spaces:\n"
    "  srgb           IEC 61966-2-1\n"
    "  rec709         BT.709 primaries, power 2.4 (BT.1886): the hub, through which every conversion goes\n"
    "  gamma:0.45     BT.709 primaries, a power law: the exponent from linear to encoded; 1 is linear light\n"
    "  rec2020        BT.2020 primaries, power 2.4\n"
    "  p3, p3-d65     P3 primaries, white D65, power 2.6\n"
    "  p3-d60, p3-dci the same with white D60, and with the white of projection\n"
    "  pq, pq-p3      SMPTE ST 2084 with BT.2020 or P3 primaries; the signal 1 is 10000 cd/m2\n"
    "  pq-normalised, pq-p3-normalised\n"
    "                 the same, scaled so that 1 is 100 cd/m2\n"
    "  hlg            BT.2100 hybrid log-gamma on a display of 1000 cd/m2\n"
    "In all others an encoded 1 is 100 cd/m2, and values above it are highlights. Raw frames keep them; a "
    "PNG\n"
    "clips it, and the last line tells how much. A PNG takes up no note of its space. PQ and HLG want\n"
    "--png-depth 16, since 8 bits show bands.\n\n"
    "--gamut-clip works towards srgb, rec2020 and p3, and from those and pq towards srgb, rec709 and "
    "gamma.\n\n"
    "--exposure, --slope and --knee, always together, first bend the luminance of the source into the range\n"
    "of standard video: 10000 / exposure cd/m2 becomes white, slope is the gain around the centre, and at "
    "the\n"
    "level of the knee the curve leaves the straight line. Only srgb, rec709, rec2020 and p3 have this. In\n"
    "rec2020 and p3 the library leaves linear light, which the program encodes again before it goes on.\n\n"
    "Examples:\n"
    "  pixelkiln colour photo.png photo-pq.png --from srgb --to pq --png-depth 16\n"
    "  pixelkiln colour clip.raw clip-709.raw --from pq --to rec709 --size 1920x1080\n"
    "  pixelkiln colour clip-709.raw clip-%04d.png --from rec709 --to srgb --size 1920x1080 \\\n"
    "      --exposure 10 --slope 1.5 --knee 0.7\n";

inline constexpr const char* kCurvesNotes =
    "Four plots: encoded over linear value up to 100 cd/m2 and over luminance up to 10000 cd/m2, and the "
    "tone\n"
    "curve of some slopes and knees. Every point is what the library computes.\n\n"
    "Example:\n"
    "  pixelkiln curves curves.svg\n";

} // namespace tool
