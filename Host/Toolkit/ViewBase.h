#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Toolkit/Commander.h"
#include "Host/Toolkit/DropEffect.h"
#include "Host/Toolkit/Events.h"
#include "Host/Toolkit/Geometry.h"

class DataObject;
class DC;
class Image;
class ViewHost;

// A rectangle of the window that paints itself and receives input: a node of a view tree. A
// parent owns its children (std::shared_ptr); a child points back to its parent without owning
// it. The tree's root is owned by a ViewHost, which routes input to the views, collects what
// they invalidate and paints them.
//
// Coordinates: GetBounds() is in the parent's coordinates; every hook receives points in the
// view's own coordinates (0, 0 at its top-left corner), also points outside the view (a view
// that captured the mouse gets every mouse event).
//
// Views are commanders: a view's super commander is its parent unless one was given at
// construction, so commands and keys travel from the focused view (the target) up to the
// window. Views must be owned by a std::shared_ptr (std::make_shared) before they join a tree;
// while a hook runs, the view is kept alive, so a handler may destroy or release its own view.
// UI thread only.
class ViewBase : public Commander, public std::enable_shared_from_this<ViewBase> {
 public:
  ~ViewBase() override;

  // --- Tree ---
  ViewBase* GetParent() const { return mParent; }
  const std::vector<std::shared_ptr<ViewBase>>& GetChildren() const { return mChildren; }
  // Adopts `child` on top of its new siblings, taking it from its previous parent or host.
  // Runs the child's FinishCreate the first time it is adopted. Adopting an ancestor, itself
  // or null is refused with a debug assertion.
  void AddChild(std::shared_ptr<ViewBase> child);
  // Lets go of `child` (no-op when it is not a child); it lives on while others hold it.
  // Mouse capture, hover and focus inside it are dropped (focus goes to this view).
  std::shared_ptr<ViewBase> RemoveChild(ViewBase& child);
  void RemoveFromParent();
  // True when `view` is this view or lies below it.
  bool Contains(const ViewBase& view) const;
  ViewBase& GetRootView();
  // The host of this view's tree; null when the tree is not in a window.
  ViewHost* GetHost() const;

  // --- Geometry ---
  const Rect& GetBounds() const { return mBounds; }
  Rect GetLocalBounds() const { return Rect::FromSize(0, 0, mBounds.Width(), mBounds.Height()); }
  Size GetSize() const { return mBounds.GetSize(); }
  // A rect with negative width or height is taken as empty. Invalidates the old and the new
  // area, then calls SetBoundsSelf.
  void SetBounds(const Rect& bounds);
  void MoveTo(Point topLeft);
  void Resize(Size size);
  Point LocalToParent(Point point) const { return point + mBounds.TopLeft(); }
  Point ParentToLocal(Point point) const { return point - mBounds.TopLeft(); }
  Point LocalToWindow(Point point) const;
  Point WindowToLocal(Point point) const;
  Rect LocalToWindow(const Rect& rect) const;

  // --- Visibility and enabling ---
  // Views start visible and enabled. Hiding drops mouse capture and hover inside the view and
  // moves the focus out of it (to its super commander).
  void Show();
  void Hide();
  void SetVisible(bool visible);
  bool IsVisible() const { return mVisible; }
  // Visible with all its ancestors, in a window.
  bool IsShown() const;
  // A disabled view (or one below a disabled view) receives no mouse or key input; clicks on
  // it go nowhere.
  void Enable() { SetEnabled(true); }
  void Disable() { SetEnabled(false); }
  void SetEnabled(bool enabled);
  bool IsEnabled() const { return mEnabled; }
  bool IsEnabledInTree() const;

  // --- Painting ---
  // Marks the area (local coordinates, clipped to the view and its ancestors) for the next
  // paint. Nothing happens while the view is not shown.
  void Invalidate();
  void InvalidateRect(const Rect& rect);
  // Paints what is invalid in the window now (no-op outside a window or during a paint).
  void UpdateNow();
  void Redraw() {
    Invalidate();
    UpdateNow();
  }
  // Paints the view and its children into an offscreen image first, then draws that image.
  void SetDoubleBuffered(bool doubleBuffered);
  bool IsDoubleBuffered() const { return mDoubleBuffered; }

  // --- Mouse ---
  // While captured, every mouse event of the window goes to this view. Capturing needs the
  // view to be shown; the capture ends on release, hide, removal or destruction.
  void CaptureMouse();
  void ReleaseMouse();
  bool HasMouseCapture() const;
  // The pointer's last position in local coordinates; nullopt outside a window or when the
  // pointer left it.
  std::optional<Point> GetMouseLocation() const;
  // The deepest visible view under `point` (local coordinates): this view, a descendant or null.
  ViewBase* FindViewAt(Point point);
  // Whether `point` (local) belongs to this view; the default is its local bounds.
  virtual bool HitTestSelf(Point point) const;
  // A view that takes focus on click becomes the target when a click lands on it or below it,
  // unless the focus already is at or below it.
  void SetTakesFocusOnClick(bool takesFocus) { mTakesFocusOnClick = takesFocus; }
  bool TakesFocusOnClick() const { return mTakesFocusOnClick; }

  // --- Tool tips ---
  // The window shows the tip of the deepest view under a resting pointer that has one, after
  // ViewHost::kToolTipDelay, and takes it down when the pointer leaves that view or a button
  // goes down. `text` may be a "$$$/" key; empty for none.
  void SetToolTip(std::string text);
  const std::string& GetToolTip() const { return mToolTip; }
  // The tip at `point` (local); views whose parts have tips of their own override it. The
  // default is the text given to SetToolTip.
  virtual std::string GetToolTipSelf(Point point) const;

