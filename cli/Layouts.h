// quendal layout show CLASS | layout check FILE: the carrier layouts the
// library ships, and a site's layout file checked and shown at work on a
// sample consignment.
#pragma once

#include <iosfwd>
#include <string>

namespace quendal::cli {

// Prints the layout the library ships for the class.
int LayoutShow(const std::string& className, std::ostream& out, bool asJson);

// Reads the layout file; when it is sound, runs the class it is meant for
// (--class, or the class the file is named after) on a sample consignment
// in a scratch folder and prints the records written. A file that can't be
// used is reported with its line and column: UsageError (exit status 1).
int LayoutCheck(const std::string& file, std::string className, std::ostream& out, bool asJson);

}  // namespace quendal::cli
