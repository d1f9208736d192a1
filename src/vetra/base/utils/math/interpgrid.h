#ifndef VETRA_BASE_UTILS_MATH_INTERPGRID_H
#define VETRA_BASE_UTILS_MATH_INTERPGRID_H

#include <cstddef>

#include "vetra/export.h"

/// \file
/// Regular grids of vector-valued samples, with linear interpolation between them, for one, two and
/// three axes. The three classes are alike; what is said of InterpGrid3D goes for the others with
/// fewer axes.

struct InterpGridAccess;

/// A grid over one axis; see InterpGrid3D.
class VETRA_EXPORT InterpGrid1D {
 public:
    /// Dimension 1, no layout.
    InterpGrid1D();
    /// Copies the array too.
    InterpGrid1D(const InterpGrid1D& oOther);
    /// Copies the array too. When there is no memory for it (std::bad_alloc) the grid is left
    /// without layout.
    InterpGrid1D& operator=(const InterpGrid1D& oOther);
    ~InterpGrid1D();

    /// Number of doubles at each point.
    unsigned int GetDimension() const { return dimension; }
    /// As `InterpGrid3D::SetDimension`.
    /// \throws std::bad_alloc when there is no memory for the new array.
    void SetDimension(unsigned int nDimension);

    /// Discards what there is and lays the grid out from start to end of each axis, as
    /// `InterpGrid3D::LayoutGrid`.
    /// \throws std::bad_alloc as that one
    void LayoutGrid(double dfStart, double dfEnd, double dfSpacing);
    /// Interpolates linearly, and extrapolates outside, as `InterpGrid3D::GetVal`. \p padfOut takes
    /// [dimension] doubles; NaN if the grid has no layout.
    void GetVal(double x, double* padfOut) const;
    /// \param padfOut  takes [points] doubles
    void GetGridPositions(double* padfOut) const;

    /// The number of points; 0 without layout.
    void GetGridSize(unsigned int& nNumPoints) const;
    /// The number of points; 0 without layout.
    std::size_t GetNumGridPoints() const { return numPoints; }
    /// Position of the first point; 0 without layout.
    void GetOffset(double& dfOffset) const;
    /// Distance of neighbouring points; 1 without layout.
    void GetSpacing(double& dfSpacing) const;
    /// [points x dimension]
    double* GetArray() const { return values; }
    /// Size of the array in bytes, modulo 2^32.
    unsigned int GetArraySizeBytes() const;

 protected:
    /// Makes the members those of a new grid, whatever they were: frees nothing.
    void Init();
    /// What the assignment does.
    void CopyFrom(const InterpGrid1D& oOther);
    /// Frees the array. The dimension stays, the layout goes.
    void Clear();

 private:
    friend struct InterpGridAccess;

    unsigned int dimension;
    unsigned int numPoints;
    double offset;
    double spacing;
    double* values;
};

/// A grid over two axes; see InterpGrid3D.
class VETRA_EXPORT InterpGrid2D {
 public:
    /// Dimension 1, no layout.
    InterpGrid2D();
    /// Copies the array too.
    InterpGrid2D(const InterpGrid2D& oOther);
    /// Copies the array too. When there is no memory for it (std::bad_alloc) the grid is left
    /// without layout.
    InterpGrid2D& operator=(const InterpGrid2D& oOther);
    ~InterpGrid2D();

    /// Number of doubles at each point.
    unsigned int GetDimension() const { return dimension; }
    /// As `InterpGrid3D::SetDimension`.
    /// \throws std::bad_alloc when there is no memory for the new array.
    void SetDimension(unsigned int nDimension);

    /// Discards what there is and lays the grid out from start to end of each axis, as
    /// `InterpGrid3D::LayoutGrid`.
    /// \throws std::bad_alloc as that one
    void LayoutGrid(double dfStartX, double dfStartY, double dfEndX, double dfEndY,
                    double dfSpacingX, double dfSpacingY);
    /// Interpolates linearly, and extrapolates outside, as `InterpGrid3D::GetVal`. \p padfOut takes
    /// [dimension] doubles; NaN if the grid has no layout.
    void GetVal(double x, double y, double* padfOut) const;
    /// \param padfOut  takes [points X x points Y x 2] doubles, pairs of x and y
    void GetGridPositions(double* padfOut) const;

    /// The numbers of points; 0 without layout.
    void GetGridSize(unsigned int& nNumPointsX, unsigned int& nNumPointsY) const;
    /// The product of the numbers of points.
    std::size_t GetNumGridPoints() const;
    /// Position of the first point on each axis; 0 without layout.
    void GetOffsets(double& dfOffsetX, double& dfOffsetY) const;
    /// Distance of neighbouring points on each axis; 1 without layout.
    void GetSpacing(double& dfSpacingX, double& dfSpacingY) const;
    /// [points X x points Y x dimension]
    double* GetArray() const { return values; }
    /// Size of the array in bytes, modulo 2^32.
    unsigned int GetArraySizeBytes() const;

 protected:
    /// Makes the members those of a new grid, whatever they were: frees nothing.
    void Init();
    /// What the assignment does.
    void CopyFrom(const InterpGrid2D& oOther);
    /// Frees the array. The dimension stays, the layout goes.
    void Clear();

