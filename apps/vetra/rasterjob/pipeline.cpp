#include "rasterjob/pipeline.h"

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <deque>
#include <exception>
#include <mutex>
#include <thread>
#include <vector>

#include "rasterjob/interrupt.h"

namespace vetra::tool {

namespace {

// How long a signal can wait while nothing happens.
constexpr std::chrono::milliseconds kLookForSignals(50);

class Pipeline {
 public:
    Pipeline(int nSlots, const PipelineSteps& oSteps) : mnSlots(nSlots), moSteps(oSteps) {
        for (int nSlot = 0; nSlot < nSlots; ++nSlot) {
            moFree.push_back(nSlot);
        }
    }

    void Run() {
        std::vector<std::thread> oThreads;
        try {
            oThreads.emplace_back([&] { Plan(); });
            oThreads.emplace_back([&] { Serve(moPlanned, moSteps.fnRead, moRead); });
            oThreads.emplace_back([&] { Serve(moDone, moSteps.fnWrite, moFree); });
            Drive();
        } catch (...) {
            Fail();
        }
        Stop();
        for (std::thread& oThread : oThreads) {
            oThread.join();
        }
        if (mpoFailure) {
            std::rethrow_exception(mpoFailure);
        }
    }

 private:
    using Queue = std::deque<int>;

    void Plan() {
        // Waiting threads of a team spin as long as there is a processor for each thread of all
        // teams, and so take the processors from those that read and write. A second team ends that
        // where processors are scarce. It must do something, or the compiler leaves it out.
        std::atomic<int> nThreads = 0;
#pragma omp parallel
        ++nThreads;
        Work(moFree, [&](int nSlot) -> Queue& {
            const bool bMore = moSteps.fnPlan(nSlot);
            mbAllPlanned = !bMore;
            return bMore ? moPlanned : moFree;
        });
    }

    void Serve(Queue& oFrom, const std::function<void(int)>& fnStep, Queue& oTo) {
        Work(oFrom, [&](int nSlot) -> Queue& {
            fnStep(nSlot);
            return oTo;
        });
    }

    // What a thread does with the slots of a queue, until all is done.
    template <class Step>
    void Work(Queue& oFrom, const Step& fnStep) {
        try {
            std::unique_lock oLock(moMutex);
            for (;;) {
                moChange.wait(oLock, [&] { return mbStop || !oFrom.empty(); });
                if (mbStop || (&oFrom == &moFree && mbAllPlanned)) {
                    return;
                }
                Pass(oLock, oFrom, fnStep);
            }
        } catch (...) {
            Fail();
        }
    }

    void Drive() {
        std::unique_lock oLock(moMutex);
        for (;;) {
            moChange.wait_for(oLock, kLookForSignals,
                              [&] { return mbStop || !moRead.empty() || IsDone(); });
            if (mbStop || IsDone()) {
                return;
            }
            ThrowIfInterrupted();
            if (!moRead.empty()) {
                Pass(oLock, moRead, [&](int nSlot) -> Queue& {
                    moSteps.fnRun(nSlot);
                    return moDone;
                });
            }
        }
    }

    bool IsDone() const { return mbAllPlanned && static_cast<int>(moFree.size()) == mnSlots; }

    // Takes the first slot of a queue through a step, which says where it goes then.
    template <class Step>
    void Pass(std::unique_lock<std::mutex>& oLock, Queue& oFrom, const Step& fnStep) {
        const int nSlot = oFrom.front();
        oFrom.pop_front();
        oLock.unlock();
        Queue& oTo = fnStep(nSlot);
        oLock.lock();
        oTo.push_back(nSlot);
        moChange.notify_all();
    }

    // In a handler: keeps the exception if it is the first.
    void Fail() {
        const std::lock_guard oLock(moMutex);
        if (!mpoFailure) {
            mpoFailure = std::current_exception();
        }
        mbStop = true;
        moChange.notify_all();
    }

    void Stop() {
        const std::lock_guard oLock(moMutex);
        mbStop = true;
        moChange.notify_all();
    }

    const int mnSlots;
    const PipelineSteps& moSteps;
    std::mutex moMutex;
    std::condition_variable moChange;
    Queue moFree;
    Queue moPlanned;
    Queue moRead;
    Queue moDone;
    std::atomic<bool> mbAllPlanned = false;
    bool mbStop = false;
    std::exception_ptr mpoFailure;
};

}  // namespace

void RunPipeline(int nSlots, const PipelineSteps& oSteps) { Pipeline(nSlots, oSteps).Run(); }

}  // namespace vetra::tool
