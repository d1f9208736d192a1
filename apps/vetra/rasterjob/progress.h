#ifndef VETRA_APPS_RASTERJOB_PROGRESS_H
#define VETRA_APPS_RASTERJOB_PROGRESS_H

#include <chrono>

namespace vetra::tool {

/// Shows how far a run is, and the time that it still takes: a line in place on the standard error
/// output when that is a terminal, else nothing.
class Progress {
 public:
    explicit Progress(bool bQuiet);
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;
    /// Ends the line; removes the bar of a run that didn't reach its end.
    ~Progress();

    /// Begins a part of the run, where the last one ended.
    /// \param dfEnd  share of the run that is done at the part's end, 0 to 1
    void StartPart(double dfEnd);
    /// \param dfDone  how much of the part is done, 0 to 1, never less than before
    void Show(double dfDone);

 private:
    bool mbShown;
    std::chrono::steady_clock::time_point moStart;
    double mdfPartStart = 0.0;
    double mdfPartEnd = 0.0;
    int mnPercent = -1;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_PROGRESS_H
