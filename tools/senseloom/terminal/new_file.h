#pragma once

#include <sys/types.h>

#include <cstdio>
#include <memory>
#include <string>
#include <string_view>

namespace senseloom::tool {

// A file that gets its name when it is complete. Until then it has ".part" behind the name, and what had the name
// before stays; only what is not a file, as a device, is written at once. All functions throw std::runtime_error, with
// the name, when it cannot be written.
class NewFile {
 public:
  // What becomes of a file that was begun but not committed.
  enum class Rest { removed, kept };

  // `mode` has the permissions, before the user's mask. A file with ".part" that another program writes, or that holds
  // what one has left, is not touched.
  NewFile(const std::string& fileName, mode_t mode, Rest uncommitted);
  ~NewFile();
  NewFile(const NewFile&) = delete;
  NewFile& operator=(const NewFile&) = delete;

  void write(std::string_view bytes);
  void flush();
  void commit();

 private:
  struct Close {
    void operator()(std::FILE* toClose) const { std::fclose(toClose); }
  };

  const std::string name;
  const std::string partName;
  const Rest rest;
  std::unique_ptr<std::FILE, Close> file;
};

}  // namespace senseloom::tool
