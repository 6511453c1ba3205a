#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Host/Model/ComponentActions.h"
#include "Host/Model/ComponentChainActions.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/EffectClipboardItem.h"
#include "Host/Model/ModelDescription.h"
#include "Host/Model/TransitionData.h"
#include "Host/Model/UndoStack.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/StandardCommands.h"
#include "Tests/Handlers/EffectControls/EffectControlsListViewTestSupport.h"
#include "Tests/Host/Model/UndoRoundTrip.h"

namespace {

using Strings = std::vector<std::string>;
using List = EffectControlsListView;

class ListCommandsTest : public ListViewTest {
 protected:
  // Motion, Opacity and Gaussian Blur (with two masks) on one clip; the list shows it.
  void ShowClip() {
    blur = Make(kMatchName_GaussianBlur);
    blur->SetMasks({Make(kMatchName_Mask), Make(kMatchName_Mask)});
    clip = AddClip(v1, {Make(kMatchName_Motion), Make(kMatchName_Opacity), blur});
    Open();
    Select({clip});
  }
  FilterItem& Row(const std::string& name) const {
    std::shared_ptr<EffectItem> found;
    list->GetVideoItems().ForEachRow([&](const EffectItemList::Row& row) {
      if (row->IsFilter() && row->GetName() == name && !found) {
        found = row;
      }
      return true;
    });
    EXPECT_NE(found, nullptr) << name;
    return dynamic_cast<FilterItem&>(*found);
  }
  std::shared_ptr<EffectItem> RowRef(const std::string& name) const {
    return Row(name).shared_from_this();
  }
  void SelectOnly(const std::vector<std::string>& names) {
    list->ClearSelection();
    for (const auto& name : names) {
      list->SelectItem(RowRef(name), true);
    }
  }
  static Strings Names(const TrackItemRef& item) {
    Strings names;
    for (const auto& component : item->GetComponentChain()->GetComponents()) {
      names.push_back(component->GetDisplayName());
    }
    return names;
  }
  Strings Selected() const {
    Strings names;
    for (const auto& entry : list->GetSelectedItems().GetEntries()) {
      names.push_back(entry.component->GetDisplayName());
    }
    return names;
  }
  CommandStatus StatusOf(CommandID command) {
    CommandStatus status;
    list->FindCommandStatus(command, status);
    return status;
  }
  UndoStack& Undo() { return project->GetUndoStack(); }
  std::string Describe() const { return DescribeForTest(*project); }

