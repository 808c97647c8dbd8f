#pragma once

#include <string>

// What a key sends, whatever the terminal type.
namespace Tarnel::Testing::Keys {

inline const std::string ENTER = "\r";
inline const std::string ESC = "\x1b";
inline const std::string SPACE = " ";
inline const std::string BACKSPACE = "\x7f";
inline const std::string UP = "\x1b[A";
inline const std::string DOWN = "\x1b[B";
inline const std::string END = "\x1b[4~";
inline const std::string PAGE_UP = "\x1b[5~";
inline const std::string PAGE_DOWN = "\x1b[6~";
inline const std::string F2 = "\x1b[12~";
inline const std::string F3 = "\x1b[13~";
inline const std::string F4 = "\x1b[14~";
inline const std::string F11 = "\x1b[23~";
inline const std::string F12 = "\x1b[24~";

}  // namespace Tarnel::Testing::Keys
