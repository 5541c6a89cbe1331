#pragma once

#include <string_view>

namespace senseloom::tool {

// Which some editors put in front of a text in UTF-8.
inline constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

}  // namespace senseloom::tool
