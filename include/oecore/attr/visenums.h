// Enumerations of presentation properties that attribute variables carry.
// Their numbers are stored and passed on as they are.
#pragma once

#include <oecore/config/classdescription.h>

enum class OmbAlignX : int { Left = 0, Right = 2, Middle = 6, None = 7 };
enum class OmbAlignY : int { Top = 0, Bottom = 8, Baseline = 24, Center = 99, None = 100 };
// The outline of a point symbol.
enum class OmbShape : int { Circle = 0, Square = 1, Triangle = 2, Diamond = 3, Cross = 4, Star = 5 };
// Which edges of an area are split into segments for drawing.
enum class OmbEdgesToSegmentize : int { None = 0, Outer = 1, Inner = 2, All = 3 };
enum class OmbPickingSupport : int { None = 0, Default = 1, Extended = 2 };
enum class OmbVisualizerLengthUnit : int { Pixels = 0, ViewCrs = 1, NominalMeters = 2 };

OMB_DESCRIBE_ENUM(OmbAlignX, "AlignX", {{"Left", 0}, {"Right", 2}, {"Middle", 6}, {"None", 7}})
OMB_DESCRIBE_ENUM(OmbAlignY, "AlignY", {{"Top", 0}, {"Bottom", 8}, {"Baseline", 24}, {"Center", 99}, {"None", 100}})
OMB_DESCRIBE_ENUM(OmbShape, "Shape",
                  {{"Circle", 0}, {"Square", 1}, {"Triangle", 2}, {"Diamond", 3}, {"Cross", 4}, {"Star", 5}})
OMB_DESCRIBE_ENUM(OmbEdgesToSegmentize, "EdgesToSegmentize", {{"None", 0}, {"Outer", 1}, {"Inner", 2}, {"All", 3}})
OMB_DESCRIBE_ENUM(OmbPickingSupport, "PickingSupport", {{"None", 0}, {"Default", 1}, {"Extended", 2}})
OMB_DESCRIBE_ENUM(OmbVisualizerLengthUnit, "VisualizerLengthUnit",
                  {{"Pixels", 0}, {"ViewCrs", 1}, {"NominalMeters", 2}})
