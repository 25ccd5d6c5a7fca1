#include "platform/Spooler.h"

#include "platform/DirectorySpooler.h"

namespace quendal {

namespace {
std::shared_ptr<Spooler>& Slot() {
  static std::shared_ptr<Spooler> spooler;
  return spooler;
}
}  // namespace

std::shared_ptr<Spooler> SetSpooler(std::shared_ptr<Spooler> spooler) {
  auto previous = std::move(Slot());
  Slot() = std::move(spooler);
  return previous;
}

Spooler& CurrentSpooler() {
  if (!Slot()) Slot() = std::make_shared<DirectorySpooler>("spool");
  return *Slot();
}

}  // namespace quendal
