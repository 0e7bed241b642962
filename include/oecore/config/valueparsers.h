// Text to number and bool, as configuration files write them: numbers in the
// classic C locale, leading white space skipped and nothing allowed after the
// number; bools exactly "true" or "false".
#pragma once

#include <oecore/core/string.h>

bool parseInt(const OmbString& text, long long& out);
bool parseFloat(const OmbString& text, float& out);
bool parseDouble(const OmbString& text, double& out);
bool parseBool(const OmbString& text, bool& out);
