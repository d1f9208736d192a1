#include "rasterjob/interrupt.h"

#include <csignal>
#include <cstdlib>
#include <initializer_list>

namespace vetra::tool {

namespace {

volatile std::sig_atomic_t nCaught = 0;

void Remember(int nSignal) { nCaught = nSignal; }

}  // namespace

void CatchSignals() {
    for (const int nSignal : {SIGINT, SIGTERM, SIGHUP}) {
        // A signal that is ignored from outside, as under nohup, stays ignored.
        if (std::signal(nSignal, Remember) == SIG_IGN) {
            std::signal(nSignal, SIG_IGN);
        }
    }
    std::signal(SIGPIPE, SIG_IGN);
    std::signal(SIGXFSZ, SIG_IGN);
}

int GetInterrupt() { return nCaught; }

void ThrowIfInterrupted() {
    if (nCaught != 0) {
        throw Interrupted{nCaught};
    }
}

void EndBySignal(int nSignal) {
    std::signal(nSignal, SIG_DFL);
    std::raise(nSignal);
    std::_Exit(128 + nSignal);
}

}  // namespace vetra::tool
