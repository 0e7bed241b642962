#pragma once

#include <cstdint>

// The kernel's id of the calling thread, as log lines and abort requests
// name threads.
std::uint32_t Omb_currentThreadId();
