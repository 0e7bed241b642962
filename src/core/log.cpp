#include <oecore/core/log.h>
#include <oecore/core/stringbuilder.h>
#include <oecore/core/threadid.h>

#include <algorithm>
#include <atomic>
#include <mutex>
#include <vector>

OmbEventHandler<OmbEngineObject, OmbLogEventArgs> OmbLog::messageWrittenEvent;

namespace {

struct LogState {
    std::mutex mutex;
    std::vector<OmbRef<OmbLogAppender>> appenders;
    bool eventsEnabled = false;
    std::atomic<int> level{OmbLogOff};
    std::atomic<bool> levelLocked{false};
};

LogState& state() {
    static LogState s;
    return s;
}

constexpr const char* labels[] = {"ALL", "DEBUG", "INFO", "WARNING", "ERROR", "FATAL", "OFF"};

}  // namespace

void OmbLog::log(OmbLogLevel level, const OmbString& message) {
    // A message logged while this thread delivers one (an appender's failure
    // raising an exception, which logs itself) is dropped, not deadlocked on.
    static thread_local bool delivering = false;
    if (!isActive(level) || delivering) return;
    LogState& s = state();
    try {
        std::lock_guard lock(s.mutex);
        delivering = true;
        struct Done {
            ~Done() { delivering = false; }
        } done;
        if (s.appenders.empty() && !s.eventsEnabled) return;
        OmbStringBuilder line;
        line << '[' << Omb_currentThreadId() << "] " << levelLabel(level) << " - " << message;
        const OmbString text = line.str();
        for (const OmbRef<OmbLogAppender>& appender : s.appenders) appender->log(text, level);
        if (s.eventsEnabled) messageWrittenEvent.raise(nullptr, OmbLogEventArgs{level, text});
    } catch (...) {
        // A log call must never fail the operation that logs.
    }
}

void OmbLog::logText(OmbLogLevel level, const char* message) {
    if (message && isActive(level)) log(level, OmbString(message));
}

void OmbLog::debug(const OmbString& message) { log(OmbLogDebug, message); }
void OmbLog::debug(const char* message) { logText(OmbLogDebug, message); }
void OmbLog::info(const OmbString& message) { log(OmbLogInfo, message); }
void OmbLog::info(const char* message) { logText(OmbLogInfo, message); }
void OmbLog::warning(const OmbString& message) { log(OmbLogWarning, message); }
void OmbLog::warning(const char* message) { logText(OmbLogWarning, message); }
void OmbLog::error(const OmbString& message) { log(OmbLogError, message); }
void OmbLog::error(const char* message) { logText(OmbLogError, message); }
void OmbLog::fatal(const OmbString& message) { log(OmbLogFatal, message); }
void OmbLog::fatal(const char* message) { logText(OmbLogFatal, message); }

OmbLogLevel OmbLog::logLevel() { return static_cast<OmbLogLevel>(state().level.load(std::memory_order_relaxed)); }

void OmbLog::logLevel(OmbLogLevel level) {
    if (!state().levelLocked.load(std::memory_order_acquire)) state().level.store(level, std::memory_order_relaxed);
}

void OmbLog::forceLogLevel(OmbLogLevel level, bool lock) {
    state().level.store(level, std::memory_order_relaxed);
    state().levelLocked.store(lock, std::memory_order_release);
}

bool OmbLog::isActive(OmbLogLevel level) { return state().level.load(std::memory_order_relaxed) <= level; }

void OmbLog::addAppender(const OmbRef<OmbLogAppender>& appender) {
    if (!appender) return;
    LogState& s = state();
    std::lock_guard lock(s.mutex);
    if (std::find(s.appenders.begin(), s.appenders.end(), appender) == s.appenders.end())
        s.appenders.push_back(appender);
}

void OmbLog::removeAppender(const OmbRef<OmbLogAppender>& appender) {
    LogState& s = state();
    std::lock_guard lock(s.mutex);
    std::erase(s.appenders, appender);
}

void OmbLog::removeAllAppenders() {
    std::vector<OmbRef<OmbLogAppender>> removed;
    {
        std::lock_guard lock(state().mutex);
        removed.swap(state().appenders);
    }
}

bool OmbLog::enableEvents() {
    std::lock_guard lock(state().mutex);
    return state().eventsEnabled;
}

void OmbLog::enableEvents(bool enabled) {
    std::lock_guard lock(state().mutex);
    state().eventsEnabled = enabled;
}

void OmbLog::shutdown() {
    LogState& s = state();
    std::vector<OmbRef<OmbLogAppender>> removed;
    std::lock_guard lock(s.mutex);
    removed.swap(s.appenders);
    // A log file configured at start-up locked the level; a later start-up
    // must be able to choose again.
    s.levelLocked.store(false, std::memory_order_release);
    s.level.store(OmbLogOff, std::memory_order_relaxed);
    s.eventsEnabled = false;
}

const char* OmbLog::levelLabel(OmbLogLevel level) {
    return level >= OmbLogDebug && level <= OmbLogFatal ? labels[level] : "";
}

bool OmbLog::parseLevel(const OmbString& text, OmbLogLevel& level) {
    const OmbString upper = text.toUpper();
    for (int i = OmbLogAll; i <= OmbLogOff; ++i) {
        if (upper == OmbString::literal(labels[i]) || text == OmbString(std::to_string(i))) {
            level = static_cast<OmbLogLevel>(i);
            return true;
        }
    }
    return false;
}

OmbString Omb_formatMessage(const char* pattern, std::initializer_list<OmbString> arguments) {
    OmbStringBuilder out;
    for (const char* p = pattern; *p;) {
        if (p[0] == '%' && p[1] >= '1' && p[1] <= '9') {
            const char* end = p + 1;
            std::size_t index = 0;
            while (*end >= '0' && *end <= '9') index = index * 10 + static_cast<std::size_t>(*end++ - '0');
            if (*end == '%' && index >= 1 && index <= arguments.size()) {
                out << arguments.begin()[index - 1];
                p = end + 1;
                continue;
            }
        }
        out << *p++;
    }
    return out.str();
}
