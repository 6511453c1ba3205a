#include "Host/Shell/MonkeyScript.h"

#include <algorithm>
#include <array>
#include <random>
#include <string_view>

namespace {

// The keys a user presses in the panel. Keys that leave the project (save, open, quit) are
// not pressed: the File menu's popup answers can still reach them.
constexpr std::array<std::string_view, 24> kKeys = {
    "Return",       "Escape", "Tab",    "Tab shift", "Up",     "Down",
    "Left",         "Right",  "Delete", "Backspace", "Home",   "End",
    "Space",        "PageUp", "Minus",  "Period",    "z ctrl", "z ctrl",
    "z ctrl shift", "c ctrl", "x ctrl", "v ctrl",    "a ctrl", "a ctrl shift"};

// What a user types into a field: numbers in every form, text, and the odd character.
constexpr std::array<std::string_view, 12> kTexts = {
    "42",      "-7.5", "0", "1e9", "100000000000", "3.14159", "abc", "00:00:01:12",
    "#FF8800", "é漢",  "",  "-"};

// Commands sent as from the main menu.
constexpr std::array<std::string_view, 12> kCommands = {"cmd.edit.copy",
                                                        "cmd.edit.cut",
                                                        "cmd.edit.paste",
                                                        "cmd.edit.clear",
                                                        "cmd.edit.undo",
                                                        "cmd.edit.redo",
                                                        "cmd.edit.selectall",
                                                        "cmd.edit.deselectall",
                                                        "cmd.transport.gotostart",
                                                        "cmd.transport.gotoend",
                                                        "cmd.transport.stepforward",
                                                        "cmd.transport.stepback"};

// Where the list's rows usually end (the keyframe area lies beyond), where their values and
// their stopwatches usually are: a bias towards input that edits, not a place to find.
constexpr int kListWidth = 270;
constexpr int kValueColumn = 120;
constexpr int kStopwatchColumn = 27;

constexpr std::array<std::string_view, 5> kTools = {"pointer", "pen", "hand", "zoom", "razor"};

enum class Event {
  kClick,
  kModifiedClick,
  kRightClick,
  kDoubleClick,
  kDrag,
  kScrub,
  kMove,
  kWheel,
  kKey,
  kType,
  kCommand,
  kSelect,
  kTime,
  kResize,
  kTool,
  kOpen,
  kReopenPanel,
};

struct Weighted {
  Event event;
  int weight;
};

// Mostly pointer work in the panel, as a user's session is.
constexpr std::array<Weighted, 17> kMix = {{
    {Event::kClick, 28},
    {Event::kModifiedClick, 5},
    {Event::kRightClick, 6},
    {Event::kDoubleClick, 4},
    {Event::kDrag, 8},
    {Event::kScrub, 14},
    {Event::kMove, 4},
    {Event::kWheel, 4},
    {Event::kKey, 14},
    {Event::kType, 6},
    {Event::kCommand, 4},
    {Event::kSelect, 6},
    {Event::kTime, 3},
    {Event::kResize, 1},
    {Event::kTool, 1},
    {Event::kOpen, 1},
    {Event::kReopenPanel, 1},
}};

class Generator {
 public:
  explicit Generator(const MonkeyOptions& options)
      : mOptions(options), mRandom(options.seed), mSize(options.panelSize) {}

  std::string Run() {
    mOut = "# Monkey run: seed " + std::to_string(mOptions.seed) + ", " +
           std::to_string(mOptions.events) + " events\n";
    for (int i = 1; i <= mOptions.events; ++i) {
      mOut += "# event " + std::to_string(i) + "\n";
      WriteEvent(Pick());
      RestoreSizeWhenDue();
      if (mOptions.checkInterval > 0 && i % mOptions.checkInterval == 0)
        mOut += "check\n";
    }
    if (mOptions.checkInterval <= 0 || mOptions.events % mOptions.checkInterval != 0)
      mOut += "check\n";
    return std::move(mOut);
  }

 private:
  // Uniform in [0, n); the modulo bias is harmless here and keeps streams equal across
  // standard libraries (the std distributions are not).
  int Below(int n) {
    return n <= 1 ? 0 : static_cast<int>(mRandom() % static_cast<std::uint64_t>(n));
  }
  bool Chance(int percent) { return Below(100) < percent; }

  Event Pick() {
    int total = 0;
    for (const auto& entry : kMix)
      total += entry.weight;
    int draw = Below(total);
    for (const auto& entry : kMix) {
      if (draw < entry.weight)
        return entry.event;
      draw -= entry.weight;
    }
    return Event::kClick;
  }

  // A point in the panel, now and then a little outside it; more than half of them in the
  // list at its left, where the controls are, some on the stopwatches.
  std::string Point() {
    const int x = Chance(10)   ? kStopwatchColumn + Below(12)
                  : Chance(55) ? Below(std::min(mSize.width, kListWidth))
                               : Below(mSize.width + 40) - 20;
    const int y = Below(mSize.height + 40) - 20;
    return std::to_string(x) + " " + std::to_string(y);
  }

