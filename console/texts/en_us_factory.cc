#include <cstddef>
#include <iterator>

#include "console/texts/string_factory.h"
#include "console/widgets/host_facts.h"

namespace Tarnel {

namespace {

// The one text that is made at run time.
constexpr size_t PRODUCT_LINE = 2;

// Long texts stand in several literals; the size below notices a comma too few.
// NOLINTBEGIN(bugprone-suspicious-missing-comma)
constexpr const char* TEXTS[] = {
    // 0
    "Customize System/View Logs",
    "Shut Down/Restart",
    "",  // the product line stands here
    "",
    "System Customization",
    "Configure Password",
    "Configure Lockdown Mode",
    "Configure DriverVM Devices",
    "Configure Management Network",
    "Restart Management Network",
    "Test Management Network",
    "Network Restore Options",
    "View Support Information",
    "View System Logs",
    "Troubleshooting Options",
    "Reset System Configuration",
    "Configure Keyboard",
    "Restart Management Network: Error",
    "Enable Management Network: Error",
    "Disable Management Network: Error",
    // 20
    "Management network interface cannot be found.",
    "Operation on the management network interface failed.",
    "To prevent unauthorized access to this system, set the password for the user.",
    "When enabled, lockdown mode prevents users from logging directly into this host. The host "
    "will only be accessible through this local console or an authorized centralized management "
    "application.",
    "It is possible to use a Linux DriverVM to control network and storage devices. This is "
    "recommended only for devices which Ostrel does not natively support. Performance may be "
    "compromised when compared to native Ostrel drivers, but the use of a DriverVM may allow you "
    "to utilize hardware that would not normally work with Ostrel",
    "To view or modify this host's management network settings in detail, press <Enter>.",
    "Restarting the management network interface may be required to restore networking or to renew "
    "a DHCP lease.\n\nRestarting the management network will result in a brief network outage that "
    "may temporarily affect running virtual machines.\n\nNote: If a renewed DHCP lease results in "
    "a new network identity (e.g., IP address or hostname), remote management software will be "
    "disconnected.",
    "To perform a brief network test, press <Enter>.\n\nBy default, this test will attempt to ping "
    "the configured default gateway, ping the configured primary and alternate DNS servers, and "
    "resolve the configured hostname.",
    "To view various network restore options like full network restore, move Management network "
    "from misconfigured Lattice to standard switch or correct misconfigured Lattice Management "
    "network port properties.",
    "Press the corresponding key to view a log.\nPress <Q> to return to this screen.",
    "To view various troubleshooting mode options like Enable Ostrel Shell, Enable SSH and Restart "
    "Agents.",
    "Warning!\n\nAll system parameters will be reverted to their software defaults, including any "
    "parameters customized by the hardware manufacturer. The root password will be reset to "
    "nothing, which may allow unauthorized access to your system. All virtual machines will be "
    "unregistered.\n\nThis operation requires a restart of the host. It is recommended to "
    "previously shut down or migrate running virtual machines off this host.",
    "Warning!\n\nAll custom extensions will be removed.\n\nThis operation requires a restart of "
    "the host. It is recommended to previously shut down or migrate running virtual machines off "
    "this host.",
    "Network identity acquired from DHCP server",
    "To select the layout type for the keyboard of this host, press <Enter>.",
    "Change default password to prevent unauthorized access",
    "Unknown",
    "IPv4 Address",
    "IPv6 Addresses",
    "Attributed addresses",
    // 40
    "Default Gateway",
    "Subnet Mask",
    "Hostname",
    "Primary DNS Server",
    "Alternate DNS Server",
    "IPv6 DNS Server",
    "Configure Management Network",
    "DriverVM Devices",
    "Network Adapters",
    "VLAN (optional)",
    "IPv4 Configuration",
    "IPv6 Configuration",
    "IPv6 is enabled.",
    "IPv6 is disabled.",
    "DNS Configuration",
    "Custom DNS Suffixes",
    "The adapters listed here provide the default network connection to and from this host. When "
    "two or more adapters are used, connections will be fault-tolerant and outgoing traffic will "
    "be load-balanced.",
    "It is possible to use a Linux DriverVM to control network and storage devices. This is "
    "recommended only for devices which Ostrel does not natively support. Performance may be "
    "compromised when compared to native Ostrel drivers, but the use of a DriverVM may allow you "
    "to use hardware that would not normally work with Ostrel",
    "A VLAN is a virtual network within a physical network. Because several VLANs can co-exist on "
    "the same physical network segment, VLAN configuration and partitioning is often more "
    "flexible, better isolated, and less expensive than flat networks based on traditional "
    "physical topology.\n\nIf you are unsure how to configure or use a VLAN, it is safe to leave "
    "this option unset.",
    "This host can obtain an IPv4 address and other networking parameters automatically if your "
    "network includes a DHCP server. If not, ask your network administrator for the appropriate "
    "settings.",
    // 60
    "This host can obtain IPv6 addresses and other networking parameters automatically if your "
    "network includes a DHCPv6 server or supports Router Advertisement.",
    "This host can be configured to support IPv6. A restart of the host will be required to enable "
    "or disable IPv6.",
    "The support for IPv6 will be enabled after the next reboot.",
    "If this host is configured using DHCP, DNS server addresses and other DNS parameters can be "
    "obtained automatically. If not, ask your network administrator for the appropriate settings.",
    "When using short, unqualified names, DNS queries will attempt to locate the specified host by "
    "appending the suffixes listed here in the order shown until a match is found or the list is "
    "exhausted.\n\nIf no suffixes are specified here, a default suffix list is derived from the "
    "local domain name.",
    "Network Configuration Error",
    "Network Restore Options",
    "Restore Network Settings",
    "Restore Standard Switch",
    "Restore Lattice",
    "Restoring the network settings will revert all network configuration and will automatically "
    "configure the network with defaults.\n\nRestoring the network settings will stop all the "
    "running virtual machines on the host.",
    "All management network and associated uplinks can be moved onto a new softSwitch in order to "
    "restore network connectivity to Fleetkeep. All interfaces apart from management interface "
    "will be disabled.\nTry Restore Lattice option to manually repair misconfigured Lattice.",
    "Reconfigure properties of misconfigured Lattice Management network port.\n\nA new Lattice "
    "host local port will be created with the reconfigured properties and the management network "
    "will be moved to this new port. All other properties will be cloned from original "
    "LatticePort. This operation is available only for HALVREN Lattice",
    "DriverVM Configuration",
    "Select the devices from this host for which you would like to use the DriverVM. Note only "
    "devices for which Ostrel does not contain a native driver will appear below.",
    "Device Assignment Warning",
    "Due to the PCI topology of this system or device constraints, changes to the ownership of "
    "this device will affect the ownership of other devices",
    "Network Adapters",
    "Select the adapters for this host's default management network connection. Use two or more "
    "adapters for fault-tolerance and load-balancing.",
    "Network Adapters: Warning",
    // 80
    "One or more of the selected adapters are already used for other connections.",
    "Remove these adapters from their current connections?",
    "Invalid IP address",
    "Please reenter a valid IPv4 address (x.x.x.x).",
    "Please reenter a valid IPv6 network address (x:x:x/x).",
    "Invalid IP or IPv6 address.",
    "Invalid subnet",
    "Please reenter a valid subnet (x.x.x.x).",
    "Invalid scope",
    "Cannot add a link-local address as static address.",
    "Invalid gateway address",
    "Please reenter a valid gateway address (x.x.x.x).",
    "Please reenter a valid IPv6 gateway address (x:x:x).",
    "Link-local addresses are not supported as default gateway.",
    "Invalid DNS server address",
    "Please reenter a valid DNS server address (IP or IPv6).",
    "Invalid VLAN ID",
    "Please reenter a valid VLAN ID (1-4095).",
    "You entered a VLAN ID of 4095. This host will receive all VLAN-tagged frames and be able to "
    "send any VLAN-tagged frame.\n\nUnless this is specifically intended, it is best not to "
    "configure a VLAN ID of 4095.",
    "If you are unsure how to configure or use a VLAN, it is safe to leave this option unset.",
    // 100
    "VLAN ID (1-4094, or 4095 to access all VLANs):",
    "IPv4 Configuration",
    "This host can obtain network settings automatically if your network includes a DHCP server. "
    "If it does not, the following settings must be specified:",
    "Disable IPv4 configuration for management network",
    "Use dynamic IPv4 address and network configuration",
    "Set static IPv4 address and network configuration:",
    "IPv6 Configuration",
    "This host can obtain network settings automatically if your network supports Stateless "
    "Address Autoconfiguration (SLAAC) or includes a DHCPv6 server. If it does not, static "
    "settings must be specified:",
    "Disable IPv6 (restart required)",
    "Use dynamic IPv6 address and network configuration",
    "Use DHCPv6",
    "Set static IPv6 address and network configuration",
    "Static address",
    "Default gateway",
    "Warning",
    "No adapter",
    "Automatic",
    "None",
    "Manual",
    "Set",
    // 120
    "Not set",
    "Enabled",
    "Disabled",
    "Done.",
    "DNS Configuration",
    "This host can only obtain DNS settings automatically if it also obtains its IP configuration "
    "automatically.",
    "Obtain DNS server addresses and a hostname automatically",
    "Use the following DNS server addresses and hostname:",
    "DNS queries will attempt to locate hosts by appending the suffixes specified here to short, "
    "unqualified names.\n\nUse spaces or commas to separate multiple entries.",
    "Suffixes:",
    "Restart Management Network: Confirm",
    "Restarting the management network will result in a brief network outage. It may disconnect "
    "remote management software and affect running virtual machines.",
    "Restart management network now?",
    "Restart Management Network",
    "Please wait while the management network restarts.",
    "Stopping management network.",
    "Starting management network.",
    "IP address is ",
    "Restore Standard Switch",
    "All management network and associated uplinks can be moved onto a new softSwitch in order to "
    "restore network connectivity to Fleetkeep.",
    // 140
    "Move the management network onto a standard switch?",
    "Download tools to manage this host from:",
    "Warning: DHCP lookup failed. You may be unable to access this system until you customize its "
    "network configuration.",
    "Warning: Host is running in audit mode. Your configuration will not be persistent across "
    "reboots. Please contact support.",
    "Authentication Required",
    "Enter an authorized login name and password for ",
    "Enter the smart card login PIN for ",
    "Authentication Denied",
    "Direct console access has been disabled by the administrator for ",
    "Login Name:",
    "Login Id:",
    "Password:",
    "PIN:",
    "Authentication failed",
    "Invalid login or password.",
    "User does not have permission to login to TARNEL.",
    "Configure Password",
    "Setting the password will prevent unauthorized access to this host.",
    "Old Password:",
    "New Password:",
    // 160
    "Confirm Password:",
    "Configure Password: Error",
    "Configure Password: Warning",
    "The old password you entered is incorrect",
    "The new password and the confirmed password do not match.",
    "Empty passwords are not allowed.",
    "New password is same as old password. Are you sure?",
    "The password change operation failed.\nPlease ensure that your password meets the complexity "
    "criteria set by the system.",
    "Shut Down/Restart",
    "Remote management software is recommended to safely shut down or restart this host.\n\nBy "
    "default, running virtual machines will be powered off, suspended, or shut down according to "
    "the current system shutdown policy.\nIf this host is part of an HA cluster, then HA will not "
    "restart these VMs unless they are forcefully terminated.",
    "Forcefully terminate running VMs",
    "Shut Down Host",
    "Shutdown in progress...",
    "Warning: VMs running on the host",
    "Host has VMs running. Are you sure you want to shutdown/restart the host or restore the "
    "network.",
    "Restart Host",
    "Restart in progress...",
    "Reset System Configuration: Confirm",
    "Warning! All system parameters will be reverted to their software defaults, and host "
    "configuration will be lost.",
    "Reset System Configuration now?",
    // 180
    "Reset System Configuration",
    "Please wait while the default settings are restored.",
    "Default settings are restored. Press <Enter> to restart your host.",
    "Remove Custom Extensions: Confirm",
    "Warning! All custom extensions will be removed.",
    "Remove custom extensions now?",
    "Remove Custom Extensions",
    "Please wait while the custom extensions are removed.",
    "Custom extensions have been removed. Press <Enter> to restart your host.",
    "Restore Network Factory Settings",
    "This option will reset the host network configuration to its default setting.",
    "Are you sure you want to reset the host network configuration?",
    "Restore to default blocked setting (unblocked) ",
    "Select Lattice uplinks",
    "Please enter a valid VLAN ID (1-4094).",
    "Restore Lattice",
    "Enter the properties for new Lattice host local port that will be created.\nAll other "
    "properties will be taken as default.",
    "Restore Lattice: Error",
    "Unable to restore Lattice. Check logs for details.",
    "Unable to restore Lattice. Restore Lattice operation cannot be performed on 3rd party "
    "Lattice.",
    // 200
    "Lattice Uplinks",
    "Select the Lattice Uplinks (one or more) to be used by management corenic",
    "Lattice Uplinks: Warning",
    "No uplinks were selected.",
    "Do you want to continue?",
    "No Lattice Uplinks: Error",
    "No uplinks are configured on the host for this Lattice.",
    "Restore Network Settings",
    "Please wait while the factory network settings are restored.",
    "Powering Off VMs.",
    "Auto-configuring network.",
    "Configure Management Network: Confirm",
    "You have made changes to the host's management network.\nApplying these changes may result in "
    "a brief network outage, disconnect remote management software and affect running virtual "
    "machines. In case IPv6 has been enabled or disabled this will restart your host.",
    "Apply changes and restart management network?",
    "Apply changes and reboot host?",
    "Test Management Network",
    "By default, this test will attempt to ping your default gateway and DNS servers, and resolve "
    "your hostname.",
    "Ping Address",
    "Resolve Hostname",
    "Testing Management Network",
    // 220
    "You may interrupt the test at any time.",
    "Pinging address",
    "Resolving hostname",
    "Failed.",
    "OK.",
    "Troubleshooting Mode Options",
    "Enable Ostrel Shell",
    "Disable Ostrel Shell",
    "Enable SSH",
    "Disable SSH",
    "Ostrel Shell",
    "SSH Support",
    "Modify Ostrel Shell and SSH timeouts",
    "Modify TARNEL idle timeout",
    "Restart Management Agents",
    "Change current state of the Ostrel Shell",
    "Change current state of SSH",
    "Ostrel Shell is Enabled",
    "Ostrel Shell is Disabled",
    "SSH is Enabled",
    // 240
    "SSH is Disabled",
    "The management agents are the programs that allow remote management software to monitor and "
    "control this host.\n\nRestarting the management agents will disconnect all remote management "
    "software and will affect all running services.",
    "Modify the number of minutes that can elapse before you must log in after Ostrel Shell access "
    "is enabled and the idle timeout for interactive sessions.",
    "Modify the number of idle minutes that can elapse before you must log in again in TARNEL.",
    "Restart Management Agents: Confirm",
    "{color:red}Warning! Restarting the management agents will disconnect all remote management "
    "software. This will affect all running services.\nCollection of extra troubleshooting "
    "information can take a noticeable amount of time.{/color}",
    "Restart management agents now?",
    "Stopping management agents.",
    "Starting management agents.",
    "Collect extra troubleshooting information",
    "Collecting host agent live core information.",
    "Please, wait ...",
    "Configure Lockdown Mode",
    "When enabled, lockdown mode prevents users from logging directly into this host.",
    "Enable lockdown mode",
    "If you are having difficulty using your keyboard, choose a layout that matches your keyboard "
    "from the options below.",
    "Enable IPv6: Restart Required",
    "This host must be restarted before IPv6 will be enabled.",
    "Disable IPv6: Restart Required",
    "This host must be restarted before IPv6 will be disabled.",
    // 260
    "Router advertised",
    "DHCP",
    "STATIC",
    "AUTOCONF",
    "Waiting for DHCP...",
    "Set the timeouts for Ostrel Shell access (local and remote)",
    "Set the number of minutes that can elapse before you must log in after Ostrel Shell is "
    "enabled (the availability timeout) and the timeout for idle interactive sessions.\n\nAfter "
    "the availability timeout expires any running shell instances will remain, but new sessions "
    "will not be allowed.  Changes to idle timeout will apply on next login, but will not affect "
    "any existing sessions.\n\nValues are in minutes. Use zero to disable timeouts. Maximum value "
    "is 1440 minutes.",
    "Availability timeout",
    "Idle timeout",
    "Invalid timeout value",
    "Timeout value must be between 0 (disabled) and 1440 minutes",
    "Set idle timeout for TARNEL access",
    "Set the number of idle minutes that can elapse before you must log in again in "
    "TARNEL.\n\nValue is in minutes. Use zero to disable the timeout. Maximum value is 1440 "
    "minutes.",
    "TARNEL idle timeout",
};
// NOLINTEND(bugprone-suspicious-missing-comma)
static_assert(std::size(TEXTS) == 274);

}  // namespace

const char* en_US_Factory::GetString(int id) {
  const auto index = static_cast<size_t>(id);
  if (index == PRODUCT_LINE) return GetProductLine().c_str();
  return index < std::size(TEXTS) ? TEXTS[index] : "";
}

}  // namespace Tarnel
