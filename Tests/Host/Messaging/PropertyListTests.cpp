#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <string>

#include "Host/Messaging/PropertyList.h"

TEST(PropertyList, MissingKeysGiveTheDefault) {
  const PropertyList list;
  EXPECT_TRUE(list.GetBool("HandlerEffectControls.AreKeyframesVisible", true));
  EXPECT_EQ(list.GetInt("a", -3), -3);
  EXPECT_EQ(list.GetFloat("HandlerEffectControls.SeparatorRatio", 0.0f), 0.0f);
  EXPECT_EQ(list.GetDouble("a", 1.5), 1.5);
  EXPECT_EQ(list.GetString("a", "none"), "none");
  EXPECT_FALSE(list.Has("a"));
  EXPECT_TRUE(list.Empty());
}

TEST(PropertyList, EachTypeReadsBackWhatWasWritten) {
  PropertyList list;
  EXPECT_TRUE(list.SetBool("ECP.Group.Expanded", false));
  EXPECT_TRUE(list.SetInt("count", -7));
  EXPECT_TRUE(list.SetFloat("HandlerEffectControls.SeparatorRatio", 0.375f));
  EXPECT_TRUE(list.SetDouble("zoom", 1e-9));
  EXPECT_TRUE(list.SetString("name", "Gaussian \"Blur\" ü"));
  EXPECT_FALSE(list.GetBool("ECP.Group.Expanded", true));
  EXPECT_EQ(list.GetInt("count", 0), -7);
  EXPECT_EQ(list.GetFloat("HandlerEffectControls.SeparatorRatio", 0), 0.375f);
  EXPECT_EQ(list.GetDouble("zoom", 0), 1e-9);
  EXPECT_EQ(list.GetString("name", ""), "Gaussian \"Blur\" ü");
  EXPECT_EQ(list.Size(), 5u);
  EXPECT_EQ(list.Keys(),
            (std::vector<std::string>{"ECP.Group.Expanded", "HandlerEffectControls.SeparatorRatio",
                                      "count", "name", "zoom"}));
}

TEST(PropertyList, WritingAgainReplacesTheValueAndItsType) {
  PropertyList list;
  list.SetInt("k", 1);
  list.SetString("k", "text");
  EXPECT_EQ(list.GetInt("k", 9), 9);
  EXPECT_EQ(list.GetString("k", ""), "text");
  EXPECT_EQ(list.Size(), 1u);
}

TEST(PropertyList, NumbersConvertWhenTheyFitOtherKindsGiveTheDefault) {
  PropertyList list;
  list.SetInt("int", 3);
  list.SetDouble("whole", 2.0);
  list.SetDouble("fraction", 2.5);
  list.SetDouble("huge", 1e300);
  list.SetBool("flag", true);
  list.SetString("text", "1");
  EXPECT_EQ(list.GetFloat("int", 0), 3.0f);
  EXPECT_EQ(list.GetDouble("int", 0), 3.0);
  EXPECT_EQ(list.GetInt("whole", 0), 2);
  EXPECT_EQ(list.GetInt("fraction", -1), -1);
  EXPECT_EQ(list.GetInt("huge", -1), -1);
  EXPECT_EQ(list.GetFloat("huge", -1), -1.0f);
  EXPECT_EQ(list.GetInt("flag", -1), -1);
  EXPECT_FALSE(list.GetBool("int", false));
  EXPECT_EQ(list.GetInt("text", -1), -1);
  EXPECT_EQ(list.GetString("int", "default"), "default");
}

TEST(PropertyList, ReadOnlyKeysRefuseEveryWriteAndKeepTheirValue) {
  PropertyList list;
  list.SetBool("be.prefs.effectcontrols.showtimerulernumbers", true);
  list.SetReadOnly("be.prefs.effectcontrols.showtimerulernumbers", true);
  EXPECT_TRUE(list.IsReadOnly("be.prefs.effectcontrols.showtimerulernumbers"));
  EXPECT_FALSE(list.SetBool("be.prefs.effectcontrols.showtimerulernumbers", false));
  EXPECT_FALSE(list.SetString("be.prefs.effectcontrols.showtimerulernumbers", "x"));
  EXPECT_FALSE(list.Remove("be.prefs.effectcontrols.showtimerulernumbers"));
  EXPECT_TRUE(list.GetBool("be.prefs.effectcontrols.showtimerulernumbers", false));
  list.SetReadOnly("be.prefs.effectcontrols.showtimerulernumbers", false);
  EXPECT_TRUE(list.SetBool("be.prefs.effectcontrols.showtimerulernumbers", false));
  EXPECT_FALSE(list.GetBool("be.prefs.effectcontrols.showtimerulernumbers", true));
}

TEST(PropertyList, AReadOnlyKeyWithoutValueStaysAbsent) {
  PropertyList list;
  list.SetReadOnly("ECP.Custom.Expanded", true);
  EXPECT_FALSE(list.SetBool("ECP.Custom.Expanded", true));
  EXPECT_FALSE(list.Has("ECP.Custom.Expanded"));
  EXPECT_FALSE(list.GetBool("ECP.Custom.Expanded", false));
}

TEST(PropertyList, RejectsEmptyKeysAndNumbersThatCannotBeSaved) {
  PropertyList list;
  EXPECT_FALSE(list.SetInt("", 1));
  EXPECT_FALSE(list.SetDouble("nan", std::nan("")));
  EXPECT_FALSE(list.SetFloat("inf", std::numeric_limits<float>::infinity()));
  EXPECT_FALSE(list.SetDouble("-inf", -std::numeric_limits<double>::infinity()));
  EXPECT_TRUE(list.Empty());
  list.SetDouble("kept", 1.0);
  EXPECT_FALSE(list.SetDouble("kept", std::nan("")));
  EXPECT_EQ(list.GetDouble("kept", 0), 1.0);
}

