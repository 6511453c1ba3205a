#include <cairo.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <limits>
#include <string>

#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Image.h"
#include "Tests/Host/Toolkit/DrawingTestSupport.h"

namespace {

std::filesystem::path TempDir() {
  auto dir = std::filesystem::temp_directory_path() /
             ("toolkit-image-" + std::to_string(::testing::UnitTest::GetInstance()->random_seed()) +
              "-" + ::testing::UnitTest::GetInstance()->current_test_info()->name());
  std::filesystem::create_directories(dir);
  return dir;
}

TEST(ImagePNG, WrittenPicturesReadBackWithTheirSizeAndPixels) {
  const auto dir = TempDir();
  const std::string path = (dir / "picture.png").string();
  Image image = MakeCanvas({30, 20}, kTestBackground, 2.0);
  {
    DC dc(image);
    dc.FillRect({5, 5, 10, 10}, kTestRed);
    dc.FillRect({0, 0, 2, 2}, Color(0, 255, 0, 128));
  }
  std::string error;
  ASSERT_TRUE(image.SavePNG(path, &error)) << error;

  cairo_surface_t* loaded = cairo_image_surface_create_from_png(path.c_str());
  ASSERT_EQ(cairo_surface_status(loaded), CAIRO_STATUS_SUCCESS);
  EXPECT_EQ(cairo_image_surface_get_width(loaded), 60);
  EXPECT_EQ(cairo_image_surface_get_height(loaded), 40);
  cairo_surface_destroy(loaded);

  const Image back = Image::LoadPNG(path, 2.0, &error);
  ASSERT_FALSE(back.IsEmpty()) << error;
  EXPECT_EQ(back.GetLogicalSize(), (Size{30, 20}));
  EXPECT_EQ(back.GetPixel(15, 15), kTestRed);
  EXPECT_TRUE(NearColor(back.GetPixel(1, 1), image.GetPixel(1, 1), 2));
  std::filesystem::remove_all(dir);
}

TEST(ImagePNG, FailuresAreReportedNotHidden) {
  std::string error;
  EXPECT_FALSE(Image().SavePNG("/tmp/never-written.png", &error));
  EXPECT_FALSE(error.empty());
  error.clear();
  Image image = MakeCanvas({4, 4}, kTestRed);
  EXPECT_FALSE(image.SavePNG("/nonexistent-directory/x.png", &error));
  EXPECT_NE(error.find("/nonexistent-directory/x.png"), std::string::npos);
  error.clear();
  EXPECT_TRUE(Image::LoadPNG("/nonexistent-directory/x.png", 1.0, &error).IsEmpty());
  EXPECT_FALSE(error.empty());
}

TEST(ImageSize, ImpossibleSizesGiveEmptyImages) {
  EXPECT_TRUE(Image(Size{0, 10}).IsEmpty());
  EXPECT_TRUE(Image(Size{-5, 10}).IsEmpty());
  EXPECT_TRUE(Image(Size{40000, 10}).IsEmpty());
  EXPECT_TRUE(Image(Size{20000, 10}, 2.0).IsEmpty());
  EXPECT_TRUE(Image::FromPixelSize({1 << 30, 1 << 30}).IsEmpty());
  const Image odd(Size{10, 10}, std::numeric_limits<double>::quiet_NaN());
  EXPECT_EQ(odd.GetScaleFactor(), 1.0);
  EXPECT_EQ(odd.GetPixelSize(), (Size{10, 10}));
  const Image fractional(Size{10, 10}, 1.5);
  EXPECT_EQ(fractional.GetPixelSize(), (Size{15, 15}));
}

TEST(ImagePixels, OutsideReadsAreTransparentAndClonesAreIndependent) {
  Image image = MakeCanvas({3, 3}, kTestRed);
  EXPECT_EQ(image.GetPixel(-1, 0), Color(0, 0, 0, 0));
  EXPECT_EQ(image.GetPixel(3, 0), Color(0, 0, 0, 0));
  Image copy = image.Clone();
  copy.Clear(kTestGreen);
  EXPECT_EQ(image.GetPixel(1, 1), kTestRed);
  EXPECT_EQ(copy.GetPixel(1, 1), kTestGreen);
  Image moved = std::move(copy);
  EXPECT_EQ(moved.GetPixel(1, 1), kTestGreen);
  EXPECT_TRUE(copy.IsEmpty());  // NOLINT(bugprone-use-after-move): moved-from is empty by contract
}

}  // namespace
