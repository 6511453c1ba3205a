#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <set>
#include <sstream>

#include "Host/Model/ComponentChainActions.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/ProjectFile.h"
#include "ModelTestFixture.h"

namespace {

using json = nlohmann::ordered_json;

class ProjectFileTest : public ModelTest {
 protected:
  ProjectFileTest() {
    // Give the fixture the kinds of data a file must carry: keyframes of every interpolation,
    // markers, in/out, a selection, a renamed and bypassed effect, transition settings.
    auto scale = Param(Intrinsic(kMatchName_Motion), "Scale");
    ComponentParam::State state = scale->GetState();
    state.timeVarying = true;
    const TemporalInterpolation modes[] = {
        TemporalInterpolation::Hold, TemporalInterpolation::Linear, TemporalInterpolation::Bezier,
        TemporalInterpolation::ContinuousBezier, TemporalInterpolation::AutoBezier};
    for (int i = 0; i < 5; ++i) {
      Keyframe k;
      k.time = kSecond + i * kSecond;
      k.value = 100.0 + 10.0 * i;
      k.interpolation = modes[i];
      EXPECT_EQ(state.keyframes.Add(k), CurveStatus::Ok);
    }
    EXPECT_EQ(state.keyframes.SetEase(2, KeyframeSide::Out, 35.0, 0.5), CurveStatus::Ok);
    scale->ApplyState(state);
    Markers markers;
    markers.Add({kSecond, 0, "Start", "the opening", 3});
    sequence->SetMarkers(markers);
    sequence->SetInPoint(kSecond);
    sequence->SetOutPoint(11 * kSecond);
    sequence->SetSelection({video});
    blur->SetInstanceName("Soft focus");
    blur->SetBypass(true);
    TransitionData data = transition->GetTransitionData();
    data.reverse = true;
    data.borderWidth = 2.5f;
    data.directions = {kTransitionDirectionEast};
    data.privateData.bytes = {0x00, 0xff, 0x10};
    transition->SetTransitionData(data);
  }

  std::string Saved() const { return ProjectFile::SaveToString(*project); }

