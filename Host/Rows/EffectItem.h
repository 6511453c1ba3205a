#pragma once

#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Message.h"
#include "Host/Messaging/Station.h"
#include "Host/Time/TickTime.h"
#include "Host/Time/TimePoint.h"
#include "Host/Toolkit/Color.h"
#include "Host/Toolkit/Geometry.h"

class DC;
class DisclosureTriangle;
class Font;
class ViewBase;

// A row opened or closed its disclosure triangle; broadcast on the row's station (the list's
// own station) so that the list lays its rows out again.
struct EffectControlsDisclosureStateChanged : MessageOf<EffectControlsDisclosureStateChanged> {
  static constexpr std::string_view kTypeName = "EffectControlsDisclosureStateChanged";
};

// The user asked to open or close every row at once (Alt-click on a triangle).
struct DisclosureStateAllChanged : MessageOf<DisclosureStateAllChanged> {
  static constexpr std::string_view kTypeName = "DisclosureStateAllChanged";
  explicit DisclosureStateAllChanged(bool e) : expanded(e) {}
  bool expanded;
};

// One row of the effect list: an effect, a group, a parameter, a transition. Rows form a tree:
// a section list (EffectItemList) owns its top rows, each row owns its children. A row's
// controls are child views of the list view (the row's parent view) and are placed by
// PositionSelf; the list paints the row's name and separators and then lets the row paint the
// surroundings of its controls (PaintSelf).
//
// Geometry is in the parent view's coordinates. A row's Height() covers its own band and, while
// it is expanded, the children that are not set aside; PositionSelf places the children under
// the row's own band.
//
// Life cycle: construct (held by std::shared_ptr), AddItem into a parent or a section list,
// FinishCreateSelf (creates the controls; also runs for children, and for children added later),
// Show/Hide/PositionSelf as the list lays out, and Destroy before the last owner lets go (the
// list's ClearList). Destroy removes the row's controls from the parent view and destroys the
// children; it is idempotent. UI thread only.
class EffectItem : public Listener, public std::enable_shared_from_this<EffectItem> {
 public:
  // Row geometry shared by every row and by the list that paints them.
  static constexpr int kIndentPerGroupLevel = 17;
  static constexpr int kTitleOffset = 37;         // name starts at the indent + this
  static constexpr int kFolderTitleHeight = 21;   // an effect or group row's own band
  static constexpr int kParameterRowHeight = 20;  // a collapsed parameter row
  static constexpr int kTriangleSize = 16;

  // `parentView`: the list view the row's controls live in; not owned (the list view owns the
  // row through its section lists and destroys it before going away). May be null for rows
  // that never show controls (tests, placeholders). `station`: where the row reports layout
  // changes (the list's own station).
  EffectItem(ViewBase* parentView, std::string name, StationName station);
  ~EffectItem() override;

  // --- Messages ---
  // Handles the row's disclosure triangle; other messages are ignored here.
  void ListenToMessage(const Message& message) override;

  // --- Life cycle ---
  // Creates the row's controls (the base: its disclosure triangle when the row can expand) and
  // finishes the children. Runs once; later calls do nothing.
  virtual void FinishCreateSelf();
  // Tears the row down: stops listening, destroys its controls and its children. Idempotent;
  // the row must not be shown or positioned afterwards.
  virtual void Destroy();
  bool IsCreated() const { return mCreated; }
  bool IsDestroyed() const { return mDestroyed; }
  // The controls the row adopted into its parent view (AdoptControl) and has not destroyed, in
  // the order they were made. For inspection (state dumps); the row keeps owning them.
  std::vector<std::shared_ptr<ViewBase>> GetControls() const;
  // Applies what the row's controls hold unconfirmed (typed text), as one undo step each; Destroy
  // does it first, while the row still hears its controls.
  virtual void CommitPendingInput();

  // --- Tree ---
  // Appends `child` (ignored when null, this row, or already someone's child). The child gets
  // this row as parent; if this row is finished, so is the child; it is shown or hidden to
  // match this row.
  void AddItem(std::shared_ptr<EffectItem> child);
  const std::vector<std::shared_ptr<EffectItem>>& GetItems() const { return mItems; }
  bool HasItems() const { return !mItems.empty(); }
  // The row this one was added to; null for a section's top row.
  std::shared_ptr<EffectItem> GetParentItem() const { return mParentItem.lock(); }
  // The list view given at construction, or null once that view is gone.
  ViewBase* GetParentView() const;
  const StationName& GetStation() const { return mStation; }

