#ifndef VETRA_TESTS_SUPPORT_ORDINARYUSER_H
#define VETRA_TESTS_SUPPORT_ORDINARYUSER_H

#include <sys/wait.h>
#include <unistd.h>

#include <functional>

namespace vetra::tests {

/// Permissions don't bind the superuser: asks in a process of an ordinary one.
inline bool AsOrdinaryUser(const std::function<bool()>& fnAsk) {
    const pid_t nChild = fork();
    if (nChild == 0) {
        const bool bReady = geteuid() != 0 || (setresgid(65534, 65534, 65534) == 0 &&
                                               setresuid(65534, 65534, 65534) == 0);
        _exit(bReady && fnAsk() ? 0 : 1);
    }
    int nStatus = 0;
    return waitpid(nChild, &nStatus, 0) == nChild && WIFEXITED(nStatus) &&
           WEXITSTATUS(nStatus) == 0;
}

}  // namespace vetra::tests

#endif  // VETRA_TESTS_SUPPORT_ORDINARYUSER_H
