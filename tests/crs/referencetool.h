// Runs an independent reference program (GeographicLib, PROJ) over lines of
// input and returns its output lines.
#pragma once

#include <gtest/gtest.h>

#include <oecore/linalg/point.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

// Empty when the program fails. The files are named after the running test,
// since ctest runs tests in parallel processes.
inline std::vector<std::string> runReferenceTool(const std::string& command, const std::vector<std::string>& lines) {
    const std::string stem = ::testing::TempDir() + "/reference-" +
                             ::testing::UnitTest::GetInstance()->current_test_info()->test_suite_name() + "-" +
                             ::testing::UnitTest::GetInstance()->current_test_info()->name();
    const std::string input = stem + "-in.txt";
    const std::string output = stem + "-out.txt";
    std::ofstream in(input);
    for (const std::string& line : lines) in << line << "\n";
    in.close();
    std::vector<std::string> result;
    if (std::system((command + " < " + input + " > " + output).c_str()) != 0) return result;
    std::ifstream out(output);
    for (std::string line; std::getline(out, line);) result.push_back(line);
    return result;
}

// PROJ's cs2cs over "lon lat h" lines; its output is x y z.
inline std::vector<OmbPoint> cs2cs(const std::string& from, const std::string& to,
                                   const std::vector<OmbPoint>& points) {
    std::vector<std::string> lines;
    char line[128];
    for (const OmbPoint& p : points) {
        std::snprintf(line, sizeof line, "%.12f %.12f %.4f", p.x, p.y, p.z);
        lines.push_back(line);
    }
    std::vector<OmbPoint> out;
    for (const std::string& row : runReferenceTool("cs2cs -f %.12f " + from + " +to " + to, lines)) {
        std::istringstream fields(row);
        OmbPoint p;
        if (fields >> p.x >> p.y >> p.z) out.push_back(p);
    }
    return out;
}
