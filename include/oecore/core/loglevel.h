#pragma once

// Severity of a log message; a message of level L is written when the log's
// current level is at most L.
enum OmbLogLevel {
    OmbLogAll = 0,
    OmbLogDebug = 1,
    OmbLogInfo = 2,
    OmbLogWarning = 3,
    OmbLogError = 4,
    OmbLogFatal = 5,
    OmbLogOff = 6
};
