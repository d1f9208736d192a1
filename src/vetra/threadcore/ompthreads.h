#ifndef VETRA_THREADCORE_OMPTHREADS_H
#define VETRA_THREADCORE_OMPTHREADS_H

#include <omp.h>

#include <algorithm>

// Private: how loops are shared out among OpenMP threads.
namespace vetra {

/// The most threads that a team started here can have.
inline int OMPGetMaxThreads() { return omp_get_max_threads(); }

/// Whether nCount independent pieces of work are worth a team: there is more than one of them and
/// more than one thread, and no other team is at work or teams may be nested.
inline bool OMPCanShare(int nCount) {
    return nCount > 1 && OMPGetMaxThreads() > 1 &&
           (omp_get_max_active_levels() > 1 || !omp_in_parallel());
}

/// While it lives, teams that the calling thread starts have at most as many threads as there are
/// pieces of work.
class OMPThreadCount {
 public:
    explicit OMPThreadCount(int nCount) : mnBefore(omp_get_max_threads()) {
        omp_set_num_threads(std::clamp(nCount, 1, mnBefore));
    }
    ~OMPThreadCount() { omp_set_num_threads(mnBefore); }

    OMPThreadCount(const OMPThreadCount&) = delete;
    OMPThreadCount& operator=(const OMPThreadCount&) = delete;

 private:
    int mnBefore;
};

}  // namespace vetra

#endif  // VETRA_THREADCORE_OMPTHREADS_H
