#include "Host/Shell/Sdl/SdlWindow.h"

#include <SDL.h>

#include <algorithm>
#include <array>
#include <chrono>
#include <cstring>
#include <utility>

#include "Host/Messaging/MessageLoop.h"
#include "Host/Shell/ScriptInputRoute.h"
#include "Host/Shell/Sdl/SdlKeyMap.h"
#include "Host/Shell/Sdl/SdlModal.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/Region.h"
#include "Host/Toolkit/RepeatTimer.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

SDL_SystemCursor SystemCursorFor(Cursor cursor) {
  switch (cursor) {
    case Cursor::kIBeam:
      return SDL_SYSTEM_CURSOR_IBEAM;
    case Cursor::kCrosshair:
    case Cursor::kTinyMarquee:
    case Cursor::kPrecisePath:
    case Cursor::kEyedropper:
    case Cursor::kEyedropperArea:
      return SDL_SYSTEM_CURSOR_CROSSHAIR;
    case Cursor::kWait:
      return SDL_SYSTEM_CURSOR_WAIT;
    case Cursor::kHand:
    case Cursor::kFist:
    case Cursor::kFistAdd:
      return SDL_SYSTEM_CURSOR_HAND;
    case Cursor::kFistNo:
      return SDL_SYSTEM_CURSOR_NO;
    case Cursor::kSplitterHorizontal:
    case Cursor::kSplitterHorizontalBig:
    case Cursor::kTrimHead:
    case Cursor::kTrimTail:
    case Cursor::kRoll:
    case Cursor::kSlideA:
    case Cursor::kRippleHead:
    case Cursor::kRippleTail:
      return SDL_SYSTEM_CURSOR_SIZEWE;
    case Cursor::kSplitterVertical:
    case Cursor::kSplitterVerticalBig:
    case Cursor::kSelectVerticalAdjust:
    case Cursor::kPenVerticalAdjust:
      return SDL_SYSTEM_CURSOR_SIZENS;
    default:
      return SDL_SYSTEM_CURSOR_ARROW;
  }
}

Uint32 ButtonBit(Uint8 sdlButton) {
  return 1u << (sdlButton & 31u);
}

MouseButton ButtonFromSdl(Uint8 button) {
  switch (button) {
    case SDL_BUTTON_RIGHT:
      return MouseButton::kRight;
    case SDL_BUTTON_MIDDLE:
      return MouseButton::kMiddle;
    default:
      return MouseButton::kLeft;
  }
}

Uint8 SdlButtonFrom(MouseButton button) {
  switch (button) {
    case MouseButton::kRight:
      return SDL_BUTTON_RIGHT;
    case MouseButton::kMiddle:
      return SDL_BUTTON_MIDDLE;
    case MouseButton::kLeft:
      break;
  }
  return SDL_BUTTON_LEFT;
}

}  // namespace

struct SdlWindow::Impl {
  // Feeds scripted input through SDL's queue, with the modifier state SDL reports while the
  // event is handled.
  class QueuedInputRoute : public ScriptInputRoute {
   public:
    explicit QueuedInputRoute(Impl& impl) : mImpl(impl) {}

