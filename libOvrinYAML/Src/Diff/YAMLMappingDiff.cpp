#include "Diff/YAMLMappingDiff.h"

#include "Diff/ChildPairs.h"
#include "Diff/KeyOrder.h"

#include <algorithm>
#include <exception>

namespace ovrin_yaml {

namespace {

/// The changes inside values of a mapping, which don't meet: carried out ahead of all others, on many values
/// at once.
class ChangesInside {
public:
    ChangesInside(const YAMLMappingDiff::EntryList& entries, YAMLMapping& target, const TaskRunner& run,
                  ObjectInspector inspect)
        : m_Inspect(inspect), m_States(entries.size(), State::Open),
          m_Failures(entries.size() / kGroupSize + 1) {
        RunInGroups(run, entries.size(), kGroupSize, [&](std::size_t first, std::size_t end) {
            for (std::size_t i = first; i < end; ++i) {
                if (i + kAhead < end) Prefetch(entries[i + kAhead], target);
                const auto* change = As<ChangeMappingOperation>(entries[i].operation);
                if (change && !Try(*change, entries[i].key, i, target)) return;
            }
        });
    }

    /// Whether entry `i` is carried out. Throws what it failed with; those behind it may be open then.
    bool IsDone(std::size_t i) const {
        if (m_States[i] == State::Failed) std::rethrow_exception(m_Failures[i / kGroupSize]);
        return m_States[i] == State::Done;
    }

private:
    static constexpr std::size_t kGroupSize = 256, kAhead = 8;
    enum class State : std::uint8_t { Open, Done, Failed };

    static void Prefetch(const YAMLMappingDiff::Entry& entry, const YAMLMapping& target) {
        __builtin_prefetch(entry.operation);
        target.PrefetchKey(entry.key);
    }

    bool Try(const ChangeMappingOperation& change, const YAMLScalar* key, std::size_t i,
             YAMLMapping& target) {
        try {
            Inspect(change.Change(target, key));
            m_States[i] = State::Done;
        } catch (...) {
            m_Failures[i / kGroupSize] = std::current_exception();
            m_States[i] = State::Failed;
        }
        return m_States[i] == State::Done;
    }

    /// An object that repeats a key is left to who comes across it in its turn.
    void Inspect(YAMLMapping& object) const {
        if (!m_Inspect) return;
        try {
            object.SetTraitsOfChanged(m_Inspect(object));
        } catch (const YAMLError&) {
        }
    }

    const ObjectInspector m_Inspect;
    std::vector<State> m_States;                // by entry
    std::vector<std::exception_ptr> m_Failures; // by group, each of which ends with its first
};

} // namespace

YAMLMappingDiff* YAMLMappingDiff::Diff(DiffContext& context, const YAMLMapping* base,
                                       const YAMLMapping* dest) {
    YAMLMappingDiff* diff = YAMLAlloc<YAMLMappingDiff>::create();
    ForEachChildPair(context, base, dest,
                     [&](const YAMLScalar* key, const YAMLNode* baseValue, const YAMLNode* destValue) {
                         if (const Operation* operation = CreateDiffOperation(context, baseValue, destValue))
                             diff->Add(key, operation);
                     });
    diff->m_KeyOrder = DiffKeyOrder(context.rules, base, dest);
    return diff;
}

YAMLMappingDiff* YAMLMappingDiff::Diff(const MergeRules& rules, const YAMLMapping* base,
                                       const YAMLMapping* dest) {
    DiffContext context(rules);
    return Diff(context, base, dest);
}

void YAMLMappingDiff::Add(const YAMLScalar* key, const Operation* operation) {
    const auto index = static_cast<std::uint32_t>(m_Entries.size());
    if (m_Index ? !m_Index->Insert(key, index) : HasKey(key))
        throw YAMLError("Cannot do a double change on the same key in a mapping");
    m_Entries.push_back({key, operation});
    if (!m_Index && m_Entries.size() > KeyIndex::kSearchLimit) {
        m_Index = std::make_unique<KeyIndex>();
        for (std::uint32_t i = 0; i < m_Entries.size(); ++i) m_Index->Set(m_Entries[i].key, i);
    }
}

const Operation* YAMLMappingDiff::Find(const YAMLScalar* key) const {
    const std::uint32_t index = IndexOf(key);
    return index == KeyIndex::kMissing ? nullptr : m_Entries[index].operation;
}

std::uint32_t YAMLMappingDiff::IndexOf(const YAMLScalar* key) const {
    if (m_Index) return m_Index->Find(key);
    for (std::uint32_t i = 0; i < m_Entries.size(); ++i)
        if (m_Entries[i].key == key) return i;
    return KeyIndex::kMissing;
}

bool YAMLMappingDiff::LeavesKeys() const {
    const auto changesInPlace = [](const Entry& entry) {
        const Operation::Kind kind = entry.operation->GetKind();
        return kind != Operation::Kind::Add && kind != Operation::Kind::Remove;
    };
    return (!m_KeyOrder || IsIdentityKeyOrder(m_KeyOrder)) &&
           std::all_of(m_Entries.begin(), m_Entries.end(), changesInPlace);
}

void YAMLMappingDiff::ApplyEntries(YAMLMapping& target, const TaskRunner& run,
                                   ObjectInspector inspect) const {
    if (!run) {
        for (const Entry& entry : m_Entries) entry.operation->Apply(target, entry.key);
        return;
    }
    const ChangesInside inside(m_Entries, target, run, inspect);
    for (std::size_t i = 0; i < m_Entries.size(); ++i)
        if (!inside.IsDone(i)) m_Entries[i].operation->Apply(target, m_Entries[i].key);
}

void YAMLMappingDiff::Apply(YAMLMapping& target, const TaskRunner& run, ObjectInspector inspect) const {
    if (LeavesKeys()) {
        target.RequireNormalState();
        ApplyEntries(target, run, inspect);
        return;
    }
    std::vector<const YAMLScalar*> before;
    before.reserve(target.Size());
    for (const auto& entry : target) before.push_back(entry.key);
    ApplyEntries(target, run, inspect);
    if (m_KeyOrder) ApplyKeyOrder(m_KeyOrder, before, target);
}

} // namespace ovrin_yaml
