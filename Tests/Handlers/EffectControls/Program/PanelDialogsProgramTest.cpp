// Drives through scripts what a user meets around the panel's rows: text typed into a value field
// and left there while the timeline selects another clip, tool tips, saving a preset and applying
// it on another clip, the marker editor, blend modes of two clips and the master clip's markers.
// Where to click comes from a first run's dump. After each edit, undo must give back the saved
// project byte for byte.
//
// Built with EC_PROGRAM (the effectcontrols executable) and EC_OUT (where the runs write).
// Track-item ids are those of the built-in demo: 21 Beach.mov (Brightness & Contrast, Gaussian
// Blur), 81 a clip with its intrinsic effects only.
#include <gtest/gtest.h>

#include <filesystem>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "Tests/Handlers/EffectControls/Program/ScriptedPanelRun.h"

namespace {

namespace fs = std::filesystem;
using nlohmann::json;
using program_test::FindProjectParam;
using program_test::Panel;
using program_test::ReadJson;
using program_test::ReadText;
using program_test::RunProgram;
using program_test::UndoDone;
using Strings = std::vector<std::string>;

constexpr long long kBeach = 21;
constexpr long long kPlainClip = 81;

class PanelDialogsProgram : public ::testing::Test {
 protected:
  // EC_OUT/<test>/<name>, fresh.
  fs::path Dir(const std::string& name) {
    const fs::path dir =
        fs::path(EC_OUT) / ::testing::UnitTest::GetInstance()->current_test_info()->name() / name;
    fs::remove_all(dir);
    fs::create_directories(dir);
    return dir;
  }

  // Runs `script` and returns the panel of `dumpFile`'s dump.
  bool Run(const fs::path& dir, const std::string& script) {
    return RunProgram(dir, script, {"--size", "1100x700"});
  }

  // The first dump, of the clip `item` selected.
  json FirstLook(const std::string& select) {
    const fs::path dir = Dir("look");
    EXPECT_TRUE(Run(dir, select + "\ndump look.dump.json\n"));
    return Panel(ReadJson(dir / "look.dump.json"));
  }

  static const json* Row(const json& panel, const Strings& pathEnd) {
    for (const json& row : panel.at("rows")) {
      const auto path = row.at("path").get<Strings>();
      if (path.size() >= pathEnd.size() &&
          std::equal(pathEnd.rbegin(), pathEnd.rend(), path.rbegin()) && !row["rect"].is_null()) {
        return &row;
      }
    }
    ADD_FAILURE() << "no shown row " << json(pathEnd).dump();
    return nullptr;
  }

  static std::string Centre(const json& rect) {
    return std::to_string(rect.at("x").get<int>() + rect.at("width").get<int>() / 2) + " " +
           std::to_string(rect.at("y").get<int>() + rect.at("height").get<int>() / 2);
  }

  // The centre of the row's first visible control whose class contains `classPart`.
  static std::string ControlOf(const json& panel, const Strings& pathEnd,
                               const std::string& classPart) {
    if (const json* row = Row(panel, pathEnd)) {
      for (const json& control : row->at("controls")) {
        if (control.at("class").get<std::string>().find(classPart) != std::string::npos &&
            control.at("visible").get<bool>()) {
          return Centre(control.at("rect"));
        }
      }
      ADD_FAILURE() << "no " << classPart << " in " << row->dump();
    }
    return "0 0";
  }

  // The value field of a number row: 15 px into the row's value controls, which start at the
  // middle of the list less 20 px past the row's indent.
  static std::string ValueFieldOf(const json& panel, const Strings& pathEnd) {
    const auto row = program_test::FindRow(panel, pathEnd);
    if (!row) {
      ADD_FAILURE() << "no row " << json(pathEnd).dump();
      return "0 0";
    }
    const program_test::ListPlace list = program_test::PlaceOf(panel);
    const int x =
        list.left + row->groupLevel * program_test::kIndentPerGroupLevel + list.width / 2 - 20 + 15;
    return std::to_string(x) + " " + std::to_string(list.top + row->top + 10);
  }

  // A click on the row's title band, right of its controls at the left.
  static std::string TitleOf(const json& panel, const Strings& pathEnd) {
    if (const json* row = Row(panel, pathEnd)) {
      return Centre(row->at("rect"));
    }
    return "0 0";
  }

