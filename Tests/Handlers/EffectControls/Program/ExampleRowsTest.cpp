// Opens every example project in the program, selects each of its track items in turn, dumps the
// panel after every selection and checks the dump against the project file itself, read here
// and not through the model: the effect rows in display order (graphics, video, then the audio
// parts by part key), under each effect a row for every parameter of a type the list presents
// and none for what an audio effect hides, every effect row shown and below the one above it,
// and no assertion. With nothing selected at the end the panel shows no rows.
//
// Built with EC_PROGRAM (the effectcontrols executable), EC_EXAMPLES (the folder of example
// projects) and EC_OUT (where the runs write, one folder per project).
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <nlohmann/json.hpp>
#include <set>
#include <sstream>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Tests/Handlers/EffectControls/Program/ScriptedPanelRun.h"

namespace {

using program_test::RunProgramWith;

namespace fs = std::filesystem;
using nlohmann::json;
using Id = long long;
using Strings = std::vector<std::string>;

// Parameter types the list makes a row for; other types get none.
constexpr std::array<int, 17> kRowTypes{1, 2, 3, 4, 5, 6, 7, 8, 9, 13, 14, 16, 21, 22, 23, 24, 25};

// Parameters an audio effect's description hides (match name, parameter name): no row.
constexpr std::array<std::pair<std::string_view, std::string_view>, 1> kHiddenAudioParams{
    {{"XO.KRVN Delay", "Plug-in State"}}};

// Intrinsic graphics groups go to the graphics section even though they are intrinsic.
constexpr std::string_view kGraphicGroupMatchName = "XO.KRVN GraphicGroup";

// Component roles as the project file stores them.
constexpr int kRoleGraphics = 3;
constexpr int kRoleCapsule = 4;

// Audio part order keys at or above this are not parts.
constexpr long long kMaxPartOrderKey = 10000;

json ReadJson(const fs::path& path) {
  std::ifstream in(path);
  return json::parse(in);
}

// `object[key]` when it is an array, else an empty one: a file may leave a list out.
const json& Members(const json& object, const char* key) {
  static const json kNone = json::array();
  const auto found = object.find(key);
  return found != object.end() && found->is_array() ? *found : kNone;
}

// `object[key]` when it is an object, else an empty one.
const json& Member(const json& object, const char* key) {
  static const json kNone = json::object();
  const auto found = object.find(key);
  return found != object.end() && found->is_object() ? *found : kNone;
}

// The name a component's row carries: its instance name, else its effect name.
std::string Title(const json& component) {
  const std::string instance = component.value("instanceName", "");
  return instance.empty() ? component.value("effectName", "") : instance;
}

// What the test needs of a project file.
struct Project {
  std::string name;
  fs::path file;
  std::vector<Id> itemIds;  // the active sequence's items, track by track
  std::map<Id, json> items;
  std::map<Id, bool> itemIsVideo;
  std::map<Id, json> masterClips;
};

const json* ActiveSequence(const json& file) {
  const json& active = file.at("activeSequence");
  for (const json& sequence : Members(file, "sequences")) {
    if (sequence.at("id") == active) {
      return &sequence;
    }
  }
  return nullptr;
}

Project LoadProject(const fs::path& path) {
  const json file = ReadJson(path);
  Project project;
  project.name = path.stem().string();
  project.file = path;
  const json* sequence = ActiveSequence(file);
  if (sequence == nullptr) {
    ADD_FAILURE() << project.name << ": no active sequence " << file.at("activeSequence");
    return project;
  }
  for (const json& track : Members(*sequence, "tracks")) {
    for (const json& item : Members(track, "items")) {
      const Id id = item.at("id").get<Id>();
      project.itemIds.push_back(id);
      project.items[id] = item;
      project.itemIsVideo[id] = track.at("mediaType") == "video";
    }
  }
  for (const json& master : Members(file, "masterClips")) {
    project.masterClips[master.at("id").get<Id>()] = master;
  }
  return project;
}

// --- Running the program ---

// Runs the program on `project` with one selection and dump per item, then none; false (with
// a failure naming the run's output) when it does not finish well or leaves a dump out.
bool RunSelections(const Project& project, const fs::path& out) {
  fs::remove_all(out);
  fs::create_directories(out);
  const fs::path script = out / (project.name + ".ecs");
  {
    std::ofstream lines(script);
    for (const Id id : project.itemIds) {
      lines << "select " << id << "\ndump " << id << ".json\n";
    }
    lines << "select-none\ndump none.json\n";
  }
  if (!RunProgramWith({"--headless", "--project", project.file.string(), "--script",
                       script.string(), "--out", out.string()},
                      out / "run.log")) {
    ADD_FAILURE() << project.name << ": the run failed";
    return false;
  }
  bool complete = true;
  for (const Id id : project.itemIds) {
    if (!fs::exists(out / (std::to_string(id) + ".json"))) {
      ADD_FAILURE() << project.name << ": no dump after selecting " << id;
      complete = false;
    }
  }
  return complete;
}

// --- What the project asks for ---

// One effect row the selection must show: its title, and where its component is in the project
// (owner -1: a master graphic's layer, whose parameters are not checked), or the transition
// whose row it is (named as the dump's sequence names it).
struct ExpectedRow {
  std::string title;
  Id owner = -1;
  std::size_t position = 0;
  Id transition = -1;
};

class Expectation {
 public:
  explicit Expectation(const Project& project) : mProject(project) {}

