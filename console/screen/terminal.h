#pragma once

#include <termios.h>

namespace Tarnel {

// False when TERM is exactly "linux" or "xterm".
extern bool runningOverSerial;
// The settings of standard output at start; on a virtual terminal without a suspend character.
extern termios orig_termios;

// No virtual terminal was asked for.
inline constexpr int NO_VIRTUAL_TERMINAL = -1;

// Reads the terminal's settings and its type, and sets the place of the terminal descriptions when
// the environment does not.
void ReadTerminal();
// Brings the virtual terminal to the front; a failure is silent.
void ActivateVirtualTerminal(int vt);
// Takes the suspend character from the terminal.
void DisableSuspend();

// Opens the curses screen with its colours and keys, and has it closed at the end of the process.
// A terminal type that curses cannot use is logged and ends the process with status 1.
void OpenScreen();
// Clears the screen, gives the terminal back and has it reset its palette.
void CloseScreen();

}  // namespace Tarnel
