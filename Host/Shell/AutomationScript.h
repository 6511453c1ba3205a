#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

// The program's automation language: one verb a line, '#' starts a comment. Parsing checks every
// line before anything runs, so a bad script changes nothing; errors name the line.

enum class ScriptVerb {
  kSelect,
  kSelectNone,
  kTime,
  kClick,
  kRightClick,
  kDoubleClick,
  kDrag,
  kMove,
  kWheel,
  kKey,
  kType,
  kCommand,
  kMenuAnswer,
  kInputAnswer,
  kResize,
  kUndo,
  kRedo,
  kShot,
  kDump,
  kSave,
  kClose,
  kWait,
  kMemory,
  kTool,
  kOpen,
  kReopenPanel,
  kCheck,
  kPress,
  kRelease,
};

// Key modifier bits of the host's modifier word.
inline constexpr std::uint32_t kScriptShift = 2;
inline constexpr std::uint32_t kScriptCtrl = 4;
inline constexpr std::uint32_t kScriptAlt = 16;

struct ScriptCommand {
  ScriptVerb verb = ScriptVerb::kUndo;
  int line = 0;                   // 1-based line in the script
  std::vector<std::int64_t> ids;  // select, open: track-item ids
  std::vector<int> numbers;       // coordinates, wheel delta, size; drag: x1 y1 x2 y2
  int steps = 1;                  // drag: pointer moves between press and release
  std::uint32_t modifiers = 0;    // kScriptShift | kScriptCtrl | kScriptAlt
  // time: ticks or "hh:mm:ss:ff" (resolved against the sequence's frame rate when run);
  // key: key name; type/input-answer: text; command: id or name; menu-answer: id, name,
  // "none" or "pick" (numbers: the index); shot/dump/save: file path; tool: the tool's name
  // (HostTool.h).
  std::string text;
};

struct ScriptError {
  int line = 0;
  std::string message;

  std::string Describe() const;  // "line 3: click needs X and Y"
};

class AutomationScript {
 public:
  using ParseResult = std::variant<AutomationScript, ScriptError>;

  static ParseResult Parse(std::string_view text);
  static ParseResult ParseFile(const std::string& path);

  const std::vector<ScriptCommand>& Commands() const { return mCommands; }

 private:
  std::vector<ScriptCommand> mCommands;
};
