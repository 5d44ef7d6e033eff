#include "Commands/SettleInBrowser.h"

#include "Names/PrintableText.h"
#include "Settle/SceneCount.h"
#include "Settle/SceneWords.h"
#include "Settle/SettleDesk.h"
#include "Settle/Web/SettlePage.h"

#include <algorithm>
#include <iostream>

namespace ovrin {

namespace {

/// What became of the scenes, as the other ways to settle tell it.
Outcome TellEnd(const SettleScenes& scenes, const SettlePage& page, bool isAnyUnreadable) {
    const std::vector<std::string>& finished = page.Finished();
    for (const std::string& path : finished) std::cerr << Printable(path) << " is settled.\n";
    bool isAnyLeft = false;
    for (const auto& session : scenes.Sessions()) {
        if (std::ranges::find(finished, session->Source().path) != finished.end()) continue;
        isAnyLeft = true;
        std::cerr << TellCount(SceneCount::Of(*session)) << '\n';
    }
    if (isAnyLeft) std::cerr << "The decisions are kept: \"ovrin settle\" goes on where you were.\n";
    const std::string& action = scenes.Sessions().front()->Source().occasion.action;
    if (!finished.empty())
        for (const std::string& step : NextSteps(scenes.Where(), action)) std::cerr << step << '\n';
    return isAnyLeft || isAnyUnreadable ? Outcome::LeftOpen : Outcome::Done;
}

} // namespace

Outcome SettleInBrowser(SettleScenes& scenes, const PageOptions& options) {
    std::vector<SettlePage::Unreadable> unreadable;
    for (const SceneCount& scene : scenes.Unreadable()) unreadable.push_back({scene.path, scene.problem});
    if (scenes.Sessions().empty()) {
        if (unreadable.empty()) std::cerr << "No scene has open conflicts.\n";
        return unreadable.empty() ? Outcome::Done : Outcome::LeftOpen;
    }
    SettleDesk desk(scenes);
    SettlePage page(scenes, desk, unreadable);
    ServePages(options, [&](const PageRequest& request) { return page.Answer(request); });
    return TellEnd(scenes, page, !unreadable.empty());
}

} // namespace ovrin
