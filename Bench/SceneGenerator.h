#pragma once

#include <cstddef>
#include <cstdint>
#include <ostream>

namespace ovrin_bench {

/// What to generate. A scene ends with the first tree of objects that reaches `size` or `objects`, whichever
/// is set.
struct SceneOptions {
    enum class Mode {
        Random, ///< both sides edit fields and structure, apart from each other but for `conflicts` conflicts
        Disjoint,  ///< every edited object is edited on both sides, in different fields
        BigList,   ///< one list of `listLength` elements, in which both sides insert, remove and move
        Conflicts, ///< `conflicts` objects that both sides gave different values; ends with the last conflict
        Remove,    ///< the right side lacks half of the objects; the left edits the others
        Add        ///< the right side has twice the objects; the left edits those of the base
    };

    Mode mode = Mode::Random;
    std::uint64_t seed = 1;
    std::uint64_t size = 0;       ///< bytes of base (of the fuller of the files, for Remove and Add)
    std::uint64_t objects = 0;    ///< the same as a number of objects
    std::uint64_t edited = 10000; ///< objects (elements, for BigList) edited per side, in parts of a million
    std::uint64_t conflicts = 0;
    std::uint64_t listLength = 0;
    bool keyedList = true; ///< elements are references; otherwise numbers, many of them equal
};

/// Where the files go. `resolve` may be null; only Mode::Conflicts writes it: a resolve file with one line
/// for each conflict, of which some hold wildcards.
struct SceneStreams {
    std::ostream& base;
    std::ostream& left;
    std::ostream& right;
    std::ostream* resolve = nullptr;
};

/// What came out. The arrays count by side, left first.
struct SceneCounts {
    std::uint64_t bytes = 0;   ///< of base (see SceneOptions::size)
    std::uint64_t objects = 0; ///< likewise
    std::uint64_t changed[2] = {0, 0};
    std::uint64_t added[2] = {0, 0};
    std::uint64_t removed[2] = {0, 0};
    std::uint64_t conflicts = 0;
};

/// Writes three object files in written form. The same options give the same bytes on every machine. Memory
/// doesn't grow with the scene, except for BigList.
SceneCounts GenerateScene(const SceneOptions& options, const SceneStreams& streams);

} // namespace ovrin_bench
