// OmbResourceObject: an engine object with a name, the base of the named
// things of a configuration (coordinate systems, visualizers, views, ...).
#pragma once

#include <oecore/core/engineobject.h>

class OmbResourceObject : public OmbEngineObject {
    OMB_DECLARE_ENGINE_CLASS()

public:
    const OmbString& name() const noexcept { return name_; }
    void name(const OmbString& name) { name_ = name; }

protected:
    OmbResourceObject() = default;
    explicit OmbResourceObject(const OmbString& name) : name_(name) {}

    bool nameEquals(const OmbString& name) const override { return !name_.empty() && name_ == name; }

private:
    OmbString name_;
};
