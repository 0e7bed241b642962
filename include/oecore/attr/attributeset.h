// OmbAttributeSet: the named attributes of a feature or presentation object.
//
// One flat table of slots (atom key and value) searched linearly, starting
// at 8 slots and growing by 8. Copies and clones share the table until one of
// them writes (copy-on-write). Removing leaves a hole that a later attribute
// may fill; otherwise iteration follows insertion order. A set owned by a
// feature keeps its geoType attribute whatever is done to it.
//
// Thread safety: sets that share a table may be used on different threads;
// one set is not safe for a writer together with readers or other writers.
#pragma once

#include <oecore/attr/attributevalue.h>
#include <oecore/core/cache.h>
#include <oecore/core/engineobject.h>

#include <atomic>
#include <cstdint>
#include <functional>
#include <set>
#include <vector>

class OmbAttributeSet : public OmbEngineObject, public OmbAbstractCacheLeaf {
    OMB_DECLARE_ENGINE_CLASS()

public:
    // The key of the geometry type that a feature keeps in its set.
    static const OmbAtomConstant geoTypeKey;
    enum OwnerType : std::uint32_t { NoOwner = 0, FeatureOwner = 1, LayerInfoOwner = 2 };

    explicit OmbAttributeSet(std::uint32_t capacity = 8);
    // Shares the table; owner and read-only mark are not copied.
    OmbAttributeSet(const OmbAttributeSet& other);
    OmbAttributeSet& operator=(const OmbAttributeSet&) = delete;
    ~OmbAttributeSet() override;

    OmbAttributeSet* clone() const override { return new OmbAttributeSet(*this); }
    void toXml(OmbXmlSerializer& serializer, TiXmlElement* topLevel, TiXmlElement* parent, const char* propertyName,
               const char* elementName, bool isPublic) const override;

    std::size_t size() const noexcept;
    std::size_t capacity() const noexcept;
    bool containsKey(OmbAtom key) const { return findValue(key) != nullptr; }
    // The stored value, valid until the set changes; null when absent.
    const OmbAttributeValue* findValue(OmbAtom key) const;
    bool get(OmbAtom key, OmbAttributeValue& out) const;
    // Typed reads: true only when the stored tag is exactly that type.
    bool get(OmbAtom key, std::int64_t& out) const;
    bool get(OmbAtom key, bool& out) const;
    bool get(OmbAtom key, unsigned long& atom) const;
    bool get(OmbAtom key, double& out) const;
    bool get(OmbAtom key, OmbString& out) const;

    // Each adds the key or replaces its value; OmbXReadOnly when read-only.
    void set(OmbAtom key, std::int64_t value) { setGeneric(key, OmbAttributeValue(value)); }
    void set(OmbAtom key, int value) { setGeneric(key, OmbAttributeValue(value)); }
    void set(OmbAtom key, unsigned long atom) { setGeneric(key, OmbAttributeValue(atom)); }
    void set(OmbAtom key, double value) { setGeneric(key, OmbAttributeValue(value)); }
    void set(OmbAtom key, const OmbString& value) { setGeneric(key, OmbAttributeValue(value)); }
    void setBool(OmbAtom key, bool value) { setGeneric(key, OmbAttributeValue::fromBool(value)); }
    void setGeneric(OmbAtom key, const OmbAttributeValue& value);
    bool remove(OmbAtom key);
    void clear();
    void assign(const OmbAttributeSet& other);
    void merge(const OmbAttributeSet& other);
    bool mergeSubset(const std::set<OmbAtom>& keys, const OmbAttributeSet& other);
    void reserve(std::uint32_t capacity);

    // Walks the attributes in slot order and keeps the set alive: the set must
    // be held by an OmbRef.
    class Iterator {
    public:
        explicit Iterator(OmbRef<const OmbAttributeSet> set) : set_(std::move(set)) {}
        // Moves to the next attribute; the first call moves to the first.
        bool next();
        OmbAtom key() const;
        const OmbAttributeValue& value() const;

    private:
        OmbRef<const OmbAttributeSet> set_;
        std::int64_t slot_ = -1;
    };
    Iterator iterator() const { return Iterator(OmbRef<const OmbAttributeSet>(this)); }
    std::vector<OmbAtom> keys() const;
    std::vector<OmbAttributeValue> values() const;
    void getKeys(std::set<OmbAtom>& keys) const;

    void markReadOnly() noexcept { readOnly_ = true; }
    bool isReadOnly() const noexcept { return readOnly_; }
    // Sets the owner mark from none; false when the set has an owner. A
    // feature owner also stores geoType (an atom value) under geoTypeKey.
    bool takeOwnership(OwnerType ownerType, OmbAtom geoType = 0);
    void releaseOwnership() noexcept { owner_.store(NoOwner); }
    bool isOwned() const noexcept { return owner_.load() != NoOwner; }

    // Equal when b holds every attribute of a with an equal value and the
    // same number of attributes; geoType values count only when asked.
    static bool compare(const OmbAttributeSet& a, const OmbAttributeSet& b, bool includeGeoType = false);

    std::size_t memoryPressure() const;
    std::size_t sizeOf() const;
    // The diagnostic lines dump() writes.
    std::vector<OmbString> dumpLines() const;
    // Writes the lines to the debugger output (standard error).
    void dump() const;

    // OmbAbstractCacheLeaf
    OmbRefCnt* asRefCnt() override { return this; }
    std::size_t gcSize() override { return sizeOf(); }

    struct Slot {
        OmbAtom key = 0;
        OmbAttributeValue value;
        bool isFree() const noexcept { return key == 0 && value.is_singular(); }
    };
    struct Table;

    // Calls fn with every attribute in slot order.
    void forEach(const std::function<void(OmbAtom, const OmbAttributeValue&)>& fn) const;

private:
    const Slot* findSlot(OmbAtom key) const;
    // Adds or replaces without the read-only and geoType checks.
    void put(OmbAtom key, const OmbAttributeValue& value);
    Table& writableTable();
    void grow(std::uint32_t capacity);
    void checkWritable() const;
    bool protectsGeoType(OmbAtom key) const;

    Table* table_;
    std::atomic<std::uint32_t> owner_{NoOwner};
    bool readOnly_ = false;
};

// Writes a set's dump, or "<NULL>" for none.
void dumpAttributeSet(const OmbAttributeSet* set);
