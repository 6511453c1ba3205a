// Edits every kind of value row of the demo project in the program, in both row styles: the
// host's angle and point rows, and the panel's own slider rows (the preference
// "effect.controls.own.slider.rows"). A first run dumps the rows of the demo's effects clip;
// the clicks of the second run are placed from that dump (the list's place in the panel, each
// row's top and group level, and the rule that value controls start at the middle of the row
// less 20 pixels). Each edit must be one undo step, and undoing them all must give back the
// saved project byte for byte. The dump must name the panel's own row classes.
//
// Built with EC_PROGRAM (the effectcontrols executable), EC_EXAMPLES (the example projects, whose
// demo.json is the program's built-in demo) and EC_OUT (where the runs write).
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <nlohmann/json.hpp>
#include <optional>
#include <sstream>
#include <string>
#include <vector>

#include "Tests/Handlers/EffectControls/Program/ScriptedPanelRun.h"

namespace {

using namespace program_test;

constexpr const char* kOwnRowsPreference = "effect.controls.own.slider.rows";
constexpr const char* kSize = "1200x1400";

// The program's options for a run in one row style.
std::vector<std::string> Options(bool ownRows) {
  return {"--size", kSize, "--pref",
          std::string(kOwnRowsPreference) + (ownRows ? "=true" : "=false")};
}

// The id of the demo's clip that carries Matte From Track (and with it the timecode, button and
// opaque parameters).
std::optional<long long> EffectsClipId() {
  const json demo = ReadJson(fs::path(EC_EXAMPLES) / "demo.json");
  for (const json& sequence : demo.at("sequences")) {
    for (const json& track : sequence.at("tracks")) {
      for (const json& item : track.at("items")) {
        if (!item.contains("chain")) {
          continue;
        }
        for (const json& component : item.at("chain").at("components")) {
          if (component.value("matchName", "") == "XO.KRVN MatteFromTrack") {
            return item.at("id").get<long long>();
          }
        }
      }
    }
  }
  return std::nullopt;
}

// Panel coordinates of a point `dx` into the row's value controls, halfway down its band.
std::string ControlPoint(const ListPlace& list, const Row& row, int dx) {
  const int controlsLeft = row.groupLevel * kIndentPerGroupLevel + list.width / 2 - 20;
  std::ostringstream text;
  text << list.left + controlsLeft + dx << " " << list.top + row.top + 10;
  return text.str();
}

// The disclosure triangle at the row's indent + 3.
std::string StopwatchPoint(const ListPlace& list, const Row& row) {
  std::ostringstream text;
  text << list.left + row.groupLevel * kIndentPerGroupLevel + 20 + 8 << " "
       << list.top + row.top + 10;
  return text.str();
}

class ValueRowsProgram : public ::testing::TestWithParam<bool> {
 protected:
  void SetUp() override {
    const auto id = EffectsClipId();
    ASSERT_TRUE(id.has_value()) << "the demo has no clip with Matte From Track";
    clipId = *id;
    out = fs::path(EC_OUT) / (GetParam() ? "own-rows" : "host-rows");
    fs::remove_all(out);
    fs::create_directories(out / "layout");
    fs::create_directories(out / "edits");
  }

  // Selects the clip at 11 s (inside it), opens the collapsed group that holds the opaque
  // parameter, and dumps the rows; `opening` is set to the script lines that got there.
  json Layout(std::string& opening) {
    opening = "time 00:00:11:00\nselect " + std::to_string(clipId) + "\n";
    if (!RunProgram(out / "layout", opening + "dump closed.json\n", Options(GetParam()))) {
      return {};
    }
    const json closedDump = ReadJson(out / "layout" / "closed.json");
    const json& closed = Panel(closedDump);
    const auto group = FindRow(closed, {"Grid Distortion", "Advanced"});
    if (!group) {
      ADD_FAILURE() << "no Advanced group";
      return {};
    }
    opening += "click " + TrianglePoint(PlaceOf(closed), *group) + "\n";
    if (!RunProgram(out / "layout", opening + "dump rows.json\n", Options(GetParam()))) {
      return {};
    }
    return ReadJson(out / "layout" / "rows.json");
  }

