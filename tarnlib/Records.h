// Allocation of the records handed out by the library. Records are zeroed C
// memory, so that a record released half built frees only what it holds.
#pragma once

#include <cstdint>
#include <cstdlib>
#include <memory>
#include <new>
#include <string>

namespace TarnSim {

// count zeroed objects of type T, or null for a count of 0.
template <typename T>
T* Allocate(size_t count = 1) {
  if (count == 0) return nullptr;
  void* memory = std::calloc(count, sizeof(T));
  if (memory == nullptr) throw std::bad_alloc();
  return static_cast<T*>(memory);
}

// A NUL-terminated copy of text.
char* CopyText(const std::string& text);

// A count as the records carry it.
int32_t Count32(size_t count);

// A record owned until it is handed to the caller, released with the
// library's free function of its type.
template <typename T>
using Owned = std::unique_ptr<T, void (*)(T*)>;

}  // namespace TarnSim
