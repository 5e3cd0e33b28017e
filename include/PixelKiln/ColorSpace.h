#pragma once

/// \file
/// Colour spaces: chromaticities and the matrices that follow from them, transfer functions, and the conversion of
/// float pixels to and from the hub.
///
/// The hub of all pixel conversions is Rec. 709 primaries with a pure 2.4 power law; 1.0 in linear light is 100 cd/m2,
/// and values above 1.0 are real highlights. Pixels are four floats in memory order B, G, R, A (V, U, Y, A on the
/// YCbCr side); alpha is carried over unless told otherwise.
///
/// Nothing here needs PK_Initialize. Nothing reports failure: bad numbers follow the rules of IEEE 754. Every const
/// operation may run on any number of threads at once, on one object or many; source and destination pixels may be the
/// same memory, but must not overlap otherwise. The vector bodies follow the processor alone, not the switches of
/// PK_SetDebugFlag.

#include <PixelKiln/Types.h>

#include <cstdint>

namespace PK {

/// A 3 x 3 matrix of floats, row by row: applied to a column (R, G, B), the first row gives X, and so on.
class PK_API CSMatrix {
public:
    float m[9];

    /// The identity.
    CSMatrix();

    /// The matrix product: `other` is applied first.
    CSMatrix operator*(const CSMatrix& other) const;

    CSMatrix Transposed() const;

    /// The inverse, by cofactors.
    /// \param ok  set to whether there is one, that is, the absolute determinant is not below 1e-6; may be null.
    /// \return the inverse, or the identity where there is none.
    CSMatrix Inverted(bool* ok = nullptr) const;
};

/// A standard illuminant: a row of the table behind ColorSpace::Illuminant.
enum PK_Illuminant : uint32_t {
    kIlluminantD50 = 0, ///< x 0.34567, y 0.3585.
    kIlluminantD55 = 1, ///< x 0.33242, y 0.34743.
    kIlluminantD60 = 2, ///< x 0.32168, y 0.33767.
    kIlluminantDCI = 3, ///< x 0.314, y 0.351: the white of DCI projection.
    kIlluminantD65 = 4, ///< x 0.31271, y 0.32902.
    kIlluminantD75 = 5, ///< x 0.29902, y 0.31485.
};

/// A shared instance, see ColorSpace::WorkingSpace.
enum PK_WorkingSpace : uint32_t {
    kWorkingSpaceRec709 = 0,
    kWorkingSpaceRec2020 = 1,
    kWorkingSpaceDCIP3D60 = 2,
    kWorkingSpaceDCIP3D65 = 3,
    kWorkingSpacePQRec2020 = 4, ///< PQ, Rec. 2020 primaries, normalised.
    kWorkingSpacePQP3 = 5,      ///< PQ, P3 primaries with D65, normalised.
    kWorkingSpaceSRGB = 6,      ///< So is every other value.
};

/// An RGB colour space. A host may derive its own.
class PK_API ColorSpace {
public:
    ColorSpace();
    ColorSpace(const ColorSpace& other);
    ColorSpace(ColorSpace&& other);
    ColorSpace& operator=(const ColorSpace& other);
    ColorSpace& operator=(ColorSpace&& other);

    /// \return six floats: x and y of red, green and blue (CIE 1931). They live as long as the object.
    virtual const float* Primaries() const = 0;

    /// \return x and y of white. They live as long as the object; all spaces of the library return a row of the table of
    ///         illuminants.
    virtual const float* WhitePoint() const = 0;

    /// \return three floats, the weights of linear red, green and blue in luminance. They live as long as the object.
    virtual const float* LuminanceCoeffs() const = 0;

    /// The encoded value of a linear one.
    virtual float LinearToEOTF(float linear) const = 0;

    /// The linear value of an encoded one.
    virtual float EOTFToLinear(float encoded) const = 0;

    /// Converts pixels of the hub to this space.
    /// \param source       B, G, R, A.
    /// \param destination  B, G, R, A.
    /// \param count        pixels; below 1 does nothing.
    /// \param gamutClip    pull colours outside the gamut towards their luminance; not all spaces have it.
    virtual void ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                         bool gamutClip) const = 0;

