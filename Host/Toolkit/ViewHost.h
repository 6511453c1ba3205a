#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Host/Toolkit/Color.h"
#include "Host/Toolkit/Commander.h"
#include "Host/Toolkit/DropEffect.h"
#include "Host/Toolkit/Events.h"
#include "Host/Toolkit/Geometry.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/Region.h"

class DataObject;
class DragDrop;
class PersistentToolTip;
class ShortcutManager;
class ViewBase;

// A window's content: owns the root of a view tree, routes the window's input to the views,
// collects the areas they invalidate and paints them into an image (what a front end shows,
// or what the program writes out headless). It is the view tree's root commander.
//
// Input arrives in window coordinates (logical pixels). Mouse events go to the view that
// captured the mouse, else to the deepest visible view under the pointer; a disabled target
// swallows them. Keys go to the target commander and up its chain; a key nobody takes is looked
// up in the shortcut manager and sent as a command. Every view is kept alive while one of its
// hooks runs. UI thread only.
class ViewHost : public Commander {
 public:
  using Presenter = std::function<void(const Image& image, const Region& painted)>;

  // `scale`: device pixels per logical pixel of the image.
  explicit ViewHost(Size size, double scale = 1.0, Commander* superCommander = nullptr);
  ~ViewHost() override;

  // The root fills the window; it runs FinishCreate when it arrives. A previous root is
  // released (not destroyed). Null leaves the window empty.
  void SetRootView(std::shared_ptr<ViewBase> root);
  ViewBase* GetRootView() const { return mRoot.get(); }
  // Resizes the image and the root view and invalidates everything.
  void Resize(Size size);
  Size GetSize() const { return mSize; }

  // --- Input (window coordinates) ---
  // clickCount: 1 for a single press, 2 for the second press of a double click, ...
  void MouseDown(MouseButton button, Point point, KeyModifiers modifiers, int clickCount = 1);
  void MouseUp(MouseButton button, Point point, KeyModifiers modifiers);
  void MouseMove(Point point, KeyModifiers modifiers);
  // The pointer left the window.
  void MouseExit();
  // True when a view took the event.
  bool MouseWheel(const WheelEvent& event);
  bool MouseMagnify(const MagnifyEvent& event);
  bool MousePan(const PanEvent& event);
  // True when the key was taken (by a view, or as a shortcut, even a disabled one).
  bool KeyDown(const KeyEvent& event);
  bool TextInput(std::string_view utf8);
  // A modifier key alone went down or up: refreshes the cursor under the pointer.
  void ModifiersChanged(KeyModifiers modifiers);
  // Sends `command` to the target and up its chain; true when handled.
  bool DoCommand(CommandID command);
  // The status as the target's chain reports it (disabled when nobody answers).
  CommandStatus GetCommandStatus(CommandID command);

  // --- Pointer state ---
  ViewBase* GetCaptureView() const;
  std::optional<Point> GetMousePoint() const { return mMousePoint; }
  // How long the pointer rests on a view before its tool tip shows (ViewBase::SetToolTip).
  static constexpr int kToolTipDelayMilliseconds = 600;
  // The tool tip shown now, or null.
  const PersistentToolTip* GetShownToolTip() const { return mToolTip.get(); }
  bool IsMouseButtonDown() const { return mButtonsDown != 0; }
  // The deepest visible view under `point` (window coordinates), or null.
  ViewBase* GetViewAt(Point point) const;

  // --- Painting ---
  void InvalidateAll();
  // Window coordinates; clipped to the window.
  void InvalidateWindowRect(const Rect& rect);
  const Region& GetDirtyRegion() const { return mDirty; }
  // Paints the dirty region (background, then the views, clipped to it) into the image,
  // clears it, hands the image to the presenter and returns what was painted. Invalidations
  // made while painting wait for the next call; a call from inside a paint does nothing.
  Region Render();
  const Image& GetImage() const { return mImage; }
  void SetBackgroundColor(Color color);
  void SetPresenter(Presenter presenter) { mPresenter = std::move(presenter); }
  bool IsRendering() const { return mRendering; }

  // --- Drag and drop ---
  // Starts an in-process drag of `data` offering `allowedEffects`. From now on pointer moves
  // go to the drop targets under the pointer (DragEnterSelf, DragOverSelf, DragLeaveSelf);
  // the next left-button release drops (DropSelf) and Escape or CancelDrag cancels. At the end
  // the source view (when given and alive) gets DragFinishedSelf and `onFinished` the effect.
  // The drag is routed at once at the last pointer position. False (nothing started) when a
  // drag is running or `data` is null. Starting a drag ends any mouse capture.
  bool StartDrag(std::shared_ptr<const DataObject> data, DropEffect allowedEffects,
                 std::weak_ptr<ViewBase> source = {},
                 std::function<void(DropEffect)> onFinished = {});
  bool IsDragging() const { return mDrag != nullptr; }
  void CancelDrag();
  // The running drag, or null.
  const DragDrop* GetDrag() const { return mDrag.get(); }

  // The shortcuts for keys nobody took; the process-wide manager unless one is set (not owned;
  // it must outlive this host or be reset to null first).
  void SetShortcutManager(ShortcutManager* manager) { mShortcuts = manager; }
  ShortcutManager& GetShortcutManager() const;

 private:
  friend class ViewBase;

  std::shared_ptr<ViewBase> CapturedView() const;
  std::shared_ptr<ViewBase> HitView(Point point) const;
  std::shared_ptr<ViewBase> MouseTarget(Point point) const;
  void NoteInput(Point point, KeyModifiers modifiers);
  void SetCapture(ViewBase& view);
  void ReleaseCapture(ViewBase& view);
  // Ends the capture for a reason other than the view's own release and tells the view.
  void TakeCaptureAway();
  static void NotifyCaptureLost(const std::shared_ptr<ViewBase>& view);
  // Forgets capture, hover and drop target when they lie in `branch`.
  void ForgetViewsIn(ViewBase& branch);
  void UpdateHover(const std::shared_ptr<ViewBase>& view);
  void UpdateCursor(const std::shared_ptr<ViewBase>& view, Point point, KeyModifiers modifiers);
  void FocusOnClick(ViewBase& view);
  void FinishDrag(Point point, KeyModifiers modifiers);
  // Schedules the tip of `view` (or its nearest ancestor with one) at `point` (window), or
  // takes the shown one down when the pointer moved to another tip or to none.
  void UpdateToolTip(const std::shared_ptr<ViewBase>& view, Point point);
  void HideToolTip();

  Size mSize;
  double mScale = 1.0;
  Image mImage;
  Color mBackground{35, 35, 35};
  std::shared_ptr<ViewBase> mRoot;
  Region mDirty;  // window coordinates
  bool mRendering = false;
  Presenter mPresenter;

  std::weak_ptr<ViewBase> mCapture;
  std::weak_ptr<ViewBase> mHover;
  std::optional<Point> mMousePoint;
  std::uint32_t mButtonsDown = 0;  // bit per MouseButton
  std::unique_ptr<DragDrop> mDrag;
  ShortcutManager* mShortcuts = nullptr;  // not owned; null = ShortcutManager::Instance()
  // The tip's view is a child of mRoot, so the tip goes first.
  std::unique_ptr<PersistentToolTip> mToolTip;
  std::weak_ptr<ViewBase> mToolTipView;  // whose tip is shown or pending
  std::string mToolTipText;
  std::uint64_t mToolTipTimer = 0;  // RepeatTimer id, 0 when none is pending
};
