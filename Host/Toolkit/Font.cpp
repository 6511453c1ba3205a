#include "Host/Toolkit/Font.h"

#include <pango/pangocairo.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <list>
#include <string>
#include <unordered_map>
#include <vector>

#include "Host/Toolkit/TextLayout.h"

namespace {

constexpr std::size_t kMaxCachedLayouts = 2048;
constexpr std::size_t kMaxCachedTextBytes = 4u << 20;

// Pango measures in ints of 1/1024 pixel, so a line must stay well under 2^21 pixels. A layout
// holds at most as many characters as could make this width at kWidestAdvance each.
constexpr int kMaxLayoutWidth = 1 << 20;
constexpr double kWidestAdvance = 8.0;  // em; wider than any glyph of ours or a fallback font's
// What could show in a width: at least one em per 16 characters, which leaves room for combining
// marks, joiners and other characters that draw narrow or nothing at all.
constexpr double kNarrowestAdvance = 1.0 / 16;  // em
constexpr std::string_view kEllipsis = "\xE2\x80\xA6";

// The length in bytes of the first `count` characters of `text`. The cut lands before a lead
// byte, so a UTF-8 sequence is never split; of stray continuation bytes, up to three count with
// the character before them and each further one counts alone (it shows as U+FFFD anyway), so a
// cut never reaches past 4 * count bytes.
std::size_t PrefixLength(std::string_view text, std::size_t count) {
  std::size_t characters = 0;
  int continuations = 3;  // before any lead byte a continuation byte stands alone
  for (std::size_t i = 0; i < text.size(); ++i) {
    const bool continuation = (static_cast<unsigned char>(text[i]) & 0xC0) == 0x80;
    if (continuation && continuations < 3) {
      ++continuations;
      continue;
    }
    if (characters == count)
      return i;
    ++characters;
    continuations = continuation ? 3 : 0;
  }
  return text.size();
}

struct Face {
  double pixelSize;
  bool bold;
  bool italic;
  bool monospace;
  PangoFontDescription* description;  // owned by the face table, lives for the process
  int height = -1;                    // -1 until measured
  int ascent = 0;
};

// Layout is done on one context without hinting, so widths are the same at every scale factor
// and the cached layouts can be drawn on any DC.
class FontSystem {
 public:
  static FontSystem& Get() {
    if (gSystem == nullptr) {
      gSystem = new FontSystem();
      std::atexit(&Release);
    }
    return *gSystem;
  }

  ~FontSystem() {
    Clear();
    for (Face& face : mFaces)
      pango_font_description_free(face.description);
    g_object_unref(mContext);
  }

  PangoContext* GetContext() const { return mContext; }

  int FindOrAddFace(double pixelSize, bool bold, bool italic, bool monospace) {
    for (std::size_t i = 0; i < mFaces.size(); ++i) {
      const Face& f = mFaces[i];
      if (f.pixelSize == pixelSize && f.bold == bold && f.italic == italic &&
          f.monospace == monospace) {
        return static_cast<int>(i);
      }
    }
    PangoFontDescription* description = pango_font_description_new();
    pango_font_description_set_family(description, monospace ? "DejaVu Sans Mono" : "DejaVu Sans");
    pango_font_description_set_weight(description, bold ? PANGO_WEIGHT_BOLD : PANGO_WEIGHT_NORMAL);
    pango_font_description_set_style(description, italic ? PANGO_STYLE_ITALIC : PANGO_STYLE_NORMAL);
    pango_font_description_set_absolute_size(description, pixelSize * PANGO_SCALE);
    mFaces.push_back({pixelSize, bold, italic, monospace, description});
    return static_cast<int>(mFaces.size() - 1);
  }

  Face& GetFace(int index) {
    if (index < 0 || index >= static_cast<int>(mFaces.size()))
      index = 0;
    Face& face = mFaces[index];
    if (face.height < 0) {
      const auto layout = GetLayout(index, "Ag", 0);
      face.height = static_cast<int>(std::ceil(layout->GetHeight() - 1e-6));
      face.ascent = static_cast<int>(std::ceil(layout->GetBaseline() - 1e-6));
    }
    return face;
  }

