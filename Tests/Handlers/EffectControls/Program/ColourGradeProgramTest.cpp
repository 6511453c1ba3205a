// Drags in the colour groups of the demo's "Colour Grade" clip in the program: a point of the
// luma curve, the colour balance wheel and a hue range handle, placed from dumps (the list's
// place in the panel, the group rows' tops and levels, and the groups' layout rules: a curve
// S = (W - 55) / 2 wide at the indent + 20 with a 20-pixel label strip; a wheel
// D = W - indent - 90 across at the indent + 35, 20 below the row's top; a range bar
// W - indent - 35 wide at the indent + 20, 5 below the row's top, its handles under the
// 18-pixel bar). Each drag must be one undo step, undoing them all must give back the saved
// project byte for byte, and a panel resized to 200 x 300 and back must show the same layout,
// with no negative size while it is small.
//
// Built with EC_PROGRAM (the effectcontrols executable), EC_EXAMPLES (the example projects, whose
// demo.json is the program's built-in demo) and EC_OUT (where the runs write).
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <nlohmann/json.hpp>
#include <optional>
#include <sstream>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "Tests/Handlers/EffectControls/Program/ScriptedPanelRun.h"

namespace {

using namespace program_test;

constexpr const char* kSize = "1200x2400";

// The program's options for every run: a panel tall enough for the expanded groups.
std::vector<std::string> Options() {
  return {"--size", kSize};
}

// The id of the demo's clip named "Colour Grade".
std::optional<long long> ColourGradeClipId() {
  const json demo = ReadJson(fs::path(EC_EXAMPLES) / "demo.json");
  for (const json& sequence : demo.at("sequences")) {
    for (const json& track : sequence.at("tracks")) {
      for (const json& item : track.at("items")) {
        if (item.value("name", "") == "Colour Grade") {
          return item.at("id").get<long long>();
        }
      }
    }
  }
  return std::nullopt;
}

// "x y" in panel coordinates.
std::string At(int x, int y) {
  return std::to_string(x) + " " + std::to_string(y);
}

// Every row's path, top and height, one line each: what "the same layout" compares.
std::string Layout(const json& panel) {
  std::string text;
  for (const json& row : panel.at("rows")) {
    text += row.at("path").dump() + " " + std::to_string(row.at("top").get<int>()) + " " +
            std::to_string(row.at("height").get<int>()) + "\n";
  }
  return text;
}

class ColourGradeProgram : public ::testing::Test {
 protected:
  void SetUp() override {
    const auto id = ColourGradeClipId();
    ASSERT_TRUE(id.has_value()) << "the demo has no Colour Grade clip";
    clipId = *id;
    out = fs::path(EC_OUT);
    fs::remove_all(out);
    fs::create_directories(out / "layout");
    fs::create_directories(out / "edits");
  }

  // Runs `opening` and dumps; the panel of the dump.
  json DumpAfter(const std::string& opening, const std::string& name) {
    if (!RunProgram(out / "layout", opening + "dump " + name + "\n", Options())) {
      return {};
    }
    return ReadJson(out / "layout" / name);
  }

