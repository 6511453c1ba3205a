#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "Host/Messaging/FunctionListener.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/ImageList.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Tests/Host/Rows/RowsTestFixture.h"

namespace {

// The smallest concrete parameter row: it shows nothing and counts its refreshes.
class PlainRow : public ParameterControl {
 public:
  using ParameterControl::ParameterControl;
  void SynchToCurrentTime() override { ++synchs; }
  bool CanExpand() const override { return true; }
  using ParameterControl::GetStopwatch;
  int synchs = 0;
};

class ParameterControlTest : public RowsTest {
 protected:
  ComponentParamRef opacity = AddParam(
      ComponentParam::Create("Opacity", ParamType::FloatSlider, 100.0)->SetRange(0.0, 100.0));

  double ValueAt(TickTime sequenceTime) {
    return *opacity->GetScalarAt(clip->SequenceTimeToClipTime(SequenceTime(sequenceTime)).Ticks());
  }
  static Point CenterOf(const ViewBase& view) { return view.GetBounds().Center(); }
};

TEST_F(ParameterControlTest, EditTimeIsConvertedToClipTimeThroughTheTrackItem) {
  auto row = MakeRow<PlainRow>(opacity);
  EXPECT_EQ(row->GetEditTime(), 12 * kSecond);
  EXPECT_EQ(row->GetClipEditTime(), 7 * kSecond);
  EXPECT_EQ(row->ClipTimeToSequenceTime(ClipTime(7 * kSecond)).Ticks(), 12 * kSecond);
  EXPECT_EQ(row->GetName(), "Opacity");
}

TEST_F(ParameterControlTest, WithoutASharedEditTimeTheSequencesCurrentTimeIsUsed) {
  ParameterControlInfo info = Info(opacity);
  info.editTime = nullptr;
  sequence->SetCurrentTime(15 * kSecond);
  PlainRow row(info);
  EXPECT_EQ(row.GetEditTime(), 15 * kSecond);
}

TEST_F(ParameterControlTest, StopwatchClickAddsAKeyframeAtTheEditTimeAsOneUndoableStep) {
  auto row = MakeRow<PlainRow>(opacity, 40);
  MultiPictureButton* stopwatch = row->GetStopwatch();
  ASSERT_NE(stopwatch, nullptr);
  EXPECT_EQ(stopwatch->GetBounds(), Rect::FromSize(20, 42, 16, 16));
  Click(CenterOf(*stopwatch));
  EXPECT_TRUE(opacity->IsTimeVarying());
  EXPECT_EQ(opacity->GetKeyframeTimes(), (std::vector<TickTime>{7 * kSecond}));
  EXPECT_EQ(stopwatch->GetValue(), 1);
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetTimeVarying"}));

  ASSERT_TRUE(Undo());
  EXPECT_FALSE(opacity->IsTimeVarying());
  EXPECT_FALSE(opacity->HasKeyframes());
  EXPECT_EQ(stopwatch->GetValue(), 0);  // the row follows the model's message
}

TEST_F(ParameterControlTest, StopwatchOffRemovesEveryKeyframeKeepingTheValueAtTheEditTime) {
  auto row = MakeRow<PlainRow>(opacity);
  ASSERT_EQ(ComponentParamActions::AddKeyframe(opacity, 6 * kSecond, 10.0), EditStatus::Done);
  ASSERT_EQ(ComponentParamActions::AddKeyframe(opacity, 8 * kSecond, 30.0), EditStatus::Done);
  const double atEditTime = ValueAt(12 * kSecond);  // clip 7 s: halfway, 20
  Click(CenterOf(*row->GetStopwatch()));
  EXPECT_FALSE(opacity->IsTimeVarying());
  EXPECT_FALSE(opacity->HasKeyframes());
  EXPECT_DOUBLE_EQ(ValueAt(0), atEditTime);
  ASSERT_TRUE(Undo());
  EXPECT_EQ(opacity->GetKeyframeTimes(), (std::vector<TickTime>{6 * kSecond, 8 * kSecond}));
}

TEST_F(ParameterControlTest, ATimeVaryingParameterEditedAtANewTimeGetsANewKeyframe) {
  auto row = MakeRow<PlainRow>(opacity);
  row->SetTimeVarying(true);
  SetEditTime(15 * kSecond, *row);
  EXPECT_TRUE(row->ApplyValue(40.0));
  EXPECT_EQ(opacity->GetKeyframeTimes(), (std::vector<TickTime>{7 * kSecond, 10 * kSecond}));
  EXPECT_DOUBLE_EQ(ValueAt(15 * kSecond), 40.0);
  EXPECT_DOUBLE_EQ(ValueAt(12 * kSecond), 100.0);
  EXPECT_EQ(UndoNames().back(), "MZ.ComponentParam.SetValue");
  ASSERT_TRUE(Undo());
  EXPECT_EQ(opacity->GetKeyframeTimes(), (std::vector<TickTime>{7 * kSecond}));
}

TEST_F(ParameterControlTest, AGestureOfManyValuesIsOneUndoStepThatRestoresTheOriginal) {
  auto row = MakeRow<PlainRow>(opacity);
  for (double v : {90.0, 70.0, 50.0}) {
    EXPECT_TRUE(row->SetEditValue(v));
    EXPECT_DOUBLE_EQ(ValueAt(12 * kSecond), v);  // live, without a step
  }
  EXPECT_TRUE(UndoNames().empty());
  EXPECT_TRUE(row->CommitEdit());
  EXPECT_FALSE(row->CommitEdit());  // once only: no second step, no contract failure
  row->ReleaseParamActor();
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  ASSERT_TRUE(Undo());
  EXPECT_DOUBLE_EQ(ValueAt(12 * kSecond), 100.0);
}

TEST_F(ParameterControlTest, AReadOnlyRowOpensNoEditAndItsStopwatchIsDisabled) {
  ParameterControlInfo info = Info(opacity);
  info.readOnly = true;
  auto row = std::make_shared<PlainRow>(info);
  row->FinishCreateSelf();
  row->Show();
  EXPECT_FALSE(row->SynchParamActor());
  EXPECT_FALSE(row->ApplyValue(10.0));
  EXPECT_FALSE(row->GetStopwatch()->IsEnabled());
  row->ObeyCommand(ParameterControl::kToggleTimeVaryingCommand);
  EXPECT_FALSE(opacity->IsTimeVarying());
  EXPECT_TRUE(UndoNames().empty());
}

TEST_F(ParameterControlTest, DestroyingARowWithAnOpenEditCommitsItAndRemovesItsControls) {
  auto row = MakeRow<PlainRow>(opacity);
  ASSERT_TRUE(row->SetEditValue(25.0));
  const std::size_t childrenBefore = listView->GetChildren().size();
  EXPECT_GT(childrenBefore, 0u);
  row->Destroy();
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  EXPECT_TRUE(listView->GetChildren().empty());
  EXPECT_DOUBLE_EQ(ValueAt(12 * kSecond), 25.0);
}

TEST_F(ParameterControlTest, StoppingThePlayerEndsAnOpenEditWithItsValueCommitted) {
  auto row = MakeRow<PlainRow>(opacity);
  ASSERT_TRUE(row->SetEditValue(60.0));
  sequence->SetPlayerState(PlayerState::Playing);
  sequence->SetPlayerState(PlayerState::Stopped);
  EXPECT_FALSE(row->IsEditOpen());
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
}

TEST_F(ParameterControlTest, AModelChangeRefreshesTheRowAndAHiddenParameterIsSetAside) {
  auto row = MakeRow<PlainRow>(opacity);
  int layouts = 0;
  FunctionListener listener(
      [&](const Message& m) { layouts += m.Is<EffectControlsDisclosureStateChanged>() ? 1 : 0; });
  AddListener(kStation, listener);
  const int synchsBefore = row->synchs;
  ASSERT_EQ(ComponentParamActions::SetValue(opacity, 7 * kSecond, 33.0), EditStatus::Done);
  EXPECT_GT(row->synchs, synchsBefore);
  opacity->SetVisible(false);
  EXPECT_TRUE(row->IsSetAside());
  EXPECT_FALSE(row->IsShown());
  EXPECT_EQ(layouts, 1);
  opacity->SetEnabled(false);  // no visibility change: no new layout
  EXPECT_EQ(layouts, 1);
}

TEST_F(ParameterControlTest, MovingTheEditTimeRefreshesOnlyWhenItChanged) {
  auto row = MakeRow<PlainRow>(opacity);
  const int before = row->synchs;
  row->RecursiveSynchToTime(false);
  EXPECT_EQ(row->synchs, before);
  SetEditTime(13 * kSecond, *row);
  EXPECT_EQ(row->synchs, before + 1);
  row->RecursiveSynchToTime(true);
  EXPECT_EQ(row->synchs, before + 2);
}

TEST_F(ParameterControlTest, KeyframeTimesComeInSequenceOrClipTime) {
  auto row = MakeRow<PlainRow>(opacity);
  ComponentParamActions::AddKeyframe(opacity, 6 * kSecond);
  std::set<TickTime> sequenceTimes;
  std::set<TickTime> clipTimes;
  row->GetKeyframeTimes(sequenceTimes, TimeLine::kSequence);
  row->GetKeyframeTimes(clipTimes, TimeLine::kClip);
  EXPECT_EQ(sequenceTimes, (std::set<TickTime>{11 * kSecond}));
  EXPECT_EQ(clipTimes, (std::set<TickTime>{6 * kSecond}));
}

TEST_F(ParameterControlTest, KeyframeHitTestFindsTheGlyphWithinSevenPixels) {
  auto row = MakeRow<PlainRow>(opacity);
  ComponentParamActions::AddKeyframe(opacity, 6 * kSecond);  // sequence 11 s
  // One pixel is a tenth of a second; the area starts at 10 s: the keyframe is at x 10.
  const FrameRate pixel = *FrameRate::FromTicksPerFrame(kSecond / 10);
  TickTime hit = 0;
  EXPECT_TRUE(row->HitKeyframe({10, 5}, 10 * kSecond, pixel, hit));
  EXPECT_EQ(hit, 11 * kSecond);
  EXPECT_TRUE(row->HitKeyframe({3, 5}, 10 * kSecond, pixel, hit));
  EXPECT_TRUE(row->HitKeyframe({17, 5}, 10 * kSecond, pixel, hit));
  EXPECT_FALSE(row->HitKeyframe({2, 5}, 10 * kSecond, pixel, hit));
  EXPECT_FALSE(row->HitKeyframe({18, 5}, 10 * kSecond, pixel, hit));
}

TEST_F(ParameterControlTest, AKeyframeBeforeTheSequenceStartIsNeverHit) {
  auto row = MakeRow<PlainRow>(opacity);
  ComponentParamActions::AddKeyframe(opacity, 1 * kSecond);  // sequence -4 s
  const FrameRate pixel = *FrameRate::FromTicksPerFrame(kSecond);
  TickTime hit = 0;
  EXPECT_FALSE(row->HitKeyframe({0, 5}, -4 * kSecond, pixel, hit));
}

TEST_F(ParameterControlTest, TheGlyphIndexIsSixTimesTheKindPlusTheVariant) {
  for (int i = 1; i <= 4; ++i) {
    ComponentParamActions::AddKeyframe(opacity, i * kSecond, std::min(100.0, 50.0 * (i - 1)));
  }
  ComponentParamActions::SetTemporalInterpolation(opacity, 3 * kSecond,
                                                  TemporalInterpolation::AutoBezier);
  ComponentParamActions::SetTemporalInterpolation(opacity, 4 * kSecond,
                                                  TemporalInterpolation::Hold);
  EXPECT_EQ(ParameterControl::GetKeyframeImageIndex(*opacity, 0, false), 1);       // linear, first
  EXPECT_EQ(ParameterControl::GetKeyframeImageIndex(*opacity, 0, true), 4);        // selected
  EXPECT_EQ(ParameterControl::GetKeyframeImageIndex(*opacity, 1, false), 0);       // linear
  EXPECT_EQ(ParameterControl::GetKeyframeImageIndex(*opacity, 2, true), 12 + 3);   // auto
  EXPECT_EQ(ParameterControl::GetKeyframeImageIndex(*opacity, 3, false), 18 + 2);  // hold, last
  ComponentParamActions::ApplyAutomaticEase(opacity, 2 * kSecond, KeyframeSide::In);
  EXPECT_EQ(ParameterControl::GetKeyframeImageIndex(*opacity, 1, false), 24);  // ease in
  ComponentParamActions::ApplyAutomaticEase(opacity, 2 * kSecond, KeyframeSide::Out);
  EXPECT_EQ(ParameterControl::GetKeyframeImageIndex(*opacity, 1, false), 6);  // both: bezier
  EXPECT_EQ(ParameterControl::GetKeyframeImageList()->GetCount(), 48);
}

TEST_F(ParameterControlTest, DrawKeyframesPutsTheGlyphOnTheKeyframesPixel) {
  auto row = MakeRow<PlainRow>(opacity);
  ComponentParamActions::AddKeyframe(opacity, 6 * kSecond);  // sequence 11 s
  const FrameRate pixel = *FrameRate::FromTicksPerFrame(kSecond / 10);
  const Color background(10, 20, 30);
  Image image({100, 40});
  image.Clear(background);
  DC dc(image);
  row->DrawKeyframes(dc, {0, 10, 100, 40}, 10 * kSecond, pixel, {});
  int left = 100;
  int right = -1;
  int top = 40;
  int bottom = -1;
  for (int y = 0; y < 40; ++y) {
    for (int x = 0; x < 100; ++x) {
      if (image.GetPixel(x, y) != background) {
        left = std::min(left, x);
        right = std::max(right, x);
        top = std::min(top, y);
        bottom = std::max(bottom, y);
      }
    }
  }
  ASSERT_GE(right, 0) << "nothing drawn";
  EXPECT_GE(left, 10 - 7);
  EXPECT_LE(right, 10 + 8);
  EXPECT_LT(left, 10);
  EXPECT_GT(right, 10);
  EXPECT_GE(top, 10);  // inside the 20-pixel strip at the row's top
  EXPECT_LT(bottom, 30);
}

TEST_F(ParameterControlTest, AnExpandedRowMakesRoomForItsGraphsAtTheBottom) {
  auto row = MakeRow<PlainRow>(opacity, 100);
  EXPECT_EQ(row->Height(), 20);
  row->SetIsExpanded(true);
  EXPECT_EQ(row->Height(), 20 + 54 + 1 + 54);
  row->SetValueGraphHeight(5);  // limited to the minimum
  EXPECT_EQ(row->GetValueGraphHeight(), ParameterControl::kMinimumGraphHeight);
  const Rect rowRect{0, 100, 300, 100 + row->Height()};
  EXPECT_EQ(row->GetVelocityGraphRect(rowRect), Rect(0, rowRect.bottom - 54, 300, rowRect.bottom));
  EXPECT_EQ(row->GetValueGraphRect(rowRect),
            Rect(0, rowRect.bottom - 54 - 1 - 20, 300, rowRect.bottom - 54 - 1));
  row->SetIsExpanded(false);
  EXPECT_TRUE(row->GetValueGraphRect(rowRect).IsEmpty());
}

// A graph viewer that reports a hit everywhere inside the rectangle it was set up with.
class FakeViewer : public ControlPointViewerHSLBase {
 public:
  explicit FakeViewer(bool velocity) : mVelocity(velocity) {}
  void SetOwner(ParameterControl* owner) override { mOwner = owner; }
  ParameterControl* GetOwner() const override { return mOwner; }
  void BindToParameter(const SequenceRef&, const TrackItemRef&, const ComponentRef&,
                       const ComponentParamRef& param) override {
    bound = param;
  }
  bool IsVelocityGraph() const override { return mVelocity; }
  void SetupForPaint(EffectControlsKeyframeViewHSLBase*, const Rect& rect, bool, TickTime,
                     double) override {
    mRect = rect;
  }
  void DrawGraph(DC&) override { ++draws; }
  ControlPointHit HitTest(Point point) override {
    ControlPointHit hit;
    if (mRect.Contains(point)) {
      hit.viewer = this;
      hit.isVelocityGraph = mVelocity;
    }
    return hit;
  }
  void SetHandlesHidden(bool) override {}

