#include "Checks/ObjectChecks.h"

#include "Checks/ObjectTable.h"
#include "Scenes/InOrder.h"

#include "Repair/ComponentDependencies.h"

#include <algorithm>
#include <atomic>
#include <tuple>

// Two rounds over all objects, each by ranges on all processors:
//
//  1. What an object says of itself, and each of its references. Lists of children and components are
//  compared
//     with what those say of their parent and owner; those that are listed rightly are noted.
//  2. What an object says of its parent and owner: they must have noted it.
//
// Loops of parents are looked for at the end, on one thread: each Transform is visited once.

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using Faults = std::vector<ObjectFault>;

/// Objects whose check is worth a turn.
constexpr std::size_t kRange = 8192;

struct Range {
    std::size_t begin, end;
};

/// A note for each object, which several threads may leave.
class Notes {
public:
    explicit Notes(std::size_t count) : m_Notes(count) {}

    /// False if the note was there.
    bool Leave(std::size_t index) {
        return !std::atomic_ref(m_Notes[index]).exchange(true, std::memory_order_relaxed);
    }
    bool Has(std::size_t index) const { return m_Notes[index]; }

private:
    std::vector<std::uint8_t> m_Notes;
};

class ObjectChecks {
public:
    ObjectChecks(const Outlines& outlines, const YAMLTypeInfoManager& types)
        : m_Table(outlines), m_Types(types), m_IsListed(outlines.objects.size()),
          m_IsOwned(outlines.objects.size()) {
        std::size_t keys = 0;
        for (const ObjectOutline& object : outlines.objects) {
            m_FirstKeys.push_back(keys);
            keys += object.repeatedKeys;
        }
    }

    Faults Run() {
        Faults faults;
        OverRanges(faults, &ObjectChecks::CheckReferences);
        OverRanges(faults, &ObjectChecks::CheckOwners);
        FindLoops(faults);
        FindUnusualForm(faults);
        std::ranges::stable_sort(faults, [](const ObjectFault& a, const ObjectFault& b) {
            return std::tie(a.object, a.line, a.code) < std::tie(b.object, b.line, b.code);
        });
        return faults;
    }

private:
    using Check = void (ObjectChecks::*)(std::size_t, Faults&);

    void OverRanges(Faults& faults, Check check) {
        const std::size_t count = m_Table.All().objects.size();
        const auto checkRange = [&](std::size_t index) {
            Faults found;
            const std::size_t end = std::min(count, (index + 1) * kRange);
            for (std::size_t i = index * kRange; i < end; ++i) (this->*check)(i, found);
            return found;
        };
        ForEachInOrder((count + kRange - 1) / kRange, checkRange, [&](std::size_t, Faults found) {
            faults.insert(faults.end(), found.begin(), found.end());
        });
    }

    void CheckReferences(std::size_t index, Faults& faults);
    void CheckChild(std::size_t index, std::size_t child, const LocalReference& reference, Faults& faults);
    void CheckComponent(std::size_t index, std::size_t component, const LocalReference& reference,
                        Faults& faults);
    void CheckRequirements(std::size_t index, Faults& faults) const;
    void CheckOwners(std::size_t index, Faults& faults);
    void CheckFather(std::size_t index, Faults& faults) const;
    void CheckGameObject(std::size_t index, Faults& faults) const;
    std::uint32_t LineOfReference(const ObjectOutline& object, const YAMLScalar* field) const;
    std::size_t Above(std::size_t index) const;
    void FindLoops(Faults& faults) const;
    void FindUnusualForm(Faults& faults) const;

    const ObjectTable m_Table;
    const YAMLTypeInfoManager& m_Types;
    const YAMLScalar* const m_Children = YAMLScalar::Lookup("m_Children");
    Notes m_IsListed;                     // by the parent that the object names
    Notes m_IsOwned;                      // by the GameObject that it names
    std::vector<std::size_t> m_FirstKeys; // of the repeated keys of each object
};

void ObjectChecks::CheckReferences(std::size_t index, Faults& faults) {
    const ObjectOutline& object = m_Table.At(index);
    const bool isRepeated = m_Table.IsRepeated(index);
    if (isRepeated) faults.push_back({Code::RepeatedId, index, 0, nullptr, object.id});
    for (std::size_t i = 0; i < object.repeatedKeys; ++i) {
        const RepeatedKey& repeated = m_Table.All().repeatedKeys[m_FirstKeys[index] + i];
        faults.push_back({Code::RepeatedKey, index, repeated.line, repeated.key});
    }
    const bool hasChildren = IsTransform(object) && !isRepeated;
    const bool hasComponents = IsGameObject(object) && !isRepeated;
    for (const LocalReference& reference : m_Table.All().ReferencesOf(object)) {
        const std::size_t target = m_Table.Find(reference.target);
        if (target == ObjectTable::kNone)
            faults.push_back(
                {Code::DanglingReference, index, reference.line, reference.field, reference.target});
        else if (hasChildren && reference.field == m_Children)
            CheckChild(index, target, reference, faults);
        else if (hasComponents && reference.field == YAMLScalar::mComponent)
            CheckComponent(index, target, reference, faults);
    }
    if (hasComponents && m_Types.IsLoaded()) CheckRequirements(index, faults);
}

/// A stripped object says nothing of its parent or owner: its prefab does.
void ObjectChecks::CheckChild(std::size_t index, std::size_t child, const LocalReference& reference,
                              Faults& faults) {
    const ObjectOutline& other = m_Table.At(child);
    if (other.isStripped || !other.father) return;
    if (other.father != m_Table.At(index).id)
        faults.push_back({Code::ChildOfAnother, index, reference.line, reference.field, other.id});
    else if (!m_IsListed.Leave(child))
        faults.push_back({Code::RepeatedChild, index, reference.line, reference.field, other.id});
}

