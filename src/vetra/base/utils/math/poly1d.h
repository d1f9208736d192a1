#ifndef VETRA_BASE_UTILS_MATH_POLY1D_H
#define VETRA_BASE_UTILS_MATH_POLY1D_H

#include <vector>

#include "vetra/export.h"

/// A polynomial in one variable.
///
/// **Coefficients.** Ascending powers: c[i] is the coefficient of x^i, c[0] the constant term.
/// There is at least one; the order is their number minus 1.
///
/// Comparisons use the machine epsilon of double, 2.220446049250313e-16, called the epsilon here.
/// What is refused throws ParameterException and leaves the object as it was. Const operations of
/// one object may run concurrently.
class VETRA_EXPORT Poly1D {
 public:
    /// The polynomial 0: one coefficient of 0.
    Poly1D();
    /// As `SetCoeffs`.
    explicit Poly1D(const std::vector<double>& vdfCoeffs);
    /// As `SetCoeffs`: the first argument is the order, not a count.
    Poly1D(int nOrder, const double* padfCoeffs);
    /// A copy has the coefficients and the parameters of `GetInverse`.
    Poly1D(const Poly1D& oOther);
    /// When it throws (std::bad_alloc) the polynomial is as it was.
    Poly1D& operator=(const Poly1D& oOther);
    ~Poly1D();
    /// A copy that belongs to the caller.
    Poly1D* Clone() const;

    /// The order plus 1.
    int GetNumCoeffs() const { return mnNumCoeffs; }
    /// Highest power that has a coefficient, which may be 0.
    int GetPolyOrder() const { return mnNumCoeffs - 1; }
    /// The polynomial's own array of `GetNumCoeffs` doubles, valid until the coefficients change.
    const double* GetCoeffs() const { return mpadfCoeffs; }

    /// \p nOrder + 1, in wrapping 32-bit arithmetic.
    static int GetNumCoeffsForOrder(int nOrder);
    /// The lowest order that keeps every coefficient with an absolute value above the epsilon; 0 if
    /// there is none.
    ///
    /// \param nNumCoeffs  a count; with less than 1 the array is not read
    /// \param padfCoeffs  [nNumCoeffs]
    /// \throws ParameterException for a null array with a positive count.
    static int GetRequiredOrder(int nNumCoeffs, const double* padfCoeffs);

    /// The polynomial at \p x. Rounding is that of a sum, from 0.0, of c[i] times a running power,
    /// which starts at 1.0 and is multiplied by x behind each term, in ascending order of i. It is
    /// not Horner's scheme.
    double GetValue(double x) const;

    /// Solves p(x) = \p dfValue by Newton's iteration.
    ///
    /// A pass evaluates p and p' at x in one ascending sum each, takes |\p dfValue - p(x)| below
    /// the tolerance for convergence, and then makes the step x += (\p dfValue - p(x)) / p'(x),
    /// also in the pass that converged; that last step is not tested. There is no step where
    /// |p'(x)| is below the epsilon or where a number is NaN. There are up to maximum + 1 passes.
    ///
    /// A constant polynomial leaves \p dfX as it is and succeeds if it is within the tolerance.
    ///
    /// \param dfValue  the target
    /// \param dfX      start value on entry; the solution on return, or the last iterate on failure
    /// \return 0 for success, -1 when no pass converged, as always with a tolerance of 0
    int GetInverse(double dfValue, double& dfX) const;
    /// How `GetInverse` ends: the maximum number of iterations, 20 in a new polynomial, and the
    /// tolerance of the value, 1e-8 in a new polynomial.
    void GetInverseParams(unsigned int& nMaxIterations, double& dfTolerance) const;
    /// Any values are accepted.
    void SetInverseParams(unsigned int nMaxIterations, double dfTolerance);

    /// Whether numbers of coefficients and maximum iterations are equal and neither the tolerances
    /// nor a pair of coefficients differ by more than the epsilon. A NaN differs from nothing.
    bool operator==(const Poly1D& oOther) const;

    // None of the following touches the parameters of `GetInverse`. Arrays may be part of the
    // polynomial's own.

    /// Takes all entries of the vector.
    /// \throws ParameterException for an empty vector, and one of more than 2^31 - 1 entries.
    void SetCoeffs(const std::vector<double>& vdfCoeffs);
    /// \param nOrder      the order, from 0 to 2^31 - 2
    /// \param padfCoeffs  [nOrder + 1], not null
    /// \throws ParameterException for other arguments.
    void SetCoeffs(int nOrder, const double* padfCoeffs);
    /// Sets c[nWhich].
    /// \throws ParameterException for an index that is negative or not below `GetNumCoeffs`.
    void UpdateCoeff(int nWhich, double dfValue);
    /// Overwrites the first \p nCount coefficients. A larger count than `GetNumCoeffs` makes the
    /// polynomial longer, a smaller one leaves the higher coefficients as they are.
    ///
    /// \param nCount      a count, not an order; with 0 nothing happens
    /// \param padfCoeffs  [nCount]; not null, unless the count is 0
    /// \throws ParameterException for a negative count and for a null array.
    void UpdateCoeffs(int nCount, const double* padfCoeffs);

 protected:
    /// Makes the members those of an object without coefficients and with the default parameters
    /// of `GetInverse`. Frees nothing.
    void Init();
    /// What the assignment does.
    void CopyFrom(const Poly1D& oOther);

 private:
    void Assign(int nNumCoeffs, const double* padfCoeffs);

    int mnNumCoeffs;
    double* mpadfCoeffs;
    unsigned int mnMaxIterations;
    double mdfTolerance;
};

#endif  // VETRA_BASE_UTILS_MATH_POLY1D_H
