#pragma once

#include <initializer_list>
#include <memory>
#include <vector>

#include "Host/Toolkit/Bitmap.h"
#include "Host/Toolkit/ButtonControl.h"

// A button that shows one of several pictures: picture i stands for value i (an expander's
// open and closed chevrons, play and stop, an effect's on and off switch). A click advances the
// value (the last wraps to 0) and sends the command; when nobody handles the command the value
// goes back, so the picture never claims what did not happen. Owners that decide the state
// themselves set the value from their command handler, which wins over the advance.
class MultiPictureButton : public ButtonControl {
 public:
  // `commander`: see ButtonControl. No pictures is allowed (nothing is drawn).
  MultiPictureButton(const Rect& bounds, CommandID command,
                     std::vector<std::shared_ptr<const Bitmap>> pictures,
                     Commander* commander = nullptr);
  MultiPictureButton(const Rect& bounds, CommandID command, std::initializer_list<Decal> pictures,
                     Commander* commander = nullptr);

  void SetPictures(std::vector<std::shared_ptr<const Bitmap>> pictures);
  int GetValueCount() const { return static_cast<int>(mPictures.size()); }

  // A value outside [0, count) is refused with a debug assertion.
  void SetValue(int value);
  int GetValue() const { return mValue; }

  void PaintSelf(DC& dc) override;

 protected:
  bool ClickSelf(KeyModifiers modifiers) override;

 private:
  std::vector<std::shared_ptr<const Bitmap>> mPictures;
  int mValue = 0;
};