    void MouseDown(MouseButton button, Point point, KeyModifiers modifiers,
                   int clickCount) override {
      PushButton(SDL_MOUSEBUTTONDOWN, button, point, modifiers, clickCount);
    }
    void MouseUp(MouseButton button, Point point, KeyModifiers modifiers) override {
      PushButton(SDL_MOUSEBUTTONUP, button, point, modifiers, 1);
    }
    void MouseMove(Point point, KeyModifiers modifiers) override {
      SDL_Event event{};
      event.type = SDL_MOUSEMOTION;
      event.motion.windowID = mImpl.windowID;
      event.motion.x = point.x;
      event.motion.y = point.y;
      event.motion.xrel = point.x - mImpl.lastMouse.x;
      event.motion.yrel = point.y - mImpl.lastMouse.y;
      Deliver(event, modifiers);
    }
    void Wheel(Point point, int deltaY, KeyModifiers modifiers) override {
      if (!(mImpl.lastMouse == point))
        MouseMove(point, modifiers);
      SDL_Event event{};
      event.type = SDL_MOUSEWHEEL;
      event.wheel.windowID = mImpl.windowID;
      event.wheel.y = deltaY;
      event.wheel.preciseY = static_cast<float>(deltaY);
      event.wheel.direction = SDL_MOUSEWHEEL_NORMAL;
      event.wheel.mouseX = point.x;
      event.wheel.mouseY = point.y;
      Deliver(event, modifiers);
    }
    void Key(KeyCode key, KeyModifiers modifiers) override {
      SDL_Event event{};
      event.type = SDL_KEYDOWN;
      event.key.windowID = mImpl.windowID;
      event.key.state = SDL_PRESSED;
      event.key.keysym.sym = SdlKeyFromKeyCode(key);
      event.key.keysym.scancode = SDL_GetScancodeFromKey(event.key.keysym.sym);
      event.key.keysym.mod = SdlModifiersFromKeyModifiers(modifiers);
      Deliver(event, modifiers);
      event.type = SDL_KEYUP;
      event.key.state = SDL_RELEASED;
      Deliver(event, modifiers);
    }
    void Text(std::string_view utf8) override {
      // A text event holds at most 31 bytes; longer text goes in pieces cut between characters.
      while (!utf8.empty()) {
        std::size_t length = std::min<std::size_t>(utf8.size(), SDL_TEXTINPUTEVENT_TEXT_SIZE - 1);
        while (length < utf8.size() && length > 0 &&
               (static_cast<unsigned char>(utf8[length]) & 0xC0) == 0x80) {
          --length;
        }
        SDL_Event event{};
        event.type = SDL_TEXTINPUT;
        event.text.windowID = mImpl.windowID;
        std::memcpy(event.text.text, utf8.data(), length);
        Deliver(event, kKeyModifierNone);
        utf8.remove_prefix(length);
      }
    }
    void Resize(Size size) override {
      SDL_SetWindowSize(mImpl.window, size.width, size.height);
      mImpl.ApplySize(size);
      mImpl.Pump(0);
    }

   private:
    void PushButton(Uint32 type, MouseButton button, Point point, KeyModifiers modifiers,
                    int clickCount) {
      SDL_Event event{};
      event.type = type;
      event.button.windowID = mImpl.windowID;
      event.button.button = SdlButtonFrom(button);
      event.button.state = type == SDL_MOUSEBUTTONDOWN ? SDL_PRESSED : SDL_RELEASED;
      event.button.clicks = static_cast<Uint8>(std::clamp(clickCount, 1, 255));
      event.button.x = point.x;
      event.button.y = point.y;
      Deliver(event, modifiers);
    }

    void Deliver(SDL_Event& event, KeyModifiers modifiers) {
      const SDL_Keymod saved = SDL_GetModState();
      SDL_SetModState(static_cast<SDL_Keymod>(SdlModifiersFromKeyModifiers(modifiers)));
      SDL_PushEvent(&event);
      mImpl.Pump(0);
      SDL_SetModState(saved);
    }

    Impl& mImpl;
  };

  explicit Impl(ViewHost& viewHost) : host(viewHost), route(*this) {}

  ~Impl() {
    SetCursorObserver({});
    host.SetPresenter({});
    for (SDL_Cursor* cursor : cursors) {
      if (cursor != nullptr)
        SDL_FreeCursor(cursor);
    }
    if (texture != nullptr)
      SDL_DestroyTexture(texture);
    if (overlay != nullptr)
      SDL_DestroyTexture(overlay);
    if (renderer != nullptr)
      SDL_DestroyRenderer(renderer);
    if (window != nullptr)
      SDL_DestroyWindow(window);
    if (videoStarted) {
      SDL_StopTextInput();
      SDL_QuitSubSystem(SDL_INIT_VIDEO);
      SDL_Quit();
    }
  }

