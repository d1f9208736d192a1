#include "vetra/base/utils/resample/postfm/ibufpostfm.h"

namespace vetra::utils {

// Here, so that the class's type information is emitted once, in the library.
IBufPosTfm::~IBufPosTfm() = default;

}  // namespace vetra::utils
