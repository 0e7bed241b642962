#include <oecore/core/abort.h>
#include <oecore/core/exception.h>
#include <oecore/core/globalcache.h>
#include <oecore/core/globalstatus.h>
#include <oecore/core/log.h>
#include <oecore/core/runtime.h>
#include <oecore/core/screen.h>
#include <oecore/core/threadid.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <vector>

#include "tempdir.h"
#include "testobjects.h"

namespace {

// Leaves the runtime shut down whatever a test did.
class RuntimeTest : public ::testing::Test {
protected:
    void TearDown() override { OmbRuntime::assertShutdown(); }
};

std::vector<std::string> events;
void record(const char* what) { events.emplace_back(what); }

int predefinedCreated = 0;
void createSymbols() {
    ++predefinedCreated;
    OmbRuntime::registerPredefined(OmbString("Circle"), OmbRef<OmbEngineObject>(new TestNode("circle")));
    OmbRuntime::registerPredefined(OmbString("Square"), OmbRef<OmbEngineObject>(new TestNode("square")));
}
void dropSymbols() { record("drop symbols"); }

}  // namespace

TEST_F(RuntimeTest, InitAndShutdownAreIdempotentAndRebuildEverything) {
    OmbRuntime::shutdown();  // without init: nothing happens
    EXPECT_FALSE(OmbRuntime::isInitialized());

    OmbRuntime::registerPredefinedClass(OmbRuntime::PredefinedClass::Symbols, createSymbols, dropSymbols);
    predefinedCreated = 0;
    OmbRuntime::init();
    OmbRuntime::init();
    EXPECT_EQ(predefinedCreated, 1);
    EXPECT_TRUE(OmbRuntime::isInitialized());
    EXPECT_TRUE(OmbRuntime::settings());
    EXPECT_TRUE(OmbRuntime::configurationLock());
    OmbRuntime::registerObject(OmbString("app"), OmbRef<OmbEngineObject>(new TestNode));
    const OmbRef<OmbEngineObject> circle = OmbRuntime::getPredefinedObject(OmbString("Circle"));
    ASSERT_TRUE(circle);
    EXPECT_EQ(circle->predefinedName(), OmbString("Circle"));
    EXPECT_FALSE(OmbRuntime::getPredefinedObject(OmbString("circle")));

    events.clear();
    OmbRuntime::shutdown();
    EXPECT_EQ(events, (std::vector<std::string>{"drop symbols"}));
    EXPECT_FALSE(OmbRuntime::getPredefinedObject(OmbString("Circle")));
    EXPECT_FALSE(OmbRuntime::getRegisteredObject(OmbString("app")));
    EXPECT_FALSE(OmbRuntime::configurationLock());
    EXPECT_FALSE(OmbRuntime::settings());

    OmbRuntime::init();
    EXPECT_EQ(predefinedCreated, 2);
    EXPECT_TRUE(OmbRuntime::getPredefinedObject(OmbString("Square")));
    OmbRuntime::registerPredefinedClass(OmbRuntime::PredefinedClass::Symbols, nullptr, nullptr);
}

TEST_F(RuntimeTest, PredefinedNamesAreListedInOrder) {
    OmbRuntime::init();
    OmbRuntime::registerPredefined(OmbString("b"), OmbRef<OmbEngineObject>(new TestNode));
    OmbRuntime::registerPredefined(OmbString("a"), OmbRef<OmbEngineObject>(new TestNode));
    OmbRuntime::registerPredefined(OmbString("a"), OmbRef<OmbEngineObject>(new TestNode("second")));
    const OmbRef<OmbVec<OmbString>> names = OmbRuntime::predefinedObjects();
    const std::vector<OmbString> list(names->begin(), names->end());
    EXPECT_TRUE(std::is_sorted(list.begin(), list.end()));
    EXPECT_EQ(std::count(list.begin(), list.end(), OmbString("a")), 1);
    EXPECT_EQ(std::count(list.begin(), list.end(), OmbString("b")), 1);
    EXPECT_EQ(omb_dynamic_cast<TestNode>(OmbRuntime::getPredefinedObject(OmbString("a")))->name(), OmbString("second"));
}

