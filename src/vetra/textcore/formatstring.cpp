#include "vetra/textcore/formatstring.h"

#include <locale.h>

#include <cstdarg>
#include <cstdio>
#include <stdexcept>

namespace {

// Ends both argument lists on every way out, an exception of the allocator included.
struct ArgumentList {
    va_list args;
    ~ArgumentList() { va_end(args); }
};

// The C locale for this thread and the life of the object.
class NeutralLocale {
 public:
    NeutralLocale() : mOld(uselocale(Get())) {}
    NeutralLocale(const NeutralLocale&) = delete;
    ~NeutralLocale() { uselocale(mOld); }

 private:
    static locale_t Get() {
        static const locale_t kCLocale = newlocale(LC_ALL_MASK, "C", nullptr);
        return kCLocale;
    }
    locale_t mOld;
};

}  // namespace

std::string FormatString(const char* format, ...) {
    ArgumentList oMeasure;
    ArgumentList oWrite;
    va_start(oMeasure.args, format);
    va_copy(oWrite.args, oMeasure.args);

    const NeutralLocale oNeutral;
    const int nLength = std::vsnprintf(nullptr, 0, format, oMeasure.args);
    if (nLength < 0) {
        throw std::invalid_argument("FormatString: the arguments cannot be formatted");
    }
    std::string sText(static_cast<std::size_t>(nLength), '\0');
    // Writes nLength characters and the zero byte that std::string keeps behind its last one.
    std::vsnprintf(sText.data(), sText.size() + 1, format, oWrite.args);
    return sText;
}
