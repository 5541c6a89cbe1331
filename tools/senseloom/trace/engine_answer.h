#pragma once

#include <span>
#include <string>

namespace senseloom::tool {

// What the platform's gesture engine recognised when it took a group of a record's samples.
struct EngineAnswer {
  int group = 0;  // from 0
  std::string name;
};
// Groups of samples that the longest record has room for.
inline constexpr int kMostGroups = 170;

// For people: the names in quotes, or "nothing".
std::string answersText(std::span<const EngineAnswer> answers);

}  // namespace senseloom::tool
