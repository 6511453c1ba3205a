#include "Handlers/EffectControls/Src/EffectControlsHandler.h"

#include <functional>
#include <optional>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "Handlers/EffectControls/Src/EffectControlsResources.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Localization.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/TrackItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Shell/Application.h"
#include "Host/Shell/ShellIdentifiers.h"
#include "Host/Shell/ShellMessages.h"
#include "Host/Shell/WorkspaceFrame.h"
#include "Host/Toolkit/Bitmap.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/CommandContext.h"
#include "Host/Toolkit/ImageList.h"
#include "Host/Toolkit/Menu.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/ShortcutManager.h"

namespace {

constexpr const char* kPanelContextLabel =
    "$$$/Vantile/Handlers/EffectControls/EffectControlsPanel=Effect Controls Panel";
constexpr const char* kWindowTitle =
    "$$$/Vantile/Handlers/EffectControls/EffectControls=Effect Controls";
constexpr const char* kPanelMenuLabel = "$$$/Vantile/Handlers/PanelMenu=Panel Menu";
constexpr int kWindowClassFlags = 1;

struct CommandEntry {
  const char* name;
  CommandID id;
  int kind;
  const char* shortcutLabel;  // "" where the command has none
};

// Every command of the panel, in declaration order.
constexpr CommandEntry kCommands[] = {
    {"cmd.effectcontrols.rename", 18001, 0, ""},
    {"cmd.effectcontrols.save.preset", 18002, 0, ""},
    {"cmd.effectcontrols.effects.enabled", 18003, 0, ""},
    {"cmd.edit.clear", 57632, 0, ""},
    {"cmd.effectcontrols.delete.all.effects", 11541, 0, ""},
    {"cmd.effectcontrols.toggle.snapping", 18006, 0, ""},
    {"cmd.effectcontrols.snap.to.video", 18007, 0, ""},
    {"cmd.effectcontrols.snap.to.audio", 18008, 0, ""},
    {"cmd.effectcontrols.snap.to.sequence.markers", 18009, 0, ""},
    {"cmd.effectcontrols.snap.to.cti", 18010, 0, ""},
    {"cmd.effectcontrols.snap.to.clip", 18011, 0, ""},
    {"cmd.effectcontrols.snap.to.all", 18012, 0, ""},
    {"cmd.effectcontrols.snap.to.none", 18013, 0, ""},
    {"cmd.effectcontrols.audio.sample.mode", 18052, 0, ""},
    {"cmd.effectcontrols.toggletimerulernumbers", 18054, 0, ""},
    {"cmd.effectcontrols.loop.audio", 18051, 0, ""},
    {"cmd.effectcontrols.pin.to.clip", 18053, 0, ""},
    {"cmd.effectcontrols.interpolation.linear", 18401, 2,
     "$$$/Vantile/Handlers/EffectControls/InterpolationEffectLinear=Keyframe Temporal "
     "Interpolation - Linear"},
    {"cmd.effectcontrols.interpolation.bezier", 18402, 2,
     "$$$/Vantile/Handlers/EffectControls/InterpolationEffectBezier=Keyframe Temporal "
     "Interpolation - Bezier"},
    {"cmd.effectcontrols.interpolation.bezier.auto", 18403, 2,
     "$$$/Vantile/Handlers/EffectControls/InterpolationEffectAutoBezier=Keyframe Temporal "
     "Interpolation - Auto Bezier"},
    {"cmd.effectcontrols.interpolation.bezier.continuous", 18404, 2,
     "$$$/Vantile/Handlers/EffectControls/InterpolationEffectContinuousBezier=Keyframe Temporal "
     "Interpolation - Continuous Bezier"},
    {"cmd.effectcontrols.interpolation.hold", 18405, 2,
     "$$$/Vantile/Handlers/EffectControls/InterpolationEffectHold=Keyframe Temporal "
     "Interpolation - Hold"},
    {"cmd.effectcontrols.interpolation.easein", 18406, 2,
     "$$$/Vantile/Handlers/EffectControls/InterpolationEffectEaseIn=Keyframe Temporal "
     "Interpolation - Ease In"},
    {"cmd.effectcontrols.interpolation.easeout", 18407, 2,
     "$$$/Vantile/Handlers/EffectControls/InterpolationEffectEaseOut=Keyframe Temporal "
     "Interpolation - Ease Out"},
    {"cmd.effectcontrols.interpolation.spatial.linear", 18408, 2,
     "$$$/Vantile/Handlers/EffectControls/SpatialInterpolationEffectLinear=Keyframe Spatial "
     "Interpolation - Linear"},
    {"cmd.effectcontrols.interpolation.spatial.bezier", 18409, 2,
     "$$$/Vantile/Handlers/EffectControls/SpatialInterpolationEffectBezier=Keyframe Spatial "
     "Interpolation - Bezier"},
    {"cmd.effectcontrols.interpolation.spatial.bezier.auto", 18410, 2,
     "$$$/Vantile/Handlers/EffectControls/SpatialInterpolationEffectAutoBezier=Keyframe Spatial "
     "Interpolation - Auto Bezier"},
    {"cmd.effectcontrols.interpolation.spatial.bezier.continuous", 18411, 2,
     "$$$/Vantile/Handlers/EffectControls/SpatialInterpolationEffectContinuousBezier=Keyframe "
     "Spatial Interpolation - Continuous Bezier"},
    {"cmd.effectcontrols.softness.off", 18461, 0, ""},
    {"cmd.effectcontrols.softness.low", 18462, 0, ""},
    {"cmd.effectcontrols.softness.medium", 18463, 0, ""},
    {"cmd.effectcontrols.softness.high", 18464, 0, ""},
    {"cmd.effectcontrols.txalign.center", 18471, 0, ""},
    {"cmd.effectcontrols.txalign.start", 18472, 0, ""},
    {"cmd.effectcontrols.txalign.end", 18473, 0, ""},
    {"cmd.effectcontrols.txalign.custom", 18474, 0, ""},
    {"cmd.effectcontrols.keyframes.clearall", 18420, 0, ""},
    {"cmd.effectcontrols.audioexpander", 18500, 2,
     "$$$/Vantile/Handlers/EffectControls/ExpandAudioEffects=Expand Audio Effects"},
    {"cmd.effectcontrols.videoexpander", 18499, 2,
     "$$$/Vantile/Handlers/EffectControls/ExpandVideoEffects=Expand Video Effects"},
    {"cmd.effectcontrols.masterclipvideoexpander", 18498, 3, ""},
    {"cmd.effectcontrols.masterclipaudioexpander", 19000, 3, ""},
    {"cmd.effectcontrols.xoeditabletextexpander", 19050, 3, ""},
    {"cmd.effectcontrols.own.slider.rows", 18055, 0, ""},
};

// The keyframe glyphs are one run of the decal list, already in image-list order.
constexpr Decal kFirstKeyframeDecal = kEffectControlsKeyLinearNormalDecal;
constexpr Decal kLastKeyframeDecal = kEffectControlsKeyTRDualHoldLeftSelectedDecal;
static_assert(kLastKeyframeDecal - kFirstKeyframeDecal + 1 ==
              EffectControlsHandler::kKeyframeImageCount);

constexpr std::array<Decal, EffectControlsHandler::kKeyframeImageCount> MakeKeyframeImageDecals() {
  std::array<Decal, EffectControlsHandler::kKeyframeImageCount> decals{};
  for (int i = 0; i < EffectControlsHandler::kKeyframeImageCount; ++i) {
    decals[i] = static_cast<Decal>(kFirstKeyframeDecal + i);
  }
  return decals;
}

constexpr std::array<Decal, EffectControlsHandler::kKeyframeImageCount> kKeyframeImageDecals =
    MakeKeyframeImageDecals();

EffectControlsHandler* gInstance = nullptr;

// What construction did so far, undone in reverse order when a later step fails.
class Unwinder {
 public:
  Unwinder() = default;
  Unwinder(const Unwinder&) = delete;
  Unwinder& operator=(const Unwinder&) = delete;
  ~Unwinder() {
    for (auto it = mSteps.rbegin(); it != mSteps.rend(); ++it) {
      (*it)();
    }
  }
  void Then(std::function<void()> undo) { mSteps.push_back(std::move(undo)); }
  void Commit() { mSteps.clear(); }

