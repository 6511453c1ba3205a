#include "Host/Model/ProjectFileReader.h"

#include <cmath>
#include <map>
#include <set>
#include <string>

#include "Host/Messaging/PropertyList.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/JsonDocumentReader.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"

using json = nlohmann::ordered_json;

namespace {

struct LoadError {
  std::string message;
};

// Deeper than any file the model writes (about 16 levels) with room for nested masks. Saving and
// loading recurse over the document, so deeper input is refused while it is read.
constexpr std::size_t kMaxNestingDepth = 64;

// Text of the file quoted in a message (a name, a key): short and on one line.
std::string Excerpt(std::string_view text) {
  return JsonDocumentReader::Excerpt(text, 40);
}

// Messages quote the file's own text; keep them to one readable line.
std::string OneLine(std::string_view message) {
  return JsonDocumentReader::Excerpt(message, 400);
}

// A place in the file: the JSON value and its path ("sequences[0].tracks[2]").
class Node {
 public:
  Node(const json& value, std::string path) : mValue(value), mPath(std::move(path)) {}

  const json& Value() const { return mValue; }
  const std::string& Path() const { return mPath; }

  [[noreturn]] void Fail(const std::string& what) const {
    throw LoadError{(mPath.empty() ? std::string("file") : mPath) + ": " + what};
  }

  bool Has(const char* key) const { return mValue.is_object() && mValue.contains(key); }

  Node Member(const char* key) const {
    if (!mValue.is_object())
      Fail("expected an object");
    auto it = mValue.find(key);
    if (it == mValue.end())
      Node(mValue, Join(key)).Fail("is missing");
    return Node(*it, Join(key));
  }

  // The members of an array, each with its own path.
  std::vector<Node> Elements() const {
    if (!mValue.is_array())
      Fail("expected an array");
    std::vector<Node> nodes;
    for (std::size_t i = 0; i < mValue.size(); ++i) {
      nodes.emplace_back(mValue[i], mPath + "[" + std::to_string(i) + "]");
    }
    return nodes;
  }

  std::int64_t Int(const char* what = "an integer") const {
    if (!mValue.is_number_integer())
      Fail(std::string("expected ") + what);
    if (mValue.is_number_unsigned() &&
        mValue.get<std::uint64_t>() > static_cast<std::uint64_t>(INT64_MAX)) {
      Fail(std::string("expected ") + what + " (too large)");
    }
    return mValue.get<std::int64_t>();
  }

  TickTime Time() const {
    const auto t = Int("an integer tick count");
    if (t < kTime_Min || t > kTime_Max)
      Fail("tick count out of range");
    return t;
  }

  std::optional<TickTime> OptionalTime() const {
    if (mValue.is_null())
      return std::nullopt;
    return Time();
  }

  double Number() const {
    if (!mValue.is_number())
      Fail("expected a number");
    const double d = mValue.get<double>();
    if (!std::isfinite(d))
      Fail("expected a finite number");
    return d;
  }

  bool Bool() const {
    if (!mValue.is_boolean())
      Fail("expected true or false");
    return mValue.get<bool>();
  }

  std::string String() const {
    if (!mValue.is_string())
      Fail("expected a string");
    return mValue.get<std::string>();
  }

  int IntIn(std::int64_t lo, std::int64_t hi) const {
    const auto v = Int();
    if (v < lo || v > hi) {
      Fail("expected an integer from " + std::to_string(lo) + " to " + std::to_string(hi));
    }
    return static_cast<int>(v);
  }

  // Optional members: the default when absent.
  std::int64_t Int(const char* key, std::int64_t fallback) const {
    return Has(key) ? Member(key).Int() : fallback;
  }
  TickTime Time(const char* key, TickTime fallback) const {
    return Has(key) ? Member(key).Time() : fallback;
  }
  double Number(const char* key, double fallback) const {
    return Has(key) ? Member(key).Number() : fallback;
  }
  bool Bool(const char* key, bool fallback) const {
    return Has(key) ? Member(key).Bool() : fallback;
  }
  std::string String(const char* key, std::string fallback) const {
    return Has(key) ? Member(key).String() : fallback;
  }

