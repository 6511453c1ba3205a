#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <optional>
#include <string>

#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessageLoop.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/Preferences.h"

namespace fs = std::filesystem;

namespace {

std::string ReadFile(const fs::path& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
}

void WriteFile(const fs::path& path, const std::string& text) {
  std::ofstream(path, std::ios::binary) << text;
}

std::vector<std::string> FileNames(const fs::path& directory) {
  std::vector<std::string> names;
  for (const auto& entry : fs::directory_iterator(directory)) {
    names.push_back(entry.path().filename().string());
  }
  std::sort(names.begin(), names.end());
  return names;
}

// Sets an environment variable for its lifetime and restores the old value.
class ScopedEnvironment {
 public:
  ScopedEnvironment(const char* name, const char* value) : mName(name) {
    if (const char* old = std::getenv(name)) {
      mOld = old;
    }
    if (value != nullptr) {
      ::setenv(name, value, 1);
    } else {
      ::unsetenv(name);
    }
  }
  ~ScopedEnvironment() {
    if (mOld) {
      ::setenv(mName, mOld->c_str(), 1);
    } else {
      ::unsetenv(mName);
    }
  }

 private:
  const char* mName;
  std::optional<std::string> mOld;
};

}  // namespace

class PreferencesTest : public ::testing::Test {
 protected:
  void SetUp() override {
    static int counter = 0;
    mDirectory = fs::temp_directory_path() /
                 ("ec-preferences-" + std::to_string(::getpid()) + "-" + std::to_string(++counter));
    fs::remove_all(mDirectory);
    mFile = mDirectory / "effectcontrols" / "preferences.json";
  }
  void TearDown() override { fs::remove_all(mDirectory); }

  MessagingTestScope mScope;
  fs::path mDirectory;
  fs::path mFile;
};

TEST_F(PreferencesTest, MissingFileMeansDefaults) {
  Preferences preferences(mFile);
  const auto result = preferences.Load();
  EXPECT_EQ(result.status, Preferences::LoadStatus::kMissing);
  EXPECT_TRUE(preferences.GetBool("effect.controls.is.keyframe.snapping", true));
  EXPECT_TRUE(preferences.Properties().Empty());
  EXPECT_FALSE(fs::exists(mFile));
}

TEST_F(PreferencesTest, SavedValuesComeBackInANewSession) {
  {
    Preferences preferences(mFile);
    preferences.Load();
    preferences.SetBool("effect.controls.is.snapping.to.cti", false);
    preferences.SetInt("count", 12);
    preferences.SetFloat("ratio", 0.3f);
    preferences.SetDouble("seconds.per.pixel", 0.004);
    preferences.SetString("last.preset", "Blur & Glow");
    preferences.Properties().SetReadOnly("be.prefs.effectcontrols.showtimerulernumbers", true);
    std::string error;
    ASSERT_TRUE(preferences.Save(&error)) << error;
  }
  Preferences again(mFile);
  EXPECT_EQ(again.Load().status, Preferences::LoadStatus::kLoaded);
  EXPECT_FALSE(again.GetBool("effect.controls.is.snapping.to.cti", true));
  EXPECT_EQ(again.GetInt("count", 0), 12);
  EXPECT_EQ(again.GetFloat("ratio", 0), 0.3f);
  EXPECT_EQ(again.GetDouble("seconds.per.pixel", 0), 0.004);
  EXPECT_EQ(again.GetString("last.preset", ""), "Blur & Glow");
  EXPECT_TRUE(again.IsReadOnly("be.prefs.effectcontrols.showtimerulernumbers"));
  EXPECT_FALSE(again.SetBool("be.prefs.effectcontrols.showtimerulernumbers", false));
}

TEST_F(PreferencesTest, SavingReplacesTheFileAndLeavesNoTemporaryBehind) {
  Preferences preferences(mFile);
  preferences.SetInt("n", 1);
  ASSERT_TRUE(preferences.Save());
  preferences.SetInt("n", 2);
  ASSERT_TRUE(preferences.Save());
  EXPECT_EQ(FileNames(mFile.parent_path()), (std::vector<std::string>{"preferences.json"}));
  Preferences again(mFile);
  again.Load();
  EXPECT_EQ(again.GetInt("n", 0), 2);
}

TEST_F(PreferencesTest, LoadReplacesValuesSetBefore) {
  Preferences writer(mFile);
  writer.SetInt("saved", 1);
  ASSERT_TRUE(writer.Save());
  Preferences preferences(mFile);
  preferences.SetInt("unsaved", 5);
  preferences.Load();
  EXPECT_FALSE(preferences.Properties().Has("unsaved"));
  EXPECT_EQ(preferences.GetInt("saved", 0), 1);
}

