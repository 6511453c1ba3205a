#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/SubView.h"
#include "Host/Toolkit/ViewHost.h"

// A small project for the row tests: one video clip on [10 s, 20 s) of the sequence whose first
// frame shows media time 5 s (clip time = sequence time - 5 s), one effect on it, and a window
// whose root view stands in for the list view (the rows' parent view).
class RowsTest : public ::testing::Test {
 protected:
  static constexpr TickTime kSecond = kTicksPerSecond;

  RowsTest() {
    host.SetRootView(listView);
    *editTime = 12 * kSecond;
  }

  // A parameter of the effect.
  ComponentParamRef AddParam(ComponentParamRef param) {
    effect->AddParam(param);
    return param;
  }

  ParameterControlInfo Info(const ComponentParamRef& param) {
    ParameterControlInfo info;
    info.parentView = listView.get();
    info.station = kStation;
    info.sequence = sequence;
    info.component = effect;
    info.param = param;
    info.trackItem = clip;
    info.editTime = editTime;
    return info;
  }

  // Makes a row as the list does: constructed, finished, shown, placed at `top`.
  template <class Row>
  std::shared_ptr<Row> MakeRow(const ComponentParamRef& param, int top = 0) {
    auto row = std::make_shared<Row>(Info(param));
    row->FinishCreateSelf();
    row->Show();
    row->PositionSelf(top, 0, kListWidth);
    return row;
  }

  // Moves the edit line (as the list does when the player moves).
  void SetEditTime(TickTime sequenceTime, EffectItem& row) {
    *editTime = sequenceTime;
    row.RecursiveSynchToTime(false);
  }

  void Click(Point point, KeyModifiers modifiers = kKeyModifierNone) {
    host.MouseDown(MouseButton::kLeft, point, modifiers);
    host.MouseUp(MouseButton::kLeft, point, modifiers);
  }

  // A left-button drag: press, `steps` moves along the way, release.
  void Drag(Point from, Point to, int steps) {
    host.MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
    for (int i = 1; i <= steps; ++i) {
      host.MouseMove({from.x + (to.x - from.x) * i / steps, from.y + (to.y - from.y) * i / steps},
                     kKeyModifierNone);
    }
    host.MouseUp(MouseButton::kLeft, to, kKeyModifierNone);
  }

  std::vector<std::string> UndoNames() { return project->GetUndoStack().GetUndoNames(); }
  bool Undo() { return project->GetUndoStack().Undo(); }
  bool Redo() { return project->GetUndoStack().Redo(); }

  static inline const StationName kStation = "Test.ListStation";
  static constexpr int kListWidth = 400;

  MessagingTestScope messaging;
  ProjectBuilder builder{"Rows"};
  ProjectRef project = builder.GetProject();
  SequenceRef sequence = builder.AddSequence("Sequence");
  TrackRef track = builder.AddTrack(sequence, MediaType::Video, "V1");
  TrackItemRef clip = builder.AddClip(track, nullptr,
                                      {.start = 10 * kSecond,
                                       .end = 20 * kSecond,
                                       .mediaIn = 5 * kSecond,
                                       .withIntrinsics = false});
  ComponentRef effect = builder.AddComponent(
      clip->GetComponentChain(),
      Component::Create("XO.Test Effect", "Test Effect", MediaType::Video, false));
  std::shared_ptr<TickTime> editTime = std::make_shared<TickTime>(0);
  ViewHost host{{kListWidth, 300}};
  std::shared_ptr<SubView> listView = std::make_shared<SubView>();
};
