// OmbBoxedValue<T>: a plain value carried as a reference-counted object, the
// form in which the configuration reader hands over property values.
#pragma once

#include <oecore/core/ref.h>
#include <oecore/core/refcnt.h>

#include <utility>

template <class T>
class OmbBoxedValue : public OmbRefCnt {
public:
    explicit OmbBoxedValue(T value) : value_(std::move(value)) {}

    static OmbRef<OmbRefCnt> box(T value) { return OmbRef<OmbRefCnt>(new OmbBoxedValue(std::move(value))); }

    const T& value() const noexcept { return value_; }

private:
    T value_;
};
