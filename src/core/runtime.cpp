#include <oecore/core/abort.h>
#include <oecore/core/globalcache.h>
#include <oecore/core/globalstatus.h>
#include <oecore/core/log.h>
#include <oecore/core/runtime.h>
#include <oecore/version.h>

#include <algorithm>
#include <array>
#include <atomic>
#include <cstdio>
#include <map>
#include <mutex>
#include <vector>

#include "fpuprecision.h"

OmbEventHandler<OmbEngineObject, OmbGlobalStatusEventArgs> OmbRuntime::statusChangedEvent;
OmbEventHandler<OmbEngineObject, OmbErrorEventArgs> OmbRuntime::errorEvent;

namespace {

struct RegisteredAPI {
    OmbString name;
    OmbRuntime::ApiFunction initialize;
    OmbRuntime::ApiFunction second;
    OmbRuntime::ApiFunction shutdown;
};

struct PredefinedClassFunctions {
    void (*create)() = nullptr;
    void (*drop)() = nullptr;
};

struct Registry {
    std::mutex mutex;
    std::map<OmbString, OmbRef<OmbEngineObject>> objects;
};

struct RuntimeState {
    // Serialises init() and shutdown(); recursive because API and clean-up
    // callbacks run under it and may ask the runtime about its state.
    std::recursive_mutex lifecycle;
    std::atomic<bool> initialized{false};
    OmbRef<OmbSettingsFile> settings;
    OmbRef<OmbReaderWriterLock> configurationLock;
    Registry predefined;
    Registry registered;
    Registry sharedConfigs;
    std::mutex apisMutex;
    std::vector<RegisteredAPI> apis;
    // The release mutex guards the clean-up table and the pending releases.
    std::mutex releaseMutex;
    std::map<IShutdownHandler*, OmbWRef<OmbEngineObject>> cleanUp;
    std::vector<OmbRef<OmbRefCnt>> pendingRelease;
    std::atomic<int> globalCacheSize{300};
    std::array<PredefinedClassFunctions, static_cast<std::size_t>(OmbRuntime::PredefinedClass::Count)>
        predefinedClasses;
    std::array<PredefinedClassFunctions, static_cast<std::size_t>(OmbRuntime::Service::Count)> services;
};

RuntimeState& state() {
    static RuntimeState s;
    return s;
}

void store(Registry& registry, const OmbString& name, const OmbRef<OmbEngineObject>& object) {
    OmbRef<OmbEngineObject> replaced;
    std::lock_guard lock(registry.mutex);
    OmbRef<OmbEngineObject>& slot = registry.objects[name];
    replaced = std::exchange(slot, object);
}

OmbRef<OmbEngineObject> lookUp(Registry& registry, const OmbString& name) {
    std::lock_guard lock(registry.mutex);
    const auto it = registry.objects.find(name);
    return it == registry.objects.end() ? OmbRef<OmbEngineObject>() : it->second;
}

void empty(Registry& registry) {
    std::map<OmbString, OmbRef<OmbEngineObject>> released;
    std::lock_guard lock(registry.mutex);
    released.swap(registry.objects);
}

std::vector<RegisteredAPI> apisSnapshot() {
    std::lock_guard lock(state().apisMutex);
    return state().apis;
}

void startFileLog(const OmbString& fileName) {
    constexpr unsigned fileCount = 4;
    constexpr unsigned maximumFileSize = 10485760;
    OmbLog::addAppender(OmbRef<OmbLogAppender>(new OmbRollingFileLogAppender(fileName, fileCount, maximumFileSize)));
    OmbLog::forceLogLevel(OmbLogAll, true);
    OmbLog::info("Adding file logger and forcing log level to ALL.");
}

void startService(OmbRuntime::Service service) {
    if (const auto init = state().services[static_cast<std::size_t>(service)].create) init();
}

void stopService(OmbRuntime::Service service) {
    if (const auto cleanUp = state().services[static_cast<std::size_t>(service)].drop) cleanUp();
}

void checkFloatingPointPrecision() {
    if (oecore::detail::fpuPrecisionBits() <= 24)
        OmbLog::error("Invalid floating point precision, must be greater than 24-bits.");
    else
        OmbLog::info("Floating point precision is 53-bits or greater.");
}

void stopBackgroundThreads() {
    OmbLog::info("Shutting down background threads");
    RuntimeState& s = state();
    std::map<IShutdownHandler*, OmbWRef<OmbEngineObject>> table;
    std::lock_guard lock(s.releaseMutex);
    table.swap(s.cleanUp);
    for (const auto& [handler, object] : table)
        if (const OmbRef<OmbEngineObject> alive = object.strong()) handler->stopThreads();
}

void releaseRuntimeObjects() {
    RuntimeState& s = state();
    std::vector<OmbRef<OmbRefCnt>> pending;
    std::lock_guard lock(s.releaseMutex);
    pending.swap(s.pendingRelease);
}

}  // namespace

