#include <algorithm>
#include <string>

#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/ParameterRowFactory.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Tests/Handlers/EffectControls/EffectControlsListViewTestSupport.h"
#include "Tests/Host/Model/WideText.h"

namespace {

using Strings = std::vector<std::string>;

ComponentRef CountedGroupEffect(std::string_view spans, std::vector<std::string> following) {
  ComponentRef effect = Component::Create("XO.KRVN Test", "Test", MediaType::Video, false);
  effect->AddParam(ComponentParam::Create("Counted", ParamType::GroupBegin, WideText(spans))
                       ->SetGroupKind(GroupKind::Counted));
  for (const std::string& name : following) {
    effect->AddParam(ComponentParam::Create(name, ParamType::FloatSlider, 1.0));
  }
  return effect;
}

bool ClassIs(const EffectItem& row, std::string_view name) {
  return ParameterRowFactory::GetRowClassName(row).starts_with(name);
}

// A row and every row under it on one line, "Name@level{Child, ...}", masks marked.
std::string Outline(const EffectItem& row) {
  const auto* filter = dynamic_cast<const FilterItem*>(&row);
  std::string text = (filter != nullptr && filter->IsMask() ? "mask " : "") + row.GetName();
  if (row.GetGroupLevel() > 0) {
    text += "@" + std::to_string(row.GetGroupLevel());
  }
  std::string children;
  for (const auto& child : row.GetItems()) {
    children += (children.empty() ? "" : ", ") + Outline(*child);
  }
  return children.empty() ? text : text + "{" + children + "}";
}

std::string Outline(const EffectItemList& rows) {
  std::string text;
  for (const auto& row : rows) {
    text += (text.empty() ? "" : ", ") + Outline(*row);
  }
  return text;
}

TEST_F(ListViewTest, ClipOpensTheVideoSectionWithFinishedShownRows) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Motion), Make(kMatchName_GaussianBlur),
                                         Make(kMatchName_Opacity), Make(kMatchName_Crop)});
  Open();
  Select({clip});

  EXPECT_EQ(list->GetTargetKind(), EffectControlsListView::kTargetClip);
  EXPECT_EQ(list->GetVideoItems().Size(), 4u);
  EXPECT_TRUE(list->GetGraphicsItems().IsEmpty());
  EXPECT_TRUE(list->IsVideoExpanded());
  EXPECT_EQ(list->GetVideoTrackItem(), clip);
  ASSERT_NE(list->GetKeyframeSelection(), nullptr);
  EXPECT_EQ(list->GetKeyframeSelection()->GetSequence(), sequence);
  ASSERT_NE(list->GetVideoExpander(), nullptr);
  EXPECT_TRUE(list->GetVideoExpander()->IsVisible());
  EXPECT_EQ(list->GetVideoExpander()->GetValue(), 0);
  for (const auto& row : list->GetVideoItems()) {
    EXPECT_TRUE(row->IsCreated());
    EXPECT_TRUE(row->IsShown());
  }
}

TEST_F(ListViewTest, GroupsAndCountedGroupsHoldTheirParametersAtEveryDepth) {
  const TrackItemRef clip = AddClip(
      v1, {Make(kMatchName_Timecode),
           CountedGroupEffect("Smoothness;Settings;", {"Smoothness", "Settings", "After"})});
  Select({clip});
  EXPECT_EQ(Outline(list->GetVideoItems()),
            "Test{Counted{Smoothness@1, Settings@1}, After}, "
            "Timecode{Position and Size{Position@1, Size@1}, Time Display, Field Symbol, "
            "Starting Timecode, Offset}");
  const EffectItem& group = *list->GetVideoItems().At(0)->GetItems().front();
  EXPECT_TRUE(group.IsGroupBegin());
}

