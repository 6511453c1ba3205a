#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Handlers/EffectControls/Src/UpdateActiveProgramMonitorViewMessage.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentActions.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Toolkit/CheckBoxControl.h"
#include "Host/Toolkit/KeyModifiers.h"
#include "Host/Toolkit/MenuTracker.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Host/Toolkit/PictureButton.h"
#include "Host/Toolkit/PicturePopup.h"
#include "Host/Toolkit/ScriptedMenuTracker.h"
#include "Host/Toolkit/SubView.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

constexpr TickTime kSecond = kTicksPerSecond;

// One video clip with one applied effect (a "Radius" parameter), an effect row for it in a
// window whose root view stands in for the list view, and a recorder of what the row says on
// the list's station and the sequence's station.
class FilterItemTest : public ::testing::Test {
 protected:
  FilterItemTest() {
    radius->SetRange(0, 100);
    effect->AddParam(radius);
    builder.AddComponent(clip->GetComponentChain(), effect);
    host.SetRootView(listView);
    AddListener(kStation, listRecorder);
    AddListener(sequence->GetStation(), sequenceRecorder);
    SetMenuTrackerForTesting(menus);
  }
  ~FilterItemTest() override {
    SetMenuTrackerForTesting(nullptr);
    SetAsyncKeyModifiers(kKeyModifierNone);
    if (row) {
      row->Destroy();
    }
  }

  void SetPresets(std::vector<std::string> names) {
    std::vector<ComponentPreset> presets;
    for (auto& name : names) {
      presets.push_back({std::move(name), {}});
    }
    effect->SetPresets(std::move(presets));
  }

  std::shared_ptr<FilterItem> MakeRow(FilterItemOptions options = {}, int top = 10) {
    auto made = std::make_shared<FilterItem>(MediaType::Video, effect, clip, sequence, nullptr,
                                             options, kStation, listView.get());
    made->FinishCreateSelf();
    made->Show();
    made->PositionSelf(top, 0, kWidth);
    return made;
  }

  std::vector<std::string> UndoNames() { return project->GetUndoStack().GetUndoNames(); }

  int Count(const std::vector<std::string>& heard, std::string_view type) const {
    return static_cast<int>(std::count(heard.begin(), heard.end(), std::string(type)));
  }

  static inline const StationName kStation = "Test.EffectList";
  static constexpr int kWidth = 400;

  MessagingTestScope messaging;
  ProjectBuilder builder{"Filter rows"};
  ProjectRef project = builder.GetProject();
  SequenceRef sequence = builder.AddSequence("Sequence");
  TrackRef track = builder.AddTrack(sequence, MediaType::Video, "V1");
  TrackItemRef clip =
      builder.AddClip(track, nullptr, {.start = 0, .end = 10 * kSecond, .withIntrinsics = false});
  ComponentRef effect = Component::Create("XO.Test Blur", "Blur", MediaType::Video, false);
  ComponentParamRef radius = ComponentParam::Create("Radius", ParamType::FloatSlider, 10.0);
  ViewHost host{{kWidth, 300}};
  std::shared_ptr<SubView> listView = std::make_shared<SubView>();
  std::shared_ptr<ScriptedMenuTracker> menus = std::make_shared<ScriptedMenuTracker>();
  std::shared_ptr<FilterItem> row;

  std::vector<std::string> listHeard;
  std::vector<bool> onOffAll;
  FunctionListener listRecorder{[this](const Message& message) {
    listHeard.emplace_back(message.GetTypeName());
    if (const auto* all = message.As<FilterOnOffAllChanged>()) {
      onOffAll.push_back(all->enabled);
    }
  }};
  std::vector<std::string> sequenceHeard;
  FunctionListener sequenceRecorder{
      [this](const Message& message) { sequenceHeard.emplace_back(message.GetTypeName()); }};
};

// --- Presets ---

TEST_F(FilterItemTest, AnEffectWithoutPresetsHasNeitherResetButtonNorPopup) {
  row = MakeRow();
  EXPECT_EQ(row->GetResetButton(), nullptr);
  EXPECT_EQ(row->GetPresetPopup(), nullptr);
  ASSERT_NE(row->GetSwitchButton(), nullptr);
}

TEST_F(FilterItemTest, OnePresetGivesAResetButtonWithItsToolTip) {
  SetPresets({"Default"});
  row = MakeRow();
  ASSERT_NE(row->GetResetButton(), nullptr);
  EXPECT_EQ(row->GetPresetPopup(), nullptr);
  EXPECT_EQ(row->GetResetButton()->GetToolTip(),
            "$$$/Vantile/Handlers/EffectControls/ResetEffect=Reset Effect");
  EXPECT_TRUE(row->GetResetButton()->IsEnabled());
}