  ComponentRef blur;
  TrackItemRef clip;
};

TEST_F(ListCommandsTest, DeletingOnlyIntrinsicEffectsRemovesNothingAndLeavesDeleteToTheKeyframes) {
  ShowClip();
  SelectOnly({"Motion", "Opacity"});
  EXPECT_FALSE(list->CanDeleteEffects());
  EXPECT_FALSE(StatusOf(kCommandClear).enabled);
  EXPECT_FALSE(list->ObeyCommand(kCommandClear));
  EXPECT_EQ(Names(clip), (Strings{"Motion", "Opacity", "Gaussian Blur"}));
  EXPECT_FALSE(Undo().CanUndo());
}

TEST_F(ListCommandsTest, DeletingAnAppliedEffectWithMotionRemovesOnlyTheAppliedOneInOneStep) {
  ShowClip();
  MessageRecorder recorder;
  recorder.Listen(clip->GetComponentChain()->GetStation());
  UndoRoundTrip check(
      *project, [this] { return Describe(); }, recorder);
  check.Check({.name = ComponentChainActions::kRemoveMultipleFilters,
               .edit =
                   [this] {
                     SelectOnly({"Motion", "Gaussian Blur"});
                     EXPECT_TRUE(StatusOf(kCommandClear).enabled);
                     return list->ObeyCommand(kCommandClear) ? EditStatus::Done
                                                             : EditStatus::NoChange;
                   },
               .checkEdited =
                   [this] {
                     EXPECT_EQ(Names(clip), (Strings{"Motion", "Opacity"}));
                   }});
}

TEST_F(ListCommandsTest, DeletingEffectsOfVideoAndAudioIsOneUndoStep) {
  const TrackItemRef picture =
      AddClip(v1, {Make(kMatchName_Opacity), Make(kMatchName_GaussianBlur)});
  const TrackItemRef sound = AddClip(a1, {Make(kMatchName_Volume), Make(kMatchName_Delay)});
  picture->SetLinkGroup(4);
  sound->SetLinkGroup(4);
  Open({420, 900});
  Select({picture, sound});
  list->SelectItem(list->GetVideoItems().At(1), true);
  list->SelectItem(list->GetAudioParts().front()->GetItems().At(1), true);
  ASSERT_EQ(Selected(), (Strings{"Gaussian Blur", "Delay"}));

  EXPECT_TRUE(list->ObeyCommand(kCommandClear));
  EXPECT_EQ(Names(picture), Strings{"Opacity"});
  EXPECT_EQ(Names(sound), Strings{"Volume"});
  ASSERT_EQ(Undo().GetUndoNames().size(), 1u);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(Names(picture), (Strings{"Opacity", "Gaussian Blur"}));
  EXPECT_EQ(Names(sound), (Strings{"Volume", "Delay"}));
}

TEST_F(ListCommandsTest, DeletingOneMaskRemovesOnlyThatMaskAndRebuildsTheList) {
  ShowClip();
  const ComponentRef second = blur->GetMasks().at(1);
  list->ClearSelection();
  std::shared_ptr<EffectItem> maskRow;
  list->GetVideoItems().ForEachRow([&](const EffectItemList::Row& row) {
    if (auto* filter = dynamic_cast<FilterItem*>(row.get());
        filter != nullptr && filter->Component() == second) {
      maskRow = row;
    }
    return true;
  });
  ASSERT_NE(maskRow, nullptr);
  list->SelectItem(maskRow, true);
  ASSERT_TRUE(list->SelectionContainsSubsidiaryItems());
  EXPECT_EQ(list->GetSelectedItems().At(0).parent, blur);

  EXPECT_TRUE(list->ObeyCommand(kCommandClear));
  ASSERT_EQ(blur->GetMasks().size(), 1u);
  EXPECT_NE(blur->GetMasks().front(), second);
  EXPECT_EQ(Names(clip), (Strings{"Motion", "Opacity", "Gaussian Blur"}));
  EXPECT_EQ(Undo().GetUndoName(), ComponentActions::kRemoveMask);
  // The list was rebuilt: no row shows the removed mask.
  bool shown = false;
  list->GetVideoItems().ForEachRow([&](const EffectItemList::Row& row) {
    auto* filter = dynamic_cast<FilterItem*>(row.get());
    shown = shown || (filter != nullptr && filter->Component() == second);
    return true;
  });
  EXPECT_FALSE(shown);
}

TEST_F(ListCommandsTest, CopyThenPasteOntoAnotherClipAddsASelectedCloneWithTheSameValues) {
  ShowClip();
  ProjectBuilder::AddKeyframes(blur->GetParams().front(),
                               {{.time = 0, .value = 3.0}, {.time = kSecond, .value = 9.0}});
  const TrackItemRef other = AddClip(v1, {Make(kMatchName_Motion)}, 8 * kSecond, 12 * kSecond);
  SelectOnly({"Gaussian Blur"});
  EXPECT_TRUE(StatusOf(kCommandCopy).enabled);
  EXPECT_TRUE(list->ObeyCommand(kCommandCopy));
  EXPECT_FALSE(Undo().CanUndo());

  Select({other});
  const std::string before = Describe();
  EXPECT_TRUE(StatusOf(kCommandPaste).enabled);
  EXPECT_TRUE(list->ObeyCommand(kCommandPaste));
  ASSERT_EQ(Names(other), (Strings{"Motion", "Gaussian Blur"}));
  const ComponentRef pasted = other->GetComponentChain()->GetComponents().back();
  EXPECT_NE(pasted, blur);
  for (std::size_t i = 0; i < blur->GetParamCount(); ++i) {
    EXPECT_EQ(pasted->GetParams()[i]->GetState(), blur->GetParams()[i]->GetState()) << i;
  }
  EXPECT_EQ(Selected(), Strings{"Gaussian Blur"});
  EXPECT_TRUE(Row("Gaussian Blur").IsSelected());
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);

  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(Describe(), before);
}

TEST_F(ListCommandsTest, CutOfAnIntrinsicIsRefusedAndLeavesTheClipboardAlone) {
  ShowClip();
  SelectOnly({"Opacity"});
  EXPECT_FALSE(StatusOf(kCommandCut).enabled);
  list->ObeyCommand(kCommandCut);
  EXPECT_TRUE(project->GetClipboard().IsEmpty());
  EXPECT_EQ(Names(clip), (Strings{"Motion", "Opacity", "Gaussian Blur"}));
  EXPECT_FALSE(Undo().CanUndo());
}