 private:
  std::string Join(const char* key) const { return mPath.empty() ? key : mPath + "." + key; }

  const json& mValue;
  std::string mPath;
};

std::vector<std::uint8_t> FromHex(const Node& node) {
  const auto hex = node.String();
  if (hex.size() % 2 != 0)
    node.Fail("expected hexadecimal bytes (an even number of digits)");
  std::vector<std::uint8_t> bytes;
  bytes.reserve(hex.size() / 2);
  auto digit = [&](char c) -> int {
    if (c >= '0' && c <= '9')
      return c - '0';
    if (c >= 'a' && c <= 'f')
      return c - 'a' + 10;
    if (c >= 'A' && c <= 'F')
      return c - 'A' + 10;
    node.Fail("expected hexadecimal bytes");
  };
  for (std::size_t i = 0; i < hex.size(); i += 2) {
    bytes.push_back(static_cast<std::uint8_t>(digit(hex[i]) * 16 + digit(hex[i + 1])));
  }
  return bytes;
}

ParamPoint LoadPoint(const Node& node) {
  const auto elements = node.Elements();
  if (elements.size() != 2)
    node.Fail("expected [x, y]");
  return {elements[0].Number(), elements[1].Number()};
}

ParamColor LoadColor(const Node& node) {
  const auto e = node.Elements();
  if (e.size() != 4)
    node.Fail("expected [r, g, b, a]");
  return {static_cast<float>(e[0].Number()), static_cast<float>(e[1].Number()),
          static_cast<float>(e[2].Number()), static_cast<float>(e[3].Number())};
}

ParamValue LoadValue(const Node& node) {
  if (!node.Value().is_object() || node.Value().size() != 1) {
    node.Fail(
        "expected a value object with one member: double, point, color, bool, choice, string or "
        "blob");
  }
  const auto& key = node.Value().begin().key();
  if (key == "double")
    return node.Member("double").Number();
  if (key == "point")
    return LoadPoint(node.Member("point"));
  if (key == "color")
    return LoadColor(node.Member("color"));
  if (key == "bool")
    return node.Member("bool").Bool();
  if (key == "choice") {
    return ParamChoice{node.Member("choice").IntIn(INT32_MIN, INT32_MAX)};
  }
  if (key == "string")
    return node.Member("string").String();
  if (key == "blob")
    return ParamBlob{FromHex(node.Member("blob"))};
  node.Fail("unknown value kind '" + Excerpt(key) + "'");
}

FrameRate LoadFrameRate(const Node& node) {
  if (node.Has("sampleRate")) {
    const auto sampleRate = node.Member("sampleRate");
    auto rate = FrameRate::FromSampleRate(sampleRate.IntIn(1, 10'000'000));
    if (!rate)
      sampleRate.Fail("not a sample rate that divides the tick rate");
    return *rate;
  }
  const auto ticks = node.Member("ticksPerFrame");
  auto rate = FrameRate::FromTicksPerFrame(ticks.Int(), node.Bool("dropFrame", false));
  if (!rate)
    ticks.Fail("not a valid frame rate (positive ticks; drop frame only at 29.97/59.94)");
  return *rate;
}

PropertyList LoadProperties(const Node& node) {
  if (!node.Value().is_object())
    node.Fail("expected an object of properties");
  std::string error;
  auto list = PropertyList::FromJSON(node.Value().dump(), &error);
  if (!list)
    node.Fail(error);
  return std::move(*list);
}

Markers LoadMarkers(const Node& node) {
  Markers markers;
  for (const auto& m : node.Elements()) {
    Marker marker;
    marker.time = m.Member("time").Time();
    marker.duration = m.Time("duration", 0);
    if (marker.duration < 0)
      m.Member("duration").Fail("must not be negative");
    marker.name = m.String("name", "");
    marker.comment = m.String("comment", "");
    marker.colorIndex = m.Has("color") ? m.Member("color").IntIn(0, 7) : 0;
    if (!markers.Add(marker))
      m.Fail("marker time cannot be stored");
  }
  return markers;
}

// Ids: every object of the file has its own; objects without one, and objects the model makes
// that the file does not list (the chain of a master clip written without one), get fresh ids
// once the whole file is read, so a fresh id never takes one that appears later in the file.
class IdRegistry {
 public:
  void Claim(const Node& node, ModelObject& object) {
    if (!node.Has("id")) {
      Adopt(object);
      return;
    }
    const auto idNode = node.Member("id");
    const auto id = idNode.Int("an integer id");
    if (id <= 0)
      idNode.Fail("ids must be positive");
    if (!mSeen.insert(id).second)
      idNode.Fail("id " + std::to_string(id) + " is used twice");
    object.SetID(id);
  }

