// The path from exceptions to the process log. The log itself lives with the
// runtime; exceptions reach it only through these two calls.
#pragma once

#include <oecore/core/string.h>

namespace oecore::detail {

bool errorLogActive();
void writeErrorLog(const OmbString& message);

}  // namespace oecore::detail