  // --- What the row is (the list lays out, paints and hit-tests by these) ---
  virtual bool IsFilter() const { return false; }
  virtual bool IsFolder() const { return false; }
  virtual bool IsSelectable() const { return true; }
  virtual bool IsParameter() const { return false; }
  virtual bool IsCustom() const { return false; }
  virtual bool IsGroupBegin() const { return false; }
  virtual bool IsGenericGroup() const { return false; }
  virtual bool IsTransition() const { return false; }
  virtual bool CanTimeVary() const { return false; }
  virtual bool IsParamEnabled() const { return true; }
  virtual bool ShouldDrawDivider() const { return true; }
  virtual bool ShouldIndentTitleToCurrentLevel() const { return true; }
  // Whether the row has a disclosure triangle and can be opened; folders by default.
  virtual bool CanExpand() const { return IsFolder(); }

  // --- Name ---
  const std::string& GetName() const { return mName; }
  void SetName(std::string name) { mName = std::move(name); }

  // --- Group level and indent ---
  // The nesting level the build gives the row (the effect's base level plus group depth).
  void SetGroupLevel(int level);
  int GetGroupLevel() const { return mGroupLevel; }
  virtual int GetSubgroupLevel() const { return mGroupLevel; }
  virtual int GetIndentPerGroupLevel() const { return kIndentPerGroupLevel; }
  // Pixels from the row's left to the start of its level.
  virtual int GetGroupLevelIndentInPixels() const;
  // Where a parameter's controls measure from (custom areas, buttons).
  virtual int GetParameterIndentInPixels() const { return GetGroupLevelIndentInPixels(); }
  // The x where the name starts (view coordinates).
  int GetTitleLeft() const;
  // The x where the name must end (view coordinates); the row's controls start there.
  virtual int GetTitleRightEdge() const;

  // --- Visibility ---
  // Show makes the row's controls visible, and its children that are not set aside when the
  // row is expanded. Hide hides the row's controls and all children.
  virtual void Show();
  virtual void Hide();
  bool IsShown() const { return mShown; }
  // A set-aside row belongs to the tree but is never shown and takes no height (a parameter the
  // effect hides). Setting a shown row aside hides it; bringing one back shows it when its
  // parent is shown and expanded.
  void SetAside(bool aside);
  bool IsSetAside() const { return mSetAside; }

  // --- Expansion ---
  // Records the state and shows (not set aside) or hides the children to match.
  virtual void SetIsExpanded(bool expanded);
  bool IsExpanded() const { return mExpanded; }
  // This row and every row below it.
  void SetAllExpanded(bool expanded);
  // The user opened or closed the row: follow the triangle and tell the list
  // (EffectControlsDisclosureStateChanged on the row's station).
  void OnDisclosureStateChanged();

  // --- Selection ---
  void SetSelected(bool selected) { mSelected = selected; }
  bool IsSelected() const { return mSelected; }

  // --- Geometry ---
  // Places the row at `top` (view coordinates) across `width`; rows span the view from x 0.
  // `depth`: how deep the caller nests the row (0 for a section's top rows; a parent passes
  // its own depth + 1). The base places the triangle and lays the visible children out under
  // the row's own band.
  virtual void PositionSelf(int top, int depth, int width);
  // PositionSelf across the parent view's width (rows that size themselves to the view).
  virtual void PositionSelfUsingHostSize(int top, int depth);
  // The row's own band plus, while expanded, its expanded area and the heights of its children
  // that are not set aside. A set-aside row still answers its height; callers skip it.
  virtual int Height() const;
  // The row's own band (title, and controls shown beside it).
  virtual int OwnHeight() const { return IsFolder() ? kFolderTitleHeight : kParameterRowHeight; }
  // What an expanded row shows between its band and its children (a slider, graphs).
  virtual int GetExpandedAreaHeight() const { return 0; }
  int GetTop() const { return mTop; }
  int GetWidth() const { return mWidth; }
  int GetDepth() const { return mDepth; }
  int GetBottom() const { return mTop + Height(); }
  Rect GetRect() const { return Rect::FromSize(0, mTop, mWidth, Height()); }
  // The list view's visible vertical extent (view coordinates), given before each placement.
  void SetViewTopAndBottom(int viewTop, int viewBottom);
  int GetViewTop() const { return mViewTop; }
  int GetViewBottom() const { return mViewBottom; }
  // Rows with an area of their own (a custom user interface) that the list must not paint over.
  virtual bool HasCustomView() const { return false; }
  virtual Rect GetCustomViewRect() const { return {}; }
  virtual void SetCustomViewRect(const Rect& /*rect*/) {}

