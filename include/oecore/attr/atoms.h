// Atoms: attribute names interned as 32-bit numbers, so that no lookup
// compares key strings. Atom 0 is the empty string.
//
// Thread safety: every OmbAtoms function may be called from any thread; one
// lock guards the table.
#pragma once

#include <oecore/core/string.h>

#include <atomic>
#include <cstdint>

using OmbAtom = std::uint32_t;

class OmbAtomConstant;

class OmbAtoms {
public:
    OmbAtoms() = delete;

    // The atom of the string, created when the string is new.
    static OmbAtom atom(const OmbString& name);
    // The atom of a constant, which keeps its number across shutdown and init.
    static OmbAtom atom(const OmbAtomConstant* constant);
    // Throws OmbXAtomsIllegalAtom for a number that names nothing.
    static OmbString name(OmbAtom atom);
    // True for a non-empty string whose first character is '#'.
    static bool isAtomString(const OmbString& text);

    // Called by the runtime: init() forgets every atom but the constants,
    // cleanUp() empties the ordinary atoms.
    static void init();
    static void cleanUp();
};

// A well-known key: resolved to its atom on first use and cached.
class OmbAtomConstant {
public:
    explicit OmbAtomConstant(const char* name) : name_(OmbString::literal(name)) {}
    OmbAtomConstant(const OmbAtomConstant& other) : atom_(other.atom_.load()), name_(other.name_) {}

    // A race only resolves the same number twice.
    operator OmbAtom() const {
        const OmbAtom known = atom_.load(std::memory_order_relaxed);
        if (known) return known;
        const OmbAtom resolved = OmbAtoms::atom(this);
        atom_.store(resolved, std::memory_order_relaxed);
        return resolved;
    }
    const OmbString& name() const noexcept { return name_; }

private:
    mutable std::atomic<OmbAtom> atom_{0};
    OmbString name_;
};
