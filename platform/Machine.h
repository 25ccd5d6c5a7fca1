// The machine's name and the host's message pump.
#pragma once

#include <functional>
#include <optional>
#include <string>

namespace quendal {

// The computer name (at most 30 characters); nullopt when the system can't tell.
std::optional<std::string> ComputerName();

// Lets the host process its pending events (a no-op unless a pump is set).
void PumpMessages();
void SetMessagePump(std::function<void()> pump);

}  // namespace quendal