  // An object the file does not describe.
  void Adopt(ModelObject& object) { mUnassigned.emplace_back(&object); }

  // Called once everything is built.
  void Finish() {
    if (!mSeen.empty())
      ModelObject::ReserveObjectIDsThrough(*mSeen.rbegin());
    for (const auto& object : mUnassigned)
      object->SetID(ModelObject::AllocateObjectID());
  }

 private:
  std::set<std::int64_t> mSeen;
  // Held, not pointed at: the loader may drop an object before Finish.
  std::vector<boost::intrusive_ptr<ModelObject>> mUnassigned;
};

class Loader {
 public:
  ProjectRef Load(const json& root) {
    const Node file(root, "");
    if (!root.is_object())
      file.Fail("expected a project object");
    if (file.String("format", ProjectFile::kFormatName) != ProjectFile::kFormatName) {
      file.Member("format").Fail(std::string("expected \"") + ProjectFile::kFormatName + "\"");
    }
    const auto version = file.Int("version", ProjectFile::kFormatVersion);
    if (version != ProjectFile::kFormatVersion) {
      file.Member("version").Fail("unsupported version " + std::to_string(version));
    }
    auto project = Project::Create(file.String("name", "Untitled"));
    mIds.Claim(file, *project);
    if (file.Has("properties")) {
      project->GetProperties() = LoadProperties(file.Member("properties"));
    }
    if (file.Has("media")) {
      for (const auto& m : file.Member("media").Elements())
        LoadMedia(m);
    }
    if (file.Has("masterClips")) {
      for (const auto& c : file.Member("masterClips").Elements()) {
        project->AddMasterClip(LoadMasterClip(c));
      }
    }
    for (const auto& s : file.Member("sequences").Elements()) {
      project->AddSequence(LoadSequence(s));
    }
    mIds.Finish();
    if (file.Has("activeSequence") && !file.Member("activeSequence").Value().is_null()) {
      const auto node = file.Member("activeSequence");
      auto sequence = project->FindSequence(node.Int("a sequence id"));
      if (!sequence)
        node.Fail("no sequence has this id");
      project->SetActiveSequence(sequence);
    }
    for (auto& [sequence, node] : mSelections)
      ApplySelection(*project, *sequence, node);
    project->SetReadOnly(file.Bool("readOnly", false));
    return project;
  }

 private:
  void LoadMedia(const Node& node) {
    const auto durationNode = node.Member("duration");
    TickTime duration = kTime_Max;
    if (!durationNode.Value().is_null()) {
      duration = durationNode.Time();
      if (duration <= 0)
        durationNode.Fail("must be positive (null for generated media)");
    }
    auto media = Media::Create(
        node.String("name", ""), duration, node.Bool("video", true), node.Bool("audio", false),
        node.Has("frameRate") ? LoadFrameRate(node.Member("frameRate")) : kFrameRate_25);
    mIds.Claim(node, *media);
    if (node.Has("id"))
      mMedia[media->GetID()] = media;
  }

