// OmbConfiguration: what a loaded .px file becomes, a named set of public
// objects; and OmbConfigurationParameters, the values a file reads through
// ConfigurationParameter markup extensions.
#pragma once

#include <oecore/config/xmlparser.h>
#include <oecore/core/engineobject.h>
#include <oecore/core/refvec.h>
#include <oecore/core/string.h>
#include <oecore/core/vec.h>

#include <cstdint>
#include <map>
#include <mutex>

class OmbConfigurationParameters : public OmbEngineObject {
    OMB_DECLARE_ENGINE_CLASS()

public:
    OmbConfigurationParameters* clone() const override { return new OmbConfigurationParameters(*this); }

    // Each stores the value as configuration text, replacing an earlier value.
    void add(const OmbString& key, std::int64_t value);
    void add(const OmbString& key, int value) { add(key, static_cast<std::int64_t>(value)); }
    void add(const OmbString& key, unsigned long value);
    void add(const OmbString& key, double value);
    void add(const OmbString& key, bool value);
    void add(const OmbString& key, const OmbString& value);
    void add(const OmbString& key, const char* value) { add(key, OmbString(value)); }
    void add(const OmbString& key, const char16_t* value) { add(key, OmbString::fromWide(value)); }
    void add(const OmbString& key, const wchar_t* value) { add(key, OmbString::fromWide(value)); }
    bool get(const OmbString& key, OmbString& out) const;

private:
    std::map<OmbString, OmbString> values_;
};

class OmbConfiguration : public OmbEngineObject {
    OMB_DECLARE_ENGINE_CLASS()

public:
    OmbConfiguration() = default;
    // Loads a file (a .mpx map package through the OEDataSets module); the
    // runtime must be initialised.
    OmbConfiguration(const OmbString& fileName, OmbDataSetInitialization datasetInitialization,
                     const OmbRef<OmbResourceResolver>& resolver = OmbRef<OmbResourceResolver>());
    OmbConfiguration(const OmbString& fileName, const OmbRef<OmbConfigurationParameters>& params,
                     OmbDataSetInitialization datasetInitialization,
                     const OmbRef<OmbResourceResolver>& resolver = OmbRef<OmbResourceResolver>());

    static OmbRef<OmbConfiguration> fromString(
        const OmbString& text, const OmbRef<OmbConfigurationParameters>& params,
        OmbDataSetInitialization datasetInitialization = OmbDataSetInitialization::Immediate,
        const OmbRef<OmbResourceResolver>& resolver = OmbRef<OmbResourceResolver>());
    static OmbRef<OmbConfiguration> fromString(
        const OmbString& text, OmbDataSetInitialization datasetInitialization = OmbDataSetInitialization::Immediate,
        const OmbRef<OmbResourceResolver>& resolver = OmbRef<OmbResourceResolver>());

    // A new configuration sharing the same objects.
    OmbConfiguration* clone() const override { return new OmbConfiguration(*this); }
    // A configuration cannot be saved into another one: throws.
    void toXml(OmbXmlSerializer& serializer, TiXmlElement* topLevel, TiXmlElement* parent, const char* propertyName,
               const char* elementName, bool isPublic) const override;
    OmbRef<OmbEngineObjectVec> getMyChildObjects() const override { return publicObjects(); }

    // The exact name, else the name in the default namespace; empty when
    // absent or not an engine object.
    OmbRef<OmbEngineObject> getPublicObject(const OmbString& name) const;
    // The exact name only, any object.
    OmbRef<OmbRefCnt> getAny(const OmbString& name) const;
    OmbRef<OmbVec<OmbString>> publicNames() const;
    OmbRef<OmbEngineObjectVec> publicObjects() const;
    void add(const OmbString& name, const OmbRef<OmbRefCnt>& object);

    const OmbString& defaultNamespace() const noexcept { return defaultNamespace_; }
    void setDefaultNamespace(const OmbString& ns) { defaultNamespace_ = ns; }

    // Writes every public engine object into one document, in name order.
    void savePublicObjects(const OmbString& fileName, OmbSaveMode mode = OmbSaveMode::Default) const;

    static void save(const OmbString& fileName, const OmbRef<OmbEngineObject>& object,
                     OmbSaveMode mode = OmbSaveMode::Default);
    static OmbString save(const OmbRef<OmbEngineObject>& object, OmbSaveMode mode = OmbSaveMode::Default);

    // The comment of the document it was read from; empty when it had none.
    const OmbString& comment() const noexcept { return comment_; }
    void storeComment(const OmbString& comment) { comment_ = comment; }

private:
    void copyFrom(const OmbConfiguration& loaded);
    void loadMapPackage(const OmbString& fileName, const OmbRef<OmbResourceResolver>& resolver);

    // Serialises construction from files.
    static std::mutex mutex_;

    std::map<OmbString, OmbRef<OmbRefCnt>> publicObjects_;
    OmbString defaultNamespace_;
    OmbString comment_;
};
