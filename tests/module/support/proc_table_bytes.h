// A host procedure table as bytes: 16-bit version, 16-bit count, then 8-byte
// pointers from offset 4. Tests set, remove and shorten its procedures.
#pragma once

#include <cstdint>
#include <cstring>
#include <vector>

namespace FringeTest {

class ProcTableBytes {
 public:
  explicit ProcTableBytes(int procedures) : bytes_(4 + 8 * static_cast<size_t>(procedures), 0) {
    SetCount(static_cast<int16_t>(procedures));
  }

  template <typename Proc>
  void Set(int position, Proc proc) {
    static_assert(sizeof(Proc) == 8);
    std::memcpy(bytes_.data() + 4 + 8 * static_cast<size_t>(position - 1), &proc, 8);
  }
  void Remove(int position) { Set(position, static_cast<void (*)()>(nullptr)); }
  void SetCount(int16_t count) { std::memcpy(bytes_.data() + 2, &count, 2); }

  template <typename Table>
  const Table* As() const {
    return reinterpret_cast<const Table*>(bytes_.data());
  }

 private:
  std::vector<unsigned char> bytes_;
};

// A suite: plain 8-byte procedure pointers from offset 0.
class SuiteBytes {
 public:
  explicit SuiteBytes(int procedures) : bytes_(8 * static_cast<size_t>(procedures), 0) {}
  template <typename Proc>
  void Set(int position, Proc proc) {
    static_assert(sizeof(Proc) == 8);
    std::memcpy(bytes_.data() + 8 * static_cast<size_t>(position - 1), &proc, 8);
  }
  const void* Data() const { return bytes_.data(); }

 private:
  std::vector<unsigned char> bytes_;
};

}  // namespace FringeTest
