#include "errorlog.h"

namespace oecore::detail {

// Until the runtime's log is started nothing is written, so error lines are
// not built at all.
bool errorLogActive() { return false; }

void writeErrorLog(const OmbString&) {}

}  // namespace oecore::detail
