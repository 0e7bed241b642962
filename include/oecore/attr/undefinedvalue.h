// The no-data value of a raster band: an integer or a float that marks
// cells without data.
#pragma once

#include <oecore/core/resourceobject.h>

#include <cstdint>

class OmbUndefinedValue : public OmbResourceObject {
    OMB_ENGINE_CLASS_INLINE(OmbResourceObject, "UndefinedValue", 0)

public:
    virtual bool isUndefined(float) const { return false; }
    virtual bool isUndefined(int) const { return false; }
    virtual bool isInt() const { return false; }
    virtual bool isFloat() const { return false; }
    virtual int intValue() const { return 0; }
    virtual float floatValue() const { return 0; }
};

struct OmbUndefinedIntValueParams {
    std::int32_t value = 0;
};

class OmbUndefinedIntValue : public OmbUndefinedValue {
    OMB_ENGINE_CLASS_INLINE(OmbUndefinedValue, "UndefinedIntValue", 0)

public:
    explicit OmbUndefinedIntValue(std::int32_t value = 0) : value_(value) {}
    explicit OmbUndefinedIntValue(const OmbUndefinedIntValueParams& params) : value_(params.value) {}
    OmbUndefinedIntValue* clone() const override { return new OmbUndefinedIntValue(*this); }

    using OmbUndefinedValue::isUndefined;  // the float form stays visible
    bool isUndefined(int v) const override { return v == value_; }
    bool isInt() const override { return true; }
    int intValue() const override { return value_; }

private:
    std::int32_t value_;
};

struct OmbUndefinedFloatValueParams {
    float value = 0;
};

// Floating-point equality: a NaN no-data value marks nothing.
class OmbUndefinedFloatValue : public OmbUndefinedValue {
    OMB_ENGINE_CLASS_INLINE(OmbUndefinedValue, "UndefinedFloatValue", 0)

public:
    explicit OmbUndefinedFloatValue(float value = 0) : value_(value) {}
    explicit OmbUndefinedFloatValue(const OmbUndefinedFloatValueParams& params) : value_(params.value) {}
    OmbUndefinedFloatValue* clone() const override { return new OmbUndefinedFloatValue(*this); }

    using OmbUndefinedValue::isUndefined;  // the int form stays visible
    bool isUndefined(float v) const override { return v == value_; }
    bool isFloat() const override { return true; }
    float floatValue() const override { return value_; }

private:
    float value_;
};