TEST_F(ListViewTest, TimeRemappingStyleBitDropsOnlyThatIntrinsic) {
  const TrackItemRef clip = AddClip(v1, Catalogue().CreateIntrinsics(MediaType::Video));
  Open();
  Select({clip});
  EXPECT_EQ(Titles(list->GetVideoItems()), (Strings{"Time Remapping", "Opacity", "Motion"}));

  list->SetStyle(kStyleHideTimeRemapping);
  list->ClearAndRebuildList();
  EXPECT_EQ(Titles(list->GetVideoItems()), (Strings{"Opacity", "Motion"}));
}

TEST_F(ListViewTest, GraphicsClipOpensTheGraphicsSectionAboveTheVideoSection) {
  ComponentRef text = Component::Create("XO.KRVN TextLayer", "Text", MediaType::Video, false);
  text->SetRole(ComponentRole::Graphics);
  ComponentRef shape = Component::Create("XO.KRVN ShapeLayer", "Shape", MediaType::Video, false);
  shape->SetRole(ComponentRole::Graphics);
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Motion), text, Make(kMatchName_Opacity),
                                         shape, Make(kMatchName_GaussianBlur)});
  Open();
  Select({clip});

  EXPECT_EQ(list->GetVideoItems().Size(), 2u);
  EXPECT_EQ(list->GetGraphicsItems().Size(), 3u);
  EXPECT_TRUE(list->IsGraphicsExpanded());
  ASSERT_NE(list->GetGraphicsExpander(), nullptr);
  EXPECT_TRUE(list->GetGraphicsExpander()->IsVisible());
  // The graphics section comes first, the video section under it.
  EXPECT_LT(list->GetGraphicsHeaderTop(), list->GetVideoHeaderTop());
  EXPECT_EQ(list->GetGraphicsHeaderTop(), EffectControlsListView::kInitialBaseline);
}

TEST_F(ListViewTest, MasterClipModeShowsTheMasterClipsChainAndNoAudio) {
  masterClip->GetVideoChain()->Append(Make(kMatchName_Tint));
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity), Make(kMatchName_GaussianBlur)});
  const TrackItemRef sound = AddClip(a1, {Make(kMatchName_Volume)});
  clip->SetLinkGroup(1);
  sound->SetLinkGroup(1);
  list->SetMasterClip(masterClip);
  Open();
  Select({clip});

  ASSERT_TRUE(list->GetShowAudio());
  EXPECT_EQ(Titles(list->GetVideoItems()), (Strings{"Tint"}));
  EXPECT_EQ(list->GetVideoChain(), masterClip->GetVideoChain());
  EXPECT_TRUE(list->GetAudioParts().empty());

  // The same clip outside master-clip mode has its own effects and a mask-shape row.
  list->ClearMasterClip();
  list->ClearAndRebuildList();
  EXPECT_EQ(Titles(list->GetVideoItems()), (Strings{"Opacity", "Gaussian Blur"}));
  const EffectItem& blurRow = *list->GetVideoItems().At(1);
  ASSERT_FALSE(blurRow.GetItems().empty());
  EXPECT_TRUE(ClassIs(*blurRow.GetItems().front(), "MaskShapeControl"));
  EXPECT_EQ(list->GetAudioParts().size(), 1u);
}