  // --- Painting (called by the list) ---
  // Draws the name inside `rect` (the list chose the rectangle and the colour).
  virtual void DrawTitle(DC& dc, const Rect& rect, const Font& font, Color color) const;
  // Paints what surrounds the row's controls (labels, frames) inside `rowRect`; the controls
  // paint themselves. The base paints nothing.
  virtual void PaintSelf(DC& dc, const Rect& rowRect);

  // --- Keyframes ---
  // Adds the keyframe times of the row (the base: of its children that are not set aside) to
  // `times`, on the given time line.
  virtual void GetKeyframeTimes(std::set<TickTime>& times, TimeLine line) const;

  // --- Model follow-up (recursive helpers the list calls) ---
  // Re-reads from the model whether parameter rows are set aside; true when any changed.
  bool RecursiveUpdateSetAside();
  // Re-reads the parameter rows' enabled state, name and visibility from the model; true when
  // any row's set-aside state changed.
  bool RecursiveUpdateParameterUI();
  // Tells every row that the edit time moved or the model changed (ParameterControl re-reads its
  // value); `force` re-reads even when the time did not change.
  void RecursiveSynchToTime(bool force);

 protected:
  // Hooks of the recursive helpers, for this row only. UpdateSetAside returns whether the row's
  // set-aside state changed.
  virtual bool UpdateSetAside() { return false; }
  virtual bool UpdateParameterUI() { return UpdateSetAside(); }
  virtual void SynchToTime(bool /*force*/) {}

  // Shows or hides the row's own controls (not the children); called by Show and Hide, and
  // again with true when a shown row opens or closes.
  virtual void ShowControls(bool /*show*/) {}
  // Where the disclosure triangle sits, relative to the row's left and top.
  virtual Point GetDisclosureTrianglePosition() const;
  DisclosureTriangle* GetDisclosureTriangle() const { return mTriangle.get(); }

  // Adds `view` to the parent view (hidden until the row is shown) and returns it; null when
  // the row has no parent view. The row keeps its own reference and destroys it in Destroy.
  template <class V>
  std::shared_ptr<V> AdoptControl(std::shared_ptr<V> view) {
    if (!AdoptView(view)) {
      return nullptr;
    }
    return view;
  }
  bool AdoptView(const std::shared_ptr<ViewBase>& view);
  // Destroys a control made by AdoptControl (null is ignored) and resets the reference.
  template <class V>
  static void DestroyControl(std::shared_ptr<V>& view) {
    if (view) {
      DestroyView(*view);
      view.reset();
    }
  }
  static void DestroyView(ViewBase& view);
  // Moves a control to `bounds` unless it is there already.
  static void PlaceView(ViewBase& view, const Rect& bounds);

  // Lays the visible children out one under the other from `top`; returns the y after them.
  int PositionChildren(int top, int depth, int width);
  // The children's total height (not set aside), as PositionChildren stacks them.
  int ChildrenHeight() const;

 private:
  void ShowChildren();
  void HideChildren();

  std::string mName;
  StationName mStation;
  ViewBase* mParentView;                     // not owned; see the constructor
  std::weak_ptr<ViewBase> mParentViewAlive;  // set when the view is shared-owned
  bool mTracksParentView = false;
  std::weak_ptr<EffectItem> mParentItem;
  std::vector<std::shared_ptr<EffectItem>> mItems;
  std::shared_ptr<DisclosureTriangle> mTriangle;
  // What AdoptControl gave the parent view; the subclasses' members own them.
  std::vector<std::weak_ptr<ViewBase>> mControls;

  int mGroupLevel = 0;
  int mTop = 0;
  int mWidth = 0;
  int mDepth = 0;
  int mViewTop = 0;
  int mViewBottom = 0;
  bool mCreated = false;
  bool mDestroyed = false;
  bool mShown = false;
  bool mSetAside = false;
  bool mExpanded = false;
  bool mSelected = false;
};
