// A drawn print job on an installed printer, as a printer device context
// offers it: a document of pages drawn on a Canvas.
#pragma once

#include <string>

#include "platform/Canvas.h"

namespace quendal {

class DeviceContext : public Canvas {
 public:
  // Starts a document; false when the printer refuses it.
  virtual bool StartDoc(const std::string& documentName) = 0;
  // Ends the document: its pages go to the printer.
  virtual bool EndDoc() = 0;
};

}  // namespace quendal