TEST_F(FilterItemTest, ThreePresetsGiveAPopupOfThreeItemsWithTheCurrentOneChecked) {
  SetPresets({"Default", "Soft", "Strong"});
  effect->SetCurrentPreset(1);
  row = MakeRow();
  EXPECT_EQ(row->GetResetButton(), nullptr);
  ASSERT_NE(row->GetPresetPopup(), nullptr);
  EXPECT_EQ(row->GetPresetPopup()->GetItemCount(), 3);
  EXPECT_EQ(row->GetPresetPopup()->GetSelectedIndex(), 1);

  menus->PushAnswer(std::nullopt);  // look, then dismiss
  row->GetPresetPopup()->OpenMenu();
  ASSERT_EQ(menus->GetRequests().size(), 1u);
  const auto& entries = menus->GetRequests()[0].entries;
  ASSERT_EQ(entries.size(), 3u);
  EXPECT_EQ(entries[0].text, "Default");
  EXPECT_EQ(entries[2].text, "Strong");
  for (int i = 0; i < 3; ++i) {
    EXPECT_EQ(entries[i].command, 18600 + i);
    EXPECT_TRUE(entries[i].enabled);
    EXPECT_EQ(entries[i].checked, i == 1) << i;
  }
  EXPECT_TRUE(UndoNames().empty());
}

TEST_F(FilterItemTest, ChoosingAPresetTakesItsValuesAsOneUndoStep) {
  effect->SetPresets({{"Default", {}}, {"Soft", {{0, ParamValue(40.0)}}}, {"Strong", {}}});
  row = MakeRow();
  menus->PushAnswer(18601);
  row->GetPresetPopup()->OpenMenu();
  EXPECT_EQ(effect->GetCurrentPreset(), 1);
  EXPECT_EQ(row->GetPresetPopup()->GetSelectedIndex(), 1);
  EXPECT_EQ(radius->GetValueAt(0), ParamValue(40.0));
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{ComponentActions::kApplyPreset}));
  EXPECT_EQ(Count(sequenceHeard, UpdateActiveProgramMonitorViewMessage::kTypeName), 1);

  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(effect->GetCurrentPreset(), -1);
  EXPECT_EQ(row->GetPresetPopup()->GetSelectedIndex(), -1);
  EXPECT_EQ(radius->GetValueAt(0), ParamValue(10.0));
  ASSERT_TRUE(project->GetUndoStack().Redo());
  EXPECT_EQ(row->GetPresetPopup()->GetSelectedIndex(), 1);
}

TEST_F(FilterItemTest, APresetCommandBeyondThePresetsChangesNothing) {
  SetPresets({"Default", "Soft"});
  row = MakeRow();
  EXPECT_TRUE(row->ObeyCommand(18605));
  EXPECT_EQ(effect->GetCurrentPreset(), -1);
  EXPECT_TRUE(UndoNames().empty());
}

// --- On/off ---

TEST_F(FilterItemTest, ToggleWithoutModifierBypassesTheEffectAsOneUndoStep) {
  row = MakeRow();
  ASSERT_EQ(row->GetSwitchButton()->GetValue(), 1);  // on
  EXPECT_TRUE(row->ObeyCommand(FilterItem::kToggleCommand));
  EXPECT_TRUE(effect->IsBypassed());
  EXPECT_FALSE(row->IsEnabled());
  EXPECT_EQ(row->GetSwitchButton()->GetValue(), 0);
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{ComponentActions::kSetBypass}));
  EXPECT_EQ(Count(sequenceHeard, UpdateActiveProgramMonitorViewMessage::kTypeName), 1);
  EXPECT_TRUE(onOffAll.empty());

  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_FALSE(effect->IsBypassed());
  EXPECT_TRUE(row->IsEnabled());  // follows the model's message
  EXPECT_EQ(row->GetSwitchButton()->GetValue(), 1);
}

TEST_F(FilterItemTest, ClickingTheSwitchInTheWindowTogglesTheEffect) {
  row = MakeRow();
  const Point center = row->GetSwitchButton()->GetBounds().Center();
  host.MouseDown(MouseButton::kLeft, center, kKeyModifierNone);
  host.MouseUp(MouseButton::kLeft, center, kKeyModifierNone);
  EXPECT_TRUE(effect->IsBypassed());
  EXPECT_EQ(row->GetSwitchButton()->GetValue(), 0);
  EXPECT_EQ(UndoNames().size(), 1u);
}

