#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/UndoStack.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/StandardCommands.h"
#include "Tests/Handlers/EffectControls/EffectControlsViewTestSupport.h"

using namespace panel_view_test;

namespace {

// Delete goes to the list's selected effects first and to the selected keyframes only when the
// list has nothing to act on.
class PanelRoutingTest : public PanelViewTest {
 protected:
  void ShowClip() {
    clip = AddClip(v1, 0, 10 * kSec);
    motion = builder.AddEffect(clip, kMatchName_Motion);
    blur = builder.AddEffect(clip, kMatchName_GaussianBlur);
    ProjectBuilder::AddKeyframes(
        motion->GetParams().front(),
        {{.time = 0, .value = ParamPoint{1, 2}}, {.time = kSec, .value = ParamPoint{3, 4}}});
    Open({900, 500});
    sequence->SetSelection({clip});
    view->SequenceClipSelectionChanged(sequence);
  }
  EffectControlsListView& List() { return *view->GetListView(); }
  std::shared_ptr<EffectItem> Row(const std::string& name) {
    std::shared_ptr<EffectItem> found;
    List().GetVideoItems().ForEachRow([&](const EffectItemList::Row& row) {
      if (!found && row->GetName() == name) {
        found = row;
      }
      return true;
    });
    return found;
  }
  std::size_t Effects() const { return clip->GetComponentChain()->GetComponents().size(); }
  bool Enabled(CommandID command) {
    CommandStatus status;
    view->FindCommandStatus(command, status);
    return status.enabled;
  }

  TrackItemRef clip;
  ComponentRef motion;
  ComponentRef blur;
};

TEST_F(PanelRoutingTest, DeleteRemovesTheSelectedEffectAndLeavesTheSelectedKeyframes) {
  ShowClip();
  List().GetKeyframeSelection()->AddAllItems(clip, motion, motion->GetParams().front());
  List().SelectItem(Row("Gaussian Blur"), true);
  ASSERT_TRUE(Enabled(kCommandClear));
  view->ObeyCommand(kCommandClear);
  EXPECT_EQ(Effects(), 1u);
  EXPECT_EQ(motion->GetParams().front()->GetKeyframes().Size(), 2u);
}

TEST_F(PanelRoutingTest, DeleteReachesTheSelectedKeyframesWhenNoEffectCanGo) {
  ShowClip();
  List().SelectItem(Row("Motion"), true);
  List().GetKeyframeSelection()->AddAllItems(clip, motion, motion->GetParams().front());
  ASSERT_TRUE(Enabled(kCommandClear));
  view->ObeyCommand(kCommandClear);
  EXPECT_EQ(Effects(), 2u);
  EXPECT_TRUE(motion->GetParams().front()->GetKeyframes().IsEmpty());
  EXPECT_EQ(project->GetUndoStack().GetUndoNames().size(), 1u);
  EXPECT_FALSE(Enabled(kCommandClear));
}

}  // namespace
