#ifndef VETRA_APPS_RASTERJOB_INTERRUPT_H
#define VETRA_APPS_RASTERJOB_INTERRUPT_H

namespace vetra::tool {

/// Thrown when the user or the system asks the run to stop.
struct Interrupted {
    int nSignal;
};

/// From now on a signal to stop is remembered, so that the run can tidy up, and a closed pipe or a
/// limit on file sizes makes writing fail instead of ending the process.
void CatchSignals();
/// The remembered signal, or 0.
int GetInterrupt();
/// \throws Interrupted when there is one.
void ThrowIfInterrupted();
/// Ends the process by a signal, as the caller expects it who sent it.
[[noreturn]] void EndBySignal(int nSignal);

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_INTERRUPT_H
