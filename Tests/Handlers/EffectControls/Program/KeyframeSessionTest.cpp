// Drives the keyframe area of the program on the demo project as a user would: clicks on
// keyframe glyphs, a drag onto the edit line, a marquee over two rows, delete, copy and paste,
// the interpolation from the context menu, each undone until the saved project is the one
// before. Where to click comes from a first run's dump (each glyph's centre, the keyframe
// area's place, the edit line's x).
//
// Built with EC_PROGRAM (the effectcontrols executable) and EC_OUT (where the runs write).
// Track item 21 of examples/demo.json is Beach.mov with Position, Scale, Opacity and
// Blurriness keyframed.
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "Tests/Handlers/EffectControls/Program/ScriptedPanelRun.h"

namespace {

using program_test::ReadJson;
using program_test::ReadText;
using program_test::RunProgramWith;

namespace fs = std::filesystem;
using nlohmann::json;
using Strings = std::vector<std::string>;

constexpr const char* kEditLine = "00:00:05:10";

struct Glyph {
  Strings path;
  std::int64_t time = 0;
  int x = 0;
  int y = 0;
  bool selected = false;
};

class KeyframeSession : public ::testing::Test {
 protected:
  void SetUp() override {
    ASSERT_TRUE(Run("layout", {"select 21", std::string("time ") + kEditLine,
                               "dump layout.dump.json", "save before.json"}));
    layout = Panel("layout.dump.json");
    before = ReadText(dir / "before.json");
  }

  bool Run(const std::string& name, const Strings& lines) {
    return program_test::RunScriptLines(name, lines, dir);
  }

  json Panel(const std::string& file) const { return ReadJson(dir / file)["panels"][0]; }

  static std::vector<Glyph> Glyphs(const json& panel, const Strings& path) {
    std::vector<Glyph> glyphs;
    for (const json& glyph : panel["keyframeArea"]["glyphs"]) {
      if (glyph["path"].get<Strings>() == path) {
        glyphs.push_back({path, glyph["time"].get<std::int64_t>(), glyph["x"].get<int>(),
                          glyph["y"].get<int>(), glyph["selected"].get<bool>()});
      }
    }
    EXPECT_FALSE(glyphs.empty()) << "no glyph of " << json(path).dump();
    return glyphs;
  }
  static std::string At(const Glyph& glyph) {
    return std::to_string(glyph.x) + " " + std::to_string(glyph.y);
  }
  static std::set<std::pair<Strings, std::int64_t>> Selected(const json& panel) {
    std::set<std::pair<Strings, std::int64_t>> keys;
    for (const json& key : panel["keyframeArea"]["selectedKeyframes"]) {
      keys.insert({key["path"].get<Strings>(), key["time"].get<std::int64_t>()});
    }
    return keys;
  }
  // The keyframes of a parameter of track item 21 in a saved project.
  static json Keyframes(const json& project, const std::string& param) {
    const json* item = Find(project, [](const json& o) { return o.value("id", -1) == 21; });
    if (item == nullptr) {
      ADD_FAILURE() << "no track item 21";
      return json::array();
    }
    const json* found = Find(*item, [&](const json& o) {
      return o.contains("keyframes") && o.value("name", std::string()) == param;
    });
    return found ? (*found)["keyframes"] : json::array();
  }
  template <class Test>
  static const json* Find(const json& node, const Test& test) {
    if (node.is_object() && test(node)) {
      return &node;
    }
    if (node.is_structured()) {
      for (const json& child : node) {
        if (const json* hit = Find(child, test)) {
          return hit;
        }
      }
    }
    return nullptr;
  }
  static std::vector<std::int64_t> Times(const json& keyframes) {
    std::vector<std::int64_t> times;
    for (const json& key : keyframes) {
      times.push_back(key["time"].get<std::int64_t>());
    }
    return times;
  }
  int EditLineX() const { return layout["extra"]["currentTimeX"].get<int>(); }
  int AreaLeft() const { return layout["extra"]["keyframeAreaLeft"].get<int>(); }
  // The first glyph clear of the area's left edge, where a press grabs the list's separator.
  Glyph Away(const std::vector<Glyph>& glyphs) const {
    for (const Glyph& glyph : glyphs) {
      if (glyph.x > AreaLeft() + 10) {
        return glyph;
      }
    }
    ADD_FAILURE() << "every glyph on the area's edge";
    return glyphs.front();
  }

