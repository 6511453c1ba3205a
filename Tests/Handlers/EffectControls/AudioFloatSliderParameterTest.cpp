#include <gtest/gtest.h>

#include <cmath>
#include <memory>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/AudioFloatSliderParameter.h"
#include "Handlers/EffectControls/Src/ParameterRowFactory.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/UndoStack.h"
#include "Host/Toolkit/FloatSliderControl.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Host/Toolkit/Static.h"
#include "Host/Toolkit/SubView.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Handlers/EffectControls/EffectControlsListViewTestSupport.h"

namespace {

constexpr TickTime kSec = kTicksPerSecond;
const std::string kMinusInfinity = "-\xE2\x88\x9E";

// An audio clip on [10 s, 20 s) showing media from 5 s, with Volume and Delay, and a window whose
// root view stands in for the list; the edit line at 12 s (clip time 7 s).
class AudioSliderRowTest : public ::testing::Test {
 protected:
  AudioSliderRowTest() {
    builder.AddComponent(clip->GetComponentChain(), volume);
    builder.AddComponent(clip->GetComponentChain(), delay);
    host.SetRootView(listView);
    *editTime = 12 * kSec;
  }
  ~AudioSliderRowTest() override {
    for (const auto& row : rows) {
      row->Destroy();
    }
  }

  std::shared_ptr<AudioFloatSliderParameter> MakeRow(const ComponentRef& component,
                                                     const char* paramName, bool expanded = false) {
    ParameterControlInfo info;
    info.parentView = listView.get();
    info.station = "Test.AudioRows";
    info.sequence = sequence;
    info.component = component;
    info.param = component->FindParam(paramName);
    info.trackItem = clip;
    info.editTime = editTime;
    auto row = std::make_shared<AudioFloatSliderParameter>(info);
    row->FinishCreateSelf();
    row->Show();
    row->SetIsExpanded(expanded);
    row->PositionSelf(0, 0, 400);
    rows.push_back(row);
    return row;
  }

  void TypeInto(HotFloatControl& field, const std::string& text) {
    const Point at = field.GetBounds().Center();
    host.MouseDown(MouseButton::kLeft, at, kKeyModifierNone);
    host.MouseUp(MouseButton::kLeft, at, kKeyModifierNone);
    ASSERT_TRUE(field.IsEditing());
    host.TextInput(text);
    host.KeyDown({KeyCode::kReturn});
  }

  double Stored(const char* paramName, const ComponentRef& component) const {
    return *component->FindParam(paramName)->GetScalarAt(7 * kSec);
  }
  double Level() const { return Stored("Level", volume); }
  std::vector<std::string> UndoNames() { return project->GetUndoStack().GetUndoNames(); }

  MessagingTestScope messaging;
  ProjectBuilder builder{"Audio rows"};
  ProjectRef project = builder.GetProject();
  SequenceRef sequence = builder.AddSequence("Sequence");
  TrackRef track = builder.AddTrack(sequence, MediaType::Audio, "A1");
  TrackItemRef clip = builder.AddClip(
      track, nullptr,
      {.start = 10 * kSec, .end = 20 * kSec, .mediaIn = 5 * kSec, .withIntrinsics = false});
  ComponentRef volume = EffectCatalogue::Standard().Create(kMatchName_Volume);
  ComponentRef delay = EffectCatalogue::Standard().Create(kMatchName_Delay);
  std::shared_ptr<TickTime> editTime = std::make_shared<TickTime>(0);
  ViewHost host{{400, 300}};
  std::shared_ptr<SubView> listView = std::make_shared<SubView>();
  std::vector<std::shared_ptr<AudioFloatSliderParameter>> rows;
};

TEST_F(AudioSliderRowTest, UnityGainShowsAsZeroDecibels) {
  auto row = MakeRow(volume, "Level", true);
  HotFloatControl* field = row->GetHotText();
  ASSERT_NE(field, nullptr);
  EXPECT_EQ(field->GetDisplayText(), "0.0 dB");
  EXPECT_FLOAT_EQ(row->GetSlider()->GetValue(), 0.0f);
  EXPECT_EQ(row->GetMinLabel(), kMinusInfinity);
  EXPECT_EQ(row->GetMaxLabel(), "15.0");
  EXPECT_DOUBLE_EQ(field->GetMinValue(), -96.0);
  EXPECT_DOUBLE_EQ(field->GetMaxValue(), 15.0);
  EXPECT_EQ(field->GetMinimumValueString(), kMinusInfinity);
  EXPECT_EQ(field->GetHorizontalTextAlignment(), 0);
  EXPECT_TRUE(field->IsExponential());
  EXPECT_DOUBLE_EQ(field->GetExponent(), AudioFloatSliderParameter::kFaderExponent);
  // " dB" is three characters.
  EXPECT_EQ(row->GetHotTextPaddingWidth(), 30);
  EXPECT_EQ(field->GetBounds().Width(), SliderParameter::kHotTextWidth + 30);
}

TEST_F(AudioSliderRowTest, SilenceShowsAsMinusInfinity) {
  ComponentParamActions::SetValue(volume->FindParam("Level"), 7 * kSec, 0.0);
  auto row = MakeRow(volume, "Level");
  EXPECT_EQ(row->GetHotText()->GetDisplayText(), kMinusInfinity);
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValue(), -96.0);
}

