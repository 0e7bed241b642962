// OmbException and the OmbX... family: every error the library raises.
//
// An exception carries the file and line of its throw site and up to three
// arguments that fill "$1".."$3" in its class's message template. Every
// exception is logged at error level when it is constructed, so a failure
// leaves a trace even when a caller swallows it.
#pragma once

#include <oecore/core/string.h>

// Where users should report internal errors.
#define OECORE_SUPPORT_ADDRESS "the OECore maintainers"

class OmbException {
public:
    OmbException(const char* file, int line, const OmbString& a1 = OmbString(), const OmbString& a2 = OmbString(),
                 const OmbString& a3 = OmbString());
    virtual ~OmbException() = default;

    // The short name: the class name without "OmbX", e.g. "ReadOnly".
    virtual OmbString id() const = 0;
    virtual OmbString defaultMessage() const = 0;

    // The template with "$1", "$2" and "$3" filled in, in that order.
    OmbString asString() const;

    const char* file() const noexcept { return file_; }
    int line() const noexcept { return line_; }
    const OmbString& argument(int index) const;

protected:
    void logException() const;

private:
    // Replaces every occurrence of what, left to right, never rescanning
    // inserted text; an empty pattern changes nothing.
    static void findReplace(OmbString& text, const OmbString& what, const OmbString& with);

    const char* file_;
    int line_;
    OmbString a1_;
    OmbString a2_;
    OmbString a3_;
};

#define OMB_EXCEPTION_MEMBERS(ID)                                                                              \
public:                                                                                                        \
    OmbX##ID(const char* file, int line, const OmbString& a1 = OmbString(), const OmbString& a2 = OmbString(), \
             const OmbString& a3 = OmbString());                                                               \
    OmbString id() const override;                                                                             \
    OmbString defaultMessage() const override;
#define OMB_EXCEPTION(ID, TEMPLATE)        \
    class OmbX##ID : public OmbException { \
        OMB_EXCEPTION_MEMBERS(ID)          \
    };
// The code is rendered as text into "$3".
#define OMB_EXCEPTION_WITH_CODE(ID, TEMPLATE)                                                          \
    class OmbX##ID : public OmbException {                                                             \
        OMB_EXCEPTION_MEMBERS(ID)                                                                      \
        OmbX##ID(const char* file, int line, const OmbString& a1, const OmbString& a2, int errorCode); \
    };
#include <oecore/core/exceptionlist.h>
#undef OMB_EXCEPTION
#undef OMB_EXCEPTION_WITH_CODE
#undef OMB_EXCEPTION_MEMBERS

// The operating system's text for an error code (errno values on Linux).
OmbString getLastErrorAsString(int errorCode);

// Throws OmbX<ID> with the current file and line: OMB_THROW(ReadOnly, "Collection").
#define OMB_THROW(ID, ...) throw OmbX##ID(__FILE__, __LINE__, ##__VA_ARGS__)
