#include "vetra/base/utils/math/sincos.h"

#include <cmath>

void sincos(double x, double& s, double& c) {
    s = std::sin(x);
    c = std::cos(x);
}
