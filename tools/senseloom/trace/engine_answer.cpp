#include "trace/engine_answer.h"

namespace senseloom::tool {

std::string answersText(std::span<const EngineAnswer> answers) {
  std::string text;
  for (const EngineAnswer& answer : answers) {
    text.append(text.empty() ? "\"" : ", \"").append(answer.name).append("\"");
  }
  return text.empty() ? "nothing" : text;
}

}  // namespace senseloom::tool
