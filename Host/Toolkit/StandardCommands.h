#pragma once

#include "Host/Toolkit/CommandStatus.h"

// The host's standard edit commands. The shortcut manager declares them, with their names and
// keys, in its global context; views answer them through their commanders.
inline constexpr CommandID kCommandClear = 57632;        // "cmd.edit.clear": Delete, Backspace
inline constexpr CommandID kCommandCopy = 57634;         // "cmd.edit.copy": Ctrl+C
inline constexpr CommandID kCommandCut = 57635;          // "cmd.edit.cut": Ctrl+X
inline constexpr CommandID kCommandPaste = 57637;        // "cmd.edit.paste": Ctrl+V
inline constexpr CommandID kCommandSelectAll = 57642;    // "cmd.edit.selectall": Ctrl+A
inline constexpr CommandID kCommandUndo = 57643;         // "cmd.edit.undo": Ctrl+Z
inline constexpr CommandID kCommandRedo = 57644;         // "cmd.edit.redo": Ctrl+Shift+Z
inline constexpr CommandID kCommandDeselectAll = 11303;  // "cmd.edit.deselectall": Ctrl+Shift+A
// The open project's file, and the program.
inline constexpr CommandID kCommandOpen = 57601;    // "cmd.file.open": Ctrl+O
inline constexpr CommandID kCommandSave = 57603;    // "cmd.file.save": Ctrl+S
inline constexpr CommandID kCommandSaveAs = 57604;  // "cmd.file.saveas": Ctrl+Shift+S
// The answers to "save the changes before closing?" besides kCommandSave.
inline constexpr CommandID kCommandDontSave = 57605;     // "cmd.file.dontsave"
inline constexpr CommandID kCommandCancelClose = 57606;  // "cmd.file.cancelclose"
inline constexpr CommandID kCommandQuit = 57665;         // "cmd.file.quit": Ctrl+Q
// Playback of the active sequence; a focused view that takes these keys (a text field) keeps them.
inline constexpr CommandID kCommandPlayStop = 11400;     // "cmd.transport.playstop": Space
inline constexpr CommandID kCommandGoToStart = 11401;    // "cmd.transport.gotostart": Home
inline constexpr CommandID kCommandGoToEnd = 11402;      // "cmd.transport.gotoend": End
inline constexpr CommandID kCommandStepBack = 11403;     // "cmd.transport.stepback": Left
inline constexpr CommandID kCommandStepForward = 11404;  // "cmd.transport.stepforward": Right
