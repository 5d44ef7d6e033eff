#pragma once

#include "OpenScenes.h"
#include "Settle/Terminal/Screen.h"

#include <clocale>
#include <optional>
#include <string>
#include <vector>

namespace open_scenes {

/// A person at a terminal in such a repository.
struct TerminalScene : UnmergedFolder {
    TerminalScene() { std::setlocale(LC_CTYPE, "C.UTF-8"); }
    ~TerminalScene() override { std::setlocale(LC_CTYPE, "C"); }

    void Begin() {
        scenes.emplace(remarks);
        ASSERT_EQ(scenes->Open(remarks), 0) << remarks[0];
        desk.emplace(*scenes);
        walk.emplace(*desk);
        screen.emplace(*walk, letters);
    }
    std::vector<std::string> Picture(Extent extent = Screen::kLeast) {
        std::vector<std::string> texts;
        for (const StyledLine& line : screen->Draw(extent)) {
            EXPECT_EQ(ColumnsOf(line), extent.columns);
            texts.push_back(TextOf(line).substr(0, TextOf(line).find_last_not_of(' ') + 1));
        }
        EXPECT_EQ(texts.size(), extent.rows);
        return texts;
    }
    /// The picture as one text, after these keys.
    std::string After(const std::string& keys, Extent extent = Screen::kLeast) {
        Picture(extent);
        for (const char key : keys) screen->Press(key == '\n' ? Key::Enter : KeyOf(key));
        std::string text;
        for (const std::string& line : Picture(extent)) text += line + '\n';
        return text;
    }

    Remarks remarks;
    const Letters letters = Letters(true);
    std::optional<SettleScenes> scenes;
    std::optional<SettleDesk> desk;
    std::optional<Walk> walk;
    std::optional<Screen> screen;
};

} // namespace open_scenes
