#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <nlohmann/json.hpp>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/AudioFilterParamInfo.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/KeyframeMultiSelectionActor.h"
#include "Host/Model/ProjectFile.h"
#include "ModelTestFixture.h"

namespace {

using json = nlohmann::ordered_json;

const double kHeadroomGain = std::pow(10.0, 0.75);

std::uint32_t IndexOf(const Component& component, const char* name) {
  return static_cast<std::uint32_t>(component.GetParamIndex(component.FindParam(name).get()) - 1);
}

TEST(AudioGainScale, UnityIsZeroDecibelsAndSilenceIsTheFloor) {
  EXPECT_DOUBLE_EQ(AudioFilterParamInfo::GainToDecibels(1.0), 0.0);
  EXPECT_DOUBLE_EQ(AudioFilterParamInfo::GainToDecibels(0.0), -96.0);
  EXPECT_DOUBLE_EQ(AudioFilterParamInfo::GainToDecibels(-0.5), -96.0);
  EXPECT_DOUBLE_EQ(AudioFilterParamInfo::GainToDecibels(1e-9), -96.0);
  EXPECT_DOUBLE_EQ(AudioFilterParamInfo::GainToDecibels(std::nan("")), -96.0);
  EXPECT_NEAR(AudioFilterParamInfo::GainToDecibels(kHeadroomGain), 15.0, 1e-12);
  EXPECT_NEAR(AudioFilterParamInfo::GainToDecibels(0.5), -6.0206, 1e-4);
}

TEST(AudioGainScale, DecibelsAtOrBelowTheFloorAreSilence) {
  EXPECT_DOUBLE_EQ(AudioFilterParamInfo::DecibelsToGain(0.0), 1.0);
  EXPECT_DOUBLE_EQ(AudioFilterParamInfo::DecibelsToGain(-96.0), 0.0);
  EXPECT_DOUBLE_EQ(AudioFilterParamInfo::DecibelsToGain(-500.0), 0.0);
  EXPECT_DOUBLE_EQ(AudioFilterParamInfo::DecibelsToGain(-std::numeric_limits<double>::infinity()),
                   0.0);
  EXPECT_NEAR(AudioFilterParamInfo::DecibelsToGain(15.0), kHeadroomGain, 1e-12);
  // A NaN must reach the parameter as NaN so that it is refused, not silence the clip.
  EXPECT_TRUE(std::isnan(AudioFilterParamInfo::DecibelsToGain(std::nan(""))));
}

TEST(AudioGainScale, DecibelsRoundTripAboveTheFloor) {
  for (double dB : {-95.9, -60.0, -6.0, -0.1, 0.0, 0.1, 6.0, 14.9, 15.0}) {
    EXPECT_NEAR(AudioFilterParamInfo::GainToDecibels(AudioFilterParamInfo::DecibelsToGain(dB)), dB,
                1e-9)
        << dB;
  }
}

class AudioFilterParamInfoTest : public ModelTest {
 protected:
  ComponentRef AudioIntrinsic(const char* matchName) const {
    return audio1->GetComponentChain()->FindByMatchName(matchName);
  }
};

TEST_F(AudioFilterParamInfoTest, TheCatalogueGainsAreLinearNumbersShownAsFadersInDecibels) {
  for (const char* matchName : {kMatchName_Volume, kMatchName_ChannelVolume}) {
    const Component* effect = Catalogue().FindTemplate(matchName);
    ASSERT_NE(effect, nullptr);
    const auto info = AudioFilterParamInfo::ForComponent(*effect);
    ASSERT_TRUE(info);
    for (std::uint32_t index = 0; index < effect->GetParamCount(); ++index) {
      const ComponentParamRef& param = effect->GetParam(index);
      if (param->GetType() == ParamType::Checkbox) {
        continue;
      }
      EXPECT_EQ(param->GetType(), ParamType::FloatSlider) << param->GetName();
      EXPECT_TRUE(param->IsAudioGain()) << param->GetName();
      EXPECT_EQ(param->GetDefaultValue(), ParamValue(1.0));
      AudioParamDisplayInfo display;
      ASSERT_TRUE(info->GetParamDisplayInfo(index, display));
      EXPECT_EQ(display.displayMode, AudioFilterParamInfo::kDisplayModeFader);
      EXPECT_TRUE(display.valueMapping);
      EXPECT_FLOAT_EQ(display.minimum, -96.0f);
      EXPECT_FLOAT_EQ(display.maximum, 15.0f);
      EXPECT_EQ(info->GetUnitText(index), " dB");
      EXPECT_TRUE(info->IsParamShown(index));
      EXPECT_DOUBLE_EQ(info->MapValueToDisplay(index, 1.0), 0.0);
      EXPECT_DOUBLE_EQ(info->MapDisplayToValue(index, -96.0), 0.0);
      // The headroom is exactly the parameter's maximum, so +15 dB is accepted as it is.
      EXPECT_EQ(param->Coerce(ParamValue(info->MapDisplayToValue(index, 15.0))),
                ParamValue(param->GetMaximum()));
    }
  }
}

TEST_F(AudioFilterParamInfoTest, OtherParametersAreShownAsStoredWithTheirUnits) {
  const ComponentRef delay = AudioIntrinsic(kMatchName_Delay);
  ASSERT_TRUE(delay);
  const auto info = AudioFilterParamInfo::ForComponent(*delay);
  ASSERT_TRUE(info);
  ASSERT_EQ(info->GetParamCount(), delay->GetParamCount());

  const std::uint32_t time = IndexOf(*delay, "Delay");
  AudioParamDisplayInfo display;
  ASSERT_TRUE(info->GetParamDisplayInfo(time, display));
  EXPECT_EQ(display.displayMode, AudioFilterParamInfo::kDisplayModeFine);
  EXPECT_FALSE(display.valueMapping);
  EXPECT_FLOAT_EQ(display.maximum, 2.0f);
  EXPECT_EQ(info->GetUnitText(time), " s");
  EXPECT_DOUBLE_EQ(info->MapValueToDisplay(time, 0.25), 0.25);
  EXPECT_DOUBLE_EQ(info->MapDisplayToValue(time, 0.25), 0.25);

  const std::uint32_t mix = IndexOf(*delay, "Mix");
  ASSERT_TRUE(info->GetParamDisplayInfo(mix, display));
  EXPECT_EQ(display.displayMode, AudioFilterParamInfo::kNoDisplayMode);
  EXPECT_FLOAT_EQ(display.minimum, 0.0f);
  EXPECT_FLOAT_EQ(display.maximum, 100.0f);
  EXPECT_EQ(info->GetUnitText(mix), "%");

  EXPECT_FALSE(info->IsParamShown(IndexOf(*delay, "Plug-in State")));
  EXPECT_EQ(info->GetUnitText(IndexOf(*delay, "Feedback")), "%");
}

TEST_F(AudioFilterParamInfoTest, IndicesPastTheLastParameterAreNotDescribed) {
  const auto info = AudioFilterParamInfo::ForComponent(*AudioIntrinsic(kMatchName_Volume));
  ASSERT_TRUE(info);
  const auto past = static_cast<std::uint32_t>(info->GetParamCount());
  AudioParamDisplayInfo display;
  display.increment = 7.0f;
  EXPECT_FALSE(info->GetParamDisplayInfo(past, display));
  EXPECT_FLOAT_EQ(display.increment, 7.0f);  // untouched
  EXPECT_FALSE(info->IsParamShown(past));
  EXPECT_FALSE(info->IsParamShown(0xFFFFFFFFu));
  EXPECT_EQ(info->GetUnitText(past), "");
  EXPECT_DOUBLE_EQ(info->MapValueToDisplay(past, 0.5), 0.5);
  EXPECT_DOUBLE_EQ(info->MapDisplayToValue(past, -6.0), -6.0);
}

TEST_F(AudioFilterParamInfoTest, VideoEffectsHaveNoAudioDescription) {
  EXPECT_EQ(AudioFilterParamInfo::ForComponent(*blur), nullptr);
}

TEST_F(AudioFilterParamInfoTest, ACatalogueDescriptionFollowsTheParameterByName) {
  EffectCatalogue catalogue;
  AudioParamDescription hidden;
  hidden.shown = false;
  catalogue.DescribeAudioParam("XO.Test Reverb", "Size", hidden);
  AudioParamDescription replaced;
  replaced.unitText = " m";
  catalogue.DescribeAudioParam("XO.Test Reverb", "Size", replaced);

  ComponentRef reverb = Component::Create("XO.Test Reverb", "Reverb", MediaType::Audio, false);
  reverb->AddParam(ComponentParam::Create("Wet", ParamType::FloatSlider, 0.5)
                       ->SetRange(0.0, 1.0)
                       ->SetUnits(ParamUnits::Percent));
  reverb->AddParam(ComponentParam::Create("Size", ParamType::FloatSlider, 10.0));
  const auto info = AudioFilterParamInfo::ForComponent(*reverb, catalogue);
  ASSERT_TRUE(info);
  EXPECT_EQ(info->GetUnitText(0), "%");
  EXPECT_TRUE(info->IsParamShown(1));  // the later description replaced the hiding one
  EXPECT_EQ(info->GetUnitText(1), " m");
  // Another effect with a parameter of the same name is not affected.
  ComponentRef other = Component::Create("XO.Test Echo", "Echo", MediaType::Audio, false);
  other->AddParam(ComponentParam::Create("Size", ParamType::FloatSlider, 10.0));
  EXPECT_EQ(AudioFilterParamInfo::ForComponent(*other, catalogue)->GetUnitText(0), "");
}

TEST_F(AudioFilterParamInfoTest, OnlyNumbersCanBeGainsAndTheFlagSurvivesACopy) {
  ClearRecordedDebugAssertions();
  ComponentParamRef check = ComponentParam::Create("On", ParamType::Checkbox, true);
  check->SetAudioGain(true);
  EXPECT_FALSE(check->IsAudioGain());
  EXPECT_EQ(RecordedDebugAssertions().size(), 1u);
  ClearRecordedDebugAssertions();

  ComponentParamRef gain =
      ComponentParam::Create("Gain", ParamType::FloatSlider, 1.0)->SetAudioGain(true);
  EXPECT_TRUE(gain->Clone()->IsAudioGain());
  EXPECT_FALSE(gain->SetAudioGain(false)->IsAudioGain());
  EXPECT_TRUE(ComponentParam::Create("Old", ParamType::AudioGain, 1.0)->IsAudioGain());
}

TEST_F(AudioFilterParamInfoTest, KeyframeDragsScaleGainsInDecibelsAndOtherNumbersLinearly) {
  const ComponentRef channels = AudioIntrinsic(kMatchName_ChannelVolume);
  const ComponentRef delay = AudioIntrinsic(kMatchName_Delay);
  const ComponentParamRef left = channels->FindParam("Left");
  const ComponentParamRef mix = delay->FindParam("Mix");
  auto keyAt = [](const ComponentParamRef& param, TickTime time, double value) {
    ComponentParam::State state = param->GetState();
    state.timeVarying = true;
    Keyframe key;
    key.time = time;
    key.value = value;
    ASSERT_EQ(state.keyframes.Add(key), CurveStatus::Ok);
    param->ApplyState(state);
  };
  keyAt(left, 3 * kSecond, 0.5);
  keyAt(mix, 3 * kSecond, 40.0);
  auto selection = std::make_shared<KeyframeMultiSelection>(sequence);
  ASSERT_TRUE(selection->AddItem(audio1, channels, left, 3 * kSecond));
  ASSERT_TRUE(selection->AddItem(audio1, delay, mix, 3 * kSecond));
  const std::string before = Dump();
  KeyframeMultiSelectionActor actor(sequence, selection);
  actor.SetScaleDB(true);
  ASSERT_TRUE(actor.MoveSelectionTo(0, 6.0));
  EXPECT_NEAR(*left->GetScalarAt(3 * kSecond), 0.5 * std::pow(10.0, 0.3), 1e-12);
  EXPECT_NEAR(*mix->GetScalarAt(3 * kSecond), 46.0, 1e-12);
  ASSERT_EQ(actor.CommitMoveSelection(), EditStatus::Done);
  Undo().Undo();
  EXPECT_EQ(Dump(), before);
}

class AudioGainFileTest : public AudioFilterParamInfoTest {
 protected:
  json SavedJson() const { return json::parse(ProjectFile::SaveToString(*project)); }
  // The first parameter named `name` in the saved file.
  static json* FindParamNode(json& node, const std::string& name) {
    if (node.is_object() && node.contains("type") && node.contains("name") &&
        node["name"] == name && node.contains("default")) {
      return &node;
    }
    if (node.is_structured()) {
      for (auto& child : node) {
        if (json* found = FindParamNode(child, name)) {
          return found;
        }
      }
    }
    return nullptr;
  }
};

TEST_F(AudioGainFileTest, TheGainFlagIsSavedAndLoaded) {
  json saved = SavedJson();
  json* level = FindParamNode(saved, "Level");
  ASSERT_NE(level, nullptr);
  EXPECT_EQ((*level)["audioGain"], true);
  EXPECT_EQ((*level)["type"], 2);
  EXPECT_EQ((*FindParamNode(saved, "Mix"))["audioGain"], false);

  const auto loaded = ProjectFile::LoadFromString(saved.dump());
  ASSERT_TRUE(loaded) << loaded.error;
  const ComponentRef volume = loaded.project->FindTrackItem(audio1->GetID())
                                  ->GetComponentChain()
                                  ->FindByMatchName(kMatchName_Volume);
  ASSERT_TRUE(volume);
  EXPECT_TRUE(volume->FindParam("Level")->IsAudioGain());
  EXPECT_FALSE(volume->FindParam("Bypass")->IsAudioGain());
  EXPECT_EQ(ProjectFile::SaveToString(*loaded.project), ProjectFile::SaveToString(*project));
}

TEST_F(AudioGainFileTest, AFileThatTypesGainsAsSeventeenLoadsThemAsNumberGains) {
  json saved = SavedJson();
  json* level = FindParamNode(saved, "Level");
  ASSERT_NE(level, nullptr);
  (*level)["type"] = 17;
  level->erase("audioGain");
  (*level)["value"] = {{"double", 0.5}};
  const auto loaded = ProjectFile::LoadFromString(saved.dump());
  ASSERT_TRUE(loaded) << loaded.error;
  const ComponentParamRef loadedLevel = loaded.project->FindTrackItem(audio1->GetID())
                                            ->GetComponentChain()
                                            ->FindByMatchName(kMatchName_Volume)
                                            ->FindParam("Level");
  EXPECT_EQ(loadedLevel->GetType(), ParamType::FloatSlider);
  EXPECT_TRUE(loadedLevel->IsAudioGain());
  EXPECT_EQ(loadedLevel->GetConstantValue(), ParamValue(0.5));
  // Saved again, it is written the way files are written today.
  json again = json::parse(ProjectFile::SaveToString(*loaded.project));
  EXPECT_EQ((*FindParamNode(again, "Level"))["type"], 2);
  EXPECT_EQ((*FindParamNode(again, "Level"))["audioGain"], true);
}

TEST_F(AudioGainFileTest, AGainThatIsNotANumberIsRefusedWithItsPlace) {
  json saved = SavedJson();
  json* bypass = FindParamNode(saved, "Bypass");
  ASSERT_NE(bypass, nullptr);
  (*bypass)["audioGain"] = true;
  const auto loaded = ProjectFile::LoadFromString(saved.dump());
  EXPECT_FALSE(loaded);
  EXPECT_NE(loaded.error.find("audioGain: a gain must be a number"), std::string::npos)
      << loaded.error;
}

}  // namespace
