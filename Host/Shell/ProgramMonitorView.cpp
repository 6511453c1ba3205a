#include "Host/Shell/ProgramMonitorView.h"

#include "Host/Messaging/Station.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Shell/Application.h"
#include "Host/Shell/FrameRenderer.h"
#include "Host/Shell/ShellMessages.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Image.h"

ProgramMonitorView::ProgramMonitorView(Application& application) : mApplication(application) {
  AddListener(kSequenceActivationStation, *this);
}

ProgramMonitorView::~ProgramMonitorView() {
  RemoveListenerFromAllStations(*this);
}

void ProgramMonitorView::ListenToMessage(const Message& message) {
  if (message.Is<SequenceChangedMessage>())
    mListeningStale = true;
  Invalidate();
}

void ProgramMonitorView::ListenTo(const SequenceRef& sequence) {
  mListened = sequence;
  mListeningStale = false;
  RemoveListenerFromAllStations(*this);
  AddListener(kSequenceActivationStation, *this);
  if (sequence == nullptr)
    return;
  AddListener(sequence->GetStation(), *this);
  AddListener(sequence->GetPlayerStation(), *this);
  if (const ProjectRef& project = mApplication.GetProject())
    AddListener(project->GetStation(), *this);
  // Values change while a user scrubs, before the step is recorded.
  for (const TrackRef& track : sequence->GetVideoTracks()) {
    for (const TrackItemRef& item : track->GetItems()) {
      if (item->GetComponentChain() != nullptr)
        AddListener(item->GetComponentChain()->GetStation(), *this);
    }
  }
}

Rect ProgramMonitorView::GetFrameRect() const {
  const SequenceRef sequence = mApplication.GetActiveSequence();
  return sequence != nullptr ? FrameRenderer::FrameRect(*sequence, GetSize()) : Rect{};
}

void ProgramMonitorView::SetBoundsSelf(const Rect& /*bounds*/) {
  Invalidate();
}

void ProgramMonitorView::PaintSelf(DC& dc) {
  const SequenceRef sequence = mApplication.GetActiveSequence();
  if (sequence != mListened || mListeningStale)
    ListenTo(sequence);
  const Size size = GetSize();
  if (sequence == nullptr || size.width <= 0 || size.height <= 0) {
    dc.FillRect({0, 0, size.width, size.height}, Color(0, 0, 0));
    return;
  }
  const Image frame = FrameRenderer::Render(*sequence, sequence->GetCurrentTime(), size);
  dc.DrawImage(frame, Point{0, 0});
}
