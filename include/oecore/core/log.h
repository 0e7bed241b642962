// OmbLog: the process-wide log.
//
// A message of level L is written when the current level is at most L; the
// level is "off" until the application sets one or the settings file names
// a log file. Each message becomes one line "[thread id] LABEL - message"
// that is handed to every appender, in the order they were added, and to
// messageWrittenEvent when events are enabled.
//
// Thread safety: every operation may be called from any thread; one mutex
// orders the formatting and delivery of messages. Logging never throws.
#pragma once

#include <oecore/core/engineobject.h>
#include <oecore/core/event.h>
#include <oecore/core/loglevel.h>
#include <oecore/core/string.h>

#include <cstdio>
#include <initializer_list>

class OmbLogAppender;

class OmbLog {
public:
    OmbLog() = delete;

    static void debug(const OmbString& message);
    static void debug(const char* message);
    static void info(const OmbString& message);
    static void info(const char* message);
    static void warning(const OmbString& message);
    static void warning(const char* message);
    static void error(const OmbString& message);
    static void error(const char* message);
    static void fatal(const OmbString& message);
    static void fatal(const char* message);

    static OmbLogLevel logLevel();
    // Ignored while the level lock is set.
    static void logLevel(OmbLogLevel level);
    // Sets the level, and the level lock to lock.
    static void forceLogLevel(OmbLogLevel level, bool lock);
    static bool isActive(OmbLogLevel level);

    // Adds the appender unless this same appender is present already.
    static void addAppender(const OmbRef<OmbLogAppender>& appender);
    static void removeAppender(const OmbRef<OmbLogAppender>& appender);
    static void removeAllAppenders();

    static bool enableEvents();
    static void enableEvents(bool enabled);

    // Removes all appenders, turns the log off, clears the level lock and
    // disables events.
    static void shutdown();

    // "DEBUG", "INFO", "WARNING", "ERROR" or "FATAL"; "" for other levels.
    static const char* levelLabel(OmbLogLevel level);
    // A level from its label or its number ("WARNING", "warning" or "3").
    static bool parseLevel(const OmbString& text, OmbLogLevel& level);

    static OmbEventHandler<OmbEngineObject, OmbLogEventArgs> messageWrittenEvent;

private:
    static void log(OmbLogLevel level, const OmbString& message);
    static void logText(OmbLogLevel level, const char* message);
};

// Fills "%1%", "%2%", ... in a log message pattern with the arguments.
OmbString Omb_formatMessage(const char* pattern, std::initializer_list<OmbString> arguments);

// Where log lines go.
class OmbLogAppender : public OmbEngineObject {
    OMB_DECLARE_ENGINE_CLASS()

public:
    virtual void log(const OmbString& line, OmbLogLevel level) const = 0;
};

// Writes each line to standard error, the debugger output channel on Linux.
class OmbDebuggerLogAppender : public OmbLogAppender {
    OMB_DECLARE_ENGINE_CLASS()

public:
    OmbDebuggerLogAppender* clone() const override { return new OmbDebuggerLogAppender(*this); }
    void log(const OmbString& line, OmbLogLevel level) const override;
};

// Writes to a set of files: engine.log, then engine.1.log, engine.2.log, ...
// When the current file has grown past maximumFileSize the files move up
// one index, the oldest is dropped and a new engine.log is started.
class OmbRollingFileLogAppender : public OmbLogAppender {
    OMB_DECLARE_ENGINE_CLASS()

public:
    // Throws OmbXArgument when fileCount is 0, the name has no extension or
    // its directory cannot be created.
    OmbRollingFileLogAppender(const OmbString& fileName, unsigned fileCount, unsigned maximumFileSize);
    OmbRollingFileLogAppender(const OmbRollingFileLogAppender& other);
    ~OmbRollingFileLogAppender() override;

    OmbRollingFileLogAppender* clone() const override { return new OmbRollingFileLogAppender(*this); }
    void log(const OmbString& line, OmbLogLevel level) const override;

    const OmbString& fileName() const noexcept { return fileName_; }
    unsigned fileCount() const noexcept { return fileCount_; }
    unsigned maximumFileSize() const noexcept { return maximumFileSize_; }
    // The path of the file with the given index (0 is fileName()).
    OmbString indexedFileName(unsigned index) const;

private:
    void rotate() const;

    OmbString fileName_;
    unsigned fileCount_;
    unsigned maximumFileSize_;
    OmbString directory_;
    OmbString baseName_;
    OmbString extension_;
    mutable std::FILE* file_ = nullptr;
};
