#include "Host/Shell/AutomationScript.h"

#include <fstream>
#include <map>
#include <sstream>

#include "Host/Shell/HostTool.h"
#include "Host/Shell/WholeNumber.h"

namespace {

struct VerbInfo {
  ScriptVerb verb;
  bool takesRestOfLine;  // the argument is free text, '#' included
};

const std::map<std::string, VerbInfo, std::less<>>& VerbTable() {
  static const std::map<std::string, VerbInfo, std::less<>> table = {
      {"select", {ScriptVerb::kSelect, false}},
      {"select-none", {ScriptVerb::kSelectNone, false}},
      {"time", {ScriptVerb::kTime, false}},
      {"click", {ScriptVerb::kClick, false}},
      {"rclick", {ScriptVerb::kRightClick, false}},
      {"dblclick", {ScriptVerb::kDoubleClick, false}},
      {"drag", {ScriptVerb::kDrag, false}},
      {"move", {ScriptVerb::kMove, false}},
      {"wheel", {ScriptVerb::kWheel, false}},
      {"key", {ScriptVerb::kKey, false}},
      {"type", {ScriptVerb::kType, true}},
      {"command", {ScriptVerb::kCommand, false}},
      {"menu-answer", {ScriptVerb::kMenuAnswer, false}},
      {"input-answer", {ScriptVerb::kInputAnswer, true}},
      {"resize", {ScriptVerb::kResize, false}},
      {"undo", {ScriptVerb::kUndo, false}},
      {"redo", {ScriptVerb::kRedo, false}},
      {"shot", {ScriptVerb::kShot, true}},
      {"dump", {ScriptVerb::kDump, true}},
      {"save", {ScriptVerb::kSave, true}},
      {"close", {ScriptVerb::kClose, false}},
      {"wait", {ScriptVerb::kWait, false}},
      {"memory", {ScriptVerb::kMemory, true}},
      {"tool", {ScriptVerb::kTool, false}},
      {"open", {ScriptVerb::kOpen, false}},
      {"reopen-panel", {ScriptVerb::kReopenPanel, false}},
      {"check", {ScriptVerb::kCheck, false}},
      {"press", {ScriptVerb::kPress, false}},
      {"release", {ScriptVerb::kRelease, false}},
  };
  return table;
}

std::string_view Trim(std::string_view s) {
  const auto first = s.find_first_not_of(" \t\r");
  if (first == std::string_view::npos)
    return {};
  const auto last = s.find_last_not_of(" \t\r");
  return s.substr(first, last - first + 1);
}

std::vector<std::string_view> SplitWords(std::string_view s) {
  std::vector<std::string_view> words;
  std::size_t i = 0;
  while (i < s.size()) {
    while (i < s.size() && (s[i] == ' ' || s[i] == '\t'))
      ++i;
    std::size_t j = i;
    while (j < s.size() && s[j] != ' ' && s[j] != '\t')
      ++j;
    if (j > i)
      words.push_back(s.substr(i, j - i));
    i = j;
  }
  return words;
}

std::optional<std::uint32_t> ParseModifier(std::string_view word) {
  if (word == "shift")
    return kScriptShift;
  if (word == "ctrl")
    return kScriptCtrl;
  if (word == "alt")
    return kScriptAlt;
  return std::nullopt;
}

bool LooksLikeTimecode(std::string_view word) {
  int separators = 0;
  for (char c : word) {
    if (c == ':' || c == ';') {
      ++separators;
    } else if (c < '0' || c > '9') {
      return false;
    }
  }
  return separators == 3;
}

// Parses the arguments of one line; returns an error message, empty on success.
class LineParser {
 public:
  LineParser(ScriptCommand& command, std::string_view verbName, std::vector<std::string_view> args)
      : mCommand(command), mVerbName(verbName), mArgs(std::move(args)) {}

