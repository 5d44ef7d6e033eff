#include "Support/Documents.h"
#include "Support/Trees.h"
#include "Values/Hash.h"
#include "Values/KeyIndex.h"
#include "Writing/YAMLEmitter.h"

#include <gtest/gtest.h>

#include <functional>
#include <limits>
#include <random>
#include <thread>

namespace {

using namespace documents;
using namespace trees;

const char* const kDuplicateKeys = "Cannot perform this operation on a YAML file with duplicate keys";

const YAMLScalar* S(std::string_view text) {
    return YAMLScalar::Lookup(text);
}

TEST(Scalars, OneTextIsOneObjectForAllThreads) {
    constexpr int kTexts = 20000;
    std::vector<std::vector<const YAMLScalar*>> found(4);
    std::vector<std::thread> threads;
    for (auto& mine : found)
        threads.emplace_back([&mine] {
            for (int i = 0; i < kTexts; ++i) mine.push_back(S("thread text " + std::to_string(i)));
        });
    for (std::thread& thread : threads) thread.join();
    for (const auto& other : found) EXPECT_EQ(found[0], other);
    for (int i = 0; i < kTexts; ++i) ASSERT_EQ(found[0][i]->Value(), "thread text " + std::to_string(i));
}

TEST(Scalars, TheTextAloneMakesTheScalar) {
    EXPECT_EQ(S(""), YAMLScalar::empty);
    EXPECT_EQ(Node("\"1\""), Node("1"));
    EXPECT_NE(S("1"), S("1.0"));
    EXPECT_NE(S(std::string_view("a\0b", 3)), S("a"));
    EXPECT_EQ(S(std::string_view("a\0b", 3))->Value().size(), 3u);
    EXPECT_EQ(S("x")->Clone(), S("x"));
}

TEST(Scalars, NumbersAreReadLikeStreamsReadThem) {
    const auto least = std::numeric_limits<int>::min(), most = std::numeric_limits<int>::max();
    const std::tuple<std::string, int, float> cases[] = {{"12", 12, 12},
                                                         {" \t\n-7", -7, -7},
                                                         {"+5", 5, 5},
                                                         {"12x", 12, 12},
                                                         {"1.75", 1, 1.75f},
                                                         {"abc", 0, 0},
                                                         {"", 0, 0},
                                                         {"0x10", 0, 0},
                                                         {"010", 10, 10},
                                                         {"inf", 0, 0},
                                                         {"nan", 0, 0},
                                                         {"-", 0, 0},
                                                         {"1e2", 1, 100},
                                                         {"1e50", 1, std::numeric_limits<float>::max()},
                                                         {"-1e50", -1, -std::numeric_limits<float>::max()},
                                                         {"99999999999", most, 99999999999.f},
                                                         {"-99999999999", least, -99999999999.f},
                                                         {std::string("1\0002", 3), 1, 1}};
    for (const auto& [text, integer, number] : cases) {
        EXPECT_EQ(S(text)->GetIntValue(), integer) << text;
        EXPECT_EQ(S(text)->GetFloatValue(), number) << text;
    }
    for (const int value : {0, 9, 10, 99, 100, 999, 1000, 2147483647}) {
        EXPECT_EQ(IntToString(value), std::to_string(value));
        EXPECT_EQ(IndexScalar(value), S(std::to_string(value)));
    }
}

TEST(Hashes, ScalarsHaveTheirMurmurHash) {
    const std::tuple<const char*, std::uint32_t, std::uint32_t> known[] = {
        {"", 0, 0},
        {"", 1, 0x514E28B7},
        {"", 0xffffffff, 0x81F16F39},
        {"test", 0, 0xba6bd213},
        {"test", 0x9747b28c, 0x704b81dc},
        {"Hello, world!", 0, 0xc0363e43},
        {"Hello, world!", 0x9747b28c, 0x24884CBA},
        {"The quick brown fox jumps over the lazy dog", 0x9747b28c, 0x2FA826CD},
        {"aaa", 0x9747b28c, 0x283e0130},
        {"aa", 0x9747b28c, 0x5D211726},
        {"a", 0x9747b28c, 0x7FA09EA6}};
    for (const auto& [text, seed, hash] : known) EXPECT_EQ(MurmurHash3(text, seed), hash) << text;
    EXPECT_EQ(S("m_Father")->m_Hash, MurmurHash3("m_Father", 42));
}

TEST(Hashes, ContainersFoldOrderAndPosition) {
    EXPECT_EQ(Doc("{}")->m_Hash, 0u);
    EXPECT_EQ(List("[]")->m_Hash, 0u);
    EXPECT_EQ(CombineHash(0, 0), 0x9e3779b9u);
    EXPECT_EQ(CombineHash(1, 2), 1u ^ (2 + 0x9e3779b9u + 64 + 0));
    EXPECT_EQ(List("[a, b]")->m_Hash,
              CombineHash(CombineHash(CombineHash(CombineHash(0, S("a")->m_Hash), 0), S("b")->m_Hash), 1));
    EXPECT_EQ(Doc("{a: b}")->m_Hash,
              CombineHash(CombineHash(CombineHash(0, S("a")->m_Hash), S("b")->m_Hash), 0));
    EXPECT_NE(Doc("{a: 1, b: 2}")->m_Hash, Doc("{b: 2, a: 1}")->m_Hash);
    EXPECT_NE(List("[[], {}]")->m_Hash, List("[{}]")->m_Hash);
}

TEST(Hashes, RebuildingGivesWhatTheReaderFolded) {
    const char* const texts[] = {"a: [1, {b: c}, []]\nd: {e: {f: }}", "- 1\n- - 2\n  - x: y", "{}"};
    for (const char* text : texts) {
        YAMLNode* node = Node(text);
        const std::string read = Dump(node);
        node->RebuildHash(false);
        EXPECT_EQ(Dump(node), read);
    }
    YAMLMapping* outer = Doc("a: {b: 1}");
    AsMapping(outer->Get(S("a")))->m_Hash = 5;
    outer->RebuildHash(true);
    EXPECT_EQ(outer->m_Hash, FoldPair(0, S("a")->m_Hash, 5, 0));
}

TEST(Equality, KnownHashesDecideAlone) {
    YAMLMapping *a = Doc("{a: 1}"), *b = Doc("{a: 2}");
    YAMLSequence* list = List("[1]");
    EXPECT_TRUE(a->Equals(Doc("a: 1")));
    EXPECT_FALSE(a->Equals(b));
    b->m_Hash = list->m_Hash = a->m_Hash;
    EXPECT_TRUE(a->Equals(b));
    EXPECT_TRUE(a->Equals(list)) << "not even the kind is looked at";
}

TEST(Equality, WithoutHashesTheKeysOfMappingsDecideAndTheItemsOfLists) {
    const std::tuple<YAMLNode*, YAMLNode*, bool> cases[] = {
        {Block({{"a", "1"}}), Block({{"a", "2"}}), true}, // values are not compared
        {Block({{"a", "1"}}), Block({{"b", "1"}}), false},
        {Block({{"a", "1"}, {"b", "2"}}), Block({{"b", "2"}, {"a", "1"}}), false},
        {Block({{"a", "1"}}), Doc("{a: 2}"), true},
        {Block({}), Block({}), true},
        {Block({}), BlockList({}), false},
        {BlockList({}), Block({}), false},
        {BlockList({"1"}), BlockList({"1"}), true},
        {BlockList({"1"}), BlockList({"2"}), false},
        {BlockList({"1"}), BlockList({"1", "1"}), false},
        {BlockList({Block({{"a", "1"}})}), BlockList({Block({{"a", "2"}})}), true},
        {BlockList({"1"}), Tree("1"), false},
        {Tree("1"), BlockList({"1"}), false},
        {Block({{"a", "1"}, {"a", "2"}}), Block({}), true}, // in the duplicate state there are no keys
        {Block({{"a", "1"}, {"a", "2"}}), Block({{"b", "1"}}), false}};
    int number = 0;
    for (const auto& [left, right, equal] : cases) EXPECT_EQ(left->Equals(right), equal) << number++;
}

/// Everything that a mapping in the duplicate state refuses.
const std::vector<std::function<void(YAMLMapping&)>> kRefusedWithDuplicates = {
    [](YAMLMapping& m) { m.Get(S("a")); },
    [](YAMLMapping& m) { m.GetRef(S("a")); },
    [](YAMLMapping& m) { m.HasKey(S("a")); },
    [](YAMLMapping& m) { m.Size(); },
    [](YAMLMapping& m) { m.begin(); },
    [](YAMLMapping& m) { m.end(); },
    [](YAMLMapping& m) { m.First(); },
    [](YAMLMapping& m) { m.Steal(S("a")); },
    [](YAMLMapping& m) { m.Remove(S("a")); },
    [](YAMLMapping& m) { m.Insert(S("z"), YAMLScalar::one); },
    [](YAMLMapping& m) { m.Change(S("a"), YAMLScalar::one); },
    [](YAMLMapping& m) { m.ChangeKey(S("a"), S("z")); },
    [](YAMLMapping& m) { m.Reorder({}); },
    [](YAMLMapping& m) { m.Clone(); },
    [](YAMLMapping& m) { BlockList({&m})->Clone(); }};

TEST(DuplicateKeys, OnlyAppendingConvertingAndWritingGoOn) {
    YAMLMapping* mapping = Block({{"a", "1"}, {"b", "2"}});
    mapping->Append(S("a"), Tree("1"));
    EXPECT_EQ(Show(mapping), "{a: 1, b: 2}") << "an equal value is dropped";
    mapping->Append(S("a"), Tree("3"));
    for (const auto& act : kRefusedWithDuplicates)
        EXPECT_EQ(ErrorOf([&] { act(*mapping); }), kDuplicateKeys) << &act - &kRefusedWithDuplicates[0];
    mapping->Append(S("a"), Tree("1"));
    EXPECT_EQ(Show(mapping), "{a: 1, b: 2, a: 3, a: 1}");
    EXPECT_EQ(GetYAMLString(*mapping), "a: 1\nb: 2\na: 3\na: 1");
    EXPECT_EQ(Show(mapping->ToSequence()), "[{a: 1}, {b: 2}, {a: 3}, {a: 1}]");
    mapping->m_Hash = 7;
    mapping->RebuildHash(false);
    EXPECT_EQ(mapping->m_Hash, 0u);
}

TEST(DuplicateKeys, ABigMappingKeepsItsOrderWhenItFallsIntoTheState) {
    YAMLMapping* mapping = Block({});
    std::string expected;
    for (int i = 0; i < 40; ++i) mapping->Insert(S("k" + std::to_string(i)), Tree("v"));
    for (int i = 0; i < 40; i += 2) mapping->Remove(S("k" + std::to_string(i)));
    mapping->Append(S("k7"), Tree("other"));
    for (int i = 1; i < 40; i += 2) expected += "k" + std::to_string(i) + ": v, ";
    EXPECT_EQ(Show(mapping), "{" + expected + "k7: other}");
}

TEST(Mappings, AChangeOfKeysLeavesThoseOfOtherMappingsAlone) {
    const std::function<void(YAMLMapping&)> changes[] = {
        [](YAMLMapping& m) { m.Insert(S("d"), YAMLScalar::zero); },
        [](YAMLMapping& m) { m.Append(S("b"), YAMLScalar::zero); }, // the duplicate state
        [](YAMLMapping& m) { m.Steal(S("a")); },
        [](YAMLMapping& m) { m.ChangeKey(S("a"), S("z")); },
        [](YAMLMapping& m) {
            m.Reorder({S("c"), S("b"), S("a")});
        },
        [](YAMLMapping& m) { m.Change(S("b"), YAMLScalar::zero); },
        [](YAMLMapping& m) { m.Clear(); },
    };
    for (const auto& change : changes) {
        YAMLSequence* list = List("[{a: 1, b: 2, c: 3}, {a: 4, b: 5, c: 6}]");
        YAMLMapping& first = ToMapping(list->m_Items[0]);
        const std::string second = Dump(list->m_Items[1]);
        YAMLNode* const copy = first.Clone();
        const std::string before = Dump(&first);
        ASSERT_EQ(Dump(copy), before);
        change(first);
        const std::string changed = Dump(&first);
        EXPECT_NE(changed, before);
        EXPECT_EQ(Dump(CopyExactly(&first)), changed);
        EXPECT_EQ(Dump(list->m_Items[1]), second);
        EXPECT_EQ(Dump(copy), before);
        ToMapping(copy).Steal(S("c"));
        EXPECT_EQ(Dump(&first), changed);
    }
}

TEST(Mappings, FailuresAreToldAndChangeNothing) {
    YAMLMapping* mapping = Doc("{a: 1, b: 2}");
    const std::pair<std::function<void()>, const char*> cases[] = {
        {[&] { mapping->Insert(S("a"), Tree("9")); }, "Cannot add existing key in YAMLMapping"},
        {[&] { mapping->Change(S("x"), Tree("9")); }, "Cannot change non existing key in YAMLMapping"},
        {[&] { mapping->GetRef(S("x")); }, "Cannot get unknown key from yaml mapping"},
        {[&] { mapping->ChangeKey(S("x"), S("y")); }, "Cannot change key of non existing key in YAMLMapping"},
        {[&] { mapping->Reorder({S("a")}); }, "Unmapped key when trying to reorder mapping keys"},
        {[&] {
             mapping->Reorder({S("b"), S("a"), S("b")});
         },
         "Unmapped key when trying to reorder mapping keys"}};
    for (const auto& [act, error] : cases) EXPECT_EQ(ErrorOf(act), error);
    EXPECT_EQ(mapping->Get(S("x")), nullptr);
    EXPECT_EQ(mapping->Steal(S("x")), nullptr);
    EXPECT_EQ(Show(mapping), "{a: 1, b: 2}");
    mapping->Reorder({S("b"), S("unknown"), S("a")});
    EXPECT_EQ(Show(mapping), "{b: 2, a: 1}");
}

/// What a mapping should be: a plain list of pairs.
struct Model {
    std::vector<std::pair<std::string, std::string>> pairs;

