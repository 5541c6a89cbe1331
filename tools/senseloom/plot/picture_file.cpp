#include "plot/picture_file.h"

#include "terminal/new_file.h"

namespace senseloom::tool {
namespace {

NewFile pictureFile(const std::string& name) {
  return {name, 0666, NewFile::Rest::removed};
}

}  // namespace

void requireWritable(const std::string& file) {
  const NewFile nothing = pictureFile(file);
}

void writePicture(const std::string& file, const std::string& picture) {
  NewFile written = pictureFile(file);
  written.write(picture);
  written.commit();
}

}  // namespace senseloom::tool