 private:
  std::vector<std::function<void()>> mSteps;
};

[[noreturn]] void Fail(const std::string& why) {
  throw std::runtime_error("Effect controls handler: " + why);
}

}  // namespace

const std::array<Decal, EffectControlsHandler::kKeyframeImageCount>&
EffectControlsHandler::GetKeyframeImageDecals() {
  return kKeyframeImageDecals;
}

EffectControlsHandler* EffectControlsHandler::GetInstance() {
  return gInstance;
}

void EffectControlsHandler::SetUpCommandContext(ShortcutManager& shortcuts) {
  CommandContext* context = shortcuts.AddContext(kContextName, kPanelContextLabel);
  if (!HOST_VERIFY(context != nullptr, "Cannot add the effect controls context")) {
    return;
  }
  for (const CommandEntry& command : kCommands) {
    context->DeclareCommand(command.name, command.id, command.kind, command.shortcutLabel,
                            std::nullopt, false);
  }
  shortcuts.DeclareKeyRepeatsDisabledCommand(kKeyRepeatsDisabledCommand);
}

EffectControlsHandler::EffectControlsHandler(std::string_view handlerID) : Handler(handlerID) {
  Unwinder unwind;
  if (gInstance != nullptr) {
    Fail("a handler exists already");
  }
  gInstance = this;
  unwind.Then([] { gInstance = nullptr; });

  for (std::string_view name : {kResetStation, kAudioPlayerRelayStation}) {
    const StationName station(name);
    if (!RegisterStation(station)) {
      Fail("the station " + station + " is taken");
    }
    unwind.Then([station] { DisposeStation(station); });
  }

  const std::string colorSet(kColorSetName);
  ColorManager::RegisterColorSet(colorSet, EffectControlsColorsResource());
  unwind.Then([colorSet] { ColorManager::UnregisterColorSet(colorSet); });

  std::string menuError;
  const std::optional<std::vector<Menu>> menus =
      Menu::Parse(EffectControlsMenusResource(), &menuError);
  if (!menus) {
    Fail("the menu resources do not parse: " + menuError);
  }
  for (const Menu& menu : *menus) {
    MenuRegistry::Instance().Register(menu);
    unwind.Then([name = menu.GetName()] { MenuRegistry::Instance().Remove(name); });
  }

  AddListener(kToolStation, *this);
  AddListener(kTrackItemActivationStation, *this);
  unwind.Then([this] { RemoveListenerFromAllStations(*this); });

  auto images = std::make_shared<ImageList>();
  for (const Decal decal : kKeyframeImageDecals) {
    if (images->Add(Bitmap::GetBitmap(decal)) < 0) {
      Fail("a keyframe image is missing");
    }
  }
  mKeyframeImages = images;
  ParameterControl::SetKeyframeImageList(mKeyframeImages);
  unwind.Then([this] {
    ParameterControl::SetKeyframeImageList(nullptr);
    mKeyframeImages.reset();
  });

  Application& application = Application::Instance();
  if (!application.AddWindowClass(kEffectControlsWindowTypeID, GetHandlerID(), kWindowClassFlags)) {
    Fail("the window class is taken");
  }
  mWindowClassAdded = true;
  unwind.Then([this, &application] {
    application.RemoveWindowClass(kEffectControlsWindowTypeID);
    mWindowClassAdded = false;
  });

  if (!application.AddWindow(kEffectControlsWindowTypeID, kWindowTitle, kDefaultWindowID,
                             kDefaultWindowContextID)) {
    Fail("the window is registered already");
  }

  // The window menu lives as long as the process's shortcut manager; a later handler of the
  // same process finds its own entry there.
  ShortcutManager& shortcuts = ShortcutManager::Instance();
  const std::string menuLabel =
      LocalizeString(kWindowTitle) + " " + LocalizeString(kPanelMenuLabel);
  if (const WindowMenuEntry* entry = shortcuts.FindWindowMenu(kContextName)) {
    if (entry->menuName != kFlyoutMenuName) {
      Fail("the window menu is taken");
    }
  } else if (!shortcuts.AddWindowMenuID(kContextName, menuLabel, kFlyoutMenuName)) {
    Fail("the window menu cannot be added");
  }
  unwind.Commit();
}

