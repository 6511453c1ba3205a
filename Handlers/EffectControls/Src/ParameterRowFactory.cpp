#include "Handlers/EffectControls/Src/ParameterRowFactory.h"

#include <cxxabi.h>

#include <cstdlib>
#include <typeinfo>
#include <utility>

#include "Handlers/EffectControls/Src/AngleSliderParameter.h"
#include "Handlers/EffectControls/Src/AudioFloatSliderParameter.h"
#include "Handlers/EffectControls/Src/ButtonParameter.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Handlers/EffectControls/Src/GroupButtonsBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupCurveBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupHueBalanceAndPhaseBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupHueRangeDefinitionBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupLevelsBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupLumaRangeDefinitionBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupRGBCurvesBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupSaturationRangeDefinitionBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupThreeWayHueBalanceBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupTonalRangeDefinitionBeginParameter.h"
#include "Handlers/EffectControls/Src/OpaqueParameter.h"
#include "Handlers/EffectControls/Src/PointSliderParameter.h"
#include "Handlers/EffectControls/Src/TimecodeParameter.h"
#include "Handlers/EffectControls/Src/TrackMenuParameter.h"
#include "Handlers/EffectControls/Src/VideoFloatSliderParameter.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/TrackItem.h"
#include "Host/Rows/AngleParameter.h"
#include "Host/Rows/CheckboxParameter.h"
#include "Host/Rows/ColorPickerParameter.h"
#include "Host/Rows/DoubleSliderParameter.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/GroupBeginParameter.h"
#include "Host/Rows/InfoParameter.h"
#include "Host/Rows/LinkedPointPickerParameter.h"
#include "Host/Rows/MenuParameter.h"
#include "Host/Rows/PointPickerParameter.h"
#include "Host/Rows/SliderParameter.h"
#include "Host/Rows/SpreadsheetParameter.h"
#include "Host/Rows/TextParameter.h"

namespace {

// A row that stands in for a class the panel does not have yet, and says which.
class StandInRowName {
 public:
  explicit StandInRowName(std::string className) : mClassName(std::move(className)) {}
  virtual ~StandInRowName() = default;
  const std::string& GetStandInClassName() const { return mClassName; }

 private:
  std::string mClassName;
};

template <class HostRow>
class StandInRow final : public HostRow, public StandInRowName {
 public:
  template <class... Args>
  StandInRow(std::string_view meant, std::string_view made, Args&&... args)
      : HostRow(std::forward<Args>(args)...),
        StandInRowName(std::string(meant) + " (host " + std::string(made) + ")") {}
};

// A row whose control does not exist yet and would show nothing but that control (mask
// creation buttons, a custom audio interface): it keeps its place in the tree, takes no room and
// cannot be selected.
class EmptyStandInRow final : public EffectItem, public StandInRowName {
 public:
  EmptyStandInRow(std::string_view meant, ViewBase* parentView, const StationName& station)
      : EffectItem(parentView, std::string(), station),
        StandInRowName(std::string(meant) + " (host EffectItem)") {}

  int OwnHeight() const override { return 0; }
  bool IsSelectable() const override { return false; }
  bool ShouldDrawDivider() const override { return false; }
};

// The host row that shows a parameter's value as text: what every value parameter falls back to
// until its own row exists.
std::shared_ptr<ParameterControl> ValueStandIn(std::string_view meant,
                                               const ParameterControlInfo& info) {
  return std::make_shared<StandInRow<InfoParameter>>(meant, "InfoParameter", info);
}

// The host row that edits the parameter the way the panel's own row will, standing in for it.
template <class HostRow, class... Args>
std::shared_ptr<ParameterControl> HostRowStandIn(std::string_view meant, std::string_view made,
                                                 const ParameterControlInfo& info, Args&&... args) {
  return std::make_shared<StandInRow<HostRow>>(meant, made, info, std::forward<Args>(args)...);
}

std::shared_ptr<GroupBeginParameter> GroupStandIn(std::string_view meant,
                                                  const ParameterControlInfo& info) {
  return std::make_shared<StandInRow<GroupBeginParameter>>(meant, "GroupBeginParameter", info);
}

std::shared_ptr<EffectItem> ItemStandIn(std::string_view meant, ViewBase* parentView,
                                        std::string name, const StationName& station) {
  return std::make_shared<StandInRow<EffectItem>>(meant, "EffectItem", parentView, std::move(name),
                                                  station);
}

// A template's scale starts with its coordinates linked.
bool IsTemplateScale(const ParameterControlInfo& info) {
  return info.component && info.component->IsCapsule() && info.param->GetName() == "Scale";
}

bool IsChromil(const ComponentRef& component) {
  return component && component->GetMatchName() == kMatchnameChromil;
}

std::string Demangle(const char* mangled) {
  int status = 0;
  char* readable = abi::__cxa_demangle(mangled, nullptr, nullptr, &status);
  if (status != 0 || readable == nullptr) {
    return mangled;
  }
  std::string result(readable);
  std::free(readable);  // NOLINT: allocated by the demangler with malloc
  return result;
}

}  // namespace

