#include <gtest/gtest.h>

#include "Host/Messaging/FunctionListener.h"
#include "Host/Model/ComponentActions.h"
#include "Host/Model/ComponentChainActions.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/ComponentParamActor.h"
#include "Host/Model/ModelMessages.h"
#include "ModelTestFixture.h"

namespace {

class ModelMessagesTest : public ModelTest {
 protected:
  // Listens where the effect list does: the chain, the track item and the parameter.
  void ListenLikeTheList(const ComponentParamRef& param) {
    recorder.Listen(videoChain->GetStation());
    recorder.Listen(video->GetStation());
    recorder.Listen(param->GetStation());
  }
  MessageRecorder recorder;
};

TEST_F(ModelMessagesTest, AValueEditSendsTheSameMessagesOnDoUndoAndRedo) {
  const ComponentParamRef blurriness = blur->FindParam("Blurriness");
  ListenLikeTheList(blurriness);
  ComponentParamActions::SetValue(blurriness, 0, 12.0);
  const std::vector<std::string> onDo = recorder.names;
  EXPECT_EQ(onDo,
            (std::vector<std::string>{"ParamChangedMessage", "ComponentChainChangedMessage"}));
  for (auto step : {&UndoStack::Undo, &UndoStack::Redo}) {
    recorder.Clear();
    (Undo().*step)();
    EXPECT_EQ(recorder.names, onDo);
  }
}

TEST_F(ModelMessagesTest, ALiveDragSendsAChangeForEveryStepAndNoStructureChange) {
  const ComponentParamRef blurriness = blur->FindParam("Blurriness");
  ListenLikeTheList(blurriness);
  {
    ComponentParamActor actor(blurriness, 0);
    actor.SetValue(1.0);
    actor.SetValue(2.0);
    actor.SetValue(3.0);
  }
  // One per live change; the commit records what the model already shows and adds none.
  EXPECT_EQ(recorder.Count("ParamChangedMessage"), 3);
  recorder.Clear();
  Undo().Undo();
  EXPECT_EQ(recorder.Count("ParamChangedMessage"), 1);
  EXPECT_EQ(recorder.Count("ComponentChainStructureChangedMessage"), 0);
}

TEST_F(ModelMessagesTest, StructureChangesAreToldApartFromValueChanges) {
  recorder.Listen(videoChain->GetStation());
  ComponentChainActions::RemoveFilter(videoChain, crop);
  EXPECT_EQ(recorder.names, (std::vector<std::string>{"ComponentChainStructureChangedMessage"}));
  recorder.Clear();
  Undo().Undo();
  EXPECT_EQ(recorder.names, (std::vector<std::string>{"ComponentChainStructureChangedMessage"}));
  recorder.Clear();
  ComponentParamActions::SetValue(crop->FindParam("Left"), 0, 10.0);
  EXPECT_EQ(recorder.names, (std::vector<std::string>{"ComponentChainChangedMessage"}));
}

TEST_F(ModelMessagesTest, AStructureMessageSaysWhatChanged) {
  std::vector<ComponentChainChange> changes;
  FunctionListener listener([&](const Message& message) {
    if (const auto* changed = message.As<ComponentChainStructureChangedMessage>()) {
      EXPECT_EQ(changed->chain, videoChain);
      changes = changed->changes;
    }
  });
  AddListener(videoChain->GetStation(), listener);
  ComponentChainActions::MoveFilters(videoChain, {crop}, nullptr);
  ASSERT_FALSE(changes.empty());
  EXPECT_EQ(changes[0].kind, ComponentChainChange::Kind::Moved);
  EXPECT_EQ(changes[0].component, crop);
  EXPECT_EQ(changes[0].index, 0);
}

TEST_F(ModelMessagesTest, ComponentMessagesReachTheTrackItemStation) {
  // The effect row listens on its track item's station.
  std::vector<std::string> names;
  std::vector<Component*> components;
  FunctionListener listener([&](const Message& message) {
    names.emplace_back(message.GetTypeName());
    if (const auto* changed = message.As<ComponentChangedMessage>()) {
      components.push_back(changed->component.get());
    }
  });
  AddListener(video->GetStation(), listener);
  ComponentActions::SetBypass(blur, true);
  ComponentActions::SetInstanceName(blur, "Renamed");
  Undo().Undo();
  EXPECT_EQ(names, (std::vector<std::string>{"ComponentChangedMessage",
                                             "ComponentInstanceNameChangedMessage",
                                             "ComponentInstanceNameChangedMessage"}));
  EXPECT_EQ(components, (std::vector<Component*>{blur.get()}));
}

TEST_F(ModelMessagesTest, AnEditDuringAChangeMessageJoinsTheStepInsteadOfBreakingUndo) {
  // A listener that keeps Scale Width in step with Scale (as a linked control would).
  const ComponentRef motion = Intrinsic(kMatchName_Motion);
  const ComponentParamRef scale = motion->FindParam("Scale");
  const ComponentParamRef width = motion->FindParam("Scale Width");
  FunctionListener follower([&](const Message& message) {
    if (message.Is<ParamChangedMessage>() && !Undo().IsPerformingUndoOrRedo()) {
      ComponentParamActions::SetValue(width, 0, scale->GetConstantValue());
    }
  });
  AddListener(scale->GetStation(), follower);
  ComponentParamActions::SetValue(scale, 0, 50.0);
  EXPECT_EQ(width->GetConstantValue(), ParamValue(50.0));
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);
  Undo().Undo();
  EXPECT_EQ(scale->GetConstantValue(), ParamValue(100.0));
  EXPECT_EQ(width->GetConstantValue(), ParamValue(100.0));
}

TEST_F(ModelMessagesTest, SelectionChangesAreAnnouncedOnceAndOnlyWhenTheyChange) {
  recorder.Listen(sequence->GetStation());
  sequence->SetSelection({video});
  sequence->SetSelection({audio2});  // same linked clip: same group
  EXPECT_EQ(recorder.Count("SequenceClipSelectionChangedMessage"), 1);
  sequence->ClearSelection();
  EXPECT_EQ(recorder.Count("SequenceClipSelectionChangedMessage"), 2);
}

TEST_F(ModelMessagesTest, TheEditLineMovesThePlayer) {
  std::vector<TickTime> times;
  FunctionListener listener([&](const Message& message) {
    if (const auto* moved = message.As<PlayerPositionChangedMessage>()) {
      times.push_back(moved->time);
    }
  });
  AddListener(sequence->GetPlayerStation(), listener);
  sequence->SetCurrentTime(3 * kSecond);
  EXPECT_EQ(times, (std::vector<TickTime>{3 * kSecond}));
  EXPECT_EQ(sequence->GetCurrentTime(), 3 * kSecond);
}

TEST_F(ModelMessagesTest, AMessagePostedForLaterKeepsItsObjectsAlive) {
  auto message = std::make_shared<ComponentChangedMessage>(blur);
  ComponentChainActions::RemoveFilter(videoChain, blur);
  Undo().Clear();
  blur.reset();
  EXPECT_EQ(message->component->GetMatchName(), kMatchName_GaussianBlur);
}

}  // namespace
