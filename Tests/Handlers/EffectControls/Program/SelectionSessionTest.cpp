// Drives the program on the demo project as a user would: clicks, Ctrl-, Shift- and
// empty-space clicks on the effect list, copy and paste between clips, delete, undo. Where to
// click comes from a first run's dump (each shown row's rectangle in panel pixels); the
// scripts that click are written from it, run, and their dumps checked.
//
// Built with EC_PROGRAM (the effectcontrols executable) and EC_OUT (where the runs write).
// Track-item ids are those of examples/demo.json (21: Beach.mov with Brightness & Contrast
// and Gaussian Blur, 81: a clip with its intrinsic effects only, 111: the title).
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <nlohmann/json.hpp>
#include <sstream>
#include <string>
#include <vector>

#include "Tests/Handlers/EffectControls/Program/ScriptedPanelRun.h"

namespace {

using program_test::ReadText;
using program_test::RunProgramWith;

namespace fs = std::filesystem;
using nlohmann::json;
using Strings = std::vector<std::string>;

class SelectionSession : public ::testing::Test {
 protected:
  bool Run(const std::string& name, const Strings& lines) {
    return program_test::RunScriptLines(name, lines, dir);
  }

  static json Dump(const fs::path& path) {
    std::ifstream in(path);
    return json::parse(in);
  }
  json Panel(const std::string& file) const { return Dump(dir / file)["panels"][0]; }

  // The row with this path of titles (the first when several match).
  static const json* FindRow(const json& panel, const Strings& path) {
    for (const json& row : panel["rows"]) {
      if (row["path"].get<Strings>() == path) {
        return &row;
      }
    }
    return nullptr;
  }
  // "click X Y [mods]" at the middle of the row's title band, as the dump places it.
  static std::string PointerOn(const json& panel, const Strings& path, const std::string& verb,
                               const std::string& modifiers) {
    const json* row = FindRow(panel, path);
    if (row == nullptr || row->at("rect").is_null()) {
      ADD_FAILURE() << "no shown row " << json(path).dump();
      return "# missing row";
    }
    const json& rect = row->at("rect");
    const int x = rect["x"].get<int>() + rect["width"].get<int>() / 2;
    const int y = rect["y"].get<int>() + rect["height"].get<int>() / 2;
    return verb + " " + std::to_string(x) + " " + std::to_string(y) +
           (modifiers.empty() ? "" : " " + modifiers);
  }
  static std::string ClickOn(const json& panel, const Strings& path,
                             const std::string& modifiers = {}) {
    return PointerOn(panel, path, "click", modifiers);
  }
  static std::string RightClickOn(const json& panel, const Strings& path) {
    return PointerOn(panel, path, "rclick", {});
  }
  // A click on a parameter's name: just right of its last control left of the name (the
  // stopwatch or the triangle), inside its band.
  static std::string ClickOnName(const json& panel, const Strings& path) {
    const json* row = FindRow(panel, path);
    if (row == nullptr || row->at("rect").is_null()) {
      ADD_FAILURE() << "no shown row " << json(path).dump();
      return "# missing row";
    }
    const json& rect = row->at("rect");
    int left = rect["x"].get<int>();
    for (const json& control : row->at("controls")) {
      const int right = control["rect"]["x"].get<int>() + control["rect"]["width"].get<int>();
      if (control["visible"].get<bool>() && right < rect["x"].get<int>() + 60) {
        left = std::max(left, right);
      }
    }
    return "click " + std::to_string(left + 6) + " " +
           std::to_string(rect["y"].get<int>() + rect["height"].get<int>() / 2);
  }
  // Below every row of the list, inside it.
  static std::string ClickBelowTheRows(const json& panel) {
    int bottom = 0;
    int x = 0;
    for (const json& row : panel["rows"]) {
      if (!row["rect"].is_null()) {
        bottom = std::max(bottom, row["rect"]["y"].get<int>() + row["rect"]["height"].get<int>());
        x = row["rect"]["x"].get<int>() + 60;
      }
    }
    return "click " + std::to_string(x) + " " + std::to_string(bottom + 20);
  }
  static Strings SelectedEffects(const json& panel) {
    Strings names;
    for (const json& row : panel["rows"]) {
      if (row["class"] == "FilterItem" && row["selected"].get<bool>()) {
        names.push_back(row["path"].back().get<std::string>());
      }
    }
    return names;
  }
  static Strings TopTitles(const json& panel) {
    Strings names;
    for (const json& row : panel["rows"]) {
      if (row["path"].size() == 1) {
        names.push_back(row["path"][0].get<std::string>());
      }
    }
    return names;
  }

