#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Messaging/Station.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Rows/ParameterControl.h"

class EffectItem;
class GroupBeginParameter;
class ViewBase;

// The colour-grading effect, whose colour parameters pick from the program monitor and whose
// buttons at 68 and 70 are set up specially.
inline constexpr std::string_view kMatchnameChromil = "XO.KRVN ChromilColor";

// What the list knows about one parameter when it asks for its row.
struct ParameterRowRequest {
  // Parent view, list station, sequence, component, parameter, track item, edit time, name and
  // read-only state, as every parameter row is made with.
  ParameterControlInfo info;
  // The list's style bits; only kOwnSliderRowsStyle changes the choice here.
  std::uint32_t listStyle = 0;
  // An opaque parameter shows no reset button.
  bool suppressReset = false;
  // The parameter's component is a mask of another effect (buttons groups become tracker
  // buttons).
  bool componentIsMask = false;
  // Audio sliders: the audio filter's parameter description marks the parameter.
  bool audioParamMarked = false;
  // Text parameters of a motion-graphics template whose texts may change.
  bool textEditable = true;
  // Point parameters of a capsule: the parameter is the template's scale.
  bool isTemplateScaleParam = false;
};

// Makes the row the list shows for a parameter (by its type code) and for a group-begin
// parameter (by its group kind), and the stand-ins of the rows the panel does not have yet.
// This is the one place that decides which class presents what, so the choice can change here
// alone as the panel's own rows arrive.
//
// Until a row class exists, the nearest host row stands in for it and answers, through
// GetRowClassName, "<class the panel means> (host <class made>)", e.g.
// "CustomParameter (host InfoParameter)", so that a dump shows what each row is meant
// to be. Rows are returned constructed, not finished: the list sets the group level, finishes,
// sets aside and adopts them. UI thread only.
class ParameterRowFactory {
 public:
  // Angle, point and colour parameters use the panel's own rows.
  static constexpr std::uint32_t kOwnSliderRowsStyle = 0x800;

  // The rows for a parameter that is not a group begin or end: none for a type without a row,
  // two for a point with the panel's own slider rows (horizontal first), else one.
  static std::vector<std::shared_ptr<ParameterControl>> CreateParameterRows(
      const ParameterRowRequest& request);

  // The group row for a group-begin parameter (type 11), by its group kind; a plain
  // GroupBeginParameter for kinds without a row of their own. Null without a parameter.
  static std::shared_ptr<GroupBeginParameter> CreateGroupRow(const ParameterRowRequest& request);

  // The first child of an effect that can take masks.
  static std::shared_ptr<EffectItem> CreateMaskShapeRow(ViewBase* parentView,
                                                        const StationName& station,
                                                        const ComponentRef& component);
  // The custom interface rows of an audio effect: `second` false for the first, true for the
  // second.
  static std::shared_ptr<EffectItem> CreateCustomAudioFilterRow(ViewBase* parentView,
                                                                const StationName& station,
                                                                const ComponentRef& component,
                                                                bool second);
  // The row of a targeted video or audio transition.
  static std::shared_ptr<EffectItem> CreateVideoTransitionRow(ViewBase* parentView,
                                                              const StationName& station,
                                                              const TrackItemRef& transition);
  static std::shared_ptr<EffectItem> CreateAudioTransitionRow(ViewBase* parentView,
                                                              const StationName& station,
                                                              const TrackItemRef& transition);

  // The class a row stands for, as the dump shows it: "FilterItem", "CheckboxParameter",
  // "CustomParameter (host InfoParameter)"; the C++ class name for other rows.
  static std::string GetRowClassName(const EffectItem& row);
};
