#include "tests/support/KillLoop.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <map>
#include <random>
#include <set>
#include <string>
#include <thread>

#include "tests/support/EnvCount.h"

namespace quendal::test {

namespace {

// The child's side: write units and report each success. Never returns.
[[noreturn]] void Child(const KillLoop& loop, int first, int fd) {
  for (int n = first; n < first + loop.unitsPerChild; ++n) {
    if (!loop.write(n)) continue;
    const std::int32_t number = n;
    if (::write(fd, &number, sizeof number) != static_cast<ssize_t>(sizeof number)) break;
  }
  ::_exit(0);
}

// Everything the child reported before it died.
std::vector<int> Reported(int fd) {
  std::vector<int> numbers;
  std::string bytes;
  char buffer[4096];
  for (ssize_t got; (got = ::read(fd, buffer, sizeof buffer)) != 0;) {
    if (got < 0) {
      if (errno == EINTR) continue;
      break;
    }
    bytes.append(buffer, static_cast<std::size_t>(got));
  }
  for (std::size_t at = 0; at + sizeof(std::int32_t) <= bytes.size(); at += sizeof(std::int32_t)) {
    std::int32_t number;
    std::memcpy(&number, bytes.data() + at, sizeof number);
    numbers.push_back(number);
  }
  return numbers;
}

}  // namespace

KillLoopResult RunKillLoop(const KillLoop& loop) {
  const long rounds = EnvCount("QUENDAL_KILL_ROUNDS", loop.rounds);
  const auto seed = static_cast<std::uint32_t>(EnvCount("QUENDAL_KILL_SEED", std::random_device{}()));
  SCOPED_TRACE("QUENDAL_KILL_SEED=" + std::to_string(seed));
  std::mt19937 random(seed);
  std::uniform_int_distribution<long> delay(0, loop.maxDelay.count());

  KillLoopResult result;
  std::set<int> reported;
  int first = 1;
  for (long round = 0; round < rounds; ++round, first += loop.unitsPerChild + 1) {
    int fds[2];
    if (::pipe2(fds, O_CLOEXEC) != 0) {
      ADD_FAILURE() << "pipe failed";
      break;
    }
    const pid_t child = ::fork();
    if (child < 0) {
      ADD_FAILURE() << "fork failed";
      ::close(fds[0]);
      ::close(fds[1]);
      break;
    }
    if (child == 0) {
      ::close(fds[0]);
      Child(loop, first, fds[1]);
    }
    ::close(fds[1]);
    std::this_thread::sleep_for(std::chrono::microseconds(delay(random)));
    ::kill(child, SIGKILL);
    int status = 0;
    ::waitpid(child, &status, 0);
    if (WIFSIGNALED(status) && WTERMSIG(status) == SIGKILL) ++result.kills;
    for (const int n : Reported(fds[0])) reported.insert(n);
    ::close(fds[0]);

    // The next call repairs whatever the kill left, then adds its own unit.
    const int own = first + loop.unitsPerChild;
    if (loop.write(own))
      reported.insert(own);
    else
      ADD_FAILURE() << "round " << round << ": the call after the kill failed";

    std::map<int, int> counts;
    for (const int n : loop.read()) ++counts[n];
    for (const auto& [n, count] : counts)
      if (count > 1) ADD_FAILURE() << "round " << round << ": unit " << n << " is there " << count << " times";
    for (const int n : reported)
      if (!counts.contains(n)) ADD_FAILURE() << "round " << round << ": unit " << n << " reported written is missing";
    if (::testing::Test::HasFailure()) break;
  }
  result.reported = static_cast<int>(reported.size());
  std::printf("[ kill loop ] %d kills, %d units reported written\n", result.kills, result.reported);
  return result;
}

std::vector<std::string> ClnConsignments(const std::vector<std::string>& lines,
                                         std::string_view codes) {
  std::vector<std::string> firsts;
  const std::size_t size = codes.size() / 3;
  for (std::size_t i = 1; i < lines.size(); i += size) {
    const std::string no = lines[i].substr(2, 20);
    std::string kinds;
    for (std::size_t j = i; j < i + size && j < lines.size(); ++j) {
      kinds += lines[j].substr(0, 2) + " ";
      EXPECT_EQ(lines[j].substr(2, 20), no) << "line " << j;
    }
    EXPECT_EQ(kinds, codes) << "line " << i;
    firsts.push_back(lines[i]);
  }
  return firsts;
}

}  // namespace quendal::test