TEST_F(ListCommandsTest, CutCopiesThenDeletesAsOneStep) {
  ShowClip();
  SelectOnly({"Gaussian Blur"});
  EXPECT_TRUE(StatusOf(kCommandCut).enabled);
  EXPECT_TRUE(list->ObeyCommand(kCommandCut));
  const auto* item =
      dynamic_cast<const EffectClipboardItem*>(project->GetClipboard().GetItem().get());
  ASSERT_NE(item, nullptr);
  ASSERT_EQ(item->GetEffects().size(), 1u);
  EXPECT_EQ(item->GetEffects().front()->GetMatchName(), kMatchName_GaussianBlur);
  EXPECT_EQ(Names(clip), (Strings{"Motion", "Opacity"}));
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);
}

TEST_F(ListCommandsTest, PastingTwoMasksOntoASelectedEffectIsOneStepNamedPasteEffectMasks) {
  ShowClip();
  const TrackItemRef other =
      AddClip(v1, {Make(kMatchName_GaussianBlur)}, 8 * kSecond, 12 * kSecond);
  list->ClearSelection();
  list->GetVideoItems().ForEachRow([&](const EffectItemList::Row& row) {
    if (auto* filter = dynamic_cast<FilterItem*>(row.get()); filter && filter->IsMask()) {
      list->SelectItem(row, true);
    }
    return true;
  });
  ASSERT_EQ(list->GetSelectedItems().Size(), 2u);
  ASSERT_TRUE(list->OnCopy());

  Select({other});
  list->SelectItem(list->GetVideoItems().At(0), true);
  EXPECT_TRUE(list->ObeyCommand(kCommandPaste));
  const ComponentRef target = other->GetComponentChain()->GetComponents().front();
  EXPECT_EQ(target->GetMasks().size(), 2u);
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);
  EXPECT_EQ(Undo().GetUndoName(), ComponentActions::kAddMask);
  EXPECT_EQ(Undo().GetUndoText(), "Paste Effect Masks");
  // The mask the paste added is selected once the list shows it.
  ASSERT_EQ(list->GetSelectedItems().Size(), 1u);
  EXPECT_EQ(list->GetSelectedItems().At(0).component, target->GetMasks().back());
}

TEST_F(ListCommandsTest, EnableWithAMixedSelectionMakesAllTheOppositeOfTheFirst) {
  ShowClip();
  ComponentActions::SetBypass(blur, true);
  Undo().Clear();
  SelectOnly({"Gaussian Blur", "Opacity", "Motion"});
  EXPECT_FALSE(StatusOf(List::kEffectsEnabledCommand).checked);
  list->ObeyCommand(List::kEffectsEnabledCommand);
  for (const auto& component : clip->GetComponentChain()->GetComponents()) {
    EXPECT_TRUE(component->IsEnabled()) << component->GetDisplayName();
  }
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);
  EXPECT_TRUE(StatusOf(List::kEffectsEnabledCommand).checked);

  list->ObeyCommand(List::kEffectsEnabledCommand);
  for (const auto& component : clip->GetComponentChain()->GetComponents()) {
    EXPECT_FALSE(component->IsEnabled()) << component->GetDisplayName();
  }
  EXPECT_EQ(Undo().GetUndoNames().size(), 2u);
}

TEST_F(ListCommandsTest, ResettingTwoEffectsIsOneUndoStep) {
  ShowClip();
  ProjectBuilder::AddKeyframes(blur->GetParams().front(), {{.time = 0, .value = 7.0}});
  const ComponentRef opacity = clip->GetComponentChain()->GetComponents().at(1);
  opacity->GetParams().front()->SetValueAt(0, 20.0);
  const std::string before = Describe();
  SelectOnly({"Opacity", "Gaussian Blur"});
  list->ObeyCommand(List::kResetEffectCommand);
  EXPECT_FALSE(blur->GetParams().front()->IsTimeVarying());
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(Describe(), before);
}

TEST_F(ListCommandsTest, SelectAllSelectsEveryEffectAndDeselectAllNone) {
  ShowClip();
  EXPECT_FALSE(StatusOf(kCommandDeselectAll).enabled);
  EXPECT_TRUE(list->ObeyCommand(kCommandSelectAll));
  EXPECT_EQ(Selected(), (Strings{"Opacity", "Motion", "Gaussian Blur"}));
  EXPECT_TRUE(StatusOf(kCommandDeselectAll).enabled);
  EXPECT_TRUE(list->ObeyCommand(kCommandDeselectAll));
  EXPECT_TRUE(Selected().empty());
}

