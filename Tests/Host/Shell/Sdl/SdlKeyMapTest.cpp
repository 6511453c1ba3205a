#include <SDL.h>
#include <gtest/gtest.h>

#include "Host/Shell/Sdl/SdlKeyMap.h"

namespace {

TEST(SdlKeyMap, LettersBecomeUpperCaseCodes) {
  EXPECT_EQ(KeyCodeFromSdlKey(SDLK_a), KeyCode::kA);
  EXPECT_EQ(KeyCodeFromSdlKey(SDLK_z), KeyCode::kZ);
  EXPECT_EQ(SdlKeyFromKeyCode(KeyCode::kQ), SDLK_q);
}

TEST(SdlKeyMap, EveryToolkitKeyRoundTrips) {
  for (std::uint32_t code = 1; code < 0x200; ++code) {
    const auto key = static_cast<KeyCode>(code);
    if (KeyCodeName(key).empty())
      continue;
    const auto sdl = SdlKeyFromKeyCode(key);
    ASSERT_NE(sdl, SDLK_UNKNOWN) << KeyCodeName(key);
    EXPECT_EQ(KeyCodeFromSdlKey(sdl), key) << KeyCodeName(key);
  }
}

TEST(SdlKeyMap, KeypadEnterIsReturnAndModifierKeysAreNoKeys) {
  EXPECT_EQ(KeyCodeFromSdlKey(SDLK_KP_ENTER), KeyCode::kReturn);
  EXPECT_EQ(SdlKeyFromKeyCode(KeyCode::kReturn), SDLK_RETURN);
  EXPECT_FALSE(KeyCodeFromSdlKey(SDLK_LSHIFT).has_value());
  EXPECT_TRUE(IsSdlModifierKey(SDLK_RCTRL));
  EXPECT_FALSE(IsSdlModifierKey(SDLK_a));
}

TEST(SdlKeyMap, ModifiersMapBothSidesAndIgnoreOthers) {
  EXPECT_EQ(KeyModifiersFromSdl(KMOD_RSHIFT | KMOD_LCTRL), kKeyModifierShift | kKeyModifierCtrl);
  EXPECT_EQ(KeyModifiersFromSdl(KMOD_RALT | KMOD_NUM | KMOD_CAPS | KMOD_LGUI), kKeyModifierAlt);
  for (KeyModifiers m = 0; m <= kKeyModifierMask; ++m) {
    const KeyModifiers valid = m & kKeyModifierMask;
    EXPECT_EQ(KeyModifiersFromSdl(SdlModifiersFromKeyModifiers(valid)), valid);
  }
}

}  // namespace
