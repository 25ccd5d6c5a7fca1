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
  if (gethostname(buf, sizeof buf - 1) != 0 || buf[0] == '\0') return std::nullopt;
  std::string name = buf;
  if (name.size() > 30) name.resize(30);
  return name;
}

void PumpMessages() {
  if (Pump()) Pump()();
}

void SetMessagePump(std::function<void()> pump) { Pump() = std::move(pump); }

}  // namespace quendal
