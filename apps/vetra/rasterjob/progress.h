#ifndef VETRA_APPS_RASTERJOB_PROGRESS_H
#define VETRA_APPS_RASTERJOB_PROGRESS_H

namespace vetra::tool {

/// Shows how far a run is: a bar in place on the standard error output when that is a terminal,
/// else dots and tens on the standard output, so that the standard error output holds errors only.
class Progress {
 public:
    explicit Progress(bool bQuiet);
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;
    /// Ends the line; removes the bar of a run that didn't reach its end.
    ~Progress();

    /// \param dfDone  0 to 1, never less than before
    void Show(double dfDone);

 private:
    bool mbQuiet;
    bool mbTerminal;
    int mnPercent = -1;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_PROGRESS_H
