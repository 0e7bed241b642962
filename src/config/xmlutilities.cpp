#include <oecore/config/xmlutilities.h>
#include <oecore/core/stringbuilder.h>
#include <oecore/core/stringutils.h>

#include <tinyxml.h>

#include <algorithm>
#include <fstream>
#include <sstream>
#include <string_view>

namespace {

// The deepest element nesting of a document, found without parsing it:
// every "<name" opens, every "</" and "/>" closes; comments, CDATA,
// declarations and processing instructions are skipped.
int nestingDepth(std::string_view text) {
    int depth = 0;
    int deepest = 0;
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] != '<') {
            if (text[i] == '/' && i + 1 < text.size() && text[i + 1] == '>') --depth;
            continue;
        }
        const std::string_view rest = text.substr(i);
        const auto skipTo = [&](std::string_view end) {
            const std::size_t at = text.find(end, i);
            i = at == std::string_view::npos ? text.size() : at + end.size() - 1;
        };
        if (rest.starts_with("<!--")) {
            skipTo("-->");
        } else if (rest.starts_with("<![CDATA[")) {
            skipTo("]]>");
        } else if (rest.starts_with("<?") || rest.starts_with("<!")) {
            skipTo(">");
        } else if (rest.starts_with("</")) {
            --depth;
        } else {
            deepest = std::max(deepest, ++depth);
        }
    }
    return deepest;
}

// "(row, column)" of a byte offset, as the XML parser reports positions.
OmbString positionOf(std::string_view text, std::size_t offset) {
    std::size_t row = 1;
    std::size_t lineStart = 0;
    for (std::size_t i = 0; i < offset; ++i)
        if (text[i] == '\n') ++row, lineStart = i + 1;
    return OmbString("(" + std::to_string(row) + ", " + std::to_string(offset - lineStart + 1) + ")");
}

}  // namespace

bool OmbXmlUtilities::loadXmlFromString(const OmbString& text, TiXmlDocument& document, OmbString& error) {
    // The XML parser trusts multi-byte sequences and stops at a zero byte:
    // malformed text never reaches it.
    std::size_t bad = 0;
    const bool valid = OmbStringUtils::isValidUtf8(text.view(), &bad);
    const std::size_t zero = text.view().find('\0');
    if (!valid || zero != std::string_view::npos) {
        error = positionOf(text.view(), valid ? zero : std::min(bad, zero));
        return false;
    }
    if (nestingDepth(text.view()) > maximumNesting) {
        error = OmbString("(elements nested more than " + std::to_string(maximumNesting) + " levels deep)");
        return false;
    }
    document.Parse(text.dataUtf8(), nullptr, TIXML_ENCODING_UTF8);
    if (!document.Error()) return true;
    OmbStringBuilder position;
    position << "(" << document.ErrorRow() << ", " << document.ErrorCol() << ")";
    error = position.str();
    return false;
}

bool OmbXmlUtilities::loadXmlFromFile(const OmbString& fileName, TiXmlDocument& document, OmbString& error) {
    std::ifstream in(fileName.dataUtf8(), std::ios::binary);
    if (!in) {
        error = OmbString("(cannot open ") + fileName + OmbString(")");
        return false;
    }
    std::ostringstream text;
    text << in.rdbuf();
    const std::string bytes = text.str();
    return loadXmlFromString(createXmlStringFromBuffer(bytes.data(), bytes.size()), document, error);
}

OmbString OmbXmlUtilities::createXmlStringFromBuffer(const char* bytes, std::size_t length) {
    std::string_view text(bytes, length);
    if (text.starts_with("\xEF\xBB\xBF")) text.remove_prefix(3);
    return OmbString(text);
}

void OmbXmlUtilities::NamespaceStack::enter(const TiXmlElement* element) {
    std::map<OmbString, OmbString> scope;
    for (const TiXmlAttribute* a = element->FirstAttribute(); a; a = a->Next()) {
        const std::string_view name = a->Name();
        if (name == "xmlns")
            scope[OmbString()] = OmbString(a->Value());
        else if (name.starts_with("xmlns:"))
            scope[OmbString(name.substr(6))] = OmbString(a->Value());
    }
    scopes_.push_back(std::move(scope));
}

void OmbXmlUtilities::NamespaceStack::leave() {
    if (!scopes_.empty()) scopes_.pop_back();
}

OmbString OmbXmlUtilities::NamespaceStack::namespaceOf(const OmbString& name) const {
    const std::ptrdiff_t colon = name.find(OmbString::literal(":"));
    const OmbString prefix = colon < 0 ? OmbString() : name.substr(0, static_cast<std::size_t>(colon));
    for (auto scope = scopes_.rbegin(); scope != scopes_.rend(); ++scope)
        if (const auto it = scope->find(prefix); it != scope->end()) return it->second;
    return OmbString();
}

OmbString OmbXmlUtilities::NamespaceStack::localName(const OmbString& name) {
    const std::ptrdiff_t colon = name.find(OmbString::literal(":"));
    return colon < 0 ? name : name.substr(static_cast<std::size_t>(colon) + 1);
}