  bool Open(const std::string& title, std::string* error) {
    auto fail = [&](const char* what) {
      if (error != nullptr)
        *error = std::string(what) + ": " + SDL_GetError();
      return false;
    };
    if (SDL_InitSubSystem(SDL_INIT_VIDEO) != 0)
      return fail("cannot start SDL video");
    videoStarted = true;
    const Size size = host.GetSize();
    window = SDL_CreateWindow(title.c_str(), SDL_WINDOWPOS_CENTERED, SDL_WINDOWPOS_CENTERED,
                              size.width, size.height, SDL_WINDOW_RESIZABLE);
    if (window == nullptr)
      return fail("cannot open a window");
    windowID = SDL_GetWindowID(window);
    renderer = SDL_CreateRenderer(window, -1, SDL_RENDERER_ACCELERATED);
    if (renderer == nullptr)
      renderer = SDL_CreateRenderer(window, -1, SDL_RENDERER_SOFTWARE);
    if (renderer == nullptr)
      return fail("cannot make a renderer");
    host.SetPresenter(
        [this](const Image& image, const Region& painted) { Present(image, painted); });
    SetCursorObserver([this](Cursor cursor) { ShowCursorShape(cursor); });
    SDL_StartTextInput();
    host.InvalidateAll();
    host.Render();
    return true;
  }

  // Copies what was painted into the texture and shows the frame.
  void Present(const Image& image, const Region& painted) {
    const Size pixels = image.GetPixelSize();
    if (image.IsEmpty())
      return;
    bool whole = false;
    if (texture == nullptr || !(textureSize == pixels)) {
      if (texture != nullptr)
        SDL_DestroyTexture(texture);
      texture = SDL_CreateTexture(renderer, SDL_PIXELFORMAT_ARGB8888, SDL_TEXTUREACCESS_STREAMING,
                                  pixels.width, pixels.height);
      if (texture == nullptr)
        return;
      SDL_SetTextureBlendMode(texture, SDL_BLENDMODE_NONE);
      textureSize = pixels;
      whole = true;
    }
    const double scale = image.GetScaleFactor();
    const Rect imageRect = Rect::FromSize(0, 0, pixels.width, pixels.height);
    auto upload = [&](const Rect& rect) {
      const Rect r = rect.Intersect(imageRect);
      if (r.IsEmpty())
        return;
      const SDL_Rect area{r.left, r.top, r.Width(), r.Height()};
      const std::uint8_t* data = image.GetData() +
                                 static_cast<std::ptrdiff_t>(r.top) * image.GetStride() +
                                 static_cast<std::ptrdiff_t>(r.left) * 4;
      SDL_UpdateTexture(texture, &area, data, image.GetStride());
    };
    if (whole) {
      upload(imageRect);
    } else {
      for (const Rect& logical : painted.Rects()) {
        // Painted rects are logical pixels; widen to whole device pixels.
        upload(Rect{static_cast<int>(logical.left * scale), static_cast<int>(logical.top * scale),
                    static_cast<int>(logical.right * scale + 0.999),
                    static_cast<int>(logical.bottom * scale + 0.999)});
      }
    }
    ShowFrame();
  }

  void ShowFrame() {
    if (texture == nullptr)
      return;
    SDL_RenderClear(renderer);
    SDL_RenderCopy(renderer, texture, nullptr, nullptr);
    if (modal != nullptr)
      DrawModal();
    SDL_RenderPresent(renderer);
    modalDirty = false;
  }

  // Paints the modal into its own texture and draws it over the frame.
  void DrawModal() {
    const Rect bounds = modal->GetBounds(host.GetSize());
    if (bounds.IsEmpty())
      return;
    Image image(bounds.GetSize());
    if (image.IsEmpty())
      return;
    {
      DC dc(image);
      modal->Paint(dc);
    }
    const Size pixels = image.GetPixelSize();
    if (overlay == nullptr || !(overlaySize == pixels)) {
      if (overlay != nullptr)
        SDL_DestroyTexture(overlay);
      overlay = SDL_CreateTexture(renderer, SDL_PIXELFORMAT_ARGB8888, SDL_TEXTUREACCESS_STREAMING,
                                  pixels.width, pixels.height);
      if (overlay == nullptr)
        return;
      SDL_SetTextureBlendMode(overlay, SDL_BLENDMODE_BLEND);
      overlaySize = pixels;
    }
    SDL_UpdateTexture(overlay, nullptr, image.GetData(), image.GetStride());
    const SDL_Rect where{bounds.left, bounds.top, bounds.Width(), bounds.Height()};
    SDL_RenderCopy(renderer, overlay, nullptr, &where);
  }

