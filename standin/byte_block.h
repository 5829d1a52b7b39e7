// A zero-filled block of bytes with typed access by offset, for records that the
// host lays out for a module (filter record, about record, parameter blocks).
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <stdexcept>
#include <type_traits>

namespace Standin {

class ByteBlock {
 public:
  explicit ByteBlock(size_t size) : size_(size), bytes_(new uint8_t[size]()) {}

  uint8_t* Data() { return bytes_.get(); }
  const uint8_t* Data() const { return bytes_.get(); }
  size_t Size() const { return size_; }

  void Clear() { std::memset(bytes_.get(), 0, size_); }

  template <typename T>
  void Put(size_t offset, T value) {
    static_assert(std::is_trivially_copyable_v<T>);
    Check(offset, sizeof(T));
    std::memcpy(bytes_.get() + offset, &value, sizeof(T));
  }

  template <typename T>
  T Get(size_t offset) const {
    static_assert(std::is_trivially_copyable_v<T>);
    Check(offset, sizeof(T));
    T value;
    std::memcpy(&value, bytes_.get() + offset, sizeof(T));
    return value;
  }

  // Pointers are written as 8-byte values (the record is a 64-bit record).
  void PutPointer(size_t offset, const void* pointer) {
    static_assert(sizeof(void*) == 8, "the host's records are laid out for 64-bit code");
    Put<const void*>(offset, pointer);
  }
  void* GetPointer(size_t offset) const { return Get<void*>(offset); }

 private:
  void Check(size_t offset, size_t width) const {
    if (offset > size_ || width > size_ - offset) throw std::out_of_range("record offset");
  }

  size_t size_;
  std::unique_ptr<uint8_t[]> bytes_;
};

}  // namespace Standin
