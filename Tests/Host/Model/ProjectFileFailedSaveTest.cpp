// Saves that fail or are cut short: the file on disk is always a whole project, the old one or
// the new one. Each case runs the save in a child process, so that a write limit or a kill
// reaches only the save.

#include <gtest/gtest.h>
#include <signal.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <thread>

#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/ModelDescription.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/ProjectFile.h"
#include "Host/Model/Sequence.h"

namespace {

constexpr TickTime kSecond = kTicksPerSecond;

// A sequence of `clips` one-second clips on one video track; large when `clips` is.
ProjectRef MakeProject(const std::string& name, int clips) {
  ProjectBuilder builder(name);
  const SequenceRef sequence = builder.AddSequence("Sequence");
  const TrackRef track = builder.AddTrack(sequence, MediaType::Video, "V1");
  const MediaRef media =
      builder.AddMedia("long.mov", (clips + 10) * kSecond, ProjectBuilder::Streams::Video);
  const MasterClipRef master = builder.AddMasterClip("Long", media);
  for (int i = 0; i < clips; ++i) {
    builder.AddClip(track, master, {.start = i * kSecond, .end = (i + 1) * kSecond});
  }
  return builder.GetProject();
}

std::string ReadFile(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  std::ostringstream content;
  content << in.rdbuf();
  return content.str();
}

// Runs `body` in a child process and returns its exit status (-signal when a signal ended it).
template <class Body>
int RunInChild(Body body, std::chrono::milliseconds killAfter = std::chrono::milliseconds(-1)) {
  const pid_t child = ::fork();
  if (child == 0) {
    ::_exit(body());
  }
  if (killAfter.count() >= 0) {
    std::this_thread::sleep_for(killAfter);
    ::kill(child, SIGKILL);
  }
  int status = 0;
  ::waitpid(child, &status, 0);
  return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}

class ProjectFileFailedSaveTest : public ::testing::Test {
 protected:
  ProjectFileFailedSaveTest() {
    std::filesystem::remove_all(folder);
    std::filesystem::create_directories(folder);
  }
  ~ProjectFileFailedSaveTest() override { std::filesystem::remove_all(folder); }

  MessagingTestScope messaging;
  const std::string folder =
      (std::filesystem::temp_directory_path() / ("ec-failed-save-" + std::to_string(::getpid())))
          .string();
  const std::string path = folder + "/project.json";
};

}  // namespace

TEST_F(ProjectFileFailedSaveTest, AWriteThatRunsOutOfRoomKeepsTheOldFileAndSaysWhy) {
  const ProjectRef small = MakeProject("Small", 1);
  ASSERT_TRUE(ProjectFile::Save(*small, path));
  const std::string before = ReadFile(path);
  const ProjectRef large = MakeProject("Large", 200);
  ASSERT_GT(ProjectFile::SaveToString(*large).size(), 4 * before.size());

  // The child may write no more than the old file's size: the new one cannot fit.
  const int status = RunInChild([&] {
    ::signal(SIGXFSZ, SIG_IGN);
    const rlimit limit{before.size(), before.size()};
    ::setrlimit(RLIMIT_FSIZE, &limit);
    std::string error;
    const bool saved = ProjectFile::Save(*large, path, &error);
    const bool saysWhy = error.find("writing failed: File too large") != std::string::npos;
    return !saved && saysWhy ? 0 : 1;
  });
  EXPECT_EQ(status, 0) << "the save did not fail, or not with its reason";
  EXPECT_EQ(ReadFile(path), before);
  EXPECT_FALSE(std::filesystem::exists(path + ".saving"));
}

TEST_F(ProjectFileFailedSaveTest, AProcessKilledWhileSavingLeavesAWholeProject) {
  const ProjectRef first = MakeProject("First", 150);
  const ProjectRef second = MakeProject("Second", 151);
  ASSERT_TRUE(ProjectFile::Save(*first, path));
  const std::string firstText = ProjectFile::SaveToString(*first);
  const std::string secondText = ProjectFile::SaveToString(*second);
  // Killed at different moments of saving the two projects in turn, forever.
  for (const int milliseconds : {2, 20, 60}) {
    const int status = RunInChild(
        [&] {
          for (int i = 0;; ++i) {
            ProjectFile::Save(i % 2 == 0 ? *second : *first, path);
          }
          return 0;
        },
        std::chrono::milliseconds(milliseconds));
    EXPECT_EQ(status, -SIGKILL);
    const std::string text = ReadFile(path);
    EXPECT_TRUE(text == firstText || text == secondText)
        << "after " << milliseconds << " ms the file is neither project (" << text.size()
        << " bytes)";
  }
  EXPECT_TRUE(ProjectFile::Load(path));
}
