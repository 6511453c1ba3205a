#pragma once

#include <array>
#include <memory>
#include <string>
#include <string_view>

#include "Handlers/EffectControls/Src/ToolMode.h"
#include "Host/Messaging/Listener.h"
#include "Host/Shell/Handler.h"
#include "Host/Toolkit/Decals.h"

class EffectControlsView;
class ImageList;
class ShortcutManager;

// The effect-controls panel's handler: registers the panel with the host (stations, colour set,
// menus, the shared keyframe images, window class, window and window menu), makes the panel's
// tab view on request and passes the timeline tool on to it.
//
// Made by the handler factory registered at load and owned by the application; at most one
// exists at a time (GetInstance). Construction fails (throws std::runtime_error after undoing
// what it did) when a registration is refused; the factory then returns null. UI thread only.
class EffectControlsHandler : public Handler, public Listener {
 public:
  static constexpr std::string_view kContextName = "effectcontrols";
  static constexpr std::string_view kResetStation = "EffectControls.Reset";
  static constexpr std::string_view kAudioPlayerRelayStation = "ECW.audio.player.relay";
  static constexpr std::string_view kColorSetName = "effectcontrolscolors";
  static constexpr std::string_view kFlyoutMenuName = "HandlerEffectControls_Flyout_Menu";
  static constexpr CommandID kKeyRepeatsDisabledCommand = 12052;

  // The keyframe images, in image-list order: 6 x kind + variant, then time remapping.
  static constexpr int kKeyframeImageCount = 48;
  static const std::array<Decal, kKeyframeImageCount>& GetKeyframeImageDecals();

  explicit EffectControlsHandler(std::string_view handlerID);
  ~EffectControlsHandler() override;

  // The live handler, or null.
  static EffectControlsHandler* GetInstance();

  // Declares the panel's context and commands (the module registers it with the shortcut
  // manager, which calls it with itself).
  static void SetUpCommandContext(ShortcutManager& shortcuts);

  // --- CommandHandler ---
  // 11311, 11916, 11917 go to their Handler hooks; when those decline, and for every other
  // command, the CommandHandler base answers.
  bool ObeyCommand(CommandID command) override;
  std::string GetContextName() const override { return std::string(kContextName); }

  // --- TabViewCreator ---
  // Replaces the previous view (destroyed first), hands the new one to `frame`, gives it the
  // active sequence and its clip selection, and the current tool mode.
  TabView* CreateTabView(TabFrame* frame, const PropertyList& state) override;
  bool IsSingleInstance() const override { return true; }

  // --- Listener ---
  // Tool changes and opened track-item selections (a transition brings the tab to the front).
  void ListenToMessage(const Message& message) override;

  ToolMode GetToolMode() const { return mToolMode; }
  // The panel's view; null before the host asked for it and after its tab was destroyed.
  EffectControlsView* GetView() const;
  // The images every keyframe track draws from (also handed to the rows).
  const std::shared_ptr<const ImageList>& GetKeyframeImageList() const { return mKeyframeImages; }

 private:
  void SetToolMode(ToolMode mode);
  // Drops a view whose tab the host destroyed (a closed tab).
  void ForgetDestroyedView();

  ToolMode mToolMode = ToolMode::kPointer;
  std::shared_ptr<EffectControlsView> mView;  // shared with the workspace frame
  std::shared_ptr<const ImageList> mKeyframeImages;
  bool mWindowClassAdded = false;
};
