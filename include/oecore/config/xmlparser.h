// The .px reader: turns a configuration document into an OmbConfiguration.
//
// Every element names a registered class; every attribute or property
// element ("View.Layers") sets one of its properties. Names declared with
// Name= are visible to later elements of the same file; ResourceReference
// finds them, predefined objects and objects of other files. Every error is
// an OmbXXmlParserError whose text ends with the element's "Row r, Column c.".
//
// Thread safety: a context belongs to one load on one thread. Loads on
// different threads share the process's current directory, which a file load
// changes while it runs: serialise loads from different folders.
#pragma once

#include <oecore/config/classmetadata.h>
#include <oecore/core/engineobject.h>
#include <oecore/core/refcnt.h>
#include <oecore/core/string.h>

#include <functional>
#include <map>
#include <memory>
#include <vector>

class OmbConfiguration;
class OmbConfigurationParameters;
class OmbResourceResolver;
class OmbXmlParserContext;
class TiXmlDocument;
class TiXmlNode;

enum class OmbDataSetInitialization { Immediate = 0, Delayed = 1 };

// An object read from a document that stands for another value: the reader
// replaces it by provideValue().
class MarkupExtension : public OmbRefCnt {
public:
    virtual OmbRef<OmbRefCnt> provideValue(OmbXmlParserContext& context) = 0;
};

// Converts text to a boxed value; empty when the text is rejected.
using OmbTypeConverter = std::function<OmbRef<OmbRefCnt>(const OmbString& text, OmbXmlParserContext& context)>;

// What an extension module hands the reader: it registers its classes with a
// context and removes them again when the context ends.
class OmbPluginInstance {
public:
    virtual ~OmbPluginInstance() = default;
    virtual void registerClasses(OmbXmlParserContext& context) = 0;
    virtual void unregisterClasses(OmbXmlParserContext& context) = 0;
};

class OmbXmlParserContext {
public:
    OmbXmlParserContext(OmbRef<OmbConfigurationParameters> params, OmbDataSetInitialization datasetInitialization,
                        OmbRef<OmbResourceResolver> resolver);
    ~OmbXmlParserContext();
    OmbXmlParserContext(const OmbXmlParserContext&) = delete;
    OmbXmlParserContext& operator=(const OmbXmlParserContext&) = delete;

    OmbRef<OmbConfiguration> loadFile(const OmbString& fileName);
    OmbRef<OmbConfiguration> loadString(const OmbString& text);

    OmbRef<OmbRefCnt> createInstance(TiXmlElement* element);
    ClassMetaData* getClassMetaData(const OmbString& name, bool throwIfMissing);
    void registerClass(ClassMetaData* metaData);
    void unregisterClass(ClassMetaData* metaData);
    void registerTypeConverter(const OmbString& name, OmbTypeConverter converter);
    void unregisterTypeConverter(const OmbString& name);
    // Text to a boxed value of the type, or the conversion errors; a text the
    // converter rejects is reported at node's position when one is given.
    OmbRef<OmbRefCnt> convertToType(const OmbString& text, const OmbString& typeName, const TiXmlNode* node = nullptr);
    // A named object of the current scope, or null.
    OmbRef<OmbRefCnt> findResource(const OmbString& qualifiedName);

    // Stacked properties: values handed down to nested elements.
    OmbRef<OmbRefCnt> getPropertyValue(const OmbString& name);
    void pushProperty(const OmbString& name, const OmbRef<OmbRefCnt>& value);
    void popProperty(const OmbString& name);

    // The parameter's text, or false when there is none.
    bool getConfigurationParameter(const OmbString& key, OmbString& value);

    const OmbString& currentNamespace() const noexcept { return namespace_; }
    const OmbString& currentFile() const;
    const OmbString& comment() const noexcept { return comment_; }
    void comment(const OmbString& text) { comment_ = text; }
    const OmbRef<OmbConfigurationParameters>& params() const noexcept { return params_; }
    const OmbRef<OmbResourceResolver>& resourceResolver() const noexcept { return resolver_; }
    OmbDataSetInitialization datasetInitialization() const noexcept { return datasetInitialization_; }
    // The packed version of the document being read (5.4.0.3 is 0x05040003).
    std::uint32_t version() const noexcept { return version_; }
    void setConfigNamespace(const OmbString& ns);

    // Loads an extension module's classes ("" is the library itself).
    void loadPluginByName(const OmbString& name);

    // Sets the current namespace and restores the previous one.
    class NamespaceTransaction {
    public:
        NamespaceTransaction(OmbXmlParserContext& context, const OmbString& ns);
        ~NamespaceTransaction();
        NamespaceTransaction(const NamespaceTransaction&) = delete;
        NamespaceTransaction& operator=(const NamespaceTransaction&) = delete;

