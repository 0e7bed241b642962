#include <oecore/core/abort.h>
#include <oecore/core/exception.h>
#include <oecore/core/threadid.h>

#include <map>
#include <mutex>

namespace {

struct AbortState {
    std::mutex mutex;
    bool global = false;
    std::map<std::uint32_t, bool> perThread;
};

AbortState& state() {
    static AbortState s;
    return s;
}

// Called with the abort mutex held.
void checkAbortLocked(AbortState& s) {
    const std::uint32_t self = Omb_currentThreadId();
    const auto own = s.perThread.find(self);
    const bool requested = s.global || (own != s.perThread.end() && own->second);
    if (!requested) return;
    s.global = false;
    if (own != s.perThread.end()) s.perThread.erase(own);
    OMB_THROW(Abort);
}

}  // namespace

void Omb_requestAbort(std::uint32_t threadId) {
    AbortState& s = state();
    std::lock_guard lock(s.mutex);
    if (threadId == 0)
        s.global = true;
    else
        s.perThread[threadId] = true;
}

void Omb_resetAbort(std::uint32_t threadId) {
    AbortState& s = state();
    std::lock_guard lock(s.mutex);
    if (threadId == 0)
        s.global = false;
    else
        s.perThread.erase(threadId);
}

void Omb_checkAbort() {
    AbortState& s = state();
    std::lock_guard lock(s.mutex);
    checkAbortLocked(s);
}

// Keys are never seen held down on Linux (see the header).
void Omb_RegisterInterruptKey(int) {}
void Omb_UnregisterInterruptKey(int) {}
void Omb_checkInterrupt() {}
void Omb_checkAbortAndInterrupt() { Omb_checkAbort(); }