  // Confirms input the view holds and has not applied yet (typed text), as losing the focus
  // does; owners call it before the view goes away. The default holds none.
  virtual void CommitPendingInput() {}

  // --- Drag and drop ---
  // A drop target receives the drag hooks for drags over it and over descendants that are no
  // drop targets themselves.
  void SetAcceptsDrops(bool acceptsDrops) { mAcceptsDrops = acceptsDrops; }
  bool AcceptsDrops() const { return mAcceptsDrops; }
  // Starts dragging `data` from this view (see ViewHost::StartDrag): the following pointer
  // moves go to the drop targets under the pointer and the button release drops; the outcome
  // arrives in DragFinishedSelf. False when the view is not in a window or a drag is running.
  bool DoDragDrop(std::shared_ptr<const DataObject> data, DropEffect allowedEffects);

  // --- Menus ---
  // Shows the menu resource `menuName` at `point` (local) through the installed menu tracker
  // and sends the chosen command from this view up the chain. The chosen command, or nullopt.
  std::optional<CommandID> TrackPopupMenu(std::string_view menuName, Point point);

  // --- Life cycle ---
  // Runs FinishCreateSelf once; adoption by a parent or a host calls it.
  void FinishCreate();
  bool IsCreated() const { return mCreated; }
  // Tears the view down once: DestroySelf, then the children last to first, then it leaves
  // its parent (or host) and the commander chain. Safe from the view's own hooks.
  void Destroy();
  bool IsDestroyed() const { return mDestroyed; }

  // --- Hooks ---
  virtual void FinishCreateSelf() {}
  virtual void DestroySelf() {}
  // After the bounds changed; `bounds` in parent coordinates.
  virtual void SetBoundsSelf(const Rect& /*bounds*/) {}
  virtual void ShowSelf() {}
  virtual void HideSelf() {}
  // Local coordinates; the clip box is the part to paint. Children paint afterwards, on top.
  virtual void PaintSelf(DC& /*dc*/) {}
  virtual void LeftButtonDownSelf(Point /*point*/, KeyModifiers /*modifiers*/) {}
  // The second and later press of a multi-click; the default treats it as a press.
  virtual void LeftButtonMultiClickSelf(Point point, KeyModifiers modifiers, int /*clickCount*/) {
    LeftButtonDownSelf(point, modifiers);
  }
  virtual void LeftButtonUpSelf(Point /*point*/, KeyModifiers /*modifiers*/) {}
  virtual void RightButtonDownSelf(Point /*point*/, KeyModifiers /*modifiers*/) {}
  virtual void RightButtonUpSelf(Point /*point*/, KeyModifiers /*modifiers*/) {}
  virtual void MouseMoveSelf(Point /*point*/, KeyModifiers /*modifiers*/) {}
  // The capture ended without the view's own ReleaseMouse: another view captured, the view
  // was hidden or removed, or a drag started. A drag in progress rolls back here; the view
  // no longer has the capture when this runs. Not called while the view is destroyed.
  virtual void MouseCaptureLostSelf() {}
  // The pointer left the view (or went to a child of it) while nothing was captured.
  virtual void MouseLeaveSelf() {}
  // Asked before each uncaptured mouse move, from the view under the pointer up to the root;
  // true when it set the cursor (SetCurrentCursor). When no view sets one, the arrow is shown.
  virtual bool SetCursorSelf(Point /*point*/, KeyModifiers /*modifiers*/) { return false; }
  // Wheel and gestures go to the view under the pointer and up its parents until one returns
  // true. The event's point is in the receiving view's coordinates.
  virtual bool MouseWheelSelf(const WheelEvent& /*event*/) { return false; }
  virtual bool MouseMagnifySelf(const MagnifyEvent& /*event*/) { return false; }
  virtual bool MousePanSelf(const PanEvent& /*event*/) { return false; }
  // Drop targets: the effect the drop would have (kDropEffectNone: no drop here).
  virtual DropEffect DragEnterSelf(const DataObject& /*data*/, KeyModifiers /*modifiers*/,
                                   Point /*point*/) {
    return kDropEffectNone;
  }
  virtual DropEffect DragOverSelf(const DataObject& /*data*/, KeyModifiers /*modifiers*/,
                                  Point /*point*/) {
    return kDropEffectNone;
  }
  virtual void DragLeaveSelf() {}
  // True when the data was taken.
  virtual bool DropSelf(const DataObject& /*data*/, DropEffect /*effect*/, Point /*point*/) {
    return false;
  }
  // Drag sources: the drag this view started ended with `effect` (none: cancelled or refused).
  virtual void DragFinishedSelf(DropEffect /*effect*/) {}

 protected:
  // The view's super commander defaults to its parent; pass one to route commands elsewhere.
  explicit ViewBase(Commander* superCommander = nullptr);

  std::shared_ptr<const void> KeepAliveForDispatch() const override;

 private:
  friend class ViewHost;

  void PaintTree(DC& dc);
  void PaintContent(DC& dc);
  // Drops the host's references (capture, hover, drop target) into this branch.
  void LeaveHostState();

  ViewBase* mParent = nullptr;  // not owned: the parent owns this view and clears it on release
  ViewHost* mHost = nullptr;    // roots only; not owned: the host owns this view and clears it
  std::vector<std::shared_ptr<ViewBase>> mChildren;  // bottom to top
  Rect mBounds;
  bool mVisible = true;
  bool mEnabled = true;
  bool mDoubleBuffered = false;
  bool mAcceptsDrops = false;
  bool mTakesFocusOnClick = false;
  std::string mToolTip;
  bool mCreated = false;
  bool mDestroying = false;
  bool mDestroyed = false;
  std::unique_ptr<Image> mBackBuffer;  // double buffering only
  Size mBackBufferSize;
  double mBackBufferScale = 0.0;
};