  // The saved fixture with one edit applied to its JSON; the load must fail naming `place`.
  void ExpectLoadFails(const std::function<void(json&)>& edit, const std::string& expected) {
    json j = json::parse(Saved());
    edit(j);
    const auto result = ProjectFile::LoadFromString(j.dump());
    EXPECT_FALSE(result);
    EXPECT_EQ(result.error, expected);
  }
};

TEST_F(ProjectFileTest, LoadOfSaveGivesTheSameProjectAndTheSameFile) {
  const std::string first = Saved();
  const auto loaded = ProjectFile::LoadFromString(first);
  ASSERT_TRUE(loaded) << loaded.error;
  EXPECT_EQ(DescribeForTest(*loaded.project), DescribeForTest(*project));
  EXPECT_EQ(ProjectFile::SaveToString(*loaded.project), first);
  EXPECT_EQ(loaded.project->GetActiveSequence()->GetID(), sequence->GetID());
  ASSERT_EQ(loaded.project->GetActiveSequence()->GetSelection().size(), 1u);
  EXPECT_EQ(loaded.project->FindTrackItem(video->GetID())->GetComponentChain()->GetCount(),
            videoChain->GetCount());
}

TEST_F(ProjectFileTest, ObjectsMadeAfterALoadGetFreshIds) {
  const auto loaded = ProjectFile::LoadFromString(Saved());
  ASSERT_TRUE(loaded);
  auto extra = Media::Create("later", kSecond, true, false);
  EXPECT_EQ(loaded.project->FindObject(extra->GetID()), nullptr);
  EXPECT_GT(extra->GetID(), transition->GetID());
}

TEST_F(ProjectFileTest, UndoingEveryEditRestoresTheSavedFileAndRedoingRestoresTheEdited) {
  const std::string original = Saved();
  const auto scale = Param(Intrinsic(kMatchName_Motion), "Scale");
  const auto opacity = Param(Intrinsic(kMatchName_Opacity), "Opacity");
  // A fixed pseudo-random series of edits of different kinds.
  std::uint32_t seed = 12345;
  auto next = [&] { return seed = seed * 1664525u + 1013904223u; };
  int done = 0;
  for (int i = 0; i < 40; ++i) {
    const auto r = next();
    const TickTime time = kSecond + static_cast<TickTime>(r % 5000) * (kSecond / 1000);
    EditStatus status = EditStatus::NoChange;
    switch (r % 5) {
      case 0:
        status = ComponentParamActions::SetValue(opacity, time, ParamValue(double(r % 100)));
        break;
      case 1:
        status = ComponentParamActions::AddKeyframe(scale, time, ParamValue(double(r % 300)));
        break;
      case 2:
        status = ComponentParamActions::SetTimeVarying(opacity, (r >> 8) % 2 == 0, time);
        break;
      case 3:
        status = ComponentChainActions::SetBypassOfComponents({crop}, (r >> 8) % 2 == 0);
        break;
      default:
        status = ComponentParamActions::SetTemporalInterpolation(
            scale, scale->GetKeyframes().At(r % scale->GetKeyframes().Size()).time,
            TemporalInterpolation::Bezier);
        break;
    }
    done += status == EditStatus::Done ? 1 : 0;
  }
  ASSERT_GT(done, 10);
  const std::string edited = Saved();
  ASSERT_NE(edited, original);
  while (Undo().Undo()) {
  }
  EXPECT_EQ(Saved(), original);
  while (Undo().Redo()) {
  }
  EXPECT_EQ(Saved(), edited);
}

TEST_F(ProjectFileTest, BadFilesAreRefusedWithThePlaceAndTheFault) {
  const auto items = [](json& j) -> json& { return j["sequences"][0]["tracks"][0]["items"]; };
  ExpectLoadFails([&](json& j) { items(j)[1]["start"] = "soon"; },
                  "sequences[0].tracks[0].items[1].start: expected an integer tick count");
  ExpectLoadFails([&](json& j) { items(j)[0]["end"] = 1; },
                  "sequences[0].tracks[0].items[0].end: ends before it starts");
  ExpectLoadFails([&](json& j) { items(j)[0].erase("kind"); },
                  "sequences[0].tracks[0].items[0].kind: is missing");
  ExpectLoadFails([&](json& j) { items(j)[0]["kind"] = "gap"; },
                  "sequences[0].tracks[0].items[0].kind: expected \"clip\" or \"transition\"");
  ExpectLoadFails([&](json& j) { items(j)[0]["masterClip"] = 999999; },
                  "sequences[0].tracks[0].items[0].masterClip: no master clip has this id");
  ExpectLoadFails([&](json& j) { items(j)[1]["id"] = items(j)[0]["id"]; },
                  "sequences[0].tracks[0].items[1].id: id " + std::to_string(video->GetID()) +
                      " is used twice");
  ExpectLoadFails([&](json& j) { items(j)[2]["start"] = 3 * kSecond; },
                  "sequences[0].tracks[0].items[2].start: overlaps an earlier clip of the track");
  ExpectLoadFails([&](json& j) { items(j)[0]["speed"] = -1.0; },
                  "sequences[0].tracks[0].items[0].speed: speed must be positive");
  ExpectLoadFails([&](json& j) { j["version"] = 7; }, "version: unsupported version 7");
  ExpectLoadFails([&](json& j) { j["sequences"][0]["selection"] = {424242}; },
                  "sequences[0].selection[0]: no track item of this sequence has this id");
  ExpectLoadFails([&](json& j) { j["activeSequence"] = 424242; },
                  "activeSequence: no sequence has this id");
  ExpectLoadFails([&](json& j) { j["sequences"][0]["videoFrameRate"]["ticksPerFrame"] = 0; },
                  "sequences[0].videoFrameRate.ticksPerFrame: not a valid frame rate (positive "
                  "ticks; drop frame only at 29.97/59.94)");
  ExpectLoadFails([&](json& j) { j["sequences"][0]["markers"][0]["color"] = 9; },
                  "sequences[0].markers[0].color: expected an integer from 0 to 7");
  ExpectLoadFails([&](json& j) { j["sequences"][0]["tracks"][0]["mediaType"] = "smell"; },
                  "sequences[0].tracks[0].mediaType: expected \"video\" or \"audio\"");
}

TEST_F(ProjectFileTest, BadParameterDataIsRefusedWithItsPlace) {
  // Motion is the first component of the first clip's chain; Scale is one of its parameters.
  const json saved = json::parse(Saved());
  const json& components = saved["sequences"][0]["tracks"][0]["items"][0]["chain"]["components"];
  std::size_t motion = 0;
  while (components[motion]["matchName"] != kMatchName_Motion)
    ++motion;
  std::size_t scale = 0;
  while (components[motion]["params"][scale]["name"] != "Scale")
    ++scale;
  const std::string place = "sequences[0].tracks[0].items[0].chain.components[" +
                            std::to_string(motion) + "].params[" + std::to_string(scale) + "]";
  auto param = [&](json& j) -> json& {
    return j["sequences"][0]["tracks"][0]["items"][0]["chain"]["components"][motion]["params"]
            [scale];
  };
  ExpectLoadFails(
      [&](json& j) { param(j)["keyframes"][1]["time"] = param(j)["keyframes"][0]["time"]; },
      place + ".keyframes[1]: cannot be stored: " + ToString(CurveStatus::DuplicateTime));
  ExpectLoadFails(
      [&](json& j) {
        param(j)["keyframes"][0]["value"] = {{"string", "big"}};
      },
      place + ".keyframes[0].value: does not suit the parameter (kind or range)");
  ExpectLoadFails([&](json& j) { param(j)["keyframes"][0]["interpolation"] = 9; },
                  place + ".keyframes[0].interpolation: expected an integer from 0 to 4");
  ExpectLoadFails([&](json& j) { param(j)["keyframes"][0]["inInfluence"] = 3.0; },
                  place + ".keyframes[0].inInfluence: expected an influence from 0.002 to 1");
  ExpectLoadFails(
      [&](json& j) {
        param(j)["value"] = {{"volume", 11}};
      },
      place + ".value: unknown value kind 'volume'");
  ExpectLoadFails(
      [&](json& j) {
        param(j)["value"] = {{"double", 1}, {"bool", true}};
      },
      place +
          ".value: expected a value object with one member: double, point, "
          "color, bool, choice, string or blob");
}

TEST_F(ProjectFileTest, TextThatIsNotAProjectIsRefused) {
  EXPECT_EQ(ProjectFile::LoadFromString("[1, 2]").error, "file: expected a project object");
  EXPECT_NE(ProjectFile::LoadFromString("{\"sequences\": [").error.find("not valid JSON"),
            std::string::npos);
  EXPECT_EQ(ProjectFile::LoadFromString("{}").error, "sequences: is missing");
  EXPECT_EQ(ProjectFile::LoadFromString("").error.substr(0, 14), "not valid JSON");
  EXPECT_EQ(ProjectFile::LoadFromString("{\"sequences\": 3}").error,
            "sequences: expected an array");
}

TEST_F(ProjectFileTest, SavingIsAtomicAndAFailedSaveKeepsTheOldFile) {
  const auto dir =
      std::filesystem::temp_directory_path() / ("ec-projectfile-" + std::to_string(::getpid()));
  std::filesystem::create_directories(dir);
  const std::string path = (dir / "p.json").string();
  std::string error;
  ASSERT_TRUE(ProjectFile::Save(*project, path, &error)) << error;
  const auto loaded = ProjectFile::Load(path);
  ASSERT_TRUE(loaded) << loaded.error;
  EXPECT_EQ(DescribeForTest(*loaded.project), DescribeForTest(*project));
  EXPECT_FALSE(std::filesystem::exists(path + ".saving"));

  // A save that cannot write its temporary file reports it and leaves the old file alone.
  const auto before = ProjectFile::SaveToString(*project);
  std::filesystem::create_directory(path + ".saving");  // blocks the temporary file
  blur->SetInstanceName("Changed");
  EXPECT_FALSE(ProjectFile::Save(*project, path, &error));
  EXPECT_NE(error.find("cannot write beside it"), std::string::npos) << error;
  std::ifstream in(path);
  std::stringstream content;
  content << in.rdbuf();
  EXPECT_EQ(content.str(), before);

  EXPECT_EQ(ProjectFile::Load((dir / "missing.json").string()).error,
            (dir / "missing.json").string() + ": cannot open");
  std::filesystem::remove_all(dir);
}

}  // namespace