TEST_F(AudioSliderRowTest, AsTextAGainReadsInDecibelsToo) {
  auto row = MakeRow(volume, "Level");
  row->SetShowValueAsText(true);
  ASSERT_NE(row->GetValueLabel(), nullptr);
  EXPECT_EQ(row->GetValueLabel()->GetText(), "0.0 dB");
  ComponentParamActions::SetValue(volume->FindParam("Level"), 7 * kSec, 0.0);
  EXPECT_EQ(row->GetValueLabel()->GetText(), kMinusInfinity + " dB");
}

TEST_F(AudioSliderRowTest, ATypedDecibelValueIsOneUndoStepStoredLinear) {
  auto row = MakeRow(volume, "Level");
  TypeInto(*row->GetHotText(), "-6");
  EXPECT_NEAR(Level(), std::pow(10.0, -6.0 / 20.0), 1e-9);
  EXPECT_EQ(row->GetHotText()->GetDisplayText(), "-6.0 dB");
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));

  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_DOUBLE_EQ(Level(), 1.0);
  EXPECT_EQ(row->GetHotText()->GetDisplayText(), "0.0 dB");
  ASSERT_TRUE(project->GetUndoStack().Redo());
  EXPECT_NEAR(Level(), std::pow(10.0, -6.0 / 20.0), 1e-9);
  EXPECT_EQ(row->GetHotText()->GetDisplayText(), "-6.0 dB");
}

TEST_F(AudioSliderRowTest, TypedValuesOutsideTheFaderStopAtItsEnds) {
  auto row = MakeRow(volume, "Level");
  TypeInto(*row->GetHotText(), "40 dB");
  EXPECT_DOUBLE_EQ(Level(), volume->FindParam("Level")->GetMaximum());
  EXPECT_NEAR(Level(), std::pow(10.0, 0.75), 1e-12);
  EXPECT_EQ(row->GetHotText()->GetDisplayText(), "15.0 dB");

  TypeInto(*row->GetHotText(), "-200");
  EXPECT_DOUBLE_EQ(Level(), 0.0);
  EXPECT_EQ(row->GetHotText()->GetDisplayText(), kMinusInfinity);

  TypeInto(*row->GetHotText(), "+3");
  EXPECT_NEAR(Level(), std::pow(10.0, 3.0 / 20.0), 1e-9);
  TypeInto(*row->GetHotText(), kMinusInfinity);
  EXPECT_DOUBLE_EQ(Level(), 0.0);
  EXPECT_EQ(UndoNames().size(), 4u);
}

TEST_F(AudioSliderRowTest, UnreadableTextChangesNothing) {
  auto row = MakeRow(volume, "Level");
  TypeInto(*row->GetHotText(), "loud");
  EXPECT_DOUBLE_EQ(Level(), 1.0);
  EXPECT_TRUE(UndoNames().empty());
  EXPECT_EQ(row->GetHotText()->GetDisplayText(), "0.0 dB");
}

TEST_F(AudioSliderRowTest, TheBottomOfTheFaderIsSilenceEvenWhenTheControlsRoundedIt) {
  auto row = MakeRow(volume, "Level");
  row->OnSliderValueChanged(-96.04f, true);
  EXPECT_DOUBLE_EQ(Level(), 0.0);
  row->OnSliderValueChanged(-95.0f, true);
  EXPECT_NEAR(Level(), std::pow(10.0, -95.0 / 20.0), 1e-9);
}

