// Child processes that stand for packing stations: each runs its work once
// the parent lets all of them go at the same moment, and ends with _exit so
// that nothing of the test's own state is torn down twice.
#pragma once

#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <functional>
#include <string>
#include <vector>

#include "tests/support/EnvCount.h"

namespace quendal::test {

class Stations {
 public:
  // Starts a child that waits for Go, runs `work` and exits with its result (0 for success).
  void Start(const std::function<int()>& work) {
    int gate[2];
    if (::pipe(gate) != 0) return;
    const pid_t pid = ::fork();
    if (pid == 0) {
      ::close(gate[1]);
      char go = 0;
      const ssize_t got = ::read(gate[0], &go, 1);
      ::_exit(got == 1 ? work() : 99);
    }
    ::close(gate[0]);
    if (pid < 0) {
      ::close(gate[1]);
      return;
    }
    children_.push_back({pid, gate[1]});
  }
  std::size_t Count() const { return children_.size(); }
  // Lets every child go at once.
  void Go() {
    for (Child& child : children_) {
      const ssize_t sent = ::write(child.gate, "g", 1);
      static_cast<void>(sent);
      ::close(child.gate);
      child.gate = -1;
    }
  }
  // Kills the child now (SIGKILL).
  void Kill(std::size_t i) { ::kill(children_[i].pid, SIGKILL); }
  // Waits for every child; the exit codes, -signal for a child that was killed.
  std::vector<int> Wait() {
    std::vector<int> codes;
    for (Child& child : children_) {
      if (child.gate >= 0) ::close(child.gate);
      int status = 0;
      while (::waitpid(child.pid, &status, 0) < 0) {
      }
      codes.push_back(WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status));
    }
    children_.clear();
    return codes;
  }
  ~Stations() {
    for (std::size_t i = 0; i < children_.size(); ++i) Kill(i);
    Wait();
  }

 private:
  struct Child {
    pid_t pid;
    int gate;
  };
  std::vector<Child> children_;
};

}  // namespace quendal::test