  ComponentParamRef bound;
  int draws = 0;

 private:
  bool mVelocity;
  ParameterControl* mOwner = nullptr;
  Rect mRect;
};

TEST_F(ParameterControlTest, GraphsAreDrawnAndHitThroughTheRegisteredViewers) {
  ParameterControl::SetGraphViewerFactory(
      [](ParameterControl&, bool velocity) { return std::make_unique<FakeViewer>(velocity); });
  auto row = MakeRow<PlainRow>(opacity, 0);
  row->SetIsExpanded(true);
  Image image({300, 200});
  DC dc(image);
  const Rect rowRect{0, 0, 300, row->Height()};
  row->DisplayGraph(dc, rowRect, 0, 0.01, true);
  auto* value = static_cast<FakeViewer*>(row->GetValueGraphViewer());
  auto* velocity = static_cast<FakeViewer*>(row->GetVelocityGraphViewer());
  ASSERT_NE(value, nullptr);
  ASSERT_NE(velocity, nullptr);
  EXPECT_EQ(value->GetOwner(), row.get());
  EXPECT_EQ(value->bound, opacity);
  EXPECT_EQ(value->draws, 1);
  EXPECT_EQ(velocity->draws, 1);
  EXPECT_EQ(row->HitControlPointGraph({50, 25}).viewer, value);
  EXPECT_TRUE(row->HitControlPointGraph({50, rowRect.bottom - 2}).isVelocityGraph);
  EXPECT_FALSE(row->HitControlPointGraph({50, 5}).IsHit());  // the keyframe strip
  ParameterControl::SetGraphViewerFactory(nullptr);
}

TEST_F(ParameterControlTest, RebindingMovesTheRowToAnotherParameter) {
  auto other =
      AddParam(ComponentParam::Create("Scale", ParamType::FloatSlider, 50.0)->SetRange(0, 200));
  auto row = MakeRow<PlainRow>(opacity);
  ASSERT_TRUE(row->SetEditValue(10.0));
  row->UpdateParamBinding(sequence, effect, other, clip);
  EXPECT_FALSE(row->IsEditOpen());  // the open edit ended (and committed)
  EXPECT_EQ(UndoNames().size(), 1u);
  EXPECT_EQ(row->GetName(), "Scale");
  const int before = row->synchs;
  ComponentParamActions::SetValue(opacity, 0, 1.0);  // the old parameter no longer reaches it
  EXPECT_EQ(row->synchs, before);
  ComponentParamActions::SetValue(other, 0, 1.0);
  EXPECT_GT(row->synchs, before);
}

}  // namespace

