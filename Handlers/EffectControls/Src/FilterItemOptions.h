#pragma once

// How the list asks an effect row to look, decided once per row from the list's style and the
// row's nesting (the list build fills it; the row keeps a copy).
struct FilterItemOptions {
  // The row is a section's top row (subgroup level 0): only top rows get an on/off switch.
  bool topLevel = true;
  // The on/off switch is a check box at the right edge instead of the picture button at the left.
  bool checkboxSwitch = false;
  // Video effects skip their setup-dialog button.
  bool noVideoSetupButton = false;
  // Extra left indent of the row, in pixels (40 for lists that indent their effects, else 0).
  int indent = 0;
  // The row starts collapsed unless the effect remembers it open.
  bool startCollapsed = false;
  // The row has no indent of its own and shows no switch, reset or preset controls.
  bool noIndent = false;
};
