#include "frame/FailSafe.h"

#include <dlfcn.h>

#include <cctype>
#include <exception>
#include <filesystem>
#include <mutex>
#include <new>

#include "frame/Error.h"

namespace quendal {

namespace {

class AbortPrompt : public ErrorPrompt {
 public:
  Answer Ask(const std::string&, const std::string&) override { return Answer::Abort; }
};

std::shared_ptr<ErrorPrompt>& PromptSlot() {
  static std::shared_ptr<ErrorPrompt> prompt = std::make_shared<AbortPrompt>();
  return prompt;
}

// What the exception in flight says, as an error number, description and source.
ErrorDetails Describe(std::exception_ptr e) {
  ErrorDetails d;
  try {
    std::rethrow_exception(e);
  } catch (const Error& error) {
    d.number = error.Number();
    d.description = error.Description();
    d.source = error.Source();
  } catch (const std::bad_alloc&) {
    d.number = 7;
    d.description = std::string(StandardDescription(7));
  } catch (const std::filesystem::filesystem_error& error) {
    d.number = err::kPathFileAccess;
    d.description = std::string(StandardDescription(d.number)) + ": " + error.what();
  } catch (const std::exception& error) {
    d.number = err::kAutomation;
    d.description = error.what();
  } catch (...) {
    d.number = err::kAutomation;
    d.description = std::string(StandardDescription(d.number));
  }
  return d;
}

}  // namespace

std::shared_ptr<ErrorPrompt> SetErrorPrompt(std::shared_ptr<ErrorPrompt> prompt) {
  auto previous = PromptSlot();
  PromptSlot() = prompt ? std::move(prompt) : std::make_shared<AbortPrompt>();
  return previous;
}

ErrorPrompt& CurrentErrorPrompt() { return *PromptSlot(); }

std::string LibraryPath() {
  Dl_info info{};
  if (dladdr(reinterpret_cast<void*>(&LibraryPath), &info) && info.dli_fname) {
    std::error_code ec;
    auto path = std::filesystem::canonical(info.dli_fname, ec);
    return ec ? std::string(info.dli_fname) : path.string();
  }
  return "quendal";
}

std::string ErrorReportMessage(const ErrorDetails& error, std::string_view module,
                               std::string_view procedure, std::string_view libraryPath) {
  std::string suffix = ".";
  const std::string& source = error.source;
  if (!source.empty() && std::isdigit(static_cast<unsigned char>(source[0])) && source[0] != '0') {
    const std::size_t bang = source.find('!');
    const std::string remote =
        source.substr(1, bang == std::string::npos ? std::string::npos : bang - 1);
    suffix = ". This error was generated remotely by " + remote + ", a component of " +
             std::string(libraryPath) + ".";
  }
  return "MVE error - program error #" + std::to_string(error.number) + " (" + error.description +
         ") occured in module " + std::string(module) + ", " + std::string(procedure) + ", line " +
         std::to_string(error.line) + suffix;
}

Action ReportError(const ErrorDetails& error, std::string_view module, std::string_view procedure) {
  const std::string message = ErrorReportMessage(error, module, procedure, LibraryPath());
  switch (CurrentErrorPrompt().Ask("Unexpected Error", message)) {
    case Answer::Retry:
      return Action::Retry;
    case Answer::Ignore:
      return Action::Ignore;
    case Answer::Abort:
      break;
  }
  return Action::Abort;
}

Action Procedure::Fail() {
  ErrorDetails details = Describe(std::current_exception());
  details.line = line_;
  return ReportError(details, module_, name_);
}

}  // namespace quendal
