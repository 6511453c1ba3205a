#include "Host/Toolkit/ImageList.h"

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/DC.h"

int ImageList::Add(std::shared_ptr<const Bitmap> bitmap) {
  if (!HOST_VERIFY(bitmap != nullptr, "Null bitmap added to an image list"))
    return -1;
  mBitmaps.push_back(std::move(bitmap));
  return GetCount() - 1;
}

std::shared_ptr<const Bitmap> ImageList::GetBitmap(int index) const {
  if (index < 0 || index >= GetCount())
    return nullptr;
  return mBitmaps[index];
}

Size ImageList::GetImageSize(int index) const {
  const auto bitmap = GetBitmap(index);
  return bitmap ? bitmap->GetSize() : Size{};
}

void ImageList::Draw(DC& dc, int index, Point topLeft, double alpha) const {
  if (!HOST_VERIFY(index >= 0 && index < GetCount(), "Image list index out of range"))
    return;
  dc.DrawBitmap(*mBitmaps[index], topLeft, alpha);
}
