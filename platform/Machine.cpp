#include "platform/Machine.h"

#include <unistd.h>

namespace quendal {

namespace {
std::function<void()>& Pump() {
  static std::function<void()> pump;
  return pump;
}
}  // namespace

std::optional<std::string> ComputerName() {
  char buf[256] = {};
  if (gethostname(buf, sizeof buf - 1) != 0) return std::nullopt;
  return ComputerNameFrom(buf);
}

std::optional<std::string> ComputerNameFrom(std::string_view hostName) {
  // The name must fit a buffer of 30 characters with its terminating zero;
  // a longer one is not given at all rather than cut.
  if (hostName.empty() || hostName.size() >= 30) return std::nullopt;
  return std::string(hostName);
}

void PumpMessages() {
  if (Pump()) Pump()();
}

void SetMessagePump(std::function<void()> pump) { Pump() = std::move(pump); }

}  // namespace quendal
