#include <oecore/core/cacheref.h>

OmbCacheRef::OmbCacheRef(OmbICachable* cachable) : cachable_(cachable) {
    if (!cachable) return;
    if (cachable->gcEvictable())
        ref_ = OmbRef<OmbRefCnt>(cachable->asRefCnt());
    else
        wref_ = OmbWRef<OmbWRefCnt>(dynamic_cast<OmbWRefCnt*>(cachable->asRefCnt()));
}
