// Static events: an event is a static object of a class, not attached to an
// instance; the sender comes with every call. Code outside the library
// installs a handler by writing one of the three slots; the library only
// raises events.
//
// Thread safety: slots are read without locking; writing a slot while the
// event is raised on another thread is not supported.
#pragma once

#include <oecore/core/loglevel.h>
#include <oecore/core/string.h>

#include <cstdint>

template <class Sender, class Args>
class OmbEventHandler {
public:
    using Handler = void (*)(Sender* sender, const Args& args);

    Handler slots[3] = {nullptr, nullptr, nullptr};

    // Calls the slots in order. A handler that throws ends the call: the
    // remaining slots are skipped and the exception is discarded.
    void raise(Sender* sender, const Args& args) const noexcept {
        try {
            for (Handler handler : slots)
                if (handler) handler(sender, args);
        } catch (...) {
        }
    }
};

struct OmbNoEventArgs {
    friend bool operator==(const OmbNoEventArgs&, const OmbNoEventArgs&) { return true; }
};

struct OmbErrorEventArgs {
    OmbString message;
    friend bool operator==(const OmbErrorEventArgs&, const OmbErrorEventArgs&) = default;
};

struct OmbLogEventArgs {
    OmbLogLevel logLevel = OmbLogOff;
    OmbString message;
    // Two log events are equal when their messages are.
    friend bool operator==(const OmbLogEventArgs& a, const OmbLogEventArgs& b) { return a.message == b.message; }
};

struct OmbGlobalStatusEventArgs {
    std::uint32_t id = 0;
    OmbString message;
    int percentComplete = -1;
    bool isLast = false;

    bool isPercentCompleteValid() const { return percentComplete >= 0; }
    friend bool operator==(const OmbGlobalStatusEventArgs&, const OmbGlobalStatusEventArgs&) = default;
};
