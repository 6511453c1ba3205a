#pragma once

#include <memory>
#include <string>

#include "Host/Rows/PointPickerParameter.h"

class CheckBoxControl;

// A point row with a link switch (a graphics template's scale): while linked, changing one
// coordinate scales the other by the same factor, so the point keeps its proportions. The
// switch's state is kept with the component ("ECP.Point.Linked.<parameter index>"); it starts
// linked for a template's scale parameter and unlinked otherwise.
class LinkedPointPickerParameter : public PointPickerParameter {
 public:
  static constexpr std::string_view kLinkedPropertyPrefix = "ECP.Point.Linked";

  LinkedPointPickerParameter(const ParameterControlInfo& info, bool isTemplateScale);

  void ListenToMessage(const Message& message) override;
  void PositionSelf(int top, int depth, int width) override;

  bool IsLinked() const;
  void SetLinked(bool linked);
  bool IsTemplateScale() const { return mIsTemplateScale; }
  CheckBoxControl* GetLinkSwitch() const { return mLink.get(); }

 protected:
  ParamPoint MakePoint(const ParamPoint& current, bool isX, double value) const override;
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

 private:
  std::string GetLinkedPropertyKey() const;

  bool mIsTemplateScale;
  std::shared_ptr<CheckBoxControl> mLink;
};