  // A value field dragged sideways, as a user scrubs a number.
  std::string Scrub() {
    const int x =
        kValueColumn + Below(std::max(1, std::min(mSize.width, kListWidth) - kValueColumn));
    const int y = Below(mSize.height);
    const int to = x + Below(161) - 80;
    return "drag " + std::to_string(x) + " " + std::to_string(y) + " " + std::to_string(to) + " " +
           std::to_string(y) + " steps " + std::to_string(1 + Below(4)) + "\n";
  }

  std::string Modifiers() {
    std::string text;
    if (Chance(40))
      text += " shift";
    if (Chance(40))
      text += " ctrl";
    if (Chance(15))
      text += " alt";
    return text.empty() ? " shift" : text;
  }

  // Popups and input boxes that a pointer event may open get an answer queued first.
  void MaybeQueueAnswers(int menuPercent, int inputPercent) {
    if (Chance(menuPercent))
      mOut += Chance(80) ? "menu-answer pick " + std::to_string(Below(40)) + "\n"
                         : std::string("menu-answer none\n");
    if (Chance(inputPercent))
      mOut += "input-answer " + std::string(kTexts[Below(kTexts.size())]) + "\n";
  }

  void WriteSelect() {
    const auto& ids = mOptions.trackItemIds;
    if (ids.empty() || Chance(10)) {
      mOut += "select-none\n";
      return;
    }
    std::string line = "select";
    const int count = 1 + (Chance(75) ? 0 : Below(3));
    for (int i = 0; i < count; ++i)
      line += " " + std::to_string(ids[Below(static_cast<int>(ids.size()))]);
    mOut += line + "\n";
  }

  // Tiny sizes too (layouts must not go negative), for a few events only: a user makes the
  // window usable again.
  void WriteResize() {
    const bool tiny = Chance(25);
    mSize =
        tiny ? Size{60 + Below(240), 40 + Below(260)} : Size{640 + Below(800), 400 + Below(500)};
    mEventsUntilRestore = tiny ? 1 + Below(10) : 0;
    mOut += "resize " + std::to_string(mSize.width) + " " + std::to_string(mSize.height) + "\n";
  }

  void RestoreSizeWhenDue() {
    if (mEventsUntilRestore == 0 || --mEventsUntilRestore > 0)
      return;
    mSize = mOptions.panelSize;
    mOut += "resize " + std::to_string(mSize.width) + " " + std::to_string(mSize.height) + "\n";
  }

  void WriteEvent(Event event) {
    switch (event) {
      case Event::kClick:
        MaybeQueueAnswers(15, 15);
        mOut += "click " + Point() + "\n";
        return;
      case Event::kModifiedClick:
        mOut += "click " + Point() + Modifiers() + "\n";
        return;
      case Event::kRightClick:
        MaybeQueueAnswers(95, 10);
        mOut += "rclick " + Point() + "\n";
        return;
      case Event::kDoubleClick:
        MaybeQueueAnswers(10, 20);
        mOut += "dblclick " + Point() + "\n";
        return;
      case Event::kDrag:
        mOut += "drag " + Point() + " " + Point() + " steps " + std::to_string(1 + Below(6)) +
                (Chance(20) ? Modifiers() : std::string()) + "\n";
        return;
      case Event::kScrub:
        mOut += Scrub();
        return;
      case Event::kMove:
        mOut += "move " + Point() + "\n";
        return;
      case Event::kWheel:
        mOut += "wheel " + std::to_string(Below(11) - 5) + "\n";
        return;
      case Event::kKey:
        mOut += "key " + std::string(kKeys[Below(kKeys.size())]) + "\n";
        return;
      case Event::kType: {
        const std::string_view text = kTexts[Below(kTexts.size())];
        mOut += text.empty() ? std::string("key Backspace\n") : "type " + std::string(text) + "\n";
        return;
      }
      case Event::kCommand:
        mOut += "command " + std::string(kCommands[Below(kCommands.size())]) + "\n";
        return;
      case Event::kSelect:
        WriteSelect();
        return;
      case Event::kTime:  // a frame of the first half minute
        mOut += "time " + std::to_string(static_cast<long long>(Below(900)) * 8467200000LL) + "\n";
        return;
      case Event::kResize:
        WriteResize();
        return;
      case Event::kTool:
        mOut += "tool " + std::string(kTools[Below(kTools.size())]) + "\n";
        return;
      case Event::kOpen:
        if (!mOptions.trackItemIds.empty()) {
          mOut +=
              "open " +
              std::to_string(
                  mOptions.trackItemIds[Below(static_cast<int>(mOptions.trackItemIds.size()))]) +
              "\n";
        }
        return;
      case Event::kReopenPanel:
        mOut += "reopen-panel\n";
        return;
    }
  }

  const MonkeyOptions& mOptions;
  std::mt19937_64 mRandom;
  Size mSize;
  int mEventsUntilRestore = 0;
  std::string mOut;
};

}  // namespace

std::string MonkeyScript::Generate(const MonkeyOptions& options) {
  return Generator(options).Run();
}
