#pragma once

#include "Review/PageRequest.h"
#include "Review/SceneProcess.h"
#include "Review/SceneView.h"
#include "Settle/SettleDesk.h"

#include <cstdint>
#include <memory>
#include <nlohmann/json_fwd.hpp>
#include <vector>

namespace ovrin {

/// The scenes of a desk as a page looks at them. The tree of a scene is built when something of it is asked
/// for first, and shows the conflicts as they stand. As long as the desk.
class DeskViews {
public:
    explicit DeskViews(const SettleDesk& desk) : m_Desk(desk), m_Views(desk.Scenes().size()) {}

    /// SceneView::Counts.
    nlohmann::json Counts(std::size_t scene);
    /// Answers what is asked about the scene that the query names. Nothing for other requests. Results are
    /// those of the decisions so far.
    std::optional<PageAnswer> Answer(const PageRequest& request);
    /// The list of conflicts has changed.
    void Renew() { ++m_Revision; }

private:
    struct Shown {
        std::unique_ptr<SceneView> view;
        std::uint64_t revision = 0;
        std::unique_ptr<SceneProcess> merged; ///< has the merge by the decisions of that revision
    };

    SceneView& View(std::size_t scene);
    PageAnswer AnswerMerged(std::size_t scene, const PageRequest& request);

    const SettleDesk& m_Desk;
    std::vector<Shown> m_Views;
    std::uint64_t m_Revision = 1;
};

} // namespace ovrin