    auto Find(const std::string& key) {
        return std::find_if(pairs.begin(), pairs.end(), [&](const auto& pair) { return pair.first == key; });
    }
    std::string Text() const {
        std::string text;
        for (const auto& [key, value] : pairs) text += (text.empty() ? "" : ", ") + key + ": " + value;
        return "{" + text + "}";
    }
};

/// Does the same, at random, to both.
void ChangeBoth(YAMLMapping& mapping, Model& model, std::size_t keys, std::mt19937& random) {
    const std::string key = "k" + std::to_string(random() % keys),
                      other = "k" + std::to_string(random() % keys);
    const std::string value = std::to_string(random() % 100);
    const auto found = model.Find(key);
    if (found == model.pairs.end()) {
        EXPECT_EQ(mapping.Get(S(key)), nullptr);
        mapping.Insert(S(key), Tree(value));
        model.pairs.emplace_back(key, value);
        return;
    }
    switch (random() % 4) {
    case 0:
        EXPECT_EQ(mapping.Steal(S(key)), S(found->second));
        model.pairs.erase(found);
        break;
    case 1:
        EXPECT_EQ(mapping.Change(S(key), Tree(value)), S(found->second));
        found->second = value;
        break;
    case 2:
        if (model.Find(other) != model.pairs.end()) break;
        mapping.ChangeKey(S(key), S(other));
        found->first = other;
        break;
    default:
        std::vector<const YAMLScalar*> order;
        std::shuffle(model.pairs.begin(), model.pairs.end(), random);
        for (const auto& pair : model.pairs) order.push_back(S(pair.first));
        mapping.Reorder(order);
    }
}

TEST(Mappings, SmallAndBigOnesBehaveLikeAListOfPairs) {
    for (const std::size_t keys : {std::size_t{4}, KeyIndex::kSearchLimit + 2, std::size_t{60}}) {
        std::mt19937 random(static_cast<unsigned>(keys));
        YAMLMapping* mapping = Block({});
        Model model;
        for (int step = 0; step < 3000; ++step) {
            ChangeBoth(*mapping, model, keys, random);
            ASSERT_EQ(Show(mapping), model.Text()) << "keys " << keys << " step " << step;
            ASSERT_EQ(mapping->Size(), model.pairs.size());
            if (step % 8 != 7) continue;
            // A copy may share its keys with the original, which is changed no further, and must not change.
            YAMLMapping* copy = AsMapping(mapping->Clone());
            const Model before = model;
            ChangeBoth(*copy, model, keys, random);
            ASSERT_EQ(Show(mapping), before.Text()) << "keys " << keys << " step " << step;
            mapping = copy;
        }
    }
}

TEST(Lists, IndexesAreChecked) {
    YAMLSequence* list = List("[a, b]");
    for (const int index : {-1, 2}) {
        EXPECT_EQ(ErrorOf([&] { list->Get(index); }), "Cannot get non existing index in YAMLSequence");
        EXPECT_EQ(ErrorOf([&] { list->Set(index, Tree("x")); }),
                  "Cannot change non existing index in YAMLSequence");
    }
    EXPECT_EQ(list->Set(0, nullptr), S("a"));
    list->GrowTo(4);
    EXPECT_EQ(Show(list->Clone()), "[~, b, ~, ~]");
    list->DropHoles();
    EXPECT_EQ(Show(list), "[b]");
}

TEST(Values, WhatOutgrowsItsFieldIsRefused) {
    EXPECT_EQ(ErrorOf([] { YAMLScalar::Lookup({"", std::size_t{1} << 32}); }), "Scalar is too long");
    EXPECT_EQ(ErrorOf([] { Doc("a: b")->Reserve(std::size_t{1} << 30); }), "Mapping is too long");
    EXPECT_EQ(ErrorOf([] { List("[a]")->GrowTo(std::size_t{1} << 31); }), "Sequence is too long");
}

TEST(Clones, ACopySharesScalarsOnlyAndKeepsWhatTheReaderMade) {
    YAMLMapping* source = Doc("a: {x: [1, {}]}\nb:\n  c: 2");
    YAMLMapping* copy = AsMapping(source->Clone());
    EXPECT_EQ(Dump(copy), Dump(source));
    AsMapping(copy->Get(S("a")))->Change(S("x"), Tree("9"));
    copy->Remove(S("b"));
    EXPECT_EQ(Show(source), "{a: {x: [1, {}]}, b: {c: 2}}");
}

} // namespace
