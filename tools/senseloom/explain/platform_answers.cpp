#include "explain/platform_answers.h"

#include <cstdlib>
#include <cstring>
#include <optional>
#include <string>
#include <string_view>

namespace senseloom::tool {
namespace {

constexpr int kSomeError = -1;

// What comes after `lead` in a text that begins with it.
std::optional<std::string> after(std::string_view lead, const std::string& text) {
  if (text.compare(0, lead.size(), lead) != 0) return std::nullopt;
  return text.substr(lead.size());
}

}  // namespace

model::Answers answersToldBy(const model::Log& log) {
  model::Answers answers;
  bool wasOpened = false;
  bool hasVersion = false;
  for (const model::LogLine& line : log) {
    if (const auto error = after("bool audio_hal_init() load audio hw module aware.primary ", line.text)) {
      answers.get = *error == '(' + std::string(std::strerror(0)) + ')' ? 0 : kSomeError;
    } else if (const auto result = after("device open result ", line.text)) {
      answers.open = std::atoi(result->c_str());
      wasOpened = answers.open == 0;
    } else if (const auto version = after("device version ", line.text)) {
      answers.version = static_cast<uint32_t>(std::atoi(version->c_str()));
      hasVersion = true;
    } else if (after("activated aware failed", line.text)) {
      answers.activate = kSomeError;
    } else if (after("deactivated aware session failed", line.text)) {
      answers.deactivate = kSomeError;
    } else if (after("hmm gesture algorithm start return false", line.text)) {
      answers.starts = false;
    } else if (auto name = after("-- gesture: ", line.text)) {
      answers.names.push_back(std::move(name));
    }
  }
  answers.gives = !wasOpened || hasVersion;
  return answers;
}

}  // namespace senseloom::tool
