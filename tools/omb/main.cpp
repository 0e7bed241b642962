// omb: the OECore command-line tool.
#include "crscommands.h"

#include <oecore/oecore.h>

#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <iostream>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace {

void printHelp(std::ostream& out) {
    out << "Usage: omb [options] <command>\n"
           "\n"
           "Commands:\n"
           "  info                   print the library version and the registered engine classes\n"
           "  info FILE.px           load a configuration and list its public objects\n"
           "  classes                list the registered engine classes with their class records\n"
           "  resave FILE.px OUT.px  load a configuration and save its public objects again\n"
           "  expr 'EXPRESSION' [NAME=VALUE]...\n"
           "                         evaluate an expression against attributes given as literals\n"
           "                         (3, 2.5, \"text\", #atom, true), printing the value and its type\n"
           "  datum FILE.px FROM TO LON,LAT[,H]...\n"
           "                         move points (degrees, height in metres) from one geodetic datum\n"
           "                         to another; datums by public name or predefined (Datums.Wgs84)\n"
           "  project FILE.px PROJECTION DATUM LON,LAT[,H]...\n"
           "                         project points (degrees) on a datum's ellipsoid to x, y in the\n"
           "                         projection's unit; projections by public name or predefined\n"
           "                         (Projections.mercator1SP_web), or UTM zones as Utm33N, Utm33S\n"
           "  unproject FILE.px PROJECTION DATUM X,Y[,Z]...\n"
           "                         the reverse: projected points back to degrees\n"
           "  transform --from CRS --to CRS [X Y [Z]]\n"
           "                         transform a point, or one 'X Y [Z]' line at a time from standard\n"
           "                         input (x is longitude in long/lat systems)\n"
           "  crs CRS                describe a coordinate reference system\n"
           "\n"
           "CRS: epsg:NNNN, esri:NNNNNN, crs:84, an OGC URN (urn:ogc:def:crs:EPSG::4326), a predefined\n"
           "name (Crs.Wgs84LongLat, Crs.Wgs84Utm33N) or @FILE with well-known text.\n"
           "\n"
           "Options:\n"
           "  --param KEY=VALUE  a configuration parameter for ConfigurationParameter (repeatable)\n"
           "  --lenient          assume a datum coincides with WGS 84 when no shift is known\n"
           "  --log-file FILE    write the library's log to FILE (rotated at 10 MiB, 4 files)\n"
           "  --log-level LEVEL  all, debug, info, warning, error, fatal or off (default: off,\n"
           "                     or all when a log file is given)\n"
           "  -h, --help         show this help and exit\n"
           "  -V, --version      print the version and exit\n"
           "\n"
           "Settings are read from omb.ini beside the executable, as for any OECore application.\n";
}

void printClasses(std::ostream& out) {
    std::size_t count = 0;
    for (const OmbClass* record : OmbClass::all()) {
        if (!*record->name()) continue;  // collection instantiations have no element name
        out << "  " << record->name();
        if (const OmbClass* base = record->baseClass()) out << " : " << base->name();
        out << "  [" << (record->plugin() ? pluginName(record->plugin()).view() : std::string_view("OECore")) << "]\n";
        ++count;
    }
    out << count << " engine classes\n";
}

// Returns false, having said why, when the arguments do not parse.
bool parse(int argc, char** argv, Options& options) {
    for (int i = 1; i < argc; ++i) {
        const std::string arg = argv[i];
        const bool takesValue =
            arg == "--log-file" || arg == "--log-level" || arg == "--param" || arg == "--from" || arg == "--to";
        if (takesValue && i + 1 >= argc) {
            std::cerr << "omb: " << arg << " needs a value; see 'omb --help'\n";
            return false;
        }
        if (arg == "--log-file")
            options.logFile = argv[++i];
        else if (arg == "--from")
            options.from = argv[++i];
        else if (arg == "--to")
            options.to = argv[++i];
        else if (arg == "--lenient")
            options.lenient = true;
        else if (arg == "--log-level")
            options.logLevel = argv[++i];
        else if (arg == "--param") {
            const std::string pair = argv[++i];
            const std::size_t equals = pair.find('=');
            if (equals == std::string::npos || equals == 0) {
                std::cerr << "omb: --param takes KEY=VALUE, not '" << pair << "'\n";
                return false;
            }
            options.params.emplace_back(pair.substr(0, equals), pair.substr(equals + 1));
        } else if (options.command.empty())
            options.command = arg;
        else
            options.files.push_back(arg);
    }
    return true;
}

