// OmbRuntime: the process-wide part of the library.
//
// init() starts logging, reads the settings, creates the configuration lock
// and the predefined objects and initialises registered language bindings;
// shutdown() undoes all of it in reverse. Between the two, the runtime keeps
// the registries of predefined and application objects, references to be
// released on the main thread, the thread clean-up handlers of objects that
// own worker threads, and the global cache size.
//
// Thread safety: every operation may be called from any thread. init() and
// shutdown() are serialised against each other; calling shutdown() while
// other threads still use the library is not supported.
#pragma once

#include <oecore/core/engineobject.h>
#include <oecore/core/event.h>
#include <oecore/core/readerwriterlock.h>
#include <oecore/core/settingsfile.h>
#include <oecore/core/string.h>
#include <oecore/core/vec.h>

#include <cstdint>

class OmbConfiguration;
class OmbConfigurationParameters;
class OmbResourceResolver;
enum class OmbDataSetInitialization;

// Implemented by objects that own worker threads: stops them at shutdown.
class IShutdownHandler {
public:
    virtual ~IShutdownHandler() = default;
    virtual void stopThreads() = 0;
};

class OmbRuntime {
public:
    OmbRuntime() = delete;

    // Does nothing when already initialised.
    static void init();
    // Does nothing when not initialised.
    static void shutdown();
    static void assertShutdown();
    static bool isInitialized();
    // The library version, "5.4.0.3".
    static OmbString version();

    static const OmbRef<OmbSettingsFile>& settings();
    // Orders configuration changes (writers) against walks of the object
    // graph (readers); null while the runtime is not initialised.
    static const OmbRef<OmbReaderWriterLock>& configurationLock();
    // The resolver used when a load is given none. (Defined with the
    // configuration language, like the load functions.)
    static const OmbRef<OmbResourceResolver>& defaultResourceResolver();
    // Read a .px document (see OmbXmlParser).
    static OmbRef<OmbConfiguration> loadFile(const OmbString& fileName,
                                             const OmbRef<OmbConfigurationParameters>& parameters,
                                             OmbDataSetInitialization dataSetInitialization,
                                             const OmbRef<OmbResourceResolver>& resolver);
    static OmbRef<OmbConfiguration> loadString(const OmbString& text,
                                               const OmbRef<OmbConfigurationParameters>& parameters,
                                               OmbDataSetInitialization dataSetInitialization,
                                               const OmbRef<OmbResourceResolver>& resolver);
    // Configurations shared between loads, under their file's absolute path
    // (OmbConfiguration objects; released at shutdown).
    static void sharedConfig(const OmbString& name, const OmbRef<OmbEngineObject>& configuration);
    static OmbRef<OmbEngineObject> getSharedConfig(const OmbString& name);

    // Take and release the configuration lock's write side.
    static void lock();
    static void unlock();

    // Stores object under name (replacing an earlier one) and makes name its
    // predefined name.
    static void registerPredefined(const OmbString& name, const OmbRef<OmbEngineObject>& object);
    // Exact, case-sensitive lookup; empty when absent.
    static OmbRef<OmbEngineObject> getPredefinedObject(const OmbString& name);
    // The names of all predefined objects in ascending order.
    static OmbRef<OmbVec<OmbString>> predefinedObjects();
    static void registerObject(const OmbString& name, const OmbRef<OmbEngineObject>& object);
    static OmbRef<OmbEngineObject> getRegisteredObject(const OmbString& name);

    // The classes of predefined objects, in the order they are created
    // (a datum refers to its ellipsoid, a Crs to its datum and projection).
    enum class PredefinedClass {
        LengthUnits,
        AngleUnits,
        PrimeMeridians,
        Ellipsoids,
        GeodeticDatums,
        Projections,
        Crs,
        Symbols,
        Fonts,
        LineStyles,
        Count
    };
    // A class's functions that register its predefined objects at init()
    // and drop its static references to them at shutdown().
    static void registerPredefinedClass(PredefinedClass cls, void (*create)(), void (*drop)());

    // Process-wide services of other subsystems that the runtime starts and
    // cleans up at fixed points: the block pool before the configuration
    // lock, the atom table before the predefined objects; at shutdown GDAL
    // access, atoms and the block pool, in that order, after the cache.
    enum class Service { BlockPool, Atoms, GdalAccess, Count };
    static void registerService(Service service, void (*init)(), void (*cleanUp)());

    using ApiFunction = void (*)();
    // Initialises the runtime, then stores the API's functions (replacing
    // those of an API with the same name). An API registered while the
    // runtime is initialised is initialised at once.
    static void registerAPI(const OmbString& name, ApiFunction initialize, ApiFunction second, ApiFunction shutdown);
    // Clears the named API's functions; the record stays.
    static void unregisterAPI(const OmbString& name);

    // At shutdown, handler->stopThreads() is called if object still exists.
    static void registerThreadCleanUp(IShutdownHandler* handler, OmbEngineObject* object);

    // Keeps the reference until the main thread calls releasePendingObjects().
    static void releaseOnMainThread(const OmbRef<OmbRefCnt>& object);
    static void releasePendingObjects();

    // The global cache's size setting (the byte limit is 768 KiB per unit).
    static int globalCacheSize();
    static void globalCacheSize(int size);

    // Requests the abort of the running long operation on any thread.
    static void abort();
    // Raises statusChangedEvent with a null sender and id 0.
    static void fireStatusChanged(const OmbString& message, int percentComplete, bool isLast);

    // Nothing to set up on Linux; kept for code written against the
    // interface, where drawing back-ends needed a COM apartment.
    static void CoInitialize() {}
    static void CoUninitialize() {}

    static OmbEventHandler<OmbEngineObject, OmbGlobalStatusEventArgs> statusChangedEvent;
    static OmbEventHandler<OmbEngineObject, OmbErrorEventArgs> errorEvent;
};