  // Events while a modal runs: everything goes to it.
  void HandleModal(const SDL_Event& event) {
    switch (event.type) {
      case SDL_MOUSEBUTTONDOWN:
      case SDL_MOUSEBUTTONUP:
        if (event.button.windowID != windowID || event.button.which == SDL_TOUCH_MOUSEID)
          return;
        lastMouse = {event.button.x, event.button.y};
        if (event.type == SDL_MOUSEBUTTONDOWN) {
          // Its release belongs to the modal too, even when it arrives after the modal ended.
          modalButtons |= ButtonBit(event.button.button);
          modal->MouseDown(ButtonFromSdl(event.button.button), lastMouse);
        } else {
          modalButtons &= ~ButtonBit(event.button.button);
          modal->MouseUp(ButtonFromSdl(event.button.button), lastMouse);
        }
        break;
      case SDL_MOUSEMOTION:
        if (event.motion.windowID != windowID || event.motion.which == SDL_TOUCH_MOUSEID)
          return;
        lastMouse = {event.motion.x, event.motion.y};
        modal->MouseMove(lastMouse);
        break;
      case SDL_KEYDOWN:
        if (event.key.windowID != windowID || IsSdlModifierKey(event.key.keysym.sym))
          return;
        if (const auto key = KeyCodeFromSdlKey(event.key.keysym.sym)) {
          KeyEvent keyEvent;
          keyEvent.key = *key;
          keyEvent.modifiers = KeyModifiersFromSdl(event.key.keysym.mod);
          keyEvent.isRepeat = event.key.repeat != 0;
          modal->KeyDown(keyEvent);
        }
        break;
      case SDL_TEXTINPUT:
        if (event.text.windowID == windowID)
          modal->TextInput(event.text.text);
        break;
      default:
        return;
    }
    modalDirty = true;
  }

  bool RunModal(SdlModal& newModal) {
    SdlModal* const previous = modal;
    modal = &newModal;
    modalDirty = true;
    while (!newModal.IsDone() && !closed)
      Pump(20);
    modal = previous;
    ShowFrame();
    return !closed;
  }

  void ShowCursorShape(Cursor cursor) {
    const SDL_SystemCursor shape = SystemCursorFor(cursor);
    SDL_Cursor*& made = cursors[static_cast<std::size_t>(shape)];
    if (made == nullptr)
      made = SDL_CreateSystemCursor(shape);
    if (made != nullptr)
      SDL_SetCursor(made);
  }

  void ApplySize(Size size) {
    if (size.width < 1 || size.height < 1 || size == host.GetSize())
      return;
    host.Resize(size);
  }

  KeyModifiers CurrentModifiers() const { return KeyModifiersFromSdl(SDL_GetModState()); }

