// Cancelling long operations. Long loops call Omb_checkAbort(); a request
// for one thread, or for all (thread id 0), makes the next check on that
// thread throw OmbXAbort. A request for all threads is consumed by the first
// thread that checks.
//
// Thread safety: every function may be called from any thread.
#pragma once

#include <cstdint>

void Omb_requestAbort(std::uint32_t threadId);
void Omb_resetAbort(std::uint32_t threadId);
// Throws OmbXAbort, clearing the request, when one is pending for the
// calling thread or for all threads.
void Omb_checkAbort();

// Keys whose being held down interrupts the calling thread's long operations.
// Linux gives a library no view of the keyboard, so no key is ever seen held:
// registering does nothing and Omb_checkInterrupt() never throws. They stay
// for code written against the interface.
void Omb_RegisterInterruptKey(int virtualKey);
void Omb_UnregisterInterruptKey(int virtualKey);
void Omb_checkInterrupt();
void Omb_checkAbortAndInterrupt();
