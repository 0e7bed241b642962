// OmbPrimeMeridian: the meridian from which a datum counts longitudes.
#pragma once

#include <oecore/config/classdescription.h>
#include <oecore/core/resourceobject.h>

// Every predefined prime meridian: name, accessor, degrees east of Greenwich.
// clang-format off
#define OMB_PREDEFINED_PRIME_MERIDIANS(X) \
    X(Athens, athens, 23.716337499999998) \
    X(Bern, bern, 7.439583333333333) \
    X(Bogota, bogota, -74.08091666666667) \
    X(Brussels, brussels, 4.3679749999999995) \
    X(FerroAlbrecht, ferroAlbrecht, -17.662783333333334) \
    X(FerroRounded, ferroRounded, -17.666666666666668) \
    X(Greenwich, greenwich, 0.0) \
    X(Jakarta, jakarta, 106.80771944444444) \
    X(Lisbon, lisbon, -9.131906111111112) \
    X(Madrid, madrid, -3.687938888888889) \
    X(Oslo, oslo, 10.722916666666666) \
    X(Paris, paris, 2.33722917) \
    X(Rome, rome, 12.452333333333332) \
    X(Stockholm, stockholm, 18.05827777777778)
// clang-format on

class OmbPrimeMeridian : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    explicit OmbPrimeMeridian(double longitudeFromGreenwich = 0) : longitude_(longitudeFromGreenwich) {}
    OmbPrimeMeridian* clone() const override { return new OmbPrimeMeridian(*this); }

    double longitudeFromGreenwich() const noexcept { return longitude_; }
    void longitudeFromGreenwich(double degrees) { longitude_ = degrees; }

    // The predefined meridians, while the runtime is initialised (registered
    // as "PrimeMeridians." + name; Oslo as "PrimeMeridians.Olso").
#define OMB_PRIME_MERIDIAN_ACCESSOR(NAME, ACCESSOR, DEGREES) static const OmbRef<OmbPrimeMeridian>& ACCESSOR();
    OMB_PREDEFINED_PRIME_MERIDIANS(OMB_PRIME_MERIDIAN_ACCESSOR)
#undef OMB_PRIME_MERIDIAN_ACCESSOR

    static void createPredefined();
    static void destroyPredefined();

private:
    double longitude_;
};