void OmbRuntime::init() {
    RuntimeState& s = state();
    std::lock_guard lifecycle(s.lifecycle);
    if (s.initialized.load()) return;
    OmbLog::info("Initializing runtime");
    s.settings = OmbSettingsFile::load();
    if (!s.settings->logFileName().empty()) {
        try {
            startFileLog(s.settings->logFileName());
        } catch (const OmbException& e) {
            // A bad log path must not keep the application from starting; the
            // log has no appender yet, so say so on standard error.
            std::fprintf(stderr, "OECore: %s (LOG_FILE=%s); running without a log file\n", e.asString().dataUtf8(),
                         s.settings->logFileName().dataUtf8());
        }
    }
    checkFloatingPointPrecision();
    startService(Service::BlockPool);
    s.configurationLock = OmbRef<OmbReaderWriterLock>(new OmbReaderWriterLock);
    startService(Service::Atoms);
    OmbLog::info("Creating predefined objects");
    for (const PredefinedClassFunctions& cls : s.predefinedClasses)
        if (cls.create) cls.create();
    OmbLog::info("Initializing APIs");
    for (const RegisteredAPI& api : apisSnapshot())
        if (api.initialize) api.initialize();
    bool expected = false;
    s.initialized.compare_exchange_strong(expected, true);
    OmbLog::info("Initialization complete");
}

void OmbRuntime::shutdown() {
    RuntimeState& s = state();
    std::lock_guard lifecycle(s.lifecycle);
    if (!s.initialized.load()) return;
    OmbLog::info("Shutting down runtime");
    for (const RegisteredAPI& api : apisSnapshot())
        if (api.shutdown) api.shutdown();
    stopBackgroundThreads();
    empty(s.sharedConfigs);
    releaseRuntimeObjects();
    OmbLog::info("Destroying predefined objects");
    empty(s.predefined);
    for (const PredefinedClassFunctions& cls : s.predefinedClasses)
        if (cls.drop) cls.drop();
    OmbLog::info("Releasing registered objects");
    empty(s.registered);
    OmbGlobalCache::destroy();
    stopService(Service::GdalAccess);
    stopService(Service::Atoms);
    stopService(Service::BlockPool);
    {
        std::lock_guard lock(s.apisMutex);
        s.apis.clear();
    }
    s.configurationLock.reset();
    s.initialized.store(false);
    s.settings.reset();
    OmbLog::info("Shutdown complete");
    OmbLog::shutdown();
}

void OmbRuntime::assertShutdown() {
    if (isInitialized()) shutdown();
}

bool OmbRuntime::isInitialized() { return state().initialized.load(); }

OmbString OmbRuntime::version() { return OmbString::literal(OECORE_VERSION_STRING); }

const OmbRef<OmbSettingsFile>& OmbRuntime::settings() { return state().settings; }

const OmbRef<OmbReaderWriterLock>& OmbRuntime::configurationLock() { return state().configurationLock; }

void OmbRuntime::lock() {
    if (const OmbRef<OmbReaderWriterLock> lock = configurationLock()) lock->acquireWriterLock();
}

void OmbRuntime::unlock() {
    if (const OmbRef<OmbReaderWriterLock> lock = configurationLock()) lock->releaseWriterLock();
}

void OmbRuntime::registerPredefined(const OmbString& name, const OmbRef<OmbEngineObject>& object) {
    if (object) object->predefinedName(name);
    store(state().predefined, name, object);
}

