#include "MergeCheck.h"
#include "ReaderCheck.h"
#include "Support/Documents.h"
#include "Support/RandomDocuments.h"

#include "Reading/ObjectFileReader.h"
#include "Repair/ObjectTraits.h"

#include <gtest/gtest.h>

namespace {

using namespace documents;
using namespace ovrin_fuzz;
using random_documents::RandomDocuments;

constexpr unsigned kDocuments = 10000;

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
        fast += object.TraitsAsRead() != 0;
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
}

} // namespace
