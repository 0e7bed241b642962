// What the EPSG catalogue (PROJ's database) says of a system.
#include "projhandles.h"

#include <oecore/core/exception.h>
#include <oecore/crs/crs.h>

#include <cstdlib>
#include <cstring>
#include <string>

namespace {

using Context = OmbProjContext;
using Object = OmbProjObject;

// The system of an EPSG or CRS code, null when the catalogue lacks it; the
// authority and range errors name the look-up.
Object find(PJ_CONTEXT* context, const OmbString& authority, const OmbString& code, const char* where) {
    const OmbString kind = authority.toLower();
    const std::string digits(code);
    if (kind == OmbString::literal("crs")) {
        if (digits == "84" || digits == "83")
            return Object(proj_create_from_database(context, "OGC", "CRS84", PJ_CATEGORY_CRS, 0, nullptr));
        return Object(proj_create_from_database(context, "EPSG", "4267", PJ_CATEGORY_CRS, 0, nullptr));
    }
    if (kind != OmbString::literal("epsg")) OMB_THROW(UnsupportedAuthority, authority, OmbString(where));
    char* end = nullptr;
    const long number = std::strtol(digits.c_str(), &end, 10);
    if (end == digits.c_str() || *end || number < 1024 || number > 32767) OMB_THROW(EpsgCrsCodeOutOfRange, code);
    return Object(proj_create_from_database(context, "EPSG", digits.c_str(), PJ_CATEGORY_CRS, 0, nullptr));
}

// The axis's information, or false.
bool axisInfo(PJ_CONTEXT* context, const OmbString& authority, const OmbString& code, int axis, const char* where,
              const char** abbreviation, const char** direction, bool& projected) {
    if (axis < 0 || axis > 1) OMB_THROW(RangeError, "axis", OmbString(where), "0 or 1");
    const Object crs = find(context, authority, code, where);
    if (!crs) return false;
    projected = proj_get_type(crs.get()) == PJ_TYPE_PROJECTED_CRS;
    const Object cs(proj_crs_get_coordinate_system(context, crs.get()));
    return cs && axis < proj_cs_get_axis_count(context, cs.get()) &&
           proj_cs_get_axis_info(context, cs.get(), axis, nullptr, abbreviation, direction, nullptr, nullptr, nullptr,
                                 nullptr);
}

}  // namespace

OmbString OmbCrs::authoritativeName(const OmbString& authority, const OmbString& code) {
    const Context context = Omb_quietProjContext();
    const Object crs = find(context.get(), authority, code, "Crs.authoritativeName");
    if (!crs) OMB_THROW(EpsgCrsCodeNotFound, code);
    return OmbString(proj_get_name(crs.get()));
}

OmbCrsAxisDirection OmbCrs::authoritativeAxisDirection(const OmbString& authority, const OmbString& code, int axis) {
    const Context context = Omb_quietProjContext();
    const char* direction = nullptr;
    bool projected = false;
    if (!axisInfo(context.get(), authority, code, axis, "Crs.authoritativeAxisDirection", nullptr, &direction,
                  projected))
        OMB_THROW(AxisAbbreviationEpsgCrsCodeNotFound, code);
    const std::string d = direction ? direction : "";
    using D = OmbCrsAxisDirection;
    if (d == "north") return projected ? D::GridNorth : D::North;
    if (d == "south") return projected ? D::GridSouth : D::South;
    if (d == "east") return projected ? D::GridEast : D::East;
    if (d == "west") return projected ? D::GridWest : D::West;
    if (d == "up") return D::Up;
    if (d == "down") return D::Down;
    return D::UnknownDirection;
}

OmbString OmbCrs::authoritativeAxisAbbreviation(const OmbString& authority, const OmbString& code, int axis) {
    const Context context = Omb_quietProjContext();
    const char* abbreviation = nullptr;
    bool projected = false;
    if (!axisInfo(context.get(), authority, code, axis, "Crs.authoritativeAxisAbbreviation", &abbreviation, nullptr,
                  projected))
        OMB_THROW(AxisAbbreviationEpsgCrsCodeNotFound, code);
    return OmbString(abbreviation ? abbreviation : "");
}

OmbString OmbCrs::authoritativeAreaOfUseDescription(const OmbString& authority, const OmbString& code) {
    const Context context = Omb_quietProjContext();
    const Object crs = find(context.get(), authority, code, "Crs.authoritativeAreaOfUseDescription");
    const char* description = nullptr;
    if (!crs || !proj_get_area_of_use(context.get(), crs.get(), nullptr, nullptr, nullptr, nullptr, &description))
        OMB_THROW(AreaBoundsEpsgCrsCodeNotFound, code);
    return OmbString(description ? description : "");
}

OmbRect OmbCrs::authoritativeAreaOfUseBounds(const OmbString& authority, const OmbString& code) {
    const Context context = Omb_quietProjContext();
    const Object crs = find(context.get(), authority, code, "Crs.authoritativeAreaOfUseBounds");
    double west, south, east, north;
    if (!crs || !proj_get_area_of_use(context.get(), crs.get(), &west, &south, &east, &north, nullptr) || west == -1000)
        OMB_THROW(AreaBoundsEpsgCrsCodeNotFound, code);
    return {west, south, east, north};
}

OmbString OmbCrs::epsgVersion() {
    const Context context = Omb_quietProjContext();
    const char* version = proj_context_get_database_metadata(context.get(), "EPSG.VERSION");
    return OmbString(version ? version : "");
}
