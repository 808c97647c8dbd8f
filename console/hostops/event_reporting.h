#pragma once

#include <cstdint>

namespace Tarnel {

// The events that a fleet's administrator sees: the whole message, with a place for its argument
// where it has one. The characters before the event's name are what the daemon knows it by.
inline constexpr char NOTARY_LOGIN_FAILED[] =
    "@&!*@*@(notary.user.tarnel.login.failed)Authentication for user %s failed";
inline constexpr char NOTARY_PASSWORD_CHANGED[] =
    "@&!*@*@(notary.user.tarnel.login.passwd.changed)Login password for user %s changed";
inline constexpr char NOTARY_NETWORK_RESTART[] =
    "@&!*@*@(notary.user.tarnel.network.restart)Restarting %s";
inline constexpr char NOTARY_NETWORK_RESTORED[] =
    "@&!*@*@(notary.user.tarnel.factory.network.restored)Restoring factory network settings";
inline constexpr char NOTARY_AGENTS_RESTART[] =
    "@&!*@*@(notary.user.tarnel.restarting.hostagents)Restarting host agents";
inline constexpr char NOTARY_SHUT_DOWN[] =
    "@&!*@*@(notary.user.tarnel.shutdown.host)Shutting down host";
inline constexpr char NOTARY_REBOOT[] = "@&!*@*@(notary.user.tarnel.reboot.host)Rebooting host";
inline constexpr char NOTARY_RESTORE_DEFAULTS[] =
    "@&!*@*@(notary.user.tarnel.restore.factory.defaults)Restoring factory defaults";

// Connects to the observation daemon. 0 on success, else its error code, which is logged.
int32_t OpenNotary();

// Posts one event over a connection of its own. Without the daemon the event is lost and nobody
// but the log is told.
void PostEvent(const char* message, const char* argument = "");

}  // namespace Tarnel
