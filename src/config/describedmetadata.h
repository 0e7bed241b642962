// Reader metadata made from class descriptions, collection types and the
// markup extensions: everything the library itself registers with a context.
#pragma once

#include <oecore/config/classdescription.h>
#include <oecore/config/classmetadata.h>
#include <oecore/config/xmlparser.h>

#include <memory>
#include <vector>

class OmbXmlParserContext;

namespace oecore::detail {

// Reads the properties of a described class into a record, checks them and
// creates the object.
class DescribedClassMetaData : public ClassMetaData {
public:
    explicit DescribedClassMetaData(const OmbClassDescription& description);
    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override;

private:
    const OmbClassDescription& description_;
};

// A collection made from child elements of the item class.
class DescribedCollectionMetaData : public CollectionClassMetaData {
public:
    explicit DescribedCollectionMetaData(const OmbClassDescription::CollectionType& type);
    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override;

private:
    OmbClassDescription::CollectionType type_;
};

// The metadata of the library's own classes, for one context.
std::vector<std::unique_ptr<ClassMetaData>> coreMetaData();

// What the library's subsystems registered through OmbXmlParser.
std::vector<std::unique_ptr<ClassMetaData> (*)()>& libraryClasses();
std::vector<std::pair<OmbString, OmbTypeConverter>>& libraryTypeConverters();

}  // namespace oecore::detail