  // The rows selecting `id` must show, top to bottom.
  std::vector<ExpectedRow> RowsFor(Id id) {
    mRows.clear();
    SplitGroup(id);
    if (mVideo.size() == 1) {
      const json& video = Item(mVideo.front());
      if (video.at("kind") == "clip") {
        AddVideoClip(mVideo.front());
        if (!mAudio.empty()) {
          AddAudioParts();
        }
      } else {
        AddTransition(mVideo.front());
      }
    } else if (mVideo.empty() && !mAudio.empty()) {
      if (Item(mAudio.front()).at("kind") == "clip") {
        AddAudioParts();
      } else if (mAudio.size() == 1) {
        mRows.push_back({"", -1, 0, mAudio.front()});
      }
    }
    return mRows;
  }

 private:
  const json& Item(Id id) const { return mProject.items.at(id); }

  // The selected group: the item and every item linked to it, video and audio apart, each in
  // track order.
  void SplitGroup(Id id) {
    mVideo.clear();
    mAudio.clear();
    const long long link = Item(id).value("linkGroup", 0LL);
    for (const Id other : mProject.itemIds) {
      if (other == id || (link != 0 && Item(other).value("linkGroup", 0LL) == link)) {
        (mProject.itemIsVideo.at(other) ? mVideo : mAudio).push_back(other);
      }
    }
  }

  // The transition's own row, then the component that carries its settings.
  void AddTransition(Id id) {
    mRows.push_back({"", -1, 0, id});
    const json& components = Members(Member(Item(id), "chain"), "components");
    if (components.size() > 1) {
      mRows.push_back({Title(components[1]), id, 1, -1});
    }
  }

  void AddVideoClip(Id id) {
    const json& components = Members(Member(Item(id), "chain"), "components");
    const json* master = MasterClipOf(Item(id));
    const bool isTemplate = master != nullptr && master->value("template", false);
    std::vector<ExpectedRow> graphics;
    std::vector<ExpectedRow> video;
    // Intrinsics, last first; a template's capsules too.
    for (std::size_t c = components.size(); c-- > 0;) {
      const json& component = components[c];
      if (!component.value("intrinsic", false) ||
          (!isTemplate && component.value("role", 0) == kRoleCapsule)) {
        continue;
      }
      const bool group = component.value("matchName", "") == kGraphicGroupMatchName;
      (group ? graphics : video).push_back({Title(component), id, c, -1});
    }
    const bool graphicsClip = std::any_of(
        components.begin(), components.end(),
        [](const json& component) { return component.value("role", 0) == kRoleGraphics; });
    if (graphicsClip) {
      // The layers in chain order, then the master graphic's.
      AddApplied(components, id, graphics);
      if (master != nullptr && master->value("masterGraphic", false)) {
        AddApplied(Members(Member(*master, "videoChain"), "components"), -1, graphics);
      }
    } else {
      // Applied effects, the last applied on top.
      for (std::size_t c = components.size(); c-- > 0;) {
        if (!components[c].value("intrinsic", false)) {
          video.push_back({Title(components[c]), id, c, -1});
        }
      }
    }
    mRows.insert(mRows.end(), graphics.begin(), graphics.end());
    mRows.insert(mRows.end(), video.begin(), video.end());
  }

