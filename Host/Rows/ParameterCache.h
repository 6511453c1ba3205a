#pragma once

#include <cstddef>
#include <memory>
#include <vector>

class Commander;
class HotFloatControl;
class ViewBase;

// Lends number fields (HotFloatControl) to parameter rows and takes them back, so that rows
// made and dropped at every rebuild of the list reuse the views they had instead of making new
// ones. A lent field is a hidden child of the list view, commanded by the borrower; a returned
// field stays a hidden child of its view, reset to a plain field, until a row of the same view
// borrows it again. The cache owns nothing: a view owns its fields and they go with it.
// UI thread only.
class ParameterCache {
 public:
  ParameterCache() = default;
  ParameterCache(const ParameterCache&) = delete;
  ParameterCache& operator=(const ParameterCache&) = delete;

  // A field in `parent` (hidden, enabled, value 0, linear, unbounded, two digits, cookie 0)
  // whose commands go to `superCommander` (the parent when null).
  std::shared_ptr<HotFloatControl> CreateHotFloat(ViewBase& parent,
                                                  Commander* superCommander = nullptr);
  // Takes back a field made by CreateHotFloat. The borrower stops listening to its station
  // first. A field without a parent is destroyed.
  void ReturnHotFloat(const std::shared_ptr<HotFloatControl>& field);

  // Fields waiting to be lent again (those whose view still lives).
  std::size_t GetIdleCount();

 private:
  struct Entry {
    ViewBase* parent;               // not owned; compared only while `alive` holds
    std::weak_ptr<ViewBase> alive;  // the parent view
    std::weak_ptr<HotFloatControl> field;
  };
  void Purge();

  std::vector<Entry> mIdle;
};
