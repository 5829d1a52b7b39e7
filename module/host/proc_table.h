// The one rule for calling into a host procedure table: a table starts with a
// 16-bit version and a 16-bit count, then 8-byte procedure pointers packed on
// 4-byte boundaries. A procedure is reachable only when the table exists, the
// count reaches its position (counting from 1) and its pointer is set.
#pragma once

#include <cstdint>
#include <cstring>

namespace Vireo {

inline constexpr size_t kProcTableHeaderBytes = 4;
inline constexpr size_t kProcPointerBytes = 8;

// The table's procedure count; 0 for a missing table.
inline int16_t TableCount(const void* table) {
  if (table == nullptr) return 0;
  int16_t count = 0;
  std::memcpy(&count, static_cast<const unsigned char*>(table) + 2, sizeof count);
  return count;
}

// The procedure at a position, or null when the rule says it is not there.
// The bytes are copied out because the host packs pointers on 4-byte bounds.
template <typename Proc>
Proc TableProc(const void* table, int position) {
  static_assert(sizeof(Proc) == kProcPointerBytes, "host procedures are 8-byte pointers");
  if (table == nullptr || position < 1 || TableCount(table) < position) return nullptr;
  Proc proc = nullptr;
  std::memcpy(&proc,
              static_cast<const unsigned char*>(table) + kProcTableHeaderBytes +
                  static_cast<size_t>(position - 1) * kProcPointerBytes,
              sizeof proc);
  return proc;
}

// True when every procedure at positions 1 to last is reachable.
inline bool TableComplete(const void* table, int last) {
  for (int position = 1; position <= last; ++position) {
    if (TableProc<void (*)()>(table, position) == nullptr) return false;
  }
  return true;
}

// A procedure of a suite handed out by the basic suite: plain 8-byte pointers
// without a header, numbered from 1.
template <typename Proc>
Proc SuiteProc(const void* suite, int position) {
  static_assert(sizeof(Proc) == kProcPointerBytes, "host procedures are 8-byte pointers");
  if (suite == nullptr || position < 1) return nullptr;
  Proc proc = nullptr;
  std::memcpy(&proc,
              static_cast<const unsigned char*>(suite) +
                  static_cast<size_t>(position - 1) * kProcPointerBytes,
              sizeof proc);
  return proc;
}

}  // namespace Vireo