TEST_F(ListViewTest, EveryAudioPartGetsAnExpanderAndOnlySeveralPartsGetPlayButtons) {
  const TrackItemRef keyTwo = AddClip(a1, {Make(kMatchName_Volume)});
  const TrackItemRef keyZero = AddClip(a2, {Make(kMatchName_Panner)});
  const TrackItemRef keyOne = AddClip(a3, {Make(kMatchName_Delay)});
  keyTwo->SetPartOrderKey(2);
  keyZero->SetPartOrderKey(0);
  keyOne->SetPartOrderKey(1);
  for (const TrackItemRef& item : {keyTwo, keyZero, keyOne}) {
    item->SetLinkGroup(4);
  }
  Open();
  Select({keyTwo});

  ASSERT_EQ(list->GetNumberOfAudioParts(), 3);
  // The buttons are numbered in display order.
  EXPECT_EQ(list->GetAudioParts()[0]->GetTrackItem(), keyZero);
  EXPECT_EQ(Titles(list->GetAudioParts()[0]->GetItems()), (Strings{"Panner"}));
  for (int index = 0; index < 3; ++index) {
    const AudioPartInfo& part = *list->GetAudioParts()[static_cast<std::size_t>(index)];
    EXPECT_TRUE(part.IsExpanded());
    ASSERT_NE(part.GetExpanderButton(), nullptr);
    EXPECT_EQ(part.GetExpanderButton()->GetCommand(),
              EffectControlsListView::kAudioExpanderCommand + index);
    ASSERT_NE(part.GetPlayButton(), nullptr);
    EXPECT_EQ(part.GetPlayButton()->GetCommand(),
              EffectControlsListView::kPlayAudioPartCommand + index);
    EXPECT_TRUE(part.GetPlayButton()->IsEnabled());
  }
  EXPECT_TRUE(list->GetVideoItems().IsEmpty());

  Select({keyZero});  // same clip: nothing to rebuild
  sequence->SetSelection({});
  const TrackItemRef single = AddClip(a1, {Make(kMatchName_Volume)}, 20 * kSecond, 25 * kSecond);
  Select({single});
  ASSERT_EQ(list->GetNumberOfAudioParts(), 1);
  EXPECT_EQ(list->GetAudioParts()[0]->GetPlayButton(), nullptr);
  EXPECT_NE(list->GetAudioParts()[0]->GetExpanderButton(), nullptr);
}

TEST_F(ListViewTest, SlowedAudioPartCannotPlayOnItsOwn) {
  const TrackItemRef first = AddClip(a1, {Make(kMatchName_Volume)});
  const TrackItemRef second = AddClip(a2, {Make(kMatchName_Volume)});
  first->SetLinkGroup(3);
  second->SetLinkGroup(3);
  second->SetPartOrderKey(1);
  second->SetSpeed(0.5);
  Open();
  Select({first});
  EXPECT_TRUE(list->CanPlayAudioPart(0));
  EXPECT_FALSE(list->CanPlayAudioPart(1));
  EXPECT_FALSE(list->CanPlayAudioPart(2));
  EXPECT_FALSE(list->CanPlayAudioPart(-1));
  EXPECT_FALSE(list->GetAudioParts()[1]->GetPlayButton()->IsEnabled());
}

TEST_F(ListViewTest, AudioEffectWithItsOwnWindowGetsTheTwoCustomRowsFirst) {
  ComponentRef plugin = Make(kMatchName_Delay);
  plugin->SetHasSetupDialog(true);
  const TrackItemRef sound = AddClip(a1, {Make(kMatchName_Volume), plugin});
  Select({sound});
  ASSERT_EQ(list->GetNumberOfAudioParts(), 1);
  const EffectItemList& rows = list->GetAudioParts()[0]->GetItems();
  ASSERT_EQ(Titles(rows), (Strings{"Volume", "Delay"}));
  const auto& children = rows.At(1)->GetItems();
  ASSERT_EQ(children.size(), 5u);
  EXPECT_TRUE(ClassIs(*children[0], "CustomAudioFilterItem"));
  EXPECT_TRUE(ClassIs(*children[1], "CustomAudioFilterItem"));
  EXPECT_EQ(ChildTitles(*rows.At(1)),
            (Strings{children[0]->GetName(), children[1]->GetName(), "Delay", "Feedback", "Mix"}));
  // An audio effect without its own window has none.
  for (const auto& child : rows.At(0)->GetItems()) {
    EXPECT_FALSE(ClassIs(*child, "CustomAudioFilterItem"));
  }
}

class TransitionListTest : public ListViewTest {
 protected:
  TrackItemRef AddTransition(std::vector<ComponentRef> ownChain) {
    TransitionData data;
    data.matchName = "XO.KRVN CrossDissolve";
    data.displayName = "Cross Dissolve";
    TrackItemRef item =
        TrackItem::CreateTransition(MediaType::Video, 6 * kSecond, 7 * kSecond, data);
    for (const ComponentRef& component : ownChain) {
      item->GetComponentChain()->Append(component);
    }
    v1->AddItem(item);
    return item;
  }
};

