// The program as a person uses it: the timeline beside the panel picks what the panel shows, and
// the program monitor shows what the edits do. Clicks are placed from a first run's dump (the
// timeline items' rectangles); pixels are read from shots and compared with the model's values
// read from the project the run saved.
//
// Built with EC_PROGRAM (the effectcontrols executable) and EC_OUT (where the runs write).
#include <gtest/gtest.h>

#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectFile.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Toolkit/Image.h"
#include "Tests/Handlers/EffectControls/Program/ScriptedPanelRun.h"

namespace {

using namespace program_test;

constexpr TickTime kSecond = kTicksPerSecond;
constexpr int kBeach = 21;         // V1, its Opacity rises from 0 over the first second
constexpr int kLowerThird = 111;   // V2
constexpr int kSecondBeach = 136;  // V2, not linked to the lower third
constexpr int kTransition = 107;   // V1, over the cut after the beach

// EC_WINDOWED set (on a virtual display): the same runs in a window, through its real input
// events and its read-back shots.
bool Windowed() {
  const char* windowed = std::getenv("EC_WINDOWED");
  return windowed != nullptr && *windowed != '\0';
}

std::vector<std::string> Options() {
  return {"--layout", "editing", "--size", "1260x860"};
}

bool RunWorkspace(const fs::path& out, const std::string& script) {
  if (!Windowed())
    return RunProgram(out, script, Options());
  const fs::path scriptPath = out / "script.ecs";
  std::ofstream(scriptPath) << script;
  std::vector<std::string> arguments = Options();
  arguments.insert(arguments.end(), {"--script", scriptPath.string(), "--out", out.string()});
  if (!RunProgramWith(arguments, out / "run.log"))
    return false;
  const std::string log = ReadText(out / "run.log");
  EXPECT_EQ(log.find("warning:"), std::string::npos) << log;
  return true;
}

fs::path Out(const std::string& name) {
  const fs::path out = fs::path(EC_OUT) / (Windowed() ? name + "-window" : name);
  fs::remove_all(out);
  fs::create_directories(out);
  return out;
}

// "X Y" of the centre of the timeline's item `id`, from a dump.
std::string CentreOfItem(const json& dump, int id) {
  for (const json& item : dump.at("workspace").at("timeline").at("items")) {
    if (item.at("id").get<int>() == id) {
      const json& rect = item.at("rect");
      return std::to_string(rect.at("x").get<int>() + rect.at("width").get<int>() / 2) + " " +
             std::to_string(rect.at("y").get<int>() + rect.at("height").get<int>() / 2);
    }
  }
  ADD_FAILURE() << "the timeline draws no item " << id;
  return "0 0";
}

TEST(WorkspaceProgram, TheTimelinePicksWhatThePanelShows) {
  const fs::path first = Out("workspace-layout");
  ASSERT_TRUE(RunWorkspace(first, "dump layout.json\n"));
  const json layout = ReadJson(first / "layout.json");
  ASSERT_NE(layout.at("sequence").at("selection"), json::array({json::array({kLowerThird})}));

  const fs::path out = Out("workspace-timeline");
  const std::string script = "click " + CentreOfItem(layout, kLowerThird) +
                             "\ndump one.json\n"
                             "click " +
                             CentreOfItem(layout, kSecondBeach) +
                             " ctrl\ndump two.json\n"
                             "dblclick " +
                             CentreOfItem(layout, kTransition) + "\ndump transition.json\n";
  ASSERT_TRUE(RunWorkspace(out, script));

  const json one = ReadJson(out / "one.json");
  EXPECT_EQ(one.at("sequence").at("selection"), json::array({json::array({kLowerThird})}));
  EXPECT_FALSE(Panel(one).at("rows").empty());
  EXPECT_NE(Panel(one).at("header").get<std::string>().find("Lower Third"), std::string::npos)
      << Panel(one).at("header");
  const json two = ReadJson(out / "two.json");
  EXPECT_EQ(Panel(two).at("header"), "Multiple clips selected");
  const json transition = ReadJson(out / "transition.json");
  EXPECT_EQ(Panel(transition).at("targetMode"), 2);
  EXPECT_EQ(transition.at("sequence").at("selection"), json::array({json::array({kTransition})}));
}

struct Pixel {
  int r = 0, g = 0, b = 0;
};

Pixel CentrePixel(const fs::path& shot, const json& dump) {
  std::string error;
  const Image image = Image::LoadPNG(shot.string(), 1.0, &error);
  EXPECT_FALSE(image.IsEmpty()) << error;
  const json& frame = dump.at("workspace").at("monitor").at("frameInWindow");
  const Color c = image.GetPixel(frame.at("x").get<int>() + frame.at("width").get<int>() / 2,
                                 frame.at("y").get<int>() + frame.at("height").get<int>() / 2);
  return {c.r, c.g, c.b};
}

TEST(WorkspaceProgram, TheMonitorShowsOpacityAsTheModelSays) {
  const fs::path out = Out("workspace-monitor");
  const TickTime early = kSecond / 4;
  const TickTime later = kSecond * 3 / 4;
  const std::string script = "select " + std::to_string(kBeach) + "\ntime " +
                             std::to_string(early) + "\nshot early.png\ndump early.json\ntime " +
                             std::to_string(later) + "\nshot later.png\nsave project.json\n";
  ASSERT_TRUE(RunWorkspace(out, script));

  const ProjectLoadResult loaded = ProjectFile::Load((out / "project.json").string());
  ASSERT_TRUE(loaded) << loaded.error;
  const SequenceRef& sequence = loaded.project->GetActiveSequence();
  const TrackItemRef beach = sequence->FindTrackItem(kBeach);
  ASSERT_NE(beach, nullptr);
  ASSERT_GT(sequence->FindTrackItem(kLowerThird)->GetStart(), later)
      << "the lower third covers the beach at the times read";
  const ComponentParamRef opacity =
      beach->GetComponentChain()->FindByMatchName(kMatchName_Opacity)->FindParam("Opacity");
  const std::uint32_t label = beach->GetLabelColor();
  const json dump = ReadJson(out / "early.json");
  std::vector<double> seen;
  for (const auto& [time, shot] : {std::pair{early, "early.png"}, std::pair{later, "later.png"}}) {
    const double value =
        *opacity->GetScalarAt(beach->SequenceTimeToClipTime(SequenceTime(time)).Ticks()) / 100.0;
    const Pixel pixel = CentrePixel(out / shot, dump);
    SCOPED_TRACE(std::string(shot) + " at opacity " + std::to_string(value));
    EXPECT_NEAR(pixel.r, std::lround(((label >> 16) & 0xFF) * value), 3);
    EXPECT_NEAR(pixel.g, std::lround(((label >> 8) & 0xFF) * value), 3);
    EXPECT_NEAR(pixel.b, std::lround((label & 0xFF) * value), 3);
    seen.push_back(value);
  }
  EXPECT_GT(seen[1] - seen[0], 0.2) << "the two times should show different opacities";
}

}  // namespace
