#pragma once

#include "Values/ObjectTrait.h"

#include <cstddef>
#include <cstdint>

namespace ovrin_yaml {

/// How object files are read. What they mean doesn't depend on it: tests and benchmarks switch parts off.
struct ReaderOptions {
    bool fast = true;  ///< read documents in written form without libyaml
    bool share = true; ///< share the objects of documents that are the same in two files, to the letter
    /// Looks at each object right after the fast reader has read it, while it is at hand; what it returns is
    /// kept as YAMLMapping::Traits.
    ObjectInspector inspect = nullptr;
    /// Objects with one of these traits are never shared.
    std::uint8_t unshared = 0;
    /// Build no tree of an object that all files have in the same words before somebody asks for it. Its
    /// traits are those of ObjectTrait.
    bool recognise = false;
    /// Bytes of a file that is read along the base which are in memory at once, where its documents allow.
    /// Big enough to make calls cheap, small enough to stay in the cache.
    std::size_t window = std::size_t{1} << 20;
};

} // namespace ovrin_yaml
