#include "colour/Rec2020Matrices.h"

#include "colour/MatrixColumn.h"
#include "primitives/FirstUse.h"

namespace PK {

const CSMatrix& Rec709ToRec2020() {
    static constinit FirstUse<CSMatrix> sMatrix;
    return sMatrix.Get([] {
        return MatrixOf({0.6274020f, 0.3292920f, 0.0433061f, //
                         0.0690955f, 0.9195440f, 0.0113602f, //
                         0.0163937f, 0.0880281f, 0.8955780f});
    });
}

const CSMatrix& Rec2020ToRec709() {
    static constinit FirstUse<CSMatrix> sMatrix;
    return sMatrix.Get([] {
        return MatrixOf({1.6605000f, -0.5876570f, -0.0728399f, //
                         -0.1245470f, 1.1329000f, -0.0083480f, //
                         -0.0181537f, -0.1005970f, 1.1187500f});
    });
}

} // namespace PK
