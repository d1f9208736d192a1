#include "vetra/base/utils/math/poly1d.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <limits>

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

constexpr int kMaxCoeffs = std::numeric_limits<int>::max();

}  // namespace

Poly1D::Poly1D() {
    Init();
    const double dfZero = 0.0;
    Assign(1, &dfZero);
}

Poly1D::Poly1D(const std::vector<double>& vdfCoeffs) {
    Init();
    SetCoeffs(vdfCoeffs);
}

Poly1D::Poly1D(int nOrder, const double* padfCoeffs) {
    Init();
    SetCoeffs(nOrder, padfCoeffs);
}

Poly1D::Poly1D(const Poly1D& oOther) {
    Init();
    CopyFrom(oOther);
}

Poly1D& Poly1D::operator=(const Poly1D& oOther) {
    CopyFrom(oOther);
    return *this;
}

Poly1D::~Poly1D() { delete[] mpadfCoeffs; }

Poly1D* Poly1D::Clone() const { return new Poly1D(*this); }

void Poly1D::Init() {
    mnNumCoeffs = 0;
    mpadfCoeffs = nullptr;
    mnMaxIterations = 20;
    mdfTolerance = 1e-8;
}

void Poly1D::CopyFrom(const Poly1D& oOther) {
    if (this == &oOther) {
        return;
    }
    Assign(oOther.mnNumCoeffs, oOther.mpadfCoeffs);
    mnMaxIterations = oOther.mnMaxIterations;
    mdfTolerance = oOther.mdfTolerance;
}

// The new values may stand in the old array, which therefore goes last.
void Poly1D::Assign(int nNumCoeffs, const double* padfCoeffs) {
    if (nNumCoeffs == mnNumCoeffs) {
        std::copy_n(padfCoeffs, nNumCoeffs, mpadfCoeffs);
        return;
    }
    double* padfNew = new double[static_cast<std::size_t>(nNumCoeffs)];
    std::copy_n(padfCoeffs, nNumCoeffs, padfNew);
    delete[] mpadfCoeffs;
    mpadfCoeffs = padfNew;
    mnNumCoeffs = nNumCoeffs;
}

int Poly1D::GetNumCoeffsForOrder(int nOrder) {
    return static_cast<int>(static_cast<unsigned int>(nOrder) + 1u);
}

int Poly1D::GetRequiredOrder(int nNumCoeffs, const double* padfCoeffs) {
    return LastSignificantCoeff(nNumCoeffs, padfCoeffs, VETRA_HERE);
}

double Poly1D::GetValue(double x) const {
    double dfSum = 0.0;
    double dfPower = 1.0;
    for (int i = 0; i < mnNumCoeffs; ++i) {
        dfSum += mpadfCoeffs[i] * dfPower;
        dfPower *= x;
    }
    return dfSum;
}

int Poly1D::GetInverse(double dfValue, double& dfX) const {
    const double* c = mpadfCoeffs;
    if (mnNumCoeffs == 1) {
        return mdfTolerance > std::abs(c[0] - dfValue) ? 0 : -1;
    }
    bool bConverged = false;
    // One more bit than the maximum, which may be the largest number of its type.
    unsigned long long nPasses = 0;
    do {
        const double x = dfX;
        double dfSum = 0.0 + c[0];
        double dfSlope = c[1];
        double dfPower = x;
        dfSum += c[1] * dfPower;
        for (int i = 2; i < mnNumCoeffs; ++i) {
            dfSlope += i * c[i] * dfPower;
            dfPower *= x;
            dfSum += c[i] * dfPower;
        }
        const double dfDelta = dfValue - dfSum;
        bConverged = mdfTolerance > std::abs(dfDelta);
        if (std::abs(dfSlope) >= kPolyEpsilon && !std::isnan(dfDelta)) {
            dfX = x + dfDelta / dfSlope;
        }
        // From the same x every further pass would do the same.
        if (!bConverged && (dfX == x || std::isnan(x))) {
            break;
        }
        ++nPasses;
    } while (!bConverged && nPasses <= mnMaxIterations);
    return bConverged ? 0 : -1;
}

void Poly1D::GetInverseParams(unsigned int& nMaxIterations, double& dfTolerance) const {
    nMaxIterations = mnMaxIterations;
    dfTolerance = mdfTolerance;
}

void Poly1D::SetInverseParams(unsigned int nMaxIterations, double dfTolerance) {
    mnMaxIterations = nMaxIterations;
    mdfTolerance = dfTolerance;
}

bool Poly1D::operator==(const Poly1D& oOther) const {
    return this == &oOther ||
           (mnNumCoeffs == oOther.mnNumCoeffs && mnMaxIterations == oOther.mnMaxIterations &&
            CoeffsEqual(1, &mdfTolerance, &oOther.mdfTolerance) &&
            CoeffsEqual(mnNumCoeffs, mpadfCoeffs, oOther.mpadfCoeffs));
}

void Poly1D::SetCoeffs(const std::vector<double>& vdfCoeffs) {
    if (vdfCoeffs.empty()) {
        throw ParameterException("vdfCoeffs", ParameterException::eWrongLength, "0", "> 0",
                                 "Number of coefficients must be greater than zero", VETRA_HERE);
    }
    if (vdfCoeffs.size() > kMaxCoeffs) {
        throw ParameterException(
            "vdfCoeffs", ParameterException::eWrongLength, FormatString("%zu", vdfCoeffs.size()),
            FormatString("<= %d", kMaxCoeffs), "Number of coefficients is too large", VETRA_HERE);
    }
    Assign(static_cast<int>(vdfCoeffs.size()), vdfCoeffs.data());
}

void Poly1D::SetCoeffs(int nOrder, const double* padfCoeffs) {
    if (nOrder < 0) {
        throw ParameterException(
            "nOrder", ParameterException::eInvalid, FormatString("%d", nOrder), ">= 0",
            "Order of polynomial must be greater than or equal to zero", VETRA_HERE);
    }
    if (nOrder >= kMaxCoeffs) {
        throw ParameterException("nOrder", ParameterException::eInvalid, FormatString("%d", nOrder),
                                 FormatString("< %d", kMaxCoeffs),
                                 "Order of polynomial is too large", VETRA_HERE);
    }
    CheckCoeffPointer(padfCoeffs, VETRA_HERE);
    Assign(nOrder + 1, padfCoeffs);
}

void Poly1D::UpdateCoeff(int nWhich, double dfValue) {
    CheckCoeffIndex(nWhich, mnNumCoeffs, VETRA_HERE);
    mpadfCoeffs[nWhich] = dfValue;
}

void Poly1D::UpdateCoeffs(int nCount, const double* padfCoeffs) {
    if (nCount == 0) {
        return;
    }
    if (nCount < 0) {
        throw ParameterException("nCount", ParameterException::eInvalid, FormatString("%d", nCount),
                                 ">= 0", "Index is out of range", VETRA_HERE);
    }
    CheckCoeffPointer(padfCoeffs, VETRA_HERE);
    if (nCount > mnNumCoeffs) {
        Assign(nCount, padfCoeffs);
    } else {
        std::copy_n(padfCoeffs, nCount, mpadfCoeffs);
    }
}
