#pragma once

#include <cstddef>
#include <vector>

#include "Host/Model/ModelRefs.h"

// The parameters the user selected in the effect list (by clicking their names), shared with
// the other panels through the host. Entries are unique by parameter; order is selection order.
class ParameterMultiSelection {
 public:
  struct Entry {
    ComponentRef component;
    ComponentParamRef param;
    TrackItemRef trackItem;  // null in master-clip mode
  };

  class Selection {
   public:
    bool IsEmpty() const { return mEntries.empty(); }
    std::size_t Size() const { return mEntries.size(); }
    const Entry& At(std::size_t index) const { return mEntries.at(index); }
    const std::vector<Entry>& GetEntries() const { return mEntries; }

    bool Contains(const ComponentParam* param) const;
    // False when the parameter is selected already (or null).
    bool Add(const ComponentRef& component, const ComponentParamRef& param,
             const TrackItemRef& trackItem);
    bool Remove(const ComponentParam* param);
    void Clear() { mEntries.clear(); }
    // The distinct components of the selected parameters, in selection order.
    std::vector<ComponentRef> GetComponents() const;

    friend bool operator==(const Selection& a, const Selection& b);

   private:
    std::vector<Entry> mEntries;
  };
};
