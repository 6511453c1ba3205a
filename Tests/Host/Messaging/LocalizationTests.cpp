#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Host/Messaging/Localization.h"
#include "Host/Messaging/MessagingTestScope.h"

class LocalizationTest : public ::testing::Test {
 protected:
  MessagingTestScope mScope;
};

TEST_F(LocalizationTest, DefaultTextWithoutTranslation) {
  EXPECT_EQ(LocalizeString("$$$/Vantile/Handlers/EffectControls/EffectControls=Effect Controls"),
            "Effect Controls");
  EXPECT_EQ(LocalizeString("$$$/Vantile/Handlers/EffectControls/Empty="), "");
}

TEST_F(LocalizationTest, TranslationWinsWhenTheTableHasOne) {
  SetLocalizedString("Vantile/Handlers/EffectControls/PlayAudio", "Nur den Ton abspielen");
  EXPECT_EQ(LocalizeString(
                "$$$/Vantile/Handlers/EffectControls/PlayAudio=Play only the audio for this clip"),
            "Nur den Ton abspielen");
  // Other keys keep their default.
  EXPECT_EQ(LocalizeString("$$$/Vantile/Handlers/EffectControls/LoopAudio=Loop"), "Loop");
}

TEST_F(LocalizationTest, TableAcceptsFullKeysAndIsCleared) {
  SetLocalizedString("$$$/A/B=ignored default", "translated");
  EXPECT_EQ(LocalizeString("$$$/A/B=default"), "translated");
  ClearLocalizedStrings();
  EXPECT_EQ(LocalizeString("$$$/A/B=default"), "default");
}

TEST_F(LocalizationTest, PlaceholdersAreFilledAndCommentDropped) {
  const char* key =
      "$$$/Vantile/Handlers/EffectControls/DisplayName=@0  @1#{comment}component name + channel "
      "map string";
  EXPECT_EQ(LocalizeString(key, {"Volume", "5.1"}), "Volume  5.1");
  EXPECT_EQ(LocalizeString("$$$/X=@1 before @0", {"a", "b"}), "b before a");
  EXPECT_EQ(LocalizeString("$$$/X=@0@0", {"ab"}), "abab");
}

TEST_F(LocalizationTest, TranslationsGetPlaceholdersAndCommentsToo) {
  SetLocalizedString("Vantile/Handlers/EffectControls/DisplayName", "@1 – @0#{translator note}");
  EXPECT_EQ(LocalizeString("$$$/Vantile/Handlers/EffectControls/DisplayName=@0  @1", {"Vol", "L"}),
            "L – Vol");
}

TEST_F(LocalizationTest, ArgumentsAreInsertedLiterally) {
  EXPECT_EQ(LocalizeString("$$$/X=@0 and @1", {"@1", "#{not a comment}"}),
            "@1 and #{not a comment}");
}

TEST_F(LocalizationTest, PlaceholdersWithoutArgumentsStayAsWritten) {
  EXPECT_EQ(LocalizeString("$$$/X=@0 of @1"), "@0 of @1");
  EXPECT_EQ(LocalizeString("$$$/X=@0 of @1", {"one"}), "one of @1");
  EXPECT_EQ(LocalizeString("$$$/X=@99999999999999999999 x", {"a"}), "@99999999999999999999 x");
  EXPECT_EQ(LocalizeString("$$$/X=mail@host, 100@ end@"), "mail@host, 100@ end@");
}

TEST_F(LocalizationTest, ManyPlaceholdersUseTheWholeNumber) {
  std::vector<std::string> args;
  for (int i = 0; i < 12; ++i) {
    args.push_back("a" + std::to_string(i));
  }
  EXPECT_EQ(LocalizeString("$$$/X=@11,@1,@10", args), "a11,a1,a10");
}

TEST_F(LocalizationTest, TheDefaultTextMayContainEqualsSigns) {
  EXPECT_EQ(LocalizeString("$$$/X/Y=a = b"), "a = b");
}

TEST_F(LocalizationTest, PlainTextIsReturnedUnchanged) {
  EXPECT_EQ(LocalizeString("Opacity"), "Opacity");
  EXPECT_EQ(LocalizeString("@0 items #{x}", {"3"}), "@0 items #{x}");
  EXPECT_EQ(LocalizeString(""), "");
  EXPECT_EQ(LocalizeString("$$/Almost=text"), "$$/Almost=text");
}

TEST_F(LocalizationTest, MalformedKeysResolveToThemselves) {
  for (const char* key : {"$$$/", "$$$/NoEquals", "$$$/=no path", "$$$/ =blank path", "$$$/\t=x"}) {
    EXPECT_EQ(LocalizeString(key, {"arg"}), key);
  }
  SetLocalizedString("NoEquals", "should not be used");
  EXPECT_EQ(LocalizeString("$$$/NoEquals"), "$$$/NoEquals");
}

TEST_F(LocalizationTest, TranslationsLoadFromJSON) {
  std::string error;
  ASSERT_TRUE(
      LoadLocalizedStringsFromJSON(R"({"A/Title": "Titel", "$$$/B/Name": "Name @0"})", &error))
      << error;
  EXPECT_EQ(LocalizeString("$$$/A/Title=Title"), "Titel");
  EXPECT_EQ(LocalizeString("$$$/B/Name=Name", {"x"}), "Name x");
}

TEST_F(LocalizationTest, BadTranslationFilesAddNothing) {
  for (const char* text : {"", "[]", R"({"A": 1})", R"({"A": "ok", "B": null})", R"({"": "x"})",
                           "{\"A\": \"unterminated"}) {
    std::string error;
    EXPECT_FALSE(LoadLocalizedStringsFromJSON(text, &error)) << text;
    EXPECT_FALSE(error.empty()) << text;
  }
  EXPECT_EQ(LocalizeString("$$$/A=default"), "default");
}