void startLog(const Options& options) {
    if (!options.logFile.empty()) {
        constexpr unsigned fileCount = 4;
        constexpr unsigned maximumFileSize = 10485760;
        OmbLog::addAppender(OmbRef<OmbLogAppender>(
            new OmbRollingFileLogAppender(OmbString(options.logFile), fileCount, maximumFileSize)));
        OmbLog::logLevel(OmbLogAll);
    }
    if (!options.logLevel.empty()) {
        OmbLogLevel level;
        if (!OmbLog::parseLevel(OmbString(options.logLevel), level))
            OMB_THROW(IllegalArgument, OmbString("--log-level " + options.logLevel));
        OmbLog::logLevel(level);
    }
}

OmbRef<OmbConfiguration> loadConfiguration(const Options& options) {
    OmbRef<OmbConfigurationParameters> params(new OmbConfigurationParameters);
    for (const auto& [key, value] : options.params) params->add(OmbString(key), OmbString(value));
    return OmbRef<OmbConfiguration>(
        new OmbConfiguration(OmbString(options.files.at(0)), params, OmbDataSetInitialization::Immediate));
}

void printPublicObjects(const OmbConfiguration& configuration) {
    const OmbRef<OmbVec<OmbString>> names = configuration.publicNames();
    for (const OmbString& name : *names) {
        const OmbRef<OmbEngineObject> object = configuration.getPublicObject(name);
        std::cout << "  " << name << "  " << (object ? object->myRuntimeClassName() : "(value)") << "\n";
    }
    std::cout << names->size() << " public objects\n";
}

bool expectFiles(const Options& options, std::size_t count) {
    if (options.files.size() == count) return true;
    std::cerr << "omb: " << options.command << " takes " << count << " file name" << (count > 1 ? "s" : "")
              << "; see 'omb --help'\n";
    return false;
}

// A literal of the expression language (a negative number included).
bool literal(const std::string& text, OmbAttributeValue& value) {
    try {
        const OmbRef<OmbExpression> e = OmbExpression::parse(OmbString(text));
        const bool constant = e->type() == OmbExpression::Constant ||
                              (e->type() == OmbExpression::Negate && e->child(0)->type() == OmbExpression::Constant);
        return constant && e->evaluate(OmbReadOnlyAttributes(), value);
    } catch (const OmbXExpressionParseError&) {
        return false;
    }
}