  MasterClipRef LoadMasterClip(const Node& node) {
    MediaRef media;
    if (node.Has("media") && !node.Member("media").Value().is_null()) {
      const auto ref = node.Member("media");
      const auto it = mMedia.find(ref.Int("a media id"));
      if (it == mMedia.end())
        ref.Fail("no media has this id");
      media = it->second;
    }
    auto clip = MasterClip::Create(node.Member("name").String(), media);
    mIds.Claim(node, *clip);
    clip->SetInPoint(node.Has("in") ? node.Member("in").OptionalTime() : std::nullopt);
    clip->SetOutPoint(node.Has("out") ? node.Member("out").OptionalTime() : std::nullopt);
    if (node.Has("markers"))
      clip->SetMarkers(LoadMarkers(node.Member("markers")));
    clip->SetGraphicsFlags(node.Bool("graphic", false), node.Bool("masterGraphic", false),
                           node.Bool("template", false));
    clip->SetReadOnly(node.Bool("readOnly", false));
    if (node.Has("properties"))
      clip->GetProperties() = LoadProperties(node.Member("properties"));
    if (node.Has("videoChain")) {
      LoadChainInto(node.Member("videoChain"), *clip->GetVideoChain(), MediaType::Video);
    } else {
      mIds.Adopt(*clip->GetVideoChain());
    }
    mMasterClips[clip->GetID()] = clip;
    return clip;
  }

  SequenceRef LoadSequence(const Node& node) {
    const FrameRate video =
        node.Has("videoFrameRate") ? LoadFrameRate(node.Member("videoFrameRate")) : kFrameRate_25;
    const FrameRate audio = node.Has("audioFrameRate")
                                ? LoadFrameRate(node.Member("audioFrameRate"))
                                : kFrameRate_Audio48000;
    auto sequence = Sequence::Create(node.Member("name").String(), video, audio);
    mIds.Claim(node, *sequence);
    if (node.Has("videoTimeDisplay") || node.Has("audioTimeDisplay")) {
      const FrameRate videoDisplay =
          node.Has("videoTimeDisplay") ? LoadFrameRate(node.Member("videoTimeDisplay")) : video;
      const FrameRate audioDisplay =
          node.Has("audioTimeDisplay") ? LoadFrameRate(node.Member("audioTimeDisplay")) : audio;
      if (!sequence->SetTimeDisplays(videoDisplay, audioDisplay)) {
        node.Fail("time displays do not suit the frame rates");
      }
    }
    if (node.Has("frameSize")) {
      const auto sizeNode = node.Member("frameSize");
      const auto sides = sizeNode.Elements();
      if (sides.size() != 2)
        sizeNode.Fail("needs [width, height]");
      sequence->SetFrameSize(
          {sides[0].IntIn(1, Sequence::kMaxFrameSide), sides[1].IntIn(1, Sequence::kMaxFrameSide)});
    }
    sequence->SetAudioFrameAligned(node.Bool("audioFrameAligned", false));
    sequence->SetZeroPoint(node.Time("zeroPoint", 0));
    sequence->SetInPoint(node.Has("in") ? node.Member("in").OptionalTime() : std::nullopt);
    sequence->SetOutPoint(node.Has("out") ? node.Member("out").OptionalTime() : std::nullopt);
    if (node.Has("markers"))
      sequence->SetMarkers(LoadMarkers(node.Member("markers")));
    sequence->SetReadOnly(node.Bool("readOnly", false));
    for (const auto& t : node.Member("tracks").Elements())
      sequence->AddTrack(LoadTrack(t));
    sequence->SetCurrentTime(node.Time("currentTime", 0));
    if (node.Has("selection"))
      mSelections.emplace_back(sequence, node.Member("selection"));
    return sequence;
  }

  MediaType LoadMediaType(const Node& node) {
    const auto text = node.String();
    if (text == "video")
      return MediaType::Video;
    if (text == "audio")
      return MediaType::Audio;
    node.Fail("expected \"video\" or \"audio\"");
  }

