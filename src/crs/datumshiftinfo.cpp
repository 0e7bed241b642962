#include <oecore/crs/datumshiftinfo.h>

OMB_DEFINE_ENGINE_CLASS(OmbDatumShiftInfo, OmbResourceObject, "DatumShiftInfo", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbDatumShiftInfo)

namespace {

using Info = OmbDatumShiftInfo;

template <class V>
void field(OmbDescriptionBuilder<Info>& d, const char* name, V Info::*member, V defaultValue = V()) {
    d.property<V>(
        name, [member](const Info& i) { return i.*member; }, [member](Info& i, const V& v) { i.*member = v; },
        defaultValue);
}

// One side of the area of use.
void side(OmbDescriptionBuilder<Info>& d, const char* name, double OmbRect::*member) {
    d.property<double>(
        name, [member](const Info& i) { return i.areaOfUse.*member; },
        [member](Info& i, double v) { i.areaOfUse.*member = v; }, OmbRect::invalid().*member);
}

}  // namespace

OMB_DESCRIBE_CLASS(OmbDatumShiftInfo) {
    field(d, "Authority", &Info::authority);
    field(d, "AuthorityCode", &Info::authorityCode);
    field(d, "HorizontalAccuracy", &Info::horizontalAccuracy);
    field(d, "VerticalAccuracy", &Info::verticalAccuracy);
    field(d, "Scope", &Info::scope);
    field(d, "Remarks", &Info::remarks);
    field(d, "OriginalAccuracy", &Info::originalAccuracy);
    field(d, "InformationSource", &Info::informationSource);
    field(d, "FileStatus", &Info::fileStatus);
    field(d, "AreaOfUseName", &Info::areaOfUseName);
    field(d, "AreaOfUseDescription", &Info::areaOfUseDescription);
    field(d, "AreaOfUseCode", &Info::areaOfUseCode);
    side(d, "AreaOfUseWest", &OmbRect::xmin);
    side(d, "AreaOfUseSouth", &OmbRect::ymin);
    side(d, "AreaOfUseEast", &OmbRect::xmax);
    side(d, "AreaOfUseNorth", &OmbRect::ymax);
    field(d, "DatumShiftChoice", &Info::datumShiftChoice, OmbDatumShiftChoice::Conservative);
}
