#pragma once

#include <cstdint>
#include <map>
#include <vector>

namespace senseloom::tool {

// Numbers different values from 0 on, in the order in which they come.
template <class Value>
class Numbering {
 public:
  uint32_t numberOf(const Value& value) {
    const auto [known, isNew] = numbers.try_emplace(value, static_cast<uint32_t>(ordered.size()));
    if (isNew) ordered.push_back(&known->first);
    return known->second;
  }
  const Value& operator[](uint32_t number) const { return *ordered[number]; }
  // In the order of their numbers.
  const std::vector<const Value*>& values() const { return ordered; }

 private:
  std::map<Value, uint32_t> numbers;  // whose keys stay where they are
  std::vector<const Value*> ordered;
};

}  // namespace senseloom::tool
