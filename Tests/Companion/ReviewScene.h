#pragma once

#include "Review/SceneView.h"

#include <nlohmann/json.hpp>
#include <string>
#include <vector>

/// Scenes of few objects, and the views of their merges.
namespace review_scene {

using namespace ovrin;

/// "&10 GameObject" with a line for each field, which stand apart by "; ".
inline std::string Object(const std::string& head, const std::string& fields) {
    const std::size_t space = head.find(' ');
    std::string text = "--- !o!1 " + head.substr(0, space) + "\n" + head.substr(space + 1) + ":\n  ";
    for (std::size_t i = 0; i < fields.size(); ++i)
        text += fields.compare(i, 2, "; ") == 0 ? (++i, std::string("\n  ")) : std::string(1, fields[i]);
    return text + "\n";
}

/// A GameObject of that id and name with a Transform, whose id is the next and whose fields are added.
inline std::string Place(int id, const std::string& name, int father = 0,
                         const std::vector<int>& children = {}, const std::string& fields = "",
                         const std::string& more = "") {
    const std::string own = std::to_string(id), transform = std::to_string(id + 1);
    std::string list;
    for (const int child : children)
        list += (list.empty() ? "" : ", ") + ("{fileID: " + std::to_string(child)) + "}";
    return Object("&" + own + " GameObject",
                  "m_Component: [{component: {fileID: " + transform + "}}]; m_Name: " + name + more) +
           Object("&" + transform + " Transform", "m_GameObject: {fileID: " + own +
                                                      "}; m_Father: {fileID: " + std::to_string(father) +
                                                      "}; m_Children: [" + list + "]" + fields);
}

inline std::string File(const std::string& objects) {
    return "%YAML 1.1\n%TAG !o! tag:test,2011:\n" + objects;
}

/// A merge of three files of objects with its views; all open conflicts are known to them.
struct Viewed {
    Viewed(const std::string& base, const std::string& ours, const std::string& theirs,
           ovrin_yaml::MergeRules rules = {})
        : merge({File(base), File(ours), File(theirs)}, std::move(rules)),
          names((merge.Merge(), merge.Session())), view(merge, names) {
        std::vector<ConflictMark> marks;
        for (const OpenConflict& open : merge.Open()) marks.push_back({&open, marks.size()});
        view.SetConflicts(marks);
    }

    /// A line for each node below a parent: its name, mark and author, and the conflicts at and below it.
    std::string Tree(bool touchedOnly = false, const std::string& parent = "",
                     const std::string& indent = "") {
        std::string text;
        const nlohmann::json page = view.Tree(parent, {0, 1000}, touchedOnly);
        for (const auto& node : page["nodes"]) {
            text += indent + std::string(node["name"]) + " " + std::string(node["mark"]);
            if (!node["by"].is_null()) text += " by " + std::string(node["by"]);
            if (node["open"] != 0) text += " open " + node["open"].dump();
            text += "\n" + Tree(touchedOnly, node["id"], indent + " ");
        }
        return text;
    }

    /// A line for each row of an object: "property type state: base | ours | theirs | result".
    std::string Rows(const std::string& id, bool all = false) {
        std::string text;
        const nlohmann::json object = view.Object(id, all);
        for (const auto& row : object["rows"]) {
            text += std::string(row["property"]) + " " + std::string(row["type"]) + " " +
                    std::string(row["state"]) + ":";
            for (const char* version : {"base", "ours", "theirs", "result"}) {
                const auto& value = row["values"][version];
                text +=
                    (text.back() == ':' ? " " : " | ") + (value.is_null() ? "-" : std::string(value["text"]));
            }
            text += "\n";
        }
        return text;
    }

    SceneMerge merge;
    MergeNames names;
    SceneView view;
};

} // namespace review_scene
