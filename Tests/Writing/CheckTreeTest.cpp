#include "Writing/CheckTree.h"
#include "Reading/ObjectFileReader.h"
#include "Support/Documents.h"

#include <gtest/gtest.h>

namespace {

using namespace documents;

class CheckTreeTest : public testing::Test {
protected:
    CheckTreeTest() {
        const std::string text = ObjectText("--- !o!4 &1\nTransform:\n  a: {x: 1}\n  l:\n  - 2\n  - 3\n");
        ParseYAMLFile(text, m_Objects, {.inspect = [](const YAMLMapping&) { return std::uint8_t{1}; }});
    }

    YAMLMapping& Root() { return m_Objects.GetMapping(); }
    YAMLMapping& Object() { return *AsMapping(Root().First()); }
    /// The fields of the object as it stands.
    YAMLMapping& Fields() { return *AsMapping(Object().First()); }
    YAMLSequence& List() { return *AsSequence(Fields().Get(YAMLScalar::Lookup("l"))); }
    /// The fields of the object, to be changed.
    YAMLMapping& Changing() { return *AsMapping(AsMapping(Root().GetForChange(YAMLScalar::one))->First()); }
    std::string Fault(TreeStage stage = TreeStage::Changed) { return CheckTree(Root(), stage); }

    OvrinObjects m_Objects;
};

TEST_F(CheckTreeTest, AReadFileHasNoFault) {
    EXPECT_FALSE(Object().Source().empty());
    EXPECT_EQ(Fault(TreeStage::Hashed), "");
}

TEST_F(CheckTreeTest, AChangedObjectHasAStaleHash) {
    Changing().Change(YAMLScalar::Lookup("a"), YAMLScalar::empty);
    EXPECT_EQ(Fault(), "");
    EXPECT_EQ(Fault(TreeStage::Hashed), "1.Transform: a hash that isn't that of the pairs");
}

TEST_F(CheckTreeTest, AnObjectThatIsChangedInPlaceIsNoticed) {
    Fields().Change(YAMLScalar::Lookup("a"), YAMLScalar::empty);
    EXPECT_EQ(Fault(), "1.Transform: a hash that isn't that of the pairs");
    Fields().RebuildHash(false);
    EXPECT_EQ(Fault(), "1: a hash that isn't that of the pairs");
}

TEST_F(CheckTreeTest, AnObjectThatIsSharedStaysAsItIs) {
    const std::unique_ptr<OvrinObjects> copy(m_Objects.Clone());
    Changing().Change(YAMLScalar::Lookup("a"), YAMLScalar::empty);
    EXPECT_EQ(CheckTree(copy->GetMapping(), TreeStage::Changed), "");
    AsMapping(AsMapping(copy->GetMapping().First())->First())->Remove(YAMLScalar::Lookup("a"));
    EXPECT_EQ(CheckTree(copy->GetMapping(), TreeStage::Changed),
              "1.Transform: a hash that isn't that of the pairs");
}

TEST_F(CheckTreeTest, HolesAreNoticedAtEveryStage) {
    Changing();
    List().GrowTo(3);
    EXPECT_EQ(Fault(), "1.Transform.l.2: no value");
    List().DropHoles();
    EXPECT_EQ(Fault(), "");
}

TEST_F(CheckTreeTest, SourceBytesThatTheWriterWouldNotGiveAreNoticed) {
    Object().SetSource("--- !o!4 &1\nTransform: {}\n");
    EXPECT_TRUE(Fault().starts_with("1: the source bytes\n--- !o!4 &1\nTransform: {}\nare written as\n"));
}

TEST(CheckTree, BigMappingsKeepCountOfWhatIsRemoved) {
    YAMLMapping* mapping = Doc("k: 0");
    for (int i = 0; i < 100; ++i) mapping->Insert(IndexScalar(i), YAMLScalar::empty);
    for (int i = 0; i < 100; i += 3) mapping->Remove(IndexScalar(i));
    EXPECT_EQ(CheckTree(*mapping, TreeStage::Changed), "");
    mapping->ChangeKey(IndexScalar(1), IndexScalar(0));
    EXPECT_EQ(CheckTree(*mapping, TreeStage::Changed), "");
    mapping->Append(IndexScalar(0), YAMLScalar::one);
    EXPECT_TRUE(mapping->HasDuplicates());
    EXPECT_EQ(CheckTree(*mapping, TreeStage::Changed), "");
}

#ifndef NDEBUG
using CheckTreeDeathTest = CheckTreeTest;

TEST_F(CheckTreeDeathTest, AnObjectIsNotChangedAheadOfGetForChange) {
    EXPECT_DEATH(Object().Remove(YAMLScalar::Lookup("Transform")), "GetForChange");
    EXPECT_DEATH(Object().Append(YAMLScalar::empty, YAMLScalar::empty), "GetForChange");
}
#endif

} // namespace
