#include "record/recorder_files.h"

#include <dlfcn.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>

#include "input_error.h"
#include "recorder/recorder_names.h"

namespace senseloom::tool {
namespace {

constexpr int kOwnBits = 8 * sizeof(void*);

std::filesystem::path ownFolder() {
  Dl_info library{};
  dladdr(dlsym(RTLD_NEXT, "ctx_open_session"), &library);
  return std::filesystem::canonical(library.dli_fname).parent_path();
}

std::filesystem::path folderFor(int bits) {
  std::filesystem::path folder = ownFolder();
  if (bits != kOwnBits) folder.replace_filename(bits == 32 ? "i386-linux-gnu" : "x86_64-linux-gnu");
  return folder;
}

// The auditing library in a folder of libraries. If the recording library is missing, the linker would only warn and
// start the program without it.
std::string auditIn(const std::filesystem::path& folder) {
  return folder / "senseloom" / SENSELOOM_AUDIT_FILE;
}
bool isInstalled(const std::filesystem::path& folder) {
  const std::string recorder = folder / "senseloom" / SENSELOOM_RECORDER_FILE;
  return access(auditIn(folder).c_str(), R_OK) == 0 && access(recorder.c_str(), R_OK) == 0;
}

}  // namespace

std::string auditLibrary(int bits) {
  const int otherBits = bits == 32 ? 64 : 32;
  const std::filesystem::path folder = folderFor(bits);
  const bool hasOther = isInstalled(folderFor(otherBits));
  if (!isInstalled(folder)) {
    if (!hasOther) throw InputError(auditIn(folder) + ": the recording library is not installed");
    std::fprintf(stderr,
                 "senseloom: the program has %d bits, for which the recording library is not installed: only programs "
                 "of %d bits that it starts are recorded\n",
                 bits, otherBits);
    return auditIn(folderFor(otherBits));
  }
  // The linker replaces $LIB by "lib/x86_64-linux-gnu" or "lib/i386-linux-gnu".
  const std::filesystem::path libraries = folder.parent_path();
  return hasOther && libraries.filename() == "lib" ? auditIn(libraries.parent_path() / "$LIB") : auditIn(folder);
}

}  // namespace senseloom::tool
