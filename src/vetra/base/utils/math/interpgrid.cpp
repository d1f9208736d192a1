#include "vetra/base/utils/math/interpgrid.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <new>

namespace {

struct Axis {
    unsigned int nPoints;
    double dfOffset;
    double dfSpacing;
};

template <std::size_t kAxes>
using Axes = std::array<Axis, kAxes>;

// Of a grid without layout.
constexpr Axis kNoAxis{0, 0.0, 1.0};

Axis LayoutAxis(double dfStart, double dfEnd, double dfSpacing) {
    const double dfRange = dfEnd - dfStart;
    if (dfSpacing == 0.0) {
        dfSpacing = dfRange * 0.25;
        if (dfSpacing == 0.0) {
            dfSpacing = 1.0;
        }
    }
    double dfPoints = std::ceil(dfRange / dfSpacing) + 1.0;
    // Also without a meaningful quotient.
    if (!(dfPoints >= 2.0)) {
        dfPoints = 2.0;
    }
    if (dfPoints > std::numeric_limits<unsigned int>::max()) {
        throw std::bad_array_new_length();
    }
    return {static_cast<unsigned int>(dfPoints), dfStart, dfSpacing};
}

template <std::size_t kAxes>
std::size_t CountPoints(const Axes<kAxes>& aoAxes) {
    std::size_t nPoints = 1;
    for (const Axis& oAxis : aoAxes) {
        nPoints *= oAxis.nPoints;
    }
    return nPoints;
}

template <std::size_t kAxes>
double* MakeArray(unsigned int nDimension, const Axes<kAxes>& aoAxes) {
    constexpr std::size_t kMaxSize = std::numeric_limits<std::ptrdiff_t>::max() / sizeof(double);
    // No factor but the last one is 0.
    std::size_t nSize = 1;
    const auto fnMultiply = [&](std::size_t nFactor) {
        if (nFactor > kMaxSize / nSize) {
            throw std::bad_array_new_length();
        }
        nSize *= nFactor;
    };
    for (const Axis& oAxis : aoAxes) {
        fnMultiply(oAxis.nPoints);
    }
    fnMultiply(nDimension);
    return new double[nSize];
}

template <std::size_t kAxes>
void WritePositions(const Axes<kAxes>& aoAxes, double* padfOut) {
    unsigned int anIndex[kAxes] = {};
    for (std::size_t n = CountPoints(aoAxes); n > 0; --n) {
        for (std::size_t a = 0; a < kAxes; ++a) {
            *padfOut++ = anIndex[a] * aoAxes[a].dfSpacing + aoAxes[a].dfOffset;
        }
        for (std::size_t a = kAxes; a-- > 0 && ++anIndex[a] == aoAxes[a].nPoints;) {
            anIndex[a] = 0;
        }
    }
}

template <std::size_t kAxes>
void Interpolate(const Axes<kAxes>& aoAxes, const std::array<double, kAxes>& adfPosition,
                 unsigned int nDimension, const double* padfValues, double* padfOut) {
    if (padfValues == nullptr) {
        std::fill_n(padfOut, nDimension, std::numeric_limits<double>::quiet_NaN());
        return;
    }
    // Corners in the order of the array. Each axis makes two of each corner so far.
    constexpr std::size_t kCorners = std::size_t{1} << kAxes;
    std::size_t anPoint[kCorners] = {0};
    double adfWeight[kCorners] = {1.0};
    std::size_t nCorners = 1;
    for (std::size_t a = 0; a < kAxes; ++a, nCorners *= 2) {
        const Axis& oAxis = aoAxes[a];
        const double f = (adfPosition[a] - oAxis.dfOffset) / oAxis.dfSpacing;
        // Above 0 cutting off is rounding down. A NaN goes to the first cell.
        const unsigned int nLast = oAxis.nPoints - 2;
        unsigned int i = 0;
        if (f >= nLast) {
            i = nLast;
        } else if (f > 0.0) {
            i = static_cast<unsigned int>(f);
        }
        const double t = f - i;
        for (std::size_t k = nCorners; k-- > 0;) {
            const std::size_t nPoint = anPoint[k] * oAxis.nPoints + i;
            const double dfWeight = adfWeight[k];
            anPoint[2 * k] = nPoint;
            anPoint[2 * k + 1] = nPoint + 1;
            adfWeight[2 * k] = dfWeight * (1.0 - t);
            adfWeight[2 * k + 1] = dfWeight * t;
        }
    }
    for (std::size_t c = 0; c < nDimension; ++c) {
        double dfSum = padfValues[anPoint[0] * nDimension + c] * adfWeight[0];
        for (std::size_t k = 1; k < kCorners; ++k) {
            dfSum += padfValues[anPoint[k] * nDimension + c] * adfWeight[k];
        }
        padfOut[c] = dfSum;
    }
}

}  // namespace