TEST_F(RuntimeTest, ApisAreInitialisedWhenRegisteredAndShutDownWithTheRuntime) {
    events.clear();
    OmbRuntime::registerAPI(
        OmbString("Python"), [] { record("init python"); }, nullptr, [] { record("shutdown python"); });
    EXPECT_TRUE(OmbRuntime::isInitialized());
    OmbRuntime::registerAPI(
        OmbString("Java"), [] { record("init java"); }, nullptr, [] { record("shutdown java"); });
    OmbRuntime::unregisterAPI(OmbString("Java"));
    OmbRuntime::shutdown();
    EXPECT_EQ(events, (std::vector<std::string>{"init python", "init java", "shutdown python"}));
    // The list went with the shutdown.
    events.clear();
    OmbRuntime::init();
    OmbRuntime::shutdown();
    EXPECT_TRUE(events.empty());
}

namespace {

struct Worker : IShutdownHandler {
    int stopped = 0;
    void stopThreads() override { ++stopped; }
};

}  // namespace

TEST_F(RuntimeTest, ThreadCleanUpRunsOnlyForLiveObjects) {
    OmbRuntime::init();
    Worker live;
    Worker gone;
    OmbRef<TestNode> owner(new TestNode);
    OmbRuntime::registerThreadCleanUp(&live, owner.get());
    {
        OmbRef<TestNode> shortLived(new TestNode);
        OmbRuntime::registerThreadCleanUp(&gone, shortLived.get());
    }
    OmbRuntime::shutdown();
    EXPECT_EQ(live.stopped, 1);
    EXPECT_EQ(gone.stopped, 0);
}

TEST_F(RuntimeTest, PendingReleasesWaitForTheMainThread) {
    const int before = TestNode::alive;
    OmbRuntime::releaseOnMainThread(OmbRef<OmbRefCnt>(new TestNode));
    EXPECT_EQ(TestNode::alive, before + 1);
    OmbRuntime::releasePendingObjects();
    EXPECT_EQ(TestNode::alive, before);
}

TEST_F(RuntimeTest, GraphWalksTakeTheConfigurationLockAndReuseAHeldWriteLock) {
    OmbRuntime::init();
    OmbRef<TestNode> root(new TestNode("root"));
    root->children.push_back(OmbRef<TestNode>(new TestNode("child")));
    OmbRuntime::lock();
    EXPECT_EQ(root->getChildObjects(OmbChildObjectMode::AllLevels)->size(), 1u);
    EXPECT_TRUE(root->safeClone());
    OmbRuntime::unlock();
    OmbRuntime::configurationLock()->acquireReaderLock();
    EXPECT_TRUE(root->findChildObject(OmbString("child"), OmbChildObjectMode::TopLevel));
    OmbRuntime::configurationLock()->releaseReaderLock();
}

TEST_F(RuntimeTest, AGlobalAbortIsConsumedByTheFirstCheck) {
    OmbRuntime::abort();
    EXPECT_THROW(Omb_checkAbort(), OmbXAbort);
    EXPECT_NO_THROW(Omb_checkAbort());
    Omb_requestAbort(Omb_currentThreadId());
    EXPECT_THROW(Omb_checkAbortAndInterrupt(), OmbXAbort);
    EXPECT_NO_THROW(Omb_checkAbortAndInterrupt());
    Omb_requestAbort(0);
    Omb_resetAbort(0);
    EXPECT_NO_THROW(Omb_checkAbort());
    Omb_RegisterInterruptKey(27);
    EXPECT_NO_THROW(Omb_checkInterrupt());  // no key is ever held on Linux
    Omb_UnregisterInterruptKey(27);
}

namespace {

std::vector<OmbGlobalStatusEventArgs> statuses;
void onStatus(OmbEngineObject*, const OmbGlobalStatusEventArgs& args) { statuses.push_back(args); }

}  // namespace

