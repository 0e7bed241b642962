#pragma once

namespace oecore::detail {

// The mantissa width the floating-point unit computes with: 24, 53 or 64
// from the x87 precision control, 53 where doubles never go through it.
int fpuPrecisionBits();

}  // namespace oecore::detail
