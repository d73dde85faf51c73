#include "platform/documents/preview/ChildLimits.h"

#include <csignal>
#include <sys/prctl.h>
#include <sys/resource.h>

namespace platform {
namespace {

#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
constexpr bool memoryCanBeLimited = false; // sanitizers reserve the whole address space
#else
constexpr bool memoryCanBeLimited = true;
#endif

void limit(__rlimit_resource_t what, rlim_t most) {
    const rlimit both{most, most};
    ::setrlimit(what, &both);
}

} // namespace

void limitThisProcess(std::size_t memory, unsigned work) {
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
    ::prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0);
    ::prctl(PR_SET_DUMPABLE, 0);
    if (memoryCanBeLimited)
        limit(RLIMIT_AS, memory);
    limit(RLIMIT_CPU, work);
    ::signal(SIGXFSZ, SIG_IGN); // a library that would write something down goes on without
    limit(RLIMIT_FSIZE, 0);
    limit(RLIMIT_CORE, 0);
}

} // namespace platform