void ObjectChecks::CheckComponent(std::size_t index, std::size_t component, const LocalReference& reference,
                                  Faults& faults) {
    const ObjectOutline& other = m_Table.At(component);
    if (other.isStripped || !other.gameObject) return;
    if (other.gameObject != m_Table.At(index).id)
        faults.push_back({Code::ComponentOfAnother, index, reference.line, reference.field, other.id});
    else if (!m_IsOwned.Leave(component))
        faults.push_back({Code::RepeatedComponent, index, reference.line, reference.field, other.id});
}

/// By the same rule as the merge.
void ObjectChecks::CheckRequirements(std::size_t index, Faults& faults) const {
    std::vector<GameObjectComponent> components;
    for (const LocalReference& reference : m_Table.All().ReferencesOf(m_Table.At(index))) {
        if (reference.field != YAMLScalar::mComponent) continue;
        const ObjectOutline* component = m_Table.Get(reference.target);
        const YAMLTypeInfo* type = component ? m_Types.GetTypeInfo(component->classID) : nullptr;
        if (type) components.push_back({reference.target, type});
    }
    for (const YAMLScalar* required : UnmetRequirements(components))
        faults.push_back({Code::MissingComponent, index, 0, YAMLScalar::mComponent, required});
}

void ObjectChecks::CheckOwners(std::size_t index, Faults& faults) {
    const ObjectOutline& object = m_Table.At(index);
    if (object.isStripped || m_Table.IsRepeated(index)) return;
    if (IsTransform(object)) CheckFather(index, faults);
    if (!IsGameObject(object)) CheckGameObject(index, faults);
}

/// One that isn't there is a reference to nothing and no more; one without a list may have been left out of
/// the text.
void ObjectChecks::CheckFather(std::size_t index, Faults& faults) const {
    const ObjectOutline& object = m_Table.At(index);
    const ObjectOutline* father = RefersToSomething(object.father) ? m_Table.Get(object.father) : nullptr;
    if (!father) return;
    const std::uint32_t line = LineOfReference(object, YAMLScalar::mFather);
    if (!IsTransform(*father))
        faults.push_back({Code::FatherIsNoTransform, index, line, YAMLScalar::mFather, father->id});
    else if (!father->isStripped && father->hasChildren && !m_IsListed.Has(index))
        faults.push_back({Code::FatherLacksChild, index, line, YAMLScalar::mFather, father->id});
}

void ObjectChecks::CheckGameObject(std::size_t index, Faults& faults) const {
    const ObjectOutline& object = m_Table.At(index);
    const ObjectOutline* owner =
        RefersToSomething(object.gameObject) ? m_Table.Get(object.gameObject) : nullptr;
    if (!owner) return;
    const std::uint32_t line = LineOfReference(object, YAMLScalar::mGameObject);
    if (!IsGameObject(*owner))
        faults.push_back({Code::OwnerIsNoGameObject, index, line, YAMLScalar::mGameObject, owner->id});
    else if (!owner->isStripped && owner->hasComponents && !m_IsOwned.Has(index))
        faults.push_back({Code::ComponentNotListed, index, line, YAMLScalar::mGameObject, owner->id});
}

std::uint32_t ObjectChecks::LineOfReference(const ObjectOutline& object, const YAMLScalar* field) const {
    for (const LocalReference& reference : m_Table.All().ReferencesOf(object))
        if (reference.field == field) return reference.line;
    return 0;
}

/// The Transform that one stands under, or none.
std::size_t ObjectChecks::Above(std::size_t index) const {
    const ObjectOutline& object = m_Table.At(index);
    if (object.isStripped || !IsTransform(object) || !RefersToSomething(object.father))
        return ObjectTable::kNone;
    return m_Table.Find(object.father);
}

/// Goes up from each object to one that was visited. If that was on the same way, it is in a loop. Each loop
/// is told once, of the first of its objects in the file.
void ObjectChecks::FindLoops(Faults& faults) const {
    const std::size_t count = m_Table.All().objects.size();
    std::vector<std::uint32_t> visits(count, 0); // by which start, counted from 1
    for (std::size_t start = 0; start < count; ++start) {
        const auto way = static_cast<std::uint32_t>(start + 1);
        std::size_t at = start;
        while (at != ObjectTable::kNone && !visits[at]) {
            visits[at] = way;
            at = Above(at);
        }
        if (at == ObjectTable::kNone || visits[at] != way) continue;
        std::size_t first = at, length = 1;
        for (std::size_t next = Above(at); next != at; next = Above(next), ++length)
            first = std::min(first, next);
        const ObjectOutline& object = m_Table.At(first);
        faults.push_back({Code::ParentLoop, first, LineOfReference(object, YAMLScalar::mFather),
                          YAMLScalar::mFather, object.father, length});
    }
}

/// One for all of them: a file whose line ends were changed has nothing else.
void ObjectChecks::FindUnusualForm(Faults& faults) const {
    const auto& objects = m_Table.All().objects;
    const auto first = std::ranges::find(objects, false, &ObjectOutline::isAsWritten);
    if (first == objects.end()) return;
    faults.push_back({Code::NotAsWritten, static_cast<std::size_t>(first - objects.begin())});
}

} // namespace

std::vector<ObjectFault> CheckObjects(const Outlines& outlines, const YAMLTypeInfoManager& types) {
    return ObjectChecks(outlines, types).Run();
}

} // namespace ovrin
