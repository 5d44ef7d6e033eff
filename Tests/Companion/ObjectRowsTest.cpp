#include "Review/ObjectRows.h"

#include "Review/KeyedElements.h"
#include "Review/RowJson.h"

#include "Reading/ObjectFileReader.h"
#include "ReviewScene.h"

#include <gtest/gtest.h>

namespace {

using namespace review_scene;
using nlohmann::json;
using ovrin_yaml::ListRule;
using ovrin_yaml::MergeRules;
using ovrin_yaml::SequenceType;
using ovrin_yaml::YAMLScalar;

struct ObjectRowsTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }

    static const YAMLScalar* Id(const char* text) { return YAMLScalar::Lookup(text); }
    /// The elements of m_Slots are told apart by "n".
    static MergeRules Keyed() {
        MergeRules rules;
        rules.AddSequenceUniqueKeys(SequenceType::Set, {Id("*"), Id("Rack"), Id("m_Slots")}, {{Id("n")}});
        return rules;
    }
    /// The rows of an object of these fields.
    static std::string Rows(const std::string& base, const std::string& ours, const std::string& theirs,
                            MergeRules rules = {}) {
        const auto rack = [](const std::string& fields) { return Object("&10 Rack", "m_A: 1; " + fields); };
        return Viewed(rack(base), rack(ours), rack(theirs), std::move(rules)).Rows("10");
    }
};

TEST_F(ObjectRowsTest, StateTellsWhoChangedAValue) {
    const std::tuple<const char*, const char*, const char*, const char*> cases[] = {
        {"v: 1", "v: 2", "v: 1", "v number ours: 1 | 2 | 1 | 2\n"},
        {"v: 1", "v: 1", "v: 2", "v number theirs: 1 | 1 | 2 | 2\n"},
        {"v: 1", "v: 2", "v: 2", "v number both: 1 | 2 | 2 | 2\n"},
        {"v: 1", "v: 2", "v: 3", "v number open: 1 | 2 | 3 | 2\n"},
        {"v: 1", "v: a", "v: 1", "v text ours: 1 | a | 1 | a\n"},
        {"v: 1", "v: {x: 1}", "v: 1", "v other ours: 1 | {x: 1} | 1 | {x: 1}\n"},
        {"v: {x: 1, y: 1}", "v: {x: 2, y: 1}", "v: {x: 1, y: 3}",
         "v vector open: {x: 1, y: 1} | {x: 2, y: 1} | {x: 1, y: 3} | {x: 2, y: 1}\n"},
        {"v: [1]", "v: []", "v: [1]", "v list ours: [1] | [] | [1] | []\n"},
        {"v: {}", "v: {}", "v: {a: 1}", "v.a number theirs: - | - | 1 | 1\n"},
        {"v: {a: 1}", "v: {}", "v: {a: 1}", "v.a number ours: 1 | - | 1 | -\n"},
        {"v: 1", "w: 1", "v: 1", "w number ours: - | 1 | - | 1\nv number ours: 1 | - | 1 | -\n"}};
    for (const auto& [base, ours, theirs, rows] : cases) EXPECT_EQ(Rows(base, ours, theirs), rows);
}

TEST_F(ObjectRowsTest, ElementsAreFoundByTheirKeysWhereverTheyStand) {
    const auto slots = [](const std::string& elements) { return "m_Slots:" + elements; };
    EXPECT_EQ(Rows(slots("; - {n: a, v: 1}; - {n: b, v: 1}"),
                   slots("; - {n: b, v: 1}; - {n: c, v: 1}; - {n: a, v: 2}"), slots("; - {n: a, v: 1}"),
                   Keyed()),
              "m_Slots[a].v number ours: 1 | 2 | 1 | 2\n"
              "m_Slots[c].n text ours: - | c | - | c\nm_Slots[c].v number ours: - | 1 | - | 1\n"
              "m_Slots[b].n text theirs: b | b | - | -\nm_Slots[b].v number theirs: 1 | 1 | - | -\n");
}

