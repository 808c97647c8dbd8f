#pragma once

#include <string>

namespace Lab::Host {

// The services of the state, by their names there.
inline constexpr char SHELL_SERVICE[] = "OstrelShell";
inline constexpr char SSH_SERVICE[] = "SSH";
inline constexpr char AGENT_SERVICE[] = "stewardd";

bool IsRunning(const std::string& service);
void SetRunning(const std::string& service, bool running);
// The service starts with the host.
void SetEnabled(const std::string& service, bool enabled);

// What the agent does beyond the service's own script: it opens and closes the firewall with SSH.
void SwitchByAgent(const std::string& service, bool running);

}  // namespace Lab::Host
