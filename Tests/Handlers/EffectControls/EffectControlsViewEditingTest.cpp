// The panel-level edits that end in a host dialog or reach past the list: typed text that a
// selection change would have dropped, saving presets, the marker editor, blend modes, graphics
// resets, and the master clip's markers on the ruler.
#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessageLoop.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/MarkerActions.h"
#include "Host/Model/PresetActions.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/HotTextControl.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/PicturePopup.h"
#include "Host/Toolkit/ScriptedInputBox.h"
#include "Host/Toolkit/TimeBarControl.h"
#include "Tests/Handlers/EffectControls/EffectControlsViewTestSupport.h"

namespace {

using namespace panel_view_test;
using View = EffectControlsView;

ComponentParam::State Constant(double value) {
  ComponentParam::State state;
  state.value = value;
  return state;
}

bool Enabled(EffectControlsView& view, CommandID command) {
  CommandStatus status;
  EXPECT_TRUE(view.FindCommandStatus(command, status)) << command;
  return status.enabled;
}

// Answers the input boxes the test queues for as long as it lives.
class Answers {
 public:
  Answers() : mPrevious(InputBox::SetResponder(mAnswers)) {}
  ~Answers() { InputBox::SetResponder(mPrevious); }
  Answers& operator<<(std::optional<std::string> answer) {
    mAnswers->PushAnswer(std::move(answer));
    return *this;
  }
  const std::vector<InputBoxRequest>& Requests() const { return mAnswers->GetRequests(); }
  std::size_t Pending() const { return mAnswers->PendingAnswers(); }

 private:
  std::shared_ptr<ScriptedInputBox> mAnswers = std::make_shared<ScriptedInputBox>();
  std::shared_ptr<InputBoxResponder> mPrevious;
};

// Two 25 fps clips of the same media, each with the intrinsic effects and a Gaussian Blur, in
// an 800 x 500 panel showing the first.
class PanelEditingTest : public PanelViewTest {
 protected:
  void SetUp() override {
    first = builder.AddClip(v1, master, {.start = 0, .end = 10 * kSec});
    second = builder.AddClip(v1, master, {.start = 10 * kSec, .end = 20 * kSec});
    firstBlur = builder.AddEffect(first, kMatchName_GaussianBlur);
    secondBlur = builder.AddEffect(second, kMatchName_GaussianBlur);
    Open({800, 500});
    sequence->SetSelection({first});
    ASSERT_EQ(view->GetTargetMode(), View::kTargetClip);
  }

  UndoStack& Undo() { return project->GetUndoStack(); }
  std::size_t Steps() { return Undo().GetUndoNames().size(); }

  static ComponentParamRef OpacityOf(const TrackItemRef& item) {
    return item->GetComponentChain()->FindByMatchName(kMatchName_Opacity)->FindParam("Opacity");
  }
  static ComponentParamRef BlendModeOf(const TrackItemRef& item) {
    return item->GetComponentChain()->FindByMatchName(kMatchName_Opacity)->FindParam("Blend Mode");
  }

  // The shown row of `component`, searched through the whole tree.
  std::shared_ptr<EffectItem> RowOf(const ComponentRef& component) const {
    for (const auto& top : view->GetListView()->GetVideoItems()) {
      if (const auto* filter = dynamic_cast<const FilterItem*>(top.get());
          filter != nullptr && filter->Component() == component) {
        return top;
      }
    }
    return nullptr;
  }

  // The value field of the parameter row named `name` of `effect`: a field the parameter cache
  // lends the row, a child of the list answering to the row.
  HotTextControl* FieldOf(const ComponentRef& effect, const std::string& name) const {
    const auto row = RowOf(effect);
    if (!row) {
      return nullptr;
    }
    for (const auto& child : row->GetItems()) {
      const auto* commander = dynamic_cast<const Commander*>(child.get());
      if (child->GetName() != name || commander == nullptr) {
        continue;
      }
      for (const auto& control : view->GetListView()->GetChildren()) {
        auto* field = dynamic_cast<HotTextControl*>(control.get());
        if (field != nullptr && field->GetSuperCommander() == commander) {
          return field;
        }
      }
    }
    return nullptr;
  }

