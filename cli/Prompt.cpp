#include "cli/Prompt.h"

#include <cctype>
#include <istream>
#include <ostream>
#include <string>

namespace quendal::cli {

namespace {

// Answers the same every time. Retrying the same failing step is given up
// after a few attempts, so an unattended run can't loop for ever.
class FixedPrompt : public ErrorPrompt {
 public:
  FixedPrompt(Answer answer, std::ostream& err) : answer_(answer), err_(err) {}
  Answer Ask(const std::string& title, const std::string& message) override {
    err_ << title << ": " << message << "\n";
    if (answer_ != Answer::Retry) return answer_;
    retries_ = message == last_ ? retries_ + 1 : 1;
    last_ = message;
    if (retries_ > kRetries) {
      err_ << "Still failing after " << kRetries << " retries: Abort.\n";
      retries_ = 0;
      last_.clear();
      return Answer::Abort;
    }
    return Answer::Retry;
  }

 private:
  static constexpr int kRetries = 3;
  Answer answer_;
  std::ostream& err_;
  std::string last_;
  int retries_ = 0;
};

// Shows the report and reads the operator's answer.
class TerminalPrompt : public ErrorPrompt {
 public:
  TerminalPrompt(std::istream& in, std::ostream& err) : in_(in), err_(err) {}
  Answer Ask(const std::string& title, const std::string& message) override {
    err_ << title << ": " << message << "\n";
    for (;;) {
      err_ << "[A]bort, [R]etry or [I]gnore? " << std::flush;
      std::string line;
      if (!std::getline(in_, line)) return Answer::Abort;
      const char c = line.empty() ? ' ' : static_cast<char>(std::tolower(static_cast<unsigned char>(line[0])));
      if (c == 'a') return Answer::Abort;
      if (c == 'r') return Answer::Retry;
      if (c == 'i') return Answer::Ignore;
    }
  }

 private:
  std::istream& in_;
  std::ostream& err_;
};

}  // namespace

std::shared_ptr<ErrorPrompt> MakePrompt(std::string_view mode, std::istream& in, std::ostream& err,
                                        bool interactive) {
  if (mode == "retry") return std::make_shared<FixedPrompt>(Answer::Retry, err);
  if (mode == "ignore") return std::make_shared<FixedPrompt>(Answer::Ignore, err);
  if ((mode == "ask" || mode.empty()) && interactive) return std::make_shared<TerminalPrompt>(in, err);
  return std::make_shared<FixedPrompt>(Answer::Abort, err);
}

}  // namespace quendal::cli
