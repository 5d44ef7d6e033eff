#include "MergeCheck.h"
#include "ReaderCheck.h"
#include "Support/Documents.h"
#include "Support/RandomDocuments.h"

#include "Reading/ObjectFileReader.h"
#include "Repair/ObjectTraits.h"

#include <gtest/gtest.h>

#include <random>

namespace {

using namespace documents;
using namespace ovrin_fuzz;
using random_documents::RandomDocuments;

constexpr unsigned kDocuments = 10000;

/// Scenes whose objects refer to each other, most of which all files have: what repairs look for stands in
/// objects that nobody touched.
class RandomScenes {
public:
    explicit RandomScenes(unsigned seed) : m_Random(seed) {
        for (int id = 1; id <= kObjects; ++id) m_Objects.push_back(Object(id));
    }

    MergeTexts Texts() {
        std::string base;
        for (const std::string& object : m_Objects) base += object;
        return {ObjectText(base), ObjectText(Side()), ObjectText(Side())};
    }

private:
    static constexpr int kObjects = 12;

    int Below(int limit) { return static_cast<int>(m_Random() % static_cast<unsigned>(limit)); }
    std::string Object(int id) {
        static const std::string kHeads[] = {"4 &#\nTransform:\n", "1001 &#\nPrefabInstance:\n",
                                             "1 &#\nGameObject:\n",
                                             "4 &# stripped\nTransform:\n  m_PrefabInstance: {fileID: 3}\n"};
        static const char* const kKeys[] = {"m_Father", "m_PrefabInternal", "m_GameObject"};
        std::string text = "--- !o!" + kHeads[Below(4)];
        text.replace(text.find('#'), 1, std::to_string(id));
        for (const char* key : kKeys)
            if (Below(3))
                text += std::string("  ") + key + ": {fileID: " + std::to_string(Below(kObjects + 4)) + "}\n";
        return text + "  m_Name: " + std::to_string(Below(9)) + "\n";
    }
    std::string Side() {
        std::string side;
        for (int i = 0; i < kObjects; ++i)
            if (const int edit = Below(12))
                side += edit == 1 ? Object(i + 1) : m_Objects[static_cast<std::size_t>(i)];
        return side + Object(kObjects + 1 + Below(3));
    }

    std::mt19937 m_Random;
    std::vector<std::string> m_Objects;
};

TEST(Generated, AllWaysToReadGiveTheSame) {
    for (unsigned seed = 0; seed < kDocuments; ++seed) {
        RandomDocuments documents(seed);
        const std::string file = FileOfInput(documents.Body());
        ASSERT_EQ(CheckReader(file), "") << "seed " << seed << "\n" << file;
        const std::string damaged = documents.Damaged(file);
        ASSERT_EQ(CheckReader(damaged), "") << "seed " << seed << "\n" << damaged;
    }
}

/// Else the test above would compare the library with itself.
TEST(Generated, MostDocumentsAreReadFastAndManyAreWrittenForm) {
    unsigned fast = 0, written = 0;
    for (unsigned seed = 0; seed < kDocuments; seed += 10) {
        OvrinObjects objects;
        const std::string file = FileOfInput(RandomDocuments(seed).Body());
        if (ErrorOf([&] { ParseYAMLFile(file, objects, {.inspect = InspectObject}); }) != "none") continue;
        const YAMLMapping& object = *AsMapping(objects.GetMapping().First());
        fast += object.Traits() != 0;
        written += !object.Source().empty();
    }
    EXPECT_GT(fast, kDocuments / 10 / 2);
    EXPECT_GT(written, kDocuments / 10 / 8);
}

TEST(Generated, AllWaysToReadGiveTheSameMerge) {
    for (unsigned seed = 0; seed < kDocuments / 20; ++seed) {
        RandomDocuments documents(seed);
        std::string objects;
        for (const char* header : {"4 &1", "1 &2", "4 &3 stripped", "114 &4", "4 &5"})
            objects += std::string("--- !o!") + header + "\n" + documents.Body();
        const std::string input = objects + "=======\n" + documents.Characters(4 * (seed % 5));
        ASSERT_EQ(CheckMerge(TextsOfInput(input)), "") << "seed " << seed << "\n" << input;
    }
    for (unsigned seed = 0; seed < kDocuments / 60; ++seed)
        ASSERT_EQ(CheckMerge(RandomScenes(seed).Texts()), "") << "scene of seed " << seed;
}

} // namespace
