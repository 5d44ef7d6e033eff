#pragma once

#include "Values/YAMLMapping.h"

#include <string>

namespace ovrin_yaml {

/// What happened to a file's objects so far, which says whose hashes must be right.
enum class TreeStage {
    Hashed, ///< read, or pre-processed: every container's hash is that of its content
    Changed ///< changes were applied or repairs made: only what is known to be unchanged has a right hash
};

/// Checks the invariants of a file's objects, below the root mapping that holds them. Returns the first fault
/// and the path to it, such as "12.Transform.m_Children.0: no value"; empty if there is none.
///
/// Checked of every value:
///  - it is there: holes stand in lists only while operations are being applied;
///  - a scalar is the interned one of its text, with that text's hash;
///  - a mapping finds each of its keys where it stands, once, by its index if it has one; it counts the pairs
///    that were removed right; and in the state of repeated keys it has neither index nor removed pairs;
///  - the hash of a container is the fold of its children's, where the stage asks for it.
///
/// Changes leave hashes stale, without a mark: one would cost each change and each node. So in the stage
/// Changed the hashes count that can be known to be right, those of the objects that nobody may have changed:
/// shared ones, and ones whose source bytes or traits are known (YAMLMapping::IsKnownUnchanged). One that was
/// changed in place nevertheless is noticed by them. Three hashes count as right:
///  - the reader's, which leaves out the entries of an object's header;
///  - that of RebuildHash, which takes them in;
///  - 0 of a mapping in the state of repeated keys, which RebuildHash gives.
/// Where the reader dropped pairs that its hash covers (an equal pair that was there already, a key that is
/// no scalar) nothing is checked. The root's own hash is never asked for.
///
/// Of an object with source bytes, the writer must give the same bytes.
std::string CheckTree(const YAMLMapping& root, TreeStage stage);

} // namespace ovrin_yaml
