// Switching between a clip's own effects and its master clip's with the same clip selected.
#include <string>
#include <vector>

#include "EffectControlsViewTestSupport.h"
#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsListHeader.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Rows/EffectItem.h"

using namespace panel_view_test;

namespace {

std::vector<std::string> VideoTitles(const EffectControlsView& view) {
  std::vector<std::string> titles;
  for (const auto& row : view.GetListView()->GetVideoItems()) {
    titles.push_back(row->GetName());
  }
  return titles;
}

// A point in the header's zone, in the header's coordinates.
Point ZonePoint(const EffectControlsListHeader& header, EffectControlsListHeader::Zone zone) {
  for (int y = 0; y < header.GetBounds().Height(); ++y) {
    for (int x = 0; x < header.GetBounds().Width(); ++x) {
      if (header.HitTestZone(Point{x, y}) == zone) {
        return Point{x + 2, y + 2};
      }
    }
  }
  ADD_FAILURE() << "the header has no zone " << zone;
  return Point{-1, -1};
}

}  // namespace

// The selection stays the same when the header jumps to the master clip and back: the
// list must still take each jump for a new target, or it would keep showing (and editing)
// the clip's own effects under the master clip's name.
TEST_F(PanelViewTest, TheMasterClipJumpAndTheWayBackShowEachChainsOwnEffects) {
  const EffectCatalogue& catalogue = EffectCatalogue::Standard();
  master->GetVideoChain()->Append(catalogue.Create(kMatchName_Tint));
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 7 * kSec, 1);
  const TrackItemRef sound = AddClip(a1, 2 * kSec, 7 * kSec, 1);
  clip->GetComponentChain()->Append(catalogue.Create(kMatchName_GaussianBlur));
  Open({800, 400});
  sequence->SetSelection({clip, sound});
  ASSERT_EQ(VideoTitles(*view), (std::vector<std::string>{"Gaussian Blur"}));

  EffectControlsListHeader& header = *view->GetHeader();
  header.LeftButtonDownSelf(ZonePoint(header, EffectControlsListHeader::kZoneMaster),
                            kKeyModifierNone);
  ASSERT_TRUE(header.IsShowingMasterClip());
  EXPECT_TRUE(view->GetListView()->IsViewingMasterClip());
  EXPECT_EQ(VideoTitles(*view), (std::vector<std::string>{"Tint"}));
  EXPECT_EQ(view->GetListView()->GetVideoChain(), master->GetVideoChain());

  // Back into the sequence: the same selection again, the clip's own effects again.
  header.LeftButtonDownSelf(ZonePoint(header, EffectControlsListHeader::kZoneSequence),
                            kKeyModifierNone);
  ASSERT_FALSE(header.IsShowingMasterClip());
  EXPECT_FALSE(view->GetListView()->IsViewingMasterClip());
  EXPECT_EQ(VideoTitles(*view), (std::vector<std::string>{"Gaussian Blur"}));
  EXPECT_EQ(view->GetListView()->GetVideoChain(), clip->GetComponentChain());
}