    private:
        OmbXmlParserContext& context_;
        OmbString previous_;
    };

private:
    friend class OmbXmlParser;
    struct Plugin;

    OmbRef<OmbConfiguration> load(TiXmlDocument& document, const OmbString& path);
    void readConfigurationElement(TiXmlElement* element);
    void registerName(TiXmlElement* element, const OmbRef<OmbRefCnt>& object);

    OmbRef<OmbConfigurationParameters> params_;
    OmbDataSetInitialization datasetInitialization_;
    OmbRef<OmbResourceResolver> resolver_;
    std::uint32_t version_ = 0x05000000;
    OmbString namespace_;
    OmbString comment_;
    std::map<OmbString, ClassMetaData*> classes_;
    std::map<OmbString, OmbTypeConverter> converters_;
    std::vector<std::unique_ptr<ClassMetaData>> ownMetaData_;
    std::vector<std::unique_ptr<Plugin>> plugins_;
    std::vector<OmbString> files_;
    std::vector<OmbRef<OmbConfiguration>> configurations_;
    std::vector<std::map<OmbString, OmbRef<OmbRefCnt>>> scopes_;
    std::map<OmbString, OmbRef<OmbConfiguration>> loaded_;
    std::map<OmbString, std::vector<OmbRef<OmbRefCnt>>> stacked_;
    int depth_ = 0;
};

// Pushes a stacked property for its lifetime.
class StackedProperty {
public:
    StackedProperty(OmbXmlParserContext& context, const OmbString& name, const OmbRef<OmbRefCnt>& value);
    ~StackedProperty();
    StackedProperty(const StackedProperty&) = delete;
    StackedProperty& operator=(const StackedProperty&) = delete;

private:
    OmbXmlParserContext& context_;
    OmbString name_;
};

class OmbXmlParser {
public:
    OmbXmlParser() = delete;

    // Elements may nest this deep; deeper documents are refused with an
    // error instead of exhausting the stack.
    static constexpr int maximumDepth = 200;

    static OmbRef<OmbConfiguration> loadFile(const OmbString& fileName,
                                             const OmbRef<OmbConfigurationParameters>& params,
                                             OmbDataSetInitialization datasetInitialization,
                                             const OmbRef<OmbResourceResolver>& resolver);
    static OmbRef<OmbConfiguration> loadString(const OmbString& text, const OmbRef<OmbConfigurationParameters>& params,
                                               OmbDataSetInitialization datasetInitialization,
                                               const OmbRef<OmbResourceResolver>& resolver);

    // The one routine that reads a property of an element; empty when absent.
    static OmbRef<OmbRefCnt> parsePropertyGeneric(OmbXmlParserContext& context, TiXmlElement* element,
                                                  const OmbString& propertyName, const OmbString& typeName,
                                                  bool isContent);
    static OmbString getInstanceName(OmbXmlParserContext& context, TiXmlElement* element);
    // A String property's text; empty when absent.
    static OmbString getStringProperty(OmbXmlParserContext& context, TiXmlElement* element, const char* propertyName);
    static OmbRef<OmbRefCnt> parseCollection(OmbXmlParserContext& context, TiXmlElement* element,
                                             const OmbString& typeName,
                                             const std::function<bool(const TiXmlNode*)>& filter);
    static OmbRef<OmbRefCnt> stringToType(OmbXmlParserContext& context, TiXmlElement* element, const OmbString& text,
                                          const OmbString& typeName);
    static OmbRef<OmbRefCnt> parseMarkupExtension(OmbXmlParserContext& context, const OmbString& text,
                                                  const TiXmlNode* source);

    static bool isPropertyNode(const TiXmlNode* node);
    static bool isMarkupExtensionAttribute(const OmbString& text);
    static void getSourceInfo(const TiXmlNode* node, int& row, int& column);
    // Makes copy report the position of source (and so its children, when
    // recursive, report their counterparts').
    static void setSourceInfo(const TiXmlNode* source, TiXmlNode* copy, bool recursive);

    // Throws the reader's error for an element: its Name, the text, its position.
    [[noreturn]] static void fail(const TiXmlNode* node, const OmbString& text);

    // Hand-written metadata and type converters of the library's own
    // subsystems, registered with every context like the described classes.
    static void registerLibraryClass(std::unique_ptr<ClassMetaData> (*create)());
    static void registerLibraryTypeConverter(const char* typeName, OmbTypeConverter converter);

    // Called for every object read while data sets are initialised
    // immediately; the data set subsystem installs it.
    static void (*initializeDataSet)(OmbRefCnt& object);
};

// An extension module exports
//   extern "C" OmbPluginInstance* CreatePluginInstance(int abiVersion);
// which returns null when abiVersion is not the one it was built for.
constexpr int OmbPluginAbiVersion = 1;
using OmbCreatePluginInstanceFunction = OmbPluginInstance* (*)(int abiVersion);