TEST_F(FilterItemTest, ToggleWithAltAsksForAllEffectsAndLeavesThisOneAlone) {
  row = MakeRow();
  SetAsyncKeyModifiers(kKeyModifierAlt);
  EXPECT_TRUE(row->ObeyCommand(FilterItem::kToggleCommand));
  EXPECT_EQ(onOffAll, (std::vector<bool>{false}));  // the negation of "enabled"
  EXPECT_FALSE(effect->IsBypassed());
  EXPECT_TRUE(row->IsEnabled());
  EXPECT_EQ(row->GetSwitchButton()->GetValue(), 1);
  EXPECT_TRUE(UndoNames().empty());
}

TEST_F(FilterItemTest, AltClickOnTheSwitchOfADisabledEffectAsksToEnableAll) {
  effect->SetBypass(true);
  row = MakeRow();
  const Point center = row->GetSwitchButton()->GetBounds().Center();
  host.MouseDown(MouseButton::kLeft, center, kKeyModifierAlt);
  host.MouseUp(MouseButton::kLeft, center, kKeyModifierAlt);
  EXPECT_EQ(onOffAll, (std::vector<bool>{true}));
  EXPECT_TRUE(effect->IsBypassed());
  EXPECT_EQ(row->GetSwitchButton()->GetValue(), 0);  // the click's advance does not stick
}

TEST_F(FilterItemTest, TheCheckBoxSwitchTogglesAndFollowsUndo) {
  FilterItemOptions options;
  options.checkboxSwitch = true;
  row = MakeRow(options);
  ASSERT_EQ(row->GetSwitchButton(), nullptr);
  CheckBoxControl* box = row->GetSwitchCheckBox();
  ASSERT_NE(box, nullptr);
  EXPECT_TRUE(box->IsChecked());
  box->Click();
  EXPECT_TRUE(effect->IsBypassed());
  EXPECT_FALSE(box->IsChecked());
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_TRUE(box->IsChecked());
}

TEST_F(FilterItemTest, AnArchivedEffectOfTypeOneCountsAsEnabled) {
  effect->SetBypass(true);
  effect->SetArchived(true, 1);
  row = MakeRow();
  EXPECT_TRUE(row->IsEnabled());
  EXPECT_EQ(row->GetSwitchButton()->GetValue(), 1);
}

TEST_F(FilterItemTest, OnlyTopLevelRowsGetASwitch) {
  FilterItemOptions options;
  options.topLevel = false;
  row = MakeRow(options);
  EXPECT_EQ(row->GetSwitchButton(), nullptr);
  EXPECT_EQ(row->GetSwitchCheckBox(), nullptr);
}

// --- Read only ---

TEST_F(FilterItemTest, ARowOfAReadOnlyProjectAcceptsCommandsAndChangesNothing) {
  SetPresets({"Default", "Soft"});
  project->SetReadOnly(true);
  row = MakeRow();
  ASSERT_TRUE(row->IsReadOnly());
  EXPECT_FALSE(row->GetPresetPopup()->IsEnabled());
  EXPECT_TRUE(row->ObeyCommand(FilterItem::kToggleCommand));
  EXPECT_TRUE(row->ObeyCommand(FilterItem::kResetCommand));
  EXPECT_TRUE(row->ObeyCommand(18601));
  SetAsyncKeyModifiers(kKeyModifierAlt);
  EXPECT_TRUE(row->ObeyCommand(FilterItem::kToggleCommand));
  EXPECT_FALSE(effect->IsBypassed());
  EXPECT_EQ(effect->GetCurrentPreset(), -1);
  EXPECT_TRUE(onOffAll.empty());
  EXPECT_TRUE(UndoNames().empty());
  EXPECT_TRUE(sequenceHeard.empty());

  CommandStatus status;
  ASSERT_TRUE(row->FindCommandStatus(18600, status));
  EXPECT_FALSE(status.enabled);
}

TEST_F(FilterItemTest, AReadOnlyCheckBoxClickSpringsBack) {
  FilterItemOptions options;
  options.checkboxSwitch = true;
  row = MakeRow(options);
  row->SetReadOnly(true);
  CheckBoxControl* box = row->GetSwitchCheckBox();
  EXPECT_FALSE(box->IsEnabled());
  // Even a box that was enabled by mistake shows the model again after the click.
  box->SetEnabled(true);
  box->Click();
  EXPECT_TRUE(box->IsChecked());
  EXPECT_FALSE(effect->IsBypassed());
}

