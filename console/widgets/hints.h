#pragma once

namespace Tarnel {

// Where two hints differ only in whether a blank stands inside a tag, both are meant.

// The key hints at the bottom of the two panes of a screen.
inline constexpr char HINT_SELECT_ROW[] =
    "{color:black}<Up/Down>{/color} {color:dark-grey}Select{/color}";
inline constexpr char HINT_CHANGE_OR_EXIT[] =
    "{color:white}<Enter>{/color}{color:light-grey} Change{/color}"
    "{align:right}{color:white}<Esc> {/color}{color:light-grey}Exit{/color}{/align}";
inline constexpr char HINT_RESTART_OR_LOG_OUT[] =
    "{color:white}<Enter>{/color} {color:light-grey}Restart"
    "{align:right}{color:white}<Esc>{/color}{color:light-grey} Log Out{/color}{/align}";

// The key hints at the bottom of dialogs.
inline constexpr char HINT_OK[] =
    "{align:right}{color:black}<Enter>{/color} {color:dark-grey}OK{/color}{/align}";
inline constexpr char HINT_OK2[] =
    "{align:right}{color:black}<Enter>{/color}{color:dark-grey} OK{/color}{/align}";
inline constexpr char HINT_OK_CANCEL[] =
    "{align:right}{color:black}<Enter>{/color} {color:dark-grey}OK{/color}  "
    "{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";
inline constexpr char HINT_CONFIRM[] =
    "{color:black}<Enter>{/color} {color:dark-grey}Confirm{/color}"
    "{align:right}{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";
inline constexpr char HINT_YES_NO[] =
    "{color:black}<Y>{/color} {color:dark-grey}Yes{/color}  "
    "{color:black}<N>{/color} {color:dark-grey}No{/color}"
    "{align:right}{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";
inline constexpr char HINT_F11_OK[] =
    "{align:right}{color:black}<F11>{/color} {color:dark-grey}OK{/color}  "
    "{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";
inline constexpr char HINT_F11_RESET[] =
    "{color:black}<F11>{/color} {color:dark-grey}Yes, Reset{/color}"
    "{align:right}{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";
inline constexpr char HINT_SHUT_DOWN[] =
    "{color:black}<F2>{/color} {color:dark-grey}Shut Down{/color}  "
    "{color:black}<F11>{/color} {color:dark-grey}Restart{/color}"
    "{align:right}{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";
inline constexpr char HINT_RESTART_HOST[] =
    "{align:right}{color:black}<Enter>{/color} {color:dark-grey}Restart Host{/color}{/align}";
inline constexpr char HINT_CANCEL[] =
    "{align:right}{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";
inline constexpr char HINT_SELECT[] =
    "{color:black}<Up/Down>{/color} {color:dark-grey}Select{/color}"
    "{align:right}{color:black}<Enter>{/color} {color:dark-grey}OK{/color}  "
    "{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";
inline constexpr char HINT_MARK[] =
    "{color:black}<Up/Down>{/color} {color:dark-grey}Select{/color}  "
    "{color:black}<Space>{/color} {color:dark-grey}Mark Selected{/color}"
    "{align:right}{color:black}<Enter>{/color} {color:dark-grey}OK{/color}  "
    "{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";
inline constexpr char HINT_TOGGLE[] =
    "{color:black}<Space>{/color} {color:dark-grey}Toggle Selected{/color}"
    "{align:right}{color:black}<Enter>{/color} {color:dark-grey}OK{/color}  "
    "{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";
inline constexpr char HINT_SELECT_TOGGLE[] =
    "{color:black}<Up/Down>{/color} {color:dark-grey}Select{/color}  "
    "{color:black}<Space>{/color} {color:dark-grey}Toggle Selected{/color}"
    "{align:right}{color:black}<Enter>{/color} {color:dark-grey}OK{/color}  "
    "{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";
inline constexpr char HINT_DETAILS[] =
    "{color:black}<D>{/color} {color:dark-grey}View Details{/color}  "
    "{color:black}<Space>{/color} {color:dark-grey}Toggle Selected{/color}"
    "{align:right}{color:black}<Enter>{/color} {color:dark-grey}OK{/color}  "
    "{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";

}  // namespace Tarnel