TEST_F(TransitionListTest, TransitionShowsOnlyItsRow) {
  const TrackItemRef transition = AddTransition({});
  Open();
  Select({transition});
  EXPECT_EQ(list->GetTargetKind(), EffectControlsListView::kTargetTransition);
  ASSERT_EQ(list->GetVideoItems().Size(), 1u);
  EXPECT_TRUE(ClassIs(*list->GetVideoItems().At(0), "VideoTransitionItem"));
  EXPECT_EQ(list->GetVideoTrackItem(), transition);
  EXPECT_FALSE(list->GetVideoExpander()->IsVisible());
}

TEST_F(TransitionListTest, OwnChainOfOneComponentShowsOnlyTheTransitionRow) {
  const TrackItemRef transition = AddTransition({Make(kMatchName_Opacity)});
  Open();
  Select({transition});
  EXPECT_EQ(list->GetTargetKind(), EffectControlsListView::kTargetTransitionComponent);
  EXPECT_EQ(list->GetTransitionChain(), transition->GetComponentChain());
  ASSERT_EQ(list->GetVideoItems().Size(), 1u);
  EXPECT_TRUE(ClassIs(*list->GetVideoItems().At(0), "VideoTransitionItem"));
}

TEST_F(TransitionListTest, OwnChainOfTwoComponentsAddsAnEffectRowAfterTheTransition) {
  const TrackItemRef transition =
      AddTransition({Make(kMatchName_Opacity), Make(kMatchName_GaussianBlur)});
  Open();
  Select({transition});
  ASSERT_EQ(list->GetVideoItems().Size(), 2u);
  EXPECT_TRUE(ClassIs(*list->GetVideoItems().At(0), "VideoTransitionItem"));
  EXPECT_EQ(Filter(list->GetVideoItems(), 1).Component(),
            transition->GetComponentChain()->GetAt(1));
  // No masks for a transition's effect.
  for (const auto& child : list->GetVideoItems().At(1)->GetItems()) {
    EXPECT_FALSE(ClassIs(*child, "MaskShapeControl"));
  }
}

TEST_F(ListViewTest, NullGroupIsAFailedPreconditionAndBuildsNothing) {
  ClearRecordedDebugAssertions();
  list->RebuildVideoClipView(nullptr);
  list->RebuildAudioClipView(nullptr);
  list->RebuildTransitionView(nullptr);
  list->RebuildTransitionComponentView(nullptr);
  const auto& records = RecordedDebugAssertions();
  ASSERT_EQ(records.size(), 4u);
  for (const DebugAssertionRecord& record : records) {
    EXPECT_EQ(record.message, "Invalid inTrackItemGroup");
    EXPECT_EQ(record.condition, "inTrackItemGroup != NULL");
    EXPECT_NE(record.function.find("EffectControlsListView::Rebuild"), std::string::npos);
  }
  EXPECT_TRUE(list->GetVideoItems().IsEmpty());
  EXPECT_TRUE(list->GetAudioParts().empty());
  EXPECT_FALSE(list->IsVideoExpanded());
}

