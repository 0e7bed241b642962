// omb's command-line options, and its coordinate-system commands.
#pragma once

#include <string>
#include <utility>
#include <vector>

struct Options {
    std::string command;
    std::vector<std::string> files;
    std::vector<std::pair<std::string, std::string>> params;
    std::string logFile;
    std::string logLevel;
    std::string from;
    std::string to;
    bool lenient = false;
};

// omb transform --from CRS --to CRS [X Y [Z]]
int transformPoints(const Options& options);
// omb crs CRS
int describeCrs(const Options& options);
