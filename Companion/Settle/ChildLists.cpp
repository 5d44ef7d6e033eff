#include "Settle/ChildLists.h"

#include "Conflicts/DecisionPath.h"
#include "Conflicts/SceneMerge.h"
#include "Names/ObjectBody.h"

#include <algorithm>
#include <iterator>
#include <set>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using ID = const YAMLScalar*;

const YAMLScalar* ChildrenKey() {
    return YAMLScalar::Lookup("m_Children");
}

YAMLMapping& Tree(SceneMerge& merge, Side side) {
    MergeSession& session = merge.Session();
    return (side == Side::Base   ? session.BaseObjects()
            : side == Side::Ours ? session.RightObjects()
                                 : session.LeftObjects())
        .GetMapping();
}

ID ParentIn(SceneMerge& merge, Side side, ID transform) {
    return LocalReference(BodyOf(Tree(merge, side).Get(transform)).Field(YAMLScalar::mFather));
}

std::set<ID> ChildrenIn(SceneMerge& merge, Side side, ID parent) {
    std::set<ID> children;
    for (const YAMLNode* item : ItemsOf(BodyOf(Tree(merge, side).Get(parent)).Field(ChildrenKey())))
        children.insert(LocalReference(item));
    return children;
}

/// Whether all that the side changed in the list of the parent's children is that one child.
bool ChangedOnly(SceneMerge& merge, Side side, ID parent, ID child) {
    const std::set<ID> before = ChildrenIn(merge, Side::Base, parent);
    const std::set<ID> after = ChildrenIn(merge, side, parent);
    std::vector<ID> changed;
    std::ranges::set_symmetric_difference(before, after, std::back_inserter(changed));
    return changed == std::vector{child};
}

} // namespace

std::vector<Decision> DecideChildLists(SceneMerge& merge, ID transform, Side side) {
    std::vector<Decision> decisions;
    for (const Side dropped : {Side::Ours, Side::Theirs}) {
        const ID before = ParentIn(merge, Side::Base, transform), after = ParentIn(merge, dropped, transform);
        if (dropped == side || before == after) continue;
        for (const ID parent : {before, after}) {
            if (!parent || !ChangedOnly(merge, dropped, parent, transform)) continue;
            const Path list = {parent, BodyOf(Tree(merge, dropped).Get(parent)).className, ChildrenKey()};
            decisions.push_back({DecisionPath(list), dropped == Side::Ours ? Side::Theirs : Side::Ours});
        }
    }
    return decisions;
}

} // namespace ovrin
