#include "frame/Error.h"

#include <array>
#include <utility>

namespace quendal {

namespace {

constexpr std::array<std::pair<long, std::string_view>, 30> kDescriptions = {{
    {3, "Return without GoSub"},
    {5, "Invalid procedure call or argument"},
    {6, "Overflow"},
    {7, "Out of memory"},
    {9, "Subscript out of range"},
    {11, "Division by zero"},
    {13, "Type mismatch"},
    {28, "Out of stack space"},
    {52, "Bad file name or number"},
    {53, "File not found"},
    {54, "Bad file mode"},
    {55, "File already open"},
    {57, "Device I/O error"},
    {58, "File already exists"},
    {61, "Disk full"},
    {62, "Input past end of file"},
    {67, "Too many files"},
    {68, "Device unavailable"},
    {70, "Permission denied"},
    {71, "Disk not ready"},
    {75, "Path/File access error"},
    {76, "Path not found"},
    {91, "Object variable or With block variable not set"},
    {94, "Invalid use of Null"},
    {424, "Object required"},
    {429, "ActiveX component can't create object"},
    {438, "Object doesn't support this property or method"},
    {440, "Automation error"},
    {1801, "The printer name is invalid"},
    {-1, ""},
}};

}  // namespace

std::string_view StandardDescription(long number) {
  for (const auto& [n, text] : kDescriptions)
    if (n == number) return text;
  return "Application-defined or object-defined error";
}

Error::Error(long number, std::string description, std::string source)
    : std::runtime_error(description.empty() ? std::string(StandardDescription(number))
                                             : description),
      number_(number),
      description_(description.empty() ? std::string(StandardDescription(number))
                                       : std::move(description)),
      source_(std::move(source)) {}

}  // namespace quendal