TEST_F(ObjectRowsTest, OrderThatChangedAloneIsTold) {
    const std::string one = "m_Slots:; - {n: a}; - {n: b}", other = "m_Slots:; - {n: b}; - {n: a}";
    EXPECT_EQ(Rows(one, other, one, Keyed()), "m_Slots list ours: - {n: a}\n- {n: b} | - {n: b}\n- {n: a} | "
                                              "- {n: a}\n- {n: b} | - {n: b}\n- {n: a}\n");
}

TEST_F(ObjectRowsTest, RowsHaveABoundThatNoConflictFallsUnder) {
    const auto scene = [](int value) {
        std::string fields = "m_A: 1";
        for (int i = 0; i < 60; ++i) fields += "; m_F" + std::to_string(i) + ": " + std::to_string(value);
        return Object("&10 Rack", fields + "; m_Z: " + std::to_string(2 * value));
    };
    Viewed viewed(scene(1), scene(2), scene(3));
    const ObjectNames result(viewed.merge.Session().Result().GetMapping());
    ObjectRows rows(viewed.merge, viewed.names, result);
    std::vector<ConflictMark> marks;
    for (const OpenConflict& open : viewed.merge.Open())
        if (marks.size() < 30) marks.push_back({&open, marks.size()});
    bool isShortened = false;
    const auto found = rows.Of(Id("10"), {marks, true, 10}, isShortened);
    EXPECT_TRUE(isShortened);
    EXPECT_EQ(std::ranges::count_if(found, [](const ObjectRow& row) { return row.conflict != nullptr; }), 30);
    EXPECT_LE(found.size(), 40u);
    rows.Of(Id("10"), {{}, true, 62}, isShortened);
    EXPECT_FALSE(isShortened) << "the rows are as many as there may be";
}

TEST_F(ObjectRowsTest, LongTextsAreCutBetweenCharacters) {
    constexpr std::size_t kMost = 65'536;
    for (const std::string character : {"a", "ä", "€", "😀"})
        for (std::size_t offset = 0; offset < 4; ++offset) {
            std::string text(offset, 'x');
            while (text.size() + character.size() <= kMost) text += character;
            for (const bool isLonger : {false, true}) {
                const std::string field = "v: \"" + text + (isLonger ? character : "") + "\"";
                Viewed viewed(Object("&1 A", "v: 1"), Object("&1 A", field), Object("&1 A", "v: 1"));
                const json value = viewed.view.Object("1", false)["rows"][0]["values"]["ours"];
                EXPECT_EQ(value.value("isShortened", false), isLonger) << character << offset;
                EXPECT_TRUE(value["text"] == text) << character << offset;
            }
        }
}

TEST_F(ObjectRowsTest, ObjectThatWasRemovedIsToldAsAWhole) {
    const auto scene = [](int value) { return Object("&10 Rack", "v: " + std::to_string(value)); };
    const std::string other = Object("&20 Rack", "v: 1");
    EXPECT_EQ(Viewed(scene(1) + other, scene(2) + other, other).Rows("10"),
              " other open: there | changed v | removed | there\nv number both: 1 | 2 | - | 2\n");
    EXPECT_EQ(Viewed(other, scene(2) + other, scene(3) + other).Rows("10"), "v number open: - | 2 | 3 | 2\n");
}

struct ValueShapeTest : ObjectRowsTest {};

/// The value of "v" in an object.
struct Value {
    explicit Value(const std::string& text) {
        ovrin_yaml::ParseYAMLString(File(Object("&1 A", "v: " + text)), file);
    }
    const ovrin_yaml::YAMLNode& operator*() const {
        return *BodyOf(file.GetMapping().GetRef(YAMLScalar::Lookup("1"))).Field(YAMLScalar::Lookup("v"));
    }
    mutable ovrin_yaml::OvrinObjects file;
};

