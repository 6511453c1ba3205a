#pragma once

#include <string>

#include "Host/Toolkit/CommandStatus.h"

// What the keyframe area offers the parameter rows: the status of its keyframe commands, so a
// row (or a control of it) that has the focus can show them in menus. The keyframe area
// registers itself with each row it draws (ParameterControl::SetKeyframeViewer) and must
// unregister (SetKeyframeViewer(nullptr, ...)) or outlive the rows it registered with.
//
// Each status operation fills `enabled`, `checked` and a menu `text` (empty: keep the menu's
// own) for `command` and returns true when it answered.
class EffectControlsKeyframeViewHSLBase {
 public:
  EffectControlsKeyframeViewHSLBase() = default;
  EffectControlsKeyframeViewHSLBase(const EffectControlsKeyframeViewHSLBase&) = delete;
  EffectControlsKeyframeViewHSLBase& operator=(const EffectControlsKeyframeViewHSLBase&) = delete;
  virtual ~EffectControlsKeyframeViewHSLBase() = default;

  // Clear, Cut and Copy.
  virtual bool ClearCutCopyStatus(CommandID command, bool& enabled, bool& checked,
                                  std::string& text) = 0;
  virtual bool PasteStatus(CommandID command, bool& enabled, bool& checked, std::string& text) = 0;
  virtual bool SelectAllStatus(CommandID command, bool& enabled, bool& checked,
                               std::string& text) = 0;
  // The temporal and spatial interpolation commands.
  virtual bool InterpolationStatus(CommandID command, bool& enabled, bool& checked,
                                   std::string& text) = 0;
  virtual bool ClearAllKeyframesStatus(CommandID command, bool& enabled, bool& checked,
                                       std::string& text) = 0;
};