TEST_F(PreferencesTest, CorruptFileIsKeptAsideReportedOnceAndDefaultsUsed) {
  fs::create_directories(mFile.parent_path());
  WriteFile(mFile, R"({"values": {"effect.controls.is.keyframe.snapping": fal)");
  Preferences preferences(mFile);

  testing::internal::CaptureStderr();
  const auto result = preferences.Load();
  const auto second = preferences.Load();
  const std::string shown = testing::internal::GetCapturedStderr();

  EXPECT_EQ(result.status, Preferences::LoadStatus::kCorrupt);
  EXPECT_THAT(result.error, testing::HasSubstr("corrupt"));
  EXPECT_EQ(result.keptAside, fs::path(mFile.string() + ".corrupt"));
  EXPECT_EQ(ReadFile(result.keptAside),
            R"({"values": {"effect.controls.is.keyframe.snapping": fal)");
  EXPECT_EQ(second.status, Preferences::LoadStatus::kMissing);
  EXPECT_EQ(std::count(shown.begin(), shown.end(), '\n'), 1) << shown;
  EXPECT_THAT(shown, testing::HasSubstr("preferences.json.corrupt"));
  EXPECT_TRUE(preferences.GetBool("effect.controls.is.keyframe.snapping", true));

  // Saving afterwards writes a fresh file and leaves the kept copy alone.
  preferences.SetBool("effect.controls.is.keyframe.snapping", false);
  ASSERT_TRUE(preferences.Save());
  EXPECT_EQ(ReadFile(result.keptAside),
            R"({"values": {"effect.controls.is.keyframe.snapping": fal)");
  EXPECT_EQ(FileNames(mFile.parent_path()),
            (std::vector<std::string>{"preferences.json", "preferences.json.corrupt"}));
}

TEST_F(PreferencesTest, ASecondCorruptFileDoesNotOverwriteTheFirstKeptCopy) {
  fs::create_directories(mFile.parent_path());
  WriteFile(mFile, "first");
  WriteFile(mFile.string() + ".corrupt.1", "unrelated");
  Preferences preferences(mFile);
  testing::internal::CaptureStderr();
  EXPECT_EQ(preferences.Load().keptAside, fs::path(mFile.string() + ".corrupt"));
  WriteFile(mFile, "second");
  EXPECT_EQ(preferences.Load().keptAside, fs::path(mFile.string() + ".corrupt.2"));
  testing::internal::GetCapturedStderr();
  EXPECT_EQ(ReadFile(mFile.string() + ".corrupt"), "first");
  EXPECT_EQ(ReadFile(mFile.string() + ".corrupt.1"), "unrelated");
  EXPECT_EQ(ReadFile(mFile.string() + ".corrupt.2"), "second");
}

TEST_F(PreferencesTest, ACorruptFileThatCannotBeMovedAsideIsNeverWrittenOver) {
  // A name of the longest length allowed leaves no room for the ".corrupt" suffix.
  const fs::path file = mDirectory / (std::string(250, 'p') + ".json");
  fs::create_directories(mDirectory);
  WriteFile(file, "{corrupt");
  Preferences preferences(file);
  testing::internal::CaptureStderr();
  const auto result = preferences.Load();
  preferences.Load();
  preferences.SetInt("n", 1);
  std::string error;
  const bool saved = preferences.Save(&error);
  const std::string shown = testing::internal::GetCapturedStderr();

  EXPECT_EQ(result.status, Preferences::LoadStatus::kCorrupt);
  EXPECT_TRUE(result.keptAside.empty());
  EXPECT_FALSE(saved);
  EXPECT_THAT(error, testing::HasSubstr("could not be moved aside"));
  EXPECT_EQ(ReadFile(file), "{corrupt");
  // One line for the two loads, one for the refused save.
  EXPECT_EQ(std::count(shown.begin(), shown.end(), '\n'), 2) << shown;
}

TEST_F(PreferencesTest, EmptyOrWronglyShapedFilesAreCorrupt) {
  fs::create_directories(mFile.parent_path());
  for (const char* text : {"", "[1, 2]", R"({"values": {"a": null}})", "\xff\xfe"}) {
    WriteFile(mFile, text);
    Preferences preferences(mFile);
    testing::internal::CaptureStderr();
    const auto result = preferences.Load();
    testing::internal::GetCapturedStderr();
    EXPECT_EQ(result.status, Preferences::LoadStatus::kCorrupt) << text;
    EXPECT_FALSE(fs::exists(mFile)) << text;
  }
}

TEST_F(PreferencesTest, UnreadablePathIsNeverWrittenOver) {
  // A directory where the file should be: it cannot be read, and must not be replaced.
  fs::create_directories(mFile);
  WriteFile(mFile / "keep.txt", "user data");
  Preferences preferences(mFile);
  testing::internal::CaptureStderr();
  EXPECT_EQ(preferences.Load().status, Preferences::LoadStatus::kUnreadable);
  preferences.SetInt("n", 1);
  std::string error;
  EXPECT_FALSE(preferences.Save(&error));
  testing::internal::GetCapturedStderr();
  EXPECT_THAT(error, testing::HasSubstr("cannot read"));
  EXPECT_EQ(ReadFile(mFile / "keep.txt"), "user data");
}

TEST_F(PreferencesTest, SaveFailureIsReportedNotHidden) {
  fs::create_directories(mDirectory);
  WriteFile(mDirectory / "effectcontrols", "a file, not a directory");
  Preferences preferences(mFile);
  preferences.SetInt("n", 1);
  std::string error;
  testing::internal::CaptureStderr();
  EXPECT_FALSE(preferences.Save(&error));
  testing::internal::GetCapturedStderr();
  EXPECT_FALSE(error.empty());
  EXPECT_EQ(ReadFile(mDirectory / "effectcontrols"), "a file, not a directory");
}