namespace {

class TimeRemappingGlyphTest : public RowsTest {};

TEST_F(TimeRemappingGlyphTest, SpeedKeyframesUseTheirOwnPictures) {
  auto speed = AddParam(ComponentParam::Create("Speed", ParamType::TimeRemapping, 1.0));
  for (int i = 1; i <= 3; ++i) {
    ComponentParamActions::AddKeyframe(speed, i * kSecond, 1.0);
  }
  EXPECT_EQ(ParameterControl::GetKeyframeImageIndex(*speed, 0, false), 40);  // right half
  EXPECT_EQ(ParameterControl::GetKeyframeImageIndex(*speed, 1, true), 37);   // dual, selected
  EXPECT_EQ(ParameterControl::GetKeyframeImageIndex(*speed, 2, false), 38);  // left half
  ComponentParamActions::SetTemporalInterpolation(speed, 2 * kSecond, TemporalInterpolation::Hold);
  EXPECT_EQ(ParameterControl::GetKeyframeImageIndex(*speed, 1, false), 42);
  ComponentParamActions::SetTemporalInterpolation(speed, 1 * kSecond, TemporalInterpolation::Hold);
  EXPECT_EQ(ParameterControl::GetKeyframeImageIndex(*speed, 0, true), 45);
}

TEST_F(TimeRemappingGlyphTest, TheVelocityAtTheEditTimeFollowsTheKeyframes) {
  auto level = AddParam(ComponentParam::Create("Level", ParamType::FloatSlider, 0.0));
  ComponentParamActions::AddKeyframe(level, 6 * kSecond, 0.0);
  ComponentParamActions::AddKeyframe(level, 8 * kSecond, 10.0);
  auto row = MakeRow<PlainRow>(level);
  row->UpdateCurrentVelocity();  // clip 7 s, on a straight 5-per-second segment
  EXPECT_DOUBLE_EQ(row->GetCurrentVelocity(), 5.0);
  SetEditTime(15 * kSecond, *row);  // after the last keyframe
  row->UpdateCurrentVelocity();
  EXPECT_DOUBLE_EQ(row->GetCurrentVelocity(), 0.0);
}

TEST_F(TimeRemappingGlyphTest, ARowCanTakeItsWidthFromTheListView) {
  auto level = AddParam(ComponentParam::Create("Level", ParamType::FloatSlider, 0.0));
  auto row = MakeRow<PlainRow>(level);
  row->PositionSelfUsingHostSize(33, 0);
  EXPECT_EQ(row->GetTop(), 33);
  EXPECT_EQ(row->GetWidth(), listView->GetBounds().Width());
}

}  // namespace

