#include "vetra/base/utils/math/poly2d.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <memory>

#include "vetra/base/utils/math/polycoeffs.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

using vetra::ParameterException;
using vetra::utils::math::CheckCoeffIndex;
using vetra::utils::math::CheckCoeffPointer;
using vetra::utils::math::CoeffsEqual;
using vetra::utils::math::kPolyEpsilon;
using vetra::utils::math::LastSignificantCoeff;

namespace {

using Array = std::unique_ptr<double[]>;

// The highest order whose number of coefficients 32-bit arithmetic gets right.
constexpr int kMaxOrder = 46339;

constexpr long long NumCoeffsFor(long long nOrder) { return (nOrder + 1) * (nOrder + 2) / 2; }

// The lowest order with at least this number of coefficients.
int LowestOrderFor(long long nNumCoeffs) {
    int nOrder = 0;
    while (NumCoeffsFor(nOrder) < nNumCoeffs) {
        ++nOrder;
    }
    return nOrder;
}

// The polynomials up to order 5, each of which goes on where the one below ended.
double Sum1(const double* c, double x, double y) { return c[0] + x * c[1] + y * c[2]; }

double Sum2(const double* c, double x, double y) {
    const double x2 = x * x;
    const double y2 = y * y;
    return Sum1(c, x, y) + x2 * c[3] + x * c[4] * y + y2 * c[5];
}

double Sum3(const double* c, double x, double y) {
    const double x2 = x * x;
    const double x3 = x2 * x;
    const double y2 = y * y;
    const double y3 = y2 * y;
    return Sum2(c, x, y) + x3 * c[6] + x2 * c[7] * y + x * c[8] * y2 + y3 * c[9];
}

double Sum4(const double* c, double x, double y) {
    const double x2 = x * x;
    const double x3 = x2 * x;
    const double x4 = x3 * x;
    const double y2 = y * y;
    const double y3 = y2 * y;
    const double y4 = y3 * y;
    return Sum3(c, x, y) + x4 * c[10] + x3 * c[11] * y + x2 * c[12] * y2 + x * c[13] * y3 +
           y4 * c[14];
}

double Sum5(const double* c, double x, double y) {
    const double x2 = x * x;
    const double x3 = x2 * x;
    const double x4 = x3 * x;
    const double x5 = x4 * x;
    const double y2 = y * y;
    const double y3 = y2 * y;
    const double y4 = y3 * y;
    const double y5 = y4 * y;
    return Sum4(c, x, y) + x5 * c[15] + x4 * c[16] * y + x3 * c[17] * y2 + x2 * c[18] * y3 +
           x * c[19] * y4 + y5 * c[20];
}

// 1, x, x^2, ... up to x^nOrder.
Array Powers(double x, int nOrder) {
    Array padfPowers(new double[static_cast<std::size_t>(nOrder) + 1]);
    double dfPower = 1.0;
    for (int i = 0; i <= nOrder; ++i, dfPower *= x) {
        padfPowers[static_cast<std::size_t>(i)] = dfPower;
    }
    return padfPowers;
}

}  // namespace

Poly2D::Poly2D() {
    Init();
    SetOrder(0);
    mpadfCoeffs[0] = 0.0;
    CheckIfNonZero();
}

Poly2D::Poly2D(int nOrder, const double* padfCoeffs) {
    CheckCoeffPointer(padfCoeffs, VETRA_HERE);
    Init();
    SetOrder(nOrder);
    Overwrite(GetNumCoeffs(), padfCoeffs);
}

Poly2D::Poly2D(int nOrder, const std::vector<double>& vdfCoeffs) {
    CheckOrder(nOrder);
    const int nNumCoeffs = GetNumCoeffsForOrder(nOrder);
    if (vdfCoeffs.size() != static_cast<std::size_t>(nNumCoeffs)) {
        throw ParameterException(
            "vdfCoeffs", ParameterException::eInvalid,
            FormatString("%zu entries", vdfCoeffs.size()), FormatString("%d entries", nNumCoeffs),
            "Coefficient array has the wrong number of entries for the given polynomial order",
            VETRA_HERE);
    }
    Init();
    SetOrder(nOrder);
    Overwrite(nNumCoeffs, vdfCoeffs.data());
}

Poly2D::Poly2D(const Poly2D& oOther) {
    Init();
    CopyFrom(oOther);
}

Poly2D& Poly2D::operator=(const Poly2D& oOther) {
    CopyFrom(oOther);
    return *this;
}

Poly2D::~Poly2D() { delete[] mpadfCoeffs; }

Poly2D* Poly2D::Clone() const { return new Poly2D(*this); }

void Poly2D::Init() {
    mnOrder = -1;
    mpadfCoeffs = nullptr;
    mpfnEvaluator = &Poly2D::GetValueAlwaysZero;
    mbNonZero = false;
}

void Poly2D::CopyFrom(const Poly2D& oOther) {
    if (this != &oOther) {
        SetOrder(oOther.mnOrder);
        Overwrite(oOther.GetNumCoeffs(), oOther.mpadfCoeffs);
    }
}

void Poly2D::CheckOrder(int nOrder) {
    if (nOrder < 0) {
        throw ParameterException("nOrder", ParameterException::eInvalid, FormatString("%d", nOrder),
                                 ">= 0", "Polynomial order must be zero or greater", VETRA_HERE);
    }
    if (nOrder > kMaxOrder) {
        throw ParameterException("nOrder", ParameterException::eInvalid, FormatString("%d", nOrder),
                                 FormatString("<= %d", kMaxOrder), "Polynomial order is too large",
                                 VETRA_HERE);
    }
}

