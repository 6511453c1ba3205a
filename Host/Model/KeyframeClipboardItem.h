#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Model/ClipboardItem.h"
#include "Host/Model/Keyframe.h"
#include "Host/Model/ParamValue.h"
#include "Host/Time/TickTime.h"

// Copied keyframes of one or more parameters. Times are offsets from the earliest copied
// keyframe (over all parameters), so a paste places that keyframe at the paste time and keeps
// the others' distances to it. Each parameter is identified by where it sits, so that it can be
// found again in another clip's effects: the effect's match name and its ordinal among the chain's
// effects of that match name, and the parameter's position, name and value kind.
class KeyframeClipboardItem : public ClipboardItem {
 public:
  static constexpr std::string_view kKind = "keyframes";

  struct ParamKeyframes {
    std::string componentMatchName;
    int componentOrdinal = 0;    // 0: the first effect of that match name in the chain
    std::size_t paramIndex = 0;  // position in the effect's parameter list
    std::string paramName;
    ParamValueKind valueKind = ParamValueKind::Double;
    std::vector<Keyframe> keyframes;  // times relative to the earliest copied keyframe
  };

  explicit KeyframeClipboardItem(std::vector<ParamKeyframes> params) : mParams(std::move(params)) {}

  std::string_view GetKind() const override { return kKind; }
  const std::vector<ParamKeyframes>& GetParams() const { return mParams; }
  std::size_t GetKeyframeCount() const;

 private:
  std::vector<ParamKeyframes> mParams;
};