  TrackRef LoadTrack(const Node& node) {
    const auto mediaType = LoadMediaType(node.Member("mediaType"));
    auto track = Track::Create(mediaType, node.String("name", ""));
    mIds.Claim(node, *track);
    // Transitions lie over the cut between two clips; clips never overlap each other.
    TickTime previousClipEnd = kTime_Min;
    for (const auto& i : node.Member("items").Elements()) {
      auto item = LoadTrackItem(i, mediaType);
      if (item->IsClip()) {
        if (item->GetStart() < previousClipEnd) {
          i.Member("start").Fail("overlaps an earlier clip of the track");
        }
        previousClipEnd = std::max(previousClipEnd, item->GetEnd());
      }
      if (!track->AddItem(item))
        i.Fail("cannot be added to this track");
    }
    return track;
  }

  TrackItemRef LoadTrackItem(const Node& node, MediaType mediaType) {
    const auto kind = node.Member("kind").String();
    const auto startNode = node.Member("start");
    const auto endNode = node.Member("end");
    const auto start = startNode.Time();
    const auto end = endNode.Time();
    if (end < start)
      endNode.Fail("ends before it starts");
    TrackItemRef item;
    if (kind == "clip") {
      MasterClipRef masterClip;
      if (node.Has("masterClip") && !node.Member("masterClip").Value().is_null()) {
        const auto ref = node.Member("masterClip");
        const auto it = mMasterClips.find(ref.Int("a master clip id"));
        if (it == mMasterClips.end())
          ref.Fail("no master clip has this id");
        masterClip = it->second;
      }
      item = TrackItem::CreateClip(mediaType, start, end, masterClip, node.Time("mediaIn", 0));
    } else if (kind == "transition") {
      item = TrackItem::CreateTransition(mediaType, start, end,
                                         LoadTransition(node.Member("transition")));
    } else {
      node.Member("kind").Fail("expected \"clip\" or \"transition\"");
    }
    mIds.Claim(node, *item);
    if (node.Has("speed")) {
      const auto speed = node.Member("speed");
      if (!item->SetSpeed(speed.Number()))
        speed.Fail("speed must be positive");
    }
    item->SetName(node.String("name", ""));
    if (node.Has("labelColor")) {
      item->SetLabelColor(static_cast<std::uint32_t>(node.Member("labelColor").IntIn(0, 0xFFFFFF)));
    }
    if (node.Has("partOrderKey")) {
      item->SetPartOrderKey(
          static_cast<std::uint32_t>(node.Member("partOrderKey").IntIn(0, UINT32_MAX)));
    }
    if (node.Has("linkGroup"))
      item->SetLinkGroup(node.Member("linkGroup").IntIn(0, INT32_MAX));
    if (node.Has("intro") && !item->SetIntroDuration(node.Member("intro").Time())) {
      node.Member("intro").Fail("must not be negative");
    }
    if (node.Has("outro") && !item->SetOutroDuration(node.Member("outro").Time())) {
      node.Member("outro").Fail("must not be negative");
    }
    item->SetIntroOutroLocked(node.Bool("introOutroLocked", false));
    if (node.Has("chain")) {
      LoadChainInto(node.Member("chain"), *item->GetComponentChain(), mediaType);
    } else {
      mIds.Adopt(*item->GetComponentChain());
    }
    return item;
  }

