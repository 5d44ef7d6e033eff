#pragma once

#include "Conflicts/Conflict.h"
#include "Settle/SettleDesk.h"

#include <cstddef>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

namespace ovrin {

/// What stands for the name of an object at conflicts that are about none.
inline constexpr const char* kOrderOfFields = "The order of fields";

/// Where a person stands among the conflicts of a desk, and what can be done from there, for all faces of the
/// terminal. What was decided is the desk's; a step that fails is told like any other.
class Walk {
public:
    /// The desk stays. Begins at the first that is open.
    explicit Walk(SettleDesk& desk);

    const SettleDesk& Desk() const { return m_Desk; }
    /// What is to be looked at: a conflict, or a scene without any, which both sides may have added.
    struct Stop {
        std::size_t scene;
        std::optional<std::size_t> item; ///< among the desk's
    };
    const std::vector<Stop>& Stops() const { return m_Stops; }
    std::size_t At() const { return m_At; }
    const Stop& Here() const { return m_Stops[m_At]; }
    /// Null for a scene without conflicts.
    const SettleDesk::Item* ItemOf(const Stop& stop) const {
        return stop.item ? &m_Desk.Items()[*stop.item] : nullptr;
    }
    SettleSession& SceneOf(const Stop& stop) const { return *m_Desk.Scenes()[stop.scene]; }
    bool IsOpen(const Stop& stop) const;
    /// The conflict there, which is put into words once. Only for a stop with an item, until the next step.
    const Conflict& WordsOf(const Stop& stop) const;
    std::size_t CountOpen() const { return m_Open; }
    /// "Harbour/Lantern", the name of the object in one version; kOrderOfFields where there is none. Only for
    /// a stop with an item.
    std::string ObjectOf(const Stop& stop) const;
    /// "Harbour/Lantern · m_Layer", for a scene without conflicts its path; not in a form to be shown.
    std::string NameOf(const Stop& stop) const;
    /// How a side is called there: "theirs (topic)".
    std::string NameOf(const Stop& stop, Side side) const;

    void GoTo(std::size_t stop) { m_At = stop; }
    void GoToNextOpen();
    void GoToPreviousOpen();
    /// Goes to the next stop, going round, whose object, property or scene contains the text, whatever the
    /// case of ASCII letters.
    void Find(const std::string& text);

    void Take(Side side);
    void TakeWhole(Side side);
    void TakeAll(Side side);
    void TakeProposed();
    /// The remedies of all problems, counted from 0 in the order of MendableProblems.
    void Mend(std::size_t remedy);
    void Undo();
    void Redo();
    /// The desk's problems, those first that something can be done about.
    std::vector<const SettleProblem*> ProblemsInOrder() const;

    /// What a finish came to.
    struct Finished {
        std::vector<std::string> paths; ///< of the scenes that are in place
        Remarks refused;                ///< about those that are settled and are not
        Remarks changedByHand;          ///< those of them that are about files that may be overwritten
    };
    /// Nothing if it failed, which is said then.
    std::optional<Finished> Finish(bool overwrite);

    /// What became of the last request, for people; empty if there is nothing to say.
    const std::string& Said() const { return m_Said; }
    void Say(std::string words) { m_Said = std::move(words); }

private:
    std::optional<std::size_t> OpenFrom(std::size_t from, bool isForward) const;
    bool IsCalled(const Stop& stop, const std::string& text) const;
    void Refresh();
    template <class Make> bool Do(const Make& make);
    void TellStep(const std::string& what, const SettleDesk::Step& step);

    SettleDesk& m_Desk;
    std::vector<Stop> m_Stops;
    std::size_t m_At = 0;
    std::size_t m_Open = 0;
    std::string m_Said;
    mutable std::unordered_map<const OpenConflict*, Conflict> m_Words;
};

} // namespace ovrin
