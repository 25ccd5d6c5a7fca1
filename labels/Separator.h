// The separator label that goes between groups of cartons (a new store,
// item or location): VPCL II format 9 "SCMSEP", whose texts run along the
// label, and a batch of one label with no field data.
#pragma once

#include <string>
#include <string_view>

namespace quendal {

// The separator's format followed by its batch. The message's lines
// (separated by CR LF, LF or CR) fill five slots in upper case, each cut to
// its slot: 20, 30, 20, 30 and 35 characters; the fifth takes everything
// after the fourth line break. The first four slots are always sent (empty
// when the message has fewer lines); the fifth only when there is a fifth
// line.
std::string SeparatorJob(std::string_view message, std::string_view batchMode);

}  // namespace quendal