  TransitionData LoadTransition(const Node& node) {
    TransitionData t;
    t.matchName = node.String("matchName", "");
    t.displayName = node.String("displayName", "");
    t.cutRatio = node.Number("cutRatio", 0.5);
    if (t.cutRatio < 0.0 || t.cutRatio > 1.0)
      node.Member("cutRatio").Fail("expected 0 to 1");
    t.startPercent = static_cast<float>(node.Number("startPercent", 0.0));
    t.endPercent = static_cast<float>(node.Number("endPercent", 1.0));
    if (node.Has("startPosition"))
      t.startPosition = LoadPoint(node.Member("startPosition"));
    if (node.Has("endPosition"))
      t.endPosition = LoadPoint(node.Member("endPosition"));
    t.startPositionMovable = node.Bool("startPositionMovable", false);
    t.endPositionMovable = node.Bool("endPositionMovable", false);
    t.borderWidth = static_cast<float>(node.Number("borderWidth", 0.0));
    if (node.Has("borderColor"))
      t.borderColor = LoadColor(node.Member("borderColor"));
    t.reverse = node.Bool("reverse", false);
    t.switchSources = node.Bool("switchSources", false);
    if (node.Has("directions")) {
      for (const auto& d : node.Member("directions").Elements()) {
        t.directions.push_back(static_cast<std::uint32_t>(d.IntIn(0, UINT32_MAX)));
      }
    }
    t.allowedDirections = static_cast<std::uint32_t>(
        node.Has("allowedDirections") ? node.Member("allowedDirections").IntIn(0, UINT32_MAX) : 0);
    t.takesDirectionPair = node.Bool("takesDirectionPair", false);
    t.antiAliasQuality = static_cast<int>(node.Int("antiAliasQuality", kTransitionAntiAliasOff));
    if (node.Has("privateData"))
      t.privateData.bytes = FromHex(node.Member("privateData"));
    t.hasCustomSetup = node.Bool("hasCustomSetup", false);
    return t;
  }

  void LoadChainInto(const Node& node, ComponentChain& chain, MediaType mediaType) {
    mIds.Claim(node, chain);
    std::vector<ComponentRef> components;
    for (const auto& c : node.Member("components").Elements()) {
      auto component = LoadComponent(c);
      if (component->GetMediaType() != mediaType) {
        c.Member("mediaType").Fail("does not match its chain");
      }
      if (component->IsMask()) {
        c.Member("role").Fail("a mask belongs in its effect's masks, not in a chain");
      }
      components.push_back(component);
    }
    chain.SetComponents(std::move(components));
  }

  ComponentRef LoadComponent(const Node& node) {
    auto component =
        Component::Create(node.Member("matchName").String(), node.String("effectName", ""),
                          LoadMediaType(node.Member("mediaType")), node.Bool("intrinsic", false));
    mIds.Claim(node, *component);
    component->SetInstanceName(node.String("instanceName", ""));
    if (node.Has("role")) {
      component->SetRole(static_cast<ComponentRole>(node.Member("role").IntIn(0, 4)));
    }
    component->SetArchived(node.Bool("archived", false),
                           static_cast<int>(node.Int("archivedType", 0)));
    component->SetBypass(node.Bool("bypass", false));
    component->SetOffline(node.Bool("offline", false));
    component->SetHasSetupDialog(node.Bool("hasSetupDialog", false));
    component->SetCanTakeMasks(node.Bool("canTakeMasks", false));
    for (const auto& p : node.Member("params").Elements()) {
      component->AddParam(LoadParam(p));
    }
    if (node.Has("presets"))
      component->SetPresets(LoadPresets(node.Member("presets"), *component));
    if (node.Has("currentPreset")) {
      const auto current = node.Member("currentPreset");
      if (!component->SetCurrentPreset(current.IntIn(-1, INT32_MAX))) {
        current.Fail("no such preset");
      }
    }
    if (node.Has("expansion")) {
      component->GetExpansionProperties() = LoadProperties(node.Member("expansion"));
    }
    if (node.Has("masks")) {
      const auto masksNode = node.Member("masks");
      const auto elements = masksNode.Elements();
      if (!elements.empty() && !component->CanTakeMasks()) {
        masksNode.Fail("effect \"" + Excerpt(component->GetMatchName()) +
                       "\" cannot take masks (canTakeMasks is false)");
      }
      std::vector<ComponentRef> masks;
      for (const auto& m : elements)
        masks.push_back(LoadComponent(m));
      component->SetMasks(std::move(masks));
    }
    return component;
  }

