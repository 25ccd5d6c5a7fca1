// How the command answers an error report: asks the operator on a terminal,
// or answers the same every time and prints the report to stderr.
#pragma once

#include <iosfwd>
#include <memory>
#include <string_view>

#include "frame/FailSafe.h"

namespace quendal::cli {

// mode "abort", "retry", "ignore" or "ask"; empty: ask when stdin is a terminal, else abort.
// "ask" without a terminal to ask on answers Abort.
std::shared_ptr<ErrorPrompt> MakePrompt(std::string_view mode, std::istream& in, std::ostream& err,
                                        bool interactive);

}  // namespace quendal::cli
