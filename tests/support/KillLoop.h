// Kills a writer at random moments and checks what it leaves behind.
//
// Each round forks a child that writes numbered units (a consignment, a
// whole manifest run, a print job) in a loop and tells the parent, through
// a pipe, the number of every unit whose call reported success. The parent
// kills the child with SIGKILL after a random delay, makes one call of its
// own (the call that must first repair what the child left) and then reads
// the output: every unit reported written must be in it exactly once, and
// no unit may be in it twice. `read` checks the output's structure itself
// (with EXPECT_* / ADD_FAILURE) and returns the units it holds in order.
//
//   test::KillLoop loop;
//   loop.write = [&](int n) { return ProcessConsignment("N" + std::to_string(n)); };
//   loop.read = [&] { return NumbersInFile(); };
//   test::RunKillLoop(loop);
//
// QUENDAL_KILL_ROUNDS sets the number of rounds (default `rounds`), so a
// long run by hand needs no rebuild; QUENDAL_KILL_SEED repeats a run.
#pragma once

#include <chrono>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "frame/Component.h"
#include "tests/support/MemoryHost.h"

namespace quendal::test {

struct KillLoop {
  // Writes unit n; true when the call reported success.
  std::function<bool(int n)> write;
  // The units the output holds, one entry per occurrence.
  std::function<std::vector<int>()> read;
  // Default number of rounds (kills) when QUENDAL_KILL_ROUNDS is not set.
  int rounds = 20;
  // The child is killed after a delay drawn evenly from [0, maxDelay].
  std::chrono::microseconds maxDelay{25000};
  // At most this many units per child, so a slow kill never fills the pipe.
  int unitsPerChild = 4000;
};

struct KillLoopResult {
  int kills = 0;     // children killed while they were still writing
  int reported = 0;  // units whose call reported success, children and parent
};

KillLoopResult RunKillLoop(const KillLoop& loop);

// The consignments of a file in the CLN record grammar, after its header
// line: groups of records whose codes read `codes` ("10 15 20 ", each code
// followed by a space), all carrying the group's consignment number
// (columns 3 to 22). Fails the test for a group that is not whole; returns
// the first line of each group.
std::vector<std::string> ClnConsignments(const std::vector<std::string>& lines,
                                         std::string_view codes);

// True when one of the host's log entries named in `ids` has a message that
// holds `text` (the completion line that tells a call went through).
inline bool Logged(const MemoryHost& host, const quendal::LogList& ids, std::string_view text) {
  for (const std::int32_t id : ids)
    if (id >= 1 && static_cast<std::size_t>(id) <= host.logs.size() &&
        host.logs[static_cast<std::size_t>(id - 1)].at("Message").Text().find(text) !=
            std::string::npos)
      return true;
  return false;
}

}  // namespace quendal::test