  static json Value(const fs::path& project, long long item, const std::string& matchName,
                    const std::string& param) {
    const json file = ReadJson(project);
    const json* found = FindProjectParam(file, item, matchName, param);
    return found != nullptr ? found->at("value") : json();
  }
};

TEST_F(PanelDialogsProgram, TypedTextIsSavedWhenTheTimelineSelectsAnotherClipAndEscapeDropsIt) {
  const json panel = FirstLook("select 21");
  const std::string field = ValueFieldOf(panel, {"Gaussian Blur", "Blurriness"});
  const fs::path dir = Dir("typed");
  // The selection is part of the file: it goes back to 21 before each save.
  ASSERT_TRUE(Run(dir,
                  "select 21\nsave before.project.json\n"
                  "click " +
                      field +
                      "\ntype 42\nselect 81\n"
                      "dump typed.dump.json\nsave typed.project.json\n"
                      "undo\nselect 21\nsave undone.project.json\n"
                      "click " +
                      field +
                      "\ntype 42\nkey Escape\nselect 81\n"
                      "dump escaped.dump.json\nselect 21\nsave escaped.project.json\n"));
  EXPECT_EQ(UndoDone(ReadJson(dir / "typed.dump.json")), Strings{"MZ.ComponentParam.SetValue"});
  // Blurriness varies over time on this clip: the typed value is the keyframe at the edit line.
  const json typed = ReadJson(dir / "typed.project.json");
  const json* blurriness = FindProjectParam(typed, kBeach, "XO.KRVN GaussianBlur", "Blurriness");
  ASSERT_NE(blurriness, nullptr);
  EXPECT_NE(blurriness->dump().find("{\"double\":42.0}"), std::string::npos) << blurriness->dump();
  EXPECT_EQ(ReadText(dir / "undone.project.json"), ReadText(dir / "before.project.json"));
  EXPECT_TRUE(UndoDone(ReadJson(dir / "escaped.dump.json")).empty());
  EXPECT_EQ(ReadText(dir / "escaped.project.json"), ReadText(dir / "before.project.json"));
}

TEST_F(PanelDialogsProgram, HoveringTheHeaderShowsItsToolTipAfterTheDelayAndAPressHidesIt) {
  const json panel = FirstLook("select 21");
  const json& extra = panel.at("extra");
  const std::string zone = std::to_string(extra.at("headerSequenceZoneX").get<int>()) + " " +
                           std::to_string(extra.at("headerSequenceZoneY").get<int>());
  const fs::path dir = Dir("tips");
  ASSERT_TRUE(Run(dir, "select 21\nmove " + zone +
                           "\ndump early.dump.json\nwait 800\n"
                           "dump shown.dump.json\nrclick " +
                           zone + "\ndump pressed.dump.json\n"));
  EXPECT_TRUE(ReadJson(dir / "early.dump.json")["workspace"]["toolTip"].is_null());
  const json shown = ReadJson(dir / "shown.dump.json")["workspace"]["toolTip"];
  ASSERT_TRUE(shown.is_string());
  EXPECT_NE(shown.get<std::string>().find("Beach.mov"), std::string::npos) << shown;
  EXPECT_TRUE(ReadJson(dir / "pressed.dump.json")["workspace"]["toolTip"].is_null());
}

TEST_F(PanelDialogsProgram, APresetSavedOnOneClipAppliesOnAnotherAndUndoRestoresTheFile) {
  const json first = FirstLook("select 21");
  const std::string blurField = ValueFieldOf(first, {"Gaussian Blur", "Blurriness"});
  const std::string blurTitle = TitleOf(first, {"Gaussian Blur"});
  // The blur copied onto clip 81 first, then 25 typed on 21's and saved as "Dreamy" ("Soft" is
  // one of the effect's own presets: refused, asked again).
  const std::string save = "select 21\nclick " + blurTitle +
                           "\ncommand 57634\nselect 81\n"
                           "command 57637\nselect 21\nclick " +
                           blurField + "\ntype 25\nkey Return\nclick " + blurTitle +
                           "\ninput-answer Soft\ninput-answer Dreamy\ncommand 18002\n";
  const fs::path setup = Dir("setup");
  ASSERT_TRUE(Run(setup, save + "dump saved.dump.json\nsave saved.project.json\nselect 81\n"
                                "dump look.dump.json\n"));
  const json saved = ReadJson(setup / "saved.dump.json");
  ASSERT_FALSE(UndoDone(saved).empty());
  EXPECT_EQ(UndoDone(saved).back(), "MZ.Component.SavePreset");
  EXPECT_TRUE(saved.at("assertions").empty());
  // The other clip's blur lists it too.
  int presetIndex = -1;
  const json project = ReadJson(setup / "saved.project.json");
  for (const json& track : project.at("sequences").at(0).at("tracks")) {
    for (const json& item : track.at("items")) {
      if (item.at("id").get<long long>() != kPlainClip) {
        continue;
      }
      for (const json& component : item.at("chain").at("components")) {
        if (component.value("matchName", "") == "XO.KRVN GaussianBlur") {
          const json& presets = component.at("presets");
          for (std::size_t i = 0; i < presets.size(); ++i) {
            if (presets[i].at("name") == "Dreamy") {
              presetIndex = static_cast<int>(i);
            }
          }
        }
      }
    }
  }
  ASSERT_GE(presetIndex, 0) << "clip 81's blur does not list the preset";
  const std::string popup =
      ControlOf(Panel(ReadJson(setup / "look.dump.json")), {"Gaussian Blur"}, "PicturePopup");

  const fs::path apply = Dir("apply");
  ASSERT_TRUE(Run(apply, "select 21\nsave before.project.json\n" + save +
                             "select 81\nmenu-answer " + std::to_string(18600 + presetIndex) +
                             "\nclick " + popup +
                             "\ndump applied.dump.json\nsave applied.project.json\n"
                             "undo\nundo\nundo\nundo\nselect 21\nsave undone.project.json\n"));
  EXPECT_EQ(UndoDone(ReadJson(apply / "applied.dump.json")).back(), "MZ.Component.ApplyPreset");
  EXPECT_EQ(Value(apply / "applied.project.json", kPlainClip, "XO.KRVN GaussianBlur", "Blurriness"),
            (json{{"double", 25.0}}));
  EXPECT_EQ(ReadText(apply / "undone.project.json"), ReadText(apply / "before.project.json"));
}

TEST_F(PanelDialogsProgram, EditingAMarkerIsOneStepAndUndoRestoresTheFile) {
  const fs::path dir = Dir("marker");
  ASSERT_TRUE(Run(dir,
                  "select 21\ntime 00:00:01:00\ncommand 12072\nsave before.project.json\n"
                  "input-answer Intro\ninput-answer a note\ninput-answer 3\n"
                  "input-answer 99:00:00:00\ninput-answer 00:00:01:00\ncommand 11793\n"
                  "dump edited.dump.json\nsave edited.project.json\n"
                  "undo\nsave undone.project.json\n"));
  const json edited = ReadJson(dir / "edited.dump.json");
  EXPECT_EQ(UndoDone(edited).back(), "MZ.MarkerActions.ChangeMarker");
  EXPECT_EQ(UndoDone(edited).size(), 2U);
  EXPECT_EQ(Panel(edited)
                .at("extra")
                .at("rulerMarkers")
                .get<std::string>()
                .rfind("Intro@254016000000, ", 0),
            0U);
  const json marker =
      ReadJson(dir / "edited.project.json").at("sequences").at(0).at("markers").at(0);
  EXPECT_EQ(marker.at("name"), "Intro");
  EXPECT_EQ(marker.at("comment"), "a note");
  EXPECT_EQ(marker.at("color"), 3);
  EXPECT_EQ(marker.at("duration"), 254016000000LL);
  EXPECT_EQ(ReadText(dir / "undone.project.json"), ReadText(dir / "before.project.json"));
}

TEST_F(PanelDialogsProgram, TheBlendModeOfTwoSelectedClipsIsOneStep) {
  const fs::path dir = Dir("blend");
  ASSERT_TRUE(Run(dir,
                  "select 21 81\nsave before.project.json\ncommand 12201\n"
                  "dump blended.dump.json\nsave blended.project.json\n"
                  "undo\nsave undone.project.json\n"));
  EXPECT_EQ(UndoDone(ReadJson(dir / "blended.dump.json")), Strings{"MZ.ComponentParam.SetValue"});
  for (const long long item : {kBeach, kPlainClip}) {
    EXPECT_EQ(Value(dir / "blended.project.json", item, "XO.KRVN Opacity", "Blend Mode"),
              (json{{"choice", 1}}))
        << item;
  }
  EXPECT_EQ(ReadText(dir / "undone.project.json"), ReadText(dir / "before.project.json"));
}

TEST_F(PanelDialogsProgram, MasterClipModeShowsOnlyTheMasterClipsMarkers) {
  const json panel = FirstLook("select 21");
  const json& extra = panel.at("extra");
  const std::string master = std::to_string(extra.at("headerMasterZoneX").get<int>()) + " " +
                             std::to_string(extra.at("headerMasterZoneY").get<int>());
  const fs::path dir = Dir("master");
  ASSERT_TRUE(
      Run(dir,
          "select 21\ntime 00:00:01:00\ncommand 12072\nsave before.project.json\n"
          "click " +
              master +
              "\ndump master.dump.json\n"
              "time 00:00:02:00\ncommand 12072\ndump added.dump.json\n"
              "save added.project.json\nundo\ntime 00:00:01:00\nsave undone.project.json\n"));
  const json inMaster = Panel(ReadJson(dir / "master.dump.json"));
  EXPECT_TRUE(inMaster.at("extra").at("masterClipTargeted").get<bool>());
  EXPECT_EQ(inMaster.at("extra").at("rulerMarkers"), "") << "the sequence's marker is not shown";
  EXPECT_EQ(Panel(ReadJson(dir / "added.dump.json")).at("extra").at("rulerMarkers"),
            "@508032000000");
  EXPECT_EQ(ReadText(dir / "undone.project.json"), ReadText(dir / "before.project.json"));
}

}  // namespace
