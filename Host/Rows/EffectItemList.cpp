#include "Host/Rows/EffectItemList.h"

#include <algorithm>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Rows/EffectItem.h"

namespace {

bool VisitRow(const EffectItemList::Row& row,
              const std::function<bool(const EffectItemList::Row&)>& visit) {
  if (!visit(row)) {
    return false;
  }
  for (const auto& child : row->GetItems()) {
    if (!VisitRow(child, visit)) {
      return false;
    }
  }
  return true;
}

EffectItemList::Row FindShownRowAt(const EffectItemList::Row& row, int y) {
  if (!row->IsShown() || row->IsSetAside()) {
    return nullptr;
  }
  if (y >= row->GetTop() && y < row->GetTop() + row->OwnHeight()) {
    return row;
  }
  if (row->IsExpanded()) {
    for (const auto& child : row->GetItems()) {
      if (auto hit = FindShownRowAt(child, y)) {
        return hit;
      }
    }
  }
  return nullptr;
}

}  // namespace

EffectItemList& EffectItemList::operator=(EffectItemList&& other) noexcept {
  if (this != &other) {
    Clear();
    mRows = std::move(other.mRows);
  }
  return *this;
}

EffectItemList::~EffectItemList() {
  Clear();
}

void EffectItemList::AddItem(Row row) {
  InsertItem(mRows.size(), std::move(row));
}

void EffectItemList::InsertItem(std::size_t index, Row row) {
  if (!HOST_VERIFY(row != nullptr, "Invalid row")) {
    return;
  }
  if (std::find(mRows.begin(), mRows.end(), row) != mRows.end()) {
    return;
  }
  index = std::min(index, mRows.size());
  mRows.insert(mRows.begin() + static_cast<std::ptrdiff_t>(index), std::move(row));
}

bool EffectItemList::RemoveItem(const EffectItem& row) {
  const auto it =
      std::find_if(mRows.begin(), mRows.end(), [&](const Row& r) { return r.get() == &row; });
  if (it == mRows.end()) {
    return false;
  }
  mRows.erase(it);
  return true;
}

void EffectItemList::Clear() {
  // Taken out first: a row's Destroy may run code that looks at this list.
  std::vector<Row> rows = std::move(mRows);
  mRows.clear();
  for (auto it = rows.rbegin(); it != rows.rend(); ++it) {
    (*it)->Destroy();
  }
}

int EffectItemList::IndexOf(const EffectItem& row) const {
  for (std::size_t i = 0; i < mRows.size(); ++i) {
    if (mRows[i].get() == &row) {
      return static_cast<int>(i);
    }
  }
  return -1;
}

int EffectItemList::TotalHeight() const {
  int height = 0;
  for (const auto& row : mRows) {
    if (!row->IsSetAside()) {
      height += row->Height();
    }
  }
  return height;
}

bool EffectItemList::ForEachRow(const std::function<bool(const Row&)>& visit) const {
  for (const auto& row : mRows) {
    if (!VisitRow(row, visit)) {
      return false;
    }
  }
  return true;
}

EffectItemList::Row EffectItemList::FindRowAt(int y) const {
  for (const auto& row : mRows) {
    if (auto hit = FindShownRowAt(row, y)) {
      return hit;
    }
  }
  return nullptr;
}
