#include "vetra/base/utils/resample/resampleutils.h"

#include <gtest/gtest.h>

#include <cmath>
#include <vector>

namespace vetra::utils {
namespace {

// A source of 5 columns and 4 rows: all valid, and with 0 at (2, 1) and 2 at (3, 2).
const unsigned char kOnes[20] = {1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1};
const unsigned char kHoles[20] = {1, 1, 1, 1, 1, 1, 1, 0, 1, 1, 1, 1, 1, 2, 1, 1, 1, 1, 1, 1};
const unsigned char* const kNone = nullptr;
constexpr NodataFillAction NN = eNFA_NN;
constexpr NodataFillAction BGD = eNFA_BGD;

struct Case {
    unsigned char nRequest;
    const unsigned char* pabyMask;
    double dfCol, dfRow;
    int nColOff, nRowOff, nWndCols, nWndRows;
    NodataFillAction eFill;
    int nFloor;    // result of ChooseResampleMode
    int nNearest;  // result of ChooseResampleModeForFilter
};

void ExpectAll(const char* pszWhat, const std::vector<Case>& aoCases) {
    for (const Case& o : aoCases) {
        SCOPED_TRACE(testing::Message() << pszWhat << ", case " << &o - aoCases.data());
        const auto fnRun = [&](auto fnChoose) {
            return +fnChoose(o.nRequest, o.pabyMask, 5, 4, o.dfCol, o.dfRow, o.nColOff, o.nRowOff,
                             o.nWndCols, o.nWndRows, o.eFill);
        };
        EXPECT_EQ(fnRun(ChooseResampleMode), o.nFloor);
        EXPECT_EQ(fnRun(ChooseResampleModeForFilter), o.nNearest);
    }
}

TEST(ChooseResampleMode, Cases) {
    ExpectAll("requests 0 and 3 stand, whatever the source holds",
              {{0, kNone, 1, 1, 0, 0, 1, 1, NN, 0, 0},
               {3, kHoles, 2, 1, 0, 0, 1, 1, BGD, 3, 3},
               {3, kNone, -9, NAN, 0, 0, 1, 1, NN, 3, 3}});
    ExpectAll("request 2 asks for a usable nearest pixel and no more",
              {{2, kNone, 1, 1, 0, 0, 9, 9, BGD, 2, 2},
               {2, kHoles, 2, 1, 0, 0, 1, 1, NN, 0, 0},
               {2, kHoles, 2.5, 1, 0, 0, 1, 1, NN, 2, 2},
               {2, kHoles, 3, 2, 0, 0, 1, 1, NN, 0, 0},
               {2, kNone, -0.5, 3.49, 0, 0, 1, 1, NN, 2, 2},
               {2, kNone, -0.51, 0, 0, 0, 1, 1, NN, 0, 0},
               {2, kNone, 4.5, 0, 0, 0, 1, 1, NN, 0, 0},
               {2, kNone, std::nextafter(4.5, 0.0), 0, 0, 0, 1, 1, NN, 2, 2},
               {2, kNone, 0, 3.5, 0, 0, 1, 1, NN, 0, 0}});
    ExpectAll("the anchors differ where a fraction passes half; other requests count as 1",
              {{1, kNone, 0, 0, 0, 0, 2, 2, BGD, 1, 1},
               {1, kOnes, 3.9, 2.4, 0, 0, 2, 2, BGD, 1, 0},
               {1, kOnes, 3.4, 2.9, 0, 0, 2, 2, NN, 1, 2},
               {1, kNone, -0.2, 0, 0, 0, 2, 2, NN, 2, 1},
               {4, kNone, 1, 1, 0, 0, 2, 2, BGD, 1, 1},
               {255, kNone, 4, 1, 0, 0, 2, 2, BGD, 0, 0}});
    ExpectAll("windows that leave the source or exceed it; an unknown fill action",
              {{1, kNone, 0.9, 2, -1, -1, 4, 3, NN, 2, 1},
               {1, kNone, 2, 0.9, -1, -1, 4, 3, BGD, 0, 1},
               {1, kNone, 4, 1, 0, 0, 2, 2, NN, 2, 2},
               {1, kNone, 1, 3, 0, 0, 2, 2, BGD, 0, 0},
               {1, kNone, 2, 2, -2, -2, 5, 4, BGD, 1, 1},
               {1, kNone, 2, 2, -2, -2, 6, 4, BGD, 0, 0},
               {1, kNone, 2, 2, -2, -2, 5, 5, NN, 2, 2},
               {1, kNone, 4, 1, 0, 0, 2, 2, static_cast<NodataFillAction>(7), 2, 2}});
    ExpectAll("masks: every pixel of the window counts; 2 is valid there, but not as nearest pixel",
              {{1, kHoles, 1, 0, 0, 0, 2, 2, NN, 2, 2},
               {1, kHoles, 2, 1, 0, 0, 2, 2, NN, 0, 0},
               {1, kHoles, 3, 2, 0, 0, 2, 2, NN, 1, 1},
               {1, kHoles, 3, 2, 0, 0, 3, 2, NN, 0, 0},
               {1, kHoles, 0, 2, 0, 0, 5, 2, BGD, 1, 1},
               {1, kHoles, 2, 0, 0, 0, 1, 2, BGD, 0, 0},
               {1, kHoles, 1, 1, 0, 0, 2, 1, BGD, 0, 0},
               {1, kHoles, 0, 1, 0, 0, 2, 1, BGD, 1, 1}});
    ExpectAll(
        "without window rows no mask byte is looked at",
        {{1, kHoles, 2, 1, 0, 0, 1, 0, BGD, 1, 1}, {1, kHoles, 2, 1, 0, 0, 1, -1, BGD, 1, 1}});
    ExpectAll("NaN and positions beyond int lie outside",
              {{1, kNone, NAN, 1, 0, 0, 1, 1, NN, 0, 0},
               {2, kNone, 1, NAN, 0, 0, 1, 1, NN, 0, 0},
               {1, kOnes, INFINITY, 1, 0, 0, 1, 1, NN, 0, 0},
               {1, kOnes, 4294967297.0, 1, 0, 0, 1, 1, NN, 0, 0},
               {2, kOnes, 2147483647.5, 1, 0, 0, 1, 1, NN, 0, 0},
               {1, kOnes, 2147483647.0, 1, 1, 0, 1, 1, NN, 0, 0},
               {1, kOnes, -2147483648.0, -2147483648.0, -3, -3, 8, 8, NN, 0, 0}});
}

}  // namespace
}  // namespace vetra::utils
