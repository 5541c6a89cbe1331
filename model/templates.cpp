#include "templates.h"

namespace senseloom::model {

bool Templates::store(size_t slot, const std::string& text) {
  const auto digit = [&](size_t i) { return text[i] >= 'a' && text[i] <= 'z' ? text[i] - 87 : text[i] - 48; };
  if (text.size() < 4) return false;
  const int length = digit(0) * 4096 + digit(1) * 256 + digit(2) * 16 + digit(3);
  const size_t bytes = (text.size() - 4) / 2;
  if (length < 0 || length > kMostBytes || bytes > kMostBytes) return false;
  slots[slot].length = static_cast<size_t>(length);
  for (size_t i = 0; i < bytes; ++i) {
    slots[slot].data[i] = static_cast<uint8_t>(digit(4 + 2 * i) * 16 + digit(5 + 2 * i));
  }
  return true;
}

std::string Templates::bytes(size_t slot, size_t length) const {
  return {reinterpret_cast<const char*>(slots[slot].data.data()), length};
}

}  // namespace senseloom::model
