#include <oecore/core/globalstatus.h>
#include <oecore/core/runtime.h>

#include <string>
#include <vector>

OmbGlobalStatusHandler& OmbGlobalStatusHandler::instance() {
    static OmbGlobalStatusHandler handler;
    return handler;
}

std::uint32_t OmbGlobalStatusHandler::getUniqueID() {
    std::lock_guard lock(mutex_);
    return nextId_++;
}

void OmbGlobalStatusHandler::sendGlobalStatus(OmbEngineObject* sender, std::uint32_t id, const OmbString& message,
                                              int percentComplete, bool isLast) {
    {
        std::lock_guard lock(mutex_);
        if (isLast)
            open_.erase(id);
        else
            open_.insert(id);
    }
    OmbRuntime::statusChangedEvent.raise(sender, OmbGlobalStatusEventArgs{id, message, percentComplete, isLast});
}

void OmbGlobalStatusHandler::killOngoingJobs() {
    std::set<std::uint32_t> open;
    {
        std::lock_guard lock(mutex_);
        open.swap(open_);
    }
    for (const std::uint32_t id : open)
        OmbRuntime::statusChangedEvent.raise(nullptr, OmbGlobalStatusEventArgs{id, OmbString(), -1, true});
}

OmbGlobalStatusPercent::OmbGlobalStatusPercent(OmbEngineObject* sender, std::uint32_t id, std::uint64_t taskCount,
                                               int stepPercent, bool enabled)
    : sender_(sender),
      id_(id),
      taskCount_(taskCount),
      step_(stepPercent > 0 ? stepPercent : 1),
      enabled_(enabled),
      nextReport_(step_) {}

void OmbGlobalStatusPercent::setDoneTasks(std::uint64_t done) {
    done_ = done;
    if (!enabled_ || taskCount_ == 0) return;
    const int percent = static_cast<int>(done_ >= taskCount_ ? 100 : done_ * 100 / taskCount_);
    if (percent < nextReport_) return;
    while (nextReport_ <= percent) nextReport_ += step_;
    OmbGlobalStatusHandler::instance().sendGlobalStatus(
        sender_, id_, OmbString("Done " + std::to_string(percent) + "%"), percent, false);
}

void OmbGlobalStatusPercent::finished() {
    if (enabled_)
        OmbGlobalStatusHandler::instance().sendGlobalStatus(sender_, id_, OmbString::literal("Done 100 %"), 100, true);
}
