// Progress reports of long jobs, raised as OmbRuntime::statusChangedEvent.
//
// Thread safety: all operations may be called from any thread.
#pragma once

#include <oecore/core/engineobject.h>
#include <oecore/core/string.h>

#include <cstdint>
#include <mutex>
#include <set>

class OmbGlobalStatusHandler {
public:
    static OmbGlobalStatusHandler& instance();

    // A new status id; ids increase from 1.
    std::uint32_t getUniqueID();
    // Raises the status event; a last status forgets its id.
    void sendGlobalStatus(OmbEngineObject* sender, std::uint32_t id, const OmbString& message, int percentComplete,
                          bool isLast);
    // Sends a last status (percent -1) for every id still open.
    void killOngoingJobs();

private:
    OmbGlobalStatusHandler() = default;

    std::mutex mutex_;
    std::uint32_t nextId_ = 1;
    std::set<std::uint32_t> open_;
};

// Counts the finished tasks of one job and reports "Done N%" each time the
// done fraction passes the next step, and "Done 100 %" when finished.
class OmbGlobalStatusPercent {
public:
    OmbGlobalStatusPercent(OmbEngineObject* sender, std::uint32_t id, std::uint64_t taskCount, int stepPercent,
                           bool enabled = true);

    void oneMoreTaskIsDone() { setDoneTasks(done_ + 1); }
    void setDoneTasks(std::uint64_t done);
    void finished();

private:
    OmbEngineObject* sender_;
    std::uint32_t id_;
    std::uint64_t taskCount_;
    int step_;
    bool enabled_;
    std::uint64_t done_ = 0;
    int nextReport_;
};
