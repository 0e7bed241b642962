#include "projectiondescriptions.h"

#include <oecore/core/exception.h>
#include <oecore/crs/projections/identity.h>

#include <cmath>

OMB_DEFINE_ENGINE_CLASS(OmbLoLa, OmbProjection, "LongLatProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbLoLa)
OMB_DEFINE_ENGINE_CLASS(OmbRectangularProjection, OmbProjection, "NonGeoreferencedProjection", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbRectangularProjection)

OMB_DESCRIBE_CLASS(OmbLoLa) {}

OMB_DESCRIBE_CLASS(OmbRectangularProjection) {
    d.object<OmbLengthUnit>(
        "LengthUnit", [](const OmbRectangularProjection& p) { return p.configuredLengthUnit(); },
        [](OmbRectangularProjection& p, const OmbRef<OmbLengthUnit>& v) { p.lengthUnit(v); });
}

OmbLoLa::OmbLoLa() {
    OMB_THROW(InvalidOperation, "Can not create new LongLatProjection object, use predefined instance");
}

OmbLoLa::OmbLoLa(Predefined) {}

void OmbLoLa::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    mx = my = cached->a * 0.017453292519943295;
}

bool OmbRectangularProjection::project(const OmbRect& in, const OmbProjCachedNumbers*, OmbRect& out) const {
    out = in;
    return true;
}

bool OmbRectangularProjection::unproject(const OmbRect& in, const OmbProjCachedNumbers*, OmbRect& out) const {
    out = in;
    return true;
}

bool OmbRectangularProjection::metersXY(const OmbPoint&, const OmbProjCachedNumbers* cached, double& mx,
                                        double& my) const {
    nominalMetersXY(cached, mx, my);
    return true;
}

void OmbRectangularProjection::nominalMetersXY(const OmbProjCachedNumbers* cached, double& mx, double& my) const {
    mx = my = cached->metersPerUnit;
}

bool OmbRectangularProjection::isValid(const OmbPoint& p, const OmbProjCachedNumbers*) const {
    return std::isfinite(p.x) && std::isfinite(p.y);
}