TEST_F(FilterItemTest, AResetButtonOfAReadOnlyOrOfflineEffectIsDisabled) {
  SetPresets({"Default"});
  effect->SetOffline(true);
  row = MakeRow();
  ASSERT_NE(row->GetResetButton(), nullptr);
  EXPECT_FALSE(row->GetResetButton()->IsEnabled());
}

// --- Reset ---

TEST_F(FilterItemTest, ResetRestoresValuesAndNameAsOneUndoStep) {
  SetPresets({"Default"});
  ComponentParamActions::SetValue(radius, 0, 70.0);
  ComponentActions::SetInstanceName(effect, "Wide Blur");
  row = MakeRow();
  ASSERT_EQ(row->GetName(), "Wide Blur");
  const std::size_t stepsBefore = UndoNames().size();

  row->GetResetButton()->Click();
  EXPECT_EQ(radius->GetValueAt(0), ParamValue(10.0));
  EXPECT_EQ(effect->GetInstanceName(), "");
  EXPECT_EQ(row->GetName(), "Blur");
  EXPECT_EQ(UndoNames().size(), stepsBefore + 1);
  EXPECT_EQ(Count(listHeard, EffectControlsBecomeTargetMessage::kTypeName), 1);
  EXPECT_EQ(Count(sequenceHeard, UpdateActiveProgramMonitorViewMessage::kTypeName), 1);

  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(radius->GetValueAt(0), ParamValue(70.0));
  EXPECT_EQ(effect->GetInstanceName(), "Wide Blur");
  EXPECT_EQ(row->GetName(), "Wide Blur");
}

TEST_F(FilterItemTest, ResettingAnUntouchedEffectMakesNoStep) {
  row = MakeRow();
  EXPECT_TRUE(row->ObeyCommand(FilterItem::kResetCommand));
  EXPECT_TRUE(UndoNames().empty());
  EXPECT_EQ(Count(listHeard, EffectControlsBecomeTargetMessage::kTypeName), 0);
}

// --- Setup ---

TEST_F(FilterItemTest, TheSetupButtonReportsThatTheHostCannotRunSetupDialogs) {
  effect->SetHasSetupDialog(true);
  row = MakeRow();
  ASSERT_NE(row->GetSetupButton(), nullptr);
  EXPECT_THROW(row->ObeyCommand(FilterItem::kSetupCommand), NullInterfaceException);
  ClearRecordedDebugAssertions();
  EXPECT_TRUE(row->GetSetupButton()->Click());  // the command dispatch records it
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
  EXPECT_NE(RecordedDebugAssertions()[0].message.find("IComponentSetup"), std::string::npos);
  EXPECT_TRUE(UndoNames().empty());
}

TEST_F(FilterItemTest, OptionSixLeavesVideoEffectsWithoutSetupButton) {
  effect->SetHasSetupDialog(true);
  FilterItemOptions options;
  options.noVideoSetupButton = true;
  row = MakeRow(options);
  EXPECT_EQ(row->GetSetupButton(), nullptr);
  EXPECT_FALSE(row->HasSetup());
}

// --- Title ---

TEST_F(FilterItemTest, RenamingGivesTheNameTwoSpacesAndTheChannelMap) {
  row = MakeRow();
  row->SetChannelMapText("L, R");
  EXPECT_EQ(row->GetName(), "Blur  L, R");
  listHeard.clear();
  ASSERT_EQ(ComponentActions::SetInstanceName(effect, "Hall"), EditStatus::Done);
  EXPECT_EQ(row->GetName(), "Hall  L, R");
  EXPECT_EQ(Count(listHeard, FilterItemNameChanged::kTypeName), 1);
}

TEST_F(FilterItemTest, RenamingAnotherEffectLeavesTheTitleAlone) {
  ComponentRef other = Component::Create("XO.Test Tint", "Tint", MediaType::Video, false);
  clip->GetComponentChain()->Append(other);
  row = MakeRow();
  ASSERT_EQ(ComponentActions::SetInstanceName(other, "Warm"), EditStatus::Done);
  EXPECT_EQ(row->GetName(), "Blur");
  EXPECT_EQ(Count(listHeard, FilterItemNameChanged::kTypeName), 0);
}

// --- Placement ---