EffectControlsHandler::~EffectControlsHandler() {
  // The stations and the view go now; no message may reach this handler while they do.
  RemoveListenerFromAllStations(*this);
  if (mView) {
    mView->Destroy();
    mView.reset();
    if (Application* application = Application::InstanceOrNull()) {
      application->GetWorkspaceFrame().TabsChanged();
    }
  }
  if (ParameterControl::GetKeyframeImageList() == mKeyframeImages) {
    ParameterControl::SetKeyframeImageList(nullptr);
  }
  mKeyframeImages.reset();
  if (mWindowClassAdded) {
    if (Application* application = Application::InstanceOrNull()) {
      application->RemoveWindowClass(kEffectControlsWindowTypeID);
    }
  }
  DisposeStation(StationName(kResetStation));
  DisposeStation(StationName(kAudioPlayerRelayStation));
  if (gInstance == this) {
    gInstance = nullptr;
  }
}

bool EffectControlsHandler::ObeyCommand(CommandID command) {
  switch (command) {
    case kCommandSelectFindBox:
      if (OnSelectFindBox()) {
        return true;
      }
      break;
    case kCommandSelectNextPanel:
      if (OnSelectNextPanel()) {
        return true;
      }
      break;
    case kCommandSelectPreviousPanel:
      if (OnSelectPreviousPanel()) {
        return true;
      }
      break;
    default:
      break;
  }
  return CommandHandler::ObeyCommand(command);
}