  // See Font::GetLayout. No layout is as wide as kMaxLayoutWidth, so a wider ellipsizeWidth
  // gives the natural layout.
  std::shared_ptr<const TextLayout> GetLayout(int face, std::string_view text, int ellipsizeWidth) {
    if (ellipsizeWidth <= 0 || ellipsizeWidth >= kMaxLayoutWidth)
      ellipsizeWidth = 0;
    const std::size_t length = PrefixLength(text, CharacterLimit(face, ellipsizeWidth));
    const bool cut = length < text.size();
    if (ellipsizeWidth > 0 && !cut) {
      // Short enough to lay out whole: when it fits, the natural layout serves both.
      auto natural = FindOrBuild(face, text, 0, false);
      if (natural->GetWidth() <= ellipsizeWidth)
        return natural;
    }
    return FindOrBuild(face, text.substr(0, length), ellipsizeWidth, cut);
  }

  std::size_t LayoutsBuilt() const { return mBuilt; }
  std::size_t CachedCount() const { return mEntries.size(); }
  void Clear() {
    mIndex.clear();
    mEntries.clear();
    mTextBytes = 0;
  }

 private:
  struct Entry {
    std::string key;
    std::shared_ptr<const TextLayout> layout;
  };

  // The most characters a layout of `face` takes: what could fill ellipsizeWidth, and never more
  // than Pango can measure.
  std::size_t CharacterLimit(int face, int ellipsizeWidth) const {
    const double em = mFaces[face].pixelSize;
    const double most = std::max(256.0, std::floor(kMaxLayoutWidth / (kWidestAdvance * em)));
    if (ellipsizeWidth <= 0)
      return static_cast<std::size_t>(most);
    const double fit = std::ceil(ellipsizeWidth / (kNarrowestAdvance * em)) + 1;
    return static_cast<std::size_t>(std::min(most, fit));
  }

  // `text` is already bounded by CharacterLimit.
  std::shared_ptr<const TextLayout> FindOrBuild(int face, std::string_view text, int ellipsizeWidth,
                                                bool cut) {
    std::string key =
        std::to_string(face) + '\x1f' + std::to_string(ellipsizeWidth) + (cut ? '\x1e' : '\x1f');
    key.append(text);
    if (auto found = mIndex.find(key); found != mIndex.end()) {
      mEntries.splice(mEntries.begin(), mEntries, found->second);
      return found->second->layout;
    }
    auto layout = Build(face, text, ellipsizeWidth, cut);
    mEntries.push_front({key, layout});
    mTextBytes += key.size();
    mIndex.emplace(std::move(key), mEntries.begin());
    while (mEntries.size() > kMaxCachedLayouts || mTextBytes > kMaxCachedTextBytes) {
      mTextBytes -= mEntries.back().key.size();
      mIndex.erase(mEntries.back().key);
      mEntries.pop_back();
    }
    return layout;
  }

  FontSystem() {
    mContext = pango_font_map_create_context(pango_cairo_font_map_get_default());
    cairo_font_options_t* options = cairo_font_options_create();
    cairo_font_options_set_hint_style(options, CAIRO_HINT_STYLE_NONE);
    cairo_font_options_set_hint_metrics(options, CAIRO_HINT_METRICS_OFF);
    cairo_font_options_set_antialias(options, CAIRO_ANTIALIAS_GRAY);
    pango_cairo_context_set_font_options(mContext, options);
    cairo_font_options_destroy(options);
    pango_context_set_round_glyph_positions(mContext, FALSE);
    // Presets first, so that a FontID is its face index.
    FindOrAddFace(11, false, false, false);  // kFont_Normal
    FindOrAddFace(11, true, false, false);   // kFont_Bold
    FindOrAddFace(10, false, false, false);  // kFont_Small
    FindOrAddFace(10, true, false, false);   // kFont_SmallBold
    mFaces.push_back(mFaces[kFont_Normal]);  // kFont_Label: same face, its own handle
    mFaces.back().description = pango_font_description_copy(mFaces[kFont_Normal].description);
    FindOrAddFace(13, true, false, false);  // kFont_Title
    FindOrAddFace(14, false, false, true);  // kFont_Timecode
  }

  // Invalid UTF-8 would make Pango drop the text; NUL would end it early.
  static std::string Sanitize(std::string_view text) {
    std::string clean;
    if (g_utf8_validate(text.data(), static_cast<gssize>(text.size()), nullptr)) {
      clean.assign(text);
    } else {
      gchar* valid = g_utf8_make_valid(text.data(), static_cast<gssize>(text.size()));
      clean = valid;
      g_free(valid);
    }
    std::string out;
    out.reserve(clean.size());
    for (char c : clean) {
      if (c == '\0') {
        out += "\xEF\xBF\xBD";
      } else {
        out += c;
      }
    }
    return out;
  }

