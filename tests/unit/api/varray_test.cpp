#include <gtest/gtest.h>
#include <malloc.h>

#include <cstdlib>
#include <cstring>
#include <limits>
#include <string>

#include "library_memory.h"
#include "senseloom.h"

namespace {

// Elements of three letters, in an array that frees itself.
class Array : public testing::Test {
 protected:
  void SetUp() override { ASSERT_NE(_va_init(&array, 3), nullptr); }
  void TearDown() override { va_free(&array); }

  void append(const std::string& element) {
    void* slot = va_new(&array);
    ASSERT_NE(slot, nullptr);
    std::memcpy(slot, element.data(), 3);
  }
  // Appends "000", "001", ... up to `count` elements.
  void fill(int count) {
    for (int i = array.count; i < count; ++i) append(numbered(i));
  }
  static std::string numbered(int i) { return (i < 10 ? "00" : i < 100 ? "0" : "") + std::to_string(i); }

  std::string slots(int first, int count) const {
    return {static_cast<const char*>(array.data) + first * 3, static_cast<size_t>(count) * 3};
  }
  std::string elements() const { return slots(0, array.count); }

  varray_t array{};
};

// A record whose storage must not be used.
varray_t handMade(int32_t count, int32_t capacity, void* data) {
  return {.count = count, .capacity = capacity, .elemSize = 1, .data = data};
}

void expectRecord(const varray_t& array, int32_t count, int32_t capacity, int32_t elemSize, const void* data) {
  EXPECT_EQ(array.count, count);
  EXPECT_EQ(array.capacity, capacity);
  EXPECT_EQ(array.elemSize, elemSize);
  EXPECT_EQ(array.data, data);
}

TEST_F(Array, IsMadeEmptyWithSixteenZeroFilledSlots) {
  varray_t made = handMade(5, 6, nullptr);
  void* data = _va_init(&made, 3);
  ASSERT_NE(data, nullptr);
  expectRecord(made, 0, 16, 3, data);
  EXPECT_EQ(std::string(static_cast<char*>(data), 48), std::string(48, '\0'));
  va_free(&made);
}

TEST_F(Array, IsNotMadeOfElementsWithoutASize) {
  for (const int size : {0, -1, std::numeric_limits<int>::min()}) {
    varray_t untouched = handMade(5, 6, &untouched);
    EXPECT_EQ(_va_init(&untouched, size), nullptr) << size;
    expectRecord(untouched, 5, 6, 1, &untouched);
  }
  EXPECT_EQ(_va_init(nullptr, 3), nullptr);
}

TEST_F(Array, IsSetButHasNoStorageWhenMemoryRunsOut) {
  varray_t made = handMade(5, 6, nullptr);
  {
    const memory::FailingAllocation first(1);
    EXPECT_EQ(_va_init(&made, 3), nullptr);
    EXPECT_TRUE(first.happened());
  }
  expectRecord(made, 0, 16, 3, nullptr);
  EXPECT_EQ(va_new(&made), nullptr);
  va_free(&made);
}

TEST_F(Array, MadeOnceMoreForgetsItsStorage) {
  fill(17);
  void* const old = array.data;
  ASSERT_NE(_va_init(&array, 5), nullptr);
  EXPECT_NE(array.data, old);
  expectRecord(array, 0, 16, 5, array.data);
  std::free(old);  // was not freed
}

TEST_F(Array, AppendsAtTheEnd) {
  for (int i = 0; i < 16; ++i) {
    EXPECT_EQ(va_new(&array), static_cast<char*>(array.data) + i * 3);
    EXPECT_EQ(array.count, i + 1);
  }
  EXPECT_EQ(array.capacity, 16);
}

TEST_F(Array, DoublesWhenFullAndKeepsItsElements) {
  std::string expected;
  for (int i = 0; i < 70; ++i) {
    append(numbered(i));
    expected += numbered(i);
    EXPECT_EQ(array.capacity, i < 16 ? 16 : i < 32 ? 32 : i < 64 ? 64 : 128) << i;
  }
  EXPECT_EQ(elements(), expected);
}

TEST_F(Array, TakesNoMoreMemoryThanItsSlotsNeed) {
  EXPECT_LT(malloc_usable_size(array.data), 3U * 24);  // 16 slots, rounded up
  fill(17);
  EXPECT_LT(malloc_usable_size(array.data), 3U * 48);  // 32 slots
}

TEST_F(Array, SlotAfterGrowthIsZeroFilled) {
  fill(16);
  va_new(&array);
  EXPECT_EQ(slots(16, 16), std::string(48, '\0'));
}

TEST_F(Array, SlotOfADeletedElementKeepsItsBytes) {
  fill(3);
  char out[3];
  _va_del(&array, 0, out);
  EXPECT_EQ(slots(0, 3), "001002002");
  EXPECT_EQ(va_new(&array), static_cast<char*>(array.data) + 6);
  EXPECT_EQ(elements(), "001002002");
}

TEST_F(Array, FailedGrowthChangesNothing) {
  fill(16);
  void* const data = array.data;
  const std::string before = elements();
  {
    const memory::FailingAllocation first(1);
    EXPECT_EQ(va_new(&array), nullptr);
    EXPECT_TRUE(first.happened());
  }
  expectRecord(array, 16, 16, 3, data);
  EXPECT_EQ(elements(), before);
  EXPECT_NE(va_new(&array), nullptr);
}

TEST_F(Array, DeletesByIndexAndClosesTheGap) {
  struct {
    int index;
    const char* deleted;
    const char* left;
  } const steps[] = {
      {1, "001", "000002003004"}, {0, "000", "002003004"}, {2, "004", "002003"}, {1, "003", "002"}, {0, "002", ""},
  };
  fill(5);
  for (const auto& [index, deleted, left] : steps) {
    char out[4] = "___";
    EXPECT_EQ(_va_del(&array, index, out), out);
    EXPECT_STREQ(out, deleted);
    EXPECT_EQ(elements(), left);
  }
  char out[3];
  EXPECT_EQ(_va_del(&array, 0, out), nullptr);
}

TEST_F(Array, NeverShrinks) {
  fill(17);
  void* const data = array.data;
  char out[3];
  while (array.count > 0) _va_del(&array, 0, out);
  EXPECT_EQ(std::string(out, 3), "016");
  expectRecord(array, 0, 32, 3, data);
}

TEST_F(Array, RefusesToDeleteWhatIsNotThere) {
  fill(2);
  char out[4] = "___";
  for (const int index : {-1, 2, 3, std::numeric_limits<int>::min(), std::numeric_limits<int>::max()}) {
    EXPECT_EQ(_va_del(&array, index, out), nullptr) << index;
  }
  EXPECT_EQ(_va_del(nullptr, 0, out), nullptr);
  EXPECT_STREQ(out, "___");
  EXPECT_EQ(elements(), "000001");
}

TEST_F(Array, DeletesNothingWithoutADestination) {
  fill(2);
  EXPECT_EQ(_va_del(&array, 0, nullptr), nullptr);
  EXPECT_EQ(elements(), "000001");
}

TEST_F(Array, FreeingZeroesTheRecordAndIsHarmlessAgain) {
  fill(17);
  for (int i = 0; i < 2; ++i) {
    va_free(&array);
    expectRecord(array, 0, 0, 0, nullptr);
  }
  va_free(nullptr);
}

TEST_F(Array, GrowsFromASingleSlotThatTheCallerMade) {
  varray_t small = handMade(0, 1, std::malloc(1));
  EXPECT_EQ(va_new(&small), small.data);
  expectRecord(small, 1, 1, 1, small.data);
  const void* second = va_new(&small);
  EXPECT_EQ(second, static_cast<char*>(small.data) + 1);
  expectRecord(small, 2, 2, 1, small.data);
  va_free(&small);
}

TEST_F(Array, AppendsNothingWithoutStorage) {
  EXPECT_EQ(va_new(nullptr), nullptr);
  char memory[16];
  varray_t zeroed{};
  varray_t noCapacity = handMade(0, 0, memory);
  varray_t negative = handMade(-1, -1, memory);
  varray_t noData = handMade(0, 16, nullptr);
  for (varray_t* refused : {&zeroed, &noCapacity, &negative, &noData}) {
    const varray_t before = *refused;
    EXPECT_EQ(va_new(refused), nullptr);
    expectRecord(*refused, before.count, before.capacity, before.elemSize, before.data);
  }
}

TEST_F(Array, AppendsNothingAfterItWasFreed) {
  va_free(&array);
  EXPECT_EQ(va_new(&array), nullptr);
  expectRecord(array, 0, 0, 0, nullptr);
}

TEST_F(Array, DoesNotGrowBeyondTwoToTheThirtiethSlots) {
  char memory[1];
  varray_t full = handMade(1 << 30, 1 << 30, memory);
  const memory::AllocationCount allocations;
  EXPECT_EQ(va_new(&full), nullptr);
  EXPECT_EQ(allocations.made(), 0U);
  expectRecord(full, 1 << 30, 1 << 30, 1, memory);
}

}  // namespace
