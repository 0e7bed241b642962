#include "codepage.h"

#include <iconv.h>
#include <langinfo.h>

#include <array>
#include <cerrno>

namespace oecore::detail {

std::string activeCodePageName() { return nl_langinfo(CODESET); }

std::string codePageName(int codePage) {
    switch (codePage) {
        case 65001: return "UTF-8";
        case 1200: return "UTF-16LE";
        case 1201: return "UTF-16BE";
        case 20127: return "ASCII";
        case 28591: return "ISO-8859-1";
        case 932: return "CP932";
        default:
            if (codePage > 28590 && codePage < 28606) return "ISO-8859-" + std::to_string(codePage - 28590);
            return "CP" + std::to_string(codePage);
    }
}

namespace {

class IconvHandle {
public:
    IconvHandle(const std::string& from, const std::string& to) : handle_(iconv_open(to.c_str(), from.c_str())) {}
    ~IconvHandle() {
        if (valid()) iconv_close(handle_);
    }
    IconvHandle(const IconvHandle&) = delete;
    IconvHandle& operator=(const IconvHandle&) = delete;
    bool valid() const { return handle_ != reinterpret_cast<iconv_t>(-1); }
    iconv_t get() const { return handle_; }

private:
    iconv_t handle_;
};

// Short texts are converted through a stack buffer; the output string then
// grows only once.
constexpr std::size_t stackBufferSize = 10000;

}  // namespace

bool convertCharset(std::string_view text, const std::string& from, const std::string& to, bool ignoreErrors,
                    std::string& out) {
    out.clear();
    IconvHandle cd(from, to);
    if (!cd.valid()) return false;
    std::array<char, stackBufferSize> buffer;
    char* in = const_cast<char*>(text.data());
    std::size_t inLeft = text.size();
    while (inLeft > 0) {
        char* outPtr = buffer.data();
        std::size_t outLeft = buffer.size();
        const std::size_t rc = iconv(cd.get(), &in, &inLeft, &outPtr, &outLeft);
        const int error = errno;
        out.append(buffer.data(), outPtr);
        if (rc != static_cast<std::size_t>(-1) || error == E2BIG) continue;
        // EILSEQ: malformed or unrepresentable; EINVAL: a truncated sequence.
        if (!ignoreErrors) return false;
        if (error == EINVAL) break;
        ++in;
        --inLeft;
    }
    // Writes the shift sequence that returns a stateful charset to its initial state.
    char* outPtr = buffer.data();
    std::size_t outLeft = buffer.size();
    iconv(cd.get(), nullptr, nullptr, &outPtr, &outLeft);
    out.append(buffer.data(), outPtr);
    return true;
}

}  // namespace oecore::detail