// The hit test searches for the first keyframe in reach instead of scanning from the start; it
// must find what a scan finds, keyframes closer together than the tolerance included.
TEST_F(ParameterControlTest, TheKeyframeHitTestFindsWhatAScanOfEveryKeyframeFinds) {
  auto row = MakeRow<PlainRow>(opacity);
  std::uint32_t state = 99;
  const auto next = [&state](std::uint32_t range) {
    state = state * 1664525u + 1013904223u;
    return (state >> 8) % range;
  };
  TickTime time = 0;
  for (int i = 0; i < 300; ++i) {
    time += static_cast<TickTime>(1 + next(40)) * (kSecond / 100);
    ComponentParamActions::AddKeyframe(opacity, time, 50.0);
  }
  const auto scan = [&](Point point, TickTime origin,
                        const FrameRate& rate) -> std::optional<TickTime> {
    for (const TickTime clipTime : opacity->GetKeyframeTimes()) {
      const TickTime at = row->ClipTimeToSequenceTime(ClipTime(clipTime)).Ticks();
      const std::int64_t x = std::clamp<std::int64_t>(ToFrame(at - origin, rate), -65536, 65536);
      if (x - ParameterControl::kKeyframeHitTolerance < point.x &&
          point.x < x + ParameterControl::kKeyframeHitTolerance && at >= 0) {
        return at;
      }
    }
    return std::nullopt;
  };
  for (const TickTime perPixel : {kSecond / 100, kSecond / 7, kSecond / 1000}) {
    const FrameRate rate = *FrameRate::FromTicksPerFrame(perPixel);
    for (const TickTime origin : {TickTime{0}, -3 * kSecond, 7 * kSecond + 13}) {
      for (int x = -20; x < 900; x += 3) {
        TickTime hit = -1;
        const bool found = row->HitKeyframe({x, 5}, origin, rate, hit);
        const std::optional<TickTime> expected = scan({x, 5}, origin, rate);
        ASSERT_EQ(found, expected.has_value()) << x << " " << origin << " " << perPixel;
        if (found) {
          EXPECT_EQ(hit, *expected) << x << " " << origin << " " << perPixel;
        }
      }
    }
  }
}
