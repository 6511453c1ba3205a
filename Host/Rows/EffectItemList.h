#pragma once

#include <cstddef>
#include <functional>
#include <memory>
#include <vector>

class EffectItem;

// The top rows of one section of the effect list (video, graphics, one audio part), in display
// order. The list owns its rows: Clear and the destructor Destroy them (last to first) before
// letting go, so their controls leave the list view. UI thread only.
class EffectItemList {
 public:
  using Row = std::shared_ptr<EffectItem>;
  using const_iterator = std::vector<Row>::const_iterator;

  EffectItemList() = default;
  EffectItemList(const EffectItemList&) = delete;
  EffectItemList& operator=(const EffectItemList&) = delete;
  EffectItemList(EffectItemList&&) noexcept = default;
  EffectItemList& operator=(EffectItemList&& other) noexcept;
  ~EffectItemList();

  // Appends `row` (null is refused with a debug assertion; a row already in the list is not
  // added twice).
  void AddItem(Row row);
  // Inserts at `index` (clamped to the end).
  void InsertItem(std::size_t index, Row row);
  // Takes `row` out without destroying it; false when it is not a top row here.
  bool RemoveItem(const EffectItem& row);
  // Destroys every row, last to first, and empties the list.
  void Clear();

  bool IsEmpty() const { return mRows.empty(); }
  std::size_t Size() const { return mRows.size(); }
  const Row& At(std::size_t index) const { return mRows.at(index); }
  const Row& operator[](std::size_t index) const { return mRows[index]; }
  const Row& Front() const { return mRows.front(); }
  const_iterator begin() const { return mRows.begin(); }
  const_iterator end() const { return mRows.end(); }
  const std::vector<Row>& GetRows() const { return mRows; }

  // Position of a top row; -1 when it is not one.
  int IndexOf(const EffectItem& row) const;
  // Sum of the heights of the rows that are not set aside.
  int TotalHeight() const;
  // Every row of the section, depth first in display order, set-aside rows included; the
  // visitor returns false to stop the walk. Returns false when it was stopped.
  bool ForEachRow(const std::function<bool(const Row&)>& visit) const;
  // The deepest shown row whose own band (top to top + OwnHeight) holds `y`; null for none.
  Row FindRowAt(int y) const;

 private:
  std::vector<Row> mRows;
};
