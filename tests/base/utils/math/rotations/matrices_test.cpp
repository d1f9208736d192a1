#include <gtest/gtest.h>

#include <cmath>
#include <Eigen/Dense>
#include <limits>
#include <random>
#include <vector>

#include "vetra/vetra.h"

namespace {

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

using RowMajor = Eigen::Matrix<double, Eigen::Dynamic, Eigen::Dynamic, Eigen::RowMajor>;

// A matrix of AllocMat with the elements of one of Eigen's.
class Matrix {
 public:
    Matrix(int nRows, int nCols) : mnRows(nRows), mnCols(nCols) { AllocMat(mpadf, nRows, nCols); }
    explicit Matrix(const RowMajor& o) : Matrix(int(o.rows()), int(o.cols())) {
        Eigen::Map<RowMajor>(mpadf[0], mnRows, mnCols) = o;
    }
    ~Matrix() { FreeMat(mpadf); }
    Matrix(const Matrix&) = delete;
    Matrix& operator=(const Matrix&) = delete;

    operator double* const*() { return mpadf; }
    RowMajor Get() const { return Eigen::Map<RowMajor>(mpadf[0], mnRows, mnCols); }

 private:
    double** mpadf = nullptr;
    int mnRows;
    int mnCols;
};

TEST(Matrices, Allocation) {
    double** papadf = nullptr;
    AllocMat(papadf, 3, 5);
    EXPECT_EQ(papadf[1], papadf[0] + 5);
    EXPECT_EQ(papadf[2], papadf[0] + 10);
    papadf[2][4] = 1.0;
    FreeMat(papadf);
    EXPECT_EQ(papadf, nullptr);
    FreeMat(papadf);
    for (const auto& [nRows, nCols] : {std::pair{0, 4}, {4, 0}, {-1, -1}, {-2147483647, 3}}) {
        AllocMat(papadf, nRows, nCols);
        EXPECT_NE(papadf, nullptr);
        FreeMat(papadf);
    }
}

TEST(Matrices, ProductsOfAnyShape) {
    for (const auto& [r, n, c] :
         {std::array{1, 1, 1}, {2, 3, 4}, {5, 1, 3}, {7, 8, 1}, {2, 0, 2}}) {
        const RowMajor a = RowMajor::Random(r, n);
        const RowMajor b = RowMajor::Random(n, c);
        Matrix A(a);
        Matrix B(b);
        Matrix C(r, c);
        EXPECT_EQ(MatMult(A, B, r, n, c, C), 0);
        EXPECT_LT((C.Get() - a * b).norm(), 1e-14);
        Matrix T(n, r);
        EXPECT_EQ(MatTranspose(A, r, n, T), 0);
        EXPECT_EQ(T.Get(), RowMajor(a.transpose()));
        Matrix D(r, n);
        CopyMat(A, D, r, n);
        EXPECT_EQ(D.Get(), a);
        EXPECT_EQ(MatSclMult(D, r, n, -2.5, D), 0);
        EXPECT_EQ(D.Get(), RowMajor(-2.5 * a));
        const Eigen::VectorXd v = Eigen::VectorXd::Random(n);
        Eigen::VectorXd out(r);
        EXPECT_EQ(MatVecMult(A, v.data(), r, n, out.data()), 0);
        EXPECT_LT((out - a * v).norm(), 1e-14);
    }
}

TEST(Matrices, VectorsOfAnyLength) {
    double v[] = {2, -3, 6};
    EXPECT_EQ(DotProd(v, v, 3), 49.0);
    EXPECT_EQ(DotProd(v, v, -1), 0.0);
    EXPECT_EQ(VecAbs(v, 3), 7.0);
    EXPECT_EQ(VecAbs(v, 0), 0.0);
    EXPECT_EQ(VecSclMult(v, 2, 0.5, v), 0);
    EXPECT_TRUE(v[0] == 1.0 && v[1] == -1.5 && v[2] == 6.0);
    double w[] = {3, 4};
    EXPECT_EQ(VecNormalize(w, 2), 0);
    EXPECT_TRUE(w[0] == 0.6 && w[1] == 0.8);
    double adfSmall[] = {2e-16, 0};
    EXPECT_EQ(VecNormalize(adfSmall, 2), -1);
    EXPECT_EQ(adfSmall[0], 2e-16);
    const auto fnIndex = [](const std::vector<double>& vdf) {
        return VecIdxMaxAbs(vdf.data(), static_cast<int>(vdf.size()));
    };
    EXPECT_EQ(fnIndex({1, -3, 3}), 1);
    EXPECT_EQ(fnIndex({}), 0);
    EXPECT_EQ(fnIndex({kNaN, 0, -HUGE_VAL, HUGE_VAL}), 2);
    EXPECT_EQ(fnIndex({kNaN, kNaN}), 0);
}

TEST(Matrices, Inversion) {
    std::mt19937 oRandom(5);
    std::normal_distribution<double> oNormal;
    for (const int n : {1, 2, 3, 7, 40}) {
        RowMajor r(n, n);
        for (int i = 0; i < n * n; ++i) {
            r.data()[i] = oNormal(oRandom);
        }
        const RowMajor a = r * r.transpose() + RowMajor::Identity(n, n);
        for (const bool bMirror : {false, true}) {
            RowMajor oLower = a;
            oLower.triangularView<Eigen::StrictlyUpper>().setConstant(-99.0);
            Matrix A(oLower);
            EXPECT_EQ(mat_inv(A, n, bMirror), 0);
            RowMajor oInverse = A.Get();
            if (!bMirror) {
                const RowMajor oUpper = oInverse.triangularView<Eigen::StrictlyUpper>();
                EXPECT_EQ(oUpper.minCoeff(), n == 1 ? 0.0 : -99.0);
                EXPECT_EQ(oUpper.sum(), -99.0 * n * (n - 1) / 2);
                oInverse = RowMajor(oInverse.selfadjointView<Eigen::Lower>());
            }
            EXPECT_LT((oInverse * a - RowMajor::Identity(n, n)).norm(), 1e-12 * n);
        }
    }
    for (const auto& [dfValue, nResult] : {std::pair{4.0, 0}, {0.0, 1}, {-1.0, 1}, {kNaN, 0}}) {
        Matrix A(RowMajor::Constant(1, 1, dfValue));
        EXPECT_EQ(mat_inv(A, 1, true), nResult);
        if (nResult == 0) {
            EXPECT_TRUE(std::isnan(dfValue) ? std::isnan(A.Get()(0, 0)) : A.Get()(0, 0) == 0.25);
        }
    }
    Matrix B(RowMajor::Constant(3, 3, 1.0));
    EXPECT_EQ(mat_inv(B, 3, true), 2);
    EXPECT_EQ(mat_inv(B, 0, true), 0);
}

TEST(Matrices, Polynomial) {
    const double c[] = {2, -3, 5};
    EXPECT_EQ(polyval(c, 2, 10.0), 175.0);
    EXPECT_EQ(polyval(c, 0, 10.0), 2.0);
    EXPECT_EQ(polyval(c, -1, 10.0), 0.0);
}

TEST(Matrices, Printing) {
    const auto fnPrint = [](int nRows, int nCols) {
        std::vector<double> vdf(28);
        for (std::size_t i = 0; i < vdf.size(); ++i) {
            vdf[i] = -0.5 * static_cast<double>(i);
        }
        testing::internal::CaptureStdout();
        PrintMatrix("A%s", nRows, nCols, vdf.data());
        return testing::internal::GetCapturedStdout();
    };
    EXPECT_EQ(fnPrint(2, 2),
              "Matrix: A%s (2 by 2)\n -0.00000e+00 -5.00000e-01\n -1.00000e+00 -1.50000e+00\n\n");
    const std::string sSix =
        " -0.00000e+00 -5.00000e-01 -1.00000e+00 -1.50000e+00 -2.00000e+00 -2.50000e+00\n";
    EXPECT_EQ(fnPrint(1, 6), "Matrix: A%s (1 by 6)\n" + sSix + "\n");
    EXPECT_EQ(fnPrint(1, 7), "Matrix: A%s (1 by 7)\nColumns 0 though 5\n" + sSix +
                                 "Columns 6 though 6\n -3.00000e+00\n\n");
    EXPECT_EQ(fnPrint(2, 0), "Matrix: A%s (2 by 0)\n\n");
    EXPECT_EQ(fnPrint(0, -1), "Matrix: A%s (0 by -1)\n\n");
}

}  // namespace
