#pragma once

// The matrices between linear Rec. 709 and Rec. 2020 as they are fixed to six digits (ITU-R BT.2087 has four).

#include <PixelKiln/ColorSpace.h>

namespace PK {

const CSMatrix& Rec709ToRec2020();
const CSMatrix& Rec2020ToRec709();

} // namespace PK
