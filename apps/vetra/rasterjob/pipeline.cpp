#include "rasterjob/pipeline.h"

#include <chrono>
#include <condition_variable>
#include <deque>
#include <exception>
#include <mutex>
#include <thread>

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
        std::thread oReader([&] { Serve(moPlanned, moSteps.fnRead, moRead); });
        std::thread oWriter;
        try {
            oWriter = std::thread([&] { Serve(moDone, moSteps.fnWrite, moFree); });
            Drive();
        } catch (...) {
            Fail();
        }
        Stop();
        oReader.join();
        if (oWriter.joinable()) {
            oWriter.join();
        }
        if (mpoFailure) {
            std::rethrow_exception(mpoFailure);
        }
    }

 private:
    using Queue = std::deque<int>;

    void Serve(Queue& oFrom, const std::function<void(int)>& fnStep, Queue& oTo) {
        try {
            std::unique_lock oLock(moMutex);
            for (;;) {
                moChange.wait(oLock, [&] { return mbStop || !oFrom.empty(); });
                if (mbStop) {
                    return;
                }
                Pass(oLock, oFrom, [&](int nSlot) -> Queue& {
                    fnStep(nSlot);
                    return oTo;
                });
            }
        } catch (...) {
            Fail();
        }
    }

    void Drive() {
        bool bMore = true;
        std::unique_lock oLock(moMutex);
        for (;;) {
            moChange.wait_for(oLock, kLookForSignals, [&] {
                return mbStop || !moRead.empty() || (bMore && !moFree.empty()) || IsEmpty();
            });
            if (mbStop) {
                return;
            }
            ThrowIfInterrupted();
            // Planning first: the reader shall never wait for a block.
            if (bMore && !moFree.empty()) {
                Pass(oLock, moFree, [&](int nSlot) -> Queue& {
                    bMore = moSteps.fnPlan(nSlot);
                    return bMore ? moPlanned : moFree;
                });
            } else if (!moRead.empty()) {
                Pass(oLock, moRead, [&](int nSlot) -> Queue& {
                    moSteps.fnRun(nSlot);
                    return moDone;
                });
            } else if (!bMore && IsEmpty()) {
                return;
            }
        }
    }

    bool IsEmpty() const { return static_cast<int>(moFree.size()) == mnSlots; }

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
    bool mbStop = false;
    std::exception_ptr mpoFailure;
};

}  // namespace

void RunPipeline(int nSlots, const PipelineSteps& oSteps) { Pipeline(nSlots, oSteps).Run(); }

}  // namespace vetra::tool