  fs::path dir;
  json layout;
  std::string before;
};

TEST_F(KeyframeSession, ADraggedKeyframeLandsOnTheEditLineAndUndoRestoresTheProject) {
  const Glyph opacity = Away(Glyphs(layout, {"Opacity", "Opacity"}));
  const int dropX = EditLineX() + 3;
  ASSERT_TRUE(
      Run("drag", {"select 21", std::string("time ") + kEditLine, "click " + At(opacity),
                   "drag " + At(opacity) + " " + std::to_string(dropX) + " " +
                       std::to_string(opacity.y) + " steps 6",
                   "dump dragged.dump.json", "save dragged.json", "undo", "save undone.json"}));
  const json dragged = Panel("dragged.dump.json");
  const auto selected = Selected(dragged);
  ASSERT_EQ(selected.size(), 1u);
  const std::int64_t landed = selected.begin()->second;
  // On the edit line, not where the pointer let go.
  for (const Glyph& glyph : Glyphs(dragged, {"Opacity", "Opacity"})) {
    if (glyph.time == landed) {
      EXPECT_EQ(glyph.x, EditLineX());
    }
  }
  const std::vector<std::int64_t> saved =
      Times(Keyframes(ReadJson(dir / "dragged.json"), "Opacity"));
  EXPECT_NE(std::find(saved.begin(), saved.end(), landed), saved.end());
  EXPECT_EQ(std::find(saved.begin(), saved.end(), opacity.time), saved.end());
  EXPECT_EQ(program_test::UndoDone(ReadJson(dir / "dragged.dump.json")).back(),
            "MZ.KeyframeSelection.MoveKeyframes");
  EXPECT_EQ(ReadText(dir / "undone.json"), before);
}

TEST_F(KeyframeSession, AMarqueeOverTwoRowsSelectsExactlyTheirKeyframes) {
  const std::vector<Glyph> position = Glyphs(layout, {"Motion", "Position"});
  const std::vector<Glyph> scale = Glyphs(layout, {"Motion", "Scale"});
  int left = position.front().x;
  int right = position.front().x;
  std::set<std::pair<Strings, std::int64_t>> expected;
  for (const auto* row : {&position, &scale}) {
    for (const Glyph& glyph : *row) {
      left = std::min(left, glyph.x);
      right = std::max(right, glyph.x);
      expected.insert({glyph.path, glyph.time});
    }
  }
  const int top = position.front().y - 6;
  const int bottom = scale.front().y + 6;
  ASSERT_TRUE(
      Run("marquee", {"select 21", std::string("time ") + kEditLine,
                      // From the right: the left end lies beyond the area, where the
                      // captured pointer still drags.
                      "drag " + std::to_string(right + 12) + " " + std::to_string(top) + " " +
                          std::to_string(left - 12) + " " + std::to_string(bottom) + " steps 5",
                      "dump marquee.dump.json"}));
  EXPECT_EQ(Selected(Panel("marquee.dump.json")), expected);
}

TEST_F(KeyframeSession, DeleteCopyAndPasteAreOneStepEachAndUndoRestoresTheProject) {
  const Glyph blur = Glyphs(layout, {"Gaussian Blur", "Blurriness"}).front();
  const std::vector<Glyph> scale = Glyphs(layout, {"Motion", "Scale"});
  ASSERT_GE(scale.size(), 3u);
  ASSERT_TRUE(Run("edit", {"select 21", std::string("time ") + kEditLine, "click " + At(blur),
                           "key Delete", "save deleted.json", "click " + At(scale[1]),
                           "click " + At(scale[2]) + " shift", "command 57634", "time 00:00:06:00",
                           "command 57637", "dump pasted.dump.json", "save pasted.json", "undo",
                           "undo", std::string("time ") + kEditLine, "save undone.json"}));
  const std::vector<std::int64_t> blurTimes =
      Times(Keyframes(ReadJson(dir / "deleted.json"), "Blurriness"));
  EXPECT_EQ(std::find(blurTimes.begin(), blurTimes.end(), blur.time), blurTimes.end());
  // The pasted pair keeps its spacing, its first keyframe at the edit line.
  const auto pasted = Selected(Panel("pasted.dump.json"));
  ASSERT_EQ(pasted.size(), 2u);
  const std::int64_t first = pasted.begin()->second;
  const std::int64_t second = std::next(pasted.begin())->second;
  EXPECT_EQ(second - first, scale[2].time - scale[1].time);
  const std::vector<std::int64_t> saved = Times(Keyframes(ReadJson(dir / "pasted.json"), "Scale"));
  EXPECT_EQ(saved.size(), scale.size() + 2);
  const Strings undo = program_test::UndoDone(ReadJson(dir / "pasted.dump.json"));
  ASSERT_GE(undo.size(), 2u);
  EXPECT_EQ(undo[undo.size() - 2], "MZ.KeyframeSelection.RemoveKeyframes");
  EXPECT_EQ(undo.back(), "MZ.KeyframeSelection.Paste");
  EXPECT_EQ(ReadText(dir / "undone.json"), before);
}

TEST_F(KeyframeSession, TheContextMenuSetsTheInterpolationAndUndoRestoresTheProject) {
  const std::vector<Glyph> scale = Glyphs(layout, {"Motion", "Scale"});
  ASSERT_GE(scale.size(), 2u);
  ASSERT_TRUE(
      Run("menu", {"select 21", std::string("time ") + kEditLine,
                   "menu-answer cmd.effectcontrols.interpolation.hold", "rclick " + At(scale[1]),
                   "save hold.json", "undo", "save undone.json"}));
  // Hold is the temporal code 0; only the clicked keyframe changed.
  const json was = Keyframes(json::parse(before), "Scale");
  const json now = Keyframes(ReadJson(dir / "hold.json"), "Scale");
  ASSERT_EQ(now.size(), was.size());
  for (std::size_t i = 0; i < now.size(); ++i) {
    const bool clicked = now[i]["time"].get<std::int64_t>() == scale[1].time;
    EXPECT_EQ(now[i]["interpolation"].get<int>(), clicked ? 0 : was[i]["interpolation"].get<int>())
        << now[i].dump();
  }
  EXPECT_NE(was[1]["interpolation"].get<int>(), 0);
  EXPECT_EQ(ReadText(dir / "undone.json"), before);
}

TEST_F(KeyframeSession, ADragInProgressShowsTheKeyframeOnTheEditLineBeforeTheRelease) {
  const Glyph opacity = Away(Glyphs(layout, {"Opacity", "Opacity"}));
  const std::string drop = std::to_string(EditLineX() + 2) + " " + std::to_string(opacity.y);
  ASSERT_TRUE(
      Run("shot", {"select 21", std::string("time ") + kEditLine, "click " + At(opacity),
                   "press " + At(opacity), "move " + drop, "shot keyframe-drag.png",
                   "dump during.dump.json", "release " + drop, "undo", "save undone.json"}));
  EXPECT_TRUE(fs::exists(dir / "keyframe-drag.png"));
  bool onEditLine = false;
  for (const Glyph& glyph : Glyphs(Panel("during.dump.json"), {"Opacity", "Opacity"})) {
    onEditLine = onEditLine || (glyph.selected && glyph.x == EditLineX());
  }
  EXPECT_TRUE(onEditLine);
  EXPECT_EQ(ReadText(dir / "undone.json"), before);
}

}  // namespace