std::vector<std::shared_ptr<ParameterControl>> ParameterRowFactory::CreateParameterRows(
    const ParameterRowRequest& request) {
  const ParameterControlInfo& info = request.info;
  if (!HOST_VERIFY(info.param, "Invalid ComponentParam")) {
    return {};
  }
  const bool ownSliderRows = (request.listStyle & kOwnSliderRowsStyle) != 0;
  const bool audio = info.component && info.component->GetMediaType() == MediaType::Audio;

  std::vector<std::shared_ptr<ParameterControl>> rows;
  switch (info.param->GetType()) {
    case ParamType::Slider:
      rows.push_back(std::make_shared<SliderParameter>(info));
      break;
    case ParamType::AudioGain:
      // Gains made in code with the old type code; a gain means nothing to a video effect.
      if (audio) {
        rows.push_back(std::make_shared<AudioFloatSliderParameter>(info));
      }
      break;
    case ParamType::FloatSlider:
      if (audio) {
        rows.push_back(std::make_shared<AudioFloatSliderParameter>(info));
      } else {
        rows.push_back(std::make_shared<VideoFloatSliderParameter>(info));
      }
      break;
    case ParamType::Angle:
      if (ownSliderRows) {
        rows.push_back(std::make_shared<AngleSliderParameter>(info));
      } else {
        rows.push_back(std::make_shared<AngleParameter>(info));
      }
      break;
    case ParamType::Checkbox:
      rows.push_back(std::make_shared<CheckboxParameter>(info));
      break;
    case ParamType::Color:
      if (IsChromil(info.component)) {
        rows.push_back(HostRowStandIn<ColorPickerParameter>("OffscreenPickerParameter",
                                                            "ColorPickerParameter", info));
      } else {
        rows.push_back(std::make_shared<ColorPickerParameter>(info));
      }
      break;
    case ParamType::Point:
      if (ownSliderRows) {
        // One row per coordinate: horizontal, then vertical.
        rows.push_back(
            std::make_shared<PointSliderParameter>(info, PointSliderParameter::Coordinate::X));
        rows.push_back(
            std::make_shared<PointSliderParameter>(info, PointSliderParameter::Coordinate::Y));
      } else if (info.component && info.component->IsCapsule()) {
        rows.push_back(std::make_shared<LinkedPointPickerParameter>(info, IsTemplateScale(info)));
      } else {
        rows.push_back(std::make_shared<PointPickerParameter>(info));
      }
      break;
    case ParamType::Menu:
      rows.push_back(std::make_shared<MenuParameter>(info));
      break;
    case ParamType::DoubleSlider:
    case ParamType::TimeRemapping:
      rows.push_back(std::make_shared<DoubleSliderParameter>(info));
      break;
    case ParamType::Custom:
      rows.push_back(ValueStandIn(info.component && info.component->IsGraphicsComponent()
                                      ? "GraphicsParameter"
                                      : "CustomParameter",
                                  info));
      break;
    case ParamType::TrackMenu:
      rows.push_back(std::make_shared<TrackMenuParameter>(info));
      break;
    case ParamType::Timecode:
      rows.push_back(std::make_shared<TimecodeParameter>(info));
      break;
    case ParamType::Button:
      rows.push_back(std::make_shared<ButtonParameter>(info));
      break;
    case ParamType::Opaque:
      rows.push_back(std::make_shared<OpaqueParameter>(info));
      break;
    case ParamType::Text:
      rows.push_back(std::make_shared<TextParameter>(info, request.textEditable));
      break;
    case ParamType::Info:
      rows.push_back(std::make_shared<InfoParameter>(info));
      break;
    case ParamType::Spreadsheet:
      rows.push_back(std::make_shared<SpreadsheetParameter>(info));
      break;
    case ParamType::GroupBegin:
    case ParamType::GroupEnd:
      break;  // groups have rows of their own
  }
  return rows;
}