  static void AddApplied(const json& components, Id owner, std::vector<ExpectedRow>& rows) {
    for (std::size_t c = 0; c < components.size(); ++c) {
      if (!components[c].value("intrinsic", false)) {
        rows.push_back({Title(components[c]), owner, c, -1});
      }
    }
  }

  const json* MasterClipOf(const json& item) const {
    const auto id = item.find("masterClip");
    if (id == item.end() || !id->is_number_integer()) {
      return nullptr;
    }
    const auto found = mProject.masterClips.find(id->get<Id>());
    return found != mProject.masterClips.end() ? &found->second : nullptr;
  }

  // The clip items by part key, equal keys in the group's order; each one's effects in chain
  // order.
  void AddAudioParts() {
    std::vector<Id> parts;
    for (const Id id : mAudio) {
      if (Item(id).at("kind") == "clip" && Item(id).value("partOrderKey", 0LL) < kMaxPartOrderKey) {
        parts.push_back(id);
      }
    }
    std::stable_sort(parts.begin(), parts.end(), [this](Id a, Id b) {
      return Item(a).value("partOrderKey", 0LL) < Item(b).value("partOrderKey", 0LL);
    });
    for (const Id id : parts) {
      const json& components = Members(Member(Item(id), "chain"), "components");
      for (std::size_t c = 0; c < components.size(); ++c) {
        mRows.push_back({Title(components[c]), id, c, -1});
      }
    }
  }

  const Project& mProject;
  std::vector<Id> mVideo;
  std::vector<Id> mAudio;
  std::vector<ExpectedRow> mRows;
};

// --- What the dump shows ---

// The last panel that dumped its state; null when none did.
const json* DumpedPanel(const json& dump) {
  const json* panel = nullptr;
  for (const json& candidate : Members(dump, "panels")) {
    if (candidate.value("dumped", false)) {
      panel = &candidate;
    }
  }
  return panel;
}

std::string ItemName(const json& dump, Id id) {
  for (const json& item : Members(Member(dump, "sequence"), "items")) {
    if (item.at("id").get<Id>() == id) {
      return item.value("name", "");
    }
  }
  return "<transition " + std::to_string(id) + ">";
}

std::string Join(const Strings& titles) {
  std::string text;
  for (const std::string& title : titles) {
    text += (text.empty() ? "" : ", ") + title;
  }
  return "[" + text + "]";
}

bool IsRowType(int type) {
  return std::find(kRowTypes.begin(), kRowTypes.end(), type) != kRowTypes.end();
}

bool IsHiddenAudioParam(const std::string& matchName, const std::string& paramName) {
  return std::any_of(kHiddenAudioParams.begin(), kHiddenAudioParams.end(), [&](const auto& hidden) {
    return hidden.first == matchName && hidden.second == paramName;
  });
}

class DumpCheck {
 public:
  DumpCheck(const Project& project, Id selected, const json& dump)
      : mProject(project), mSelected(selected), mDump(dump) {}

  void Run(const std::vector<ExpectedRow>& expected) {
    const json& assertions = Members(mDump, "assertions");
    ASSERT_TRUE(assertions.empty()) << Where() << " raised assertions: " << assertions.dump();
    const json* panel = DumpedPanel(mDump);
    ASSERT_NE(panel, nullptr) << Where() << ": no panel in the dump";
    ReadRows(*panel);
    Strings titles;
    for (const ExpectedRow& row : expected) {
      titles.push_back(row.transition >= 0 ? ItemName(mDump, row.transition) : row.title);
    }
    ASSERT_EQ(mTopTitles, titles) << Where() << " shows the effect rows\n  " << Join(mTopTitles)
                                  << "\nbut the project asks for\n  " << Join(titles);
    for (const ExpectedRow& row : expected) {
      if (row.owner >= 0) {
        CheckParameters(mProject.items.at(row.owner).at("chain").at("components").at(row.position));
      }
    }
  }

