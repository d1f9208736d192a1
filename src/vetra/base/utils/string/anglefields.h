#ifndef VETRA_BASE_UTILS_STRING_ANGLEFIELDS_H
#define VETRA_BASE_UTILS_STRING_ANGLEFIELDS_H

// Private: the sexagesimal fields of an angle, for all that writes them.
namespace vetra {

enum class AngleKind { eLatitude, eLongitude };

/// An angle as it is written. Minutes and seconds are below 60.
struct AngleFields {
    int nDegrees;  // at most 180
    int nMinutes;
    int nSeconds;
    int nFraction;      // of a second, in units of one by the scale
    bool bNegative;     // west or south
    char chHemisphere;  // N, S, E or W
};

/// Reduces an angle in degrees to one turn, folds a latitude at the poles or wraps a longitude, and
/// splits it.
///
/// \param dfValue  degrees, up to 2^53 either way: beyond, whole degrees can't be told apart
/// \param nScale   the fraction's units in a second, a power of ten; 1 for no fraction, and then
///                 seconds are cut, not rounded, but for the last 0.0005
/// \throws ParameterException (argument "value") for an infinity, a NaN or a larger angle.
AngleFields SplitAngle(double dfValue, AngleKind eKind, int nScale);

}  // namespace vetra

#endif  // VETRA_BASE_UTILS_STRING_ANGLEFIELDS_H