  std::vector<ComponentPreset> LoadPresets(const Node& node, const Component& component) {
    std::vector<ComponentPreset> presets;
    for (const auto& p : node.Elements()) {
      ComponentPreset preset;
      preset.name = p.Member("name").String();
      for (const auto& v : p.Member("values").Elements()) {
        const auto position = v.Member("param");
        const auto index = position.IntIn(0, INT32_MAX);
        if (static_cast<std::size_t>(index) >= component.GetParamCount()) {
          position.Fail("no parameter at this position");
        }
        preset.values.emplace_back(static_cast<std::size_t>(index), LoadValue(v.Member("value")));
      }
      presets.push_back(std::move(preset));
    }
    return presets;
  }

  ComponentParamRef LoadParam(const Node& node) {
    const auto typeNode = node.Member("type");
    auto type = static_cast<ParamType>(typeNode.IntIn(0, 1000));
    // Older files typed gains apart; today a gain is a number parameter with the gain flag.
    const bool oldGainType = type == ParamType::AudioGain;
    if (oldGainType) {
      type = ParamType::FloatSlider;
    }
    auto param = ComponentParam::Create(node.Member("name").String(), type,
                                        LoadValue(node.Member("default")));
    mIds.Claim(node, *param);
    if (node.Has("groupKind")) {
      param->SetGroupKind(static_cast<GroupKind>(node.Member("groupKind").IntIn(0, 1000)));
    }
    const double minimum = node.Number("min", param->GetMinimum());
    const double maximum = node.Number("max", param->GetMaximum());
    if (maximum < minimum)
      node.Member("max").Fail("is below min");
    param->SetRange(minimum, maximum);
    if (node.Has("sliderMin") || node.Has("sliderMax")) {
      const double sliderMin = node.Number("sliderMin", minimum);
      const double sliderMax = node.Number("sliderMax", maximum);
      if (sliderMax < sliderMin)
        node.Member("sliderMax").Fail("is below sliderMin");
      param->SetSliderRange(sliderMin, sliderMax);
    }
    if (node.Has("precision"))
      param->SetPrecision(node.Member("precision").IntIn(0, 15));
    if (node.Has("exponent")) {
      const auto exponent = node.Member("exponent");
      if (exponent.Number() <= 0.0)
        exponent.Fail("must be positive");
      param->SetExponent(exponent.Number());
    }
    if (node.Has("units")) {
      param->SetUnits(static_cast<ParamUnits>(node.Member("units").IntIn(0, 5)));
    }
    if (node.Has("step"))
      param->SetStep(node.Member("step").Number());
    if (node.Has("menu")) {
      std::vector<std::string> entries;
      for (const auto& e : node.Member("menu").Elements())
        entries.push_back(e.String());
      param->SetMenuEntries(std::move(entries));
    }
    param->SetCanVaryOverTime(node.Bool("canVary", true));
    if (node.Has("timebase")) {
      const auto timebaseNode = node.Member("timebase");
      const FrameRate timebase = LoadFrameRate(timebaseNode);
      if (timebase.IsAudio())
        timebaseNode.Fail("must be a video frame rate");
      param->SetParameterTimebase(timebase);
    }
    if (node.Has("checkboxName"))
      param->SetCheckboxDisplayName(node.Member("checkboxName").String());
    if (node.Bool("audioGain", oldGainType)) {
      if (param->GetValueKind() != ParamValueKind::Double) {
        (node.Has("audioGain") ? node.Member("audioGain") : typeNode)
            .Fail("a gain must be a number");
      }
      param->SetAudioGain(true);
    }
    if (node.Has("disablesWhenOn")) {
      std::vector<std::string> names;
      for (const auto& e : node.Member("disablesWhenOn").Elements())
        names.push_back(e.String());
      param->SetDisablesWhenOn(std::move(names));
    }
    param->SetVisible(node.Bool("visible", true));
    param->SetEnabled(node.Bool("enabled", true));
    param->SetReadOnly(node.Bool("readOnly", false));
    param->ApplyState(LoadParamState(node, *param));
    return param;
  }