 private:
    friend struct InterpGridAccess;

    unsigned int dimension;
    unsigned int numPointsX;
    unsigned int numPointsY;
    double offsetX;
    double offsetY;
    double spacingX;
    double spacingY;
    double* values;
};

/// A regular grid of vectors over three axes, evaluated by linear interpolation.
///
/// Lay the grid out, fill the array of `GetArray` at the positions of `GetGridPositions`, and call
/// `GetVal` anywhere.
///
/// **Samples.** [points X x points Y x points Z x dimension] doubles: X varies slowest, the
/// component of the vector fastest. Component c of point (i, j, k) is element
/// ((i * points Y + j) * points Z + k) * dimension + c. Point i lies at i * spacing + offset on its
/// axis.
///
/// A new grid has dimension 1 and no layout: no points, offsets 0, spacings 1, no array. Arguments
/// are not checked. When there is no memory for an array (std::bad_alloc) the grid is left without
/// layout, because the old array goes before the new one comes.
///
/// `GetVal` and the getters may run concurrently on one grid.
class VETRA_EXPORT InterpGrid3D {
 public:
    /// Dimension 1, no layout.
    InterpGrid3D();
    /// Copies the array too.
    InterpGrid3D(const InterpGrid3D& oOther);
    /// Copies the array too. When there is no memory for it (std::bad_alloc) the grid is left
    /// without layout.
    InterpGrid3D& operator=(const InterpGrid3D& oOther);
    ~InterpGrid3D();

    /// Number of doubles at each point.
    unsigned int GetDimension() const { return dimension; }
    /// Sets the number of doubles at each point. A number other than the present one replaces the
    /// array, if there is one, by one that is not initialised.
    /// \throws std::bad_alloc when there is no memory for it.
    void SetDimension(unsigned int nDimension);

    /// Discards what there is and lays the grid out from start to end of each axis.
    ///
    /// An axis has ceil((end - start) / spacing) + 1 points and at least 2, the first one at its
    /// start. So the last one is at the end or less than a spacing behind it. A spacing of 0 means
    /// a quarter of the range, and 1 if that is 0 too. A range with the opposite sign to the
    /// spacing gives 2 points.
    ///
    /// The array is not initialised.
    /// \throws std::bad_alloc when there is no memory for it, or an axis has more than 2^32 - 1
    ///         points.
    void LayoutGrid(double dfStartX, double dfStartY, double dfStartZ, double dfEndX, double dfEndY,
                    double dfEndZ, double dfSpacingX, double dfSpacingY, double dfSpacingZ);

    /// Interpolates linearly along each axis, within the cell around a position. Outside the grid
    /// the outermost cell's function goes on: positions there are extrapolated.
    ///
    /// With f = (position - offset) / spacing and i = floor(f), limited to 0 and points - 2, the
    /// weights along an axis are 1 - t at point i and t at i + 1, with t = f - i. A component is
    /// the sum of sample times weight over the cell's corners in the order of the array, a corner's
    /// weight being (X times Y) times Z.
    ///
    /// \param x        position along the first axis
    /// \param y        position along the second axis
    /// \param z        position along the third axis
    /// \param padfOut  takes [dimension] doubles; NaN if the grid has no layout
    void GetVal(double x, double y, double z, double* padfOut) const;

    /// Positions of all points in the order of the array.
    /// \param padfOut  takes [points X x points Y x points Z x 3] doubles, triplets of x, y and z
    void GetGridPositions(double* padfOut) const;

    /// The numbers of points; 0 without layout.
    void GetGridSize(unsigned int& nNumPointsX, unsigned int& nNumPointsY,
                     unsigned int& nNumPointsZ) const;
    /// The product of the numbers of points.
    std::size_t GetNumGridPoints() const;
    /// Position of the first point on each axis; 0 without layout.
    void GetOffsets(double& dfOffsetX, double& dfOffsetY, double& dfOffsetZ) const;
    /// Distance of neighbouring points on each axis; 1 without layout.
    void GetSpacing(double& dfSpacingX, double& dfSpacingY, double& dfSpacingZ) const;
    /// The samples, to be read and written; null without layout. The grid owns them: they are valid
    /// until its layout or its dimension changes.
    double* GetArray() const { return values; }
    /// Size of the array in bytes, modulo 2^32.
    unsigned int GetArraySizeBytes() const;

 protected:
    /// Makes the members those of a new grid, whatever they were: frees nothing.
    void Init();
    /// What the assignment does.
    void CopyFrom(const InterpGrid3D& oOther);
    /// Frees the array. The dimension stays, the layout goes.
    void Clear();

 private:
    friend struct InterpGridAccess;

    unsigned int dimension;
    unsigned int numPointsX;
    unsigned int numPointsY;
    unsigned int numPointsZ;
    double offsetX;
    double offsetY;
    double offsetZ;
    double spacingX;
    double spacingY;
    double spacingZ;
    double* values;
};

#endif  // VETRA_BASE_UTILS_MATH_INTERPGRID_H