    /// Converts pixels of this space to the hub. Arguments as for ConvertPixelsFromRec709.
    virtual void ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                                       bool gamutClip) const = 0;

    /// Bends the luminance of pixels of a wider range into that of standard video, by a curve in the logarithm of
    /// luminance, and keeps the chromaticity. Some spaces do nothing, not even copy: each says so.
    /// \param source       B, G, R, A, encoded.
    /// \param destination  B, G, R, A.
    /// \param count        pixels; below 1 does nothing.
    /// \param exposure     factor on linear luminance ahead of the curve.
    /// \param slope        gain of the curve around its centre, above 0. With 0 the curve is flat.
    /// \param knee         output level, up to 1, at which the curve leaves the straight line; 1 gives NaN.
    virtual void CompressPixelsToSDR(const float* source, float* destination, int32_t count, float exposure,
                                     float slope, float knee) const = 0;

    /// The matrix from linear RGB to CIE XYZ with Y = 1 for white (SMPTE RP 177), calculated anew from Primaries and
    /// WhitePoint. The reference lives as long as the object.
    const CSMatrix& RGBtoXYZ() const;

    /// Its inverse.
    const CSMatrix& XYZtoRGB() const;

    /// \param illuminant  must be one of the enumerators: it is not checked.
    /// \return x and y, in a table of the library.
    static const float* Illuminant(PK_Illuminant illuminant);

    /// The matrix from linear RGB of one space to linear RGB of the other, with Bradford adaptation where their whites
    /// differ by more than 1e-6. That of a space with itself is the product of a matrix and its inverse, which is not the
    /// exact identity.
    static CSMatrix CalculateConversionMatrix(const ColorSpace& from, const ColorSpace& to);

    /// The Bradford adaptation of XYZ from one white to another; the identity if three floats behind both pointers differ
    /// by no more than 1e-6.
    /// \param fromWhite  x and y. Where they equal the other two, a third float is read, as the rows of the table of
    ///                   illuminants have it.
    /// \param toWhite    likewise.
    static CSMatrix CalculateAdaptationMatrix(const float* fromWhite, const float* toWhite);

    /// \return a shared instance, which lives as long as the library.
    static const ColorSpace& WorkingSpace(PK_WorkingSpace which);

protected:
    /// Nothing is deleted through this class.
    ~ColorSpace() = default;

    /// \param coeffs  set to the Y row of RGBtoXYZ, three floats.
    void CalculateLumaCoeffs(float* coeffs) const;

    /// Refreshes both matrices.
    void CalculateMatrices() const;

    mutable CSMatrix rgbToXYZ;
    mutable CSMatrix xyzToRGB;
    mutable bool matricesValid = false;
};

/// IEC 61966-2-1 (sRGB). Negative values take the linear segment, however large.
class PK_API SRGBColorSpace : public ColorSpace {
public:
    SRGBColorSpace();
    SRGBColorSpace(const SRGBColorSpace& other);
    SRGBColorSpace(SRGBColorSpace&& other);
    SRGBColorSpace& operator=(const SRGBColorSpace& other);
    SRGBColorSpace& operator=(SRGBColorSpace&& other);

    const float* Primaries() const override;
    const float* WhitePoint() const override;
    const float* LuminanceCoeffs() const override;
    float LinearToEOTF(float linear) const override;
    float EOTFToLinear(float encoded) const override;
    /// The gamut is clipped on encoded values.
    void ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                 bool gamutClip) const override;
    /// The gamut is clipped on encoded values.
    void ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                               bool gamutClip) const override;
    void CompressPixelsToSDR(const float* source, float* destination, int32_t count, float exposure,
                             float slope, float knee) const override;
};

/// The primaries of Rec. 709 with a power law of the caller's.
class PK_API GammaColorSpace : public SRGBColorSpace {
public:
    /// \param gamma  the exponent from linear to encoded.
    GammaColorSpace(float gamma = 0.45f);
    GammaColorSpace(const GammaColorSpace& other);
    GammaColorSpace(GammaColorSpace&& other);
    GammaColorSpace& operator=(const GammaColorSpace& other);
    GammaColorSpace& operator=(GammaColorSpace&& other);