TEST_F(ValueShapeTest, IsWhatAPersonSees) {
    using Numbers = std::vector<double>;
    const std::tuple<const char*, const char*, Numbers> cases[] = {
        {"4.5", "number", {4.5}},
        {"-1e-3", "number", {-0.001}},
        {"\"7\"", "number", {7}},
        {"1e999", "text", {}},
        {"nan", "text", {}},
        {"-inf", "text", {}},
        {"0x10", "text", {}},
        {"1 2", "text", {}},
        {"\"\"", "text", {}},
        {"{x: 1, y: 2}", "vector", {1, 2}},
        {"{x: 1, y: 2, z: 3, w: 4}", "vector", {1, 2, 3, 4}},
        {"{x: 1}", "other", {1}},
        {"{y: 1, x: 2}", "other", {1, 2}},
        {"{x: 1, y: 2, z: 3, w: 4, v: 5}", "other", {1, 2, 3, 4, 5}},
        {"{x: 1, y: nan}", "vector", {}},
        {"{x: 1, y: [2]}", "other", {}},
        {"{x: 1, x: 2}", "other", {1, 2}},
        {"{r: 1, g: 0, b: 0}", "colour", {1, 0, 0}},
        {"{r: 1, g: 0, b: 0, a: 1e999}", "colour", {}},
        {"{r: 1, g: 0}", "other", {1, 0}},
        {"{fileID: 12}", "reference", {12}},
        {"{fileID: 12, guid: aa, type: 3}", "reference", {}},
        {"{}", "other", {}},
        {"[1, 2]", "list", {}},
        {"[]", "list", {}}};
    for (const auto& [text, shape, numbers] : cases) {
        const Value value(text);
        EXPECT_STREQ(ShapeName(ShapeOf(*value)), shape) << text;
        EXPECT_EQ(NumbersOf(*value), numbers) << text;
    }
}

TEST_F(ValueShapeTest, ValuesAreTheSameIfTheySayTheSame) {
    const char* const texts[] = {"1",   "1.0",          "{a: 1}",     "{a: 1, b: 1}",  "{b: 1, a: 1}",
                                 "[1]", "[1, 1]",       "[[1], [2]]", "[[1], [2, 3]]", "{}",
                                 "[]",  "{a: {b: [1]}}"};
    for (const char* one : texts)
        for (const char* other : texts) {
            const Value left(one), right(other);
            EXPECT_EQ(IsSameValue(&*left, &*right), one == other) << one << " " << other;
        }
    EXPECT_TRUE(IsSameValue(nullptr, nullptr));
    EXPECT_FALSE(IsSameValue(&*Value("{}"), nullptr));
}

struct KeyedElementsTest : ObjectRowsTest {};

TEST_F(KeyedElementsTest, AreMatchedWhereEachHasItsOwnKey) {
    const ListRule byN{SequenceType::Set, {{Id("n")}}, false};
    const Value one("[{n: a}, {n: b}]"), other("[{n: c}, {n: a}]");
    const auto match = [&](const char* last) {
        const Value value(last);
        const auto elements = MatchElements({&*one, nullptr, &*other, &*value}, byN);
        std::string text = elements ? "" : "none";
        for (const ElementIndexes& indexes : elements.value_or(std::vector<ElementIndexes>()))
            for (const int index : indexes) text += index < 0 ? "-" : std::to_string(index);
        return text;
    };
    EXPECT_EQ(match("[{n: b}, {n: d}]"), "1--0---1--0-0-1-");
    EXPECT_EQ(match("[]"), "--0-0-1-1---");
    for (const char* without :
         {"[{n: a}, {n: a}]", "[{m: a}]", "[1]", "[[]]", "{n: a}", "5", "[{n: 1, n: 2}]"})
        EXPECT_EQ(match(without), "none") << without;
    EXPECT_FALSE(MatchElements({&*one, &*one, &*one, &*one}, {SequenceType::Set, {}, false}));
}

} // namespace