  long long clipId = 0;
  fs::path out;
};

TEST_F(ColourGradeProgram, CurveWheelAndRangeDragsAreOneStepEachAndUndoRestoresTheSavedProject) {
  // Opens the three groups one at a time, each from a dump taken after the one before.
  std::string opening = "time 00:00:18:00\nselect " + std::to_string(clipId) + "\n";
  const std::vector<std::pair<std::vector<std::string>, std::string>> groups = {
      {{"Luma Curve", "Luma Curve"}, "GroupCurveBeginParameter"},
      {{"Color Balance Wheel", "Balance"}, "GroupHueBalanceAndPhaseBeginParameter"},
      {{"Hue Range", "Hue Range"}, "GroupHueRangeDefinitionBeginParameter"}};
  for (std::size_t g = 0; g < groups.size(); ++g) {
    const json dump = DumpAfter(opening, "closed" + std::to_string(g) + ".json");
    ASSERT_FALSE(dump.is_null());
    const auto group = FindRow(Panel(dump), groups[g].first);
    ASSERT_TRUE(group.has_value()) << groups[g].first.back();
    EXPECT_EQ(group->className, groups[g].second);
    opening += "click " + TrianglePoint(PlaceOf(Panel(dump)), *group) + "\n";
  }
  const json openDump = DumpAfter(opening, "open.json");
  ASSERT_FALSE(openDump.is_null());
  const json& panel = Panel(openDump);
  const ListPlace list = PlaceOf(panel);
  const auto curve = FindRow(panel, {"Luma Curve", "Luma Curve"});
  const auto wheel = FindRow(panel, {"Color Balance Wheel", "Balance"});
  const auto range = FindRow(panel, {"Hue Range", "Hue Range"});
  ASSERT_TRUE(curve && wheel && range);
  ASSERT_TRUE(curve->shown && wheel->shown && range->shown);

  // The demo's second luma point is at levels (64, 52); drag it up by a quarter of the plot.
  const int side = (list.width - 55) / 2;
  const int curveLeft = list.left + curve->groupLevel * kIndentPerGroupLevel + 20;
  const int plotBottom = list.top + curve->top + 20 + side - 1;
  const auto level = [&](int value) { return (value * (side - 1) + 127) / 255; };
  const int pointX = curveLeft + level(64);
  const int pointY = plotBottom - level(52);
  // The wheel's centre, and a quarter of its diameter above it.
  const int indent = wheel->groupLevel * kIndentPerGroupLevel;
  const int diameter = list.width - indent - 90;
  ASSERT_GT(diameter, 40);
  const int centerX = list.left + indent + 35 + (diameter - 1) / 2;
  const int centerY = list.top + wheel->top + 20 + (diameter - 1) / 2;

  // The hue range's end threshold handle (180 of 0..360) under its bar, 20 pixels to the left.
  const int rangeIndent = range->groupLevel * kIndentPerGroupLevel;
  const int rangeWidth = list.width - rangeIndent - 35;
  const int handleX = list.left + rangeIndent + 20 + (rangeWidth - 1) / 2;
  const int handleY = list.top + range->top + 5 + 18 + 4;

  std::ostringstream script;
  script << opening << "save before.project.json\n"
         << "drag " << At(pointX, pointY) << " " << At(pointX, pointY - side / 4) << " steps 5\n"
         << "dump curve.dump.json\n"
         << "drag " << At(centerX + 2, centerY) << " " << At(centerX, centerY - diameter / 4)
         << " steps 5\n"
         << "dump wheel.dump.json\n"
         << "drag " << At(handleX, handleY) << " " << At(handleX - 20, handleY) << " steps 4\n"
         << "dump range.dump.json\nsave edited.project.json\n"
         << "resize 200 300\ndump tiny.dump.json\nresize 1200 2400\ndump back.dump.json\n"
         << "undo\nundo\nundo\ndump undone.dump.json\nsave undone.project.json\n";
  ASSERT_TRUE(RunProgram(out / "edits", script.str(), Options()));

  const json curveEdit = ReadJson(out / "edits" / "curve.dump.json");
  EXPECT_EQ(UndoDone(curveEdit), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  EXPECT_TRUE(curveEdit.at("assertions").empty()) << curveEdit.at("assertions").dump();
  const json wheelEdit = ReadJson(out / "edits" / "wheel.dump.json");
  EXPECT_EQ(UndoDone(wheelEdit),
            (std::vector<std::string>{"MZ.ComponentParam.SetValue", "MZ.ComponentParam.SetValue"}));
  const json rangeEdit = ReadJson(out / "edits" / "range.dump.json");
  EXPECT_EQ(UndoDone(rangeEdit).size(), 3u) << "the range handle drag is one step";
  EXPECT_TRUE(rangeEdit.at("assertions").empty()) << rangeEdit.at("assertions").dump();
  const std::string before = ReadText(out / "edits" / "before.project.json");
  const std::string edited = ReadText(out / "edits" / "edited.project.json");
  EXPECT_NE(before, edited);

  const json tiny = ReadJson(out / "edits" / "tiny.dump.json");
  for (const json& row : Panel(tiny).at("rows")) {
    EXPECT_GE(row.at("height").get<int>(), 0) << row.at("path").dump();
  }
  EXPECT_EQ(Layout(Panel(ReadJson(out / "edits" / "back.dump.json"))), Layout(Panel(rangeEdit)))
      << "resizing to tiny and back changed the layout";

  EXPECT_TRUE(UndoDone(ReadJson(out / "edits" / "undone.dump.json")).empty());
  EXPECT_EQ(before, ReadText(out / "edits" / "undone.project.json"))
      << "undoing the three drags did not restore the saved project";
}

// The levels group (its level rows hidden, so its controls start at its top: the input levels
// control at the indent + 15, 22 below, W - 20 - indent wide, its handles under a 10-pixel ramp)
// and the tonal range (laid out as the hue range, on 0..100).
TEST_F(ColourGradeProgram, LevelsAndTonalRangeDragsAreOneStepEachAndUndoRestoresTheSavedProject) {
  std::string opening = "time 00:00:18:00\nselect " + std::to_string(clipId) + "\n";
  const std::vector<std::pair<std::vector<std::string>, std::string>> groups = {
      {{"Levels", "Levels"}, "GroupLevelsBeginParameter"},
      {{"Tonal Range", "Tonal Range"}, "GroupTonalRangeDefinitionBeginParameter"}};
  for (std::size_t g = 0; g < groups.size(); ++g) {
    const json dump = DumpAfter(opening, "closed" + std::to_string(g) + ".json");
    ASSERT_FALSE(dump.is_null());
    const auto group = FindRow(Panel(dump), groups[g].first);
    ASSERT_TRUE(group.has_value()) << groups[g].first.back();
    EXPECT_EQ(group->className, groups[g].second);
    opening += "click " + TrianglePoint(PlaceOf(Panel(dump)), *group) + "\n";
  }
  const json openDump = DumpAfter(opening, "open.json");
  ASSERT_FALSE(openDump.is_null());
  const json& panel = Panel(openDump);
  const ListPlace list = PlaceOf(panel);
  const auto levels = FindRow(panel, {"Levels", "Levels"});
  const auto tonal = FindRow(panel, {"Tonal Range", "Tonal Range"});
  ASSERT_TRUE(levels && tonal);
  ASSERT_TRUE(levels->shown && tonal->shown);

  // The demo's input white level (235 of 255), dragged 30 pixels to the left.
  const int levelsIndent = levels->groupLevel * kIndentPerGroupLevel;
  const int levelsWidth = list.width - 20 - levelsIndent;
  ASSERT_GT(levelsWidth, 100);
  const int whiteX = list.left + levelsIndent + 15 + (235 * (levelsWidth - 1) + 127) / 255;
  const int whiteY = list.top + levels->top + 22 + 10 + 3;
  // The tonal range's shadow threshold (25 of 0..100) under its bar, 20 pixels to the right.
  const int tonalIndent = tonal->groupLevel * kIndentPerGroupLevel;
  const int tonalWidth = list.width - tonalIndent - 35;
  const int shadowX = list.left + tonalIndent + 20 + (25 * (tonalWidth - 1) + 50) / 100;
  const int shadowY = list.top + tonal->top + 5 + 18 + 4;

  std::ostringstream script;
  script << opening << "save before.project.json\n"
         << "drag " << At(whiteX, whiteY) << " " << At(whiteX - 30, whiteY) << " steps 4\n"
         << "dump levels.dump.json\n"
         << "drag " << At(shadowX, shadowY) << " " << At(shadowX + 20, shadowY) << " steps 4\n"
         << "dump tonal.dump.json\nsave edited.project.json\n"
         << "undo\nundo\ndump undone.dump.json\nsave undone.project.json\n";
  ASSERT_TRUE(RunProgram(out / "edits", script.str(), Options()));

  const json levelsEdit = ReadJson(out / "edits" / "levels.dump.json");
  EXPECT_EQ(UndoDone(levelsEdit), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  EXPECT_TRUE(levelsEdit.at("assertions").empty()) << levelsEdit.at("assertions").dump();
  const json tonalEdit = ReadJson(out / "edits" / "tonal.dump.json");
  EXPECT_EQ(UndoDone(tonalEdit).size(), 2u) << "the tonal handle drag is one step";
  EXPECT_TRUE(tonalEdit.at("assertions").empty()) << tonalEdit.at("assertions").dump();
  const std::string before = ReadText(out / "edits" / "before.project.json");
  EXPECT_NE(before, ReadText(out / "edits" / "edited.project.json"));
  EXPECT_TRUE(UndoDone(ReadJson(out / "edits" / "undone.dump.json")).empty());
  EXPECT_EQ(before, ReadText(out / "edits" / "undone.project.json"))
      << "undoing the two drags did not restore the saved project";
}

}  // namespace