  void Handle(const SDL_Event& event) {
    if (modal != nullptr && event.type != SDL_QUIT && event.type != SDL_WINDOWEVENT) {
      HandleModal(event);
      return;
    }
    switch (event.type) {
      case SDL_QUIT:
        // Closing the last window sends a quit after the window's close: asked once.
        if (!closeJustRefused)
          AskToClose();
        closeJustRefused = false;
        break;
      case SDL_WINDOWEVENT:
        if (event.window.windowID != windowID)
          break;
        switch (event.window.event) {
          case SDL_WINDOWEVENT_CLOSE:
            AskToClose();
            closeJustRefused = !closed;
            break;
          case SDL_WINDOWEVENT_SIZE_CHANGED:
            ApplySize({event.window.data1, event.window.data2});
            break;
          case SDL_WINDOWEVENT_EXPOSED:
            ShowFrame();
            break;
          case SDL_WINDOWEVENT_LEAVE:
            host.MouseExit();
            break;
          default:
            break;
        }
        break;
      case SDL_MOUSEBUTTONDOWN:
      case SDL_MOUSEBUTTONUP: {
        if (event.button.windowID != windowID || event.button.which == SDL_TOUCH_MOUSEID)
          break;
        if (event.type == SDL_MOUSEBUTTONUP &&
            (modalButtons & ButtonBit(event.button.button)) != 0) {
          modalButtons &= ~ButtonBit(event.button.button);
          break;
        }
        const Point point{event.button.x, event.button.y};
        lastMouse = point;
        const MouseButton button = ButtonFromSdl(event.button.button);
        if (event.type == SDL_MOUSEBUTTONDOWN) {
          host.MouseDown(button, point, CurrentModifiers(), std::max<int>(1, event.button.clicks));
        } else {
          host.MouseUp(button, point, CurrentModifiers());
        }
        break;
      }
      case SDL_MOUSEMOTION:
        if (event.motion.windowID != windowID || event.motion.which == SDL_TOUCH_MOUSEID)
          break;
        lastMouse = {event.motion.x, event.motion.y};
        host.MouseMove(lastMouse, CurrentModifiers());
        break;
      case SDL_MOUSEWHEEL: {
        if (event.wheel.windowID != windowID)
          break;
        const int flip = event.wheel.direction == SDL_MOUSEWHEEL_FLIPPED ? -1 : 1;
        WheelEvent wheel;
        wheel.point = lastMouse;
        wheel.deltaX = event.wheel.x * flip;
        wheel.deltaY = event.wheel.y * flip;
        wheel.modifiers = CurrentModifiers();
        host.MouseWheel(wheel);
        break;
      }
      case SDL_KEYDOWN:
      case SDL_KEYUP: {
        if (event.key.windowID != windowID)
          break;
        const KeyModifiers modifiers = KeyModifiersFromSdl(event.key.keysym.mod);
        if (IsSdlModifierKey(event.key.keysym.sym)) {
          host.ModifiersChanged(modifiers);
          break;
        }
        if (event.type == SDL_KEYUP)
          break;
        if (const auto key = KeyCodeFromSdlKey(event.key.keysym.sym)) {
          KeyEvent keyEvent;
          keyEvent.key = *key;
          keyEvent.modifiers = modifiers;
          keyEvent.isRepeat = event.key.repeat != 0;
          host.KeyDown(keyEvent);
        }
        break;
      }
      case SDL_TEXTINPUT:
        if (event.text.windowID == windowID)
          host.TextInput(event.text.text);
        break;
      default:
        break;
    }
  }

  bool Pump(int timeoutMs) {
    SDL_Event event;
    bool gotEvent = false;
    while (SDL_PollEvent(&event) != 0) {
      gotEvent = true;
      Handle(event);
    }
    auto& loop = MessageLoop::Instance();
    if (!gotEvent && timeoutMs > 0 && !loop.HasPending() && host.GetDirtyRegion().IsEmpty() &&
        !modalDirty) {
      if (SDL_WaitEventTimeout(&event, timeoutMs) != 0) {
        Handle(event);
        while (SDL_PollEvent(&event) != 0)
          Handle(event);
      }
    }
    loop.RunPending();
    UpdateTitle();
    if (!host.GetDirtyRegion().IsEmpty())
      host.Render();
    else if (modal != nullptr && modalDirty)
      ShowFrame();
    return !closed;
  }

  ViewHost& host;  // not owned; outlives the window
  QueuedInputRoute route;
  bool videoStarted = false;
  SDL_Window* window = nullptr;
  Uint32 windowID = 0;
  SDL_Renderer* renderer = nullptr;
  SDL_Texture* texture = nullptr;
  Size textureSize;
  SdlModal* modal = nullptr;  // not owned; the innermost RunModal's
  Uint32 modalButtons = 0;    // buttons pressed while a modal ran, until their release
  bool modalDirty = false;
  SDL_Texture* overlay = nullptr;
  Size overlaySize;
  std::array<SDL_Cursor*, SDL_NUM_SYSTEM_CURSORS> cursors{};
  Point lastMouse;
  bool closed = false;
  std::function<bool()> closeGuard;
  bool closeJustRefused = false;
  std::function<std::string()> titleSource;
  std::string shownTitle;