TEST_F(ListViewTest, MasksBecomeRowsUnderTheMaskShapeRowOneLevelDeeper) {
  ComponentRef blur = Make(kMatchName_GaussianBlur);
  blur->SetMasks({Make(kMatchName_Mask), Make(kMatchName_Mask)});
  const TrackItemRef clip = AddClip(v1, {blur});
  Select({clip});
  const EffectItem& row = *list->GetVideoItems().At(0);
  ASSERT_GE(row.GetItems().size(), 3u);
  EXPECT_TRUE(ClassIs(*row.GetItems()[0], "MaskShapeControl"));
  for (std::size_t i = 1; i <= 2; ++i) {
    const auto* mask = dynamic_cast<const FilterItem*>(row.GetItems()[i].get());
    ASSERT_NE(mask, nullptr);
    EXPECT_TRUE(mask->IsMask());
    EXPECT_EQ(mask->GetGroupLevel(), 1);
    EXPECT_FALSE(mask->GetOptions().topLevel);
  }
  EXPECT_EQ(row.GetItems()[3]->GetName(), "Blurriness");

  list->SetStyle(kStyleNoMaskControls);
  list->ClearAndRebuildList();
  EXPECT_EQ(ChildTitles(*list->GetVideoItems().At(0)),
            (Strings{"Blurriness", "Blur Dimensions", "Repeat Edge Pixels"}));
}

TEST_F(ListViewTest, HiddenParametersAreSetAside) {
  ComponentRef blur = Make(kMatchName_GaussianBlur);
  blur->FindParam("Blur Dimensions")->SetVisible(false);
  Select({AddClip(v1, {blur})});
  const auto& children = list->GetVideoItems().At(0)->GetItems();
  const auto hidden = std::find_if(children.begin(), children.end(), [](const auto& row) {
    return row->GetName() == "Blur Dimensions";
  });
  ASSERT_NE(hidden, children.end());
  EXPECT_TRUE((*hidden)->IsSetAside());
  EXPECT_FALSE((*hidden)->IsShown());
}

TEST_F(ListViewTest, RebuildDestroysTheOldRowsAndAnnouncesTheNewList) {
  MessageRecorder own;
  MessageRecorder keyframes;
  own.Listen(list->GetOwnStation());
  keyframes.Listen(list->GetKeyframeViewStation());
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity)});
  Open();
  Select({clip});
  const std::shared_ptr<EffectItem> before = list->GetVideoItems().At(0);
  EXPECT_EQ(own.Count("EffectControlsListChangedMessage"), 1);
  EXPECT_EQ(keyframes.Count("EffectControlsRefreshKeyframesMessage"), 1);

  clip->GetComponentChain()->Append(Make(kMatchName_Crop));  // a structure change rebuilds
  EXPECT_TRUE(before->IsDestroyed());
  EXPECT_EQ(Titles(list->GetVideoItems()), (Strings{"Opacity", "Crop"}));
  EXPECT_EQ(own.Count("EffectControlsListChangedMessage"), 2);

  list->ClearList();
  EXPECT_TRUE(list->GetVideoItems().IsEmpty());
  EXPECT_FALSE(list->IsVideoExpanded());
  EXPECT_FALSE(list->GetVideoExpander()->IsVisible());
  EXPECT_EQ(list->GetVideoExpander()->GetValue(), 1);
  EXPECT_EQ(list->GetVideoTrackItem(), nullptr);
  EXPECT_EQ(list->GetKeyframeSelection(), nullptr);
}

TEST_F(ListViewTest, ClearSelectionEmptiesBothSelectionsAndEveryFlag) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity), Make(kMatchName_Crop)});
  Select({clip});
  MessageRecorder own;
  own.Listen(list->GetOwnStation());

  list->ClearSelection();  // nothing selected: no announcement
  EXPECT_EQ(own.Count("EffectControlsFilterSelectionChangedMessage"), 0);

  const auto& rows = list->GetVideoItems();
  list->SelectItem(rows.At(0), true);
  list->SelectItem(rows.At(1), true);
  list->SelectItem(rows.At(1), true);  // twice is once
  // Crop takes no masks: its first child is its first parameter.
  list->SelectParameter(rows.At(1)->GetItems().front(), true);
  EXPECT_EQ(list->GetSelectedItems().Size(), 2u);
  EXPECT_EQ(list->GetSelectedParameters().Size(), 1u);
  EXPECT_TRUE(rows.At(1)->IsSelected());

  list->SelectItem(rows.At(0), false);
  EXPECT_EQ(list->GetSelectedItems().Size(), 1u);
  EXPECT_FALSE(rows.At(0)->IsSelected());

  list->ClearSelection();
  EXPECT_TRUE(list->GetSelectedItems().IsEmpty());
  EXPECT_TRUE(list->GetSelectedParameters().IsEmpty());
  EXPECT_FALSE(rows.At(1)->IsSelected());
  EXPECT_FALSE(rows.At(1)->GetItems().front()->IsSelected());
  EXPECT_EQ(own.Count("EffectControlsFilterSelectionChangedMessage"), 1);
}

