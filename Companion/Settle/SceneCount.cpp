#include "Settle/SceneCount.h"

#include "Conflicts/ConflictReport.h"
#include "Names/PrintableText.h"
#include "Settle/SettleSession.h"

#include <nlohmann/json.hpp>

namespace ovrin {

using nlohmann::json;

namespace {

std::string TellOccasion(const Occasion& occasion) {
    std::string text = occasion.action;
    const auto add = [&](const char* words, const std::string& label) {
        if (!label.empty()) text += (text.empty() ? "" : ", ") + (words + Printable(label));
    };
    add("ours is ", occasion.ours);
    add("theirs is ", occasion.theirs);
    return text;
}

json OrNull(const std::string& label) {
    return label.empty() ? json() : json(label);
}

} // namespace

SceneCount SceneCount::Of(const SettleSession& session) {
    const std::size_t open = session.Open().size();
    return {session.Source().path,     session.Source().occasion,    open,
            session.CountMet() - open, session.Source().isBothAdded, ""};
}

SceneCount SceneCount::Of(const OpenMerge& merge, const Progress& progress) {
    return {merge.path,        merge.occasion,
            progress.open,     merge.conflicts > progress.open ? merge.conflicts - progress.open : 0,
            merge.isBothAdded, ""};
}

std::string TellCount(const SceneCount& count) {
    std::string text = Printable(count.path) + ": ";
    if (!count.problem.empty()) return text + count.problem;
    text += CountOpen(count.open);
    if (count.settled) text += ", " + std::to_string(count.settled) + " settled";
    if (count.isBothAdded) text += ", both sides added the scene";
    const std::string occasion = TellOccasion(count.occasion);
    return occasion.empty() ? text : text + " (" + occasion + ")";
}

json ToJson(const SceneCount& count) {
    const Occasion& occasion = count.occasion;
    return {{"path", count.path},
            {"action", OrNull(occasion.action)},
            {"base", OrNull(occasion.base)},
            {"ours", OrNull(occasion.ours)},
            {"theirs", OrNull(occasion.theirs)},
            {"bothAdded", count.isBothAdded},
            {"open", count.open},
            {"settled", count.settled},
            {"problem", OrNull(count.problem)}};
}

} // namespace ovrin