  std::string Parse(std::string_view restOfLine) {
    switch (mCommand.verb) {
      case ScriptVerb::kSelect:
      case ScriptVerb::kOpen:
        return ParseSelect();
      case ScriptVerb::kTool:
        return ParseTool();
      case ScriptVerb::kSelectNone:
      case ScriptVerb::kReopenPanel:
      case ScriptVerb::kUndo:
      case ScriptVerb::kRedo:
      case ScriptVerb::kClose:
      case ScriptVerb::kCheck:
        return ExpectNoArguments();
      case ScriptVerb::kTime:
        return ParseTime();
      case ScriptVerb::kClick:
      case ScriptVerb::kRightClick:
      case ScriptVerb::kDoubleClick:
      case ScriptVerb::kPress:
      case ScriptVerb::kRelease:
        return ParseIntegersThenModifiers(2, "X and Y", false);
      case ScriptVerb::kDrag:
        return ParseIntegersThenModifiers(4, "X1 Y1 X2 Y2", true);
      case ScriptVerb::kMove:
        return ParseExactIntegers(2, "X and Y");
      case ScriptVerb::kWheel:
        return ParseExactIntegers(1, "DY");
      case ScriptVerb::kWait:
        return ParseWait();
      case ScriptVerb::kResize:
        return ParseSize();
      case ScriptVerb::kKey:
        return ParseKey();
      case ScriptVerb::kCommand:
        return ParseSingleWord();
      case ScriptVerb::kMenuAnswer:
        return ParseMenuAnswer();
      case ScriptVerb::kType:
      case ScriptVerb::kInputAnswer:
        mCommand.text = std::string(restOfLine);
        return {};
      case ScriptVerb::kShot:
      case ScriptVerb::kDump:
      case ScriptVerb::kSave:
      case ScriptVerb::kMemory:
        return ParsePath(restOfLine);
    }
    return "unknown verb";
  }

 private:
  std::string Needs(std::string_view what) const {
    return std::string(mVerbName) + " needs " + std::string(what);
  }

  std::string ExpectNoArguments() const {
    return mArgs.empty() ? std::string() : std::string(mVerbName) + " takes no arguments";
  }

  std::string ParseTool() {
    if (mArgs.size() != 1)
      return Needs("one tool name");
    if (!HostToolFromName(mArgs[0])) {
      std::string names;
      for (const auto& entry : kHostToolNames)
        names += (names.empty() ? "" : ", ") + std::string(entry.first);
      return "'" + std::string(mArgs[0]) + "' is not a tool (" + names + ")";
    }
    mCommand.text = std::string(mArgs[0]);
    return {};
  }

  std::string ParseSelect() {
    if (mArgs.empty()) {
      return mCommand.verb == ScriptVerb::kOpen
                 ? Needs("at least one track-item id")
                 : Needs("at least one track-item id (or use select-none)");
    }
    for (auto word : mArgs) {
      auto id = ParseWholeNumber<std::int64_t>(word);
      if (!id || *id < 0)
        return "'" + std::string(word) + "' is not a track-item id";
      mCommand.ids.push_back(*id);
    }
    return {};
  }

  std::string ParseTime() {
    if (mArgs.size() != 1)
      return Needs("one time: ticks or hh:mm:ss:ff");
    const auto word = mArgs[0];
    if (!ParseWholeNumber<std::int64_t>(word) && !LooksLikeTimecode(word)) {
      return "'" + std::string(word) + "' is neither a tick count nor a timecode hh:mm:ss:ff";
    }
    mCommand.text = std::string(word);
    return {};
  }

  // Milliseconds, 0 to a minute: a longer wait is surely a mistake in a script.
  std::string ParseWait() {
    if (std::string error = ParseExactIntegers(1, "MS"); !error.empty())
      return error;
    if (mCommand.numbers.front() < 0 || mCommand.numbers.front() > 60000)
      return std::string(mVerbName) + " needs MS from 0 to 60000";
    return {};
  }

  std::string ParseExactIntegers(std::size_t count, std::string_view what) {
    if (mArgs.size() != count)
      return Needs(what);
    return ParseIntegers(count, what);
  }

  std::string ParseIntegers(std::size_t count, std::string_view what) {
    if (mArgs.size() < count)
      return Needs(what);
    for (std::size_t i = 0; i < count; ++i) {
      auto value = ParseWholeNumber<int>(mArgs[i]);
      if (!value)
        return "'" + std::string(mArgs[i]) + "' is not an integer (" + Needs(what) + ")";
      mCommand.numbers.push_back(*value);
    }
    return {};
  }