int evaluateExpression(const Options& options) {
    if (options.files.empty()) {
        std::cerr << "omb: expr takes an expression; see 'omb --help'\n";
        return 2;
    }
    OmbRef<OmbAttributeSet> attributes(new OmbAttributeSet);
    for (std::size_t i = 1; i < options.files.size(); ++i) {
        const std::string& pair = options.files[i];
        const std::size_t equals = pair.find('=');
        OmbAttributeValue value;
        if (equals == std::string::npos || equals == 0 || !literal(pair.substr(equals + 1), value)) {
            std::cerr << "omb: '" << pair
                      << "' is not NAME=VALUE with a literal value (3, 2.5, \"text\", #atom, true)\n";
            return 2;
        }
        attributes->setGeneric(OmbAtoms::atom(OmbString(pair.substr(0, equals))), value);
    }
    const std::string& text = options.files[0];
    OmbRef<OmbExpression> expression;
    try {
        expression = OmbExpression::parse(OmbString(text));
    } catch (const OmbXExpressionParseError& e) {
        const std::size_t position = std::stoul(std::string(e.argument(2).view()));
        std::cerr << "omb: " << e.argument(3) << "\n  " << text << "\n  " << std::string(position, ' ') << "^\n";
        return 1;
    }
    OmbAttributeValue result;
    if (!expression->evaluate(OmbReadOnlyAttributes(attributes), result)) {
        std::cout << "null\n";
        return 0;
    }
    OmbAttributeValue shown;
    Omb_toString(result, shown);
    const bool quoted = result.type() == OmbAttributeString;
    std::cout << (result.type() == OmbAttributeAtom ? "#" : "") << (quoted ? "\"" : "") << shown.asString()
              << (quoted ? "\"" : "") << " (" << Omb_attributeTypeName(result.type()) << ")\n";
    return 0;
}

// An object of class T by its public name in the configuration or by its
// predefined name.
template <class T>
OmbRef<T> findNamed(const OmbConfiguration& configuration, const std::string& name) {
    OmbRef<OmbEngineObject> object = configuration.getPublicObject(OmbString(name));
    if (!object) object = OmbRuntime::getPredefinedObject(OmbString(name));
    return omb_dynamic_cast<T>(object);
}

// A projection by name, or a UTM zone written as Utm33N or Utm33S.
OmbRef<OmbProjection> findProjection(const OmbConfiguration& configuration, const std::string& name) {
    if (OmbRef<OmbProjection> named = findNamed<OmbProjection>(configuration, name)) return named;
    int zone = 0;
    char hemisphere = 0, rest = 0;
    if (std::sscanf(name.c_str(), "Utm%d%c%c", &zone, &hemisphere, &rest) == 2 && zone >= 1 && zone <= 60 &&
        (hemisphere == 'N' || hemisphere == 'S'))
        return OmbProjection::utm(zone, hemisphere == 'N' ? OmbUTMHemisphere::North : OmbUTMHemisphere::South);
    return {};
}

// "x,y" or "x,y,z", all numbers.
bool parsePoint(const std::string& text, OmbPoint& p) {
    const char* at = text.c_str();
    for (std::size_t i = 0; i < 3; ++i) {
        char* end = nullptr;
        p[i] = std::strtod(at, &end);
        if (end == at) return false;
        if (*end == '\0') return i >= 1;
        if (*end != ',') return false;
        at = end + 1;
    }
    return false;
}

// The points from the command's arguments at first and after; false, with
// a message, when one is not a point.
bool readPoints(const Options& options, std::size_t first, const char* form, OmbPointArray& points) {
    for (std::size_t i = first; i < options.files.size(); ++i) {
        OmbPoint p;
        if (!parsePoint(options.files[i], p)) {
            std::cerr << "omb: '" << options.files[i] << "' is not " << form << "\n";
            return false;
        }
        points.push_back(p);
    }
    return true;
}

// One line a point, x and y with the given number of decimals.
void printPoints(const OmbPointArray& points, int decimals) {
    char line[128];
    for (const OmbPoint& p : points) {
        std::snprintf(line, sizeof line, "%.*f %.*f %.4f\n", decimals, p.x, decimals, p.y, p.z);
        std::cout << line;
    }
}

int convertDatum(const Options& options) {
    if (options.files.size() < 4) {
        std::cerr << "omb: datum takes FILE.px FROM TO and at least one LON,LAT[,H]; see 'omb --help'\n";
        return 2;
    }
    OmbPointArray points;
    if (!readPoints(options, 3, "LON,LAT or LON,LAT,H", points)) return 2;
    const OmbRef<OmbConfiguration> configuration = loadConfiguration(options);
    OmbRef<OmbGeodeticDatum> datums[2];
    for (int i = 0; i < 2; ++i) {
        datums[i] = findNamed<OmbGeodeticDatum>(*configuration, options.files[1 + i]);
        if (!datums[i]) {
            std::cerr << "omb: " << options.files[0] << ": no geodetic datum named '" << options.files[1 + i] << "'\n";
            return 1;
        }
    }
    datums[0]->changeDatumTo(*datums[1], points);
    printPoints(points, 9);
    return 0;
}

