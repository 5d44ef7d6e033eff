#include "Diff/CreateDiffOperation.h"

#include "Diff/DiffContext.h"
#include "Diff/SequenceMatching.h"
#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLSequence.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace ovrin_yaml {

namespace {

/// The hash of an object that is unbuilt comes with its tree.
std::uint32_t HashOf(const YAMLNode& node) {
    if (const YAMLMapping* mapping = AsMapping(&node)) mapping->NeedTree();
    return node.m_Hash;
}

void RequireNormalState(const YAMLNode* node) {
    if (const YAMLMapping* mapping = AsMapping(node)) mapping->RequireNormalState();
}

/// Whether two floats differ by less than the larger of the two bounds, in single precision throughout. A
/// bound that is not greater than zero switches the tolerance off.
bool WithinTolerance(float a, float b, const Tolerance& tolerance) {
    const auto [relative, absolute] = tolerance;
    if (!(relative > 0) || !(absolute > 0)) return false;
    if (a == b) return true;
    const float magnitude = std::min(std::fabs(a) + std::fabs(b), std::numeric_limits<float>::max());
    return std::max(absolute, relative * magnitude) > std::fabs(a - b);
}

/// A reference is written in flow style and changes as a whole, but for its file id.
bool IsMergeableByStyle(const YAMLMapping* base, const YAMLMapping* dest) {
    if (!base->m_Flow && !dest->m_Flow) return true;
    return base->HasKey(YAMLScalar::fileID) || dest->HasKey(YAMLScalar::fileID);
}

bool IsMergeableMapping(const DiffContext& context, const YAMLMapping* base, const YAMLMapping* dest) {
    if (const auto mergeable = context.rules.FindExclusion(context.path, dest)) return *mergeable;
    if (const auto mergeable = context.rules.FindExclusion(context.path)) return *mergeable;
    return IsMergeableByStyle(base, dest);
}

/// A component whose script changed is another component: its fields can't be combined with the other side's.
bool HasNewScript(const Path& path, const YAMLMappingDiff* diff) {
    return path.size() == 2 && path[1] == YAMLScalar::monoBehaviour && diff->HasKey(YAMLScalar::mScript);
}

const Operation* DiffMappings(DiffContext& context, const YAMLMapping* base, const YAMLMapping* dest) {
    YAMLMappingDiff* diff = YAMLMappingDiff::Diff(context, base, dest);
    if (diff->Entries().empty()) {
        YAMLAlloc<YAMLMappingDiff>::free(diff);
        return nullptr;
    }
    const bool mergeable = IsMergeableMapping(context, base, dest) && !HasNewScript(context.path, diff);
    return YAMLAlloc<ChangeMappingOperation>::create(diff, mergeable);
}

const Operation* DiffSequences(DiffContext& context, const YAMLSequence* base, const YAMLSequence* dest) {
    const YAMLSequenceRemapper* remapper = FindMapping(context, base, dest);
    YAMLSequenceDiff* diff =
        remapper ? YAMLSequenceDiff::Diff(context, remapper->Arrange(base->m_Items), dest->m_Items)
                 : YAMLSequenceDiff::Diff(context, base->m_Items, dest->m_Items);
    if (!remapper && diff->Entries().empty()) {
        YAMLAlloc<YAMLSequenceDiff>::free(diff);
        return nullptr;
    }
    return YAMLAlloc<ChangeSequenceOperation>::create(diff, remapper,
                                                      context.rules.IsMergeablePath(context.path, dest));
}

} // namespace

bool ScalarsDiffer(const DiffContext& context, const YAMLScalar* base, const YAMLScalar* dest) {
    const std::optional<Tolerance> tolerance = context.rules.FindTolerance(context.path);
    return !tolerance || !WithinTolerance(base->GetFloatValue(), dest->GetFloatValue(), *tolerance);
}

bool CountAsEqual(const YAMLNode* base, const YAMLNode* dest) {
    if (base == dest) return true;
    if (!base || !dest || HashOf(*base) != HashOf(*dest)) return false;
    // A rebuilt hash says nothing of repeated keys, and what they hold must not get lost.
    if (base->m_Hash == 0) {
        RequireNormalState(base);
        RequireNormalState(dest);
    }
    return true;
}

const Operation* CreateDiffOperation(DiffContext& context, const YAMLNode* base, const YAMLNode* dest) {
    if (base == dest) return nullptr;
    if (!dest) return YAMLAlloc<RemoveOperation>::create(context.rules.IsMergeablePath(context.path, base));
    if (!base)
        return YAMLAlloc<AddOperation>::create(dest, context.rules.IsMergeablePath(context.path, dest));
    if (CountAsEqual(base, dest)) return nullptr;
    if (base->GetKind() != dest->GetKind()) return YAMLAlloc<ChangeOperation>::create(dest);
    switch (base->GetKind()) {
    case YAMLNode::Kind::Scalar:
        if (!ScalarsDiffer(context, AsScalar(base), AsScalar(dest))) return nullptr;
        return YAMLAlloc<ChangeOperation>::create(dest);
    case YAMLNode::Kind::Mapping:
        return DiffMappings(context, AsMapping(base), AsMapping(dest));
    case YAMLNode::Kind::Sequence:
        return DiffSequences(context, AsSequence(base), AsSequence(dest));
    }
    throw YAMLError("Cannot diff unknown yaml value");
}

} // namespace ovrin_yaml
