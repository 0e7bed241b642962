// Latitudes and longitudes as degrees, minutes and seconds of text.
#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>
#include <oecore/crs/crs.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <locale>
#include <sstream>
#include <string>

namespace {

enum class Axis { Latitude, Longitude };

// Rounds |value| at the last component's precision and splits it, so that
// rounding carries into the larger units instead of showing 60.
OmbRef<OmbVec<OmbString>> format(double value, int decimals, bool withSeconds, Axis axis) {
    decimals = std::clamp(decimals, 0, 12);
    const double unitsPerDegree = (withSeconds ? 3600.0 : 60.0) * std::pow(10.0, decimals);
    const double units = std::round(std::fabs(value) * unitsPerDegree);
    // Whole units of the last component, and its decimals as an integer.
    const double steps = std::pow(10.0, decimals);
    const double wholeLast = std::floor(units / steps);
    const double fraction = units - wholeLast * steps;
    const long long degrees = (long long)(wholeLast / (withSeconds ? 3600 : 60));
    const long long rest = (long long)wholeLast - degrees * (withSeconds ? 3600 : 60);
    OmbRef<OmbVec<OmbString>> parts(new OmbVec<OmbString>);
    char text[64];
    std::snprintf(text, sizeof text, "%lld", degrees);
    parts->add(OmbString(text));
    const auto last = [&](long long whole) {
        if (decimals == 0)
            std::snprintf(text, sizeof text, "%02lld", whole);
        else
            std::snprintf(text, sizeof text, "%02lld.%0*lld", whole, decimals, (long long)fraction);
        parts->add(OmbString(text));
    };
    if (withSeconds) {
        std::snprintf(text, sizeof text, "%02lld", rest / 60);
        parts->add(OmbString(text));
        last(rest % 60);
    } else {
        last(rest);
    }
    const bool negative = value < 0 && units > 0;
    parts->add(OmbString(axis == Axis::Latitude ? (negative ? "S" : "N") : (negative ? "W" : "E")));
    return parts;
}

const char* contextOf(Axis axis) { return axis == Axis::Latitude ? "Crs.ParseLatitude()" : "Crs.ParseLongitude()"; }

// One component of text: checked as described on OmbCrs::parseLatitude.
double component(const OmbString& raw, const char* name, int maxDigits, bool last, bool signAllowed, bool hasHemisphere,
                 Axis axis, bool& negative) {
    const OmbString context = OmbString(contextOf(axis));
    std::string text(raw);
    const std::size_t begin = text.find_first_not_of(" \t"), end = text.find_last_not_of(" \t");
    text = begin == std::string::npos ? std::string() : text.substr(begin, end - begin + 1);
    const OmbString shown(text);
    const OmbString digits = OmbString(std::to_string(maxDigits));
    if (text.empty()) OMB_THROW(NoDigitsInDegMinSecComponent, OmbString(name), digits, context);
    if (text[0] == '-') {
        if (hasHemisphere) OMB_THROW(MinusInDegMinSecComponent, shown, OmbString(name), context);
        if (!signAllowed) OMB_THROW(NonDigitInDegMinSecComponent, shown, OmbString(name), context);
        negative = true;
        text.erase(0, 1);
    }
    const std::size_t dots = std::count(text.begin(), text.end(), '.');
    const std::size_t commas = std::count(text.begin(), text.end(), ',');
    if (dots && commas) OMB_THROW(BothCommaAndDotInDegMinSecComponent, shown, OmbString(name), context);
    if (dots + commas > 1) OMB_THROW(TooManySeparatorsInDegMinSecComponent, shown, OmbString(name), context);
    const std::size_t separator = text.find_first_of(".,");
    if (separator != std::string::npos && !last) {
        const OmbString kind(dots ? "point" : "comma");
        if (std::string(name) == "degrees") OMB_THROW(DecimalSeparatorInDegreesComponent, shown, kind, context);
        OMB_THROW(DecimalSeparatorInMinutesComponent, shown, kind, context);
    }
    const std::string whole = text.substr(0, separator);
    const std::string fraction = separator == std::string::npos ? std::string() : text.substr(separator + 1);
    if (whole.empty()) {
        if (separator != std::string::npos) OMB_THROW(NoIntPartInDegMinSecComponent, shown, OmbString(name), context);
        OMB_THROW(NoDigitsInDegMinSecComponent, OmbString(name), digits, context);
    }
    for (const char c : whole)
        if (c < '0' || c > '9') OMB_THROW(NonDigitInDegMinSecComponent, shown, OmbString(name), context);
    for (const char c : fraction)
        if (c < '0' || c > '9') OMB_THROW(NonDigitInDegMinSecComponentFrac, shown, OmbString(name), context);
    if (int(whole.size()) > maxDigits) {
        if (maxDigits == 3) OMB_THROW(TooManyDigitsInDegMinSecComponent1to3, shown, OmbString(name), context);
        OMB_THROW(TooManyDigitsInDegMinSecComponent1to2, shown, OmbString(name), context);
    }
    std::istringstream number(whole + (fraction.empty() ? "" : "." + fraction));
    number.imbue(std::locale::classic());
    double value = 0;
    number >> value;
    return value;
}

double parse(const OmbString& d, const OmbString* m, const OmbString* s, const OmbString& hemisphere, Axis axis) {
    const OmbString context = OmbString(contextOf(axis));
    std::string h(hemisphere);
    const std::size_t b = h.find_first_not_of(" \t"), e = h.find_last_not_of(" \t");
    h = b == std::string::npos ? std::string() : h.substr(b, e - b + 1);
    const bool hasHemisphere = !h.empty();
    bool south = false;
    if (hasHemisphere) {
        const char c = char(std::toupper(static_cast<unsigned char>(h[0])));
        const char* letters = axis == Axis::Latitude ? "NS" : "EW";
        if (h.size() != 1 || (c != letters[0] && c != letters[1]))
            OMB_THROW(RangeError, "hemisphere \"" + hemisphere + "\"", context,
                      axis == Axis::Latitude ? "N or S" : "E or W");
        south = c == letters[1];
    }
    bool negative = false;
    const double degrees = component(d, "degrees", 3, !m, true, hasHemisphere, axis, negative);
    const double minutes = m ? component(*m, "minutes", 2, !s, false, hasHemisphere, axis, negative) : 0;
    const double seconds = s ? component(*s, "seconds", 2, true, false, hasHemisphere, axis, negative) : 0;
    const double limit = axis == Axis::Latitude ? 90 : 999;
    if (degrees > limit)
        OMB_THROW(RangeError, "degrees = " + d, context, axis == Axis::Latitude ? "0 to 90" : "0 to 999");
    if (minutes >= 60) OMB_THROW(RangeError, "minutes = " + *m, context, "0 to 59.999...");
    if (seconds >= 60) OMB_THROW(RangeError, "seconds = " + *s, context, "0 to 59.999...");
    const double value = degrees + minutes / 60 + seconds / 3600;
    if (value > limit) OMB_THROW(RangeError, "value", context, axis == Axis::Latitude ? "0 to 90" : "0 to 999");
    return (south || negative) ? -value : value;
}

}  // namespace

