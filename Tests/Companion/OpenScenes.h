#pragma once

#include "Settle/SettleDesk.h"
#include "Support/GitFolder.h"

#include <array>
#include <memory>
#include <string>

/// Scenes whose merge needs a person.
namespace open_scenes {

using namespace ovrin;

inline const std::string kHeader = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";
inline constexpr const char* kRules = OVRIN_SOURCE_DIR "/Src/Data/mergerules.txt";

/// A GameObject of few fields.
inline std::string Object(int id, const std::string& layer, const std::string& name) {
    return "--- !o!1 &" + std::to_string(id) + "\nGameObject:\n  m_Layer: " + layer + "\n  m_Name: " + name +
           "\n";
}

/// A layer, and an object that theirs has removed.
inline ThreeTexts TwoConflicts() {
    return {kHeader + Object(10, "1", "Lantern") + Object(20, "1", "Buoy"),
            kHeader + Object(10, "5", "Lantern") + Object(20, "7", "Buoy"),
            kHeader + Object(10, "2", "Lantern")};
}

inline OpenMerge MergeOf(const ThreeTexts& texts, const std::string& path = "a.ovrin") {
    OpenMerge merge;
    merge.path = path;
    merge.occasion = {.action = "merge", .base = "", .ours = "main", .theirs = "topic", .head = ""};
    merge.isBothAdded = texts.base.empty();
    merge.rules = kRules;
    merge.texts = texts;
    return merge;
}

inline std::unique_ptr<SettleSession> SessionOf(const ThreeTexts& texts, const Progress& progress = {}) {
    return std::make_unique<SettleSession>(MergeOf(texts), progress);
}

/// A repository whose index holds scenes unmerged, as a merge that stopped leaves them.
struct UnmergedFolder : GitFolder {
    UnmergedFolder() { ovrin_yaml::initialize(); }

    /// As another program left the merge: its file is ours, and nothing is written down.
    void Unmerge(const std::string& name, const ThreeTexts& texts) const {
        folder.Write(name, texts.ours);
        std::string entries = "0 " + std::string(40, '0') + "\t" + name + "\n";
        int stage = 0;
        for (const std::string& text : {texts.base, texts.ours, texts.theirs}) {
            ++stage;
            if (text.empty()) continue;
            const std::string object = OutputOf({"git", "hash-object", "-w", "--stdin"}, {.input = text});
            entries += "100644 " + object.substr(0, object.find('\n')) + " " + std::to_string(stage) + "\t" +
                       name + "\n";
        }
        OutputOf({"git", "update-index", "--index-info"}, {.input = entries});
    }
    /// The same with a record.
    void Record(const std::string& name, const ThreeTexts& texts) const {
        Unmerge(name, texts);
        OpenMerge merge = MergeOf(texts, name);
        merge.conflicts = SettleSession(merge).Open().size();
        OpenMerges(Found()).Add(merge);
    }
    /// The files that are unmerged still, a line each.
    static std::string Unmerged() { return Git({"diff", "--name-only", "--diff-filter=U"}); }

    const surroundings::Variable rules{"OVRIN_RULES", kRules};
};

} // namespace open_scenes
