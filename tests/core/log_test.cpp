#include <oecore/core/exception.h>
#include <oecore/core/log.h>
#include <oecore/core/threadid.h>

#include <gtest/gtest.h>

#include <clocale>
#include <string>
#include <vector>

#include "../errortext.h"
#include "tempdir.h"

namespace {

std::vector<std::string> lines;
void collect(OmbEngineObject*, const OmbLogEventArgs& args) { lines.emplace_back(args.message.view()); }

// Captures log lines through the event for one test and turns the log off after.
class LogTest : public ::testing::Test {
protected:
    void SetUp() override {
        lines.clear();
        OmbLog::messageWrittenEvent.slots[0] = collect;
        OmbLog::enableEvents(true);
    }
    void TearDown() override {
        OmbLog::shutdown();
        OmbLog::messageWrittenEvent.slots[0] = nullptr;
    }
};

std::string prefix() { return "[" + std::to_string(Omb_currentThreadId()) + "] "; }

}  // namespace

TEST_F(LogTest, LinesCarryThreadIdAndLabelAndHonourTheLevel) {
    OmbLog::logLevel(OmbLogWarning);
    OmbLog::info("dropped");
    OmbLog::warning("kept");
    OmbLog::error(OmbString("also kept"));
    OmbLog::fatal(static_cast<const char*>(nullptr));
    EXPECT_EQ(lines, (std::vector<std::string>{prefix() + "WARNING - kept", prefix() + "ERROR - also kept"}));
    EXPECT_TRUE(OmbLog::isActive(OmbLogFatal));
    EXPECT_FALSE(OmbLog::isActive(OmbLogInfo));
}

TEST_F(LogTest, AForcedLevelCannotBeChangedUntilShutdown) {
    OmbLog::forceLogLevel(OmbLogAll, true);
    OmbLog::logLevel(OmbLogDebug);
    EXPECT_EQ(OmbLog::logLevel(), OmbLogAll);
    OmbLog::shutdown();
    EXPECT_EQ(OmbLog::logLevel(), OmbLogOff);
    EXPECT_FALSE(OmbLog::enableEvents());
    OmbLog::logLevel(OmbLogInfo);  // the lock went with the shutdown
    EXPECT_EQ(OmbLog::logLevel(), OmbLogInfo);
}

TEST_F(LogTest, ExceptionsLogWhenConstructed) {
    OmbLog::logLevel(OmbLogError);
    const OmbXReadOnly e("layer.cpp", 42, OmbString("Collection"));
    ASSERT_EQ(lines.size(), 1u);
    EXPECT_EQ(lines[0], prefix() + "ERROR - layer.cpp, line 42: The Collection is read-only., ReadOnly");
}

TEST_F(LogTest, UnrepresentableTextNeverMakesLoggingThrow) {
    TempDir dir;
    const std::string saved = std::setlocale(LC_CTYPE, nullptr);
    std::setlocale(LC_CTYPE, "C");  // an ASCII code page
    OmbRef<OmbLogAppender> file(new OmbRollingFileLogAppender(OmbString((dir / "a.log").string()), 2, 1000));
    OmbLog::addAppender(file);
    OmbLog::addAppender(file);  // the same appender is added once
    OmbLog::logLevel(OmbLogAll);
    EXPECT_NO_THROW(
        OmbLog::info(OmbString("K\xC3\xB8"
                               "benhavn \xE2\x82\xAC")));
    EXPECT_NO_THROW(OmbLog::info(OmbString("bad \xC3 utf-8")));
    std::setlocale(LC_CTYPE, saved.c_str());
    EXPECT_EQ(readFile(dir / "a.log"), prefix() + "INFO - Kbenhavn \n" + prefix() + "INFO - bad  utf-8\n");
}

TEST(RollingFileLogAppender, RotatesThroughFourFiles) {
    TempDir dir;
    OmbRollingFileLogAppender log(OmbString((dir / "engine.log").string()), 4, 10);
    EXPECT_EQ(std::string(log.indexedFileName(2).view()), (dir / "engine.2.log").string());
    // Each line is 11 bytes, so every write after the first rotates.
    for (const char* line : {"line-00001", "line-00002", "line-00003", "line-00004", "line-00005"})
        log.log(OmbString(line), OmbLogInfo);
    EXPECT_EQ(readFile(dir / "engine.log"), "line-00005\n");
    EXPECT_EQ(readFile(dir / "engine.1.log"), "line-00004\n");
    EXPECT_EQ(readFile(dir / "engine.2.log"), "line-00003\n");
    EXPECT_EQ(readFile(dir / "engine.3.log"), "line-00002\n");  // the oldest, line 1, is gone
    EXPECT_FALSE(std::filesystem::exists(dir / "engine.4.log"));
}

TEST(RollingFileLogAppender, OneFileStartsAfresh) {
    TempDir dir;
    OmbRollingFileLogAppender log(OmbString((dir / "one.txt").string()), 1, 15);
    log.log(OmbString("first line"), OmbLogInfo);
    log.log(OmbString("second line"), OmbLogInfo);  // 11 bytes: not past the limit yet
    log.log(OmbString("third"), OmbLogInfo);        // 23 bytes: start anew
    EXPECT_EQ(readFile(dir / "one.txt"), "third\n");
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(dir.path()), {}), 1);
}

TEST(RollingFileLogAppender, AppendsToAnExistingFileAndCreatesItsDirectory) {
    TempDir dir;
    dir.write("old.log", "earlier\n");
    OmbRollingFileLogAppender(OmbString((dir / "old.log").string()), 2, 1000).log(OmbString("later"), OmbLogInfo);
    EXPECT_EQ(readFile(dir / "old.log"), "earlier\nlater\n");
    OmbRollingFileLogAppender nested(OmbString((dir / "a/b/c.log").string()), 2, 1000);
    nested.log(OmbString("x"), OmbLogInfo);
    EXPECT_EQ(readFile(dir / "a/b/c.log"), "x\n");
}

TEST(RollingFileLogAppender, BadArgumentsSayWhat) {
    TempDir dir;
    auto message = [](const std::string& name, unsigned count) {
        return errorOf([&] { OmbRollingFileLogAppender(OmbString(name), count, 100); });
    };
    EXPECT_EQ(message((dir / "x.log").string(), 0),
              "Invalid argument in Number of log files must be greater than zero..");
    EXPECT_EQ(message((dir / "noextension").string(), 1), "Invalid argument in Invalid log file.");
    dir.write("file", "");
    EXPECT_EQ(message((dir / "file/sub/x.log").string(), 1), "Invalid argument in Invalid log file.");
}
