// The message of the OmbException a call throws, or "no error".
#pragma once

#include <oecore/core/exception.h>

#include <functional>
#include <string>

inline std::string errorOf(const std::function<void()>& call) {
    try {
        call();
    } catch (const OmbException& e) {
        return std::string(e.asString().view());
    }
    return "no error";
}
