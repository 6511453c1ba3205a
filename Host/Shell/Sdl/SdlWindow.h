#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "Host/Toolkit/Geometry.h"

class Image;
class ScriptInputRoute;
class SdlModal;
class ViewHost;

// The interactive front end: an SDL2 window that shows a view host's image and feeds it the
// window's input. It repaints on invalidation: each pump renders the host's dirty region and
// copies the painted rectangles into a streaming texture. Mouse buttons, moves and wheel
// (with the modifiers held), keys, text input and resizes go to the host; closing the window
// ends the loop. Posted messages (MessageLoop) run between events.
//
// One window at a time: it owns SDL's video subsystem for its lifetime. UI thread only.
class SdlWindow {
 public:
  // Opens a window of the host's size. Null, with `error` filled, when there is no display or
  // SDL cannot make the window or its renderer. The host must outlive the window.
  static std::unique_ptr<SdlWindow> Open(ViewHost& host, const std::string& title,
                                         std::string* error = nullptr);
  ~SdlWindow();
  SdlWindow(const SdlWindow&) = delete;
  SdlWindow& operator=(const SdlWindow&) = delete;

  // Handles every queued event, delivers posted messages, repaints what is invalid. Waits up to
  // `timeoutMs` for an event when there is nothing else to do. False once the window is closed.
  bool Pump(int timeoutMs = 0);
  // Pumps until the window is closed.
  void Run();
  bool IsClosed() const;
  // Queues the window's close event, as the window manager's close button does.
  void RequestClose();
  // Asked before the window closes (its close button, RequestClose, the system's quit); false
  // keeps it open. Without one the window always closes.
  void SetCloseGuard(std::function<bool()> guard);
  void SetTitle(const std::string& title);
  // Asked after every pump; the window takes a title that changed.
  void SetTitleSource(std::function<std::string()> source);
  // A message box over the window, for what a person must read (a failed save).
  void ShowMessage(const std::string& title, const std::string& text);

  // Shows `modal` over the window and gives it every event until it is done (a nested loop:
  // posted messages and repaints go on meanwhile). False when the window was closed first.
  bool RunModal(SdlModal& modal);

  // Input sent through SDL's event queue, so that it takes the same path as the user's; each
  // call returns once the event has been handled. Owned by the window.
  ScriptInputRoute& GetInputRoute();

  // What the window shows now, read back from the renderer (an empty image on failure).
  Image ReadBack() const;
  Size GetSize() const;
  // SDL's id of the window (events carry it).
  std::uint32_t GetWindowID() const;

 private:
  struct Impl;
  explicit SdlWindow(std::unique_ptr<Impl> impl);

  std::unique_ptr<Impl> mImpl;
};
