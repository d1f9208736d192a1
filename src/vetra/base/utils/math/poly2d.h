#ifndef VETRA_BASE_UTILS_MATH_POLY2D_H
#define VETRA_BASE_UTILS_MATH_POLY2D_H

#include <cstddef>
#include <vector>

#include "vetra/export.h"

/// \file
/// Polynomials in two variables, and integer powers.

/// A polynomial in two variables, with all terms up to a total degree, its order.
///
/// **Coefficients.** (order + 1)(order + 2) / 2, degree by degree from 0 up, and within a degree
/// from the highest power of x to the highest power of y:
///
///     1, x, y, x^2, x y, y^2, x^3, x^2 y, x y^2, y^3, ...
///
/// The coefficient of x^i y^j, with d = i + j, stands at index d (d + 1) / 2 + j.
///
/// A polynomial counts as zero if the absolute values of its coefficients add up to less than the
/// machine epsilon of double, 2.220446049250313e-16, called the epsilon here.
///
/// What is refused throws ParameterException and leaves the object as it was. Const operations of
/// one object may run concurrently.
class VETRA_EXPORT Poly2D {
 public:
    /// The polynomial 0, of order 0.
    Poly2D();
    /// \param nOrder      the order, from 0 to 46339
    /// \param padfCoeffs  [(nOrder + 1)(nOrder + 2) / 2], not null
    /// \throws ParameterException for other arguments.
    Poly2D(int nOrder, const double* padfCoeffs);
    /// \param nOrder     the order, from 0 to 46339
    /// \param vdfCoeffs  exactly (nOrder + 1)(nOrder + 2) / 2 entries
    /// \throws ParameterException for other arguments.
    Poly2D(int nOrder, const std::vector<double>& vdfCoeffs);
    /// Copies the coefficients.
    Poly2D(const Poly2D& oOther);
    /// When it throws (std::bad_alloc) the polynomial is as it was.
    Poly2D& operator=(const Poly2D& oOther);
    ~Poly2D();
    /// A copy that belongs to the caller.
    Poly2D* Clone() const;

    /// Highest total degree that has coefficients, which may all be 0.
    int GetPolyOrder() const { return mnOrder; }
    /// (order + 1)(order + 2) / 2.
    int GetNumCoeffs() const { return GetNumCoeffsForOrder(mnOrder); }
    /// The polynomial's own array of `GetNumCoeffs` doubles, valid until the polynomial changes.
    const double* GetCoeffs() const { return mpadfCoeffs; }
    /// False if the polynomial counts as zero.
    bool IsNonZero() const { return mbNonZero; }

    /// The polynomial at (\p x, \p y); 0.0 if it counts as zero.
    ///
    /// Rounding is that of a sum in the order of the coefficients, each term being
    /// (x^i times c[k]) times y^j, with powers from 1.0 by running products.
    ///
    /// Orders up to 5 allocate nothing. Higher ones allocate two arrays of order + 1 doubles.
    /// \throws std::bad_alloc when there is no memory for these.
    double GetValue(double x, double y) const { return (this->*mpfnEvaluator)(x, y); }

    /// (\p nOrder + 1)(\p nOrder + 2) / 2, in wrapping 32-bit arithmetic: right up to order 46339.
    static int GetNumCoeffsForOrder(int nOrder);
    /// The order that has exactly this number of coefficients.
    /// \throws ParameterException if there is none, as for 0, 2 and negative numbers.
    static int GetOrderForNumCoeffs(int nNumCoeffs);
    /// The lowest order that keeps every coefficient with an absolute value above the epsilon; 0 if
    /// there is none.
    ///
    /// \param nNumCoeffs  any count; with less than 1 the array is not read
    /// \param padfCoeffs  [nNumCoeffs]
    /// \throws ParameterException for a null array with a positive count.
    static int GetRequiredOrder(int nNumCoeffs, const double* padfCoeffs);

    /// Whether the orders are equal and no pair of coefficients differs by more than the epsilon. A
    /// NaN differs from nothing.
    bool operator==(const Poly2D& oOther) const;

    /// Sets entry \p nWhich of the coefficients.
    /// \throws ParameterException for an index that is negative or not below `GetNumCoeffs`.
    void UpdateCoeff(int nWhich, double dfValue);
    /// Overwrites the first coefficients with all entries of the vector. More entries than
    /// `GetNumCoeffs` raise the order to the one that has their number of coefficients; fewer leave
    /// the order and the other coefficients as they are. An empty vector does nothing.
    /// \throws ParameterException if no order has that many coefficients, when there are more than
    ///         before.
    void UpdateCoeffs(const std::vector<double>& vdfCoeffs);
    /// As above, with an array.
    ///
    /// \param nCount      a count, not an order; with 0 nothing happens
    /// \param padfCoeffs  [nCount]; not null, unless the count is 0. May be part of the
    /// polynomial's
    ///                    own array.
    /// \throws ParameterException also for a negative count and for a null array.
    void UpdateCoeffs(int nCount, const double* padfCoeffs);

 protected:
    /// Makes the members those of an object without coefficients. Frees nothing.
    void Init();
    /// What the assignment does.
    void CopyFrom(const Poly2D& oOther);
    /// Finds out anew whether the polynomial counts as zero, after a change of coefficients.
    void CheckIfNonZero();

 private:
    using Evaluator = double (Poly2D::*)(double x, double y) const;

    static Evaluator EvaluatorForOrder(int nOrder);
    static void CheckOrder(int nOrder);
    void SetOrder(int nOrder);
    void Overwrite(int nCount, const double* padfCoeffs);

    double GetValueAlwaysZero(double x, double y) const;
    double GetValueOrder0(double x, double y) const;
    double GetValueOrder1(double x, double y) const;
    double GetValueOrder2(double x, double y) const;
    double GetValueOrder3(double x, double y) const;
    double GetValueOrder4(double x, double y) const;
    double GetValueOrder5(double x, double y) const;
    double GetValueGenOrder(double x, double y) const;

    int mnOrder;
    double* mpadfCoeffs;
    Evaluator mpfnEvaluator;
    bool mbNonZero;
};

/// The product of \p n factors \p x, multiplied one after the other onto 1.0. With n of 0 or below
/// it is 1.0: a negative exponent gives no reciprocal.
VETRA_EXPORT double poweri(double x, int n);

#endif  // VETRA_BASE_UTILS_MATH_POLY2D_H