  void UpdateTitle() {
    if (!titleSource)
      return;
    std::string wanted = titleSource();
    if (wanted != shownTitle) {
      shownTitle = std::move(wanted);
      SDL_SetWindowTitle(window, shownTitle.c_str());
    }
  }

  void AskToClose() {
    if (!closed)
      closed = !closeGuard || closeGuard();
  }
};

SdlWindow::SdlWindow(std::unique_ptr<Impl> impl) : mImpl(std::move(impl)) {}

SdlWindow::~SdlWindow() = default;

std::unique_ptr<SdlWindow> SdlWindow::Open(ViewHost& host, const std::string& title,
                                           std::string* error) {
  auto impl = std::make_unique<Impl>(host);
  if (!impl->Open(title, error))
    return nullptr;
  return std::unique_ptr<SdlWindow>(new SdlWindow(std::move(impl)));
}

bool SdlWindow::Pump(int timeoutMs) {
  return mImpl->Pump(timeoutMs);
}

void SdlWindow::Run() {
  // While a person uses the window the toolkit's timers (tool tips, repeats) follow real time.
  RepeatTimer& timers = RepeatTimer::Instance();
  const RepeatTimer::Milliseconds base = timers.Now();
  const auto start = std::chrono::steady_clock::now();
  while (mImpl->Pump(50)) {
    timers.AdvanceTo(base + std::chrono::duration_cast<RepeatTimer::Milliseconds>(
                                std::chrono::steady_clock::now() - start));
  }
}

bool SdlWindow::IsClosed() const {
  return mImpl->closed;
}

void SdlWindow::RequestClose() {
  SDL_Event event{};
  event.type = SDL_WINDOWEVENT;
  event.window.windowID = mImpl->windowID;
  event.window.event = SDL_WINDOWEVENT_CLOSE;
  SDL_PushEvent(&event);
}

void SdlWindow::SetCloseGuard(std::function<bool()> guard) {
  mImpl->closeGuard = std::move(guard);
}

void SdlWindow::SetTitle(const std::string& title) {
  mImpl->shownTitle = title;
  SDL_SetWindowTitle(mImpl->window, title.c_str());
}

void SdlWindow::SetTitleSource(std::function<std::string()> source) {
  mImpl->titleSource = std::move(source);
  mImpl->UpdateTitle();
}

void SdlWindow::ShowMessage(const std::string& title, const std::string& text) {
  SDL_ShowSimpleMessageBox(SDL_MESSAGEBOX_ERROR, title.c_str(), text.c_str(), mImpl->window);
}

bool SdlWindow::RunModal(SdlModal& modal) {
  return mImpl->RunModal(modal);
}

ScriptInputRoute& SdlWindow::GetInputRoute() {
  return mImpl->route;
}

std::uint32_t SdlWindow::GetWindowID() const {
  return mImpl->windowID;
}

Size SdlWindow::GetSize() const {
  int width = 0, height = 0;
  SDL_GetWindowSize(mImpl->window, &width, &height);
  return {width, height};
}

Image SdlWindow::ReadBack() const {
  int width = 0, height = 0;
  if (SDL_GetRendererOutputSize(mImpl->renderer, &width, &height) != 0)
    return Image();
  Image image = Image::FromPixelSize({width, height});
  if (image.IsEmpty() || mImpl->texture == nullptr)
    return Image();
  // The back buffer's content after a present is undefined: draw the frame again first.
  SDL_RenderClear(mImpl->renderer);
  SDL_RenderCopy(mImpl->renderer, mImpl->texture, nullptr, nullptr);
  if (mImpl->modal != nullptr)
    mImpl->DrawModal();
  if (SDL_RenderReadPixels(mImpl->renderer, nullptr, SDL_PIXELFORMAT_ARGB8888, image.GetData(),
                           image.GetStride()) != 0) {
    return Image();
  }
  image.MarkDirty();
  return image;
}
