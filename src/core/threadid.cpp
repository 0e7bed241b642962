#include <oecore/core/threadid.h>

#include <unistd.h>

std::uint32_t Omb_currentThreadId() {
    static thread_local const std::uint32_t id = static_cast<std::uint32_t>(gettid());
    return id;
}