    /// sign(v) |v|^gamma.
    float LinearToEOTF(float linear) const override;
    float EOTFToLinear(float encoded) const override;
    /// gamutClip has no effect: the primaries are those of the hub.
    void ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                 bool gamutClip) const override;
    /// gamutClip has no effect.
    void ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                               bool gamutClip) const override;
    /// Does nothing.
    void CompressPixelsToSDR(const float* source, float* destination, int32_t count, float exposure,
                             float slope, float knee) const override;

protected:
    float gamma;
};

/// ITU-R BT.709 primaries with the 2.4 power law of ITU-R BT.1886: the hub itself.
class PK_API Rec709ColorSpace : public GammaColorSpace {
public:
    Rec709ColorSpace();
    Rec709ColorSpace(const Rec709ColorSpace& other);
    Rec709ColorSpace(Rec709ColorSpace&& other);
    Rec709ColorSpace& operator=(const Rec709ColorSpace& other);
    Rec709ColorSpace& operator=(Rec709ColorSpace&& other);

    /// Copies; does nothing where source and destination are one.
    void ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                 bool gamutClip) const override;
    /// Copies; does nothing where source and destination are one.
    void ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                               bool gamutClip) const override;
    void CompressPixelsToSDR(const float* source, float* destination, int32_t count, float exposure,
                             float slope, float knee) const override;
};

/// ITU-R BT.2020 primaries with the 2.4 power law, and its non-constant-luminance YCbCr.
class PK_API Rec2020ColorSpace : public Rec709ColorSpace {
public:
    Rec2020ColorSpace();
    Rec2020ColorSpace(const Rec2020ColorSpace& other);
    Rec2020ColorSpace(Rec2020ColorSpace&& other);
    Rec2020ColorSpace& operator=(const Rec2020ColorSpace& other);
    Rec2020ColorSpace& operator=(Rec2020ColorSpace&& other);

    const float* Primaries() const override;
    const float* WhitePoint() const override;
    const float* LuminanceCoeffs() const override;
    void ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                 bool gamutClip) const override;
    void ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                               bool gamutClip) const override;
    /// Leaves linear pixels: there is no encoding at the end.
    void CompressPixelsToSDR(const float* source, float* destination, int32_t count, float exposure,
                             float slope, float knee) const override;

    /// Encoded Cr, Cb, Y, alpha (chroma about 0) to encoded B, G, R, alpha.
    /// \param count  pixels; below 1 does nothing.
    virtual void ConvertPixelsFromYUVtoRGB(const float* source, float* destination, int32_t count) const;

    /// Encoded B, G, R, alpha to encoded Cr, Cb, Y (chroma about 0). The fourth float becomes blue in the pixels of whole
    /// groups of eight, and is alpha in the rest.
    /// \param count  pixels; below 1 does nothing.
    virtual void ConvertPixelsFromRGBtoYUV(const float* source, float* destination, int32_t count) const;
};

/// The primaries of SMPTE RP 431-2 (P3), with a white of choice and the 2.6 power law of projection.
class PK_API DCIP3ColorSpace : public GammaColorSpace {
public:
    /// \param illuminant  must be one of the enumerators: it is not checked.
    DCIP3ColorSpace(PK_Illuminant illuminant = kIlluminantD65);
    DCIP3ColorSpace(const DCIP3ColorSpace& other);
    DCIP3ColorSpace(DCIP3ColorSpace&& other);
    DCIP3ColorSpace& operator=(const DCIP3ColorSpace& other);
    DCIP3ColorSpace& operator=(DCIP3ColorSpace&& other);

    const float* Primaries() const override;
    const float* WhitePoint() const override;
    /// Calculated from primaries and white.
    const float* LuminanceCoeffs() const override;
    void ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                 bool gamutClip) const override;
    void ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                               bool gamutClip) const override;
    /// Leaves linear pixels: there is no encoding at the end.
    void CompressPixelsToSDR(const float* source, float* destination, int32_t count, float exposure,
                             float slope, float knee) const override;