OmbRef<OmbEngineObject> OmbRuntime::getPredefinedObject(const OmbString& name) {
    return lookUp(state().predefined, name);
}

OmbRef<OmbVec<OmbString>> OmbRuntime::predefinedObjects() {
    OmbRef<OmbVec<OmbString>> names(new OmbVec<OmbString>);
    Registry& registry = state().predefined;
    std::lock_guard lock(registry.mutex);
    names->reserve(registry.objects.size());
    for (const auto& [name, object] : registry.objects) names->add(name);
    return names;
}

void OmbRuntime::registerObject(const OmbString& name, const OmbRef<OmbEngineObject>& object) {
    store(state().registered, name, object);
}

OmbRef<OmbEngineObject> OmbRuntime::getRegisteredObject(const OmbString& name) {
    return lookUp(state().registered, name);
}

void OmbRuntime::sharedConfig(const OmbString& name, const OmbRef<OmbEngineObject>& configuration) {
    store(state().sharedConfigs, name, configuration);
}

OmbRef<OmbEngineObject> OmbRuntime::getSharedConfig(const OmbString& name) {
    return lookUp(state().sharedConfigs, name);
}

void OmbRuntime::registerPredefinedClass(PredefinedClass cls, void (*create)(), void (*drop)()) {
    state().predefinedClasses.at(static_cast<std::size_t>(cls)) = {create, drop};
}

void OmbRuntime::registerService(Service service, void (*init)(), void (*cleanUp)()) {
    state().services.at(static_cast<std::size_t>(service)) = {init, cleanUp};
}

void OmbRuntime::registerAPI(const OmbString& name, ApiFunction initialize, ApiFunction second, ApiFunction shutdown) {
    RuntimeState& s = state();
    std::lock_guard lifecycle(s.lifecycle);
    init();
    {
        std::lock_guard lock(s.apisMutex);
        const auto it =
            std::find_if(s.apis.begin(), s.apis.end(), [&](const RegisteredAPI& a) { return a.name == name; });
        if (it != s.apis.end())
            *it = {name, initialize, second, shutdown};
        else
            s.apis.push_back({name, initialize, second, shutdown});
    }
    // init() ran before the API was known: initialise it now.
    if (initialize) initialize();
}

void OmbRuntime::unregisterAPI(const OmbString& name) {
    RuntimeState& s = state();
    std::lock_guard lock(s.apisMutex);
    for (RegisteredAPI& api : s.apis)
        if (api.name == name) api.initialize = api.second = api.shutdown = nullptr;
}

void OmbRuntime::registerThreadCleanUp(IShutdownHandler* handler, OmbEngineObject* object) {
    if (!handler) return;
    RuntimeState& s = state();
    std::lock_guard lock(s.releaseMutex);
    s.cleanUp[handler] = OmbWRef<OmbEngineObject>(object);
}

void OmbRuntime::releaseOnMainThread(const OmbRef<OmbRefCnt>& object) {
    if (!object) return;
    RuntimeState& s = state();
    std::lock_guard lock(s.releaseMutex);
    s.pendingRelease.push_back(object);
}

void OmbRuntime::releasePendingObjects() {
    RuntimeState& s = state();
    std::vector<OmbRef<OmbRefCnt>> pending;
    {
        std::lock_guard lock(s.releaseMutex);
        pending.swap(s.pendingRelease);
    }
    // Released in list order, outside the lock: a destructor may queue more.
    for (OmbRef<OmbRefCnt>& object : pending) object.reset();
}

int OmbRuntime::globalCacheSize() { return state().globalCacheSize.load(std::memory_order_relaxed); }

void OmbRuntime::globalCacheSize(int size) {
    std::atomic<int>& value = state().globalCacheSize;
    int old = value.load();
    while (!value.compare_exchange_weak(old, size)) {
    }
}

void OmbRuntime::abort() { Omb_requestAbort(0); }

void OmbRuntime::fireStatusChanged(const OmbString& message, int percentComplete, bool isLast) {
    statusChangedEvent.raise(nullptr, OmbGlobalStatusEventArgs{0, message, percentComplete, isLast});
}
