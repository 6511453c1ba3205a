// The panel view's choice of row style: the host's angle and point rows, or the panel's own
// slider rows (the list style kStyleOwnSliderRows).

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Host/Messaging/Preferences.h"

bool EffectControlsView::HasOwnSliderRows() const {
  return mListView->HasECPStyle(kStyleOwnSliderRows);
}

void EffectControlsView::SetOwnSliderRows(bool own) {
  const std::uint32_t style = mListView->GetStyle();
  mListView->SetStyle(own ? style | kStyleOwnSliderRows : style & ~kStyleOwnSliderRows);
  auto& properties = Preferences::Application().Properties();
  if (!properties.IsReadOnly(kOwnSliderRowsKey)) {
    properties.SetBool(kOwnSliderRowsKey, own);
  }
  // Rows are rebuilt, never patched: the new style takes effect with a fresh build.
  if (mListView->GetBuiltTarget()) {
    mListView->ClearAndRebuildList();
  }
}