// project and unproject.
int projectPoints(const Options& options, bool inverse) {
    const char* form = inverse ? "X,Y or X,Y,Z" : "LON,LAT or LON,LAT,H";
    if (options.files.size() < 4) {
        std::cerr << "omb: " << options.command << " takes FILE.px PROJECTION DATUM and at least one " << form
                  << "; see 'omb --help'\n";
        return 2;
    }
    OmbPointArray points;
    if (!readPoints(options, 3, form, points)) return 2;
    const OmbRef<OmbConfiguration> configuration = loadConfiguration(options);
    const OmbRef<OmbProjection> projection = findProjection(*configuration, options.files[1]);
    if (!projection) {
        std::cerr << "omb: " << options.files[0] << ": no projection named '" << options.files[1] << "'\n";
        return 1;
    }
    const OmbRef<OmbGeodeticDatum> datum = findNamed<OmbGeodeticDatum>(*configuration, options.files[2]);
    if (!datum) {
        std::cerr << "omb: " << options.files[0] << ": no geodetic datum named '" << options.files[2] << "'\n";
        return 1;
    }
    const std::unique_ptr<OmbProjCachedNumbers> cached(projection->init(*datum));
    if (inverse)
        projection->unproject(points, cached.get());
    else
        projection->project(points, cached.get());
    printPoints(points, inverse ? 9 : 4);
    return 0;
}

int run(const Options& options) {
    if (options.command == "expr") return evaluateExpression(options);
    if (options.command == "datum") return convertDatum(options);
    if (options.command == "project" || options.command == "unproject")
        return projectPoints(options, options.command == "unproject");
    if (options.command == "transform") return transformPoints(options);
    if (options.command == "crs") return describeCrs(options);
    if (options.command == "info" && options.files.empty()) {
        std::cout << "OECore " << OmbRuntime::version() << "\n";
        printClasses(std::cout);
        return 0;
    }
    if (options.command == "info") {
        if (!expectFiles(options, 1)) return 2;
        const OmbRef<OmbConfiguration> configuration = loadConfiguration(options);
        std::cout << options.files[0] << ": namespace " << configuration->defaultNamespace() << "\n";
        printPublicObjects(*configuration);
        return 0;
    }
    if (options.command == "resave") {
        if (!expectFiles(options, 2)) return 2;
        loadConfiguration(options)->savePublicObjects(OmbString(options.files[1]));
        return 0;
    }
    if (options.command == "classes") {
        printClasses(std::cout);
        return 0;
    }
    std::cerr << "omb: unknown command '" << options.command << "'; see 'omb --help'\n";
    return 2;
}

}  // namespace

int main(int argc, char** argv) {
    std::setlocale(LC_ALL, "");
    Options options;
    if (!parse(argc, argv, options)) return 2;
    if (options.command.empty()) {
        printHelp(std::cerr);
        return 2;
    }
    if (options.command == "-h" || options.command == "--help" || options.command == "help") {
        printHelp(std::cout);
        return 0;
    }
    if (options.command == "-V" || options.command == "--version") {
        std::cout << "omb " << OECORE_VERSION_STRING << "\n";
        return 0;
    }
    int status = 1;
    try {
        startLog(options);
        OmbRuntime::init();
        status = run(options);
    } catch (const OmbException& e) {
        std::cerr << "omb: " << (options.files.empty() ? "" : options.files[0] + ": ") << e.asString() << "\n";
    }
    OmbRuntime::shutdown();
    return status;
}