namespace {

// The example projects are generated (Apps/examplegen); they must load and save back unchanged,
// so the format and the files never drift apart.
TEST(ExampleProjects, LoadAndSaveBackByteForByte) {
  MessagingTestScope messaging;
  int checked = 0;
  for (const auto& entry : std::filesystem::directory_iterator("examples")) {
    if (entry.path().extension() != ".json")
      continue;
    std::ifstream in(entry.path());
    std::stringstream content;
    content << in.rdbuf();
    const auto loaded = ProjectFile::LoadFromString(content.str());
    ASSERT_TRUE(loaded) << entry.path() << ": " << loaded.error;
    EXPECT_EQ(ProjectFile::SaveToString(*loaded.project), content.str()) << entry.path();
    ++checked;
  }
  EXPECT_GE(checked, 1);
}

TEST(ExampleProjects, TheDemoHoldsEveryCaseThePanelShows) {
  MessagingTestScope messaging;
  const auto loaded = ProjectFile::Load("examples/demo.json");
  ASSERT_TRUE(loaded) << loaded.error;
  const auto& sequence = loaded.project->GetActiveSequence();
  ASSERT_TRUE(sequence);
  ASSERT_EQ(sequence->GetSelection().size(), 1u) << "opens with a clip selected";
  const auto& group = sequence->GetSelection()[0];
  EXPECT_EQ(group.audioItems.size(), 3u) << "linked audio in three parts";
  std::set<TemporalInterpolation> modes;
  for (const auto& component : group.videoItems[0]->GetComponentChain()->GetComponents()) {
    for (const auto& param : component->GetParams()) {
      for (const auto& k : param->GetKeyframes().Keyframes())
        modes.insert(k.interpolation);
    }
  }
  EXPECT_EQ(modes.size(), 5u) << "keyframes of every temporal interpolation";
  int videoTransitions = 0, audioTransitions = 0, graphics = 0;
  sequence->ForEachTrackItem([&](const TrackItemRef& item) {
    if (item->IsTransition()) {
      (item->GetMediaType() == MediaType::Video ? videoTransitions : audioTransitions)++;
    }
    graphics += item->IsGraphicsClip() ? 1 : 0;
  });
  EXPECT_EQ(videoTransitions, 1);
  EXPECT_EQ(audioTransitions, 1);
  EXPECT_EQ(graphics, 1);
  bool masterClipEffect = false;
  for (const auto& clip : loaded.project->GetMasterClips()) {
    masterClipEffect |= clip->GetVideoChain()->GetCount() > 0;
  }
  EXPECT_TRUE(masterClipEffect);
}

}  // namespace

