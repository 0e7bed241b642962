#include <oecore/attr/attributeset.h>
#include <oecore/core/exception.h>
#include <oecore/core/log.h>
#include <oecore/core/stringbuilder.h>

#include <cstdio>
#include <cstdlib>
#include <new>

OMB_DEFINE_ENGINE_CLASS(OmbAttributeSet, OmbEngineObject, "AttributeSet", 0)

const OmbAtomConstant OmbAttributeSet::geoTypeKey("geoType");

// The storage: a count of the sets sharing it, the capacity, the used slots
// and the slots themselves, in one block.
struct alignas(alignof(OmbAttributeSet::Slot)) OmbAttributeSet::Table {
    std::atomic<int> refs{1};
    std::uint32_t capacity;
    std::uint32_t count = 0;

    Slot* slots() noexcept { return reinterpret_cast<Slot*>(this + 1); }
    const Slot* slots() const noexcept { return reinterpret_cast<const Slot*>(this + 1); }

    static Table* create(std::uint32_t capacity) {
        void* memory = std::malloc(sizeof(Table) + capacity * sizeof(Slot));
        if (!memory) throw std::bad_alloc();
        auto* table = new (memory) Table;
        table->capacity = capacity;
        for (std::uint32_t i = 0; i < capacity; ++i) new (table->slots() + i) Slot;
        return table;
    }

    // A copy with the given capacity and the used slots moved to the front.
    Table* copy(std::uint32_t newCapacity) const {
        Table* table = create(newCapacity);
        std::uint32_t to = 0;
        for (std::uint32_t i = 0; i < capacity; ++i)
            if (!slots()[i].isFree()) table->slots()[to++] = slots()[i];
        table->count = to;
        return table;
    }

    void ref() noexcept { refs.fetch_add(1, std::memory_order_relaxed); }
    void unref() noexcept {
        if (refs.fetch_sub(1, std::memory_order_acq_rel) != 1) return;
        for (std::uint32_t i = 0; i < capacity; ++i) slots()[i].~Slot();
        this->~Table();
        std::free(this);
    }
};

static_assert(alignof(OmbAttributeSet::Slot) <= alignof(std::max_align_t));
static_assert(sizeof(OmbAttributeSet::Table) % alignof(OmbAttributeSet::Slot) == 0, "slots follow the header aligned");

OmbAttributeSet::OmbAttributeSet(std::uint32_t capacity) : table_(Table::create(capacity ? capacity : 8)) {}

OmbAttributeSet::OmbAttributeSet(const OmbAttributeSet& other)
    : OmbEngineObject(other), OmbAbstractCacheLeaf(), table_(other.table_) {
    table_->ref();
}

OmbAttributeSet::~OmbAttributeSet() { table_->unref(); }

std::size_t OmbAttributeSet::size() const noexcept { return table_->count; }
std::size_t OmbAttributeSet::capacity() const noexcept { return table_->capacity; }

const OmbAttributeSet::Slot* OmbAttributeSet::findSlot(OmbAtom key) const {
    const Slot* slots = table_->slots();
    for (std::uint32_t i = 0; i < table_->capacity; ++i)
        if (slots[i].key == key && !slots[i].isFree()) return slots + i;
    return nullptr;
}

const OmbAttributeValue* OmbAttributeSet::findValue(OmbAtom key) const {
    const Slot* slot = findSlot(key);
    return slot ? &slot->value : nullptr;
}

bool OmbAttributeSet::get(OmbAtom key, OmbAttributeValue& out) const {
    const OmbAttributeValue* value = findValue(key);
    if (value) out = *value;
    return value != nullptr;
}

namespace {

template <class T, class Read>
bool typedGet(const OmbAttributeValue* value, OmbAttributeSetType type, T& out, Read read) {
    if (!value || value->type() != type) return false;
    out = read(*value);
    return true;
}

}  // namespace

