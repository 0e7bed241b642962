#include <oecore/config/classdescription.h>
#include <oecore/config/xmlserializer.h>
#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>

#include <tinyxml.h>

#include "documentwriter.h"

#include <cstdio>
#include <filesystem>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace {

bool isInside(const TiXmlNode* node, const TiXmlNode* ancestor) {
    for (; node; node = node->Parent())
        if (node == ancestor) return true;
    return false;
}

// Sets an element's Name as its first attribute, where a loaded object
// writes it too, so that saving what was loaded reproduces the same text.
void setName(TiXmlElement* element, const OmbString& name) {
    std::vector<std::pair<std::string, std::string>> others;
    for (const TiXmlAttribute* a = element->FirstAttribute(); a; a = a->Next())
        if (std::string_view(a->Name()) != "Name") others.emplace_back(a->Name(), a->Value());
    for (const auto& [attribute, value] : others) element->RemoveAttribute(attribute);
    element->RemoveAttribute("Name");
    element->SetAttribute("Name", name.dataUtf8());
    for (const auto& [attribute, value] : others) element->SetAttribute(attribute, value);
}

}  // namespace

void OmbXmlSerializer::addObject(const OmbEngineObject* object, TiXmlElement* element) {
    written_[object] = element;
    const char* name = element->Attribute("Name");
    if (!name || !*name) return;
    if (!usedNames_.insert(OmbString(name)).second) colliding_.insert(element);
}

TiXmlElement* OmbXmlSerializer::find(const OmbEngineObject* object) const {
    const auto it = written_.find(object);
    return it == written_.end() ? nullptr : it->second;
}

void OmbXmlSerializer::addReference(TiXmlElement* referenceElement, TiXmlElement* targetElement) {
    references_.emplace_back(referenceElement, targetElement);
}

void OmbXmlSerializer::removeReference(TiXmlElement* element) {
    std::erase_if(references_, [element](const auto& r) { return r.first && isInside(r.first, element); });
}

void OmbXmlSerializer::writeNames() {
    for (const auto& [reference, target] : references_) {
        const char* name = target->Attribute("Name");
        if (name && *name && !colliding_.count(target)) continue;
        const std::string tag = target->Value();
        // Counters only grow: every lower candidate was found taken before.
        for (int& counter = nextCounter_[tag];; ++counter) {
            OmbString candidate(tag + std::to_string(counter));
            if (usedNames_.insert(candidate).second) {
                setName(target, candidate);
                colliding_.erase(target);
                break;
            }
        }
    }
    for (const auto& [reference, target] : references_)
        if (reference) reference->SetAttribute("Value", target->Attribute("Name"));
}

TiXmlElement* OmbXmlSerializer::propertyElement(TiXmlElement* parent, const char* propertyName) {
    const std::string tag = std::string(parent->Value()) + "." + propertyName;
    return parent->LinkEndChild(new TiXmlElement(tag))->ToElement();
}

TiXmlElement* OmbXmlSerializer::addReferenceElement(TiXmlElement* topLevel, TiXmlElement* parent,
                                                    const char* propertyName) {
    auto* reference = new TiXmlElement("ResourceReference");
    reference->SetAttribute("Value", "");
    TiXmlElement* container = parent ? parent : topLevel;
    if (parent && propertyName && *propertyName) container = propertyElement(parent, propertyName);
    container->LinkEndChild(reference);
    return reference;
}

bool OmbXmlSerializer::predefinedToXml(const OmbEngineObject& object, TiXmlElement* topLevel, TiXmlElement* parent,
                                       const char* propertyName, bool isPublic) {
    if (!object.predefinedName().empty()) {
        TiXmlElement* reference = addReferenceElement(topLevel, parent, propertyName);
        reference->SetAttribute("Predefined", "true");
        reference->SetAttribute("Value", object.predefinedName().dataUtf8());
        return true;
    }
    TiXmlElement* existing = find(&object);
    if (!existing) return false;
    if (parent) addReference(addReferenceElement(topLevel, parent, propertyName), existing);
    if (isPublic) existing->SetAttribute("Public", "true");
    return true;
}

void OmbXmlSerializer::saveStringProperty(TiXmlElement* element, const char* name, const OmbString& value) {
    element->SetAttribute(name, value.dataUtf8());
}

void OmbXmlSerializer::saveUInt32Property(TiXmlElement* element, const char* name, std::uint32_t value) {
    element->SetAttribute(name, std::to_string(value).c_str());
}

void OmbXmlSerializer::saveInt64Property(TiXmlElement* element, const char* name, std::int64_t value) {
    element->SetAttribute(name, std::to_string(value).c_str());
}

void OmbXmlSerializer::saveUInt64Property(TiXmlElement* element, const char* name, std::uint64_t value) {
    element->SetAttribute(name, std::to_string(value).c_str());
}

void OmbXmlSerializer::saveDoubleProperty(TiXmlElement* element, const char* name, double value) {
    OmbStringBuilder text;
    text << OmbFormat::real(value);
    element->SetAttribute(name, text.str().dataUtf8());
}

