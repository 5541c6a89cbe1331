#pragma once

#include <array>
#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "explain/wishes.h"

namespace senseloom::tool {

// Something about an option string that its client may not expect, and the line that the library logs about it.
struct Remark {
  std::string text;
  std::string logged = {};  // empty: nothing
};

// The bytes that the two slots of gesture templates hold. All sessions share them.
using TemplateLengths = std::array<size_t, 2>;

// What becomes of an option string, told from the description of its sensor's options, beside the library.
struct OptionReading {
  bool accepted = false;                    // the library goes on to negotiate
  std::optional<Wishes> wishes = {};        // the session's new ones; nothing: it keeps those that it has
  std::optional<std::string> notJson = {};  // why it is no JSON
  std::vector<Remark> remarks = {};
};

// Reads a string; nothing stands for a null pointer. Templates that it holds are noted in `templates`.
OptionReading readOption(const OptionDescription& kind, const std::optional<std::string>& text,
                         TemplateLengths& templates);

}  // namespace senseloom::tool