TEST_F(ListViewTest, PastedEffectIsSelectedAfterTheRebuild) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity), Make(kMatchName_Crop)});
  Select({clip});
  const ComponentRef crop = clip->GetComponentChain()->GetAt(1);
  BroadcastMessage(list->GetOwnStation(), EmbeddedEffectAdded(crop));
  list->ClearAndRebuildList();
  ASSERT_EQ(list->GetSelectedItems().Size(), 1u);
  EXPECT_EQ(list->GetSelectedItems().At(0).component, crop);
  EXPECT_TRUE(list->GetVideoItems().At(1)->IsSelected());
  // Only once.
  list->ClearSelection();
  list->ClearAndRebuildList();
  EXPECT_TRUE(list->GetSelectedItems().IsEmpty());
}

TEST_F(ListViewTest, DumpListsEveryRowInDisplayOrderWithItsPath) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Timecode)});
  Open();
  Select({clip});
  const std::vector<StateDumpRow> rows = list->GetDumpRows();
  ASSERT_GE(rows.size(), 4u);
  EXPECT_EQ(rows[0].path, (Strings{"Timecode"}));
  EXPECT_EQ(rows[0].className, "FilterItem");
  EXPECT_TRUE(rows[0].expanded);
  EXPECT_TRUE(rows[0].shown);
  EXPECT_EQ(rows[1].path, (Strings{"Timecode", "Position and Size"}));
  EXPECT_EQ(rows[2].path, (Strings{"Timecode", "Position and Size", "Position"}));
  EXPECT_EQ(rows[2].groupLevel, 1);
  EXPECT_EQ(rows[1].top, rows[0].top + EffectItem::kFolderTitleHeight);
  for (std::size_t i = 1; i < rows.size(); ++i) {
    if (rows[i].shown && rows[i - 1].shown) {
      EXPECT_GT(rows[i].top, rows[i - 1].top) << i;
    }
  }
}

TEST_F(ListViewTest, SelectionOfLinkedClipShowsVideoAndAudioAndSameSelectionDoesNotRebuild) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity)});
  const TrackItemRef sound = AddClip(a1, {Make(kMatchName_Volume)});
  clip->SetLinkGroup(7);
  sound->SetLinkGroup(7);
  Open();
  Select({clip});
  EXPECT_TRUE(list->GetShowVideo());
  EXPECT_TRUE(list->GetShowAudio());
  const std::shared_ptr<EffectItem> row = list->GetVideoItems().At(0);
  list->DoSequenceClipSelectionChanged(sequence);
  EXPECT_FALSE(row->IsDestroyed());

  Select({});
  EXPECT_TRUE(list->GetVideoItems().IsEmpty());
  EXPECT_TRUE(list->GetAudioParts().empty());
}

}  // namespace