TEST_F(RuntimeTest, StatusReportsStepThroughPercentages) {
    statuses.clear();
    OmbRuntime::statusChangedEvent.slots[0] = onStatus;
    OmbGlobalStatusHandler& handler = OmbGlobalStatusHandler::instance();
    const std::uint32_t id = handler.getUniqueID();
    EXPECT_GT(handler.getUniqueID(), id);
    OmbGlobalStatusPercent progress(nullptr, id, 8, 25);
    for (int i = 0; i < 8; ++i) progress.oneMoreTaskIsDone();
    progress.finished();
    std::vector<std::string> messages;
    for (const auto& s : statuses) messages.emplace_back(s.message.view());
    EXPECT_EQ(messages, (std::vector<std::string>{"Done 25%", "Done 50%", "Done 75%", "Done 100%", "Done 100 %"}));
    EXPECT_TRUE(statuses.back().isLast);

    statuses.clear();
    handler.sendGlobalStatus(nullptr, 77, OmbString("loading"), 10, false);
    handler.killOngoingJobs();
    ASSERT_EQ(statuses.size(), 2u);
    EXPECT_EQ(statuses[1], (OmbGlobalStatusEventArgs{77, OmbString(), -1, true}));

    statuses.clear();
    OmbRuntime::fireStatusChanged(OmbString("x"), 5, false);
    EXPECT_EQ(statuses.at(0), (OmbGlobalStatusEventArgs{0, OmbString("x"), 5, false}));
    OmbRuntime::statusChangedEvent.slots[0] = nullptr;
}

TEST_F(RuntimeTest, ScreenResolutionFromSystemAndEnvironment) {
    const OmbScreen system = OmbScreen::fromSystem();
    EXPECT_EQ(system.dpiX(), 96);
    EXPECT_DOUBLE_EQ(system.pixWidth(), 0.0254 / 96);
    ::setenv("OMBRAVEL_ENGINE_5_DPI_X", "144", 1);
    EXPECT_EQ(OmbScreen::fromSystem().dpiX(), 144);
    EXPECT_EQ(OmbScreen::fromSystem().dpiY(), 96);
    ::setenv("OMBRAVEL_ENGINE_5_DPI_Y", "-1", 1);
    const OmbScreen fallback = OmbScreen::fromSystem();  // one bad value: both fall back
    EXPECT_EQ(fallback.dpiX(), 96);
    EXPECT_EQ(fallback.dpiY(), 96);
    ::unsetenv("OMBRAVEL_ENGINE_5_DPI_X");
    ::unsetenv("OMBRAVEL_ENGINE_5_DPI_Y");
    EXPECT_EQ(OmbScreen(0, 120).dpiY(), 96);
}

// The settings file beside the executable names a log file: init starts it
// at level ALL and locks the level until shutdown.
TEST_F(RuntimeTest, ALogFileInTheSettingsStartsTheLogAndLocksItsLevel) {
    TempDir dir;
    const std::string ini(OmbSettingsFile::defaultFileName().view());
    const std::string logFile = (dir / "logs/engine.log").string();
    std::ofstream(ini) << "LOG_FILE=" << logFile << "\r\n";
    OmbRuntime::init();
    std::filesystem::remove(ini);
    EXPECT_EQ(OmbLog::logLevel(), OmbLogAll);
    OmbLog::logLevel(OmbLogDebug);
    EXPECT_EQ(OmbLog::logLevel(), OmbLogAll);
    OmbRuntime::shutdown();
    EXPECT_EQ(OmbLog::logLevel(), OmbLogOff);
    OmbLog::logLevel(OmbLogDebug);
    EXPECT_EQ(OmbLog::logLevel(), OmbLogDebug);
    OmbLog::shutdown();

    const std::string log = readFile(logFile);
    for (const char* line :
         {"INFO - Adding file logger and forcing log level to ALL.",
          "INFO - Floating point precision is 53-bits or greater.", "INFO - Creating predefined objects",
          "INFO - Initializing APIs", "INFO - Initialization complete", "INFO - Shutting down runtime",
          "INFO - Shutting down background threads", "INFO - Destroying predefined objects",
          "INFO - Releasing registered objects", "INFO - Shutdown complete"})
        EXPECT_NE(log.find(line), std::string::npos) << line << " missing from:\n" << log;
    EXPECT_LT(log.find("Initialization complete"), log.find("Shutting down runtime"));
}