  // A cut text gets its "…" before Pango ellipsizes: when what is left fits the width (it may
  // be invisible characters), the layout must still show that something was left out.
  std::shared_ptr<const TextLayout> Build(int face, std::string_view text, int ellipsizeWidth,
                                          bool cut) {
    ++mBuilt;
    PangoLayout* layout = pango_layout_new(mContext);
    pango_layout_set_single_paragraph_mode(layout, TRUE);
    pango_layout_set_font_description(layout, mFaces[face].description);
    std::string clean = Sanitize(text);
    if (cut)
      clean += kEllipsis;
    pango_layout_set_text(layout, clean.data(), static_cast<int>(clean.size()));
    if (ellipsizeWidth > 0) {
      pango_layout_set_width(layout, ellipsizeWidth * PANGO_SCALE);
      pango_layout_set_ellipsize(layout, PANGO_ELLIPSIZE_END);
    }
    return std::make_shared<const TextLayout>(layout, cut);
  }

  // Layouts still held elsewhere keep their own references to the context and font map.
  static void Release() {
    delete gSystem;
    gSystem = nullptr;
    pango_cairo_font_map_set_default(nullptr);
  }

  static inline FontSystem* gSystem = nullptr;

  PangoContext* mContext;
  std::vector<Face> mFaces;
  std::list<Entry> mEntries;  // most recently used first
  std::unordered_map<std::string, std::list<Entry>::iterator> mIndex;
  std::size_t mTextBytes = 0;
  std::size_t mBuilt = 0;
};

}  // namespace

// Fontconfig loads its configuration and font list once per process and keeps them to the end,
// by design; leak checkers would report its allocations at exit. Only allocations made inside
// fontconfig are exempt. Weak, so that a program may give its own list.
extern "C" const char* __lsan_default_suppressions();
extern "C" __attribute__((weak)) const char* __lsan_default_suppressions() {
  return "leak:libfontconfig.so\n";
}

namespace {

int CeilPixels(double value) {
  return static_cast<int>(std::ceil(value - 1e-6));
}

}  // namespace

Font::Font() : Font(kFont_Normal) {}

Font::Font(FontID id) : mFace(id >= 0 && id < kFontCount ? id : kFont_Normal) {}

Font::Font(double pixelSize, bool bold, bool italic, bool monospace) {
  if (!std::isfinite(pixelSize))
    pixelSize = 11;
  mFace =
      FontSystem::Get().FindOrAddFace(std::clamp(pixelSize, 1.0, 512.0), bold, italic, monospace);
}

int Font::StringWidth(std::string_view text) const {
  if (text.empty())
    return 0;
  return CeilPixels(FontSystem::Get().GetLayout(mFace, text, 0)->GetWidth());
}

int Font::StringWidth(std::string_view text, int maxWidth) const {
  if (text.empty() || maxWidth <= 0)
    return 0;
  const auto layout = FontSystem::Get().GetLayout(mFace, text, maxWidth);
  return layout->IsElided() ? maxWidth : std::min(maxWidth, CeilPixels(layout->GetWidth()));
}

Size Font::MeasureString(std::string_view text) const {
  return {StringWidth(text), GetHeight()};
}

int Font::GetHeight() const {
  return FontSystem::Get().GetFace(mFace).height;
}
int Font::GetAscent() const {
  return FontSystem::Get().GetFace(mFace).ascent;
}
int Font::GetDescent() const {
  const Face& face = FontSystem::Get().GetFace(mFace);
  return face.height - face.ascent;
}
double Font::GetPixelSize() const {
  return FontSystem::Get().GetFace(mFace).pixelSize;
}
bool Font::IsBold() const {
  return FontSystem::Get().GetFace(mFace).bold;
}

std::shared_ptr<const TextLayout> Font::GetLayout(std::string_view text, int ellipsizeWidth) const {
  return FontSystem::Get().GetLayout(mFace, text, ellipsizeWidth);
}

std::size_t Font::LayoutsBuilt() {
  return FontSystem::Get().LayoutsBuilt();
}
std::size_t Font::CachedLayoutCount() {
  return FontSystem::Get().CachedCount();
}
void Font::ClearLayoutCache() {
  FontSystem::Get().Clear();
}
