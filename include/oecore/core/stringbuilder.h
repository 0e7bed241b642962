// OmbStringBuilder: assembles text in a buffer laid out like an OmbString
// block, so that str() hands the buffer over without copying.
#pragma once

#include <oecore/core/string.h>

#include <cstdint>

class OmbStringBuilder;

// A manipulator appends formatted text to a builder.
class OmbStringManipulator {
public:
    virtual ~OmbStringManipulator() = default;
    virtual void appendTo(OmbStringBuilder& builder) const = 0;
};

class OmbStringBuilder {
public:
    OmbStringBuilder() = default;
    OmbStringBuilder(const OmbStringBuilder&) = delete;
    OmbStringBuilder& operator=(const OmbStringBuilder&) = delete;
    ~OmbStringBuilder();

    OmbStringBuilder& append(const char* bytes, std::size_t count);

    OmbStringBuilder& operator<<(char c) { return append(&c, 1); }
    OmbStringBuilder& operator<<(wchar_t c);
    OmbStringBuilder& operator<<(const char* utf8);
    OmbStringBuilder& operator<<(const wchar_t* text);
    OmbStringBuilder& operator<<(const OmbString& s) { return append(s.dataUtf8(), s.size()); }
    OmbStringBuilder& operator<<(std::string_view s) { return append(s.data(), s.size()); }
    OmbStringBuilder& operator<<(int value);
    OmbStringBuilder& operator<<(unsigned int value);
    OmbStringBuilder& operator<<(long value);
    OmbStringBuilder& operator<<(unsigned long value);
    OmbStringBuilder& operator<<(long long value);
    OmbStringBuilder& operator<<(unsigned long long value);
    OmbStringBuilder& operator<<(float value);
    OmbStringBuilder& operator<<(double value);
    OmbStringBuilder& operator<<(const OmbStringManipulator& m);

    std::size_t size() const noexcept { return used_; }
    std::size_t capacity() const noexcept { return capacity_; }

    // Hands the text over as a string and leaves the builder empty.
    OmbString str();

    // Makes sure n more bytes fit while one byte stays free for the final zero.
    void makeRoom(std::size_t n);

private:
    char* buffer_ = nullptr;  // an OmbString block: length, count, bytes
    std::size_t used_ = 0;
    std::size_t capacity_ = 0;  // text bytes including the terminating zero
};

namespace OmbFormat {

// Decimal integer, optionally padded to width with spaces or zeros.
class dec : public OmbStringManipulator {
public:
    explicit dec(long long value, int width = 0, bool zeroPad = false)
        : value_(value), width_(width), zeroPad_(zeroPad) {}
    void appendTo(OmbStringBuilder& builder) const override;

private:
    long long value_;
    int width_;
    bool zeroPad_;
};

// Lower-case hexadecimal, optionally padded to width.
class hex : public OmbStringManipulator {
public:
    explicit hex(unsigned long long value, int width = 0, bool zeroPad = false)
        : value_(value), width_(width), zeroPad_(zeroPad) {}
    void appendTo(OmbStringBuilder& builder) const override;

private:
    unsigned long long value_;
    int width_;
    bool zeroPad_;
};

// Fixed-point notation with a number of decimals, optionally padded.
class fixed : public OmbStringManipulator {
public:
    explicit fixed(double value, int decimals, int width = 0, bool zeroPad = false)
        : value_(value), decimals_(decimals), width_(width), zeroPad_(zeroPad) {}
    void appendTo(OmbStringBuilder& builder) const override;

private:
    double value_;
    int decimals_;
    int width_;
    bool zeroPad_;
};

class scientific : public OmbStringManipulator {
public:
    scientific(double value, int decimals) : value_(value), decimals_(decimals) {}
    void appendTo(OmbStringBuilder& builder) const override;

private:
    double value_;
    int decimals_;
};

// Round-trip precision ("%.17g") with a "." separator and a short exponent.
class real : public OmbStringManipulator {
public:
    explicit real(double value) : value_(value) {}
    void appendTo(OmbStringBuilder& builder) const override;

private:
    double value_;
};

}  // namespace OmbFormat
