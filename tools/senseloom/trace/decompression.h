#pragma once

#include <memory>
#include <string_view>

#include "trace/byte_stream.h"

// What was compressed, as it was before; several compressed files, one after the other, are one. Reading throws
// InputError for what is cut short or damaged, once everything before it was given.
namespace senseloom::tool {

// What compressed files begin with.
inline constexpr std::string_view kGzipMark = "\x1f\x8b";
inline constexpr std::string_view kZstdMark = "\x28\xb5\x2f\xfd";

std::unique_ptr<ByteStream> gunzipped(std::unique_ptr<ByteStream> bytes);
std::unique_ptr<ByteStream> unzstded(std::unique_ptr<ByteStream> bytes);

}  // namespace senseloom::tool
