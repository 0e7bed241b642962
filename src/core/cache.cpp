#include <oecore/core/cache.h>
#include <oecore/core/globalcache.h>

#include <utility>

void OmbAbstractCacheLeaf::gcGeneration(const OmbRef<OmbCacheGen>& generation) {
    OmbRef<OmbCacheGen> previous;
    std::lock_guard lock(mutex_);
    previous = std::exchange(generation_, generation);
}

OmbRef<OmbCacheGen> OmbAbstractCacheLeaf::gcGeneration() {
    std::lock_guard lock(mutex_);
    return generation_;
}

OmbAbstractCacheNode::OmbAbstractCacheNode(std::recursive_mutex* ownerMutex)
    : mutex_(ownerMutex ? *ownerMutex : ownMutex_) {
    buckets_[parkedBucket];
    buckets_[weakBucket];
}

std::size_t OmbAbstractCacheNode::gcSize() {
    Guard lock(mutex_);
    return size_;
}

void OmbAbstractCacheNode::gcGeneration(const OmbRef<OmbCacheGen>& generation) {
    OmbRef<OmbCacheGen> previous;
    Guard lock(mutex_);
    previous = std::exchange(generation_, generation);
}

OmbRef<OmbCacheGen> OmbAbstractCacheNode::gcGeneration() {
    Guard lock(mutex_);
    return generation_;
}

void OmbAbstractCacheNode::file(std::uint64_t key, std::uint64_t bucket) { buckets_[bucket].insert(key); }

void OmbAbstractCacheNode::unfile(std::uint64_t key, std::uint64_t bucket) {
    const auto it = buckets_.find(bucket);
    if (it != buckets_.end()) it->second.erase(key);
}

void OmbAbstractCacheNode::erase(std::unordered_map<std::uint64_t, Entry>::iterator it,
                                 std::vector<OmbCacheRef>& released) {
    unfile(it->first, it->second.bucket);
    size_ -= it->second.size;
    released.push_back(std::move(it->second.ref));
    children_.erase(it);
}

OmbRef<OmbRefCnt> OmbAbstractCacheNode::gcGet(std::uint64_t key) {
    std::vector<OmbCacheRef> released;
    Guard lock(mutex_);
    const auto it = children_.find(key);
    if (it == children_.end()) return OmbRef<OmbRefCnt>();
    const OmbCacheRef& ref = it->second.ref;
    OmbRef<OmbRefCnt> owner = ref.ref() ? ref.ref() : OmbRef<OmbRefCnt>(ref.wref().strong());
    if (!owner) {
        erase(it, released);  // a weakly held child that is gone
        return owner;
    }
    ref.cachable()->gcGeneration(generation_);
    return owner;
}

void OmbAbstractCacheNode::gcAdd(std::uint64_t key, OmbICachable* child) {
    if (!child) return;
    OmbCacheRef ref(child);
    const std::uint64_t bucket = ref.ref() ? Omb_generationOf(child->gcGeneration()) : weakBucket;
    const std::size_t size = child->gcSize();
    std::vector<OmbCacheRef> released;
    Guard lock(mutex_);
    const auto old = children_.find(key);
    if (old != children_.end()) erase(old, released);
    children_.emplace(key, Entry{std::move(ref), bucket, size});
    file(key, bucket);
    size_ += size;
}

void OmbAbstractCacheNode::gcRemove(std::uint64_t key) {
    std::vector<OmbCacheRef> released;
    Guard lock(mutex_);
    const auto it = children_.find(key);
    if (it != children_.end()) erase(it, released);
}

bool OmbAbstractCacheNode::gcEmpty() {
    Guard lock(mutex_);
    return children_.empty();
}

std::size_t OmbAbstractCacheNode::childCount() {
    Guard lock(mutex_);
    return children_.size();
}

bool OmbAbstractCacheNode::filedIn(std::uint64_t key, std::uint64_t& bucket) {
    Guard lock(mutex_);
    const auto it = children_.find(key);
    if (it == children_.end()) return false;
    bucket = it->second.bucket;
    return true;
}

void OmbAbstractCacheNode::forEachLiveChild(const std::function<void(OmbICachable&)>& fn) {
    Guard lock(mutex_);
    for (const auto& [key, entry] : children_) {
        if (entry.ref.ref()) {
            fn(*entry.ref.cachable());
        } else if (const OmbRef<OmbWRefCnt> alive = entry.ref.wref().strong()) {
            fn(*entry.ref.cachable());
        }
    }
}

void OmbAbstractCacheNode::gcEvict(std::uint64_t generation) {
    // Evicted children are released after the mutex is left, so that their
    // destructors may use this node; child nodes are held while they evict.
    std::vector<OmbCacheRef> released;
    std::vector<std::pair<OmbICachable*, OmbRef<OmbRefCnt>>> childNodes;
    {
        Guard lock(mutex_);
        // Weakly held children that no longer exist.
        for (const std::uint64_t key : std::unordered_set<std::uint64_t>(buckets_[weakBucket])) {
            const auto it = children_.find(key);
            if (!it->second.ref.wref().strong()) erase(it, released);
        }
        // Parked children whose time has come.
        for (const std::uint64_t key : std::unordered_set<std::uint64_t>(buckets_[parkedBucket])) {
            const auto it = children_.find(key);
            if (it->second.ref.cachable()->gcEvictableNow()) erase(it, released);
        }
        // The generations older than the one given.
        while (!buckets_.empty() && buckets_.begin()->first < generation) {
            const auto bucket = buckets_.begin();
            const std::unordered_set<std::uint64_t> keys = std::move(bucket->second);
            buckets_.erase(bucket);
            for (const std::uint64_t key : keys) {
                const auto it = children_.find(key);
                OmbICachable* child = it->second.ref.cachable();
                const std::uint64_t touched = Omb_generationOf(child->gcGeneration());
                if (touched >= generation) {
                    it->second.bucket = touched;  // touched since it was filed
                    file(key, touched);
                } else if (child->gcEvictableNow()) {
                    erase(it, released);
                } else {
                    it->second.bucket = parkedBucket;
                    file(key, parkedBucket);
                }
            }
        }
        for (const auto& [key, entry] : children_) {
            OmbICachable* child = entry.ref.cachable();
            if (entry.ref.ref()) {
                if (!child->gcIsCacheLeaf()) childNodes.emplace_back(child, entry.ref.ref());
            } else if (OmbRef<OmbWRefCnt> alive = entry.ref.wref().strong()) {
                if (!child->gcIsCacheLeaf()) childNodes.emplace_back(child, OmbRef<OmbRefCnt>(alive));
            }
        }
    }
    for (const auto& [child, hold] : childNodes) child->gcEvict(generation);
}

std::size_t OmbCacheRoot::gcSize() {
    std::size_t size = 0;
    forEachLiveChild([&size](OmbICachable& child) { size += child.gcSize(); });
    return size;
}
