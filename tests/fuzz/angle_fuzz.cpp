#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>

#include "vetra/base/utils/string/dectodeg.h"
#include "vetra/base/utils/string/dmsutils.h"
#include "vetra/faultcore/exceptions.h"

namespace {

void Require(bool bHolds) {
    if (!bHolds) {
        std::abort();
    }
}

void Read(const std::string& sText) {
    double dfAngle = 0.0;
    const int nKind = DMSToDec(sText.c_str(), &dfAngle);
    Require(nKind >= 0 && nKind <= 3);
    Require(nKind == 0 ? dfAngle >= 0.0 : std::abs(dfAngle) <= (nKind == 2 ? 180.0 : 90.0));
}

// Every form fits its room to the byte, and what the marked forms say is read back.
void Write(double dfValue) {
    for (int nForm = 1; nForm <= 11; ++nForm) {
        const auto pszText = std::make_unique<char[]>(19);
        try {
            DecToDMS(dfValue, nForm, pszText.get());
        } catch (const vetra::ParameterException&) {
            Require(!(std::abs(dfValue) <= 0x1p53) && pszText[0] == '\0');
            return;
        }
        const bool bLatitude = nForm <= 3 || nForm == 7 || nForm == 10;
        int nDegrees = 0;
        char chHemisphere = '\0';
        char szKind[] = "Long";
        std::memcpy(szKind, bLatitude ? "Lat" : "Long", bLatitude ? 4 : 5);
        DecimalToDegrees(dfValue, szKind, &nDegrees, nullptr, nullptr, nullptr, 6, &chHemisphere);
        double dfRead = 0.0;
        const int nKind = DMSToDec(pszText.get(), &dfRead);
        if (nForm < 7 || nForm > 9) {
            // Far below -270 a latitude is folded to more than 90.
            Require(bLatitude ? nDegrees == 90 || nKind == (nDegrees < 90 ? 1 : 0) : nKind == 2);
            Require(std::abs(std::abs(dfRead) - nDegrees) < 1.001);
            Require(std::signbit(dfRead) ==
                    (nKind != 0 && (chHemisphere == 'S' || chHemisphere == 'W')));
        }
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* pabyData, std::size_t nSize) {
    Read(std::string(reinterpret_cast<const char*>(pabyData), nSize));
    double dfValue = 0.0;
    std::memcpy(&dfValue, pabyData, nSize < sizeof dfValue ? nSize : sizeof dfValue);
    Write(dfValue);
    return 0;
}
