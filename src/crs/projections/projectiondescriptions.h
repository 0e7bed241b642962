// The configuration properties shared by many projection classes, each
// described once; a class lists the groups it takes.
#pragma once

#include <oecore/crs/projection.h>

template <class T>
void Omb_describeCentralLongitude(OmbDescriptionBuilder<T>& d) {
    d.template property<double>(
        "CentralLongitude", [](const T& p) { return p.centralLongitude(); },
        [](T& p, double v) { p.centralLongitude(v); });
}

template <class T>
void Omb_describeCentre(OmbDescriptionBuilder<T>& d) {
    d.template property<double>(
        "CentralLatitude", [](const T& p) { return p.centralLatitude(); },
        [](T& p, double v) { p.centralLatitude(v); });
    Omb_describeCentralLongitude(d);
}

template <class T>
void Omb_describeFalseOrigin(OmbDescriptionBuilder<T>& d) {
    d.template property<double>(
        "FalseEasting", [](const T& p) { return p.falseEasting(); }, [](T& p, double v) { p.falseEasting(v); });
    d.template property<double>(
        "FalseNorthing", [](const T& p) { return p.falseNorthing(); }, [](T& p, double v) { p.falseNorthing(v); });
    d.template object<OmbLengthUnit>(
        "LengthUnit", [](const T& p) { return p.configuredLengthUnit(); },
        [](T& p, const OmbRef<OmbLengthUnit>& v) { p.lengthUnit(v); });
}

template <class T>
void Omb_describeScaleFactor(OmbDescriptionBuilder<T>& d) {
    d.template property<double>(
        "ScaleFactor", [](const T& p) { return p.scaleFactor(); }, [](T& p, double v) { p.scaleFactor(v); }, 1.0);
}

template <class T>
void Omb_describeEarthShape(OmbDescriptionBuilder<T>& d, OmbEarthShape defaultShape) {
    d.template property<OmbEarthShape>(
        "Shape", [](const T& p) { return p.shape(); }, [](T& p, OmbEarthShape v) { p.shape(v); }, defaultShape);
    d.template property<double>(
        "SphereRadius", [](const T& p) { return p.sphereRadius(); }, [](T& p, double v) { p.sphereRadius(v); });
    d.template property<OmbString>(
        "SphereRadiusSource", [](const T& p) { return p.sphereRadiusSource(); },
        [](T& p, const OmbString& v) { p.sphereRadiusSource(v); });
}
