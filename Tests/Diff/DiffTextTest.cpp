#include "Diff/DiffText.h"
#include "Diff/YAMLDiffOutput.h"
#include "Reading/ObjectFileReader.h"
#include "Support/Diffs.h"

#include <sstream>

namespace {

using namespace diffs;

class DiffText : public RulesTest {};

std::string Text(const YAMLMappingDiff* diff) {
    std::ostringstream stream;
    YAMLDiffOutput output(stream, 2);
    OutputDiff(*diff, output);
    return stream.str();
}

std::string Text(const std::string& base, const std::string& dest) {
    return Text(DiffOf(base, dest));
}

TEST_F(DiffText, EachOperationHasItsLines) {
    EXPECT_EQ(Text("a: 1", "a: 1"), "");
    EXPECT_EQ(Text("a: 1\nb: 2", "b: 2\na: 1"), "") << "a change of the order alone";
    EXPECT_EQ(Text("a: 1", "b: x"), "  a delete\n  b add as x\n           ...\n");
    EXPECT_EQ(Text("a: 1", "a: 'it: is'"), "  a change to 'it: is'\n");
    EXPECT_EQ(Text("a: 1", "a: x"), "  a change to x\n  ...\n") << "no step for the lines of a change";
    EXPECT_EQ(Text("a: 1", "a:\n  b: 1\n  c: {d: 2}"), "  a change to b: 1\n  c: {d: 2}\n");
    EXPECT_EQ(Text("", "abc:\n  b: 1\n  c: 2"), "  abc add as b: 1\n             c: 2\n");
    EXPECT_EQ(Text("a:\n  b:\n    c: '1,'", "a:\n  b:\n    c: '2,'"),
              "  a \n      b \n          c change to 2,\n          ...\n");
}

TEST_F(DiffText, KeysStandInTheOrderOfTheDiff) {
    EXPECT_EQ(Text("z: 1\ny: 1\nx: 1", "w: '{'\nx: '{'\nz: '{'"),
              "  z change to '{'\n  y delete\n  x change to '{'\n  w add as '{'\n");
}

TEST_F(DiffText, MovesCountDeletionsPrintedSoFar) {
    const std::tuple<const char*, const char*, const char*> cases[] = {
        {"[a, b]", "[b, a]", "[2]\n    move index \"0\" to \"1\"\n    move index \"1\" to \"0\"\n"},
        {"[a, b, c]", "[c]", "[3]\n    delete index \"0\"\n    delete index \"0\"\n"},
        {"['[', b]", "['{', b]", "[2]\n    index 0 add as '{'\n"}, // the add stands for both
        {"[b]", "[b, '{']", "[1]\n    index 1 add as '{'\n"},
        {"[a, b, c, d]", "[d, '{', a]",
         "[4]\n    move index \"0\" to \"2\"\n    delete index \"2\"\n    move index \"2\" to \"0\"\n"
         "    index 1 add as '{'\n"},
        {"[{fileID: 1, x: '{'}]", "[{fileID: 1, x: '['}]", "[]\n    index 0 \n        x change to '['\n"}};
    for (const auto& [base, dest, text] : cases)
        EXPECT_EQ(Text(std::string("l: ") + base, std::string("l: ") + dest), std::string("  l ") + text)
            << base << dest;
}

TEST_F(DiffText, AnObjectIsShownWithoutItsHeader) {
    OvrinObjects objects;
    ParseYAMLString(ObjectText("--- !o!4 &2000 stripped\nTransform:\n  m_Father: {fileID: 0}\n"), objects);
    const std::string before = Show(&objects.GetMapping());
    EXPECT_EQ(Text(YAMLMappingDiff::Diff(TheRules(), Doc(""), &objects.GetMapping())),
              "  2000 add as Transform:\n                m_Father: {fileID: 0}\n");
    EXPECT_EQ(Show(&objects.GetMapping()), before);
}

TEST_F(DiffText, AnAddedObjectShowsRepeatedKeysAsTheyStand) {
    OvrinObjects objects;
    ParseYAMLString(ObjectText("--- !o!1 &5\nC:\n  a: '1,'\n  a: '2,'\n"), objects);
    EXPECT_EQ(Text(YAMLMappingDiff::Diff(TheRules(), Doc(""), &objects.GetMapping())),
              "  5 add as C:\n             a: 1,\n             a: 2,\n");
}

/// What the writer puts out for some calls; a text "+" and "-" indents and unindents, "." is the end.
std::string Piecewise(const std::vector<std::string>& calls) {
    std::ostringstream stream;
    YAMLDiffOutput output(stream, 2);
    for (const std::string& call : calls) {
        if (call == "+")
            output.Indent();
        else if (call == "-")
            output.Unindent();
        else if (call == ".")
            output.Finish();
        else
            output << call;
    }
    return stream.str();
}

TEST_F(DiffText, EveryLineIsIndentedHoweverItArrives) {
    EXPECT_EQ(Piecewise({"+", "a", "b\nc\n", "\n", "d", "-", "e\n", "f"}), "  ab\n  c\n  \n  de\nf");
    EXPECT_EQ(Piecewise({"-", "-", "a", "", "\n"}), "a\n");
    EXPECT_EQ(Piecewise({"a", "+", "\n", "b"}), "a\n  b");
}

TEST_F(DiffText, LongRunsComeOutPieceByPiece) {
    const std::string piece(511, 'x'), rest(489, 'y');
    EXPECT_EQ(Piecewise({piece + "\n"}), piece + "\n") << "the line feed right behind a full piece is seen";
    EXPECT_EQ(Piecewise({piece + "z\n"}), piece);
    EXPECT_EQ(Piecewise({piece + "z\n", ""}), piece + "z\n");
    EXPECT_EQ(Piecewise({piece + rest, "\n"}), piece + rest + "\n");
    EXPECT_EQ(Piecewise({piece + piece + rest, "\n"}), piece + piece);
    EXPECT_EQ(Piecewise({piece + piece + rest, "\n", "."}), piece + piece + rest + "\n");
    EXPECT_EQ(Piecewise({"+", piece + "z", "\na\n", "b"}), "  " + piece + "z\n  a\n  b");
    EXPECT_EQ(Piecewise({"+", piece, "\n", "a"}), "  " + piece + "\n  a");
}

} // namespace