  fs::path dir;
};

TEST_F(SelectionSession, ClicksWithAndWithoutModifiersSelectAsTheDumpsShow) {
  ASSERT_TRUE(
      Run("layout", {"select 111", "dump title.dump.json", "select 21", "dump beach.dump.json"}));
  const json title = Panel("title.dump.json");
  const json beach = Panel("beach.dump.json");

  ASSERT_TRUE(Run("clicks", {
                                "select 21",
                                ClickOn(beach, {"Gaussian Blur"}),
                                "dump click.dump.json",
                                ClickOn(beach, Strings{"Brightness & Contrast"}, "ctrl"),
                                "dump ctrl.dump.json",
                                ClickOn(beach, Strings{"Gaussian Blur"}, "ctrl"),
                                "dump ctrl-again.dump.json",
                                ClickOnName(beach, {"Motion", "Position"}),
                                "dump name.dump.json",
                                "select 111",
                                ClickOn(title, {"Headline"}),
                                ClickOn(title, Strings{"Motion"}, "shift"),
                                "dump shift.dump.json",
                                ClickBelowTheRows(title),
                                "dump empty.dump.json",
                            }));
  EXPECT_EQ(SelectedEffects(Panel("click.dump.json")), Strings{"Gaussian Blur"});
  EXPECT_EQ(SelectedEffects(Panel("ctrl.dump.json")),
            (Strings{"Brightness & Contrast", "Gaussian Blur"}));
  EXPECT_EQ(SelectedEffects(Panel("ctrl-again.dump.json")), Strings{"Brightness & Contrast"});

  // The name of a keyframed parameter selects its keyframes and no effect.
  const json name = Panel("name.dump.json");
  EXPECT_TRUE(SelectedEffects(name).empty());
  const json& selectedKeys = name["keyframeArea"]["selectedKeyframes"];
  ASSERT_EQ(selectedKeys.size(), 2u);
  EXPECT_EQ(selectedKeys[0]["path"].get<Strings>(), (Strings{"Motion", "Position"}));
  int selectedGlyphs = 0;
  for (const json& glyph : name["keyframeArea"]["glyphs"]) {
    selectedGlyphs += glyph["selected"].get<bool>() ? 1 : 0;
  }
  EXPECT_EQ(selectedGlyphs, 2);

  // In a graphics clip Shift selects the range from the anchor, down the list as shown.
  EXPECT_EQ(SelectedEffects(Panel("shift.dump.json")),
            (Strings{"Headline", "Subtitle", "Time Remapping", "Opacity", "Motion"}));
  EXPECT_EQ(Panel("shift.dump.json")["extra"]["directManipulation"], "");
  EXPECT_TRUE(SelectedEffects(Panel("empty.dump.json")).empty());
}

TEST_F(SelectionSession, AnEffectCopiedFromOneClipPastesOntoAnotherAndUndoRestoresTheFile) {
  ASSERT_TRUE(Run("layout", {"select 21", "dump beach.dump.json"}));
  const json beach = Panel("beach.dump.json");
  ASSERT_TRUE(Run("paste", {
                               "select 21",
                               "menu-answer 57634",
                               RightClickOn(beach, {"Gaussian Blur"}),
                               "select 81",
                               "save before.project.json",
                               "command 57637",
                               "dump pasted.dump.json",
                               "undo",
                               "dump undone.dump.json",
                               "save after.project.json",
                           }));
  const json pasted = Panel("pasted.dump.json");
  const Strings titles = TopTitles(pasted);
  EXPECT_NE(std::find(titles.begin(), titles.end(), "Gaussian Blur"), titles.end());
  EXPECT_EQ(SelectedEffects(pasted), Strings{"Gaussian Blur"});
  EXPECT_EQ(Dump(dir / "pasted.dump.json")["undo"]["done"],
            json::array({"MZ.ComponentChainActions.PasteFilters"}));
  const Strings undone = TopTitles(Panel("undone.dump.json"));
  EXPECT_EQ(std::find(undone.begin(), undone.end(), "Gaussian Blur"), undone.end());
  // Byte for byte (the files are long: no diff printed).
  EXPECT_TRUE(ReadText(dir / "before.project.json") == ReadText(dir / "after.project.json"));
}

TEST_F(SelectionSession, DeletingAnAppliedEffectTogetherWithMotionRemovesOnlyTheAppliedOne) {
  ASSERT_TRUE(Run("layout", {"select 21", "dump beach.dump.json"}));
  const json beach = Panel("beach.dump.json");
  ASSERT_TRUE(Run("delete", {
                                "select 21",
                                ClickOn(beach, {"Gaussian Blur"}),
                                ClickOn(beach, Strings{"Motion"}, "ctrl"),
                                "dump selected.dump.json",
                                "key Delete",
                                "dump deleted.dump.json",
                            }));
  EXPECT_EQ(SelectedEffects(Panel("selected.dump.json")), (Strings{"Motion", "Gaussian Blur"}));
  const Strings titles = TopTitles(Panel("deleted.dump.json"));
  EXPECT_EQ(std::find(titles.begin(), titles.end(), "Gaussian Blur"), titles.end());
  EXPECT_NE(std::find(titles.begin(), titles.end(), "Motion"), titles.end());
  EXPECT_NE(std::find(titles.begin(), titles.end(), "Brightness & Contrast"), titles.end());
  EXPECT_EQ(Dump(dir / "deleted.dump.json")["undo"]["done"],
            json::array({"MZ.ComponentChainActions.RemoveMultipleFilters"}));
}

TEST_F(SelectionSession, AToolAnOpenedClipAndAReopenedPanelReachThePanel) {
  ASSERT_TRUE(Run("outside", {
                                 "tool pen",
                                 "dump pen.dump.json",
                                 "open 81",
                                 "dump opened.dump.json",
                                 "tool pointer",
                                 "reopen-panel",
                                 "dump reopened.dump.json",
                             }));
  EXPECT_EQ(Panel("pen.dump.json")["extra"]["toolMode"], "pen");
  const json opened = Dump(dir / "opened.dump.json");
  EXPECT_EQ(opened["sequence"]["selection"][0][0], 81);
  EXPECT_FALSE(TopTitles(opened["panels"][0]).empty());
  const json reopened = Panel("reopened.dump.json");
  EXPECT_EQ(reopened["extra"]["toolMode"], "pointer");
  EXPECT_EQ(TopTitles(reopened), TopTitles(opened["panels"][0]));
}

}  // namespace