TEST_F(PreferencesTest, ASymbolicLinkStaysALinkToTheSavedFile) {
  const fs::path dotfiles = mDirectory / "dotfiles" / "effectcontrols.json";
  fs::create_directories(dotfiles.parent_path());
  fs::create_directories(mFile.parent_path());
  Preferences first(dotfiles);
  first.SetInt("n", 1);
  ASSERT_TRUE(first.Save());
  fs::create_symlink(dotfiles, mFile);

  Preferences preferences(mFile);
  EXPECT_EQ(preferences.Load().status, Preferences::LoadStatus::kLoaded);
  EXPECT_EQ(preferences.GetInt("n", 0), 1);
  preferences.SetInt("n", 2);
  ASSERT_TRUE(preferences.Save());
  EXPECT_TRUE(fs::is_symlink(mFile));
  Preferences direct(dotfiles);
  direct.Load();
  EXPECT_EQ(direct.GetInt("n", 0), 2);
}

TEST_F(PreferencesTest, ReadOnlyPreferenceRefusesWrites) {
  Preferences preferences(mFile);
  preferences.SetBool("be.prefs.effectcontrols.showtimerulernumbers", true);
  preferences.Properties().SetReadOnly("be.prefs.effectcontrols.showtimerulernumbers", true);
  EXPECT_FALSE(preferences.SetBool("be.prefs.effectcontrols.showtimerulernumbers", false));
  EXPECT_FALSE(preferences.Remove("be.prefs.effectcontrols.showtimerulernumbers"));
  EXPECT_TRUE(preferences.GetBool("be.prefs.effectcontrols.showtimerulernumbers", false));
  EXPECT_EQ(preferences.Properties().GetStation(), Preferences::kStation);
}

TEST_F(PreferencesTest, DefaultPathFollowsXdgConfigHomeThenHome) {
  {
    ScopedEnvironment xdg("XDG_CONFIG_HOME", "/tmp/xdg");
    EXPECT_EQ(Preferences::DefaultFilePath(), fs::path("/tmp/xdg/effectcontrols/preferences.json"));
  }
  ScopedEnvironment home("HOME", "/home/editor");
  {
    ScopedEnvironment xdg("XDG_CONFIG_HOME", nullptr);
    EXPECT_EQ(Preferences::DefaultFilePath(),
              fs::path("/home/editor/.config/effectcontrols/preferences.json"));
  }
  {
    // Relative values are invalid for XDG_CONFIG_HOME and ignored.
    ScopedEnvironment xdg("XDG_CONFIG_HOME", "relative/dir");
    EXPECT_EQ(Preferences::DefaultFilePath(),
              fs::path("/home/editor/.config/effectcontrols/preferences.json"));
  }
}

TEST_F(PreferencesTest, ApplicationPreferencesAreInMemoryUnderTestAndCanBeInstalled) {
  EXPECT_TRUE(Preferences::Application().GetFilePath().empty());
  EXPECT_TRUE(Preferences::Application().SetBool("x", true));
  EXPECT_TRUE(Preferences::Application().Save());

  auto installed = std::make_unique<Preferences>(mFile);
  Preferences* const pointer = installed.get();
  Preferences::SetApplication(std::move(installed));
  EXPECT_EQ(&Preferences::Application(), pointer);
  Preferences::Application().SetInt("n", 3);
  ASSERT_TRUE(Preferences::Application().Save());
  EXPECT_TRUE(fs::exists(mFile));
}

TEST_F(PreferencesTest, AWriterThatFindsAReadOnlyKeyCanWarnOnThePreferencesStation) {
  std::vector<std::string> warned;
  FunctionListener listener([&](const Message& message) {
    if (const auto* warning = message.As<OverrideReadOnlyPropertyWarningMessage>()) {
      warned.push_back(warning->key);
    }
  });
  auto& preferences = Preferences::Application();
  AddListener(preferences.Properties().GetStation(), listener);
  preferences.Properties().SetReadOnly("be.prefs.effectcontrols.showtimerulernumbers", true);
  if (!preferences.SetBool("be.prefs.effectcontrols.showtimerulernumbers", false)) {
    PostMessageToUIThread(preferences.Properties().GetStation(),
                          std::make_shared<OverrideReadOnlyPropertyWarningMessage>(
                              "be.prefs.effectcontrols.showtimerulernumbers"));
  }
  EXPECT_TRUE(warned.empty());
  MessageLoop::Instance().RunPending();
  EXPECT_EQ(warned, (std::vector<std::string>{"be.prefs.effectcontrols.showtimerulernumbers"}));
}

TEST(PreferencesScope, TestScopeResetsApplicationPreferences) {
  {
    MessagingTestScope scope;
    Preferences::Application().SetBool("leak", true);
  }
  MessagingTestScope scope;
  EXPECT_FALSE(Preferences::Application().Properties().Has("leak"));
}