OmbRef<OmbVec<OmbString>> OmbCrs::formatLatitudeAsDegreesMinutes(double value, int decimals) {
    return format(value, decimals, false, Axis::Latitude);
}
OmbRef<OmbVec<OmbString>> OmbCrs::formatLatitudeAsDegreesMinutesSeconds(double value, int decimals) {
    return format(value, decimals, true, Axis::Latitude);
}
OmbRef<OmbVec<OmbString>> OmbCrs::formatLongitudeAsDegreesMinutes(double value, int decimals) {
    return format(value, decimals, false, Axis::Longitude);
}
OmbRef<OmbVec<OmbString>> OmbCrs::formatLongitudeAsDegreesMinutesSeconds(double value, int decimals) {
    return format(value, decimals, true, Axis::Longitude);
}

double OmbCrs::parseLatitude(const OmbString& degrees, const OmbString& minutes, const OmbString& hemisphere) {
    return parse(degrees, &minutes, nullptr, hemisphere, Axis::Latitude);
}
double OmbCrs::parseLatitude(const OmbString& degrees, const OmbString& minutes, const OmbString& seconds,
                             const OmbString& hemisphere) {
    return parse(degrees, &minutes, &seconds, hemisphere, Axis::Latitude);
}
double OmbCrs::parseLongitude(const OmbString& degrees, const OmbString& minutes, const OmbString& hemisphere) {
    return parse(degrees, &minutes, nullptr, hemisphere, Axis::Longitude);
}
double OmbCrs::parseLongitude(const OmbString& degrees, const OmbString& minutes, const OmbString& seconds,
                              const OmbString& hemisphere) {
    return parse(degrees, &minutes, &seconds, hemisphere, Axis::Longitude);
}
