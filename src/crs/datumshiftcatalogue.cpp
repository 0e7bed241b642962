// Datum shifts built from the EPSG catalogue in PROJ's database.
#include "crscatalogue.h"
#include "projhandles.h"

#include <oecore/core/exception.h>
#include <oecore/crs/datumshift.h>

#include <cstring>
#include <string>

namespace {

constexpr double arcSecondsPerRadian = 206264.80624709636;

// EPSG method codes of the Helmert family, each in its geocentric, 2D and
// 3D geographic domain.
bool isTranslation(int method) { return method == 1031 || method == 9603 || method == 1035; }
bool isPositionVector(int method) { return method == 1033 || method == 9606 || method == 1037; }
bool isCoordinateFrame(int method) { return method == 1032 || method == 9607 || method == 1038; }

using Context = OmbProjContext;
using Object = OmbProjObject;

[[noreturn]] void unsupported(const OmbDatumShiftInfo& info, const std::string& why) {
    OMB_THROW(UnsupportedDatumShiftCode, info.authority + ":" + info.authorityCode + " (" + OmbString(why) + ")");
}

// Whether a CRS's datum is WGS 84 (EPSG 6326, or an ensemble holding it).
bool onWgs84(PJ_CONTEXT* context, PJ* crs) {
    const Object datum(proj_crs_get_datum_forced(context, crs));
    const char* code = datum ? proj_get_id_code(datum.get(), 0) : nullptr;
    return code && std::strcmp(code, "6326") == 0;
}

}  // namespace

OmbRef<OmbDatumShift> OmbDatumShift::fromInfo(const OmbRef<OmbDatumShiftInfo>& info) {
    if (!info) OMB_THROW(NullValue, "info", "DatumShift.fromInfo");
    if (info->authority.toLower() != OmbString::literal("epsg")) unsupported(*info, "not an EPSG code");
    const Context context = Omb_quietProjContext();
    const std::string code(info->authorityCode);
    const Object operation(
        proj_create_from_database(context.get(), "EPSG", code.c_str(), PJ_CATEGORY_COORDINATE_OPERATION, 0, nullptr));
    if (!operation) unsupported(*info, "not in the catalogue");
    const char* methodCode = nullptr;
    proj_coordoperation_get_method_info(context.get(), operation.get(), nullptr, nullptr, &methodCode);
    const int method = methodCode ? std::atoi(methodCode) : 0;
    if (!isTranslation(method) && !isPositionVector(method) && !isCoordinateFrame(method))
        unsupported(*info, "not a Helmert transformation");

    OmbHelmertDatumShift::Parameters p;
    p.convention = isCoordinateFrame(method) ? OmbRotationSignConvention::CoordinateFrameRotation
                                             : OmbRotationSignConvention::PositionVectorTransform;
    const Object source(proj_get_source_crs(context.get(), operation.get()));
    const Object target(proj_get_target_crs(context.get(), operation.get()));
    if (target && onWgs84(context.get(), target.get()))
        p.direction = OmbDatumShiftDirection::ToKnownDatum;
    else if (source && onWgs84(context.get(), source.get()))
        p.direction = OmbDatumShiftDirection::FromKnownDatum;
    else
        unsupported(*info, "leads to another datum than WGS 84");

    const int count = proj_coordoperation_get_param_count(context.get(), operation.get());
    for (int i = 0; i < count; ++i) {
        const char* parameterCode = nullptr;
        double value = 0, toUnit = 1;
        proj_coordoperation_get_param(context.get(), operation.get(), i, nullptr, nullptr, &parameterCode, &value,
                                      nullptr, &toUnit, nullptr, nullptr, nullptr, nullptr);
        // Metres, radians or the plain scale, by the unit's factor.
        const double si = value * toUnit;
        switch (parameterCode ? std::atoi(parameterCode) : 0) {
            case 8605: p.dx = si; break;
            case 8606: p.dy = si; break;
            case 8607: p.dz = si; break;
            case 8608: p.rx = si * arcSecondsPerRadian; break;
            case 8609: p.ry = si * arcSecondsPerRadian; break;
            case 8610: p.rz = si * arcSecondsPerRadian; break;
            case 8611: p.scaleDifference = si * 1e6; break;
            default: break;
        }
    }
    OmbRef<OmbHelmertDatumShift> shift(new OmbHelmertDatumShift);
    shift->parameters(p);
    shift->name(info->name().empty() ? OmbString(proj_get_name(operation.get())) : info->name());
    shift->authority(OmbString::literal("epsg"));
    shift->authorityCode(info->authorityCode);
    shift->info(info);
    return OmbRef<OmbDatumShift>(shift);
}

OmbRef<OmbDatumShift> Omb_catalogueShiftToWgs84(int geographicCode) {
    const Context context = Omb_quietProjContext();
    const std::string code = std::to_string(geographicCode);
    const Object source(proj_create_from_database(context.get(), "EPSG", code.c_str(), PJ_CATEGORY_CRS, 0, nullptr));
    const Object target(proj_create_from_database(context.get(), "EPSG", "4326", PJ_CATEGORY_CRS, 0, nullptr));
    if (!source || !target) return {};
    PJ_OPERATION_FACTORY_CONTEXT* factory = proj_create_operation_factory_context(context.get(), nullptr);
    proj_operation_factory_context_set_spatial_criterion(context.get(), factory,
                                                         PROJ_SPATIAL_CRITERION_PARTIAL_INTERSECTION);
    PJ_OBJ_LIST* operations = proj_create_operations(context.get(), source.get(), target.get(), factory);
    OmbRef<OmbDatumShift> found;
    // PROJ lists the operations best first; the first single Helmert-family
    // transformation wins.
    const int count = operations ? proj_list_get_count(operations) : 0;
    for (int i = 0; i < count && !found; ++i) {
        const Object operation(proj_list_get(context.get(), operations, i));
        const char* authority = operation ? proj_get_id_auth_name(operation.get(), 0) : nullptr;
        const char* id = operation ? proj_get_id_code(operation.get(), 0) : nullptr;
        if (!authority || !id || std::strcmp(authority, "EPSG") != 0) continue;
        OmbRef<OmbDatumShiftInfo> info(new OmbDatumShiftInfo);
        info->authority = OmbString::literal("epsg");
        info->authorityCode = OmbString(id);
        info->name(OmbString(proj_get_name(operation.get())));
        try {
            found = OmbDatumShift::fromInfo(info);
        } catch (const OmbException&) {
        }
    }
    if (operations) proj_list_destroy(operations);
    proj_operation_factory_context_destroy(factory);
    return found;
}
