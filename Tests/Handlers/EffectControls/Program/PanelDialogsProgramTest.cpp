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
    const json* found = FindProjectParam(ReadJson(project), item, matchName, param);
    return found != nullptr ? found->at("value") : json();
  }
};

TEST_F(PanelDialogsProgram, TypedTextIsSavedWhenTheTimelineSelectsAnotherClipAndEscapeDropsIt) {
  const json panel = FirstLook("select 21");
  const std::string field = ValueFieldOf(panel, {"Opacity", "Opacity"});
  const fs::path dir = Dir("typed");
  ASSERT_TRUE(Run(dir,
                  "select 21\nsave before.project.json\n"
                  "click " +
                      field +
                      "\ntype 42\nselect 81\n"
                      "dump typed.dump.json\nsave typed.project.json\n"
                      "undo\nsave undone.project.json\n"
                      "select 21\nclick " +
                      field +
                      "\ntype 42\nkey Escape\nselect 81\n"
                      "dump escaped.dump.json\nsave escaped.project.json\n"));
  EXPECT_EQ(UndoDone(ReadJson(dir / "typed.dump.json")), Strings{"MZ.ComponentParam.SetValue"});
  EXPECT_EQ(Value(dir / "typed.project.json", kBeach, "XO.KRVN Opacity", "Opacity"),
            (json{{"double", 42.0}}));
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
  const fs::path dir = Dir("preset");
  // "Soft" is one of the effect's own presets: refused, asked again.
  ASSERT_TRUE(Run(dir, "select 21\nsave before.project.json\nclick " + blurField +
                           "\ntype 25\nkey Return\nclick " + blurTitle +
                           "\ninput-answer Soft\ninput-answer Dreamy\ncommand 18002\n"
                           "dump saved.dump.json\nsave saved.project.json\n"));
  const json saved = ReadJson(dir / "saved.dump.json");
  EXPECT_EQ(UndoDone(saved), (Strings{"MZ.ComponentParam.SetValue", "MZ.Component.SavePreset"}));
  EXPECT_TRUE(saved.at("assertions").empty());
  // Every instance of the effect lists the preset: the first clip with blur after 21.
  const json project = ReadJson(dir / "saved.project.json");
  long long other = 0;
  int presetIndex = -1;
  for (const json& track : project.at("sequences").at(0).at("tracks")) {
    for (const json& item : track.at("items")) {
      if (item.at("id").get<long long>() == kBeach || other != 0) {
        continue;
      }
      for (const json& component : item.at("chain").at("components")) {
        if (component.value("matchName", "") != "XO.KRVN GaussianBlur") {
          continue;
        }
        const json& presets = component.at("presets");
        for (std::size_t i = 0; i < presets.size(); ++i) {
          if (presets[i].at("name") == "Dreamy") {
            other = item.at("id").get<long long>();
            presetIndex = static_cast<int>(i);
          }
        }
      }
    }
  }
  ASSERT_NE(other, 0) << "no other clip with the blur lists the preset";
  const fs::path lookOther = Dir("look-other");
  ASSERT_TRUE(Run(lookOther, "select " + std::to_string(other) + "\ndump look.dump.json\n"));
  const std::string popup =
      ControlOf(Panel(ReadJson(lookOther / "look.dump.json")), {"Gaussian Blur"}, "Popup");

  const fs::path apply = Dir("apply");
  ASSERT_TRUE(Run(apply, "select 21\nsave before.project.json\nclick " + blurField +
                             "\ntype 25\nkey Return\nclick " + blurTitle +
                             "\ninput-answer Dreamy\ncommand 18002\nselect " +
                             std::to_string(other) + "\nmenu-answer " +
                             std::to_string(18600 + presetIndex) + "\nclick " + popup +
                             "\ndump applied.dump.json\nsave applied.project.json\n"
                             "undo\nundo\nundo\nsave undone.project.json\n"));
  EXPECT_EQ(UndoDone(ReadJson(apply / "applied.dump.json")).back(), "MZ.Component.ApplyPreset");
  EXPECT_EQ(Value(apply / "applied.project.json", other, "XO.KRVN GaussianBlur", "Blurriness"),
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
                .rfind("Intro@25401600000, ", 0),
            0U);
  const json marker =
      ReadJson(dir / "edited.project.json").at("sequences").at(0).at("markers").at(0);
  EXPECT_EQ(marker.at("name"), "Intro");
  EXPECT_EQ(marker.at("comment"), "a note");
  EXPECT_EQ(marker.at("color"), 3);
  EXPECT_EQ(marker.at("duration"), 25401600000LL);
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
  ASSERT_TRUE(Run(dir,
                  "select 21\ntime 00:00:01:00\ncommand 12072\nsave before.project.json\n"
                  "click " +
                      master +
                      "\ndump master.dump.json\n"
                      "time 00:00:02:00\ncommand 12072\ndump added.dump.json\n"
                      "save added.project.json\nundo\nsave undone.project.json\n"));
  const json inMaster = Panel(ReadJson(dir / "master.dump.json"));
  EXPECT_TRUE(inMaster.at("extra").at("masterClipTargeted").get<bool>());
  EXPECT_EQ(inMaster.at("extra").at("rulerMarkers"), "") << "the sequence's marker is not shown";
  EXPECT_EQ(Panel(ReadJson(dir / "added.dump.json")).at("extra").at("rulerMarkers"),
            "@50803200000");
  EXPECT_EQ(ReadText(dir / "undone.project.json"), ReadText(dir / "before.project.json"));
}

}  // namespace