TEST_F(FilterItemTest, TheCheckBoxSitsNearTheRightEdgeBelowTheTitle) {
  SetPresets({"Default"});
  FilterItemOptions options;
  options.checkboxSwitch = true;
  row = MakeRow(options, 50);
  EXPECT_EQ(row->GetSwitchCheckBox()->GetBounds().TopLeft(), (Point{kWidth - 30, 74}));
  EXPECT_EQ(row->GetResetButton()->GetBounds().TopLeft(), (Point{kWidth - 60, 72}));
}

TEST_F(FilterItemTest, TheButtonSwitchSitsAtTheIndentAndTheRightButtonsAtTheTop) {
  SetPresets({"Default"});
  effect->SetHasSetupDialog(true);
  row = MakeRow({}, 50);
  EXPECT_EQ(row->GetSwitchButton()->GetBounds().TopLeft(), (Point{3, 52}));
  EXPECT_EQ(row->GetResetButton()->GetBounds().TopLeft(), (Point{kWidth - 26, 50}));
  ASSERT_NE(row->GetSetupButton(), nullptr);
  EXPECT_EQ(row->GetSetupButton()->GetBounds().TopLeft(), (Point{kWidth - 52, 50}));

  row->SetGroupLevel(2);
  row->PositionSelf(80, 0, kWidth);
  EXPECT_EQ(row->GetSwitchButton()->GetBounds().TopLeft(), (Point{2 * 17 + 3, 82}));
}

TEST_F(FilterItemTest, APresetPopupSitsTwentyEightPixelsFromTheRightEdge) {
  SetPresets({"Default", "Soft"});
  row = MakeRow({}, 30);
  EXPECT_EQ(row->GetPresetPopup()->GetBounds().TopLeft(), (Point{kWidth - 28, 30}));
}

TEST_F(FilterItemTest, AWiderListMovesTheRightHandButtonsAtTheSameTop) {
  SetPresets({"Default"});
  row = MakeRow({}, 30);
  row->PositionSelf(30, 0, kWidth + 100);
  EXPECT_EQ(row->GetResetButton()->GetBounds().TopLeft(), (Point{kWidth + 100 - 26, 30}));
}

// --- Visibility, expansion, teardown ---

TEST_F(FilterItemTest, NoIndentRowsHideTheirButtons) {
  SetPresets({"Default", "Soft"});
  FilterItemOptions options;
  options.noIndent = true;
  row = MakeRow(options);
  ASSERT_NE(row->GetSwitchButton(), nullptr);
  EXPECT_FALSE(row->GetSwitchButton()->IsVisible());
  EXPECT_FALSE(row->GetPresetPopup()->IsVisible());
  EXPECT_EQ(row->GetGroupLevelIndentInPixels(), 0);
}

TEST_F(FilterItemTest, HideAndShowFollowTheButtons) {
  SetPresets({"Default"});
  row = MakeRow();
  EXPECT_TRUE(row->GetResetButton()->IsVisible());
  row->Hide();
  EXPECT_FALSE(row->GetResetButton()->IsVisible());
  EXPECT_FALSE(row->GetSwitchButton()->IsVisible());
  row->Show();
  EXPECT_TRUE(row->GetSwitchButton()->IsVisible());
}

TEST_F(FilterItemTest, TheExpansionIsRememberedByTheEffect) {
  row = MakeRow();
  EXPECT_TRUE(row->IsExpanded());  // a new effect opens
  row->SetIsExpanded(false);
  EXPECT_FALSE(effect->GetExpansionProperties().GetBool(FilterItem::kExpandedPropertyKey, true));
  row->Destroy();
  row = MakeRow();
  EXPECT_FALSE(row->IsExpanded());
}

TEST_F(FilterItemTest, StartCollapsedAppliesOnlyUntilTheEffectRemembersAState) {
  FilterItemOptions options;
  options.startCollapsed = true;
  row = MakeRow(options);
  EXPECT_FALSE(row->IsExpanded());
  row->SetIsExpanded(true);
  row->Destroy();
  row = MakeRow(options);
  EXPECT_TRUE(row->IsExpanded());
}

TEST_F(FilterItemTest, DestroyTakesTheControlsOutOfTheListView) {
  SetPresets({"Default", "Soft"});
  effect->SetHasSetupDialog(true);
  const std::size_t before = listView->GetChildren().size();
  row = MakeRow();
  EXPECT_EQ(listView->GetChildren().size(), before + 4);  // triangle, switch, setup, popup
  row->Destroy();
  EXPECT_EQ(listView->GetChildren().size(), before);
  // A destroyed row no longer follows its effect.
  ComponentActions::SetInstanceName(effect, "Later");
  EXPECT_EQ(Count(listHeard, FilterItemNameChanged::kTypeName), 0);
}

}  // namespace
