// OmbXmlSerializer: the bookkeeping of one save. Objects referred to from
// several places, or through a property, are written once at top level;
// writeNames() then gives every referenced element a unique name and points
// every ResourceReference at it.
#pragma once

#include <oecore/core/engineobject.h>
#include <oecore/core/string.h>

#include <cstdint>
#include <map>
#include <set>
#include <string>
#include <utility>
#include <vector>

class TiXmlElement;

class OmbXmlSerializer {
public:
    // The namespace URI written on saved documents.
    static constexpr const char* formatNamespace = "http://oecore.org/schemas/px/5.4";

    explicit OmbXmlSerializer(OmbSaveMode mode) : mode_(mode) {}
    OmbXmlSerializer(const OmbXmlSerializer&) = delete;
    OmbXmlSerializer& operator=(const OmbXmlSerializer&) = delete;

    OmbSaveMode mode() const noexcept { return mode_; }

    // Records that object was written as element, and notes its Name.
    void addObject(const OmbEngineObject* object, TiXmlElement* element);
    TiXmlElement* find(const OmbEngineObject* object) const;
    // referenceElement (a ResourceReference, or null) must name targetElement.
    void addReference(TiXmlElement* referenceElement, TiXmlElement* targetElement);
    // Drops the references whose reference element is element or inside it.
    void removeReference(TiXmlElement* element);
    void writeNames();

    // Writes a predefined object as a reference to its predefined name, and an
    // object written before as a reference to that element; false otherwise.
    bool predefinedToXml(const OmbEngineObject& object, TiXmlElement* topLevel, TiXmlElement* parent,
                         const char* propertyName, bool isPublic);
    // A ResourceReference placed in parent, wrapped in the property element
    // when propertyName is not empty (or in topLevel without a parent).
    static TiXmlElement* addReferenceElement(TiXmlElement* topLevel, TiXmlElement* parent, const char* propertyName);
    // The element parent tag + "." + propertyName inside parent.
    static TiXmlElement* propertyElement(TiXmlElement* parent, const char* propertyName);

    static void saveStringProperty(TiXmlElement* element, const char* name, const OmbString& value);
    static void saveUInt32Property(TiXmlElement* element, const char* name, std::uint32_t value);
    static void saveInt64Property(TiXmlElement* element, const char* name, std::int64_t value);
    static void saveUInt64Property(TiXmlElement* element, const char* name, std::uint64_t value);
    // 17 significant digits, "." and a short exponent.
    static void saveDoubleProperty(TiXmlElement* element, const char* name, double value);

private:
    OmbSaveMode mode_;
    std::set<OmbString> usedNames_;
    std::set<TiXmlElement*> colliding_;
    std::map<const OmbEngineObject*, TiXmlElement*> written_;
    std::vector<std::pair<TiXmlElement*, TiXmlElement*>> references_;
    // Per tag, the counter the next generated name starts from.
    std::map<std::string, int> nextCounter_;
};
