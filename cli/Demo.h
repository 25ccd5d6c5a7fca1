// quendal demo: a fresh demo database in a folder, a realistic despatch day
// imported into it, and every built class run on that day, generically by
// family; then a summary of what each class wrote and logged.
#pragma once

#include <iosfwd>
#include <string>

namespace quendal::cli {

int RunDemo(const std::string& out, std::ostream& cout, bool asJson);

}  // namespace quendal::cli
