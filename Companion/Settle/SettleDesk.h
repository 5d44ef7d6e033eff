#pragma once

#include "Conflicts/Conflict.h"
#include "Settle/SettleScenes.h"
#include "Settle/Wanted.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <vector>

namespace ovrin {

/// What is wrong with a result, and what would mend it.
struct SettleProblem : Problem {
    using Remedy = ovrin::Remedy;

    std::size_t scene; ///< as in SettleDesk::Item
};

/// The scenes of a working tree as a person settles them: one list of conflicts over all of them, one row of
/// steps, each of which is written down before the function returns. What every face shows and calls; it
/// holds nothing that must outlive it.
///
/// All functions throw Failure as SettleSession does; then nothing was decided. Only for a process without
/// other threads.
class SettleDesk {
public:
    /// `scenes` are open, and stay.
    explicit SettleDesk(SettleScenes& scenes);

    /// A conflict in the list. Those of a scene stand together, in the hierarchy's order, and those of an
    /// object too.
    struct Item {
        std::size_t scene;         ///< index among Scenes
        const OpenConflict* about; ///< stays as long as the desk
        std::size_t object;        ///< index of the first item about the same object
        bool isOpen;
        /// By a decision at this very place; nothing if one elsewhere settled it. Of an open one see
        /// kStillLoop.
        std::optional<Side> decided;
        /// Of an open one: what was decided of the same values before.
        std::optional<Side> proposed;
    };
    /// Valid until the next step, which may add items where decisions led to new conflicts.
    const std::vector<Item>& Items() const { return m_Items; }
    Sessions Scenes() const { return m_Scenes.Sessions(); }
    SettleSession& SceneOf(const Item& item) const { return *Scenes()[item.scene]; }
    /// The words and values of an item. All values, and `words` in full length.
    Conflict Describe(const Item& item) const;

    std::size_t CountOpen() const { return m_Open; }
    std::size_t CountProposed() const { return m_Proposed; }
    /// The next open item behind `from`, or ahead of it, going round; `from` itself comes last. Nothing if
    /// none is open.
    std::optional<std::size_t> NextOpen(std::size_t from) const;
    std::optional<std::size_t> PreviousOpen(std::size_t from) const;
    /// Nothing is open in any scene, and each that both sides added was looked through.
    bool IsSettled() const;
    const std::vector<SettleProblem>& Problems() const { return m_Problems; }

    /// What became of a step.
    struct Step {
        std::size_t settled = 0;  ///< conflicts that are open no more
        std::size_t followed = 0; ///< decisions that were made besides, since they follow
    };
    /// Takes a side for an item, open or settled.
    Step Take(std::size_t item, Side side);
    /// Takes a side for all open conflicts about the object of the item and what stands under it.
    Step TakeUnder(std::size_t item, Side side);
    /// Takes a side for all open conflicts of all scenes.
    Step TakeAll(Side side);
    /// Takes a scene as it is that both sides added, and in which nothing is open: it was looked through.
    Step Accept(std::size_t scene);
    /// Takes what is proposed wherever something is.
    Step TakeProposed();
    Step Mend(const SettleProblem& problem, const SettleProblem::Remedy& remedy);
    bool Undo();
    bool Redo();

    /// SettleScenes::Finish, after which finished scenes stay in the list.
    std::vector<std::string> Finish(bool overwrite, Remarks& remarks);
    const Remarks& ChangedByHand() const { return m_Scenes.ChangedByHand(); }

private:
    template <class Make> Step MakeStep(const Make& make);
    std::vector<std::uint64_t> LastSteps() const;
    void KeepFrom(const std::vector<std::uint64_t>& lastSteps);
    void ReturnTo(const std::vector<std::uint64_t>& lastSteps);
    bool GoBack(bool (*step)(Sessions));
    void Refresh();

    SettleScenes& m_Scenes;
    std::vector<std::unique_ptr<ConflictWords>> m_Words; // of each scene
    std::vector<Item> m_Items;
    std::size_t m_Open = 0, m_Proposed = 0;
    std::vector<SettleProblem> m_Problems;
};

} // namespace ovrin
