#include "fpuprecision.h"

#if defined(__i386__) || defined(__x86_64__)
#include <fpu_control.h>
#endif

namespace oecore::detail {

int fpuPrecisionBits() {
#if defined(__i386__) || defined(__x86_64__)
    fpu_control_t word;
    _FPU_GETCW(word);
    switch (word & 0x300) {
        case _FPU_SINGLE: return 24;
        case _FPU_DOUBLE: return 53;
        default: return 64;
    }
#else
    return 53;
#endif
}

}  // namespace oecore::detail