namespace {

TEST_F(ListViewTest, StyleBitsReachTheEffectRowsOptions) {
  list->SetStyle(kStyleCheckboxSwitch | kStyleIndentFilters | kStyleStartCollapsed |
                 kStyleNoFilterIndent | kStyleNoVideoSetupButton);
  EXPECT_TRUE(list->HasECPStyle(kStyleIndentFilters | kStyleNoAudio));
  EXPECT_FALSE(list->HasECPStyle(kStyleNoAudio | kStyleNoMaskControls));
  Select({AddClip(v1, {Make(kMatchName_Opacity)})});
  const FilterItemOptions& options = Filter(list->GetVideoItems(), 0).GetOptions();
  EXPECT_TRUE(options.topLevel);
  EXPECT_TRUE(options.checkboxSwitch);
  EXPECT_TRUE(options.noVideoSetupButton);
  EXPECT_EQ(options.indent, 40);
  EXPECT_TRUE(options.startCollapsed);
  EXPECT_TRUE(options.noIndent);

  list->SetStyle(kStyleNone);
  list->ClearAndRebuildList();
  const FilterItemOptions& plain = Filter(list->GetVideoItems(), 0).GetOptions();
  EXPECT_FALSE(plain.checkboxSwitch);
  EXPECT_EQ(plain.indent, 0);
  EXPECT_FALSE(plain.startCollapsed);
  EXPECT_FALSE(plain.noIndent);
}

TEST_F(ListViewTest, NoAudioStyleLoadsNoPartsAndNoVideoExpanderStyleMakesNoButton) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity)});
  const TrackItemRef sound = AddClip(a1, {Make(kMatchName_Volume)});
  clip->SetLinkGroup(6);
  sound->SetLinkGroup(6);
  list->SetStyle(kStyleNoAudio | kStyleNoVideoExpander);
  Open();
  Select({clip});
  EXPECT_EQ(list->GetVideoExpander(), nullptr);
  EXPECT_NE(list->GetGraphicsExpander(), nullptr);
  EXPECT_EQ(Titles(list->GetVideoItems()), (Strings{"Opacity"}));
  EXPECT_TRUE(list->GetAudioParts().empty());
  // The section keeps its header without a button.
  EXPECT_EQ(list->GetVideoItems().At(0)->GetTop(), EffectControlsListView::kSectionHeaderHeight);
}

TEST_F(ListViewTest, FindsTheAudioPartOfARowAtAnyDepth) {
  const TrackItemRef first = AddClip(a1, {Make(kMatchName_Volume)});
  const TrackItemRef second = AddClip(a2, {Make(kMatchName_Delay)});
  first->SetLinkGroup(8);
  second->SetLinkGroup(8);
  second->SetPartOrderKey(1);
  Select({first});
  ASSERT_EQ(list->GetNumberOfAudioParts(), 2);
  const EffectItem& delay = *list->GetAudioParts()[1]->GetItems().At(0);
  EXPECT_EQ(list->FindAudioPartInfo(delay), list->GetAudioParts()[1].get());
  EXPECT_EQ(list->FindAudioPartInfo(*delay.GetItems().back()), list->GetAudioParts()[1].get());
  EXPECT_EQ(list->FindAudioPartInfoByIndex(2), nullptr);
  EffectItem stranger(nullptr, "Stranger", {});
  EXPECT_EQ(list->FindAudioPartInfo(stranger), nullptr);
}

}  // namespace

namespace {

// A list whose video build meets a missing model object after it made its rows.
class FailingListView : public EffectControlsListView {
 public:
  using EffectControlsListView::EffectControlsListView;
  void LoadVideoFilters(const TrackItemRef& trackItem, const ComponentChainRef& chain,
                        bool masterClipMode) override {
    EffectControlsListView::LoadVideoFilters(trackItem, chain, masterClipMode);
    if (fail) {
      made = GetVideoItems().Size() > 0 ? GetVideoItems().At(0) : nullptr;
      throw NullInterfaceException("IComponentChain");
    }
  }
  bool fail = true;
  std::shared_ptr<EffectItem> made;
};

TEST_F(ListViewTest, ABuildThatThrowsLeavesAnEmptyAnnouncedListAndTheNextBuildWorks) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity), Make(kMatchName_Crop)});
  auto failing = std::make_shared<FailingListView>(nullptr, "EffectControlsTest.Failing");
  MessageRecorder own;
  own.Listen(failing->GetOwnStation());
  sequence->SetSelection({clip});

  EXPECT_THROW(failing->DoSequenceClipSelectionChanged(sequence), NullInterfaceException);
  ASSERT_NE(failing->made, nullptr);
  EXPECT_TRUE(failing->made->IsDestroyed());
  EXPECT_TRUE(failing->GetVideoItems().IsEmpty());
  EXPECT_EQ(failing->GetVideoTrackItem(), nullptr);
  EXPECT_EQ(failing->GetMaxHeight(), EffectControlsListView::kMaxHeightExtra);
  EXPECT_EQ(own.Count("EffectControlsListChangedMessage"), 1);

  // The same selection again is not taken for a list that is already built.
  failing->fail = false;
  failing->DoSequenceClipSelectionChanged(sequence);
  EXPECT_EQ(Titles(failing->GetVideoItems()), (Strings{"Opacity", "Crop"}));
  failing->Destroy();
}

}  // namespace

