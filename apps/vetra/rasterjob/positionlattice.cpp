#include "rasterjob/positionlattice.h"

#include <omp.h>

#include <algorithm>
#include <cmath>
#include <exception>

namespace vetra::tool {

namespace {

// The polynomial's greatest error lies beside the places where it is checked: for a smooth
// transformation it is 1.11 times as large there, 3.63 / 3.28 by the product of the distances from
// the nodes.
constexpr double kCheckedShare = 0.9;

}  // namespace

// The rectangle that is asked for, and where its positions go.
struct PositionLattice::Part {
    utils::PixelRect oRect;
    double* padfCol;
    double* padfRow;

    // Columns or rows of a cell that are in the rectangle.
    static int First(int nCell, int nStart) { return std::max(nCell, nStart); }
    static int End(int nCell, int nSize, int nStart, int nCount) {
        return nCell + std::min(nSize, nStart + nCount - nCell);
    }
    std::size_t Index(int nCol, int nRow) const {
        return static_cast<std::size_t>(nRow - oRect.nRow) * static_cast<std::size_t>(oRect.nCols) +
               static_cast<std::size_t>(nCol - oRect.nCol);
    }
};

PositionLattice::PositionLattice(const GeoTransformer& oTransformer, int nCols, int nRows,
                                 double dfError)
    : mnCols(nCols), mnRows(nRows), mdfError(dfError) {
    for (int nThread = 0; nThread < omp_get_max_threads(); ++nThread) {
        moTransformers.push_back(oTransformer.Clone());
    }
    // Lagrange's polynomials of the nodes 0 to 4.
    const auto Weight = [](int nNode, double dfPlace) {
        double dfWeight = 1.0;
        for (int n = 0; n < kNodes; ++n) {
            if (n != nNode) {
                dfWeight *= (dfPlace - n) / (nNode - n);
            }
        }
        return dfWeight;
    };
    for (std::size_t nNode = 0; nNode < kNodes; ++nNode) {
        for (std::size_t n = 0; n < kCell; ++n) {
            mvdfWeights[nNode][n] =
                Weight(static_cast<int>(nNode), static_cast<double>(n) * (kNodes - 1) / kCell);
        }
        for (std::size_t n = 0; n + 1 < kNodes; ++n) {
            mvdfMidWeights[nNode][n] =
                Weight(static_cast<int>(nNode), static_cast<double>(n) + 0.5);
        }
    }
}

void PositionLattice::Fill(const utils::PixelRect& oRect, PositionArrays& oPositions) {
    const auto nNumPix = static_cast<std::size_t>(oRect.GetNumPix());
    oPositions.vdfCol.resize(nNumPix);
    oPositions.vdfRow.resize(nNumPix);
    const Part oPart{oRect, oPositions.vdfCol.data(), oPositions.vdfRow.data()};
    const int nFirstCol = oRect.nCol / kCell;
    const int nFirstRow = oRect.nRow / kCell;
    const int nAcross = (oRect.nCol + oRect.nCols - 1) / kCell - nFirstCol + 1;
    const int nDown = (oRect.nRow + oRect.nRows - 1) / kCell - nFirstRow + 1;
    const int nThreads = static_cast<int>(moTransformers.size());
    std::exception_ptr poFailure;
#pragma omp parallel for schedule(dynamic) num_threads(nThreads)
    for (int n = 0; n < nAcross * nDown; ++n) {
        try {
            FillCell(*moTransformers[static_cast<std::size_t>(omp_get_thread_num())],
                     (nFirstCol + n % nAcross) * kCell, (nFirstRow + n / nAcross) * kCell, kCell,
                     oPart);
        } catch (...) {
            // Of the memory that the transformers take.
#pragma omp critical(vetra_lattice)
            poFailure = std::current_exception();
        }
    }
    if (poFailure) {
        std::rethrow_exception(poFailure);
    }
}

void PositionLattice::FillCell(GeoTransformer& oTransformer, int nCol, int nRow, int nSize,
                               const Part& oPart) const {
    const utils::PixelRect& oRect = oPart.oRect;
    const int nFirstCol = Part::First(nCol, oRect.nCol);
    const int nFirstRow = Part::First(nRow, oRect.nRow);
    const int nEndCol = Part::End(nCol, nSize, oRect.nCol, oRect.nCols);
    const int nEndRow = Part::End(nRow, nSize, oRect.nRow, oRect.nRows);
    if (nFirstCol >= nEndCol || nFirstRow >= nEndRow) {
        return;
    }
    if (mdfError <= 0.0 || nSize <= kSmallestCell) {
        Evaluate(oTransformer, nCol, nRow, nSize, nSize, oPart);
        return;
    }

    // Nodes, then the places midway between four of them. All at once: a batch may decide how its
    // positions are transformed.
    constexpr int kMids = kNodes - 1;
    constexpr int kNumNodes = kNodes * kNodes;
    constexpr int kPlaces = kNumNodes + kMids * kMids;
    double adfCol[kPlaces];
    double adfRow[kPlaces];
    const double dfStep = static_cast<double>(nSize) / kMids;
    for (int n = 0; n < kPlaces; ++n) {
        const bool bMid = n >= kNumNodes;
        const int nAcross = bMid ? kMids : kNodes;
        const int nPlace = bMid ? n - kNumNodes : n;
        adfCol[n] = nCol + (nPlace % nAcross + (bMid ? 0.5 : 0.0)) * dfStep;
        adfRow[n] = nRow + (nPlace / nAcross + (bMid ? 0.5 : 0.0)) * dfStep;
    }
    oTransformer.ToSource(kPlaces, adfCol, adfRow);

    // The polynomial along a row in which the rows of nodes have these weights.
    const auto Combine = [](const double* padfNodes, const auto& vdfWeights, std::size_t nPlace,
                            double* padfRow) {
        for (std::size_t x = 0; x < kNodes; ++x) {
            double df = vdfWeights[0][nPlace] * padfNodes[x];
            for (std::size_t y = 1; y < kNodes; ++y) {
                df += vdfWeights[y][nPlace] * padfNodes[y * kNodes + x];
            }
            padfRow[x] = df;
        }
    };
    const auto Along = [](const double* padfRow, const auto& vdfWeights, std::size_t n) {
        return (((vdfWeights[0][n] * padfRow[0] + vdfWeights[1][n] * padfRow[1]) +
                 vdfWeights[2][n] * padfRow[2]) +
                vdfWeights[3][n] * padfRow[3]) +
               vdfWeights[4][n] * padfRow[4];
    };
    bool bGood = std::none_of(adfCol, adfCol + kPlaces, [](double df) { return std::isnan(df); });
    double adfColRow[kNodes];
    double adfRowRow[kNodes];
    for (std::size_t y = 0; y < kMids && bGood; ++y) {
        Combine(adfCol, mvdfMidWeights, y, adfColRow);
        Combine(adfRow, mvdfMidWeights, y, adfRowRow);
        for (std::size_t x = 0; x < kMids; ++x) {
            const std::size_t nExact = kNumNodes + y * kMids + x;
            bGood = bGood && std::hypot(Along(adfColRow, mvdfMidWeights, x) - adfCol[nExact],
                                        Along(adfRowRow, mvdfMidWeights, x) - adfRow[nExact]) <=
                                 kCheckedShare * mdfError;
        }
    }
    if (!bGood) {
        const int nHalf = nSize / 2;
        for (const int y : {0, nHalf}) {
            for (const int x : {0, nHalf}) {
                if (x < mnCols - nCol && y < mnRows - nRow) {
                    FillCell(oTransformer, nCol + x, nRow + y, nHalf, oPart);
                }
            }
        }
        return;
    }
    // A smaller cell takes every second weight, and so on.
    const int nStride = kCell / nSize;
    for (int y = nFirstRow; y < nEndRow; ++y) {
        const auto nPlace = static_cast<std::size_t>((y - nRow) * nStride);
        Combine(adfCol, mvdfWeights, nPlace, adfColRow);
        Combine(adfRow, mvdfWeights, nPlace, adfRowRow);
        const std::size_t nIdx = oPart.Index(nFirstCol, y);
        double* padfCol = oPart.padfCol + nIdx;
        double* padfRow = oPart.padfRow + nIdx;
        const int nCount = nEndCol - nFirstCol;
        const int nFirst = nFirstCol - nCol;
        for (int i = 0; i < nCount; ++i) {
            const auto n = static_cast<std::size_t>((nFirst + i) * nStride);
            padfCol[i] = Along(adfColRow, mvdfWeights, n);
            padfRow[i] = Along(adfRowRow, mvdfWeights, n);
        }
    }
}

// All pixels of a cell that are in the target, row by row: the rows are batches.
void PositionLattice::Evaluate(GeoTransformer& oTransformer, int nCol, int nRow, int nCols,
                               int nRows, const Part& oPart) const {
    const utils::PixelRect& oRect = oPart.oRect;
    const int nCount = std::min(nCols, mnCols - nCol);
    const int nFirstCol = Part::First(nCol, oRect.nCol);
    const int nEndCol = Part::End(nCol, nCols, oRect.nCol, oRect.nCols);
    const int nEndRow = Part::End(nRow, nRows, oRect.nRow, oRect.nRows);
    double adfCol[kCell];
    double adfRow[kCell];
    for (int y = Part::First(nRow, oRect.nRow); y < nEndRow; ++y) {
        for (int i = 0; i < nCount; ++i) {
            adfCol[i] = nCol + i;
            adfRow[i] = y;
        }
        oTransformer.ToSource(nCount, adfCol, adfRow);
        const std::size_t nIdx = oPart.Index(nFirstCol, y);
        std::copy_n(adfCol + (nFirstCol - nCol), nEndCol - nFirstCol, oPart.padfCol + nIdx);
        std::copy_n(adfRow + (nFirstCol - nCol), nEndCol - nFirstCol, oPart.padfRow + nIdx);
    }
}

}  // namespace vetra::tool