TEST_F(AudioSliderRowTest, ASliderDragInDecibelsIsOneUndoStep) {
  auto row = MakeRow(volume, "Level", true);
  FloatSliderControl* slider = row->GetSlider();
  ASSERT_TRUE(slider->IsVisible());
  const Rect bounds = slider->GetBounds();
  const int y = bounds.top + bounds.Height() / 2;
  const Point from{bounds.left + slider->XForValue(0.0f), y};
  const Point to{bounds.left + slider->XForValue(-20.0f), y};
  host.MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
  for (int i = 1; i <= 4; ++i) {
    host.MouseMove({from.x + (to.x - from.x) * i / 4, y}, kKeyModifierNone);
  }
  EXPECT_TRUE(UndoNames().empty());  // live, no undo step yet
  host.MouseUp(MouseButton::kLeft, to, kKeyModifierNone);
  const double shown = row->GetHotText()->GetValue();
  EXPECT_NEAR(shown, -20.0, 2.0);
  EXPECT_NEAR(Level(), std::pow(10.0, shown / 20.0), 1e-3);
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_DOUBLE_EQ(Level(), 1.0);
  EXPECT_FLOAT_EQ(slider->GetValue(), 0.0f);
}

TEST_F(AudioSliderRowTest, UnityGainSitsHighOnTheSlider) {
  auto row = MakeRow(volume, "Level", true);
  FloatSliderControl* slider = row->GetSlider();
  const int width = slider->GetBounds().Width();
  // Unity must not sit at the bottom, where silence is.
  EXPECT_GT(slider->XForValue(0.0f), width / 2);
  EXPECT_LT(slider->XForValue(0.0f), slider->XForValue(15.0f));
  EXPECT_LT(slider->XForValue(-96.0f), slider->XForValue(-60.0f));
}

TEST_F(AudioSliderRowTest, ScrubbingAFewPixelsFromUnityMovesALittleAndIsOneUndoStep) {
  auto row = MakeRow(volume, "Level");
  const Point start = row->GetHotText()->GetBounds().Center();
  host.MouseDown(MouseButton::kLeft, start, kKeyModifierNone);
  for (int i = 1; i <= 5; ++i) {
    host.MouseMove({start.x - 2 * i, start.y}, kKeyModifierNone);
  }
  host.MouseUp(MouseButton::kLeft, {start.x - 10, start.y}, kKeyModifierNone);
  // Ten pixels down must not fall to silence.
  const double shown = row->GetHotText()->GetValue();
  EXPECT_LT(shown, 0.0);
  EXPECT_GT(shown, -2.0);
  EXPECT_NEAR(Level(), std::pow(10.0, shown / 20.0), 1e-3);
  EXPECT_EQ(UndoNames().size(), 1u);
}

TEST_F(AudioSliderRowTest, AChangeInTheModelReachesTheRow) {
  auto row = MakeRow(volume, "Level");
  ComponentParamActions::SetValue(volume->FindParam("Level"), 7 * kSec, 0.5);
  EXPECT_EQ(row->GetHotText()->GetDisplayText(), "-6.0 dB");
  EXPECT_EQ(row->GetCachedTime(), 12 * kSec);
  project->GetUndoStack().Undo();
  EXPECT_EQ(row->GetHotText()->GetDisplayText(), "0.0 dB");
}

TEST_F(AudioSliderRowTest, AKeyframedGainShowsItsValueAtTheEditTime) {
  const ComponentParamRef level = volume->FindParam("Level");
  ComponentParam::State state = level->GetState();
  state.timeVarying = true;
  Keyframe first;
  first.time = 5 * kSec;
  first.value = 1.0;
  Keyframe second = first;
  second.time = 9 * kSec;
  second.value = 0.1;
  ASSERT_EQ(state.keyframes.Add(first), CurveStatus::Ok);
  ASSERT_EQ(state.keyframes.Add(second), CurveStatus::Ok);
  level->ApplyState(state);
  auto row = MakeRow(volume, "Level");
  *editTime = 14 * kSec;  // clip 9 s
  row->RecursiveSynchToTime(false);
  EXPECT_EQ(row->GetHotText()->GetDisplayText(), "-20.0 dB");
  // Typing at a keyframe changes that keyframe only.
  TypeInto(*row->GetHotText(), "-40");
  EXPECT_NEAR(*level->GetScalarAt(9 * kSec), 0.01, 1e-9);
  EXPECT_DOUBLE_EQ(*level->GetScalarAt(5 * kSec), 1.0);
}

TEST_F(AudioSliderRowTest, OtherParametersTakeRangeDigitsAndUnitFromTheEffect) {
  auto time = MakeRow(delay, "Delay", true);
  EXPECT_EQ(time->GetHotText()->GetDigitsPastDecimal(), 3);
  EXPECT_EQ(time->GetHotText()->GetDisplayText(), "1.000 s");
  EXPECT_EQ(time->GetMinLabel(), "0.000");
  EXPECT_EQ(time->GetMaxLabel(), "2.000");
  EXPECT_EQ(time->GetHotText()->GetMinimumValueString(), "");
  EXPECT_FALSE(time->GetHotText()->IsExponential());
  EXPECT_EQ(time->GetHotTextPaddingWidth(), 4);
  TypeInto(*time->GetHotText(), "0.25");
  EXPECT_DOUBLE_EQ(Stored("Delay", delay), 0.25);

  auto mix = MakeRow(delay, "Mix");
  EXPECT_EQ(mix->GetHotText()->GetDisplayText(), "50.0%");
  EXPECT_EQ(mix->GetHotTextPaddingWidth(), 4);
  TypeInto(*mix->GetHotText(), "150");
  EXPECT_DOUBLE_EQ(Stored("Mix", delay), 100.0);
}

