// OmbEngineObject: the base of every object a configuration can describe.
//
// An engine object is shared through OmbRef, may be observed through
// OmbWRef, knows its run-time class, clones itself, lists the engine objects
// it refers to and writes itself back as configuration XML. The virtual
// operations keep a fixed order; subclasses append theirs after
// myRuntimeClass_().
//
// Thread safety: graph walks (getChildObjects, findChildObject, safeClone)
// run under the runtime's configuration lock for reading, so they may run
// concurrently with each other but not with a change made under its write
// lock. Anything else is one thread at a time unless a class says otherwise.
#pragma once

#include <oecore/core/class.h>
#include <oecore/core/ref.h>
#include <oecore/core/refcnt.h>
#include <oecore/core/string.h>

class OmbXmlSerializer;
class TiXmlElement;
class OmbEngineObject;

template <class T, int N, class Notifier, class Sharing>
class OmbRefVec;
class OmbRefVecNotifierDummy;
template <class T>
class OmbRefVecSharingDummy;

using OmbEngineObjectVec =
    OmbRefVec<OmbEngineObject, 0, OmbRefVecNotifierDummy, OmbRefVecSharingDummy<OmbEngineObject>>;

// How far getChildObjects and findChildObject look: only the objects the
// root refers to, or everything reachable.
enum class OmbChildObjectMode { TopLevel, AllLevels };

// What saving writes: objects that hold features in memory write them only
// with IncludeFeatures.
enum class OmbSaveMode { Default = 0, IncludeFeatures = 1 };

// Declares the class-level members every engine class has. Use in the class
// body; OMB_DEFINE_ENGINE_CLASS in the source file defines them.
#define OMB_DECLARE_ENGINE_CLASS()                                        \
public:                                                                   \
    static int classId();                                                 \
    static OmbClass* runtimeClass();                                      \
    const char* myRuntimeClassName() const override;                      \
                                                                          \
private:                                                                  \
    int myClassId_() const override { return classId(); }                 \
    OmbClass* myRuntimeClass_() const override { return runtimeClass(); } \
                                                                          \
public:

// ELEMENT is the configuration element name; PLUGIN the module id (0 here).
// The class record is created when the library loads, so OmbClass::all()
// lists every class.
#define OMB_DEFINE_ENGINE_CLASS(CLASS, BASE, ELEMENT, PLUGIN)          \
    int CLASS::classId() {                                             \
        static int id = 0;                                             \
        return initClassId(id);                                        \
    }                                                                  \
    OmbClass* CLASS::runtimeClass() {                                  \
        static OmbClass record(BASE::runtimeClass(), PLUGIN, ELEMENT); \
        return &record;                                                \
    }                                                                  \
    const char* CLASS::myRuntimeClassName() const { return ELEMENT; }  \
    [[maybe_unused]] static const OmbClass* const CLASS##RuntimeClassAtLoad = CLASS::runtimeClass();

// The same members defined in the class body, for templates and classes that
// live in one header. ELEMENT may be any expression giving a lasting name.
#define OMB_ENGINE_CLASS_INLINE(BASE, ELEMENT, PLUGIN)                                 \
public:                                                                                \
    static int classId() {                                                             \
        static int id = 0;                                                             \
        return OmbEngineObject::initClassId(id);                                       \
    }                                                                                  \
    static OmbClass* runtimeClass() {                                                  \
        static OmbClass record(BASE::runtimeClass(), PLUGIN, ELEMENT);                 \
        return &record;                                                                \
    }                                                                                  \
    const char* myRuntimeClassName() const override { return runtimeClass()->name(); } \
                                                                                       \
private:                                                                               \
    int myClassId_() const override { return classId(); }                              \
    OmbClass* myRuntimeClass_() const override { return runtimeClass(); }              \
                                                                                       \
public:

// "KIND<ARGUMENT>", kept for the life of the process: the element names of
// class template instances.
const char* Omb_templateClassName(const char* kind, const char* argument);

class OmbEngineObject : public OmbWRefCnt {
public:
    OmbEngineObject() = default;
    // A copy (and so a clone) is never predefined.
    OmbEngineObject(const OmbEngineObject& other) : OmbWRefCnt(other) {}
    OmbEngineObject& operator=(const OmbEngineObject&) { return *this; }
    ~OmbEngineObject() override = default;

    // A new object of the same class with count 0; wrap it at once.
    virtual OmbEngineObject* clone() const = 0;
    virtual void notifyChanged();
    // The engine objects this object refers to directly.
    virtual OmbRef<OmbEngineObjectVec> getMyChildObjects() const;
    virtual void toXml(OmbXmlSerializer& serializer, TiXmlElement* topLevel, TiXmlElement* parent,
                       const char* propertyName, const char* elementName, bool isPublic) const;
    virtual bool isLockable() const;
    virtual void lock();
    virtual void unlock();
    // The configuration element name of the object's class.
    virtual const char* myRuntimeClassName() const;

protected:
    virtual bool nameEquals(const OmbString& name) const;

private:
    // The comment written ahead of the object's element when saving.
    virtual OmbString saveComment() const;
    virtual int myClassId_() const = 0;
    virtual OmbClass* myRuntimeClass_() const = 0;

public:
    int myClassId() const { return myClassId_(); }
    OmbClass* myRuntimeClass() const { return myRuntimeClass_(); }
    bool isA(const OmbClass* cls) const { return myRuntimeClass()->isA(cls); }

    // clone() under the configuration lock, wrapped.
    OmbRef<OmbEngineObject> safeClone() const;
    // Breadth-first, each object once, the root itself not included.
    OmbRef<OmbEngineObjectVec> getChildObjects(OmbChildObjectMode mode) const;
    // The first child object whose name equals name, or an empty reference.
    OmbRef<OmbEngineObject> findChildObject(const OmbString& name, OmbChildObjectMode mode) const;

    // Writes the object, with everything it refers to, as a configuration
    // document; the object becomes public. The file's namespace is its name
    // without folder and extension; the string form uses "Memory".
    void save(const OmbString& fileName, OmbSaveMode mode = OmbSaveMode::Default) const;
    OmbString save(OmbSaveMode mode = OmbSaveMode::Default) const;

    // Non-empty only for the objects the runtime creates as predefined.
    const OmbString& predefinedName() const noexcept { return predefinedName_; }
    void predefinedName(const OmbString& name) { predefinedName_ = name; }

    static int classId();
    static OmbClass* runtimeClass();

protected:
    // Assigns the next class id to id on first call; returns the id.
    static int initClassId(int& id);

private:
    friend class OmbChildObjectEnumerator;
    OmbString predefinedName_;
};
