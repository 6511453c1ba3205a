// The host's renderer: the clip under the edit line with its effects applied for real.
#include <gtest/gtest.h>

#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Shell/FrameRenderer.h"
#include "Host/Toolkit/Image.h"

namespace {

constexpr TickTime kSecond = kTicksPerSecond;
constexpr Size kSize{192, 108};  // a tenth of the sequence's frame
constexpr Point kCentre{96, 54};

class FrameRendererTest : public ::testing::Test {
 protected:
  FrameRendererTest() {
    sequence = builder.AddSequence("Sequence");
    v1 = builder.AddTrack(sequence, MediaType::Video, "V1");
    master = builder.AddMasterClip(
        "Clip", builder.AddMedia("clip.mov", 20 * kSecond, ProjectBuilder::Streams::Video));
    clip = builder.AddClip(v1, master, {.start = 0, .end = 4 * kSecond});
    clip->SetLabelColor(0x4080C0);
  }

  void Set(std::string_view matchName, std::string_view param, const ParamValue& value) {
    const ComponentRef component = clip->GetComponentChain()->FindByMatchName(matchName);
    ASSERT_NE(component, nullptr) << matchName;
    ASSERT_TRUE(component->FindParam(param)->SetValueAt(0, value)) << param;
  }

  Color At(Point point, TickTime time = kSecond) const {
    return FrameRenderer::Render(*sequence, time, kSize).GetPixel(point.x, point.y);
  }

  MessagingTestScope messaging;
  ProjectBuilder builder{"Render"};
  SequenceRef sequence;
  TrackRef v1;
  MasterClipRef master;
  TrackItemRef clip;
};

void ExpectColor(Color actual, int r, int g, int b, int tolerance = 2) {
  EXPECT_NEAR(actual.r, r, tolerance);
  EXPECT_NEAR(actual.g, g, tolerance);
  EXPECT_NEAR(actual.b, b, tolerance);
}

TEST_F(FrameRendererTest, TheMiddleOfTheClipShowsItsLabelColourScaledByOpacity) {
  ExpectColor(At(kCentre), 0x40, 0x80, 0xC0);
  Set(kMatchName_Opacity, "Opacity", 50.0);
  ExpectColor(At(kCentre), 0x20, 0x40, 0x60);
  // A bypassed effect does nothing.
  clip->GetComponentChain()->FindByMatchName(kMatchName_Opacity)->SetBypass(true);
  ExpectColor(At(kCentre), 0x40, 0x80, 0xC0);
}

TEST_F(FrameRendererTest, MotionMovesScalesAndTurnsThePicture) {
  Set(kMatchName_Motion, "Position", ParamPoint{1920.0, 540.0});  // the anchor to the right edge
  ExpectColor(At({40, 54}), 0, 0, 0);
  ExpectColor(At({150, 54}), 0x40, 0x80, 0xC0);
  Set(kMatchName_Motion, "Position", ParamPoint{960.0, 540.0});
  Set(kMatchName_Motion, "Scale", 25.0);
  ExpectColor(At({10, 54}), 0, 0, 0);
  ExpectColor(At(kCentre), 0x40, 0x80, 0xC0);
  Set(kMatchName_Motion, "Scale", 0.0);  // nothing shows, and nothing breaks
  ExpectColor(At(kCentre), 0, 0, 0);
  Set(kMatchName_Motion, "Scale", 100.0);
  Set(kMatchName_Motion, "Rotation", 90.0);  // a 16:9 picture on end leaves the sides black
  ExpectColor(At({10, 54}), 0, 0, 0);
  ExpectColor(At(kCentre), 0x40, 0x80, 0xC0);
}

TEST_F(FrameRendererTest, BrightnessContrastAndBlurChangeThePixels) {
  ASSERT_NE(builder.AddEffect(clip, kMatchName_BrightnessContrast), nullptr);
  Set(kMatchName_BrightnessContrast, "Brightness", 50.0);
  ExpectColor(At(kCentre), 0x40 + 50, 0x80 + 50, 0xC0 + 50);
  Set(kMatchName_BrightnessContrast, "Brightness", 0.0);
  Set(kMatchName_BrightnessContrast, "Contrast", 100.0);  // doubles the distance from grey
  ExpectColor(At(kCentre), 0, 0x80, 0xFF, 3);
  // The white border is sharp; a blur spreads it.
  const Color sharp = At({0, 54});
  ASSERT_NE(builder.AddEffect(clip, kMatchName_GaussianBlur), nullptr);
  Set(kMatchName_GaussianBlur, "Blurriness", 60.0);
  const Color blurred = At({0, 54});
  EXPECT_LT(blurred.r + blurred.g + blurred.b, sharp.r + sharp.g + sharp.b - 60);
}

TEST_F(FrameRendererTest, HigherTracksCoverLowerOnesAndNoClipIsBlack) {
  const TrackRef v2 = builder.AddTrack(sequence, MediaType::Video, "V2");
  const TrackItemRef top = builder.AddClip(v2, master, {.start = 2 * kSecond, .end = 3 * kSecond});
  top->SetLabelColor(0xFF0000);
  ExpectColor(At(kCentre, kSecond), 0x40, 0x80, 0xC0);
  ExpectColor(At(kCentre, 2 * kSecond), 0xFF, 0, 0);
  EXPECT_EQ(FrameRenderer::TopClipAt(*sequence, 2 * kSecond), top);
  EXPECT_EQ(FrameRenderer::TopClipAt(*sequence, kSecond), clip);
  ExpectColor(At(kCentre, 10 * kSecond), 0, 0, 0);
  EXPECT_EQ(FrameRenderer::TopClipAt(*sequence, 10 * kSecond), nullptr);
}

TEST_F(FrameRendererTest, TheFrameIsCentredInAnyShapeAndATinySizeIsNoFault) {
  EXPECT_EQ(FrameRenderer::FrameRect(*sequence, {400, 100}), (Rect{111, 0, 289, 100}));
  EXPECT_EQ(FrameRenderer::FrameRect(*sequence, {192, 400}), (Rect{0, 146, 192, 254}));
  const Image tiny = FrameRenderer::Render(*sequence, kSecond, {1, 1});
  EXPECT_EQ(tiny.GetPixelSize(), (Size{1, 1}));
  const Image none = FrameRenderer::Render(*sequence, kSecond, {0, -5});
  EXPECT_EQ(none.GetPixelSize(), (Size{1, 1}));
}

}  // namespace
