#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <stdexcept>
#include <string>

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/base/utils/resample/resamplerfactory.h"
#include "vetra/faultcore/exceptions.h"

// A text gives a resampler or one of the library's failures.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* pabyData, std::size_t nSize) {
    const std::string sText(reinterpret_cast<const char*>(pabyData), nSize);
    const vetra::utils::ResamplerFactory oFactory;
    try {
        const std::unique_ptr<vetra::utils::IRasterResampler> poResampler(
            oFactory.GetResampler(sText));
        int nLeft = 0;
        int nTop = 0;
        int nRight = 0;
        int nBottom = 0;
        poResampler->GetSrcBufferMargins(nLeft, nTop, nRight, nBottom);
        if (nLeft > 0 || nTop > 0 || nRight < 0 || nBottom < 0) {
            std::abort();
        }
    } catch (const vetra::Exception&) {
    } catch (const std::length_error&) {
    }
    return 0;
}