TEST(PropertyList, RejectsTextThatIsNotValidUtf8) {
  PropertyList list;
  EXPECT_FALSE(list.SetString("name", "caf\xe9"));       // Latin-1
  EXPECT_FALSE(list.SetString("name", "\xc0\xaf"));      // overlong '/'
  EXPECT_FALSE(list.SetString("name", "\xed\xa0\x80"));  // surrogate
  EXPECT_FALSE(list.SetString("name", "\xe2\x82"));      // cut short
  EXPECT_FALSE(list.SetInt("k\xff", 1));
  EXPECT_TRUE(list.Empty());
  EXPECT_TRUE(list.SetString("name", "caf\xc3\xa9 \xf0\x9f\x8e\xac"));
  const auto restored = PropertyList::FromJSON(list.ToJSON());
  ASSERT_TRUE(restored);
  EXPECT_EQ(restored->GetString("name", ""), "caf\xc3\xa9 \xf0\x9f\x8e\xac");
}

TEST(PropertyList, RemoveAndClear) {
  PropertyList list;
  list.SetBool("ECP.Graphics.Expanded", true);
  EXPECT_TRUE(list.Remove("ECP.Graphics.Expanded"));
  EXPECT_TRUE(list.Remove("ECP.Graphics.Expanded"));
  EXPECT_FALSE(list.Has("ECP.Graphics.Expanded"));
  list.SetInt("a", 1);
  list.SetReadOnly("a", true);
  list.Clear();
  EXPECT_TRUE(list.Empty());
  EXPECT_FALSE(list.IsReadOnly("a"));
}

TEST(PropertyListJSON, RoundTripKeepsValuesAndReadOnlyMarks) {
  PropertyList list;
  list.SetFloat("HandlerEffectControls.SeparatorRatio", 0.1f);
  list.SetFloat("HandlerEffectControls.SeparatorRatioWhenMaximized", 0.7f);
  list.SetBool("HandlerEffectControls.AreKeyframesVisible", false);
  list.SetInt("big", std::numeric_limits<int>::min());
  list.SetDouble("whole", 3.0);
  list.SetString("path", "C:\\clips\n\"quoted\"");
  list.SetReadOnly("path", true);
  list.SetReadOnly("lockedAbsent", true);

  std::string error;
  const auto restored = PropertyList::FromJSON(list.ToJSON(), &error);
  ASSERT_TRUE(restored) << error;
  EXPECT_EQ(restored->GetFloat("HandlerEffectControls.SeparatorRatio", 0), 0.1f);
  EXPECT_EQ(restored->GetFloat("HandlerEffectControls.SeparatorRatioWhenMaximized", 0), 0.7f);
  EXPECT_FALSE(restored->GetBool("HandlerEffectControls.AreKeyframesVisible", true));
  EXPECT_EQ(restored->GetInt("big", 0), std::numeric_limits<int>::min());
  // A whole double must come back as a number, not turn into an int that reads differently.
  EXPECT_EQ(restored->GetDouble("whole", 0), 3.0);
  EXPECT_EQ(restored->GetString("path", ""), "C:\\clips\n\"quoted\"");
  EXPECT_TRUE(restored->IsReadOnly("path"));
  EXPECT_TRUE(restored->IsReadOnly("lockedAbsent"));
  EXPECT_EQ(restored->Keys(), list.Keys());
}

TEST(PropertyListJSON, EmptyListRoundTrips) {
  const auto restored = PropertyList::FromJSON(PropertyList().ToJSON());
  ASSERT_TRUE(restored);
  EXPECT_EQ(*restored, PropertyList());
  EXPECT_TRUE(PropertyList::FromJSON("{}"));
}

TEST(PropertyListJSON, IntegersOutsideIntRangeReadAsNumbers) {
  const auto list = PropertyList::FromJSON(R"({"values": {"a": 4294967296, "b": -4294967296}})");
  ASSERT_TRUE(list);
  EXPECT_EQ(list->GetDouble("a", 0), 4294967296.0);
  EXPECT_EQ(list->GetInt("a", -1), -1);
  EXPECT_EQ(list->GetDouble("b", 0), -4294967296.0);
}

TEST(PropertyListJSON, MalformedTextIsRefusedWithAReason) {
  for (const char* text :
       {"", "not json", "{", "[]", "42", R"({"values": []})", R"({"values": {"a": null}})",
        R"({"values": {"a": [1]}})", R"({"values": {"a": {"b": 1}}})", R"({"values": {"": 1}})",
        R"({"readOnly": "a"})", R"({"readOnly": [1]})", R"({"readOnly": [""]})"}) {
    std::string error;
    EXPECT_FALSE(PropertyList::FromJSON(text, &error)) << text;
    EXPECT_FALSE(error.empty()) << text;
  }
}

TEST(PropertyListJSON, EqualityComparesValuesAndReadOnlyMarks) {
  PropertyList a;
  PropertyList b;
  a.SetInt("k", 1);
  b.SetInt("k", 1);
  EXPECT_EQ(a, b);
  b.SetReadOnly("k", true);
  EXPECT_NE(a, b);
  a.SetReadOnly("k", true);
  a.SetStation("Elsewhere");
  EXPECT_EQ(a, b);
}
