#include "Reading/ObjectFile.h"
#include "Reading/ObjectFileReader.h"
#include "Support/Documents.h"

#include <gtest/gtest.h>

#include <fstream>
#include <new>

#include <sys/resource.h>
#include <unistd.h>

namespace {

using namespace documents;

const char* const kLostPlace = "Error locating end of document sequence";
const char* const kNoMapping = "Document root is not a mapping";
const char* const kNoClassID = "Document has no class id";
const char* const kNoFileID = "Document has no file id";
const char* const kTwoObjects =
    "--- !o!1 &10\nGameObject:\n  m_Name: a\n--- !o!4 &-11 stripped\nTransform:\n  x: {y: 0}\n";

/// The root as read, one line for each object.
std::string Read(const std::string& text) {
    OvrinObjects objects;
    ParseYAMLString(text, objects);
    std::string shown;
    for (const auto& [key, value] : objects.GetMapping())
        shown += std::string(key->Value()) + " " + Show(value) + "\n";
    return shown;
}

std::string Objects(const std::string& documents) {
    return Read(ObjectText(documents));
}

const char* const kTwoObjectsRead =
    "10 {GameObject: {m_Name: a}, MERGE_FileID: 10, MERGE_ClassID: 1}\n"
    "-11 {Transform: {x: {y: 0}}, MERGE_FileID: -11, MERGE_ClassID: 4, MERGE_StrippedPrefab: 1}\n";

std::string Replaced(std::string text, const std::string& what, const std::string& by) {
    for (std::size_t at = 0; (at = text.find(what, at)) != std::string::npos; at += by.size())
        text.replace(at, what.size(), by);
    return text;
}

TEST(Reader, HeaderLinesBecomeEntries) {
    const std::string text = ObjectText(kTwoObjects);
    EXPECT_EQ(Read(text), kTwoObjectsRead);
    EXPECT_EQ(Read(Replaced(text, "\n", "\r\n")), kTwoObjectsRead);
    EXPECT_EQ(Read(text.substr(0, text.size() - 1)), kTwoObjectsRead) << "no final line end";
    EXPECT_EQ(Read("%YAML 1.1\n# a comment\n%TAG !o! tag:x,1:\n" + std::string(kTwoObjects)),
              kTwoObjectsRead);
    EXPECT_EQ(Objects("--- !o!1 &99999999999999999999\na: b\n"),
              "99999999999999999999 {a: b, MERGE_FileID: 99999999999999999999, MERGE_ClassID: 1}\n");
}

TEST(Reader, TheHashOfAnObjectDoesNotCoverItsHeader) {
    OvrinObjects objects;
    ParseYAMLString(ObjectText("--- !o!1 &2\na: b\n"), objects);
    const YAMLMapping* object = AsMapping(objects.GetMapping().First());
    EXPECT_EQ(object->m_Hash, Doc("a: b")->m_Hash);
    EXPECT_EQ(object->m_Line, 2u) << "the line of its tag and anchor";
    EXPECT_NE(objects.GetMapping().m_Hash, 0u);
}

TEST(Reader, AFileWithoutDocumentsIsEmpty) {
    for (const char* text :
         {"%YAML 1.1", "%YAML 1.1\n--", "%YAML 1.1\n---", "%YAML 1.1\n--- \n", "%YAML\n--- a"})
        EXPECT_EQ(Read(text), "") << text;
}

TEST(Reader, EveryFailureHasItsText) {
    const std::string noSignature =
        "File is not a valid text serialized YAML file. Make sure that Asset Serialization is set to 'Force "
        "text' in Editor Settings.";
    const auto object = [](const std::string& body) { return ObjectText("--- !o!1 &2\n" + body); };
    const std::pair<std::string, std::string> cases[] = {
        {"", noSignature},
        {"YAML 1.1\n--- !o!1 &2\na: b\n", noSignature},
        {"     %YAML 1.1\n", noSignature},
        {"    %YAML 1.1\n", "none"},
        {ObjectText("--- !o!1 &2"), kLostPlace},
        {object("- a\n"), kNoMapping},
        {object("text\n"), kNoMapping},
        {ObjectText("--- !o!1 &2\n--- !o!1 &3\na: b\n"), kNoMapping},
        {ObjectText("---      \n...\n"), kNoMapping},
        {ObjectText("--- &2\na: b\n"), kNoClassID},
        {ObjectText("--- !o!x &2\na: b\n"), kNoClassID},
        {ObjectText("--- !x &2\na: b\n"), kNoClassID},
        {"%YAML 1.1\n--- !<tag:1> &2\na: b\n", kNoClassID},
        {ObjectText("--- !o!1\na: b\n"), kNoFileID},
        {ObjectText("--- !o!1 &x\na: b\n"), kNoFileID},
        {ObjectText("--- !o!1\na: &5 b\n"), "none"},
        {object("a: {b\n"), "did not find expected ',' or '}'"},
        {object("a: 'b\n"), "found unexpected end of stream"},
        {object("a: *b\n"), "found undefined alias"},
        {object("a: &x 1\nb: &x 2\n"), "second occurrence"},
        {object("a: &x [*x]\n"), "Recursive alias"},
        {object("a: &x [*x]\nb: '"), "found unexpected end of stream"},
        {object("a: \x7f\n"), "Control characters are not allowed"},
        {object("a: \x01\n"), "Control characters are not allowed"},
        {object("a: \xff\n"), "Invalid leading UTF-8 octet"},
        {object("a: \xc3(\n"), "Invalid trailing UTF-8 octet"},
        {object("a: \xc3"), "Incomplete UTF-8 octet sequence"},
        {object("a: \xc0\x80\n"), "Invalid length of a UTF-8 sequence"},
        {object("a: \xed\xa0\x80\n"), "Invalid Unicode character"},
        {"%YAML 1.2\n%TAG !o! tag:x,1:\n--- !o!1 &2\na: b\n", "found incompatible YAML document"},
        {"%YAML 2.1\n%TAG !o! tag:x,1:\n--- !o!1 &2\na: b\n", "found incompatible YAML document"},
        {"%YAML 1.2\n%YAML 1.2\n--- !o!1 &2\na: b\n", "found incompatible YAML document"},
        {"%YAML 1.2\n--- !o!1 &2\na: {b\n", "found incompatible YAML document"},
        {"%YAML 01.01\n%TAG !o! tag:x,1:\n--- !o!1 &2\na: b\n", "none"},
        {"\xff\xfe%YAML 1.1\n--- !o!1 &2\na: b\n",
         "YAML file is not UTF-8 encoded, all files must be UTF-8 encoded for performance reasons"},
        {"\xfe\xff%YAML 1.1\n--- !o!1 &2\na: b\n",
         "YAML file is not UTF-8 encoded, all files must be UTF-8 encoded for performance reasons"}};
    for (const auto& [text, error] : cases) EXPECT_EQ(ReadError(text), error) << text;
}

TEST(Reader, PositionsCountCharactersAsBytes) {
    const auto two = [](const std::string& name) {
        return ObjectText("--- !o!1 &2\na: " + name + "\n--- !o!1 &3\nb: c\n");
    };
    EXPECT_EQ(ReadError(two("\u00E9")), kLostPlace);
    EXPECT_EQ(ReadError(two("\u00E9\u00E9\u00E9")), "did not find expected <document start>");
    EXPECT_EQ(Objects("--- !o!1 &2\na: \u65E5\u672C\n"),
              "2 {a: \u65E5\u672C, MERGE_FileID: 2, MERGE_ClassID: 1}\n");
    EXPECT_EQ(Read("\xef\xbb\xbf" + ObjectText("--- !o!1 &2\na: b\n")), Objects("--- !o!1 &2\na: b\n"));
    EXPECT_NE(ReadError("\xef\xbb\xbf" + ObjectText(kTwoObjects)), "none");
}

TEST(Reader, AHeaderThatIsNoASCIIEndsTheWalkInsteadOfTurningItBack) {
    for (int surplus = 1; surplus < 80; ++surplus) {
        std::string comment = "# ";
        for (int i = 0; i < surplus; ++i) comment += "\u00E9";
        EXPECT_NE(ReadError("%YAML 1.1\n" + comment + "\n%TAG !o! tag:x,1:\n" + kTwoObjects), "none")
            << surplus;
    }
}

/// The last of many small objects behind a header, with its line.
std::string LastOf(std::size_t count, const std::string& header, const std::string& handle) {
    std::string text = header;
    for (std::size_t i = 1; i <= count; ++i)
        text += "--- " + handle + "4 &" + std::to_string(i) + "\nT: {a: b}\n";
    OvrinObjects objects;
    ParseYAMLString(text, objects);
    const YAMLMapping::Entry last = objects.GetMapping().RawEntries()[count - 1];
    return std::string(last.key->Value()) + " at " + std::to_string(last.value->m_Line);
}

TEST(Reader, ManyDocumentsOfAnyHandleBehindAnyHeaderAreReadInLinearTime) {
    const std::string directives = "%YAML 1.1\n%TAG !x! tag:x,1:\n";
    std::string comments = directives;
    for (int i = 0; i < 60'000; ++i) comments += i % 2 ? "# c\n" : "\r\n";
    EXPECT_EQ(LastOf(30'000, directives, "!x!"), "30000 at 2");
    EXPECT_EQ(LastOf(10'000, comments, "!x!"), "10000 at 60002");
    EXPECT_EQ(LastOf(10'000, Replaced(comments, "!x!", "!o!"), "!o!"), "10000 at 60002");
    EXPECT_EQ(LastOf(1, "# &5\n" + directives + "# &6\n", "!x!"), "5 at 4");
}

TEST(Reader, TheWordStrippedCountsDirectlyBeforeTheLineEnd) {
    EXPECT_NE(Objects("--- !o!1 &2   stripped\na: b\n").find("MERGE_StrippedPrefab: 1"), std::string::npos);
    EXPECT_EQ(Objects("--- !o!1 &2\nstripped: stripped\n"),
              "2 {stripped: stripped, MERGE_FileID: 2, MERGE_ClassID: 1}\n");
    EXPECT_NE(ReadError(ObjectText("--- !o!1 &2 stripped \na: b\n")), "none");
    EXPECT_NE(ReadError(ObjectText("--- !o!1 &2 stripped # why\na: b\n")), "none");
}

TEST(Reader, ATextEndsAtItsFirstNUL) {
    const std::string text = ObjectText("--- !o!1 &2\na: b\n");
    EXPECT_EQ(ReadAndWrite(text + std::string("\0--- !o!1 &3\n{", 14)), text);
}

TEST(Reader, BehindAnEndMarkerOnlyBlanksAndCommentsMayFollow) {
    const std::string text = "--- !o!1 &2\na: b\n...\n";
    const std::string read = Objects("--- !o!1 &2\na: b\n");
    for (const char* end : {"", "\n  \t\n", "# done", "# done\n#\n \n"})
        EXPECT_EQ(Objects(text + end), read) << end;
    for (const char* end : {"x", "# done\nx\n", "--- !o!1 &3\na: b\n"})
        EXPECT_NE(ReadError(ObjectText(text + end)), "none") << end;
    for (const char* mark : {"", "\xef\xbb\xbf"}) {
        const std::string other = mark + ObjectText("--- !o!1 &2\na: \u00E9\u65E5\u672C\n...\n# \u00E9\n");
        EXPECT_EQ(ReadError(other), "none");
        EXPECT_NE(ReadError(other + "x"), "none");
    }
}

TEST(Reader, OneFileIDIsOneObject) {
    const std::string one = "--- !o!1 &2\na: b\n";
    EXPECT_EQ(Objects(one + one), Objects(one));
    EXPECT_EQ(ErrorOf([&] { Objects(one + "--- !o!1 &2\na: c\n"); }),
              "Cannot perform this operation on a YAML file with duplicate keys");
    EXPECT_EQ(ReadError(ObjectText(one + "--- !o!1 &2\na: c\n")), "none") << "noticed at the first use";
}

TEST(Reader, AliasesAreCopiesOfTheirOwn) {
    YAMLMapping* root = Doc("a: &x {k: [1, 2]}\nb: *x\nc: &s text\nd: *s\ne: &dup {q: 1, q: 2}\nf: *dup");
    EXPECT_EQ(Show(root),
              "{a: {k: [1, 2]}, b: {k: [1, 2]}, c: text, d: text, e: {q: 1, q: 2}, f: {q: 1, q: 2}}");
    EXPECT_NE(root->Get(YAMLScalar::Lookup("a")), root->Get(YAMLScalar::Lookup("b")));
}

TEST(Reader, APairWithoutAScalarKeyIsDroppedAndItsIndexCounts) {
    const YAMLMapping* mapping = Doc("[x]: 1\n{y: z}: 2\na: 3");
    EXPECT_EQ(Show(mapping), "{a: 3}");
    EXPECT_NE(mapping->m_Hash, Doc("a: 3")->m_Hash);
}

/// `levels` containers inside each other, the document's own mapping included.
std::string Nested(int levels, const std::string& core = "") {
    const std::string open(levels - 1, '['), close(levels - 1, ']');
    return ObjectText("--- !o!1 &2\na: " + open + core + close + "\n");
}

TEST(Reader, AThousandLevelsAreTheLimit) {
    const std::string tooDeep = "Document is nested too deeply";
    EXPECT_EQ(ReadError(Nested(1000)), "none");
    EXPECT_EQ(ReadError(Nested(1001)), tooDeep);
    EXPECT_EQ(ReadError(ObjectText("--- !o!1 &2\na: " + std::string(2000000, '['))), tooDeep);
    EXPECT_EQ(ReadError(ObjectText("--- !o!1 &2\na: " + std::string(2000000, '{'))), tooDeep);
}

/// The parser's time is quadratic in them, for each document.
TEST(Reader, AHundredDirectivesAreTheLimit) {
    std::string header = "%YAML 1.1\n%TAG !o! tag:t,2011:\n";
    for (int i = 2; i < 100; ++i) header += "%TAG !a" + std::to_string(i) + "! tag:t\n";
    EXPECT_EQ(ReadError(header + "--- !o!1 &2\na: 1\n"), "none");
    EXPECT_EQ(ReadError(header + "%TAG !b! tag:t\n--- !o!1 &2\na: 1\n"), "Too many directives");
}

/// The base's line of that id would be looked through for each document that has it, too.
TEST(Reader, ALongHeaderLineIsNoReasonToLookLong) {
    OvrinObjects objects, others;
    ObjectFile base(objects, {}), left(others, {});
    base.Take(ObjectText("--- !o!1 &2 " + std::string(16000000, 'x') + "\na: 1\n"));
    base.Cut(nullptr);
    std::string documents;
    for (int i = 0; i < 300; ++i) documents += "--- !o!1 &" + std::to_string(1000 + i) + "\n";
    for (int i = 0; i < 200000; ++i) documents += "--- !o!1 &2\n";
    left.Take(ObjectText(documents));
    left.Cut(&base);
    EXPECT_EQ(left.MakePieces(), 3u);
}

TEST(Reader, LevelsBehindAliasesCount) {
    const auto text = [](int inner, int outer) {
        return ObjectText("--- !o!1 &2\na: &x " + std::string(inner, '[') + std::string(inner, ']') +
                          "\nb: &y [*x ]\nc: " + std::string(outer, '[') + "*y " + std::string(outer, ']') +
                          "\n");
    };
    EXPECT_EQ(ReadError(text(500, 498)), "none");
    EXPECT_EQ(ReadError(text(500, 499)), "Document is nested too deeply");
}

TEST(Reader, AliasesToAliasesEndAtTenMillionNodes) {
    std::string text = "--- !o!1 &2\nx0: &x0 a\n";
    for (int i = 1; i < 30; ++i) {
        const std::string before = "*x" + std::to_string(i - 1);
        text += "x" + std::to_string(i) + ": &x" + std::to_string(i) + " [" + before + ", " + before + "]\n";
    }
    EXPECT_EQ(ReadError(ObjectText(text)), "Too many aliased nodes");
    // Up to x16 they stand for some 260,000 nodes.
    text.resize(text.find("x17"));
    EXPECT_EQ(ReadError(ObjectText(text)), "none");
    for (int i = 0; i < 6; ++i) text += text;
    EXPECT_EQ(ReadError(ObjectText(text)), "Too many aliased nodes") << "the whole file counts";
}

/// Reads the text with so much memory more than there is now, and ends the process.
[[noreturn]] void ReadWithin(rlim_t megabytes, std::string text) {
    std::size_t pages = 0;
    std::ifstream("/proc/self/statm") >> pages;
    const rlim_t bytes = pages * sysconf(_SC_PAGESIZE) + (megabytes << 20);
    const rlimit limit{bytes, bytes};
    setrlimit(RLIMIT_AS, &limit);
    try {
        OvrinObjects objects;
        ParseYAMLString(std::move(text), objects);
    } catch (const std::bad_alloc&) {
        _exit(1);
    } catch (const YAMLError&) {
        _exit(2);
    }
    _exit(0);
}

TEST(ReaderDeathTest, ALackOfMemoryIsToldAsWhatItIs) {
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    GTEST_SKIP() << "sanitizers need address space without end";
#endif
    const std::string text =
        Replaced(ObjectText("--- !o!1 &2\na: "), "!o!", "!x!") + std::string(8 << 20, 'x');
    EXPECT_EXIT(ReadWithin(100, text), testing::ExitedWithCode(0), "");
    for (const rlim_t megabytes : {4, 10, 14, 18, 22, 26})
        EXPECT_EXIT(ReadWithin(megabytes, text), testing::ExitedWithCode(1), "") << megabytes;
}

TEST(Reader, EveryPrefixOfAFileIsReadOrRefused) {
    const std::string text = ObjectText("--- !o!1 &2\na: [1, {b: 'c d'}]\nl:\n- \"x\\n\"\n- &z y\n--- !o!4 "
                                        "&3 stripped\nT:\n  r: {fileID: 0}\n...\n");
    int read = 0;
    for (std::size_t length = 0; length <= text.size(); ++length) {
        OvrinObjects objects;
        read += ErrorOf([&] { ParseYAMLFile(text.substr(0, length), objects); }) == "none";
    }
    EXPECT_GT(read, 0);
    EXPECT_EQ(ReadError(text), "none");
}

} // namespace
