// OECore: every public header in one include.
#pragma once

#include <oecore/version.h>

#include <oecore/core/abort.h>
#include <oecore/core/cachable.h>
#include <oecore/core/cache.h>
#include <oecore/core/cacheref.h>
#include <oecore/core/class.h>
#include <oecore/core/collection.h>
#include <oecore/core/collectionpolicies.h>
#include <oecore/core/engineobject.h>
#include <oecore/core/enumerator.h>
#include <oecore/core/event.h>
#include <oecore/core/exception.h>
#include <oecore/core/globalcache.h>
#include <oecore/core/globalstatus.h>
#include <oecore/core/log.h>
#include <oecore/core/loglevel.h>
#include <oecore/core/readerwriterlock.h>
#include <oecore/core/ref.h>
#include <oecore/core/refcnt.h>
#include <oecore/core/refvec.h>
#include <oecore/core/resourceobject.h>
#include <oecore/core/runtime.h>
#include <oecore/core/screen.h>
#include <oecore/core/settingsfile.h>
#include <oecore/core/string.h>
#include <oecore/core/stringblock.h>
#include <oecore/core/stringbuilder.h>
#include <oecore/core/stringutils.h>
#include <oecore/core/threadid.h>
#include <oecore/core/unicodeutils.h>
#include <oecore/core/vec.h>

#include <oecore/attr/atoms.h>
#include <oecore/attr/attributeset.h>
#include <oecore/attr/attributesetlist.h>
#include <oecore/attr/attributeusage.h>
#include <oecore/attr/attributevalue.h>
#include <oecore/attr/attributevariable.h>
#include <oecore/attr/color.h>
#include <oecore/attr/condition.h>
#include <oecore/attr/expression.h>
#include <oecore/attr/featureattribute.h>
#include <oecore/attr/undefinedvalue.h>
#include <oecore/attr/visenums.h>

#include <oecore/linalg/point.h>
#include <oecore/linalg/pointarray.h>
#include <oecore/linalg/rect.h>

#include <oecore/crs/datumshift.h>
#include <oecore/crs/ellipsoid.h>
#include <oecore/crs/geodesic.h>
#include <oecore/crs/geodeticdatum.h>
#include <oecore/crs/primemeridian.h>
#include <oecore/crs/projection.h>
#include <oecore/crs/projections/azimuthal.h>
#include <oecore/crs/projections/equidistantcylindrical.h>
#include <oecore/crs/projections/identity.h>
#include <oecore/crs/projections/lambertconformalconic.h>
#include <oecore/crs/projections/mercator.h>
#include <oecore/crs/projections/orthographic.h>
#include <oecore/crs/projections/projlibprojections.h>
#include <oecore/crs/projections/transversemercator.h>
#include <oecore/crs/units.h>

#include <oecore/config/boxedvalue.h>
#include <oecore/config/classdescription.h>
#include <oecore/config/classmetadata.h>
#include <oecore/config/configuration.h>
#include <oecore/config/resourceresolver.h>
#include <oecore/config/valueparsers.h>
#include <oecore/config/xmlparser.h>
#include <oecore/config/xmlserializer.h>
#include <oecore/config/xmlutilities.h>