void Omb_describedToXml(const OmbEngineObject& object, OmbXmlSerializer& serializer, TiXmlElement* topLevel,
                        TiXmlElement* parent, const char* propertyName, const char*, bool isPublic) {
    if (serializer.predefinedToXml(object, topLevel, parent, propertyName, isPublic)) return;
    const OmbClassDescription* description = OmbClassDescription::of(object.myRuntimeClass());
    // Owned here until it joins the document: a property that fails to write
    // must not leak it.
    std::unique_ptr<TiXmlElement> owned(new TiXmlElement(object.myRuntimeClassName()));
    TiXmlElement* element = owned.get();
    if (parent) {
        element->SetAttribute("Name", "");
        serializer.addReference(OmbXmlSerializer::addReferenceElement(topLevel, parent, propertyName), element);
    }
    // Registered before the properties are written, so that a property that
    // leads back to this object refers to it instead of writing it again.
    serializer.addObject(&object, element);
    for (const OmbPropertyDescription* p :
         description ? description->properties() : std::vector<const OmbPropertyDescription*>()) {
        if (p->isDefault(object)) continue;
        switch (p->kind()) {
            case OmbPropertyDescription::Kind::Simple:
                element->SetAttribute(p->name(), p->text(object).dataUtf8());
                break;
            case OmbPropertyDescription::Kind::Object:
                p->object(object)->toXml(serializer, topLevel, element, p->name(), "", false);
                break;
            case OmbPropertyDescription::Kind::Collection: {
                TiXmlElement* list = OmbXmlSerializer::propertyElement(element, p->name());
                TiXmlElement* items = list->LinkEndChild(new TiXmlElement(p->typeName().dataUtf8()))->ToElement();
                const OmbRef<OmbEngineObjectVec> held = p->object(object)->getMyChildObjects();
                for (const OmbRef<OmbEngineObject>& item : *held)
                    item->toXml(serializer, topLevel, items, "", "", false);
                break;
            }
        }
    }
    // After the properties, where a loaded object writes it too.
    if (isPublic) element->SetAttribute("Public", "true");
    // Names given through properties are noted now that they are written.
    serializer.addObject(&object, element);
    topLevel->LinkEndChild(owned.release());
}

namespace oecore::detail {

void buildDocument(const std::vector<const OmbEngineObject*>& objects, const OmbString& ns, OmbSaveMode mode,
                   const OmbString& comment, TiXmlDocument& document) {
    if (!comment.empty()) document.LinkEndChild(new TiXmlComment(comment.dataUtf8()));
    document.LinkEndChild(new TiXmlDeclaration("1.0", "UTF-8", ""));
    auto* root = new TiXmlElement("Configuration");
    root->SetAttribute("Namespace", ns.dataUtf8());
    root->SetAttribute("Version", "5.4.0.3");
    root->SetAttribute("xmlns", OmbXmlSerializer::formatNamespace);
    document.LinkEndChild(root);
    OmbXmlSerializer serializer(mode);
    for (const OmbEngineObject* object : objects) {
        if (!object->predefinedName().empty()) continue;
        object->toXml(serializer, root, nullptr, "", "", true);
        // A saved object is written after what it refers to; it gets a name
        // so that, public, it can be found again after loading.
        if (TiXmlElement* own = serializer.find(object)) serializer.addReference(nullptr, own);
    }
    serializer.writeNames();
}

void writeDocument(const TiXmlDocument& document, const OmbString& fileName) {
    namespace fs = std::filesystem;
    const fs::path path(std::string(fileName.view()));
    // Written beside the target and renamed over it, so that a failed save
    // never leaves a half-written file behind.
    const fs::path partial = path.string() + ".partial";
    std::FILE* file = std::fopen(partial.c_str(), "wb");
    if (!file) OMB_THROW(GenericException, OmbString("Failed to open file ") + fileName + OmbString(" for writing"));
    const bool written = document.SaveFile(file);
    const bool closed = std::fclose(file) == 0;
    std::error_code error;
    if (written && closed) fs::rename(partial, path, error);
    if (!written || !closed || error) {
        fs::remove(partial, error);
        OMB_THROW(GenericException, OmbString("Failed to write file ") + fileName);
    }
}

OmbString namespaceOfFile(const OmbString& fileName) {
    return OmbString(std::filesystem::path(std::string(fileName.view())).stem().string());
}

}  // namespace oecore::detail

OmbString OmbEngineObject::save(OmbSaveMode mode) const {
    TiXmlDocument document;
    oecore::detail::buildDocument({this}, OmbString::literal("Memory"), mode, saveComment(), document);
    TiXmlPrinter printer;
    document.Accept(&printer);
    return OmbString(printer.CStr());
}

void OmbEngineObject::save(const OmbString& fileName, OmbSaveMode mode) const {
    TiXmlDocument document;
    oecore::detail::buildDocument({this}, oecore::detail::namespaceOfFile(fileName), mode, saveComment(), document);
    oecore::detail::writeDocument(document, fileName);
}
