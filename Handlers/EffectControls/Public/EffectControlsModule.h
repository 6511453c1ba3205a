#pragma once

#include <memory>
#include <string>

#include "Host/Shell/Module.h"

// The effect-controls plug-in module. The host makes it through CreateModule when it loads the
// plug-in and keeps it until it shuts down; it holds nothing beyond the base.
class EffectControlsModule : public Module {
 public:
  explicit EffectControlsModule(std::wstring name);
  ~EffectControlsModule() override;
};

// The module entry: makes the module named `name` and declares the panel's commands in the
// shortcut context "effectcontrols". Null when the module cannot be made. UI thread.
std::unique_ptr<Module> CreateModule(const std::wstring& name);

// Do nothing; the host refers to them so that a static link keeps the plug-in's registrations.
void Weaklink();
void SelfRegistrationSymbol();
