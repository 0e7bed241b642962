#include <oecore/core/resourceobject.h>

OMB_DEFINE_ENGINE_CLASS(OmbResourceObject, OmbEngineObject, "ResourceObject", 0)