TabView* EffectControlsHandler::CreateTabView(TabFrame* frame, const PropertyList& /*state*/) {
  if (mView) {
    mView->Destroy();
    mView.reset();
  }
  Application& application = Application::Instance();
  auto view = std::make_shared<EffectControlsView>(application.GetParentForNewViews(),
                                                   std::string(kContextName));
  mView = view;
  view->Create(GetHandlerID(), view->GetName(), frame, true);

  if (SequenceRef sequence = application.GetActiveSequence()) {
    view->OnSequenceActivated(sequence);
    view->RefreshFromClipSelection();
  }
  view->SetToolMode(mToolMode);
  return view.get();
}

EffectControlsView* EffectControlsHandler::GetView() const {
  return mView && !mView->IsDestroyed() ? mView.get() : nullptr;
}

void EffectControlsHandler::ForgetDestroyedView() {
  if (mView && mView->IsDestroyed()) {
    mView.reset();
  }
}

void EffectControlsHandler::ListenToMessage(const Message& message) {
  ForgetDestroyedView();
  if (const auto* opened = message.As<TrackItemSelectionOpenedMessage>()) {
    const bool transition =
        !opened->items.empty() && opened->items.front() && opened->items.front()->IsTransition();
    if (transition && mView) {
      mView->BringToFront(true, false);
    }
    return;
  }
  if (message.Is<PenToolSelectedMessage>()) {
    SetToolMode(ToolMode::kPen);
  } else if (message.Is<HandToolSelectedMessage>()) {
    SetToolMode(ToolMode::kHand);
  } else if (message.Is<ZoomToolSelectedMessage>()) {
    SetToolMode(ToolMode::kZoom);
  } else if (message.Is<PointerToolSelectedMessage>() ||
             message.Is<TrackSelectForwardToolSelectedMessage>() ||
             message.Is<RippleToolSelectedMessage>() || message.Is<RollToolSelectedMessage>() ||
             message.Is<RateStretchToolSelectedMessage>() ||
             message.Is<RazorToolSelectedMessage>() || message.Is<SlipToolSelectedMessage>() ||
             message.Is<SlideToolSelectedMessage>()) {
    SetToolMode(ToolMode::kPointer);
  }
}

void EffectControlsHandler::SetToolMode(ToolMode mode) {
  mToolMode = mode;
  if (mView) {
    mView->SetToolMode(mode);
  }
}
