#include <oecore/core/exception.h>
#include <oecore/core/log.h>
#include <oecore/core/stringbuilder.h>

#include <cstring>
#include <string>

OmbException::OmbException(const char* file, int line, const OmbString& a1, const OmbString& a2, const OmbString& a3)
    : file_(file ? file : ""), line_(line), a1_(a1), a2_(a2), a3_(a3) {}

const OmbString& OmbException::argument(int index) const {
    static const OmbString none;
    switch (index) {
        case 1: return a1_;
        case 2: return a2_;
        case 3: return a3_;
        default: return none;
    }
}

OmbString OmbException::asString() const {
    OmbString text = defaultMessage();
    findReplace(text, OmbString::literal("$1"), a1_);
    findReplace(text, OmbString::literal("$2"), a2_);
    findReplace(text, OmbString::literal("$3"), a3_);
    return text;
}

void OmbException::findReplace(OmbString& text, const OmbString& what, const OmbString& with) {
    if (what.empty()) return;
    text = text.replace(what, with, true);
}

void OmbException::logException() const {
    if (!OmbLog::isActive(OmbLogError)) return;
    OmbLog::error(Omb_formatMessage("%1%, line %2%: %3%, %4%",
                                    {OmbString(file_), OmbString(std::to_string(line_)), asString(), id()}));
}

OmbString getLastErrorAsString(int errorCode) {
    char buffer[256];
    // The GNU strerror_r may return a static string instead of filling buffer.
    const char* text = strerror_r(errorCode, buffer, sizeof buffer);
    OmbStringBuilder out;
    out << errorCode << " (" << text << ")";
    return out.str();
}

#define OMB_EXCEPTION(ID, TEMPLATE)                                                                               \
    OmbX##ID::OmbX##ID(const char* file, int line, const OmbString& a1, const OmbString& a2, const OmbString& a3) \
        : OmbException(file, line, a1, a2, a3) {                                                                  \
        logException();                                                                                           \
    }                                                                                                             \
    OmbString OmbX##ID::id() const { return OmbString::literal(#ID); }                                            \
    OmbString OmbX##ID::defaultMessage() const { return OmbString::literal(TEMPLATE); }
#define OMB_EXCEPTION_WITH_CODE(ID, TEMPLATE)                                                               \
    OMB_EXCEPTION(ID, TEMPLATE)                                                                             \
    OmbX##ID::OmbX##ID(const char* file, int line, const OmbString& a1, const OmbString& a2, int errorCode) \
        : OmbException(file, line, a1, a2, getLastErrorAsString(errorCode)) {                               \
        logException();                                                                                     \
    }
#include <oecore/core/exceptionlist.h>
#undef OMB_EXCEPTION
#undef OMB_EXCEPTION_WITH_CODE