namespace {

// A button's label, a timecode's timebase and the sequence's frame size travel through the file;
// parameters without them read as they always did.
TEST_F(ProjectFileTest, FrameSizeTimebaseAndButtonLabelSurviveSaveAndLoad) {
  sequence->SetFrameSize({1280, 720});
  const ComponentRef timecode = Catalogue().Create(kMatchName_Timecode);
  const ComponentRef grid = Catalogue().Create(kMatchName_GridDistortion);
  videoChain->Append(timecode);
  videoChain->Append(grid);
  const std::string first = Saved();
  const auto loaded = ProjectFile::LoadFromString(first);
  ASSERT_TRUE(loaded) << loaded.error;
  EXPECT_EQ(ProjectFile::SaveToString(*loaded.project), first);
  const SequenceRef& reread = loaded.project->GetSequences().front();
  EXPECT_EQ(reread->GetFrameSize(), (Sequence::FrameSize{1280, 720}));
  const TrackItemRef item = reread->FindTrackItem(video->GetID());
  ASSERT_NE(item, nullptr);
  const ComponentRef rereadTimecode =
      item->GetComponentChain()->FindByMatchName(kMatchName_Timecode);
  ASSERT_NE(rereadTimecode, nullptr);
  EXPECT_EQ(rereadTimecode->FindParam("Starting Timecode")->GetParameterTimebase(),
            std::optional<FrameRate>(kFrameRate_25));
  EXPECT_FALSE(rereadTimecode->FindParam("Offset")->GetParameterTimebase().has_value());
  const ComponentRef rereadGrid =
      item->GetComponentChain()->FindByMatchName(kMatchName_GridDistortion);
  EXPECT_EQ(rereadGrid->FindParam("Reset Grid")->GetCheckboxDisplayName(), "Reset");
  EXPECT_EQ(rereadGrid->FindParam("Settings")->GetCheckboxDisplayName(), "Settings");
}

TEST_F(ProjectFileTest, ABadFrameSizeOrAnAudioTimebaseIsRefused) {
  ExpectLoadFails([](json& j) { j["sequences"][0]["frameSize"] = {1920}; },
                  "sequences[0].frameSize: needs [width, height]");
  ExpectLoadFails(
      [](json& j) {
        j["sequences"][0]["frameSize"] = {0, 1080};
      },
      "sequences[0].frameSize[0]: expected an integer from 1 to 16384");
  ExpectLoadFails(
      [](json& j) {
        j["sequences"][0]["tracks"][0]["items"][0]["chain"]["components"][0]["params"][0]
         ["timebase"] = {{"sampleRate", 48000}};
      },
      "sequences[0].tracks[0].items[0].chain.components[0].params[0].timebase: must be a video "
      "frame rate");
}

}  // namespace