bool OmbAttributeSet::get(OmbAtom key, std::int64_t& out) const {
    return typedGet(findValue(key), OmbAttributeInt64, out, [](const OmbAttributeValue& v) { return v.asInt64(); });
}
bool OmbAttributeSet::get(OmbAtom key, bool& out) const {
    return typedGet(findValue(key), OmbAttributeBool, out, [](const OmbAttributeValue& v) { return v.asBool(); });
}
bool OmbAttributeSet::get(OmbAtom key, unsigned long& atom) const {
    return typedGet(findValue(key), OmbAttributeAtom, atom,
                    [](const OmbAttributeValue& v) { return static_cast<unsigned long>(v.asAtom()); });
}
bool OmbAttributeSet::get(OmbAtom key, double& out) const {
    return typedGet(findValue(key), OmbAttributeDouble, out, [](const OmbAttributeValue& v) { return v.asDouble(); });
}
bool OmbAttributeSet::get(OmbAtom key, OmbString& out) const {
    return typedGet(findValue(key), OmbAttributeString, out, [](const OmbAttributeValue& v) { return v.asString(); });
}

void OmbAttributeSet::checkWritable() const {
    if (readOnly_) OMB_THROW(ReadOnly, OmbString::literal("AttributeSet"));
}

bool OmbAttributeSet::protectsGeoType(OmbAtom key) const {
    return owner_.load() == FeatureOwner && key == static_cast<OmbAtom>(geoTypeKey);
}

OmbAttributeSet::Table& OmbAttributeSet::writableTable() {
    if (table_->refs.load(std::memory_order_acquire) > 1) grow(table_->capacity);
    return *table_;
}

void OmbAttributeSet::grow(std::uint32_t capacity) {
    Table* copy = table_->copy(capacity);
    table_->unref();
    table_ = copy;
}

void OmbAttributeSet::setGeneric(OmbAtom key, const OmbAttributeValue& value) {
    checkWritable();
    if (!protectsGeoType(key)) put(key, value);
}

void OmbAttributeSet::put(OmbAtom key, const OmbAttributeValue& value) {
    Table* table = &writableTable();
    if (const Slot* slot = findSlot(key)) {
        const_cast<Slot*>(slot)->value = value;
        return;
    }
    if (table->count == table->capacity) {
        grow(table->capacity + 8);
        table = table_;
    }
    Slot* slots = table->slots();
    std::uint32_t at = table->count;
    if (!slots[at].isFree())
        for (at = 0; !slots[at].isFree(); ++at) {
        }
    slots[at].key = key;
    slots[at].value = value;
    ++table->count;
}

bool OmbAttributeSet::remove(OmbAtom key) {
    checkWritable();
    if (protectsGeoType(key) || !findSlot(key)) return false;
    Table& table = writableTable();
    Slot* slot = const_cast<Slot*>(findSlot(key));
    slot->key = 0;
    slot->value.clear();
    --table.count;
    return true;
}

void OmbAttributeSet::clear() {
    checkWritable();
    const bool feature = owner_.load() == FeatureOwner;
    if (feature && table_->count <= 1) return;
    OmbAttributeValue geoType;
    if (feature) get(geoTypeKey, geoType);
    Table& table = writableTable();
    for (std::uint32_t i = 0; i < table.capacity; ++i) table.slots()[i] = Slot();
    table.count = 0;
    if (feature && !geoType.is_singular()) put(geoTypeKey, geoType);
}

void OmbAttributeSet::assign(const OmbAttributeSet& other) {
    if (&other == this) return;
    checkWritable();
    clear();
    other.forEach([this](OmbAtom key, const OmbAttributeValue& value) {
        if (!protectsGeoType(key)) put(key, value);
    });
}

void OmbAttributeSet::merge(const OmbAttributeSet& other) {
    checkWritable();
    if (&other == this) return;
    // Writing here copies this set's table, never other's: iterating is safe.
    other.forEach([this](OmbAtom key, const OmbAttributeValue& value) {
        if (!protectsGeoType(key)) put(key, value);
    });
}

bool OmbAttributeSet::mergeSubset(const std::set<OmbAtom>& keys, const OmbAttributeSet& other) {
    checkWritable();
    bool written = false;
    for (const OmbAtom key : keys) {
        const OmbAttributeValue* value = other.findValue(key);
        if (!value || protectsGeoType(key)) continue;
        put(key, *value);
        written = true;
    }
    return written;
}

void OmbAttributeSet::reserve(std::uint32_t capacity) {
    if (capacity > table_->capacity) grow(capacity);
}

bool OmbAttributeSet::Iterator::next() {
    const Table& table = *set_->table_;
    while (++slot_ < static_cast<std::int64_t>(table.capacity))
        if (!table.slots()[slot_].isFree()) return true;
    return false;
}

OmbAtom OmbAttributeSet::Iterator::key() const { return set_->table_->slots()[slot_].key; }

