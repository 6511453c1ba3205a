#include "Host/Rows/SpreadsheetParameter.h"

#include <algorithm>
#include <optional>
#include <variant>

#include "Host/Messaging/Localization.h"
#include "Host/Model/ParamValue.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/Static.h"
#include "Host/Toolkit/TextButton.h"

namespace {

std::vector<std::string> Split(const std::string& text, char separator) {
  std::vector<std::string> parts;
  std::size_t start = 0;
  while (true) {
    const std::size_t end = text.find(separator, start);
    parts.push_back(text.substr(start, end - start));
    if (end == std::string::npos) {
      return parts;
    }
    start = end + 1;
  }
}

std::string Trim(const std::string& text) {
  const std::size_t first = text.find_first_not_of(" \t");
  if (first == std::string::npos) {
    return {};
  }
  const std::size_t last = text.find_last_not_of(" \t");
  return text.substr(first, last - first + 1);
}

}  // namespace

SpreadsheetParameter::SpreadsheetParameter(const ParameterControlInfo& info)
    : ParameterControl(info) {}

void SpreadsheetParameter::PositionSelf(int top, int depth, int width) {
  ParameterControl::PositionSelf(top, depth, width);
  const int left = GetControlsLeft() + 10;
  if (mSummary) {
    PlaceView(*mSummary, Rect::FromSize(left, top + 3, std::max(width - left - 4, 0), 15));
  }
  const int rowsLeft = GetTitleLeft();
  int y = top + OwnHeight() + 2;
  for (const auto& button : mRowButtons) {
    PlaceView(*button,
              Rect::FromSize(rowsLeft, y, std::max(width - rowsLeft - 4, 0), kLineHeight - 2));
    y += kLineHeight;
  }
}

void SpreadsheetParameter::SynchToCurrentTime() {
  const std::vector<std::vector<std::string>> table = GetTable();
  if (mSummary) {
    mSummary->SetText(LocalizeString("$$$/Vantile/Host/Rows/SpreadsheetRows=@0 rows",
                                     {std::to_string(table.size())}));
  }
  const std::size_t shown = std::min<std::size_t>(table.size(), kMaxShownRows);
  if (shown != mRowButtons.size()) {
    RebuildRowButtons(shown);
    // A different number of lines changes the row's height.
    if (IsExpanded() && !GetStation().empty()) {
      BroadcastMessage(GetStation(), EffectControlsDisclosureStateChanged());
    }
  }
  for (std::size_t i = 0; i < shown; ++i) {
    mRowButtons[i]->SetLabel(FormatRow(table[i]));
  }
}

bool SpreadsheetParameter::FindCommandStatus(CommandID command, CommandStatus& status) {
  if (command >= kFirstRowCommand && command < kFirstRowCommand + kMaxShownRows) {
    status.enabled = !IsReadOnly() && IsParamEnabled();
    return true;
  }
  return ParameterControl::FindCommandStatus(command, status);
}

bool SpreadsheetParameter::ObeyCommand(CommandID command) {
  if (command < kFirstRowCommand || command >= kFirstRowCommand + kMaxShownRows) {
    return ParameterControl::ObeyCommand(command);
  }
  std::vector<std::vector<std::string>> table = GetTable();
  const auto index = static_cast<std::size_t>(command - kFirstRowCommand);
  if (IsReadOnly() || !IsParamEnabled() || index >= table.size()) {
    return true;
  }
  const std::string current = FormatRow(table[index]);
  const std::optional<std::string> answer =
      InputBox::Ask("$$$/Vantile/Host/Rows/EditTableRowTitle=Edit Row", GetName(), current);
  if (answer) {
    std::vector<std::string> cells = ParseRow(*answer);
    if (cells != table[index]) {
      table[index] = std::move(cells);
      ApplyValue(FormatTable(table));
    }
  }
  SynchToCurrentTime();
  return true;
}

std::vector<std::vector<std::string>> SpreadsheetParameter::GetTable() const {
  const ParamValue value = GetValueAtEditTime();
  if (const auto* text = std::get_if<std::string>(&value)) {
    return ParseTable(*text);
  }
  return {};
}

std::string SpreadsheetParameter::FormatRow(const std::vector<std::string>& cells) {
  std::string text;
  for (std::size_t i = 0; i < cells.size(); ++i) {
    text += (i == 0 ? "" : " | ") + cells[i];
  }
  return text;
}

std::vector<std::string> SpreadsheetParameter::ParseRow(const std::string& text) {
  std::vector<std::string> cells = Split(text, '|');
  for (std::string& cell : cells) {
    cell = Trim(cell);
  }
  return cells;
}

std::string SpreadsheetParameter::FormatTable(const std::vector<std::vector<std::string>>& table) {
  std::string text;
  for (std::size_t r = 0; r < table.size(); ++r) {
    if (r > 0) {
      text += '\n';
    }
    for (std::size_t c = 0; c < table[r].size(); ++c) {
      text += (c == 0 ? "" : "\t") + table[r][c];
    }
  }
  return text;
}

std::vector<std::vector<std::string>> SpreadsheetParameter::ParseTable(const std::string& text) {
  std::vector<std::vector<std::string>> table;
  if (text.empty()) {
    return table;
  }
  for (const std::string& line : Split(text, '\n')) {
    table.push_back(Split(line, '\t'));
  }
  return table;
}

int SpreadsheetParameter::GetControlAreaHeight() const {
  return static_cast<int>(mRowButtons.size()) * kLineHeight + (mRowButtons.empty() ? 0 : 4);
}

void SpreadsheetParameter::CreateControlsSelf() {
  mSummary = AdoptControl(std::make_shared<Static>(Rect{}));
}

void SpreadsheetParameter::DestroyControlsSelf() {
  DestroyControl(mSummary);
  RebuildRowButtons(0);
}

void SpreadsheetParameter::ShowControls(bool show) {
  ParameterControl::ShowControls(show);
  mControlsShown = show;
  if (mSummary) {
    mSummary->SetVisible(show);
  }
  for (const auto& button : mRowButtons) {
    button->SetVisible(show && IsExpanded());
  }
}

void SpreadsheetParameter::UpdateControlsEnabled(bool enabled) {
  mControlsEnabled = enabled;
  if (mSummary) {
    mSummary->SetEnabled(enabled);
  }
  for (const auto& button : mRowButtons) {
    button->SetEnabled(enabled);
  }
}

void SpreadsheetParameter::RebuildRowButtons(std::size_t count) {
  while (mRowButtons.size() > count) {
    DestroyControl(mRowButtons.back());
    mRowButtons.pop_back();
  }
  while (mRowButtons.size() < count && !IsDestroyed()) {
    const auto command = kFirstRowCommand + static_cast<CommandID>(mRowButtons.size());
    auto button = AdoptControl(std::make_shared<TextButton>(Rect{}, std::string(), command, this));
    if (!button) {
      return;
    }
    button->SetEnabled(mControlsEnabled);
    button->SetVisible(mControlsShown && IsExpanded());
    mRowButtons.push_back(std::move(button));
  }
  PositionSelf(GetTop(), GetDepth(), GetWidth());
}
