#ifndef VETRA_CHRONOCORE_TIMESYSTEMCONVERTER_H
#define VETRA_CHRONOCORE_TIMESYSTEMCONVERTER_H

#include "vetra/chronocore/timestamp.h"
#include "vetra/export.h"

namespace vetra::tsys {

/// Turns calendar dates into time stamps.
class VETRA_EXPORT TimeSystemConverter {
 public:
    /// The Julian date of a date in the Gregorian calendar, which is also used for the times before
    /// it was introduced. Every day has 86400 s; leap seconds don't count.
    ///
    /// Values beyond their usual range carry over: month 13 is January of the next year, day 0 the
    /// last day of the month before.
    ///
    /// Source: P. K. Seidelmann (ed.), "Explanatory Supplement to the Astronomical Almanac",
    /// University Science Books 1992, section 12.92, in a form for any year.
    ///
    /// \param year    astronomical: year 0 is ahead of year 1
    /// \param month   1 is January
    /// \param day     from 1
    /// \param hour    from 0
    /// \param minute  from 0
    /// \param second  with its fraction; not finite, it makes the time so
    /// \param result  the days up to the midnight that the day begins with, which end in .5, and
    ///                the fraction of the day
    void CalendarToJulian(const int& year, const int& month, const int& day, const int& hour,
                          const int& minute, const double& second, Timestamp& result) const;
};

}  // namespace vetra::tsys

#endif  // VETRA_CHRONOCORE_TIMESYSTEMCONVERTER_H
