#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <Eigen/Dense>
#include <limits>
#include <random>

#include "vetra/vetra.h"

namespace {

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

using Vec3 = std::array<double, 3>;
using Mat3 = std::array<double, 9>;
using RowMajor = Eigen::Matrix<double, 3, 3, Eigen::RowMajor>;

TEST(Vectors, Products) {
    const Vec3 a = {1, 2, 3};
    const Vec3 b = {-2, 5, 4};
    double df = 0.0;
    DotProduct(a.data(), b.data(), &df);
    EXPECT_EQ(df, 20.0);
    EXPECT_EQ(DotProduct(a.data(), b.data()), 20.0);
    Vec3 out = a;
    CrossProduct(out.data(), b.data(), out.data());
    EXPECT_EQ(out, (Vec3{-7, -10, 9}));
    const double dfLength = std::sqrt(230.0);
    CrossProd(a.data(), b.data(), out.data());
    EXPECT_EQ(out, (Vec3{-7 / dfLength, -10 / dfLength, 9 / dfLength}));
    // Parallel vectors: what there is, without scaling.
    CrossProd(a.data(), a.data(), out.data());
    EXPECT_EQ(out, (Vec3{0, 0, 0}));
    CrossProd(Vec3{1e-8, 0, 0}.data(), Vec3{0, 2e-8, 0}.data(), out.data());
    EXPECT_EQ(out, (Vec3{0, 0, 1e-8 * 2e-8}));
    CrossProd(Vec3{1e-8, 0, 0}.data(), Vec3{0, 3e-8, 0}.data(), out.data());
    EXPECT_EQ(out, (Vec3{0, 0, 1}));
}

TEST(Vectors, LengthsAndScales) {
    const Vec3 a = {1, 2, 2};
    Vec3 out = {7, 7, 7};
    double dfLength = -1.0;
    Normalize(a.data(), out.data(), &dfLength);
    EXPECT_EQ(dfLength, 3.0);
    EXPECT_EQ(out, (Vec3{1.0 / 3, 2.0 / 3, 2.0 / 3}));
    Normalize(Vec3{0, 0, 0}.data(), out.data(), &dfLength);
    EXPECT_EQ(dfLength, 0.0);
    EXPECT_EQ(out[0], 1.0 / 3);
    EXPECT_EQ(VecLength(a.data()), 3.0);
    EXPECT_EQ(VecDistance(a.data(), Vec3{1, 5, 6}.data()), 5.0);
    VecDiff(a.data(), Vec3{3, 3, 3}.data(), out.data());
    EXPECT_EQ(out, (Vec3{-2, -1, -1}));
    VecScale(-2.0, out.data(), out.data());
    EXPECT_EQ(out, (Vec3{4, 2, 2}));
    VecNormalize(out.data());
    EXPECT_NEAR(VecLength(out.data()), 1.0, 1e-16);
    Vec3 adfZero = {0, 0, 0};
    VecNormalize(adfZero.data());
    EXPECT_TRUE(std::isnan(adfZero[0]));
}

TEST(Vectors, MatricesInPlace) {
    const Mat3 A = {1, 2, 3, 4, 5, 6, 7, 8, 10};
    const Mat3 B = {2, 0, 1, -1, 3, 5, 4, 4, -2};
    const Eigen::Map<const RowMajor> a(A.data());
    const Eigen::Map<const RowMajor> b(B.data());
    const RowMajor oProduct = a * b;
    Mat3 C = A;
    MM3_Mult(C.data(), B.data(), C.data());
    EXPECT_EQ(Eigen::Map<RowMajor>(C.data()), oProduct);
    C = B;
    MM3_Mult(A.data(), C.data(), C.data());
    EXPECT_EQ(Eigen::Map<RowMajor>(C.data()), oProduct);
    Vec3 v = {1, -2, 3};
    MV3_Mult(A.data(), v.data(), v.data());
    EXPECT_EQ(v, (Vec3{6, 12, 21}));
    v = {1, -2, 3};
    MtV3_Mult(A.data(), v.data(), v.data());
    EXPECT_EQ(v, (Vec3{14, 16, 21}));
}

int Solve(const Mat3& A, const Vec3& b, Vec3& x) {
    int nStatus = 7;
    SolveEqn(&A[0], &A[3], &A[6], b.data(), x.data(), &nStatus);
    return nStatus;
}

TEST(Vectors, SolveEqn) {
    std::mt19937 oRandom(3);
    std::normal_distribution<double> oNormal;
    for (int n = 0; n < 1000; ++n) {
        Mat3 A;
        for (double& df : A) {
            df = oNormal(oRandom);
        }
        const Vec3 b = {oNormal(oRandom), oNormal(oRandom), oNormal(oRandom)};
        Vec3 x;
        ASSERT_EQ(Solve(A, b, x), 0);
        const Eigen::Map<const RowMajor> a(A.data());
        const Eigen::Vector3d oExpected = a.fullPivLu().solve(Eigen::Vector3d(b.data()));
        const double dfCondition = a.norm() * a.inverse().norm();
        EXPECT_LT((Eigen::Vector3d(x.data()) - oExpected).norm(),
                  1e-15 * dfCondition * (1.0 + oExpected.norm()));
    }
    // Every order of pivots.
    for (const Mat3& P : {Mat3{0, 2, 0, 0, 0, 3, 1, 0, 0}, Mat3{0, 0, 1, 3, 0, 0, 0, 2, 0},
                          Mat3{0, 0, 3, 0, 2, 0, 1, 0, 0}, Mat3{1, 0, 0, 0, 0, 2, 0, 3, 0}}) {
        Vec3 x;
        ASSERT_EQ(Solve(P, {6, 12, 18}, x), 0);
        Vec3 b;
        MV3_Mult(P.data(), x.data(), b.data());
        EXPECT_EQ(b, (Vec3{6, 12, 18}));
    }
    // The solution may take the right-hand side's place.
    Vec3 b = {2, 4, 8};
    EXPECT_EQ(Solve({2, 0, 0, 0, 2, 0, 0, 0, 2}, b, b), 0);
    EXPECT_EQ(b, (Vec3{1, 2, 4}));
    for (const Mat3& S :
         {Mat3{1, 2, 3, 2, 4, 6, 0, 1, 1}, Mat3{}, Mat3{kNaN, 0, 0, 0, 1, 0, 0, 0, 1},
          Mat3{kNaN, kNaN, kNaN, kNaN, kNaN, kNaN, kNaN, kNaN, kNaN}}) {
        EXPECT_EQ(Solve(S, {1, 1, 1}, b), -1);
    }
}

}  // namespace