  void TypeIntoOpacity(const std::string& text) {
    const ComponentRef opacity = first->GetComponentChain()->FindByMatchName(kMatchName_Opacity);
    const auto row = RowOf(opacity);
    ASSERT_NE(row, nullptr);
    row->SetIsExpanded(true);
    HotTextControl* field = FieldOf(opacity, "Opacity");
    ASSERT_NE(field, nullptr);
    ASSERT_TRUE(field->BeginEditing());
    ASSERT_TRUE(field->TextInputSelf(text));
  }

  TrackItemRef first;
  TrackItemRef second;
  ComponentRef firstBlur;
  ComponentRef secondBlur;
};

// --- Typed text ---

TEST_F(PanelEditingTest, TextTypedAndLeftUnconfirmedIsSavedWhenTheSelectionChangesOutside) {
  const std::size_t steps = Steps();
  TypeIntoOpacity("42");
  sequence->SetSelection({second});  // the timeline selects another clip; the row goes
  MessageLoop::Instance().RunPending();
  EXPECT_DOUBLE_EQ(std::get<double>(OpacityOf(first)->GetConstantValue()), 42.0);
  EXPECT_DOUBLE_EQ(std::get<double>(OpacityOf(second)->GetConstantValue()), 100.0);
  EXPECT_EQ(Steps(), steps + 1);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_DOUBLE_EQ(std::get<double>(OpacityOf(first)->GetConstantValue()), 100.0);
}

TEST_F(PanelEditingTest, EscapeDropsTheTypedTextAndNothingIsSavedLater) {
  const std::size_t steps = Steps();
  TypeIntoOpacity("42");
  const ComponentRef opacity = first->GetComponentChain()->FindByMatchName(kMatchName_Opacity);
  HotTextControl* field = FieldOf(opacity, "Opacity");
  ASSERT_NE(field, nullptr);
  field->KeyDownSelf(KeyEvent{KeyCode::kEscape});
  sequence->SetSelection({second});
  MessageLoop::Instance().RunPending();
  EXPECT_DOUBLE_EQ(std::get<double>(OpacityOf(first)->GetConstantValue()), 100.0);
  EXPECT_EQ(Steps(), steps);
}

// --- Save preset ---

TEST_F(PanelEditingTest, ASavedPresetIsListedForTheSameEffectOnAnotherClipAndAppliesItsValues) {
  firstBlur->FindParam("Blurriness")->ApplyState(Constant(12.0));
  view->GetListView()->SelectItem(RowOf(firstBlur), true);
  ASSERT_TRUE(Enabled(*view, View::kSavePresetCommand));
  std::vector<std::string> created;
  FunctionListener listener([&](const Message& message) {
    if (const auto* preset = message.As<FilterPresetCreatedMessage>()) {
      created.push_back(preset->name);
    }
  });
  AddListener(project->GetStation(), listener);
  const std::size_t steps = Steps();
  {
    Answers answers;
    answers << std::string("  ") << std::string("Dreamy");
    view->ObeyCommand(View::kSavePresetCommand);
    ASSERT_EQ(answers.Requests().size(), 2U) << "a blank name is asked again";
    EXPECT_EQ(answers.Requests()[0].title, "Save Preset");
    EXPECT_EQ(answers.Requests()[1].prompt, "A preset needs a name. Name");
  }
  EXPECT_EQ(Steps(), steps + 1);
  EXPECT_EQ(Undo().GetUndoName(), PresetActions::kSavePreset);
  EXPECT_EQ(created, std::vector<std::string>{"Dreamy"});

  sequence->SetSelection({second});
  MessageLoop::Instance().RunPending();
  const auto* row = dynamic_cast<const FilterItem*>(RowOf(secondBlur).get());
  ASSERT_NE(row, nullptr);
  ASSERT_NE(row->GetPresetPopup(), nullptr) << "the second clip's blur lists the new preset";
  const int index = static_cast<int>(secondBlur->GetPresetCount()) - 1;
  EXPECT_EQ(secondBlur->GetPresets()[static_cast<std::size_t>(index)].name, "Dreamy");
  auto* secondRow = dynamic_cast<FilterItem*>(RowOf(secondBlur).get());
  ASSERT_NE(secondRow, nullptr);
  secondRow->ObeyCommand(FilterItem::kFirstPresetCommand + index);
  EXPECT_DOUBLE_EQ(std::get<double>(secondBlur->FindParam("Blurriness")->GetConstantValue()), 12.0);

  // Undoing the apply and the save takes the preset out of both clips.
  ASSERT_TRUE(Undo().Undo());
  ASSERT_TRUE(Undo().Undo());
  MessageLoop::Instance().RunPending();
  EXPECT_EQ(firstBlur->GetPresetCount(), secondBlur->GetPresetCount());
  for (const ComponentRef& blur : {firstBlur, secondBlur}) {
    for (const ComponentPreset& preset : blur->GetPresets()) {
      EXPECT_NE(preset.name, "Dreamy");
    }
  }
}

TEST_F(PanelEditingTest, ADuplicatePresetNameIsRefusedAndCancelSavesNothing) {
  view->GetListView()->SelectItem(RowOf(firstBlur), true);
  {
    Answers answers;
    answers << std::string("Dreamy");
    view->ObeyCommand(View::kSavePresetCommand);
  }
  const std::size_t steps = Steps();
  const std::string before = secondBlur->GetPresets().back().name;
  view->GetListView()->SelectItem(RowOf(firstBlur), true);  // the save remade the rows
  {
    Answers answers;
    answers << std::string("Dreamy") << std::nullopt;
    view->ObeyCommand(View::kSavePresetCommand);
    ASSERT_EQ(answers.Requests().size(), 2U);
    EXPECT_EQ(answers.Requests()[1].prompt,
              "This effect already has a preset named \"Dreamy\". Name");
    EXPECT_EQ(answers.Requests()[1].initialText, "Dreamy");
  }
  EXPECT_EQ(Steps(), steps);
  EXPECT_EQ(secondBlur->GetPresets().back().name, before);
}

// --- Marker editor ---

TEST_F(PanelEditingTest, EditingTheMarkerAtTheEditLineIsOneStepAndUndoRestoresIt) {
  Marker marker;
  marker.time = 4 * kSec;
  marker.name = "old";
  ASSERT_EQ(MarkerActions::AddMarker(sequence, marker), EditStatus::Done);
  sequence->SetCurrentTime(4 * kSec);
  MessageLoop::Instance().RunPending();
  EXPECT_TRUE(Enabled(*view, View::kEditMarkerCommand));
  const std::size_t steps = Steps();
  {
    Answers answers;
    // 20 s of duration would run past the sequence's end (20 s); the second try fits.
    answers << std::string("Intro") << std::string("a note") << std::string("9") << std::string("3")
            << std::string("00:00:20:00") << std::string("00:00:02:00");
    view->ObeyCommand(View::kEditMarkerCommand);
    EXPECT_EQ(answers.Pending(), 0U);
    ASSERT_EQ(answers.Requests().size(), 6U);
    EXPECT_EQ(answers.Requests()[0].initialText, "old");
    EXPECT_EQ(answers.Requests()[3].prompt,
              "The colour must be a number from 0 to 7. Colour (0 to 7)");
    EXPECT_EQ(answers.Requests()[5].prompt,
              "The marker would run past the end of the sequence. Duration");
  }
  EXPECT_EQ(Steps(), steps + 1);
  EXPECT_EQ(Undo().GetUndoName(), MarkerActions::kChangeMarker);
  const Marker& edited = sequence->GetMarkers().At(0);
  EXPECT_EQ(edited.name, "Intro");
  EXPECT_EQ(edited.comment, "a note");
  EXPECT_EQ(edited.colorIndex, 3);
  EXPECT_EQ(edited.duration, 2 * kSec);
  MessageLoop::Instance().RunPending();
  EXPECT_EQ(view->GetTimeRuler()->GetMarkers().front().name, "Intro");
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(sequence->GetMarkers().At(0), marker);
}

TEST_F(PanelEditingTest, CancellingTheMarkerEditorOrHavingNoMarkerThereChangesNothing) {
  Marker marker;
  marker.time = 4 * kSec;
  ASSERT_EQ(MarkerActions::AddMarker(sequence, marker), EditStatus::Done);
  const std::size_t steps = Steps();
  Answers answers;
  answers << std::string("Intro") << std::nullopt;
  sequence->SetCurrentTime(4 * kSec);
  view->ObeyCommand(View::kEditMarkerCommand);
  sequence->SetCurrentTime(5 * kSec);  // no marker here: no editor
  EXPECT_FALSE(Enabled(*view, View::kEditMarkerCommand));
  view->ObeyCommand(View::kEditMarkerCommand);
  EXPECT_EQ(answers.Requests().size(), 2U);
  EXPECT_EQ(Steps(), steps);
  EXPECT_EQ(sequence->GetMarkers().At(0), marker);
}

TEST_F(PanelEditingTest, AddingAMarkerWhereOneSitsSelectsItInsteadOfStackingAHiddenCopy) {
  sequence->SetCurrentTime(4 * kSec);
  view->ObeyCommand(View::kAddMarkerCommand);
  const std::size_t steps = Steps();
  view->ObeyCommand(View::kAddMarkerCommand);
  view->ObeyCommand(View::kFirstColoredMarkerCommand + 2);
  EXPECT_EQ(sequence->GetMarkers().Size(), 1U);
  EXPECT_EQ(Steps(), steps);
  EXPECT_TRUE(view->GetMarkers().IsSelected(1));
  sequence->SetCurrentTime(4 * kSec + kSec / 25);  // the next frame takes one
  view->ObeyCommand(View::kAddMarkerCommand);
  EXPECT_EQ(sequence->GetMarkers().Size(), 2U);
}

// --- Blend modes ---

TEST_F(PanelEditingTest, TheBlendModeOfTwoSelectedClipsStepsInOneUndoStep) {
  sequence->SetSelection({first, second});
  MessageLoop::Instance().RunPending();
  ASSERT_TRUE(Enabled(*view, View::kBlendModeNextCommand));
  const std::size_t steps = Steps();
  view->ObeyCommand(View::kBlendModeNextCommand);
  EXPECT_EQ(Steps(), steps + 1);
  EXPECT_EQ(std::get<ParamChoice>(BlendModeOf(first)->GetConstantValue()).index, 1);
  EXPECT_EQ(std::get<ParamChoice>(BlendModeOf(second)->GetConstantValue()).index, 1);
  view->ObeyCommand(View::kBlendModePreviousCommand);
  view->ObeyCommand(View::kBlendModePreviousCommand);  // wraps to the last mode
  const int last = static_cast<int>(BlendModeOf(first)->GetMenuEntries().size()) - 1;
  EXPECT_EQ(std::get<ParamChoice>(BlendModeOf(second)->GetConstantValue()).index, last);
  ASSERT_TRUE(Undo().Undo());
  ASSERT_TRUE(Undo().Undo());
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(Steps(), steps);
  EXPECT_EQ(std::get<ParamChoice>(BlendModeOf(first)->GetConstantValue()).index, 0);
  EXPECT_EQ(std::get<ParamChoice>(BlendModeOf(second)->GetConstantValue()).index, 0);
}

TEST_F(PanelEditingTest, BlendModesAreOffWithNothingSelectedOrWhileReadOnly) {
  sequence->ClearSelection();
  MessageLoop::Instance().RunPending();
  EXPECT_FALSE(Enabled(*view, View::kBlendModeNextCommand));
  sequence->SetSelection({first});
  sequence->SetReadOnly(true);
  EXPECT_FALSE(Enabled(*view, View::kBlendModePreviousCommand));
  const std::size_t steps = Steps();
  EXPECT_TRUE(view->ObeyCommand(View::kBlendModeNextCommand));
  EXPECT_EQ(Steps(), steps);
}

// --- Graphics resets ---

TEST_F(PanelEditingTest, GraphicsResetsResetTheCapsuleParameterTheyNameOrAllOfThem) {
  EXPECT_FALSE(Enabled(*view, View::kCapsuleResetAllCommand)) << "no capsule yet";
  ComponentRef capsule = Component::Create("XO.KRVN Capsule", "Graphic", MediaType::Video, true);
  capsule->SetRole(ComponentRole::Capsule);
  capsule->AddParam(ComponentParam::Create("Size", ParamType::Slider, 10.0));
  capsule->AddParam(ComponentParam::Create("Text", ParamType::Slider, 1.0));
  first->GetComponentChain()->Insert(0, capsule);
  capsule->GetParam(0)->ApplyState(Constant(30.0));
  capsule->GetParam(1)->ApplyState(Constant(5.0));
  sequence->SetSelection({second});
  sequence->SetSelection({first});
  MessageLoop::Instance().RunPending();

  EXPECT_TRUE(Enabled(*view, View::kFirstCapsuleResetCommand + 1));
  EXPECT_FALSE(Enabled(*view, View::kFirstCapsuleResetCommand + 2)) << "the capsule has two";
  const std::size_t steps = Steps();
  view->ObeyCommand(View::kFirstCapsuleResetCommand + 1);
  EXPECT_DOUBLE_EQ(std::get<double>(capsule->GetParam(1)->GetConstantValue()), 1.0);
  EXPECT_DOUBLE_EQ(std::get<double>(capsule->GetParam(0)->GetConstantValue()), 30.0);
  view->ObeyCommand(View::kCapsuleResetAllCommand);
  EXPECT_DOUBLE_EQ(std::get<double>(capsule->GetParam(0)->GetConstantValue()), 10.0);
  EXPECT_EQ(Steps(), steps + 2);
  ASSERT_TRUE(Undo().Undo());
  ASSERT_TRUE(Undo().Undo());
  EXPECT_DOUBLE_EQ(std::get<double>(capsule->GetParam(0)->GetConstantValue()), 30.0);
  EXPECT_DOUBLE_EQ(std::get<double>(capsule->GetParam(1)->GetConstantValue()), 5.0);
}

// --- Master-clip mode ---

TEST_F(PanelEditingTest, MasterClipModeShowsOnlyTheMasterClipsMarkersWhereTheClipPlaysThem) {
  Marker sequenceMarker;
  sequenceMarker.time = 8 * kSec;
  sequenceMarker.name = "sequence";
  ASSERT_EQ(MarkerActions::AddMarker(sequence, sequenceMarker), EditStatus::Done);
  Marker clipMarker;
  clipMarker.time = first->GetMediaIn() + 3 * kSec;
  clipMarker.name = "take";
  ASSERT_EQ(MarkerActions::AddMarker(master, clipMarker), EditStatus::Done);
  MessageLoop::Instance().RunPending();
  ASSERT_EQ(view->GetTimeRuler()->GetMarkers().size(), 1U);
  EXPECT_EQ(view->GetTimeRuler()->GetMarkers().front().name, "sequence");

  view->TargetMasterClip(master);
  MessageLoop::Instance().RunPending();
  ASSERT_EQ(view->GetTimeRuler()->GetMarkers().size(), 1U);
  EXPECT_EQ(view->GetTimeRuler()->GetMarkers().front().name, "take");
  EXPECT_EQ(view->GetTimeRuler()->GetMarkers().front().time, 3 * kSec);

  // A marker added from the panel goes where the ruler shows it.
  sequence->SetCurrentTime(5 * kSec);
  view->ObeyCommand(View::kAddMarkerCommand);
  MessageLoop::Instance().RunPending();
  EXPECT_EQ(master->GetMarkers().Size(), 2U);
  EXPECT_EQ(view->GetTimeRuler()->GetMarkers().size(), 2U);
  EXPECT_EQ(sequence->GetMarkers().Size(), 1U);
}

}  // namespace