  std::string ParseIntegersThenModifiers(std::size_t count, std::string_view what,
                                         bool allowSteps) {
    if (auto error = ParseIntegers(count, what); !error.empty())
      return error;
    for (std::size_t i = count; i < mArgs.size(); ++i) {
      if (allowSteps && mArgs[i] == "steps") {
        if (i + 1 >= mArgs.size())
          return "steps needs a count";
        auto steps = ParseWholeNumber<int>(mArgs[++i]);
        if (!steps || *steps < 1 || *steps > 10000)
          return "steps must be between 1 and 10000";
        mCommand.steps = *steps;
        continue;
      }
      auto modifier = ParseModifier(mArgs[i]);
      if (!modifier) {
        return "'" + std::string(mArgs[i]) + "' is not a modifier (shift, ctrl or alt)";
      }
      mCommand.modifiers |= *modifier;
    }
    return {};
  }

  std::string ParseSize() {
    if (auto error = ParseExactIntegers(2, "W and H"); !error.empty())
      return error;
    if (mCommand.numbers[0] < 1 || mCommand.numbers[1] < 1 || mCommand.numbers[0] > 16384 ||
        mCommand.numbers[1] > 16384) {
      return "resize needs a size between 1 and 16384 pixels";
    }
    return {};
  }

  std::string ParseKey() {
    if (mArgs.empty())
      return Needs("a key name");
    mCommand.text = std::string(mArgs[0]);
    for (std::size_t i = 1; i < mArgs.size(); ++i) {
      auto modifier = ParseModifier(mArgs[i]);
      if (!modifier) {
        return "'" + std::string(mArgs[i]) + "' is not a modifier (shift, ctrl or alt)";
      }
      mCommand.modifiers |= *modifier;
    }
    return {};
  }

  std::string ParseSingleWord() {
    if (mArgs.size() != 1)
      return Needs("one argument");
    mCommand.text = std::string(mArgs[0]);
    return {};
  }

  // An id, a name, "none", or "pick N": the popup's N-th enabled command, counting round.
  std::string ParseMenuAnswer() {
    if (mArgs.size() == 2 && mArgs[0] == "pick") {
      const auto index = ParseWholeNumber<int>(mArgs[1]);
      if (!index || *index < 0)
        return "pick needs an index from 0 up, not '" + std::string(mArgs[1]) + "'";
      mCommand.text = "pick";
      mCommand.numbers.push_back(*index);
      return {};
    }
    if (mArgs.size() == 1 && mArgs[0] == "pick")
      return "pick needs an index from 0 up";
    return ParseSingleWord();
  }

  std::string ParsePath(std::string_view restOfLine) {
    if (restOfLine.empty())
      return Needs("a file name");
    mCommand.text = std::string(restOfLine);
    return {};
  }

  ScriptCommand& mCommand;
  std::string_view mVerbName;
  std::vector<std::string_view> mArgs;
};

}  // namespace

std::string ScriptError::Describe() const {
  return "line " + std::to_string(line) + ": " + message;
}

AutomationScript::ParseResult AutomationScript::Parse(std::string_view text) {
  AutomationScript script;
  int lineNumber = 0;
  std::size_t start = 0;
  while (start <= text.size()) {
    const auto end = std::min(text.find('\n', start), text.size());
    const auto rawLine = text.substr(start, end - start);
    start = end + 1;
    ++lineNumber;

    const auto line = Trim(rawLine);
    if (line.empty() || line.front() == '#') {
      if (end == text.size())
        break;
      continue;
    }
    const auto verbEnd = line.find_first_of(" \t");
    const auto verbName = line.substr(0, verbEnd);
    const auto rest =
        verbEnd == std::string_view::npos ? std::string_view{} : Trim(line.substr(verbEnd));
    const auto& table = VerbTable();
    const auto found = table.find(verbName);
    if (found == table.end()) {
      return ScriptError{lineNumber, "unknown verb '" + std::string(verbName) + "'"};
    }
    ScriptCommand command;
    command.verb = found->second.verb;
    command.line = lineNumber;
    // Free-text verbs keep '#'; the others allow a trailing comment.
    auto arguments = rest;
    if (!found->second.takesRestOfLine) {
      arguments = Trim(arguments.substr(0, arguments.find('#')));
    }
    LineParser parser(command, verbName, SplitWords(arguments));
    if (auto error = parser.Parse(arguments); !error.empty()) {
      return ScriptError{lineNumber, error};
    }
    script.mCommands.push_back(std::move(command));
    if (end == text.size())
      break;
  }
  return script;
}

AutomationScript::ParseResult AutomationScript::ParseFile(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in)
    return ScriptError{0, "cannot open script '" + path + "'"};
  std::ostringstream content;
  content << in.rdbuf();
  return Parse(content.str());
}