const OmbAttributeValue& OmbAttributeSet::Iterator::value() const { return set_->table_->slots()[slot_].value; }

void OmbAttributeSet::forEach(const std::function<void(OmbAtom, const OmbAttributeValue&)>& fn) const {
    const Slot* slots = table_->slots();
    for (std::uint32_t i = 0; i < table_->capacity; ++i)
        if (!slots[i].isFree()) fn(slots[i].key, slots[i].value);
}

std::vector<OmbAtom> OmbAttributeSet::keys() const {
    std::vector<OmbAtom> out;
    forEach([&out](OmbAtom key, const OmbAttributeValue&) { out.push_back(key); });
    return out;
}

std::vector<OmbAttributeValue> OmbAttributeSet::values() const {
    std::vector<OmbAttributeValue> out;
    forEach([&out](OmbAtom, const OmbAttributeValue& value) { out.push_back(value); });
    return out;
}

void OmbAttributeSet::getKeys(std::set<OmbAtom>& keys) const {
    forEach([&keys](OmbAtom key, const OmbAttributeValue&) { keys.insert(key); });
}

bool OmbAttributeSet::takeOwnership(OwnerType ownerType, OmbAtom geoType) {
    std::uint32_t expected = NoOwner;
    if (!owner_.compare_exchange_strong(expected, ownerType)) return false;
    if (ownerType == FeatureOwner) put(geoTypeKey, OmbAttributeValue(static_cast<unsigned long>(geoType)));
    return true;
}

bool OmbAttributeSet::compare(const OmbAttributeSet& a, const OmbAttributeSet& b, bool includeGeoType) {
    if (a.table_ == b.table_) return true;
    if (a.size() != b.size()) return false;
    const OmbAtom geoType = geoTypeKey;
    bool equal = true;
    a.forEach([&](OmbAtom key, const OmbAttributeValue& value) {
        const OmbAttributeValue* other = b.findValue(key);
        if (!other || ((key != geoType || includeGeoType) && !(*other == value))) equal = false;
    });
    return equal;
}

std::size_t OmbAttributeSet::memoryPressure() const {
    const std::size_t capacity = table_->capacity;
    return 40 + 4 * ((capacity & ~std::size_t(1)) + 6 * capacity);
}

std::size_t OmbAttributeSet::sizeOf() const {
    std::size_t size = 44;
    forEach([&size](OmbAtom, const OmbAttributeValue& value) {
        size += 16 + (value.type() == OmbAttributeString ? value.asString().size() : 0);
    });
    return size;
}

std::vector<OmbString> OmbAttributeSet::dumpLines() const {
    std::vector<OmbString> lines;
    char address[64];
    // glibc's %p writes the 0x itself.
    std::snprintf(address, sizeof address, "%p", static_cast<const void*>(this));
    lines.push_back(OmbString("OmbAttributeSet: ") + OmbString(address));
    lines.push_back(OmbString("  size: " + std::to_string(size())));
    lines.push_back(OmbString("  capacity: " + std::to_string(capacity())));
    lines.push_back(OmbString::literal("  values: ["));
    forEach([&lines](OmbAtom key, const OmbAttributeValue& v) {
        OmbStringBuilder line;
        line << "    { " << OmbAtoms::name(key) << ", ";
        switch (v.type()) {
            case OmbAttributeInt64: line << "Int64, " << static_cast<long long>(v.asInt64()) << " }"; break;
            case OmbAttributeDouble: line << "Double, " << OmbFormat::fixed(v.asDouble(), 6) << " }"; break;
            case OmbAttributeBool: line << "Bool, " << (v.asBool() ? "true" : "false") << " }"; break;
            case OmbAttributeAtom: line << "Atom, " << OmbAtoms::name(v.asAtom()) << " }"; break;
            case OmbAttributeString: line << "String, \"" << v.asString() << "\" }"; break;
            case OmbAttributeEmpty: return;
        }
        lines.push_back(line.str());
    });
    lines.push_back(OmbString::literal("  ]"));
    return lines;
}

void OmbAttributeSet::dump() const { dumpAttributeSet(this); }

void dumpAttributeSet(const OmbAttributeSet* set) {
    OmbDebuggerLogAppender out;
    if (!set) return out.log(OmbString::literal("<NULL>"), OmbLogDebug);
    for (const OmbString& line : set->dumpLines()) out.log(line, OmbLogDebug);
}
