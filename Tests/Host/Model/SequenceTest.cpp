#include <gtest/gtest.h>

#include <set>

#include "Host/Model/ModelMessages.h"
#include "Host/Model/Sequence.h"
#include "ModelTestFixture.h"

namespace {

class SequenceTest : public ModelTest {};

TEST_F(SequenceTest, SelectingAPartOfALinkedClipSelectsTheWholeClipAsOneGroup) {
  sequence->SetSelection({audio1});
  ASSERT_EQ(sequence->GetSelection().size(), 1u);
  const TrackItemGroup& group = sequence->GetSelection()[0];
  EXPECT_EQ(group.videoItems, (std::vector<TrackItemRef>{video}));
  // Audio parts in track order.
  EXPECT_EQ(group.audioItems, (std::vector<TrackItemRef>{audio1, audio2}));
  EXPECT_TRUE(sequence->IsSelected(audio2.get()));
}

TEST_F(SequenceTest, UnlinkedItemsAreGroupsOfTheirOwn) {
  sequence->SetSelection({second, transition, second});
  ASSERT_EQ(sequence->GetSelection().size(), 2u);
  EXPECT_EQ(sequence->GetSelection()[0].videoItems, (std::vector<TrackItemRef>{second}));
  EXPECT_EQ(sequence->GetSelection()[1].videoItems, (std::vector<TrackItemRef>{transition}));
}

TEST_F(SequenceTest, ItemsOfAnotherSequenceAreNotSelected) {
  const TrackItemRef stray = TrackItem::CreateClip(MediaType::Video, 0, kSecond, masterClip);
  sequence->SetSelection({stray});
  EXPECT_TRUE(sequence->GetSelection().empty());
}

TEST_F(SequenceTest, AnItemRemovedFromItsTrackLeavesTheSelection) {
  sequence->SetSelection({second});
  MessageRecorder recorder;
  recorder.Listen(sequence->GetStation());
  v1->RemoveItem(second.get());
  EXPECT_TRUE(sequence->GetSelection().empty());
  EXPECT_EQ(recorder.Count("SequenceClipSelectionChangedMessage"), 1);
  EXPECT_EQ(recorder.Count("SequenceChangedMessage"), 1);
}

TEST_F(SequenceTest, ABatchOfChangesIsAnnouncedOnce) {
  MessageRecorder recorder;
  recorder.Listen(sequence->GetStation());
  {
    Sequence::ScopedChangeBatch batch(*sequence);
    video->SetTimes(3 * kSecond, 6 * kSecond, 2 * kSecond);
    second->SetTimes(6 * kSecond, 11 * kSecond, 10 * kSecond);
    EXPECT_EQ(recorder.Count("SequenceChangedMessage"), 0);
  }
  EXPECT_EQ(recorder.Count("SequenceChangedMessage"), 1);
}

TEST_F(SequenceTest, ClipTimeIsMediaTimeSoKeyframesStayWithThePictures) {
  // Video: [2 s, 7 s) showing media from 1 s.
  EXPECT_EQ(video->SequenceTimeToClipTime(SequenceTime(2 * kSecond)).Ticks(), 1 * kSecond);
  EXPECT_EQ(video->SequenceTimeToClipTime(SequenceTime(4 * kSecond)).Ticks(), 3 * kSecond);
  EXPECT_EQ(video->ClipTimeToSequenceTime(ClipTime(3 * kSecond)).Ticks(), 4 * kSecond);
  video->SetSpeed(2.0);
  EXPECT_EQ(video->SequenceTimeToClipTime(SequenceTime(4 * kSecond)).Ticks(), 5 * kSecond);
  EXPECT_EQ(video->ClipTimeToSequenceTime(ClipTime(5 * kSecond)).Ticks(), 4 * kSecond);
  EXPECT_FALSE(video->SetSpeed(0.0));
  EXPECT_FALSE(video->SetSpeed(-1.0));
  EXPECT_EQ(video->GetSpeed(), 2.0);
}

TEST_F(SequenceTest, HeadAndTailMaterialComeFromTheMedia) {
  // 60 s of media, shown from 1 s for 5 s: 1 s of head, 54 s of tail.
  EXPECT_EQ(video->GetMediaStartInSequence(), 1 * kSecond);
  EXPECT_EQ(video->GetMediaEndInSequence(), 61 * kSecond);
  EXPECT_TRUE(video->HasHeadMaterial());
  video->SetTimes(2 * kSecond, 7 * kSecond, 0);
  EXPECT_FALSE(video->HasHeadMaterial());
  EXPECT_EQ(transition->GetMediaStartInSequence(), kTime_Min);  // no media: no limit
}

TEST_F(SequenceTest, TimesThatCannotBeStoredAreRefused) {
  EXPECT_FALSE(video->SetTimes(5 * kSecond, 4 * kSecond, 0));
  EXPECT_FALSE(video->SetTimes(kTime_Min, kSecond, 0));
  EXPECT_EQ(video->GetStart(), 2 * kSecond);
}

TEST_F(SequenceTest, TrackItemsStayInTimeOrderWhenMoved) {
  second->SetTimes(0, kSecond, 10 * kSecond);
  EXPECT_EQ(v1->GetItems().front(), second);
}

TEST_F(SequenceTest, LinkedItemsAreTheOtherPartsOfTheClip) {
  EXPECT_EQ(video->GetLinkedItems(), (std::vector<TrackItemRef>{audio1, audio2}));
  EXPECT_TRUE(second->GetLinkedItems().empty());
}

TEST_F(SequenceTest, TheIntroAndOutroNeverOverlap) {
  video->SetIntroDuration(4 * kSecond);
  video->SetOutroDuration(3 * kSecond);
  EXPECT_EQ(video->GetEffectiveIntroDuration(), 4 * kSecond);
  EXPECT_EQ(video->GetEffectiveOutroDuration(), 1 * kSecond);
  EXPECT_FALSE(video->SetIntroDuration(-1));
}

TEST_F(SequenceTest, EveryObjectHasADistinctIdTheProjectFinds) {
  std::set<ObjectID> ids;
  std::size_t count = 0;
  project->ForEachObject([&](ModelObject& object) {
    ids.insert(object.GetID());
    ++count;
  });
  EXPECT_EQ(ids.size(), count);
  EXPECT_GT(count, 50u);
  EXPECT_EQ(project->FindTrackItem(video->GetID()), video);
  EXPECT_EQ(project->FindComponent(blur->GetID()), blur);
  EXPECT_EQ(project->FindParam(blur->GetParam(0)->GetID()), blur->GetParam(0));
  EXPECT_EQ(project->FindTrackItem(blur->GetID()), nullptr);  // wrong type
  EXPECT_EQ(project->FindObject(-5), nullptr);
}

TEST_F(SequenceTest, ALoaderMayGiveIdsAndNewObjectsNeverReuseThem) {
  const ObjectID high = blur->GetID() + 1000000;
  crop->SetID(high);
  EXPECT_EQ(project->FindComponent(high), crop);
  EXPECT_GT(Catalogue().Create(kMatchName_Tint)->GetID(), high);
}

TEST_F(SequenceTest, BackPointersFollowOwnership) {
  EXPECT_EQ(blur->GetTrackItem(), video.get());
  EXPECT_EQ(blur->GetProject(), project.get());
  EXPECT_EQ(video->GetSequence(), sequence.get());
  EXPECT_EQ(masterClip->GetVideoChain()->GetMasterClip(), masterClip.get());
  // An object kept after its owner is gone no longer points at it.
  ComponentRef kept = blur;
  ProjectRef keptProject = project;
  project.reset();
  sequence.reset();
  v1.reset();
  video.reset();
  videoChain.reset();
  blur.reset();
  EXPECT_EQ(kept->GetProject(), keptProject.get());
}

TEST_F(SequenceTest, AComponentOutlivingItsChainHasNoChain) {
  ComponentRef kept = blur;
  TrackItemRef item = TrackItem::CreateClip(MediaType::Video, 0, kSecond, nullptr);
  ComponentRef effect = Catalogue().Create(kMatchName_Crop);
  item->GetComponentChain()->Append(effect);
  item.reset();  // item and chain go
  EXPECT_EQ(effect->GetChain(), nullptr);
  EXPECT_EQ(effect->GetProject(), nullptr);
}

}  // namespace

namespace {

TEST_F(SequenceTest, TheFrameSizeRefusesSidesOutsideItsRange) {
  EXPECT_EQ(sequence->GetFrameSize(), (Sequence::FrameSize{1920, 1080}));
  EXPECT_FALSE(sequence->SetFrameSize({0, 1080}));
  EXPECT_FALSE(sequence->SetFrameSize({1920, Sequence::kMaxFrameSide + 1}));
  EXPECT_EQ(sequence->GetFrameSize(), (Sequence::FrameSize{1920, 1080}));
  EXPECT_TRUE(sequence->SetFrameSize({3840, 2160}));
  EXPECT_EQ(sequence->GetFrameSize(), (Sequence::FrameSize{3840, 2160}));
}

TEST_F(SequenceTest, TrackMenuStringsListTheVideoTracksAfterNoneAndASeparator) {
  EXPECT_EQ(sequence->GetTrackComboParamStrings(), (std::vector<std::string>{"None", "(-", "V1"}));
  sequence->AddTrack(Track::Create(MediaType::Video, ""));
  EXPECT_EQ(sequence->GetTrackComboParamStrings(),
            (std::vector<std::string>{"None", "(-", "V1", "~"}));
}

}  // namespace