std::shared_ptr<GroupBeginParameter> ParameterRowFactory::CreateGroupRow(
    const ParameterRowRequest& request) {
  const ParameterControlInfo& info = request.info;
  if (!HOST_VERIFY(info.param, "Invalid ComponentParam")) {
    return nullptr;
  }
  switch (info.param->GetGroupKind()) {
    case GroupKind::HueBalanceAndPhase:
      return std::make_shared<GroupHueBalanceAndPhaseBeginParameter>(info);
    case GroupKind::ThreeWayHueBalance:
      return std::make_shared<GroupThreeWayHueBalanceBeginParameter>(info);
    case GroupKind::TonalRangeDefinition:
      return std::make_shared<GroupTonalRangeDefinitionBeginParameter>(info);
    case GroupKind::Levels:
      return std::make_shared<GroupLevelsBeginParameter>(info);
    case GroupKind::RGBCurves:
      return std::make_shared<GroupRGBCurvesBeginParameter>(info);
    case GroupKind::Buttons:
      if (request.componentIsMask) {
        return GroupStandIn("GroupTrackerButtonsBeginParameter", info);
      }
      return std::make_shared<GroupButtonsBeginParameter>(info);
    case GroupKind::Curve:
      return std::make_shared<GroupCurveBeginParameter>(info);
    case GroupKind::ColorPickerRange:
      return GroupStandIn("GroupColorPickerRangeBeginParameter", info);
    case GroupKind::HueRangeDefinition:
      return std::make_shared<GroupHueRangeDefinitionBeginParameter>(info);
    case GroupKind::SaturationRangeDefinition:
      return std::make_shared<GroupSaturationRangeDefinitionBeginParameter>(info);
    case GroupKind::LumaRangeDefinition:
      return std::make_shared<GroupLumaRangeDefinitionBeginParameter>(info);
    case GroupKind::SecondaryColorCorrection:
      return GroupStandIn("GroupSecondaryColorCorrectionBeginParameter", info);
    case GroupKind::None:
    case GroupKind::Counted:
      break;
  }
  return std::make_shared<GroupBeginParameter>(info);
}

std::shared_ptr<EffectItem> ParameterRowFactory::CreateMaskShapeRow(ViewBase* parentView,
                                                                    const StationName& station,
                                                                    const ComponentRef& component) {
  HOST_ASSERT(component, "Invalid Component");
  return std::make_shared<EmptyStandInRow>("MaskShapeControl", parentView, station);
}

std::shared_ptr<EffectItem> ParameterRowFactory::CreateCustomAudioFilterRow(
    ViewBase* parentView, const StationName& station, const ComponentRef& component,
    bool /*second*/) {
  // Both custom rows look alike until the custom interface exists.
  if (!HOST_VERIFY(component, "Invalid Component")) {
    return nullptr;
  }
  return std::make_shared<EmptyStandInRow>("CustomAudioFilterItem", parentView, station);
}

std::shared_ptr<EffectItem> ParameterRowFactory::CreateVideoTransitionRow(
    ViewBase* parentView, const StationName& station, const TrackItemRef& transition) {
  if (!HOST_VERIFY(transition, "Invalid TrackItem")) {
    return nullptr;
  }
  return ItemStandIn("VideoTransitionItem", parentView, transition->GetName(), station);
}

std::shared_ptr<EffectItem> ParameterRowFactory::CreateAudioTransitionRow(
    ViewBase* parentView, const StationName& station, const TrackItemRef& transition) {
  if (!HOST_VERIFY(transition, "Invalid TrackItem")) {
    return nullptr;
  }
  return ItemStandIn("AudioTransitionItem", parentView, transition->GetName(), station);
}

std::string ParameterRowFactory::GetRowClassName(const EffectItem& row) {
  if (const auto* standIn = dynamic_cast<const StandInRowName*>(&row)) {
    return standIn->GetStandInClassName();
  }
  if (dynamic_cast<const FilterItem*>(&row) != nullptr) {
    return "FilterItem";
  }
  return Demangle(typeid(row).name());
}
