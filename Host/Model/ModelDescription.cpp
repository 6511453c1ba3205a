#include "Host/Model/ModelDescription.h"

#include <sstream>

#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"

namespace {

std::string Indent(int depth) {
  return std::string(static_cast<std::size_t>(depth) * 2, ' ');
}

std::string Optional(const std::optional<TickTime>& time) {
  return time ? std::to_string(*time) : "unset";
}

void DescribeKeyframe(std::ostream& out, const Keyframe& k, int depth) {
  out << Indent(depth) << "key t=" << k.time << " v=" << ToString(k.value)
      << " interp=" << ToString(k.interpolation) << " spatial=" << ToString(k.spatial) << " in=("
      << k.inSpeed << "," << k.inInfluence << ") out=(" << k.outSpeed << "," << k.outInfluence
      << ") tangents=(" << k.inTangent.x << "," << k.inTangent.y << ")/(" << k.outTangent.x << ","
      << k.outTangent.y << ")\n";
}

void DescribeParam(std::ostream& out, const ComponentParam& param, int depth) {
  out << Indent(depth) << "param #" << param.GetID() << " \"" << param.GetName()
      << "\" type=" << param.GetTypeCode() << " group=" << param.GetGroupKindCode()
      << " value=" << ToString(param.GetConstantValue()) << " varying=" << param.IsTimeVarying()
      << " visible=" << param.IsVisible() << " enabled=" << param.IsEnabled()
      << " readonly=" << param.IsReadOnly() << "\n";
  for (const Keyframe& k : param.GetKeyframes().Keyframes()) {
    DescribeKeyframe(out, k, depth + 1);
  }
}

void DescribeComponent(std::ostream& out, const Component& component, int depth) {
  out << Indent(depth) << "component #" << component.GetID() << " " << component.GetMatchName()
      << " name=\"" << component.GetDisplayName() << "\" instance=\"" << component.GetInstanceName()
      << "\" intrinsic=" << component.IsIntrinsic() << " bypass=" << component.IsBypassed()
      << " offline=" << component.IsOffline() << " archived=" << component.IsArchived() << "/"
      << component.GetArchivedType() << " preset=" << component.GetCurrentPreset() << "\n";
  for (const ComponentParamRef& param : component.GetParams()) {
    DescribeParam(out, *param, depth + 1);
  }
  for (const ComponentRef& mask : component.GetMasks()) {
    out << Indent(depth + 1) << "mask:\n";
    DescribeComponent(out, *mask, depth + 2);
  }
}

void DescribeChain(std::ostream& out, const ComponentChain& chain, int depth) {
  out << Indent(depth) << "chain #" << chain.GetID() << " count=" << chain.GetCount() << "\n";
  for (const ComponentRef& component : chain.GetComponents()) {
    DescribeComponent(out, *component, depth + 1);
  }
}

void DescribeItem(std::ostream& out, const TrackItem& item, int depth) {
  out << Indent(depth) << (item.IsClip() ? "clip #" : "transition #") << item.GetID() << " \""
      << item.GetName() << "\" [" << item.GetStart() << "," << item.GetEnd()
      << ") in=" << item.GetMediaIn() << " speed=" << item.GetSpeed()
      << " master=" << (item.GetMasterClip() ? item.GetMasterClip()->GetID() : 0)
      << " label=" << item.GetLabelColor() << " part=" << item.GetPartOrderKey()
      << " link=" << item.GetLinkGroup() << " intro=" << item.GetIntroDuration()
      << " outro=" << item.GetOutroDuration() << " locked=" << item.AreIntroOutroLocked() << "\n";
  if (item.IsTransition()) {
    const TransitionData& t = item.GetTransitionData();
    out << Indent(depth + 1) << "transition " << t.matchName << " cut=" << t.cutRatio
        << " start%=" << t.startPercent << " end%=" << t.endPercent << " startPos=("
        << t.startPosition.x << "," << t.startPosition.y << ") endPos=(" << t.endPosition.x << ","
        << t.endPosition.y << ") border=" << t.borderWidth << " "
        << ToString(ParamValue(t.borderColor)) << " reverse=" << t.reverse
        << " switch=" << t.switchSources << " directions=";
    for (std::uint32_t d : t.directions) {
      out << d << ";";
    }
    out << " aa=" << t.antiAliasQuality << " private=" << t.privateData.bytes.size() << "\n";
  }
  DescribeChain(out, *item.GetComponentChain(), depth + 1);
}

void DescribeMarkers(std::ostream& out, const Markers& markers, int depth) {
  for (const Marker& m : markers.All()) {
    out << Indent(depth) << "marker t=" << m.time << " d=" << m.duration << " \"" << m.name
        << "\" \"" << m.comment << "\" color=" << m.colorIndex << "\n";
  }
}

void DescribeSequence(std::ostream& out, const Sequence& sequence, int depth) {
  out << Indent(depth) << "sequence #" << sequence.GetID() << " \"" << sequence.GetName()
      << "\" video=" << sequence.GetVideoFrameRate().GetTicksPerFrame()
      << " audio=" << sequence.GetAudioFrameRate().GetTicksPerFrame()
      << " audioAligned=" << sequence.IsAudioFrameAligned() << " zero=" << sequence.GetZeroPoint()
      << " in=" << Optional(sequence.GetInPoint()) << " out=" << Optional(sequence.GetOutPoint())
      << " time=" << sequence.GetCurrentTime() << " readonly=" << sequence.IsReadOnly() << "\n";
  DescribeMarkers(out, sequence.GetMarkers(), depth + 1);
  out << Indent(depth + 1) << "selection:";
  for (const TrackItemGroup& group : sequence.GetSelection()) {
    out << " {";
    for (const TrackItemRef& item : group.videoItems) {
      out << " v" << item->GetID();
    }
    for (const TrackItemRef& item : group.audioItems) {
      out << " a" << item->GetID();
    }
    out << " }";
  }
  out << "\n";
  for (const auto* tracks : {&sequence.GetVideoTracks(), &sequence.GetAudioTracks()}) {
    for (const TrackRef& track : *tracks) {
      out << Indent(depth + 1) << "track #" << track->GetID()
          << (track->GetMediaType() == MediaType::Video ? " video" : " audio") << "\n";
      for (const TrackItemRef& item : track->GetItems()) {
        DescribeItem(out, *item, depth + 2);
      }
    }
  }
}

}  // namespace

