#pragma once

#include <string>

struct summary_memory;

namespace senseloom::trace {

// Tells `senseloom record`, if it started the process, what becomes of the recording.
class Summary {
 public:
  Summary() = default;
  ~Summary();
  Summary(const Summary&) = delete;
  Summary& operator=(const Summary&) = delete;

  // The name of the memory, as an order has it. Without one, nothing is told.
  void connect(const std::string& file);

  void called() const;
  void recorded() const;
  void lost(const char* why) const;
  void breached(const std::string& breach) const;
  void opened(const std::string& file) const;

 private:
  summary_memory* memory = nullptr;
};

}  // namespace senseloom::trace