namespace {

TEST_F(ListViewTest, AltToggleSwitchesEveryEffectOfTheTargetAsOneUndoStep) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity), Make(kMatchName_Crop)});
  const TrackItemRef sound = AddClip(a1, {Make(kMatchName_Volume), Make(kMatchName_Delay)});
  clip->SetLinkGroup(11);
  sound->SetLinkGroup(11);
  Open();
  Select({clip});
  auto everyEffect = [&] {
    std::vector<ComponentRef> all = clip->GetComponentChain()->GetComponents();
    const auto& audio = sound->GetComponentChain()->GetComponents();
    all.insert(all.end(), audio.begin(), audio.end());
    return all;
  };
  ASSERT_EQ(list->GetNumberOfAudioParts(), 1);
  FilterItem& volumeRow = Filter(list->GetAudioParts()[0]->GetItems(), 0);

  Filter(list->GetVideoItems(), 1).Toggle(kKeyModifierAlt);
  for (const ComponentRef& component : everyEffect()) {
    EXPECT_TRUE(component->IsBypassed()) << component->GetDisplayName();
  }
  EXPECT_EQ(project->GetUndoStack().GetUndoNames(),
            (Strings{"MZ.ComponentChainActions.SetBypass"}));
  EXPECT_FALSE(Filter(list->GetVideoItems(), 0).IsEnabled());
  EXPECT_FALSE(volumeRow.IsEnabled());

  ASSERT_TRUE(project->GetUndoStack().Undo());
  for (const ComponentRef& component : everyEffect()) {
    EXPECT_FALSE(component->IsBypassed()) << component->GetDisplayName();
  }
  EXPECT_TRUE(volumeRow.IsEnabled());

  // Effects that cannot be edited stay as they are.
  sequence->SetReadOnly(true);
  list->OnFilterOnOffAllChanged(false);
  for (const ComponentRef& component : everyEffect()) {
    EXPECT_FALSE(component->IsBypassed()) << component->GetDisplayName();
  }
  EXPECT_TRUE(project->GetUndoStack().GetUndoNames().empty());
}

}  // namespace

namespace {

TEST_F(ListViewTest, AGroupListingAMissingItemReportsAMissingInterfaceAndBuildsNothing) {
  TrackItemGroup video;
  video.videoItems = {nullptr};
  TrackItemGroup audio;
  audio.audioItems = {nullptr};
  EXPECT_THROW(list->RebuildVideoClipView(&video), NullInterfaceException);
  EXPECT_THROW(list->RebuildTransitionComponentView(&video), NullInterfaceException);
  EXPECT_THROW(list->RebuildAudioClipView(&audio), NullInterfaceException);
  list->SetShowVideo(true);
  EXPECT_THROW(list->RebuildTransitionView(&video), NullInterfaceException);
  list->SetShowVideo(false);
  list->SetShowAudio(true);
  EXPECT_THROW(list->RebuildTransitionView(&audio), NullInterfaceException);
  EXPECT_TRUE(list->GetVideoItems().IsEmpty());
  EXPECT_TRUE(list->GetAudioParts().empty());
  EXPECT_EQ(list->GetVideoTrackItem(), nullptr);
}

}  // namespace
