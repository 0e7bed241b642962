// OmbICachable: what the global object cache asks of everything it holds.
#pragma once

#include <oecore/core/ref.h>

#include <cstddef>
#include <cstdint>

class OmbCacheGen;

class OmbICachable {
public:
    virtual ~OmbICachable() = default;

    // The reference-counted object that owns this interface.
    virtual OmbRefCnt* asRefCnt() = 0;
    // Bytes held, for accounting.
    virtual std::size_t gcSize() = 0;
    // Stamps the object with a generation (a "touch").
    virtual void gcGeneration(const OmbRef<OmbCacheGen>& generation) = 0;
    virtual OmbRef<OmbCacheGen> gcGeneration() = 0;
    virtual bool gcIsCacheLeaf() = 0;
    // Whether the object may ever be evicted; the cache keeps evictable
    // objects alive until it evicts them and only watches the others.
    virtual bool gcEvictable() = 0;
    virtual bool gcEvictableNow() = 0;
    // Child operations of cache nodes. gcGet returns the child's owner,
    // stamped with the node's generation, or null.
    virtual OmbRef<OmbRefCnt> gcGet(std::uint64_t key) = 0;
    virtual void gcAdd(std::uint64_t key, OmbICachable* child) = 0;
    virtual void gcRemove(std::uint64_t key) = 0;
    // Evicts children last touched before the generation.
    virtual void gcEvict(std::uint64_t generation) = 0;
    virtual bool gcEmpty() = 0;
};