// What the three classes do alike, told once over their fields.
struct InterpGridAccess {
    static Axes<1> GetAxes(const InterpGrid1D& o) { return {{{o.numPoints, o.offset, o.spacing}}}; }

    static Axes<2> GetAxes(const InterpGrid2D& o) {
        return {{{o.numPointsX, o.offsetX, o.spacingX}, {o.numPointsY, o.offsetY, o.spacingY}}};
    }

    static Axes<3> GetAxes(const InterpGrid3D& o) {
        return {{{o.numPointsX, o.offsetX, o.spacingX},
                 {o.numPointsY, o.offsetY, o.spacingY},
                 {o.numPointsZ, o.offsetZ, o.spacingZ}}};
    }

    static void SetAxis(const Axis& oAxis, unsigned int& nPoints, double& dfOffset,
                        double& dfSpacing) {
        nPoints = oAxis.nPoints;
        dfOffset = oAxis.dfOffset;
        dfSpacing = oAxis.dfSpacing;
    }

    static void SetAxes(InterpGrid1D& o, const Axes<1>& aoAxes) {
        SetAxis(aoAxes[0], o.numPoints, o.offset, o.spacing);
    }

    static void SetAxes(InterpGrid2D& o, const Axes<2>& aoAxes) {
        SetAxis(aoAxes[0], o.numPointsX, o.offsetX, o.spacingX);
        SetAxis(aoAxes[1], o.numPointsY, o.offsetY, o.spacingY);
    }

    static void SetAxes(InterpGrid3D& o, const Axes<3>& aoAxes) {
        SetAxis(aoAxes[0], o.numPointsX, o.offsetX, o.spacingX);
        SetAxis(aoAxes[1], o.numPointsY, o.offsetY, o.spacingY);
        SetAxis(aoAxes[2], o.numPointsZ, o.offsetZ, o.spacingZ);
    }

    template <typename Grid>
    static void Unset(Grid& oGrid) {
        auto aoAxes = GetAxes(oGrid);
        aoAxes.fill(kNoAxis);
        SetAxes(oGrid, aoAxes);
        oGrid.values = nullptr;
    }

    template <typename Grid>
    static void Init(Grid& oGrid) {
        oGrid.dimension = 1;
        Unset(oGrid);
    }

    template <typename Grid>
    static void Clear(Grid& oGrid) {
        delete[] oGrid.values;
        Unset(oGrid);
    }

    // The old array goes first: two might not fit into memory.
    template <typename Grid, std::size_t kAxes>
    static void Layout(Grid& oGrid, unsigned int nDimension, const Axes<kAxes>& aoAxes) {
        Clear(oGrid);
        oGrid.dimension = nDimension;
        oGrid.values = MakeArray(nDimension, aoAxes);
        SetAxes(oGrid, aoAxes);
    }

    template <typename Grid>
    static void SetDimension(Grid& oGrid, unsigned int nDimension) {
        if (nDimension == oGrid.dimension) {
            return;
        }
        if (oGrid.values != nullptr) {
            Layout(oGrid, nDimension, GetAxes(oGrid));
        }
        oGrid.dimension = nDimension;
    }