std::string DescribeForTest(const Project& project) {
  std::ostringstream out;
  out << "project \"" << project.GetName() << "\" readonly=" << project.IsReadOnly()
      << " active=" << (project.GetActiveSequence() ? project.GetActiveSequence()->GetID() : 0)
      << "\n";
  for (const SequenceRef& sequence : project.GetSequences()) {
    DescribeSequence(out, *sequence, 1);
  }
  for (const MasterClipRef& clip : project.GetMasterClips()) {
    out << "  masterclip #" << clip->GetID() << " \"" << clip->GetName()
        << "\" media=" << (clip->GetMedia() ? clip->GetMedia()->GetName() : "")
        << " in=" << Optional(clip->GetInPoint()) << " out=" << Optional(clip->GetOutPoint())
        << " graphic=" << clip->IsGraphic() << clip->IsMasterGraphic() << clip->IsTemplate()
        << "\n";
    DescribeMarkers(out, clip->GetMarkers(), 2);
    DescribeChain(out, *clip->GetVideoChain(), 2);
  }
  return out.str();
}

std::string DescribeForTest(const Sequence& sequence) {
  std::ostringstream out;
  DescribeSequence(out, sequence, 0);
  return out.str();
}

std::string DescribeForTest(const TrackItem& item) {
  std::ostringstream out;
  DescribeItem(out, item, 0);
  return out.str();
}

std::string DescribeForTest(const Component& component) {
  std::ostringstream out;
  DescribeComponent(out, component, 0);
  return out.str();
}

std::string DescribeForTest(const ComponentParam& param) {
  std::ostringstream out;
  DescribeParam(out, param, 0);
  return out.str();
}
