#pragma once

#include <cstdint>

#include "Host/Toolkit/ButtonControl.h"
#include "Host/Toolkit/ControlStation.h"

// The triangle that opens and closes a row or a group. A click (or Space) flips it and
// broadcasts DisclosureTriangleStateChangedMessage (id, open, modifiers) on its station, then
// sends the command when one is set. It takes no focus on click. SetOpen from code sends nothing.
class DisclosureTriangle : public ButtonControl {
 public:
  DisclosureTriangle(const Rect& bounds, std::int32_t id, bool open = false,
                     Commander* commander = nullptr);

  const StationName& GetStation() const { return mStation.GetName(); }

  void SetOpen(bool open);
  bool IsOpen() const { return mOpen; }
  std::int32_t GetControlID() const { return mID; }

  void PaintSelf(DC& dc) override;

 protected:
  bool ClickSelf(KeyModifiers modifiers) override;

 private:
  ControlStation mStation{"DisclosureTriangle"};
  std::int32_t mID;
  bool mOpen;
};
