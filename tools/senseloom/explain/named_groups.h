#pragma once

#include <algorithm>
#include <cstddef>
#include <string>
#include <vector>

namespace senseloom::tool {

// The elements in groups of such that are alike, in the order of the first of each.
template <class Element, class IsAlike>
std::vector<std::vector<const Element*>> groupsOf(const std::vector<Element>& elements, IsAlike isAlike) {
  std::vector<std::vector<const Element*>> groups;
  for (const Element& element : elements) {
    const auto known =
        std::find_if(groups.begin(), groups.end(), [&](const auto& group) { return isAlike(*group.front(), element); });
    if (known != groups.end()) {
      known->push_back(&element);
    } else {
      groups.push_back({&element});
    }
  }
  return groups;
}

// The names of the first of a group, and how many more there are.
template <class Element, class NameOf>
std::string namesText(const std::vector<const Element*>& group, NameOf nameOf) {
  constexpr size_t kMostNamed = 4;
  std::string text;
  for (size_t i = 0; i < std::min(group.size(), kMostNamed); ++i) text += (i == 0 ? "" : ", ") + nameOf(*group[i]);
  if (group.size() > kMostNamed) text += " and " + std::to_string(group.size() - kMostNamed) + " more";
  return text;
}

}  // namespace senseloom::tool