 private:
  std::string Where() const { return mProject.name + ": selecting " + std::to_string(mSelected); }

  // The top rows' titles, and "effect>leaf" for every row; effect rows are shown and stacked,
  // none starting above the bottom of the one before it.
  void ReadRows(const json& panel) {
    long long previousBottom = -1;
    bool first = true;
    for (const json& row : Members(panel, "rows")) {
      const json& path = row.at("path");
      const std::string top = path.front().get<std::string>();
      mPaths.insert(top + ">" + path.back().get<std::string>());
      if (path.size() != 1) {
        continue;
      }
      mTopTitles.push_back(top);
      EXPECT_TRUE(row.at("shown").get<bool>()) << Where() << " leaves '" << top << "' hidden";
      const long long rowTop = row.at("top").get<long long>();
      EXPECT_TRUE(first || rowTop >= previousBottom)
          << Where() << " puts '" << top << "' at " << rowTop
          << ", over the row above it (which ends at " << previousBottom << ")";
      previousBottom = rowTop + row.at("height").get<long long>();
      first = false;
    }
  }

  // Every parameter of a presented type has a row under its effect, unless the effect hides it.
  void CheckParameters(const json& component) {
    if (component.value("offline", false)) {
      return;
    }
    const std::string title = Title(component);
    const std::string matchName = component.value("matchName", "");
    for (const json& param : Members(component, "params")) {
      const int type = param.at("type").get<int>();
      const std::string name = param.value("name", "");
      if (!IsRowType(type)) {
        continue;
      }
      const bool shown = mPaths.count(title + ">" + name) != 0;
      if (IsHiddenAudioParam(matchName, name)) {
        EXPECT_FALSE(shown) << Where() << " shows a row for the parameter '" << name << "' that '"
                            << title << "' hides";
      } else {
        EXPECT_TRUE(shown) << Where() << " shows no row for the parameter '" << name << "' (type "
                           << type << ") of '" << title << "'";
      }
    }
  }

  const Project& mProject;
  Id mSelected;
  const json& mDump;
  Strings mTopTitles;
  std::set<std::string> mPaths;
};

void ExpectNoRows(const Project& project, const json& dump) {
  for (const json& panel : Members(dump, "panels")) {
    if (panel.value("dumped", false)) {
      EXPECT_TRUE(Members(panel, "rows").empty())
          << project.name << ": with nothing selected the panel still shows "
          << Members(panel, "rows").size() << " rows";
    }
  }
}

std::vector<fs::path> ExampleProjects() {
  std::vector<fs::path> projects;
  for (const fs::directory_entry& entry : fs::directory_iterator(EC_EXAMPLES)) {
    if (entry.path().extension() == ".json") {
      projects.push_back(entry.path());
    }
  }
  std::sort(projects.begin(), projects.end());
  return projects;
}

TEST(EffectControlsProgram, ExampleProjectsShowTheRowsOfEachSelection) {
  const std::vector<fs::path> files = ExampleProjects();
  ASSERT_FALSE(files.empty()) << "no example projects in " << EC_EXAMPLES;
  int checked = 0;
  for (const fs::path& file : files) {
    const Project project = LoadProject(file);
    if (project.itemIds.empty()) {
      continue;
    }
    const fs::path out = fs::path(EC_OUT) / project.name;
    if (!RunSelections(project, out)) {
      continue;
    }
    Expectation expectation(project);
    for (const Id id : project.itemIds) {
      DumpCheck(project, id, ReadJson(out / (std::to_string(id) + ".json")))
          .Run(expectation.RowsFor(id));
      ++checked;
    }
    ExpectNoRows(project, ReadJson(out / "none.json"));
  }
  EXPECT_GT(checked, 0);
}

}  // namespace
