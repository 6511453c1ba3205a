#include <gtest/gtest.h>

#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Shell/DemoProject.h"

namespace {

TEST(DemoProject, HasTheDocumentedItemsAtTheirIDsAndTimes) {
  MessagingTestScope messaging;
  const ProjectRef project = BuildDemoProject();
  ASSERT_EQ(project->GetSequences().size(), 1u);
  const SequenceRef sequence = project->GetActiveSequence();
  ASSERT_NE(sequence, nullptr);
  EXPECT_EQ(sequence->GetName(), "Demo Sequence");
  struct Expected {
    ObjectID id;
    TrackItemKind kind;
    MediaType media;
    double start, end;
  };
  for (const Expected& e :
       {Expected{kDemoVideoClipA, TrackItemKind::Clip, MediaType::Video, 0, 5},
        Expected{kDemoTransition, TrackItemKind::Transition, MediaType::Video, 4.5, 5.5},
        Expected{kDemoVideoClipB, TrackItemKind::Clip, MediaType::Video, 5, 10},
        Expected{kDemoAudioClipA, TrackItemKind::Clip, MediaType::Audio, 0, 5},
        Expected{kDemoAudioClipB, TrackItemKind::Clip, MediaType::Audio, 5, 10}}) {
    SCOPED_TRACE(e.id);
    const TrackItemRef item = project->FindTrackItem(e.id);
    ASSERT_NE(item, nullptr);
    EXPECT_EQ(item->GetKind(), e.kind);
    EXPECT_EQ(item->GetMediaType(), e.media);
    EXPECT_EQ(item->GetStart(), static_cast<TickTime>(e.start * kTicksPerSecond));
    EXPECT_EQ(item->GetEnd(), static_cast<TickTime>(e.end * kTicksPerSecond));
  }
  EXPECT_EQ(project->FindTrackItem(kDemoVideoClipA)->GetLinkedItems().size(), 1u);
  EXPECT_TRUE(project->GetUndoStack().GetUndoNames().empty());
}

TEST(DemoProject, ClipAHasKeyframedMotionAndOpacityAndEveryVideoClipABlur) {
  MessagingTestScope messaging;
  const ProjectRef project = BuildDemoProject();
  const TrackItemRef clipA = project->FindTrackItem(kDemoVideoClipA);
  const ComponentChainRef& chain = clipA->GetComponentChain();
  const ComponentRef motion = chain->FindByMatchName(kMatchName_Motion);
  ASSERT_NE(motion, nullptr);
  const ComponentParamRef scale = motion->FindParam("Scale");
  ASSERT_NE(scale, nullptr);
  EXPECT_TRUE(scale->IsTimeVarying());
  EXPECT_EQ(scale->GetKeyframeTimes().size(), 2u);
  // Keyframes are in clip time: clip A starts 2 s into its media.
  EXPECT_EQ(scale->GetScalarAt(2 * kTicksPerSecond), 100.0);
  EXPECT_EQ(scale->GetScalarAt(4 * kTicksPerSecond), 120.0);
  EXPECT_EQ(
      chain->FindByMatchName(kMatchName_Opacity)->FindParam("Opacity")->GetKeyframeTimes().size(),
      2u);
  for (const ObjectID id : {kDemoVideoClipA, kDemoVideoClipB}) {
    EXPECT_NE(
        project->FindTrackItem(id)->GetComponentChain()->FindByMatchName(kMatchName_GaussianBlur),
        nullptr);
  }
  EXPECT_FALSE(project->FindTrackItem(kDemoVideoClipB)
                   ->GetComponentChain()
                   ->FindByMatchName(kMatchName_Motion)
                   ->FindParam("Scale")
                   ->IsTimeVarying());
}

TEST(DemoProject, EachCallMakesAnIndependentProject) {
  MessagingTestScope messaging;
  const ProjectRef first = BuildDemoProject();
  const ProjectRef second = BuildDemoProject();
  EXPECT_NE(first, second);
  EXPECT_NE(first->FindTrackItem(kDemoVideoClipA), second->FindTrackItem(kDemoVideoClipA));
  EXPECT_EQ(second->FindTrackItem(kDemoVideoClipA)->GetProject(), second.get());
}

}  // namespace
