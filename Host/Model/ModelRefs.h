#pragma once

#include <boost/intrusive_ptr.hpp>

// References to host model objects. Holding one keeps the object alive; the model's owners
// (project -> sequence -> track -> track item -> chain -> component -> parameter) hold them
// downwards and keep plain back pointers upwards, which they clear when a child leaves.
class Project;
class Sequence;
class Track;
class TrackItem;
class MasterClip;
class Media;
class ComponentChain;
class Component;
class ComponentParam;

using ProjectRef = boost::intrusive_ptr<Project>;
using SequenceRef = boost::intrusive_ptr<Sequence>;
using TrackRef = boost::intrusive_ptr<Track>;
using TrackItemRef = boost::intrusive_ptr<TrackItem>;
using MasterClipRef = boost::intrusive_ptr<MasterClip>;
using MediaRef = boost::intrusive_ptr<Media>;
using ComponentChainRef = boost::intrusive_ptr<ComponentChain>;
using ComponentRef = boost::intrusive_ptr<Component>;
using ComponentParamRef = boost::intrusive_ptr<ComponentParam>;

// The interface names the panel's code uses for the same classes: the model has one concrete
// class per object, reached only through its public members and the undoable actions.
using ISequence = Sequence;
using ITrackItem = TrackItem;
using IMasterClip = MasterClip;
using IComponentChain = ComponentChain;
using IComponent = Component;
using IComponentParam = ComponentParam;
