#pragma once

#include "Review/PageRequest.h"
#include "Settle/SettleDesk.h"
#include "Settle/Web/DeskViews.h"

#include <cstdint>
#include <nlohmann/json_fwd.hpp>
#include <string>
#include <vector>

namespace ovrin {

struct PageStep;

/// A desk as pages use it: what they ask for, and the steps that they make. Several may be open: a step
/// counts only for who has seen the one before it, and the others hear that they haven't (409).
///
/// Nothing that a page sends is a path: it names conflicts, objects and scenes of the desk, and what they
/// come to is the desk's business.
class SettlePage {
public:
    /// `unreadable` are scenes that aren't on the desk, and why. The desk and its scenes must outlive the
    /// page.
    struct Unreadable {
        std::string path, problem;
    };
    SettlePage(SettleScenes& scenes, SettleDesk& desk, std::vector<Unreadable> unreadable = {});

    /// Throws Failure, before anything is done, for what can't be answered.
    PageAnswer Answer(const PageRequest& request);
    /// The scenes that were finished.
    const std::vector<std::string>& Finished() const { return m_Finished; }

private:
    PageAnswer Get(const PageRequest& request);
    PageAnswer Post(const PageRequest& request);
    nlohmann::json Session();
    nlohmann::json SceneOf(std::size_t scene);
    nlohmann::json Conflicts(const PageRequest& request) const;
    SettleDesk::Step MakeStep(const PageStep& step);
    PageAnswer GoBack(bool isRedo);
    PageAnswer Finish(bool overwrite);
    [[noreturn]] void TellNoneIsReady() const;
    PageAnswer Leave();
    PageAnswer AnswerStep(const SettleDesk::Step& step);
    bool IsFinished(std::size_t scene) const;
    void WantUnfinished(std::size_t scene) const;
    std::size_t SceneOfItem(std::size_t item) const;
    std::vector<std::string> Next() const;

    SettleScenes& m_Scenes;
    SettleDesk& m_Desk;
    DeskViews m_Views;
    const std::vector<Unreadable> m_Unreadable;
    std::vector<std::string> m_Finished;
    std::uint64_t m_Revision = 1;
};

} // namespace ovrin
