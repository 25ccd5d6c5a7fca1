// A host application that links the installed library: it creates the
// reference label class by its identifier through the public headers.
#include <iostream>

#include "frame/Catalogue.h"
#include "frame/FailSafe.h"
#include "frame/VB.h"
#include "frame/host/Host.h"
#include "labels/WinPrint.h"
#include "platform/Clock.h"
#include "platform/CodePage.h"
#include "platform/CupsSpooler.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileSystem.h"
#include "platform/MemorySpooler.h"
#include "platform/PrintDocument.h"
#include "platform/Settings.h"

int main() {
  const quendal::Created created = quendal::CreateObject("Quendal.clsStarTrackGenericSCM");
  if (!quendal::as<quendal::LabelInterface>(created.object)) {
    std::cerr << created.reason << "\n";
    return 1;
  }
  std::cout << created.object->ClassName() << " " << quendal::Format(quendal::Var(12.5), "###0.00")
            << "\n";
  return 0;
}
