#include <gtest/gtest.h>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/DataObject.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

namespace {

struct ComponentList {
  std::vector<std::string> names;
};

TEST(DataObject, HoldsBytesAndTypedPayloadsByFlavour) {
  DataObject data;
  data.SetString(kDataTypeName_Text, "Blur");
  const auto components =
      std::make_shared<const ComponentList>(ComponentList{{"Opacity", "Motion"}});
  data.SetPayload(kDataTypeName_EffectControlsComponent, components);

  EXPECT_EQ(data.GetString(kDataTypeName_Text), "Blur");
  EXPECT_EQ(data.GetPayload<ComponentList>(kDataTypeName_EffectControlsComponent), components);
  // Read back only as what it is.
  EXPECT_EQ(data.GetPayload<std::string>(kDataTypeName_EffectControlsComponent), nullptr);
  EXPECT_EQ(data.GetBytes(kDataTypeName_EffectControlsComponent), nullptr);
  EXPECT_EQ(data.GetPayload<ComponentList>(kDataTypeName_Text), nullptr);
  EXPECT_EQ(data.GetString(kDataTypeName_EffectSelection), std::nullopt);
  EXPECT_TRUE(data.HasFlavour(kDataTypeName_Text));
  EXPECT_FALSE(data.HasFlavour(kDataTypeName_FilterVector));
}

TEST(DataObject, ReplacingAFlavourKeepsItsPlace) {
  DataObject data;
  data.SetString("a", "1");
  data.SetString("b", "2");
  data.SetPayload("a", std::make_shared<const int>(7));
  EXPECT_EQ(data.GetFlavours(), (std::vector<std::string>{"a", "b"}));
  EXPECT_EQ(*data.GetPayload<int>("a"), 7);
  EXPECT_EQ(data.GetBytes("a"), nullptr);
  EXPECT_TRUE(data.Remove("a"));
  EXPECT_FALSE(data.Remove("a"));
  EXPECT_EQ(data.GetFlavours(), (std::vector<std::string>{"b"}));
}

TEST(DataObject, CopiesShareTheirPayloads) {
  DataObject data;
  data.SetPayload("p", std::make_shared<const ComponentList>());
  const DataObject copy = data;
  EXPECT_EQ(copy.GetPayload<ComponentList>("p"), data.GetPayload<ComponentList>("p"));
}

TEST(DataObject, RefusesNamelessFlavoursAndNullPayloads) {
  ToolkitTestScope scope;
  DataObject data;
  EXPECT_FALSE(data.SetString("", "x"));
  EXPECT_FALSE(data.SetPayload<int>("p", nullptr));
  EXPECT_TRUE(data.IsEmpty());
  EXPECT_EQ(RecordedDebugAssertions().size(), 1u);
}

TEST(DataObject, KeepsBinaryBytesExactly) {
  DataObject data;
  const std::vector<std::uint8_t> bytes{0, 255, 10, 0};
  data.SetBytes("raw", bytes);
  ASSERT_NE(data.GetBytes("raw"), nullptr);
  EXPECT_EQ(*data.GetBytes("raw"), bytes);
  EXPECT_EQ(data.GetString("raw")->size(), 4u);
}

}  // namespace
