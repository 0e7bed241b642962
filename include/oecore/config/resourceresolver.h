// OmbResourceResolver: turns resource references of a configuration (symbol
// images, data files) into file paths relative to a base path. A caller may
// pass its own to a load to redirect resources.
#pragma once

#include <oecore/core/engineobject.h>

class OmbResourceResolver : public OmbEngineObject {
    OMB_DECLARE_ENGINE_CLASS()

public:
    OmbResourceResolver* clone() const override { return new OmbResourceResolver(*this); }

    // The file fileName found from path (the folder of the referring file).
    virtual OmbString resolveString(const OmbString& path, const OmbString& fileName) const;

    // path as is when absolute, else combined with base; "." and ".." removed.
    static OmbString evaluatePath(const OmbString& base, const OmbString& path);
};
