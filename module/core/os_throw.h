// Turning operating-system failures into CSystemError. The routines that take
// a file and line write a trace line before they throw; the others do not.
#pragma once

#include <cstdint>

namespace Vireo {

void OSThrow(uint32_t number, const char* file, int line);
void OSThrowFalse(bool condition, uint32_t number, const char* file, int line);
void OSThrowZero(int64_t value, uint32_t number, const char* file, int line);
void OSThrowNull(const void* pointer, const char* file, int line);
void OSThrowLast(const char* file, int line);
void OSThrowLastFalse(bool condition, const char* file, int line);
void OSThrowLastZero(int64_t value, const char* file, int line);
void OSThrowLastNull(const void* pointer, const char* file, int line);

void OSThrow(uint32_t number);
void OSThrowFalse(bool condition, uint32_t number);
void OSThrowZero(int64_t value, uint32_t number);
// For allocations: a null pointer throws the out-of-memory number.
void OSThrowNull(const void* pointer);
void OSThrowLast();
void OSThrowLastFalse(bool condition);
void OSThrowLastZero(int64_t value);
void OSThrowLastNull(const void* pointer);

}  // namespace Vireo
