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

// Reference counting through a forward declaration, so a header can hold a reference to an
// object whose class it does not include.
#define HOST_MODEL_DECLARE_REF_COUNTING(Class)     \
  void intrusive_ptr_add_ref(const Class* object); \
  void intrusive_ptr_release(const Class* object);
HOST_MODEL_DECLARE_REF_COUNTING(Project)
HOST_MODEL_DECLARE_REF_COUNTING(Sequence)
HOST_MODEL_DECLARE_REF_COUNTING(Track)
HOST_MODEL_DECLARE_REF_COUNTING(TrackItem)
HOST_MODEL_DECLARE_REF_COUNTING(MasterClip)
HOST_MODEL_DECLARE_REF_COUNTING(Media)
HOST_MODEL_DECLARE_REF_COUNTING(ComponentChain)
HOST_MODEL_DECLARE_REF_COUNTING(Component)
HOST_MODEL_DECLARE_REF_COUNTING(ComponentParam)
#undef HOST_MODEL_DECLARE_REF_COUNTING

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