    template <typename Grid>
    static void CopyFrom(Grid& oGrid, const Grid& oOther) {
        if (&oGrid == &oOther) {
            return;
        }
        if (oOther.values == nullptr) {
            Clear(oGrid);
            oGrid.dimension = oOther.dimension;
            return;
        }
        const auto aoAxes = GetAxes(oOther);
        Layout(oGrid, oOther.dimension, aoAxes);
        std::copy_n(oOther.values, CountPoints(aoAxes) * oOther.dimension, oGrid.values);
    }

    template <typename Grid>
    static unsigned int SizeBytes(const Grid& oGrid) {
        return static_cast<unsigned int>(CountPoints(GetAxes(oGrid)) * oGrid.dimension *
                                         sizeof(double));
    }
};

InterpGrid1D::InterpGrid1D() { Init(); }

InterpGrid1D::InterpGrid1D(const InterpGrid1D& oOther) {
    Init();
    CopyFrom(oOther);
}

InterpGrid1D& InterpGrid1D::operator=(const InterpGrid1D& oOther) {
    CopyFrom(oOther);
    return *this;
}

InterpGrid1D::~InterpGrid1D() { Clear(); }

void InterpGrid1D::Init() { InterpGridAccess::Init(*this); }
void InterpGrid1D::CopyFrom(const InterpGrid1D& oOther) {
    InterpGridAccess::CopyFrom(*this, oOther);
}
void InterpGrid1D::Clear() { InterpGridAccess::Clear(*this); }

void InterpGrid1D::SetDimension(unsigned int nDimension) {
    InterpGridAccess::SetDimension(*this, nDimension);
}

void InterpGrid1D::LayoutGrid(double dfStart, double dfEnd, double dfSpacing) {
    Clear();
    InterpGridAccess::Layout(*this, dimension, Axes<1>{{LayoutAxis(dfStart, dfEnd, dfSpacing)}});
}

void InterpGrid1D::GetVal(double x, double* padfOut) const {
    Interpolate<1>(InterpGridAccess::GetAxes(*this), {x}, dimension, values, padfOut);
}

void InterpGrid1D::GetGridPositions(double* padfOut) const {
    WritePositions(InterpGridAccess::GetAxes(*this), padfOut);
}

void InterpGrid1D::GetGridSize(unsigned int& nNumPoints) const { nNumPoints = numPoints; }

void InterpGrid1D::GetOffset(double& dfOffset) const { dfOffset = offset; }

void InterpGrid1D::GetSpacing(double& dfSpacing) const { dfSpacing = spacing; }

unsigned int InterpGrid1D::GetArraySizeBytes() const { return InterpGridAccess::SizeBytes(*this); }

InterpGrid2D::InterpGrid2D() { Init(); }

InterpGrid2D::InterpGrid2D(const InterpGrid2D& oOther) {
    Init();
    CopyFrom(oOther);
}

InterpGrid2D& InterpGrid2D::operator=(const InterpGrid2D& oOther) {
    CopyFrom(oOther);
    return *this;
}

InterpGrid2D::~InterpGrid2D() { Clear(); }

void InterpGrid2D::Init() { InterpGridAccess::Init(*this); }
void InterpGrid2D::CopyFrom(const InterpGrid2D& oOther) {
    InterpGridAccess::CopyFrom(*this, oOther);
}
void InterpGrid2D::Clear() { InterpGridAccess::Clear(*this); }

void InterpGrid2D::SetDimension(unsigned int nDimension) {
    InterpGridAccess::SetDimension(*this, nDimension);
}

void InterpGrid2D::LayoutGrid(double dfStartX, double dfStartY, double dfEndX, double dfEndY,
                              double dfSpacingX, double dfSpacingY) {
    Clear();
    InterpGridAccess::Layout(*this, dimension,
                             Axes<2>{{LayoutAxis(dfStartX, dfEndX, dfSpacingX),
                                      LayoutAxis(dfStartY, dfEndY, dfSpacingY)}});
}

