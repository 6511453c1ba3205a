#pragma once

#include <memory>
#include <string>
#include <vector>

#include "Host/Rows/ParameterControl.h"

class Static;
class TextButton;

// The row of a table parameter. The value is text: one line per table row, cells separated by
// tabs. Collapsed, the value column tells how many rows there are; expanded, each table row is
// a button under the band showing its cells (" | " between them) that asks for new cells (an
// input box, cells separated by "|") and sets the table as one undoable step.
class SpreadsheetParameter : public ParameterControl {
 public:
  static constexpr CommandID kFirstRowCommand = 17910;
  static constexpr int kMaxShownRows = 64;
  static constexpr int kLineHeight = 18;

  explicit SpreadsheetParameter(const ParameterControlInfo& info);

  bool CanExpand() const override { return true; }
  void PositionSelf(int top, int depth, int width) override;
  void SynchToCurrentTime() override;
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;

  // The table at the edit time: rows of cells.
  std::vector<std::vector<std::string>> GetTable() const;
  // Text of one table row as the row shows it.
  static std::string FormatRow(const std::vector<std::string>& cells);
  // Cells typed by the user ("a | b" -> {"a", "b"}), trimmed.
  static std::vector<std::string> ParseRow(const std::string& text);
  static std::string FormatTable(const std::vector<std::vector<std::string>>& table);
  static std::vector<std::vector<std::string>> ParseTable(const std::string& text);

  Static* GetSummary() const { return mSummary.get(); }
  const std::vector<std::shared_ptr<TextButton>>& GetRowButtons() const { return mRowButtons; }

 protected:
  int GetControlAreaHeight() const override;
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

 private:
  void RebuildRowButtons(std::size_t count);

  std::shared_ptr<Static> mSummary;
  std::vector<std::shared_ptr<TextButton>> mRowButtons;
  bool mControlsShown = false;
  bool mControlsEnabled = true;
};
