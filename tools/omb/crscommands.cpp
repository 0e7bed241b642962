#include "crscommands.h"

#include <oecore/oecore.h>

#include <cstdio>
#include <fstream>
#include <iostream>
#include <sstream>

namespace {

// A system by its description on the command line (see omb --help).
OmbRef<OmbCrs> findCrs(const std::string& text, bool lenient) {
    const OmbDatumShiftChoice choice = lenient ? OmbDatumShiftChoice::Lenient : OmbDatumShiftChoice::Conservative;
    if (!text.empty() && text[0] == '@') {
        std::ifstream file(text.substr(1));
        if (!file) OMB_THROW(IOException, OmbString("Cannot read " + text.substr(1)));
        std::stringstream wkt;
        wkt << file.rdbuf();
        return OmbCrs::fromWellKnownText(OmbString(wkt.str()), OmbWellKnownTextFlavor::OgrWellKnownText, choice);
    }
    if (OmbRef<OmbCrs> predefined = omb_dynamic_cast<OmbCrs>(OmbRuntime::getPredefinedObject(OmbString(text))))
        return predefined;
    return OmbCrs::fromUrn(OmbString(text), choice);
}

bool readPoint(const std::string& line, OmbPoint& p) {
    std::istringstream fields(line);
    fields.imbue(std::locale::classic());
    p = OmbPoint();
    if (!(fields >> p.x >> p.y)) return false;
    fields >> p.z;
    return true;
}

void printPoint(const OmbPoint& p, bool degrees) {
    char line[128];
    std::snprintf(line, sizeof line, degrees ? "%.9f %.9f %.4f\n" : "%.4f %.4f %.4f\n", p.x, p.y, p.z);
    std::cout << line;
}

bool isLongLat(const OmbCrs& crs) { return dynamic_cast<const OmbLoLa*>(crs.projection().get()) != nullptr; }

}  // namespace

int transformPoints(const Options& options) {
    if (options.from.empty() || options.to.empty() ||
        (options.files.size() != 0 && options.files.size() != 2 && options.files.size() != 3)) {
        std::cerr << "omb: transform takes --from CRS --to CRS and X Y [Z] or lines on standard input; see "
                     "'omb --help'\n";
        return 2;
    }
    const OmbRef<OmbCrs> from = findCrs(options.from, options.lenient);
    const OmbRef<OmbCrs> to = findCrs(options.to, options.lenient);
    const bool degrees = isLongLat(*to);
    if (!options.files.empty()) {
        std::string line;
        for (const std::string& word : options.files) line += word + " ";
        OmbPoint p;
        if (!readPoint(line, p)) {
            std::cerr << "omb: '" << line << "' is not X Y [Z]\n";
            return 2;
        }
        from->projectTo(*to, p);
        printPoint(p, degrees);
        return 0;
    }
    int status = 0;
    for (std::string line; std::getline(std::cin, line);) {
        OmbPoint p;
        if (line.find_first_not_of(" \t\r") == std::string::npos) continue;
        if (!readPoint(line, p)) {
            std::cerr << "omb: '" << line << "' is not X Y [Z]\n";
            status = 1;
            continue;
        }
        try {
            from->projectTo(*to, p);
            printPoint(p, degrees);
        } catch (const OmbException& e) {
            std::cout << "* * *\n";
            std::cerr << "omb: " << e.asString() << "\n";
            status = 1;
        }
    }
    return status;
}

int describeCrs(const Options& options) {
    if (options.files.size() != 1) {
        std::cerr << "omb: crs takes one CRS; see 'omb --help'\n";
        return 2;
    }
    const OmbRef<OmbCrs> crs = findCrs(options.files[0], options.lenient);
    std::cout.precision(15);
    const OmbProjection& projection = *crs->projection();
    const OmbGeodeticDatum& datum = *crs->geodeticDatum();
    std::cout << "name: " << crs->name() << "\n";
    if (!crs->authority().empty())
        std::cout << "code: " << crs->authority() << ":" << crs->authorityCode()
                  << (crs->codeIsLabelOnly() ? " (label)" : "") << "\n";
    std::cout << "projection: " << projection.name() << " (" << projection.myRuntimeClassName() << ")\n"
              << "  central longitude " << projection.centralLongitude() << ", central latitude "
              << projection.centralLatitude() << ", false easting " << projection.falseEasting() << ", false northing "
              << projection.falseNorthing() << ", scale " << projection.scaleFactor() << ", unit "
              << projection.metersPerProjUnit() << " m\n";
    std::cout << "datum: " << datum.name() << ", ellipsoid a = " << datum.ellipsoid()->equatorialRadius()
              << " m, 1/f = " << datum.ellipsoid()->inverseFlattening() << ", prime meridian "
              << datum.primeMeridianDegrees() << "\n";
    if (const OmbRef<OmbDatumShift>& shift = datum.datumShift()) {
        std::cout << "  shift to WGS 84: " << shift->myRuntimeClassName();
        if (!shift->authorityCode().empty()) std::cout << " " << shift->authority() << ":" << shift->authorityCode();
        if (shift->info() && !shift->info()->name().empty()) std::cout << " (" << shift->info()->name() << ")";
        std::cout << "\n";
    }
    const OmbRect bounds = crs->bounds();
    std::cout << "bounds: " << bounds.xmin << " " << bounds.ymin << " " << bounds.xmax << " " << bounds.ymax << "\n";
    try {
        std::cout << crs->toWellKnownText(true) << "\n";
    } catch (const OmbXUnsupportedProjection&) {
        std::cout << "(no well-known text: it has no method for this projection)\n";
    }
    return 0;
}
