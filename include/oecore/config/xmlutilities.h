// Loading XML documents, and the namespace prefixes of the XML formats the
// library reads besides .px.
#pragma once

#include <oecore/core/string.h>

#include <map>
#include <vector>

class TiXmlDocument;
class TiXmlElement;

class OmbXmlUtilities {
public:
    OmbXmlUtilities() = delete;

    // Documents may nest elements this deep; deeper ones are refused before
    // parsing, which would otherwise recurse as deep as the document.
    static constexpr int maximumNesting = 1000;

    // On failure error holds "(row, column)" of the problem, or the reason.
    static bool loadXmlFromFile(const OmbString& fileName, TiXmlDocument& document, OmbString& error);
    static bool loadXmlFromString(const OmbString& text, TiXmlDocument& document, OmbString& error);
    // Text from a buffer that may start with a UTF-8 byte order mark.
    static OmbString createXmlStringFromBuffer(const char* bytes, std::size_t length);

    // Maps prefixed names ("gml:Point") to the namespaces their xmlns
    // declarations bind, element by element.
    class NamespaceStack {
    public:
        // Enters an element: its xmlns and xmlns:prefix attributes apply to it
        // and its children until leave().
        void enter(const TiXmlElement* element);
        void leave();
        // The namespace bound to the prefix of name ("" for the default one).
        OmbString namespaceOf(const OmbString& name) const;
        // The part of name after its prefix.
        static OmbString localName(const OmbString& name);

    private:
        std::vector<std::map<OmbString, OmbString>> scopes_;
    };
};
