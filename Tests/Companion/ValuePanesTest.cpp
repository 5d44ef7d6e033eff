#include "Settle/Terminal/ValuePanes.h"

#include "TerminalScene.h"

#include <gtest/gtest.h>

namespace {

using namespace open_scenes;

struct ValuePanesTest : TerminalScene {
    /// The lines of base, ours and theirs with brackets around what stands out, ahead of them what was done.
    std::vector<std::string> Sides(const ThreeTexts& texts, std::size_t columns = 80) {
        Unmerge("a.ovrin", texts);
        Begin();
        std::vector<std::string> told;
        const auto sides = walk->Here().item ? SideTextsOf(*walk, walk->Here(), letters, columns)
                                             : AddedObjectsOf(*walk, walk->Here(), letters, columns);
        for (const SideText& side : sides) {
            told.push_back(side.what.empty() ? "" : "<" + TextOf(side.what) + ">");
            for (const StyledLine& line : side.lines) {
                if (&line != side.lines.data()) told.back() += "/";
                for (const StyledSpan& span : line)
                    told.back() += span.style == Style::Difference ? "[" + span.text + "]" : span.text;
            }
        }
        return told;
    }
    static ThreeTexts Notes(const std::string& base, const std::string& ours, const std::string& theirs) {
        const auto scene = [](const std::string& note) {
            return kHeader + Object(10, "1", "Lantern") + (note.empty() ? "" : "  m_Note: " + note + "\n");
        };
        return {scene(base), scene(ours), scene(theirs)};
    }
};

using Texts = std::vector<std::string>;

TEST_F(ValuePanesTest, WhatASideAloneHasStandsOut) {
    EXPECT_EQ(Sides(Notes("the keeper lights it", "the keeper leaves it", "a keeper lights it")),
              (Texts{"[the] keeper [lights] it", "the keeper [leaves] it", "[a] keeper lights it"}));
    EXPECT_EQ(Sides(Notes("4.5", "4.25", "-4.5")), (Texts{"[4.5]", "[4.25]", "[-4.5]"}));
    EXPECT_EQ(Sides(Notes("\"a\\nb\\nc\"", "\"a\\nx\\nc\"", "\"a\\nb\\nd\"")),
              (Texts{"a/[b]/[c]", "a/[x]/c", "a/b/[d]"}));
}

TEST_F(ValuePanesTest, WhereASideHasNoValueTheOthersAreComparedAndItsDeedIsTold) {
    EXPECT_EQ(Sides(Notes("", "one two", "one three")), (Texts{"<none>", "one [two]", "one [three]"}));
    EXPECT_EQ(Sides(Notes("one two", "one three", "")), (Texts{"one [two]", "one [three]", "<removed>"}));
    const Texts whole = Sides({kHeader + Object(10, "1", "A"), kHeader + Object(10, "2", "A"), kHeader});
    EXPECT_EQ(whole[1].substr(0, 17), "<changed m_Layer>");
    EXPECT_EQ(whole[2], "<removed>");
}

TEST_F(ValuePanesTest, LongWordsAndLinesKeepTheirMarksWhereTheyAreBroken) {
    const Texts sides = Sides(Notes("aaaaaaaaaa x", "aaaaaaaaaa bbbbbbbbbbbbb", "aaaaaaaaaa y"), 10);
    EXPECT_EQ(sides, (Texts{"aaaaaaaaaa/[x]", "aaaaaaaaaa/[bbbbbbbbbb]/[bbb]", "aaaaaaaaaa/[y]"}));
}

TEST_F(ValuePanesTest, ObjectsThatEachSideAddedAreListed) {
    const std::string both = kHeader + Object(10, "1", "Lantern");
    EXPECT_EQ(
        Sides({"", both + Object(20, "1", "Buoy"), both + Object(30, "1", "Pier") + Object(40, "1", "Boat")}),
        (Texts{"<no such scene>", "<1 object of its own>Buoy", "<2 objects of its own>Pier/Boat"}));
}

TEST_F(ValuePanesTest, AnyScrollInAnyRoomIsBroughtBack) {
    std::string note = "\"";
    for (int line = 0; line < 90; ++line) note += "line" + std::to_string(line) + "\\n";
    Unmerge("a.ovrin", Notes(note + "x\"", note + "y\"", note + "z\""));
    Begin();
    for (const std::size_t columns : {1, 20, 50, 95, 96, 200})
        for (const std::size_t rows : {1, 5, 9, 10, 20, 120}) {
            ValuePanes panes(*walk, letters, columns);
            for (ValuePanes::Scroll scroll :
                 {ValuePanes::Scroll(), ValuePanes::Scroll(0), ValuePanes::Scroll(100000)}) {
                const auto lines = panes.Draw(rows, scroll, Side::Ours);
                ASSERT_EQ(lines.size(), rows);
                for (const StyledLine& line : lines) EXPECT_EQ(ColumnsOf(line), columns);
                EXPECT_LE(scroll.value_or(0), 91 * 8);
                EXPECT_TRUE(panes.Page() >= 1 && panes.Page() <= rows) << rows << " " << columns;
                const ValuePanes::Scroll before = scroll;
                panes.Draw(rows, scroll, {});
                EXPECT_EQ(scroll, before);
            }
        }
}

} // namespace
