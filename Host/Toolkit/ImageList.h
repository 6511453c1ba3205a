#pragma once

#include <memory>
#include <vector>

#include "Host/Toolkit/Bitmap.h"
#include "Host/Toolkit/Geometry.h"

class DC;

// An ordered list of bitmaps drawn by index (e.g. the keyframe glyphs, index = kind x 6 +
// variant). Holds shared references; copying the list shares the bitmaps.
class ImageList {
 public:
  ImageList() = default;

  // Returns the new image's index. A null bitmap is refused (-1, reported).
  int Add(std::shared_ptr<const Bitmap> bitmap);
  int Add(Decal decal) { return Add(Bitmap::GetBitmap(decal)); }
  void Clear() { mBitmaps.clear(); }

  int GetCount() const { return static_cast<int>(mBitmaps.size()); }
  // nullptr for an index out of range.
  std::shared_ptr<const Bitmap> GetBitmap(int index) const;
  // The logical size of image `index`; 0 x 0 out of range.
  Size GetImageSize(int index) const;

  // Draws image `index` with its top-left at `topLeft` (dc coordinates). An index out of range
  // draws nothing and is reported through the host debug assertion.
  void Draw(DC& dc, int index, Point topLeft, double alpha = 1.0) const;

 private:
  std::vector<std::shared_ptr<const Bitmap>> mBitmaps;
};
