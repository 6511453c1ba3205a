#pragma once

#include "Host/Messaging/Listener.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Toolkit/SubView.h"

class Application;

// The workspace's program monitor: the active sequence's picture at the edit line, rendered by
// the host's FrameRenderer. It follows the edit line (playback included), every edit (values,
// keyframes, effects, undo) and the active sequence. Owned by the workspace frame (a child
// view). UI thread only.
class ProgramMonitorView : public SubView, public Listener {
 public:
  explicit ProgramMonitorView(Application& application);
  ~ProgramMonitorView() override;

  // Where the sequence's frame is drawn, in local coordinates (empty without a sequence).
  Rect GetFrameRect() const;

  void PaintSelf(DC& dc) override;
  void SetBoundsSelf(const Rect& bounds) override;

  // --- Listener ---
  void ListenToMessage(const Message& message) override;

 private:
  // Listens to what the picture shows: the sequence, its player, the project's history and the
  // effect chains of its video clips.
  void ListenTo(const SequenceRef& sequence);

  Application& mApplication;
  SequenceRef mListened;        // the sequence ListenTo was last given
  bool mListeningStale = true;  // the sequence's structure changed since: other chains
};
