// The error report shown when a procedure fails, the operator's answer,
// and the procedure guard that acts on it.
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <type_traits>

namespace quendal {

class Error;

// What the operator answered; the report routine maps it to an action
// number (Retry 1, Ignore 2, Abort 3).
enum class Answer { Abort, Retry, Ignore };
enum class Action { Retry = 1, Ignore = 2, Abort = 3 };

// Asks the operator what to do about a failure (a modal box in a desktop
// host). The default answers Abort without asking.
class ErrorPrompt {
 public:
  virtual ~ErrorPrompt() = default;
  virtual Answer Ask(const std::string& title, const std::string& message) = 0;
};

// Installs the process-wide prompt (null restores the default) and returns the previous one.
std::shared_ptr<ErrorPrompt> SetErrorPrompt(std::shared_ptr<ErrorPrompt> prompt);
ErrorPrompt& CurrentErrorPrompt();

// The full path of the library file (or of the program it is linked into).
std::string LibraryPath();

struct ErrorDetails {
  long number = 0;
  std::string description;
  std::string source;
  long line = 0;
};

// The message of the error report, e.g. "MVE error - program error #91
// (Object variable or With block variable not set) occured in module
// cStarTrackGenericSCM, Function PrintLabel, line 0."
std::string ErrorReportMessage(const ErrorDetails& error, std::string_view module,
                               std::string_view procedure, std::string_view libraryPath);

// Shows the report titled "Unexpected Error" and returns the action.
Action ReportError(const ErrorDetails& error, std::string_view module, std::string_view procedure);

// Runs the steps of one public procedure. A step that throws becomes the
// error report; the answer decides: Retry runs the step again, Ignore goes
// on with the next step, Abort leaves the procedure, which then returns the
// result it holds. The step number is the line number of the report.
//
//   bool result = false;
//   Procedure proc("cStarTrackGenericSCM", "Function PrintLabel");
//   if (!proc([&] { ... })) return result;
//
// A step may return bool: false leaves the procedure without an error.
class Procedure {
 public:
  // Keeps its own copy of the names.
  Procedure(std::string_view module, std::string_view name)
      : ownModule_(module), ownName_(name), module_(ownModule_), name_(ownName_) {}
  // Refers to names that outlive the procedure (a class's module name and a
  // literal), so that guarding a call costs no copy.
  struct Lasting {};
  Procedure(Lasting, std::string_view module, std::string_view name)
      : module_(module), name_(name) {}
  // Made in place only: the names may refer into the object itself.
  Procedure(const Procedure&) = delete;
  Procedure& operator=(const Procedure&) = delete;

  template <class Step>
  bool operator()(Step&& step) {
    ++line_;
    for (;;) {
      try {
        if constexpr (std::is_same_v<std::invoke_result_t<Step>, bool>) {
          return step();
        } else {
          step();
          return true;
        }
      } catch (...) {
        switch (Fail()) {
          case Action::Retry:
            continue;
          case Action::Ignore:
            return true;
          case Action::Abort:
            return false;
        }
      }
    }
  }

  std::string_view Module() const { return module_; }
  std::string_view Name() const { return name_; }

 private:
  Action Fail();  // reports the exception in flight

  std::string ownModule_;
  std::string ownName_;
  std::string_view module_;
  std::string_view name_;
  long line_ = 0;
};

}  // namespace quendal
