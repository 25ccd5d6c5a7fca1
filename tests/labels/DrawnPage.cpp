#include "tests/labels/DrawnPage.h"

#include <filesystem>

#include "platform/DirectorySpooler.h"
#include "platform/FileSystem.h"
#include "tests/support/TempFolder.h"

namespace quendal::test {

std::string DrawnPage(LabelInterface& label,
                      const std::shared_ptr<MemoryObject<host::System>>& system,
                      const Ref<host::Pack>& pack, int dpi) {
  namespace fs = std::filesystem;
  TempFolder root;
  const fs::path printer = fs::path(root.path()) / "Office Laser";
  fs::create_directories(printer);
  AppendFile((printer / "printer.ini").string(),
             "dpi=" + std::to_string(dpi) + "\nheight_mm=210\n");
  const auto previous = SetSpooler(std::make_shared<DirectorySpooler>(root.path()));
  const Var language = system->fields["PrinterLanguage"];
  system->fields["PrinterLanguage"] = "WinPCL";
  std::string page;
  if (label.Init(system, "Office Laser") && label.PrintLabel(pack))
    for (const auto& entry : fs::directory_iterator(printer))
      if (entry.path().extension() == ".png") page = ReadFile(entry.path().string()).value_or("");
  system->fields["PrinterLanguage"] = language;
  SetSpooler(previous);
  return page;
}

}  // namespace quendal::test
