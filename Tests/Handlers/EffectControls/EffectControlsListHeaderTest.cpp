#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <memory>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/EffectControlsListHeader.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/TransitionData.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/MenuTracker.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Host/Toolkit/ScriptedMenuTracker.h"

namespace {

constexpr TickTime kSec = kTicksPerSecond;

// A header 400 px wide naming a clip of "Edit" whose master clip is "Beach.mov".
class ListHeaderTest : public ::testing::Test {
 protected:
  ListHeaderTest() {
    project = Project::Create("Header");
    sequence = Sequence::Create("Edit", kFrameRate_25);
    project->AddSequence(sequence);
    track = Track::Create(MediaType::Video, "V1");
    sequence->AddTrack(track);
    master = MasterClip::Create("Beach.mov", Media::Create("Beach.mov", 600 * kSec, true, true));
    project->AddMasterClip(master);
    clip = TrackItem::CreateClip(MediaType::Video, 2 * kSec, 7 * kSec, master);
    track->AddItem(clip);
    header = std::make_shared<EffectControlsListHeader>();
    header->FinishCreate();
    header->SetBounds(Rect::FromSize(0, 0, 400, 34));
    header->SetMasterClipHandler(
        [this](const MasterClipRef& shown) { shownMasterClips.push_back(shown); });
    header->SetSequenceHandler([this]() { ++backInSequence; });
  }

  ~ListHeaderTest() override { header->Destroy(); }

  // A point inside `zone` of the name row.
  Point PointIn(EffectControlsListHeader::Zone zone) const {
    const int top = 14 + 4;
    for (int x = 0; x < 400; ++x) {
      if (header->HitTestZone(Point{x, top}) == zone) {
        return Point{x + 2, top};
      }
    }
    ADD_FAILURE() << "no zone " << zone;
    return Point{-1, -1};
  }