  long long clipId = 0;
  fs::path out;
};

TEST_P(ValueRowsProgram, EachEditIsOneStepAndUndoingThemAllRestoresTheSavedProject) {
  const bool ownRows = GetParam();
  std::string opening;
  const json layout = Layout(opening);
  ASSERT_FALSE(layout.is_null());
  const json& panel = Panel(layout);
  for (const json& row : panel.at("rows")) {
    const std::string className = row.at("class").get<std::string>();
    for (const char* own :
         {"VideoFloatSliderParameter", "AngleSliderParameter", "PointSliderParameter",
          "ButtonParameter", "TimecodeParameter", "TrackMenuParameter", "OpaqueParameter"}) {
      EXPECT_NE(className.rfind(std::string(own) + " (host ", 0), 0u)
          << "a host row stands in for " << row.at("path").dump();
    }
  }
  const ListPlace list = PlaceOf(panel);

  struct Edit {
    std::vector<std::string> path;
    int nth;
    std::string className;
    std::string lines;  // %C: the control point, %S: the stopwatch, %T: the turns field
    std::string action;
  };
  std::vector<Edit> edits = {
      {{"Motion", "Scale"},
       0,
       "VideoFloatSliderParameter",
       "drag %C(15) %C(60) steps 5",
       "MZ.ComponentParam.SetValue"},
      {{"Opacity", "Opacity"},
       0,
       "VideoFloatSliderParameter",
       "click %C(15)\ntype 42\nkey Return",
       "MZ.ComponentParam.SetValue"},
      {{"Timecode", "Starting Timecode"},
       0,
       "TimecodeParameter",
       "drag %C(20) %C(50) steps 6",
       "MZ.ComponentParam.SetValue"},
      {{"Timecode", "Starting Timecode"},
       0,
       "TimecodeParameter",
       "click %C(20)\ntype 00:00:02:10\nkey Return",
       "MZ.ComponentParam.SetValue"},
      {{"Grid Distortion", "Reset Grid"},
       0,
       "ButtonParameter",
       "click %C(20)",
       "MZ.ComponentParam.SetValue"},
      {{"Matte From Track", "Matte"},
       0,
       "TrackMenuParameter",
       "menu-answer 18603\nclick %C(20)",
       "MZ.ComponentParam.SetValue"},
      {{"Advanced", "Settings"},
       0,
       "OpaqueParameter",
       "click %S",
       "MZ.ComponentParam.SetTimeVarying"},
  };
  if (ownRows) {
    edits.push_back({{"Motion", "Rotation"},
                     0,
                     "AngleSliderParameter",
                     "drag %C(15) %C(45) steps 5",
                     "MZ.ComponentParam.SetValue"});
    edits.push_back({{"Motion", "Rotation"},
                     0,
                     "AngleSliderParameter",
                     "click %T\ntype 3\nkey Return",
                     "MZ.ComponentParam.SetValue"});
    edits.push_back({{"Motion", "Position"},
                     0,
                     "PointSliderParameter",
                     "drag %C(15) %C(55) steps 5",
                     "MZ.ComponentParam.SetValue"});
    edits.push_back({{"Motion", "Position"},
                     1,
                     "PointSliderParameter",
                     "click %C(15)\ntype 300\nkey Return",
                     "MZ.ComponentParam.SetValue"});
  }

  std::ostringstream script;
  script << opening << "save before.project.json\n";
  for (std::size_t i = 0; i < edits.size(); ++i) {
    const Edit& edit = edits[i];
    const auto row = FindRow(panel, edit.path, edit.nth);
    ASSERT_TRUE(row.has_value()) << "no row " << edit.path.back();
    EXPECT_EQ(row->className, edit.className) << edit.path.back();
    ASSERT_TRUE(row->shown) << edit.path.back() << " is not shown";
    std::string lines = edit.lines;
    for (std::size_t at; (at = lines.find('%')) != std::string::npos;) {
      const char kind = lines[at + 1];
      std::string replacement;
      std::size_t length = 2;
      if (kind == 'S') {
        replacement = StopwatchPoint(list, *row);
      } else if (kind == 'T') {
        // The turns field sits right of the 70-pixel value field.
        replacement = ControlPoint(list, *row, 10 + 70 + 4 + 10);
      } else {
        const std::size_t close = lines.find(')', at);
        replacement = ControlPoint(list, *row, std::stoi(lines.substr(at + 3, close - at - 3)));
        length = close - at + 1;
      }
      lines.replace(at, length, replacement);
    }
    script << lines << "\ndump edit" << i << ".dump.json\n";
  }
  script << "save edited.project.json\n";
  for (std::size_t i = 0; i < edits.size(); ++i) {
    script << "undo\n";
  }
  script << "dump undone.dump.json\nsave undone.project.json\n";
  ASSERT_TRUE(RunProgram(out / "edits", script.str(), Options(ownRows)));

  for (std::size_t i = 0; i < edits.size(); ++i) {
    const json dump = ReadJson(out / "edits" / ("edit" + std::to_string(i) + ".dump.json"));
    EXPECT_TRUE(dump.at("assertions").empty()) << dump.at("assertions").dump();
    const std::vector<std::string> done = UndoDone(dump);
    ASSERT_EQ(done.size(), i + 1) << "editing " << edits[i].path.back() << " (" << edits[i].lines
                                  << ") made " << done.size() - i << " steps";
    EXPECT_EQ(done.back(), edits[i].action) << edits[i].path.back();
  }
  // What the edits wrote, read from the saved file.
  const json edited = ReadJson(out / "edits" / "edited.project.json");
  const auto value = [&](const char* matchName, const char* paramName) {
    const json* param = FindProjectParam(edited, clipId, matchName, paramName);
    return param != nullptr ? param->at("value") : json();
  };
  EXPECT_EQ(value("XO.KRVN Opacity", "Opacity"), (json{{"double", 42.0}}));
  EXPECT_EQ(value("XO.KRVN MatteFromTrack", "Matte"), (json{{"choice", 3}}));
  EXPECT_EQ(value("XO.KRVN GridDistortion", "Reset Grid"), (json{{"bool", true}}));
  // 00:00:02:10 at 25 fps is frame 60, stored in ticks.
  EXPECT_EQ(value("XO.KRVN Timecode", "Starting Timecode"),
            (json{{"double", 60.0 * 10160640000.0}}));
  const json* settings = FindProjectParam(edited, clipId, "XO.KRVN GridDistortion", "Settings");
  ASSERT_NE(settings, nullptr);
  EXPECT_TRUE(settings->at("timeVarying").get<bool>());
  if (ownRows) {
    const json rotation = value("XO.KRVN Motion", "Rotation");
    ASSERT_TRUE(rotation.contains("double"));
    // Three whole turns typed over the rest that the drag left.
    EXPECT_GT(rotation.at("double").get<double>(), 3 * 360.0 - 180.0);
    EXPECT_LE(rotation.at("double").get<double>(), 3 * 360.0 + 180.0);
    const json position = value("XO.KRVN Motion", "Position");
    ASSERT_TRUE(position.contains("point"));
    EXPECT_EQ(position.at("point").at(1).get<double>(), 300.0);
    EXPECT_NE(position.at("point").at(0).get<double>(), 960.0);
  }
  EXPECT_NE(ReadText(out / "edits" / "before.project.json"),
            ReadText(out / "edits" / "edited.project.json"));

  const json undone = ReadJson(out / "edits" / "undone.dump.json");
  EXPECT_TRUE(UndoDone(undone).empty());
  EXPECT_EQ(ReadText(out / "edits" / "before.project.json"),
            ReadText(out / "edits" / "undone.project.json"))
      << "undoing every edit did not restore the saved project";
}

INSTANTIATE_TEST_SUITE_P(BothRowStyles, ValueRowsProgram, ::testing::Bool(),
                         [](const ::testing::TestParamInfo<bool>& param) {
                           return param.param ? std::string("OwnSliderRows")
                                              : std::string("HostRows");
                         });

}  // namespace
