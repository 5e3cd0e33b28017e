# Listings, chains, and how names of formats are read.
. "$(dirname "$0")/expect.sh"

is "lines of the catalogue" "$("$program" formats --csv | wc -l)" 72
is "raster formats" "$("$program" formats --csv | grep -c ,raster,)" 47
expect 0 "0x851      V210_422_10u                       raster           2.67  -              top" formats
expect 0 "0x4        BGRA_4444_8u                       raster              4  -              bottom" formats
expect 0 "0x1000821  NTSCDV25                           DV                  -  120000" formats
is "kernels with a body for AVX2 or less" "$("$program" kernels --csv | grep -c 'none,none')" 0
expect 0 "CopyRow" kernels
expect 0 "PixelKiln   0." info

is "chain of ARGB to VUYA" "$("$program" explain ARGB_4444_8u VUYA_4444_8u | awk 'NR > 2 {print $2, $4}' | tr '\n' ';')" \
    "SwapOrderRow BGRA_4444_8u;RGBToYUV601Row VUYA_4444_8u;"
is "chain of BGRA to RGB 10-bit" "$("$program" explain BGRA_4444_8u RGB_444_10u | awk 'NR > 2 {print $2}' | tr '\n' ';')" \
    "ExpandTo32fRow;PremultiplyRow;BGR32fToRGB10uRow;"
expect 0 "SwapOrderRow" explain bgra_4444_8u 0x1004
expect 1 "NTSCDV25 is a stream" explain BGRA_4444_8u NTSCDV25

expect 2 "did you mean V210_422_10u or V210_422_10u_709;" explain V210 BGRA_4444_8u
expect 2 "did you mean BGRA_4444_8u or" explain BGRA_444_8u BGRA_4444_8u
expect 2 "there is no pixel format 'nonsense'; 'pixelkiln formats' lists all" explain nonsense BGRA_4444_8u
expect 2 "no pixel format has the number 0x99" explain 0x99 BGRA_4444_8u
expect 2 "no pixel format has the number 0x4g" explain 0x4g BGRA_4444_8u

expect 2 "DST is required" explain BGRA_4444_8u
expect 2 "quality" explain BGRA_4444_8u BGRP_4444_8u --quality 6

finish
