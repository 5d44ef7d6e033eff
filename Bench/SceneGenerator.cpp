#include "SceneGenerator.h"

#include "SceneEdits.h"

#include <algorithm>

namespace ovrin_bench {
namespace {

using Mode = SceneOptions::Mode;

class Generator {
public:
    Generator(const SceneOptions& options, const SceneStreams& streams)
        : m_Options(options), m_Streams(streams), m_Random(options.seed) {}

    SceneCounts Run() {
        m_Streams.base << kFileHeader;
        m_Streams.left << kFileHeader;
        m_Streams.right << kFileHeader;
        if (m_Streams.resolve) *m_Streams.resolve << "Conflict handling:\n";
        if (m_Options.mode == Mode::BigList)
            MakeBigList();
        else
            while (!IsDone()) MakeNextTree();
        return m_Counts;
    }

private:
    bool IsDone() const {
        bool bigEnough = m_Options.mode == Mode::Conflicts ||
                         (m_Options.size && m_Counts.bytes >= m_Options.size) ||
                         (m_Options.objects && m_Counts.objects >= m_Options.objects) ||
                         (!m_Options.size && !m_Options.objects);
        return bigEnough && m_Counts.conflicts >= m_Options.conflicts;
    }

    void MakeNextTree() {
        SceneTree tree = MakeTree(m_Random, m_IDs, MostEntities());
        SceneEditor editor(tree, m_Random, m_IDs);
        switch (m_Options.mode) {
        case Mode::Conflicts:
            PlaceConflicts(tree, editor, m_Options.conflicts);
            break;
        case Mode::Random:
            PlaceConflicts(tree, editor, ConflictsDue());
            EditApart(editor);
            break;
        case Mode::Disjoint:
            editor.EditFieldsTogether(m_Options.edited);
            break;
        case Mode::Remove:
        case Mode::Add:
            HalveOrEdit(tree, editor);
            break;
        case Mode::BigList:
            break;
        }
        for (const SceneSlot& slot : tree.slots) WriteSlot(slot);
    }

    /// Keeps the last trees small, so that a scene ends close to what was asked for.
    std::uint64_t MostEntities() const {
        constexpr std::uint64_t most = 24;
        constexpr std::uint64_t bytesPerEntity = 1700; // measured: about 3.6 objects of 470 bytes
        constexpr std::uint64_t objectsPerEntity = 4;
        std::uint64_t fitting = most;
        if (m_Options.size) fitting = Missing(m_Options.size, m_Counts.bytes) / bytesPerEntity;
        if (m_Options.objects)
            fitting = std::min(fitting, Missing(m_Options.objects, m_Counts.objects) / objectsPerEntity);
        return std::clamp<std::uint64_t>(fitting, 1, most);
    }

    static std::uint64_t Missing(std::uint64_t whole, std::uint64_t done) {
        return whole > done ? whole - done : 0;
    }

    void EditApart(SceneEditor& editor) {
        // A twentieth of the edits touch the structure: people move values more often than objects.
        constexpr std::uint64_t structureEdits = 20;
        editor.EditStructure(Left, m_Options.edited / structureEdits);
        editor.EditStructure(Right, m_Options.edited / structureEdits);
        editor.EditFieldsApart(m_Options.edited, m_Options.edited);
    }

    /// How many conflicts must stand in the scene by now to spread them over all of it.
    std::uint64_t ConflictsDue() const {
        std::uint64_t whole = m_Options.size ? m_Options.size : m_Options.objects;
        std::uint64_t done = m_Options.size ? m_Counts.bytes : m_Counts.objects;
        if (done >= whole) return m_Options.conflicts;
        return m_Options.conflicts / whole * done + m_Options.conflicts % whole * done / whole;
    }

    void PlaceConflicts(const SceneTree& tree, SceneEditor& editor, std::uint64_t due) {
        for (std::size_t slot = 0; slot < tree.slots.size() && m_Counts.conflicts < due; ++slot) {
            std::optional<SceneConflict> conflict = editor.MakeConflict(slot);
            if (!conflict) continue;
            if (m_Streams.resolve && m_Options.mode == Mode::Conflicts) WriteDecision(*conflict);
            ++m_Counts.conflicts;
        }
    }

    void WriteDecision(const SceneConflict& conflict) {
        constexpr std::uint64_t classWildcards = 100;  // one line in so many leaves the class open
        constexpr std::uint64_t sceneWildcards = 5000; // one line in so many stands for every object
        static const char* const words[] = {"left", "right", "base"};
        bool anyClass = m_Counts.conflicts % classWildcards == classWildcards / 2;
        bool anyObject = m_Counts.conflicts % sceneWildcards == sceneWildcards - 1;
        *m_Streams.resolve << m_Random.Pick(words) << ' '
                           << (anyObject ? "*" : std::to_string(conflict.object)) << '.'
                           << (anyClass ? "*" : conflict.className) << '.' << conflict.property << '\n';
    }

    /// Leaves every other tree, roughly, to the fuller files, so that half of the objects stand in all files.
    void HalveOrEdit(SceneTree& tree, SceneEditor& editor) {
        if (m_Halved * 2 >= m_Counts.objects + tree.slots.size()) {
            editor.EditFieldsApart(m_Options.edited, 0);
            return;
        }
        m_Halved += tree.slots.size();
        for (SceneSlot& slot : tree.slots) {
            if (m_Options.mode == Mode::Remove)
                slot.present[Right] = false;
            else
                slot.inBase = slot.present[Left] = false;
        }
    }

    void WriteSlot(const SceneSlot& slot) {
        std::string text = WrittenForm(slot.object);
        if (slot.inBase) m_Streams.base << text;
        if (slot.inBase || m_Options.mode == Mode::Add) {
            m_Counts.bytes += text.size();
            ++m_Counts.objects;
        }
        for (Side side : {Left, Right}) {
            std::string edited = slot.edited[side] ? WrittenForm(*slot.edited[side]) : text;
            if (slot.present[side]) (side == Left ? m_Streams.left : m_Streams.right) << edited;
            m_Counts.removed[side] += slot.inBase && !slot.present[side];
            m_Counts.added[side] += !slot.inBase && slot.present[side];
            m_Counts.changed[side] += slot.inBase && slot.present[side] && edited != text;
        }
    }

    void MakeBigList() {
        SceneSlot slot;
        slot.object = MakeMonoBehaviour(m_Random, m_IDs.Take(), 0);
        const std::string name = "m_Elements";
        slot.object.fields.Add(name, List());
        auto element = [this] {
            constexpr std::uint64_t differentNumbers = 500;
            if (m_Options.keyedList) return Reference(m_IDs.Take());
            return Text(std::to_string(m_Random.Below(differentNumbers)));
        };
        std::vector<SceneValue>& base = slot.object.fields.Find(name)->items;
        for (std::uint64_t i = 0; i < m_Options.listLength; ++i) base.push_back(element());
        for (Side side : {Left, Right})
            slot.Edit(side).fields.Find(name)->items = EditedList(base, m_Options.edited, m_Random, element);
        WriteSlot(slot);
    }

    const SceneOptions& m_Options;
    const SceneStreams& m_Streams;
    SceneRandom m_Random;
    SceneIDs m_IDs;
    SceneCounts m_Counts;
    std::uint64_t m_Halved = 0; // objects that only the fuller files have
};

} // namespace

SceneCounts GenerateScene(const SceneOptions& options, const SceneStreams& streams) {
    return Generator(options, streams).Run();
}

} // namespace ovrin_bench
