#include "Changes/ChangeJson.h"

#include <nlohmann/json.hpp>

namespace ovrin {

namespace {

using Json = nlohmann::ordered_json;

const char* WordOf(ChangeKind kind) {
    static constexpr const char* kWords[] = {"added", "removed", "changed", "moved"};
    return kWords[static_cast<std::size_t>(kind)];
}

const char* WordOf(FileStatus status) {
    static constexpr const char* kWords[] = {"added", "removed", "changed", "renamed", "copied", "unmerged"};
    return kWords[static_cast<std::size_t>(status)];
}

Json ToJson(const PropertyChange& change) {
    Json json = {{"place", change.place}, {"change", WordOf(change.kind)}};
    if (change.kind != ChangeKind::Added) json["before"] = change.before;
    if (change.kind != ChangeKind::Removed) json["after"] = change.after;
    return json;
}

Json ToJson(const ObjectChange& change) {
    Json json = {{"id", change.id},
                 {"name", change.name},
                 {"change", WordOf(change.kind)},
                 {"isMoved", change.isMoved}};
    if (change.isMoved) json["formerParent"] = change.formerParent;
    json["properties"] = Json::array();
    for (const PropertyChange& property : change.properties) json["properties"].push_back(ToJson(property));
    return json;
}

Json ToJson(const FileChange& change) {
    Json json = {{"path", change.file.newPath}};
    if (change.file.oldPath != change.file.newPath) json["oldPath"] = change.file.oldPath;
    json["status"] = WordOf(change.file.status);
    json["isScene"] = change.scene.has_value();
    if (!change.reason.empty()) json["reason"] = change.reason;
    if (!change.scene) return json;
    const SceneChange& scene = *change.scene;
    json.update(Json{{"added", scene.added},
                     {"removed", scene.removed},
                     {"changed", scene.changed},
                     {"moved", scene.moved}});
    json["objects"] = Json::array();
    for (const ObjectChange& object : scene.objects) json["objects"].push_back(ToJson(object));
    return json;
}

} // namespace

std::string ChangeJson(std::span<const FileChange> changes) {
    Json files = Json::array();
    for (const FileChange& change : changes) files.push_back(ToJson(change));
    // Paths may be of bytes that are no text.
    return Json{{"files", files}}.dump(2, ' ', false, Json::error_handler_t::replace) + "\n";
}

} // namespace ovrin
