#pragma once

#include "Settle/Terminal/Letters.h"
#include "Settle/Terminal/StyledText.h"

#include "Conflicts/OpenMerge.h"

#include <array>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <vector>

namespace ovrin {

/// A key that was pressed: a character, or one of those that write none.
enum class Key : std::uint32_t {
    Up = 0x110000,
    Down,
    Left,
    Right,
    PageUp,
    PageDown,
    Home,
    End,
    Enter,
    Escape,
    Tab,
    BackTab,
    Erase,
    Redraw, ///< the screen has another size, or is to be drawn anew
    Unknown,
};
constexpr Key KeyOf(char letter) {
    return static_cast<Key>(static_cast<unsigned char>(letter));
}

/// What a person can ask for.
enum class Request : std::uint8_t {
    NextOpen,
    PreviousOpen,
    Ours,
    Theirs,
    Base,
    WholeOurs,
    WholeTheirs,
    WholeBase,
    All,
    Proposed,
    Remedy, ///< of a number, which is the key
    Undo,
    Redo,
    Search,
    Help,
    Finish,
    Leave,
    Up,
    Down,
    First,
    Last,
    SideBefore,
    SideBehind,
    Confirm,
    ViewOn,
    ViewBack,
};

/// A request and the keys for it: of this table all help is made, and what is always in sight.
struct KeyEntry {
    Request request;
    std::array<Key, 3> keys; ///< 0 for none
    const char* shown;       ///< the keys for people; null for those that the entry ahead tells of
    const char* label;       ///< for the line at the bottom; null for what stands in the help alone
    const char* help;
    bool isForPrompts; ///< has a sense without a screen
};
std::span<const KeyEntry> KeyTable();

/// What a key asks for.
std::optional<Request> RequestOf(Key key);
/// Whether it has a sense without a screen.
bool IsForPrompts(Request request);
/// The side of a request that takes one.
std::optional<Side> SideOf(Request request);
/// The side that the letter stands for.
std::optional<Side> SideOf(Key key);
/// The letter of a side.
char LetterOf(Side side);

/// The keys in lines of so many columns.
std::vector<StyledLine> KeyLines(std::size_t columns, const Letters& letters);
/// All of them with what they do, a line or more each; for prompts without those that need a screen.
std::vector<StyledLine> HelpLines(std::size_t columns, const Letters& letters, bool isForPrompts);

} // namespace ovrin
