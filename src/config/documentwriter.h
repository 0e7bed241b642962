// Building and writing saved documents.
#pragma once

#include <oecore/core/engineobject.h>

#include <vector>

class TiXmlDocument;

namespace oecore::detail {

// A Configuration document in namespace ns holding the objects, each public,
// with everything they refer to; the comment, if any, leads the document.
void buildDocument(const std::vector<const OmbEngineObject*>& objects, const OmbString& ns, OmbSaveMode mode,
                   const OmbString& comment, TiXmlDocument& document);
// Writes the document, or throws without leaving a partial file.
void writeDocument(const TiXmlDocument& document, const OmbString& fileName);
// A file's name without folder and extension.
OmbString namespaceOfFile(const OmbString& fileName);

}  // namespace oecore::detail
