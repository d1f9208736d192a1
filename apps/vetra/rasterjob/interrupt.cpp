#include "rasterjob/interrupt.h"

#include <atomic>
#include <csignal>
#include <cstdlib>
#include <initializer_list>

namespace vetra::tool {

namespace {

// Any thread may look.
std::atomic<int> nCaught = 0;
static_assert(std::atomic<int>::is_always_lock_free);

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
    if (const int nSignal = nCaught) {
        throw Interrupted{nSignal};
    }
}

void EndBySignal(int nSignal) {
    std::signal(nSignal, SIG_DFL);
    std::raise(nSignal);
    std::_Exit(128 + nSignal);
}

}  // namespace vetra::tool
