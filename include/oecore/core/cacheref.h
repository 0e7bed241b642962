// OmbCacheRef: the global cache's handle on one entry. An evictable entry is
// held strongly (the cache keeps it alive until it evicts it); any other
// entry only weakly (the cache never keeps it alive).
#pragma once

#include <oecore/core/cachable.h>
#include <oecore/core/ref.h>

class OmbCacheRef {
public:
    OmbCacheRef() = default;
    explicit OmbCacheRef(OmbICachable* cachable);

    OmbICachable* cachable() const noexcept { return cachable_; }
    const OmbRef<OmbRefCnt>& ref() const noexcept { return ref_; }
    const OmbWRef<OmbWRefCnt>& wref() const noexcept { return wref_; }

private:
    OmbICachable* cachable_ = nullptr;
    OmbRef<OmbRefCnt> ref_;
    OmbWRef<OmbWRefCnt> wref_;
};
