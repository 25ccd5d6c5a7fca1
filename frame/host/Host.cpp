#include "frame/host/Host.h"

namespace quendal::host {

namespace {
std::shared_ptr<Library>& LibrarySlot() {
  static std::shared_ptr<Library> library;
  return library;
}
}  // namespace

std::shared_ptr<Library> RegisterLibrary(std::shared_ptr<Library> library) {
  auto previous = std::move(LibrarySlot());
  LibrarySlot() = std::move(library);
  return previous;
}

Library& CurrentLibrary() {
  if (!LibrarySlot()) throw Error(err::kCannotCreateObject, {}, "mvserver");
  return *LibrarySlot();
}

}  // namespace quendal::host
