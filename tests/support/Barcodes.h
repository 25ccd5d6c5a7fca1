// Barcodes read back from pictures by an independent reader (ZXing-cpp),
// so that a symbol the library draws is checked by what scans it.
#pragma once

#include <set>
#include <string>

namespace quendal::test {

// A GS1-128 reading as its human-readable element strings: AI 00 is 18
// digits; 421 and 90 run to the next group separator.
std::string HumanReadable(const std::string& text);

// Every GS1-128 symbol on a PNG page, as human-readable element strings,
// read band by band down the page.
std::set<std::string> ReadGs1Barcodes(const std::string& png);
// Every Code 128 symbol on a PNG page: GS1-128 ones as human-readable
// element strings, others as the text they carry.
std::set<std::string> ReadCode128Barcodes(const std::string& png);

}  // namespace quendal::test
