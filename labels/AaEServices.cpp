#include "labels/AaEServices.h"

#include <array>
#include <string_view>

#include "frame/FailSafe.h"
#include "frame/VB.h"

namespace quendal {

namespace {

struct AaEService {
  std::string_view service;
  std::string_view serviceCode;
  std::string_view articleCode;
};

constexpr std::array<AaEService, 3> kServices = {{
    {"OVERNIGHT", "O/N", "OUH"},
    {"NEXT DAY ECONOMY", "ECO", "NUH"},
    {"OFF PEAK", "O/P", "PUH"},
}};

// The class these tables belong to reports their failures.
constexpr std::string_view kModule = "cAaEGenericSCM";

const AaEService* Find(const Ref<host::ConNote>& conNote) {
  const std::string service = Trim(conNote->Service().Text());
  for (const auto& entry : kServices)
    if (entry.service == service) return &entry;
  return nullptr;
}

}  // namespace

std::string ServiceCode(const Ref<host::ConNote>& conNote) {
  std::string result;
  Procedure proc(kModule, "Function ServiceCode");
  proc([&] {
    if (const AaEService* entry = Find(conNote)) result = entry->serviceCode;
  });
  return result;
}

std::string ArticleCode(const Ref<host::ConNote>& conNote) {
  std::string result;
  Procedure proc(kModule, "Function ArticleCode");
  proc([&] {
    if (const AaEService* entry = Find(conNote)) result = entry->articleCode;
  });
  return result;
}

}  // namespace quendal
