// libFuzzer target: any format and batch text must read, lay out and draw
// without crashing, looping or reading out of bounds.
#include <cstddef>
#include <cstdint>
#include <string_view>

#include "labels/VpclLabel.h"
#include "labels/WinPrintDraw.h"
#include "platform/RecordingCanvas.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view input(reinterpret_cast<const char*>(data), size);
  // The first NUL (or the middle) separates the format from the batch.
  std::size_t split = input.find('\0');
  if (split == std::string_view::npos) split = size / 2;
  const std::string_view format = input.substr(0, split);
  const std::string_view batch = input.substr(split < size ? split + 1 : size);
  const quendal::LabelDrawing drawing =
      quendal::LayOutLabel(quendal::ReadVpclLabel(format, batch));
  quendal::RecordingCanvas canvas;
  canvas.StartPage();
  quendal::DrawLabel(canvas, 4.8f, 4.8f, drawing);
  canvas.EndPage();
  return 0;
}