private:
    PK_Illuminant illuminant;
    mutable float lumCoeffs[3] = {};
    mutable CSMatrix fromRec709;
    mutable CSMatrix toRec709;
    mutable bool fromRec709Valid = false;
    mutable bool toRec709Valid = false;
};

/// ITU-R BT.2100 hybrid log-gamma (ARIB STD-B67) on Rec. 2020 primaries, shown at a peak of 1000 cd/m2 with its system
/// gamma of 1.2. The curve depends on all three channels, and so lives in the pixel conversions alone.
class PK_API HLGColorSpace : public Rec2020ColorSpace {
public:
    HLGColorSpace();
    HLGColorSpace(const HLGColorSpace& other);
    HLGColorSpace(HLGColorSpace&& other);
    HLGColorSpace& operator=(const HLGColorSpace& other);
    HLGColorSpace& operator=(HLGColorSpace&& other);

    /// \return the argument.
    float LinearToEOTF(float linear) const override;
    /// \return the argument.
    float EOTFToLinear(float encoded) const override;
    /// gamutClip has no effect.
    void ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                 bool gamutClip) const override;
    /// The signal is clamped to 0 to 1, and decoded in 2047 steps. gamutClip has no effect.
    void ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                               bool gamutClip) const override;
    /// Does nothing.
    void CompressPixelsToSDR(const float* source, float* destination, int32_t count, float exposure,
                             float slope, float knee) const override;
};

/// SMPTE ST 2084 (PQ), with D65. A normalised space has the signal 1.0 at 100 cd/m2 instead of at 10000 cd/m2.
class PK_API PQColorSpace : public ColorSpace {
public:
    /// \param useP3       the primaries of P3 instead of those of Rec. 2020.
    /// \param normalized  see above.
    PQColorSpace(bool useP3, bool normalized);

    /// \param primaries   x and y of red, green and blue, six floats, which are copied.
    /// \param normalized  see above.
    PQColorSpace(const float* primaries, bool normalized);

    PQColorSpace(const PQColorSpace& other);
    PQColorSpace(PQColorSpace&& other);
    PQColorSpace& operator=(const PQColorSpace& other);
    PQColorSpace& operator=(PQColorSpace&& other);

    const float* Primaries() const override;
    const float* WhitePoint() const override;
    const float* LuminanceCoeffs() const override;
    /// Below 0 is NaN.
    float LinearToEOTF(float linear) const override;
    /// Below the signal of black is NaN.
    float EOTFToLinear(float encoded) const override;
    /// gamutClip has no effect.
    void ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                 bool gamutClip) const override;
    /// Without normalisation and gamutClip the signal is clamped to 0 to 1, and decoded in 4095 steps.
    void ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                               bool gamutClip) const override;
    /// Does nothing.
    void CompressPixelsToSDR(const float* source, float* destination, int32_t count, float exposure,
                             float slope, float knee) const override;

private:
    float primaries[6];
    mutable float lumCoeffs[3] = {};
    float scale = 1;
    bool hasScale = false;
    DCIP3ColorSpace p3;
    mutable CSMatrix fromRec709;
    mutable CSMatrix toRec709;
    mutable bool fromRec709Valid = false;
    mutable bool toRec709Valid = false;
};

/// Limits float samples to a range. The rows are walked one behind: `rows` of 2 and more leave the last row as it is.
/// \param source       rows of floats.
/// \param destination  rows of floats; may be the source, must not overlap it otherwise.
/// \param rows         below 1 does nothing.
/// \param rowBytes     of both images; the floats that fit into it are treated; below 4 does nothing. Where it is no
///                     multiple of 4, a row begins at the multiple below its place.
/// \param minValue     what smaller samples become. NaN becomes it too at the end of a row, behind the last group of 32
///                     floats, and maxValue in the groups.
/// \param maxValue     what larger samples become.
PK_API void ClampFloatPixels(const float* source, float* destination, int32_t rows, int32_t rowBytes,
                             float minValue, float maxValue);

} // namespace PK
