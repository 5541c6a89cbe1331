#pragma once

#include <memory>

#include "trace/byte_stream.h"

// What was compressed, as it was before; several compressed files, one after the other, are one. Reading throws
// InputError for what is cut short or damaged, once everything before it was given.
namespace senseloom::tool {

std::unique_ptr<ByteStream> gunzipped(std::unique_ptr<ByteStream> bytes);
std::unique_ptr<ByteStream> unzstded(std::unique_ptr<ByteStream> bytes);

}  // namespace senseloom::tool