TEST_F(AudioSliderRowTest, AParameterWithoutAUnitHasNoPaddingAndNoSymbol) {
  ComponentRef panner = EffectCatalogue::Standard().Create(kMatchName_Panner);
  clip->GetComponentChain()->Append(panner);
  auto row = MakeRow(panner, "Balance");
  EXPECT_EQ(row->GetHotTextPaddingWidth(), 0);
  EXPECT_EQ(row->GetHotText()->GetAppendedSymbol(), "");
  EXPECT_EQ(row->GetHotText()->GetDisplayText(), "0.0");
}

TEST_F(AudioSliderRowTest, ARowNeedsAnAudioEffect) {
  ComponentRef blur = EffectCatalogue::Standard().Create(kMatchName_GaussianBlur);
  ParameterControlInfo info;
  info.parentView = listView.get();
  info.sequence = sequence;
  info.component = blur;
  info.param = blur->FindParam("Blurriness");
  EXPECT_THROW(AudioFloatSliderParameter row(info), NullInterfaceException);
  info.component = nullptr;
  EXPECT_THROW(AudioFloatSliderParameter row(info), NullInterfaceException);
}

TEST_F(AudioSliderRowTest, TheFactoryMakesTheAudioRowForNumbersAndGainsOfAudioEffects) {
  ParameterRowRequest request;
  request.info.parentView = listView.get();
  request.info.sequence = sequence;
  request.info.component = volume;
  request.info.param = volume->FindParam("Level");
  request.info.trackItem = clip;
  auto made = ParameterRowFactory::CreateParameterRows(request);
  ASSERT_EQ(made.size(), 1u);
  EXPECT_NE(dynamic_cast<AudioFloatSliderParameter*>(made[0].get()), nullptr);
  EXPECT_EQ(ParameterRowFactory::GetRowClassName(*made[0]), "AudioFloatSliderParameter");

  // A gain made with the old type code is still a gain with its fader.
  ComponentParamRef old = ComponentParam::Create("Old Gain", ParamType::AudioGain, 1.0);
  old->SetRange(0.0, 2.0);
  volume->AddParam(old);
  request.info.param = old;
  made = ParameterRowFactory::CreateParameterRows(request);
  ASSERT_EQ(made.size(), 1u);
  auto* oldRow = dynamic_cast<AudioFloatSliderParameter*>(made[0].get());
  ASSERT_NE(oldRow, nullptr);
  EXPECT_TRUE(oldRow->GetDisplayInfo().valueMapping);
}

// --- In the list ---

TEST_F(ListViewTest, VolumeShowsItsLevelInDecibels) {
  const TrackItemRef sound = AddClip(a1, {Make(kMatchName_Volume)});
  Open();
  Select({sound});
  ASSERT_EQ(list->GetNumberOfAudioParts(), 1);
  const EffectItemList& rows = list->GetAudioParts()[0]->GetItems();
  ASSERT_GE(rows.Size(), 1u);
  ASSERT_EQ(ChildTitles(*rows.At(0)), (std::vector<std::string>{"Bypass", "Level"}));
  auto* level = dynamic_cast<AudioFloatSliderParameter*>(rows.At(0)->GetItems()[1].get());
  ASSERT_NE(level, nullptr);
  EXPECT_EQ(level->GetHotText()->GetDisplayText(), "0.0 dB");
}

TEST_F(ListViewTest, ParametersAnAudioEffectHidesGetNoRow) {
  const TrackItemRef sound = AddClip(a1, {Make(kMatchName_Delay)});
  Select({sound});
  ASSERT_EQ(list->GetNumberOfAudioParts(), 1);
  const EffectItemList& rows = list->GetAudioParts()[0]->GetItems();
  ASSERT_GE(rows.Size(), 1u);
  EXPECT_EQ(rows.At(0)->GetName(), "Delay");
  EXPECT_EQ(ChildTitles(*rows.At(0)), (std::vector<std::string>{"Delay", "Feedback", "Mix"}));
  // The hidden one is there in the model all the same.
  EXPECT_TRUE(sound->GetComponentChain()->GetAt(0)->FindParam("Plug-in State"));
}

}  // namespace
