#pragma once

#include <map>
#include <string>
#include <vector>

#include "call.h"
#include "trace/json.h"

namespace oracle {

// Reads calls as toJson() writes them, and as people write them: sessions have any name, options are objects, records
// are told by field.
class CallReader {
 public:
  // Throws InputError when the object is not a call.
  Call read(json_t* object);

  // The sessions read so far; a call names one by its place here.
  const std::vector<std::string>& sessions() const { return names; }

 private:
  void readSession(Call& call, json_t* object);
  int sessionNamed(const std::string& name);

  std::vector<std::string> names;
  std::map<int, int> sensors;  // that the sessions were last opened on, which tells the fields of a record
};

// The place of a sensor's name; -1 when it is not a sensor's.
int sensorNamed(const std::string& name);

}  // namespace oracle