TEST_F(ListCommandsTest, RemoveEffectsTakesTheAppliedEffectsOfTheShownClipInOneStep) {
  ShowClip();
  EXPECT_TRUE(StatusOf(List::kDeleteAllEffectsCommand).enabled);
  list->ObeyCommand(List::kDeleteAllEffectsCommand);
  EXPECT_EQ(Names(clip), (Strings{"Motion", "Opacity"}));
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);
}

TEST_F(ListCommandsTest, AReadOnlyContainerSwallowsEveryCommand) {
  ShowClip();
  SelectOnly({"Gaussian Blur"});
  ASSERT_TRUE(list->OnCopy());
  sequence->SetReadOnly(true);
  SelectOnly({"Gaussian Blur"});
  const std::string before = Describe();
  for (CommandID command : {kCommandClear, kCommandCut, kCommandPaste}) {
    EXPECT_FALSE(StatusOf(command).enabled) << command;
    EXPECT_TRUE(list->ObeyCommand(command)) << command;
  }
  for (CommandID command :
       {List::kDeleteAllEffectsCommand, List::kEffectsEnabledCommand, List::kResetEffectCommand}) {
    EXPECT_FALSE(StatusOf(command).enabled) << command;
    list->ObeyCommand(command);
  }
  EXPECT_EQ(Describe(), before);
  EXPECT_FALSE(Undo().CanUndo());
}

// Regression: the request to select a pasted effect was kept as "the Nth effect", so the
// rebuild of another clip selected that clip's Nth effect. It is kept as the effect itself now.
TEST_F(ListCommandsTest, APendingSelectionDoesNotReachARebuildOfAnotherClip) {
  ShowClip();
  const TrackItemRef other =
      AddClip(v1, {Make(kMatchName_Motion), Make(kMatchName_Opacity), Make(kMatchName_Crop)},
              8 * kSecond, 12 * kSecond);
  BroadcastMessage(list->GetOwnStation(), EmbeddedEffectAdded(blur));
  EXPECT_EQ(Selected(), Strings{"Gaussian Blur"});
  // An effect that has no row yet waits for the next build, and only that one.
  BroadcastMessage(list->GetOwnStation(), EmbeddedEffectAdded(Make(kMatchName_Crop)));
  Select({other});
  EXPECT_TRUE(Selected().empty());
  Select({clip});
  EXPECT_TRUE(Selected().empty());
}

TEST_F(ListCommandsTest, DeletingEffectsOfATransitionsOwnChainRemovesTheTransitionInOneStep) {
  clip = AddClip(v1, {Make(kMatchName_Opacity)}, 0, 6 * kSecond);
  TransitionData data;
  data.matchName = "XO.KRVN CrossDissolve";
  data.displayName = "Cross Dissolve";
  const TrackItemRef transition =
      TrackItem::CreateTransition(MediaType::Video, 5 * kSecond, 6 * kSecond, data);
  transition->GetComponentChain()->Append(Make(kMatchName_Opacity));
  transition->GetComponentChain()->Append(Make(kMatchName_GaussianBlur));
  v1->AddItem(transition);
  Open();
  Select({transition});
  ASSERT_EQ(list->GetTargetKind(), List::kTargetTransitionComponent);
  ASSERT_EQ(list->GetVideoItems().Size(), 2u);
  list->SelectItem(list->GetVideoItems().At(1), true);

  EXPECT_FALSE(StatusOf(kCommandCut).enabled);
  EXPECT_TRUE(StatusOf(kCommandClear).enabled);
  const std::string before = DescribeForTest(*transition);
  EXPECT_TRUE(list->ObeyCommand(kCommandClear));
  EXPECT_EQ(v1->GetItems(), std::vector<TrackItemRef>{clip});
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);
  // Undo puts the transition back with its effects (the clip selection is not history).
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(v1->GetItems(), (std::vector<TrackItemRef>{clip, transition}));
  EXPECT_EQ(DescribeForTest(*transition), before);
}

TEST_F(ListCommandsTest, SavingAPresetNeedsASelectionWithoutMasks) {
  ShowClip();
  EXPECT_FALSE(list->GetAllowSavePreset());
  SelectOnly({"Gaussian Blur"});
  EXPECT_TRUE(list->GetAllowSavePreset());
  list->GetVideoItems().ForEachRow([&](const EffectItemList::Row& row) {
    if (auto* filter = dynamic_cast<FilterItem*>(row.get()); filter && filter->IsMask()) {
      list->SelectItem(row, true);
    }
    return true;
  });
  EXPECT_FALSE(list->GetAllowSavePreset());
}

}  // namespace
