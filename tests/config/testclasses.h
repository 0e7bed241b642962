// Described engine classes for the configuration tests.
#pragma once

#include <oecore/config/classdescription.h>
#include <oecore/core/refvec.h>
#include <oecore/core/resourceobject.h>

class TestUnit : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    TestUnit* clone() const override { return new TestUnit(*this); }
    double inMeters() const { return inMeters_; }
    void inMeters(double value) { inMeters_ = value; }

private:
    double inMeters_ = 1.0;
};

class TestShape;
using TestShapeVec = OmbRefVec<TestShape>;

class TestShape : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    TestShape* clone() const override { return new TestShape(*this); }

    double width = 0;
    long long count = 0;
    bool visible = true;
    OmbString label;
    OmbChildObjectMode mode = OmbChildObjectMode::TopLevel;
    OmbRef<TestUnit> unit;
    OmbRef<TestShapeVec> parts;
};

// The class a test module provides.
class TestPluginObject;
