#include "Host/Model/KeyframeClipboardItem.h"

std::size_t KeyframeClipboardItem::GetKeyframeCount() const {
  std::size_t count = 0;
  for (const ParamKeyframes& param : mParams) {
    count += param.keyframes.size();
  }
  return count;
}