  MessagingTestScope scope;
  ProjectRef project;
  SequenceRef sequence;
  TrackRef track;
  MasterClipRef master;
  TrackItemRef clip;
  std::shared_ptr<EffectControlsListHeader> header;
  std::vector<MasterClipRef> shownMasterClips;
  int backInSequence = 0;
};

TEST_F(ListHeaderTest, HasNoZonesWithoutAClip) {
  EXPECT_EQ(header->GetDisplayMode(), EffectControlsListHeader::kModeNone);
  for (int x = 0; x < 400; x += 10) {
    EXPECT_EQ(header->HitTestZone(Point{x, 20}), EffectControlsListHeader::kZoneNone);
  }
  header->LeftButtonDownSelf(Point{30, 20}, kKeyModifierNone);
  EXPECT_TRUE(shownMasterClips.empty());
}

TEST_F(ListHeaderTest, TheNameRowHasTheMasterTheSequenceAndTheUsesZonesInThatOrder) {
  header->SetClip(sequence, clip);
  const Point masterPoint = PointIn(EffectControlsListHeader::kZoneMaster);
  const Point sequencePoint = PointIn(EffectControlsListHeader::kZoneSequence);
  const Point usesPoint = PointIn(EffectControlsListHeader::kZoneUses);
  EXPECT_LT(masterPoint.x, sequencePoint.x);
  EXPECT_LT(sequencePoint.x, usesPoint.x);
  // The uses zone is the 21 px at the right end of the text rectangle (width - 34 from x 10).
  EXPECT_EQ(header->HitTestZone(Point{10 + 366 - 1, 20}), EffectControlsListHeader::kZoneUses);
  EXPECT_EQ(header->HitTestZone(Point{10 + 366 - 21, 20}), EffectControlsListHeader::kZoneUses);
  EXPECT_EQ(header->HitTestZone(Point{30, 2}), EffectControlsListHeader::kZoneNone);  // above
}

TEST_F(ListHeaderTest, LongNamesShareTheRowWithoutOverlapping) {
  master->SetName(std::string(200, 'M'));
  clip->SetName(std::string(200, 'C'));
  header->SetClip(sequence, clip);
  int last = EffectControlsListHeader::kZoneNone;
  int changes = 0;
  for (int x = 10; x < 376; ++x) {
    const int zone = header->HitTestZone(Point{x, 20});
    if (zone != last && zone != EffectControlsListHeader::kZoneNone) {
      EXPECT_GT(zone, last) << "zones out of order at x " << x;
      last = zone;
      ++changes;
    }
  }
  EXPECT_EQ(changes, 3);
}

// A clip named with 10 MB: the header measured the whole name on every paint (seconds each,
// and its width overflowed Pango's int units), and the sequence group lost its text.
TEST_F(ListHeaderTest, AHugeNameIsElidedInItsGroupLikeAMerelyLongOne) {
  const auto zones = [&] {
    std::string row;
    for (int x = 0; x < 400; ++x) {
      row += static_cast<char>('0' + header->HitTestZone(Point{x, 20}));
    }
    return row;
  };
  const auto paint = [&] {
    Image image(Size{400, 34});
    DC dc(image);
    header->PaintSelf(dc);
    return image;
  };
  const auto sameImage = [](const Image& a, const Image& b) {
    for (int y = 0; y < 34; ++y) {
      for (int x = 0; x < 400; ++x) {
        if (a.GetPixel(x, y) != b.GetPixel(x, y)) {
          return ::testing::AssertionFailure() << "differs at " << x << "," << y;
        }
      }
    }
    return ::testing::AssertionSuccess();
  };

  master->SetName(std::string(2000, 'M'));
  clip->SetName(std::string(2000, 'C'));
  header->SetClip(sequence, clip);
  const std::string longZones = zones();
  const Image longImage = paint();
  clip->SetName("");
  header->SetClip(sequence, clip);
  const Image unnamedImage = paint();

  master->SetName(std::string(10'000'000, 'M'));
  clip->SetName(std::string(10'000'000, 'C'));
  header->SetClip(sequence, clip);
  EXPECT_EQ(zones(), longZones);
  const auto masterWidth = std::count(longZones.begin(), longZones.end(), '1');
  const auto sequenceWidth = std::count(longZones.begin(), longZones.end(), '2');
  EXPECT_GT(masterWidth, 100);
  EXPECT_LE(std::abs(masterWidth - sequenceWidth), 1) << "two long names share the row evenly";
  const Image hugeImage = paint();
  EXPECT_TRUE(sameImage(hugeImage, longImage));
  EXPECT_FALSE(sameImage(hugeImage, unnamedImage)) << "the clip's name shows";
  const auto built = Font::LayoutsBuilt();
  paint();
  header->HitTestZone(Point{100, 20});
  EXPECT_EQ(Font::LayoutsBuilt(), built) << "a repaint lays nothing out";
  EXPECT_EQ(header->GetSequenceGroupText().size(), 10'000'000 + std::string("Edit * ").size());
}

TEST_F(ListHeaderTest, ToolTipsNameTheGroupUnderThePointer) {
  header->SetClip(sequence, clip);
  EXPECT_EQ(header->GetToolTipText(PointIn(EffectControlsListHeader::kZoneMaster)),
            "Master * Beach.mov");
  EXPECT_EQ(header->GetToolTipText(PointIn(EffectControlsListHeader::kZoneSequence)),
            "Edit * Beach.mov");
  EXPECT_EQ(header->GetToolTipText(Point{5, 2}), "Edit * Beach.mov");
}

TEST_F(ListHeaderTest, MatchFrameShowsTheMasterClipOnceAndTheSequenceTakesItBack) {
  header->SetClip(sequence, clip);
  header->LeftButtonDownSelf(PointIn(EffectControlsListHeader::kZoneMaster), kKeyModifierNone);
  ASSERT_EQ(shownMasterClips.size(), 1U);
  EXPECT_EQ(shownMasterClips.front(), master);
  EXPECT_TRUE(header->IsShowingMasterClip());
  // Already showing it: a second click does nothing.
  header->LeftButtonDownSelf(PointIn(EffectControlsListHeader::kZoneMaster), kKeyModifierNone);
  EXPECT_EQ(shownMasterClips.size(), 1U);

  sequence->ClearSelection();
  header->LeftButtonDownSelf(PointIn(EffectControlsListHeader::kZoneSequence), kKeyModifierNone);
  EXPECT_FALSE(header->IsShowingMasterClip());
  EXPECT_EQ(backInSequence, 1);
  EXPECT_TRUE(sequence->IsSelected(clip.get()));
  // Not showing the master clip: the sequence group leads nowhere.
  header->LeftButtonDownSelf(PointIn(EffectControlsListHeader::kZoneSequence), kKeyModifierNone);
  EXPECT_EQ(backInSequence, 1);
}

TEST_F(ListHeaderTest, ANewTargetClearsTheMasterClipState) {
  header->SetClip(sequence, clip);
  header->LeftButtonDownSelf(PointIn(EffectControlsListHeader::kZoneMaster), kKeyModifierNone);
  ASSERT_TRUE(header->IsShowingMasterClip());
  header->SetNoTarget(0);
  EXPECT_FALSE(header->IsShowingMasterClip());
  EXPECT_EQ(header->GetDisplayText(), "(no clip selected)");
}

TEST_F(ListHeaderTest, TheUsesPopupListsEachUseAndGoesToTheChosenOne) {
  const SequenceRef other = Sequence::Create("Other", kFrameRate_25);
  project->AddSequence(other);
  const TrackRef otherTrack = Track::Create(MediaType::Video, "V1");
  other->AddTrack(otherTrack);
  const TrackItemRef use = TrackItem::CreateClip(MediaType::Video, 10 * kSec, 14 * kSec, master);
  otherTrack->AddItem(use);
  header->SetClip(sequence, clip);

  const auto uses = header->GetMasterClipUses();
  ASSERT_EQ(uses.size(), 2U);
  EXPECT_EQ(uses[0].label, "Edit : 00:00:02:00");
  EXPECT_EQ(uses[1].label, "Other : 00:00:10:00");

  auto tracker = std::make_shared<ScriptedMenuTracker>();
  tracker->PushAnswer(EffectControlsListHeader::kFirstUseCommand + 1);
  const auto previous = SetMenuTrackerForTesting(tracker);
  header->LeftButtonDownSelf(PointIn(EffectControlsListHeader::kZoneUses), kKeyModifierNone);
  SetMenuTrackerForTesting(previous);
  ASSERT_EQ(tracker->GetRequests().size(), 1U);
  EXPECT_EQ(tracker->GetRequests().front().entries.size(), 2U);
  EXPECT_EQ(other->GetCurrentTime(), 10 * kSec);
  EXPECT_TRUE(other->IsSelected(use.get()));
}

TEST_F(ListHeaderTest, AUseCommandOutOfRangeDoesNothing) {
  header->SetClip(sequence, clip);
  EXPECT_TRUE(header->ObeyCommand(EffectControlsListHeader::kFirstUseCommand + 5));
  EXPECT_EQ(sequence->GetCurrentTime(), 0);
}

TEST_F(ListHeaderTest, ATransitionShowsTheSequenceAndItsName) {
  TransitionData data;
  data.displayName = "Cross Dissolve";
  const TrackItemRef transition =
      TrackItem::CreateTransition(MediaType::Video, 6 * kSec, 8 * kSec, data);
  track->AddItem(transition);
  header->SetTransition(sequence, transition, clip, nullptr);
  EXPECT_EQ(header->GetDisplayMode(), EffectControlsListHeader::kModeTransition);
  EXPECT_EQ(header->GetDisplayText(), "Edit * " + transition->GetName());
  EXPECT_EQ(header->HitTestZone(Point{30, 20}), EffectControlsListHeader::kZoneNone);
}

TEST_F(ListHeaderTest, TheExpanderPictureFollowsTheKeyframeArea) {
  header->SetKeyframesVisible(false);
  EXPECT_FALSE(header->AreKeyframesVisible());
  EXPECT_EQ(header->GetExpander()->GetValue(), 0);
  header->SetKeyframesVisible(true);
  EXPECT_EQ(header->GetExpander()->GetValue(), 1);
  header->EnableExpander(false);
  EXPECT_FALSE(header->GetExpander()->IsEnabled());
}

}  // namespace
