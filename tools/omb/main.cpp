// omb: the OECore command-line tool.
#include <oecore/oecore.h>

#include <cstring>
#include <iostream>
#include <string>

namespace {

void printHelp(std::ostream& out) {
    out << "Usage: omb <command> [options]\n"
           "\n"
           "Commands:\n"
           "  info        print the library version and the registered engine classes\n"
           "  classes     list the registered engine classes with their class records\n"
           "\n"
           "Options:\n"
           "  -h, --help     show this help and exit\n"
           "  -V, --version  print the version and exit\n";
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

}  // namespace

int main(int argc, char** argv) {
    if (argc < 2) {
        printHelp(std::cerr);
        return 2;
    }
    const std::string command = argv[1];
    if (command == "-h" || command == "--help" || command == "help") {
        printHelp(std::cout);
        return 0;
    }
    if (command == "-V" || command == "--version") {
        std::cout << "omb " << OECORE_VERSION_STRING << "\n";
        return 0;
    }
    try {
        if (command == "info") {
            std::cout << "OECore " << OECORE_VERSION_STRING << "\n";
            printClasses(std::cout);
            return 0;
        }
        if (command == "classes") {
            printClasses(std::cout);
            return 0;
        }
    } catch (const OmbException& e) {
        std::cerr << "omb: " << e.asString() << "\n";
        return 1;
    }
    std::cerr << "omb: unknown command '" << command << "'; see 'omb --help'\n";
    return 2;
}
