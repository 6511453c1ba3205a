#include "Host/Model/ProjectFileWriter.h"

#include <nlohmann/json.hpp>
#include <set>

#include "Host/Messaging/PropertyList.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectFile.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"

using json = nlohmann::ordered_json;

namespace {

json TimeOrNull(const std::optional<TickTime>& time) {
  return time ? json(*time) : json(nullptr);
}

json SaveFrameRate(const FrameRate& rate) {
  if (rate.IsAudio()) {
    return {{"sampleRate", rate.GetTimecodeBase()}};
  }
  return {{"ticksPerFrame", rate.GetTicksPerFrame()}, {"dropFrame", rate.IsDropFrame()}};
}

json SavePoint(const ParamPoint& p) {
  return json::array({p.x, p.y});
}

std::string ToHex(const std::vector<std::uint8_t>& bytes) {
  static const char* digits = "0123456789abcdef";
  std::string hex;
  hex.reserve(bytes.size() * 2);
  for (auto byte : bytes) {
    hex.push_back(digits[byte >> 4]);
    hex.push_back(digits[byte & 15]);
  }
  return hex;
}

json SaveValue(const ParamValue& value) {
  return std::visit(
      [](const auto& v) -> json {
        using T = std::decay_t<decltype(v)>;
        if constexpr (std::is_same_v<T, double>) {
          return {{"double", v}};
        } else if constexpr (std::is_same_v<T, ParamPoint>) {
          return {{"point", SavePoint(v)}};
        } else if constexpr (std::is_same_v<T, ParamColor>) {
          return {{"color", json::array({v.r, v.g, v.b, v.a})}};
        } else if constexpr (std::is_same_v<T, bool>) {
          return {{"bool", v}};
        } else if constexpr (std::is_same_v<T, ParamChoice>) {
          return {{"choice", v.index}};
        } else if constexpr (std::is_same_v<T, std::string>) {
          return {{"string", v}};
        } else {
          return {{"blob", ToHex(v.bytes)}};
        }
      },
      value);
}

json SaveProperties(const PropertyList& properties) {
  return json::parse(properties.ToJSON());
}

json SaveMarkers(const Markers& markers) {
  json list = json::array();
  for (const auto& m : markers.All()) {
    list.push_back({{"time", m.time},
                    {"duration", m.duration},
                    {"name", m.name},
                    {"comment", m.comment},
                    {"color", m.colorIndex}});
  }
  return list;
}

json SaveKeyframe(const Keyframe& k) {
  return {{"time", k.time},
          {"value", SaveValue(k.value)},
          {"interpolation", static_cast<int>(k.interpolation)},
          {"spatial", static_cast<int>(k.spatial)},
          {"inSpeed", k.inSpeed},
          {"inInfluence", k.inInfluence},
          {"outSpeed", k.outSpeed},
          {"outInfluence", k.outInfluence},
          {"inTangent", SavePoint(k.inTangent)},
          {"outTangent", SavePoint(k.outTangent)}};
}

json SaveParam(const ComponentParam& p) {
  json keyframes = json::array();
  for (const auto& k : p.GetKeyframes().Keyframes()) {
    keyframes.push_back(SaveKeyframe(k));
  }
  json param = {{"id", p.GetID()},
                {"name", p.GetName()},
                {"type", p.GetTypeCode()},
                {"groupKind", p.GetGroupKindCode()},
                {"default", SaveValue(p.GetDefaultValue())},
                {"min", p.GetMinimum()},
                {"max", p.GetMaximum()},
                {"sliderMin", p.GetSliderMinimum()},
                {"sliderMax", p.GetSliderMaximum()},
                {"precision", p.GetPrecision()},
                {"exponent", p.GetExponent()},
                {"units", p.GetUnitsCode()},
                {"step", p.GetStep()},
                {"menu", p.GetMenuEntries()},
                {"canVary", p.CanVaryOverTime()},
                {"audioGain", p.IsAudioGain()},
                {"disablesWhenOn", p.GetDisablesWhenOn()},
                {"visible", p.IsVisible()},
                {"enabled", p.IsEnabled()},
                {"readOnly", p.IsReadOnly()},
                {"value", SaveValue(p.GetConstantValue())},
                {"timeVarying", p.IsTimeVarying()},
                {"keyframes", keyframes}};
  // Only the parameters that have them, so other parameters read as they always did.
  if (p.GetParameterTimebase()) {
    param["timebase"] = SaveFrameRate(*p.GetParameterTimebase());
  }
  if (p.HasCheckboxDisplayName()) {
    param["checkboxName"] = p.GetCheckboxDisplayName();
  }
  return param;
}

json SaveComponent(const Component& c) {
  json presets = json::array();
  for (const auto& preset : c.GetPresets()) {
    json values = json::array();
    for (const auto& [position, value] : preset.values) {
      values.push_back({{"param", position}, {"value", SaveValue(value)}});
    }
    presets.push_back({{"name", preset.name}, {"values", values}});
  }
  json params = json::array();
  for (const auto& p : c.GetParams()) {
    params.push_back(SaveParam(*p));
  }
  json masks = json::array();
  for (const auto& m : c.GetMasks()) {
    masks.push_back(SaveComponent(*m));
  }
  return {{"id", c.GetID()},
          {"matchName", c.GetMatchName()},
          {"effectName", c.GetEffectName()},
          {"instanceName", c.GetInstanceName()},
          {"mediaType", c.GetMediaType() == MediaType::Video ? "video" : "audio"},
          {"intrinsic", c.IsIntrinsic()},
          {"role", static_cast<int>(c.GetRole())},
          {"archived", c.IsArchived()},
          {"archivedType", c.GetArchivedType()},
          {"bypass", c.IsBypassed()},
          {"offline", c.IsOffline()},
          {"hasSetupDialog", c.HasSetupDialog()},
          {"canTakeMasks", c.CanTakeMasks()},
          {"presets", presets},
          {"currentPreset", c.GetCurrentPreset()},
          {"expansion", SaveProperties(c.GetExpansionProperties())},
          {"params", params},
          {"masks", masks}};
}

json SaveChain(const ComponentChain& chain) {
  json components = json::array();
  for (const auto& c : chain.GetComponents()) {
    components.push_back(SaveComponent(*c));
  }
  return {{"id", chain.GetID()}, {"components", components}};
}

json SaveTransition(const TransitionData& t) {
  return {{"matchName", t.matchName},
          {"displayName", t.displayName},
          {"cutRatio", t.cutRatio},
          {"startPercent", t.startPercent},
          {"endPercent", t.endPercent},
          {"startPosition", SavePoint(t.startPosition)},
          {"endPosition", SavePoint(t.endPosition)},
          {"startPositionMovable", t.startPositionMovable},
          {"endPositionMovable", t.endPositionMovable},
          {"borderWidth", t.borderWidth},
          {"borderColor", SaveValue(t.borderColor)["color"]},
          {"reverse", t.reverse},
          {"switchSources", t.switchSources},
          {"directions", t.directions},
          {"allowedDirections", t.allowedDirections},
          {"takesDirectionPair", t.takesDirectionPair},
          {"antiAliasQuality", t.antiAliasQuality},
          {"privateData", ToHex(t.privateData.bytes)},
          {"hasCustomSetup", t.hasCustomSetup}};
}

json SaveTrackItem(const TrackItem& item) {
  json j = {{"id", item.GetID()},
            {"kind", item.IsClip() ? "clip" : "transition"},
            {"start", item.GetStart()},
            {"end", item.GetEnd()},
            {"mediaIn", item.GetMediaIn()},
            {"speed", item.GetSpeed()},
            {"masterClip", item.GetMasterClip() ? json(item.GetMasterClip()->GetID()) : json()},
            {"name", item.GetOwnName()},
            {"labelColor", item.GetLabelColor()},
            {"partOrderKey", item.GetPartOrderKey()},
            {"linkGroup", item.GetLinkGroup()},
            {"intro", item.GetIntroDuration()},
            {"outro", item.GetOutroDuration()},
            {"introOutroLocked", item.AreIntroOutroLocked()}};
  if (item.IsTransition()) {
    j["transition"] = SaveTransition(item.GetTransitionData());
  }
  j["chain"] = SaveChain(*item.GetComponentChain());
  return j;
}

json SaveTrack(const Track& track) {
  json items = json::array();
  for (const auto& item : track.GetItems()) {
    items.push_back(SaveTrackItem(*item));
  }
  return {{"id", track.GetID()},
          {"mediaType", track.GetMediaType() == MediaType::Video ? "video" : "audio"},
          {"name", track.GetName()},
          {"items", items}};
}

json SaveSequence(const Sequence& s) {
  json tracks = json::array();
  for (const auto& t : s.GetVideoTracks())
    tracks.push_back(SaveTrack(*t));
  for (const auto& t : s.GetAudioTracks())
    tracks.push_back(SaveTrack(*t));
  json selection = json::array();
  for (const auto& group : s.GetSelection()) {
    for (const auto& item : group.videoItems)
      selection.push_back(item->GetID());
    for (const auto& item : group.audioItems)
      selection.push_back(item->GetID());
  }
  return {{"id", s.GetID()},
          {"name", s.GetName()},
          {"videoFrameRate", SaveFrameRate(s.GetVideoFrameRate())},
          {"audioFrameRate", SaveFrameRate(s.GetAudioFrameRate())},
          {"videoTimeDisplay", SaveFrameRate(s.GetVideoTimeDisplay())},
          {"audioTimeDisplay", SaveFrameRate(s.GetAudioTimeDisplay())},
          {"frameSize", json::array({s.GetFrameSize().width, s.GetFrameSize().height})},
          {"audioFrameAligned", s.IsAudioFrameAligned()},
          {"zeroPoint", s.GetZeroPoint()},
          {"in", TimeOrNull(s.GetInPoint())},
          {"out", TimeOrNull(s.GetOutPoint())},
          {"currentTime", s.GetCurrentTime()},
          {"readOnly", s.IsReadOnly()},
          {"markers", SaveMarkers(s.GetMarkers())},
          {"tracks", tracks},
          {"selection", selection}};
}

json SaveMedia(const Media& m) {
  return {{"id", m.GetID()},
          {"name", m.GetName()},
          {"duration", m.IsGenerated() ? json() : json(m.GetDuration())},
          {"video", m.HasVideo()},
          {"audio", m.HasAudio()},
          {"frameRate", SaveFrameRate(m.GetFrameRate())}};
}

json SaveMasterClip(const MasterClip& c) {
  return {{"id", c.GetID()},
          {"name", c.GetName()},
          {"media", c.GetMedia() ? json(c.GetMedia()->GetID()) : json()},
          {"in", TimeOrNull(c.GetInPoint())},
          {"out", TimeOrNull(c.GetOutPoint())},
          {"markers", SaveMarkers(c.GetMarkers())},
          {"graphic", c.IsGraphic()},
          {"masterGraphic", c.IsMasterGraphic()},
          {"template", c.IsTemplate()},
          {"readOnly", c.IsReadOnly()},
          {"properties", SaveProperties(c.GetProperties())},
          {"videoChain", SaveChain(*c.GetVideoChain())}};
}

}  // namespace

std::string ProjectFileWriter::Write(const Project& project) {
  json root = {{"format", ProjectFile::kFormatName},
               {"version", ProjectFile::kFormatVersion},
               {"id", project.GetID()},
               {"name", project.GetName()},
               {"readOnly", project.IsReadOnly()},
               {"properties", SaveProperties(project.GetProperties())}};
  // Media is shared by master clips; each is written once, in the order first used.
  json media = json::array();
  std::set<ObjectID> written;
  for (const auto& clip : project.GetMasterClips()) {
    if (clip->GetMedia() && written.insert(clip->GetMedia()->GetID()).second) {
      media.push_back(SaveMedia(*clip->GetMedia()));
    }
  }
  root["media"] = media;
  json clips = json::array();
  for (const auto& clip : project.GetMasterClips())
    clips.push_back(SaveMasterClip(*clip));
  root["masterClips"] = clips;
  json sequences = json::array();
  for (const auto& s : project.GetSequences())
    sequences.push_back(SaveSequence(*s));
  root["sequences"] = sequences;
  root["activeSequence"] =
      project.GetActiveSequence() ? json(project.GetActiveSequence()->GetID()) : json();
  return root.dump(2) + "\n";
}