  ComponentParam::State LoadParamState(const Node& node, const ComponentParam& param) {
    ComponentParam::State state;
    state.value = param.GetDefaultValue();
    if (node.Has("value")) {
      const auto valueNode = node.Member("value");
      auto value = param.Coerce(LoadValue(valueNode));
      if (!value)
        valueNode.Fail("does not suit the parameter (kind or range)");
      state.value = *value;
    }
    state.timeVarying = node.Bool("timeVarying", false);
    if (state.timeVarying && !param.CanVaryOverTime()) {
      node.Member("timeVarying").Fail("the parameter cannot vary over time");
    }
    if (node.Has("keyframes")) {
      for (const auto& k : node.Member("keyframes").Elements()) {
        const auto keyframe = LoadKeyframe(k, param);
        const auto status = state.keyframes.Add(keyframe);
        if (status != CurveStatus::Ok)
          k.Fail(std::string("cannot be stored: ") + ToString(status));
      }
    }
    return state;
  }

  Keyframe LoadKeyframe(const Node& node, const ComponentParam& param) {
    Keyframe k;
    k.time = node.Member("time").Time();
    const auto valueNode = node.Member("value");
    auto value = param.Coerce(LoadValue(valueNode));
    if (!value)
      valueNode.Fail("does not suit the parameter (kind or range)");
    k.value = *value;
    if (node.Has("interpolation")) {
      const auto code = node.Member("interpolation");
      auto mode = TemporalInterpolationFromCode(code.IntIn(0, 4));
      if (!mode)
        code.Fail("unknown temporal interpolation");
      k.interpolation = *mode;
    }
    if (node.Has("spatial")) {
      const auto code = node.Member("spatial");
      auto mode = SpatialInterpolationFromCode(code.IntIn(1, 4));
      if (!mode)
        code.Fail("unknown spatial interpolation");
      k.spatial = *mode;
    }
    k.inSpeed = node.Number("inSpeed", 0.0);
    k.outSpeed = node.Number("outSpeed", 0.0);
    k.inInfluence = node.Number("inInfluence", kDefaultInfluence);
    k.outInfluence = node.Number("outInfluence", kDefaultInfluence);
    for (const char* key : {"inInfluence", "outInfluence"}) {
      const double influence = key[0] == 'i' ? k.inInfluence : k.outInfluence;
      if (influence < kMinimumInfluence || influence > kMaximumInfluence) {
        node.Member(key).Fail("expected an influence from 0.002 to 1");
      }
    }
    if (node.Has("inTangent"))
      k.inTangent = LoadPoint(node.Member("inTangent"));
    if (node.Has("outTangent"))
      k.outTangent = LoadPoint(node.Member("outTangent"));
    return k;
  }

  void ApplySelection(Project& project, Sequence& sequence, const Node& node) {
    std::vector<TrackItemRef> items;
    for (const auto& id : node.Elements()) {
      auto item = sequence.FindTrackItem(id.Int("a track item id"));
      if (!item)
        id.Fail("no track item of this sequence has this id");
      items.push_back(item);
    }
    (void)project;
    sequence.SetSelection(items, false);
  }

  IdRegistry mIds;
  std::map<ObjectID, MediaRef> mMedia;
  std::map<ObjectID, MasterClipRef> mMasterClips;
  std::vector<std::pair<SequenceRef, Node>> mSelections;
};

}  // namespace

ProjectLoadResult ProjectFileReader::Read(std::string_view text) {
  std::string error;
  const auto root = JsonDocumentReader::Read(text, kMaxNestingDepth, &error);
  if (!root)
    return {nullptr, OneLine(error)};
  try {
    return {Loader().Load(*root), {}};
  } catch (const LoadError& e) {
    return {nullptr, OneLine(e.message)};
  } catch (const std::exception& e) {
    // The checks above should leave the library nothing to throw; if it does, still no crash.
    return {nullptr, OneLine(std::string("file: cannot be read: ") + e.what())};
  }
}
