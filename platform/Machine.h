// The machine's name and the host's message pump.
#pragma once

#include <functional>
#include <optional>
#include <string>
#include <string_view>

namespace quendal {

// The computer name (at most 29 characters); nullopt when the system can't
// tell or the name does not fit.
std::optional<std::string> ComputerName();
// The computer name a host name gives: nullopt when it is empty or 30
// characters or longer.
std::optional<std::string> ComputerNameFrom(std::string_view hostName);

// Lets the host process its pending events (a no-op unless a pump is set).
void PumpMessages();
void SetMessagePump(std::function<void()> pump);

}  // namespace quendal