// Leaves the coefficients undefined.
void Poly2D::SetOrder(int nOrder) {
    CheckOrder(nOrder);
    Array padfNew(new double[static_cast<std::size_t>(GetNumCoeffsForOrder(nOrder))]);
    delete[] mpadfCoeffs;
    mpadfCoeffs = padfNew.release();
    mnOrder = nOrder;
    mpfnEvaluator = EvaluatorForOrder(nOrder);
}

Poly2D::Evaluator Poly2D::EvaluatorForOrder(int nOrder) {
    switch (nOrder) {
        case 0:
            return &Poly2D::GetValueOrder0;
        case 1:
            return &Poly2D::GetValueOrder1;
        case 2:
            return &Poly2D::GetValueOrder2;
        case 3:
            return &Poly2D::GetValueOrder3;
        case 4:
            return &Poly2D::GetValueOrder4;
        case 5:
            return &Poly2D::GetValueOrder5;
        default:
            return &Poly2D::GetValueGenOrder;
    }
}

void Poly2D::Overwrite(int nCount, const double* padfCoeffs) {
    std::copy_n(padfCoeffs, nCount, mpadfCoeffs);
    CheckIfNonZero();
}

void Poly2D::CheckIfNonZero() {
    double dfSum = 0.0;
    for (int i = 0; i < GetNumCoeffs(); ++i) {
        dfSum += std::abs(mpadfCoeffs[i]);
    }
    mbNonZero = !(kPolyEpsilon > dfSum);
    mpfnEvaluator = mbNonZero ? EvaluatorForOrder(mnOrder) : &Poly2D::GetValueAlwaysZero;
}

double Poly2D::GetValueAlwaysZero(double, double) const { return 0.0; }
double Poly2D::GetValueOrder0(double, double) const { return mpadfCoeffs[0]; }
double Poly2D::GetValueOrder1(double x, double y) const { return Sum1(mpadfCoeffs, x, y); }
double Poly2D::GetValueOrder2(double x, double y) const { return Sum2(mpadfCoeffs, x, y); }
double Poly2D::GetValueOrder3(double x, double y) const { return Sum3(mpadfCoeffs, x, y); }
double Poly2D::GetValueOrder4(double x, double y) const { return Sum4(mpadfCoeffs, x, y); }
double Poly2D::GetValueOrder5(double x, double y) const { return Sum5(mpadfCoeffs, x, y); }

double Poly2D::GetValueGenOrder(double x, double y) const {
    const Array padfPowersX = Powers(x, mnOrder);
    const Array padfPowersY = Powers(y, mnOrder);
    const double* pdfCoeff = mpadfCoeffs;
    double dfSum = 0.0;
    for (std::size_t d = 0; d <= static_cast<std::size_t>(mnOrder); ++d) {
        for (std::size_t j = 0; j <= d; ++j) {
            dfSum += padfPowersX[d - j] * *pdfCoeff++ * padfPowersY[j];
        }
    }
    return dfSum;
}

int Poly2D::GetNumCoeffsForOrder(int nOrder) {
    const auto n = static_cast<unsigned int>(nOrder);
    return static_cast<int>((n + 1u) * (n + 2u)) / 2;
}

int Poly2D::GetOrderForNumCoeffs(int nNumCoeffs) {
    const int nOrder = LowestOrderFor(nNumCoeffs);
    if (NumCoeffsFor(nOrder) != nNumCoeffs) {
        throw ParameterException(
            "nNumCoeffs", ParameterException::eInvalid, FormatString("%d", nNumCoeffs),
            "Valid num coeffs",
            FormatString(
                "The provided number of coefficients (%d) does not correspond to a 2D polynomial "
                "order",
                nNumCoeffs),
            VETRA_HERE);
    }
    return nOrder;
}

int Poly2D::GetRequiredOrder(int nNumCoeffs, const double* padfCoeffs) {
    return LowestOrderFor(LastSignificantCoeff(nNumCoeffs, padfCoeffs, VETRA_HERE) + 1LL);
}

bool Poly2D::operator==(const Poly2D& oOther) const {
    return this == &oOther || (mnOrder == oOther.mnOrder &&
                               CoeffsEqual(GetNumCoeffs(), mpadfCoeffs, oOther.mpadfCoeffs));
}

void Poly2D::UpdateCoeff(int nWhich, double dfValue) {
    CheckCoeffIndex(nWhich, GetNumCoeffs(), VETRA_HERE);
    mpadfCoeffs[nWhich] = dfValue;
    CheckIfNonZero();
}

void Poly2D::UpdateCoeffs(const std::vector<double>& vdfCoeffs) {
    // A size that int doesn't hold has no order, as little as the largest int.
    const std::size_t nMax = std::numeric_limits<int>::max();
    UpdateCoeffs(static_cast<int>(std::min(vdfCoeffs.size(), nMax)), vdfCoeffs.data());
}

void Poly2D::UpdateCoeffs(int nCount, const double* padfCoeffs) {
    if (nCount == 0) {
        return;
    }
    if (nCount > 0) {
        CheckCoeffPointer(padfCoeffs, VETRA_HERE);
    }
    if (nCount < 0 || nCount > GetNumCoeffs()) {
        SetOrder(GetOrderForNumCoeffs(nCount));
    }
    Overwrite(nCount, padfCoeffs);
}

double poweri(double x, int n) {
    double dfProduct = 1.0;
    for (int i = 0; i < n; ++i) {
        dfProduct *= x;
    }
    return dfProduct;
}
