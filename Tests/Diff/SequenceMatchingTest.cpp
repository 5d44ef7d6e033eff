#include "Diff/SequenceMatching.h"
#include "Diff/DiffContext.h"
#include "Support/Diffs.h"
#include "Support/Trees.h"

#include <algorithm>
#include <random>

namespace {

using namespace diffs;

class SequenceMatching : public RulesTest {};

std::string Match(const std::string& path, const std::string& base, const std::string& dest) {
    return Describe(FindMapping(DiffContext(TheRules(), PathOf(path)), List(base), List(dest)));
}

std::string Generic(const std::string& base, const std::string& dest) {
    return Describe(FindGenericMapping(List(base), List(dest)));
}

TEST_F(SequenceMatching, ByKeyElementsAreFollowedWhereverTheyGo) {
    const std::tuple<const char*, const char*, const char*> cases[] = {
        {"[{fileID: 1, guid: a}, {fileID: 2, guid: a}, {fileID: 3}]",
         "[{fileID: 3}, {fileID: 4}, {fileID: 1, guid: a}]", "2 -1 0 >3"},
        {"[{fileID: 1}, {fileID: 2}]", "[{fileID: 1, x: 9}, {fileID: 2}]", "="},
        {"[{fileID: 1}]", "[{fileID: 1, guid: a}]", "-1 >1"},
        {"[{fileID: 1, guid: a}, {fileID: 1, guid: b}]", "[{fileID: 1, guid: b}]", "-1 0 >1"},
        {"[{fileID: 1}, {fileID: 1, guid: b}]", "[{fileID: 1, guid: b}]", "-1 0 >1"},
        {"[]", "[{fileID: 1}]", ">1"},
        {"[{fileID: 1}]", "[]", "-1 >0"},
        {"[]", "[]", "="},
        {"[{fileID: a}, {fileID: 'b:c'}]", "[{fileID: 'b:c'}, {fileID: a}]", "1 0 >2"}};
    for (const auto& [base, dest, mapping] : cases) EXPECT_EQ(Match("1.T.l", base, dest), mapping) << base;
}

TEST_F(SequenceMatching, OneElementWithoutAKeyOfItsOwnBringsEqualityForAll) {
    const std::pair<const char*, const char*> cases[] = {
        {"[1, 2]", "[2, 1]"},
        {"[{fileID: 1}, {x: 2}]", "[{x: 2}, {fileID: 1}]"},
        {"[{fileID: 1}, x]", "[x, {fileID: 1}]"},
        {"[{fileID: 1}, {fileID: 1, y: 2}]", "[{fileID: 1, y: 2}, {fileID: 1}]"},
        {"[{fileID: 1, guid: a}, {fileID: 1, guid: a, x: 1}]",
         "[{fileID: 1, guid: a, x: 1}, {fileID: 1, guid: a}]"},
        {"[{fileID: 1}, {fileID: {a: 1}}]", "[{fileID: {a: 1}}, {fileID: 1}]"}};
    for (const auto& [base, dest] : cases) EXPECT_EQ(Match("1.T.l", base, dest), "1 0 ~>2") << base;
    EXPECT_EQ(Match("1.T.l", "[{fileID: 1}, {fileID: 2}]", "[{fileID: 1, x: 9}, z]"), "-1 -1 ~>2");
}

TEST_F(SequenceMatching, RulesNameOtherKeys) {
    Rules("[arrays]\nplain *.T.p\nset *.T.n name kind\nset *.T.d at.fileID\nset *.T.c *.fileID\n");
    EXPECT_EQ(Match("1.T.p", "[{fileID: 1}, {fileID: 2}]", "[{fileID: 1, x: 1}, {fileID: 2}]"), "-1 1 ~>2");
    EXPECT_EQ(Match("1.T.n", "[{name: a, kind: b}, {name: c, kind: d}]", "[{name: c, kind: d, x: 1}]"),
              "-1 0 >1");
    EXPECT_EQ(Match("1.T.n", "[{name: 'a:b', kind: c}, {name: a, kind: 'b:c'}]", "[]"), "-1 -1 ~>0")
        << "texts are joined without escapes, so these two are one key";
    EXPECT_EQ(Match("1.T.d", "[{at: {fileID: 1, guid: a}}, {at: {fileID: 1, guid: b}}]",
                    "[{at: {fileID: 1, guid: b}, x: 1}]"),
              "-1 0 >1");
    EXPECT_EQ(Match("1.T.c", "[{component: {fileID: 1}}, {4: {fileID: 2}}]", "[{5: {fileID: 2}}]"),
              "-1 0 >1");
    EXPECT_EQ(Match("1.T.x", "[{fileID: 1}, {fileID: 2}]", "[{fileID: 2}]"), "-1 0 >1");
}

TEST_F(SequenceMatching, AKeyListIsMatchedByTheKeysThemselves) {
    EXPECT_EQ(Match("_", "[a, b, c]", "[c, a, d]"), "1 -1 0 >3");
    EXPECT_EQ(Match("1._", "[a, b, c]", "[c, a, d]"), "1 -1 0 ~>3") << "only the path _ alone is one";
    EXPECT_EQ(Match("_", "[a]", "[a]"), "=");
}

TEST_F(SequenceMatching, ByEqualityTheFirstEqualElementIsTaken) {
    const std::tuple<const char*, const char*, const char*> cases[] = {
        {"[a, b, c, d, e]", "[a, x, c, c, e]", "0 -1 2 -1 4 ~>5"},
        {"[a, a, a]", "[a, a]", "0 0 1 ~>2"}, // the suffix stands where it overlaps the prefix
        {"[a, a]", "[a, a, a]", "1 2 ~>3"},
        {"[x, a, b]", "[a, b, y, x]", "3 0 1 ~>4"},
        {"[a, b, a, c]", "[c, a, a, b]", "1 3 2 0 ~>4"},
        {"[a]", "[]", "-1 ~>0"},
        {"[]", "[a]", "~>1"},
        {"[]", "[]", "="},
        {"[{}, []]", "[[], {}]", "1 0 ~>2"},
        {"[{a: 1, b: 2}]", "[{b: 2, a: 1}]", "-1 ~>1"}};
    for (const auto& [base, dest, mapping] : cases) EXPECT_EQ(Generic(base, dest), mapping) << base << dest;
}

/// Matching by equality with a scan for each element.
std::string NaiveGeneric(const NodeList& base, const NodeList& dest) {
    const int n = static_cast<int>(base.size()), m = static_cast<int>(dest.size()), common = std::min(n, m);
    int prefix = 0, suffix = 0;
    while (prefix < common && base[prefix]->Equals(dest[prefix])) ++prefix;
    if (n == m && prefix == n) return "=";
    while (suffix < common && base[n - 1 - suffix]->Equals(dest[m - 1 - suffix])) ++suffix;
    YAMLSequenceRemapper remapper(base.size(), dest.size(), false);
    for (int i = 0; i < prefix; ++i) remapper.m_Mapping[i] = i;
    for (int t = 0; t < suffix; ++t) remapper.m_Mapping[n - 1 - t] = m - 1 - t;
    std::vector<bool> taken(dest.size());
    for (int a = prefix; a < n - suffix; ++a) {
        for (int p = prefix; p < m - suffix; ++p) {
            if (taken[p] || !base[a]->Equals(dest[p])) continue;
            remapper.m_Mapping[a] = p;
            taken[p] = true;
            break;
        }
    }
    return remapper.IsIdentity() ? "=" : Describe(&remapper);
}

/// All that may stand in a list: texts, empty, hashed and unhashed containers, repeated keys, and different
/// contents under one hash.
YAMLNode* AnyElement(std::mt19937& random) {
    using namespace trees;
    static YAMLMapping* const borrowed = Doc("{x: y}");
    switch (random() % 12) {
    case 0:
        return Node("{}");
    case 1:
        return Node("[]");
    case 2:
        return Node(random() % 2 ? "{a: 1}" : "{a: 2}");
    case 3:
        return Node(random() % 2 ? "[a]" : "[[a]]");
    case 4:
        return Block({{"a", random() % 2 ? "1" : "2"}});
    case 5:
        return BlockList({random() % 2 ? "a" : "b"});
    case 6:
        return Block({{"a", "1"}, {"a", "2"}});
    case 7:
        return Node(random() % 2 ? "{a: 1, a: 2}" : "{b: 1, a: 1, a: 2}");
    case 8:
        borrowed->m_Hash = YAMLScalar::Lookup("0")->m_Hash;
        return borrowed;
    default:
        return YAMLScalar::Lookup(std::to_string(random() % 4));
    }
}

TEST_F(SequenceMatching, BucketsGiveWhatAScanGives) {
    for (unsigned seed = 0; seed < 5000; ++seed) {
        std::mt19937 random(seed);
        YAMLSequence base, dest;
        for (std::size_t i = random() % 12; i > 0; --i) base.m_Items.push_back(AnyElement(random));
        for (std::size_t i = random() % 12; i > 0; --i) dest.m_Items.push_back(AnyElement(random));
        ASSERT_EQ(Describe(FindGenericMapping(&base, &dest)), NaiveGeneric(base.m_Items, dest.m_Items))
            << "seed " << seed << "\n"
            << Show(&base) << "\n"
            << Show(&dest);
    }
}

TEST_F(SequenceMatching, LongListsOfEqualElementsAreNoTrouble) {
    YAMLSequence base, dest;
    for (int i = 0; i < 200000; ++i) {
        base.m_Items.push_back(YAMLScalar::Lookup(std::to_string(i % 3)));
        dest.m_Items.push_back(YAMLScalar::Lookup(std::to_string((i + 1) % 3)));
    }
    const auto* remapper = FindGenericMapping(&base, &dest);
    EXPECT_EQ(remapper->m_Mapping[0], 2);
    EXPECT_EQ(std::count(remapper->m_Mapping.begin(), remapper->m_Mapping.end(), -1), 1) << "one 0 too many";
}

TEST_F(SequenceMatching, LenientMatchingSkipsWhatHasNoKeyAndTakesTheLastOfRepeats) {
    const std::vector<Path> keys = {PathOf("fileID")};
    const auto match = [&](const char* first, const char* second) {
        return Describe(FindIdMapping(keys, List(first), List(second)));
    };
    EXPECT_EQ(match("[x, {fileID: 1}, {fileID: 2}, {fileID: 1}]", "[{fileID: 1}, y, {fileID: 1}]"),
              "-1 2 -1 2 >3");
    EXPECT_EQ(match("[{fileID: 1}]", "[{fileID: 1}]"), "0 >1") << "an identity is given, too";
    EXPECT_EQ(match("[]", "[]"), ">0");
}

TEST_F(SequenceMatching, ElementsAreBroughtIntoTheirPlaces) {
    const auto apply = [](const char* list, std::vector<int> mapping, std::size_t count) {
        YAMLSequenceRemapper remapper(0, count, true);
        remapper.m_Mapping = std::move(mapping);
        YAMLSequence* sequence = List(list);
        remapper.Apply(*sequence);
        return Show(sequence) + (sequence->m_Hash || sequence->m_Line ? "?" : "");
    };
    EXPECT_EQ(apply("[a, b, c]", {1, -1, 0}, 3), "[c, a, ~]");
    EXPECT_EQ(apply("[a, b, c]", {0, 0, 1}, 2), "[b, c]") << "of two for one place the later stays";
    EXPECT_EQ(apply("[a, b]", {0, 1, 2}, 3), "[a, b, ~]") << "an entry beyond the list";
    EXPECT_EQ(apply("[a, b]", {1}, 2), "[~, a]") << "an element beyond the map";
    EXPECT_EQ(ErrorOf([&] { apply("[a]", {1}, 1); }), "Cannot change non existing index in YAMLSequence");
}

} // namespace
