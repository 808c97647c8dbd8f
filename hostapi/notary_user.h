#pragma once

#include <cstdint>

// The client of notaryd, the host's observation daemon. The connection belongs to the process.

// Connects to the daemon. 0 on success, else an error code.
int32_t NotaryUserLib_Init();
// Posts one event. The format is the whole message: "@&!*@*@(", the event's id, ")" and the
// readable text with its placeholders.
[[gnu::format(printf, 1, 2)]] int32_t NotaryUserLib_AddEvent(const char* format, ...);
// Ends the connection.
int32_t NotaryUserLib_Close();