void InterpGrid2D::GetVal(double x, double y, double* padfOut) const {
    Interpolate<2>(InterpGridAccess::GetAxes(*this), {x, y}, dimension, values, padfOut);
}

void InterpGrid2D::GetGridPositions(double* padfOut) const {
    WritePositions(InterpGridAccess::GetAxes(*this), padfOut);
}

void InterpGrid2D::GetGridSize(unsigned int& nNumPointsX, unsigned int& nNumPointsY) const {
    nNumPointsX = numPointsX;
    nNumPointsY = numPointsY;
}

void InterpGrid2D::GetOffsets(double& dfOffsetX, double& dfOffsetY) const {
    dfOffsetX = offsetX;
    dfOffsetY = offsetY;
}

void InterpGrid2D::GetSpacing(double& dfSpacingX, double& dfSpacingY) const {
    dfSpacingX = spacingX;
    dfSpacingY = spacingY;
}

std::size_t InterpGrid2D::GetNumGridPoints() const {
    return CountPoints(InterpGridAccess::GetAxes(*this));
}

unsigned int InterpGrid2D::GetArraySizeBytes() const { return InterpGridAccess::SizeBytes(*this); }

InterpGrid3D::InterpGrid3D() { Init(); }

InterpGrid3D::InterpGrid3D(const InterpGrid3D& oOther) {
    Init();
    CopyFrom(oOther);
}

InterpGrid3D& InterpGrid3D::operator=(const InterpGrid3D& oOther) {
    CopyFrom(oOther);
    return *this;
}

InterpGrid3D::~InterpGrid3D() { Clear(); }

void InterpGrid3D::Init() { InterpGridAccess::Init(*this); }
void InterpGrid3D::CopyFrom(const InterpGrid3D& oOther) {
    InterpGridAccess::CopyFrom(*this, oOther);
}
void InterpGrid3D::Clear() { InterpGridAccess::Clear(*this); }

void InterpGrid3D::SetDimension(unsigned int nDimension) {
    InterpGridAccess::SetDimension(*this, nDimension);
}

void InterpGrid3D::LayoutGrid(double dfStartX, double dfStartY, double dfStartZ, double dfEndX,
                              double dfEndY, double dfEndZ, double dfSpacingX, double dfSpacingY,
                              double dfSpacingZ) {
    Clear();
    InterpGridAccess::Layout(
        *this, dimension,
        Axes<3>{{LayoutAxis(dfStartX, dfEndX, dfSpacingX), LayoutAxis(dfStartY, dfEndY, dfSpacingY),
                 LayoutAxis(dfStartZ, dfEndZ, dfSpacingZ)}});
}

void InterpGrid3D::GetVal(double x, double y, double z, double* padfOut) const {
    Interpolate<3>(InterpGridAccess::GetAxes(*this), {x, y, z}, dimension, values, padfOut);
}

void InterpGrid3D::GetGridPositions(double* padfOut) const {
    WritePositions(InterpGridAccess::GetAxes(*this), padfOut);
}

void InterpGrid3D::GetGridSize(unsigned int& nNumPointsX, unsigned int& nNumPointsY,
                               unsigned int& nNumPointsZ) const {
    nNumPointsX = numPointsX;
    nNumPointsY = numPointsY;
    nNumPointsZ = numPointsZ;
}

void InterpGrid3D::GetOffsets(double& dfOffsetX, double& dfOffsetY, double& dfOffsetZ) const {
    dfOffsetX = offsetX;
    dfOffsetY = offsetY;
    dfOffsetZ = offsetZ;
}

void InterpGrid3D::GetSpacing(double& dfSpacingX, double& dfSpacingY, double& dfSpacingZ) const {
    dfSpacingX = spacingX;
    dfSpacingY = spacingY;
    dfSpacingZ = spacingZ;
}

std::size_t InterpGrid3D::GetNumGridPoints() const {
    return CountPoints(InterpGridAccess::GetAxes(*this));
}

unsigned int InterpGrid3D::GetArraySizeBytes() const { return InterpGridAccess::SizeBytes(*this); }
