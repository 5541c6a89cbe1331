#pragma once

#include <array>
#include <cstdint>
#include <memory>

#include "option/option.h"
#include "option/option_description.h"

namespace senseloom {

inline constexpr OptionKey kDTWGSKeys[] = {
    {.name = "mode",
     .range = {1, 4},
     .outOfRange = OutOfRange::kept,
     .message = "Invalid mode value %d",
     .merge = Merge::bitOr,
     .note = "required: 1 (enroll) or 4 (match)"},
    {.name = "classMask",
     .range = {1, 3},
     .outOfRange = OutOfRange::kept,
     .message = "Invalid mask value %d at match mode",
     .merge = Merge::bitOr,
     .note = "checked in match mode"},
    {.name = "level",
     .range = {-1, 1},
     .outOfRange = OutOfRange::kept,
     .message = "Invalid level value %d at match mode",
     .merge = Merge::minimum,
     .note = "checked in match mode"},
    {.name = "index",
     .range = {0, 1},
     .outOfRange = OutOfRange::kept,
     .message = "Invalid index value %d at enroll mode",
     .note = "checked in enroll mode; not merged"},
};
inline constexpr const char* kDTWGSStringKeys[] = {"template1", "template2"};
inline constexpr OptionProperty kDTWGSProperties[] = {
    {121, "level"},
    {122, "templateNumber"},
    {123, "templateData"},
};
inline constexpr OptionDescription kDTWGS{
    .sensor = "DTWGS",
    .title = "template gesture",
    .keys = kDTWGSKeys,
    .stringKeys = kDTWGSStringKeys,
    .properties = kDTWGSProperties,
    .logTag = kLogTag,
    .note =
        "a value out of range refuses the whole string; no properties while enrolling; 122 and 123 once a stored "
        "template; one session can enroll, and none can match meanwhile",
};

// Enrolls a gesture, or matches movements against up to two templates. Unlike the other kinds it refuses a whole string
// for one bad value: a client must not believe that it enrolled into, or matches against, a slot that it did not name.
class OptionDTWGS : public Option {
 public:
  static constexpr const OptionDescription& kind = kDTWGS;
  static constexpr int32_t kEnroll = 1;
  static constexpr int32_t kMatch = 4;

  // The gesture templates, in two slots that all options of all sessions share.
  struct DTWGSTemp {
    static constexpr int kCapacity = 900;  // bytes of data in a slot
    struct Slot {
      std::array<uint8_t, kCapacity> templateData;
      int32_t templateLength;  // bytes, as the template's text declares it; 0: none stored
    };
    std::array<Slot, 2> slots;

    // Decodes a template text into slot 1 if `which` is 1, else into slot 2: four lowercase hexadecimal digits of
    // length, then two a byte. Returns false, with the slot unchanged, for null, for fewer than 4 characters, for a
    // declared length outside 0..900 and for more than 900 bytes.
    bool setTemplate(int which, const char* text);
  };
  static DTWGSTemp tempInst;

  int parse(const char* text) override;
  void merge(const Option& other) override;
  std::unique_ptr<Option> clone() const override;
  void setProperty(ctx_option_t** out) override;

  int32_t classMask() const { return settings.classMask; }

 protected:
  struct Settings {
    int32_t mode = 0;  // invalid until a string sets it
    int32_t classMask = 0;
    int32_t level = 0;
    int32_t index = 0;
  };
  Settings settings;

 private:
  // The list for the settings' mode; null, with the reason logged, when sessions want what excludes each other.
  ctx_option_t* makeList();
  ctx_option_t* makeMatchingList();

  // The state of a merge.
  int32_t bit0Count = 0;  // merged options whose mode has bit 0 (enroll)
  int32_t bit1Count = 0;
  bool valid = true;  // false once two sessions want the same exclusive mode

  // What the entries of the last property list point at, the template data apart.
  int32_t levelMirror = 0;
  std::array<int32_t, 2> templateNumberMirrors{};
};

}  // namespace senseloom
