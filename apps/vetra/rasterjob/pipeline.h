#ifndef VETRA_APPS_RASTERJOB_PIPELINE_H
#define VETRA_APPS_RASTERJOB_PIPELINE_H

#include <functional>

namespace vetra::tool {

/// What is done with each of a sequence of blocks. The argument is the number of the slot that
/// holds the block's memory; a slot is in one step at a time.
struct PipelineSteps {
    std::function<bool(int)> fnPlan;  ///< chooses the next block; false when there is none
    std::function<void(int)> fnRead;
    std::function<void(int)> fnRun;
    std::function<void(int)> fnWrite;
};

/// Takes blocks through four steps that overlap: running on the caller's thread, the others on one
/// each. Planning and running may start a team. Every step sees the blocks in their order. No more
/// blocks are under way than there are slots.
///
/// What a step throws stops all others, after the blocks that they are at, and is thrown when no
/// thread is left; where several steps throw, the first counts.
/// \throws Interrupted also when a signal has come.
void RunPipeline(int nSlots, const PipelineSteps& oSteps);

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_PIPELINE_H
