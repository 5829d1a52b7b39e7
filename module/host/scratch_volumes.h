// The host's scratch volumes ('nusv' and 'svlp' properties), where the
// framework's virtual heap may keep its backing storage.
#pragma once

#include <string>
#include <vector>

namespace Vireo {

class CRastrixPlugin;

// More volumes than any machine offers: a larger count is taken as this many.
inline constexpr int kMaxScratchVolumes = 64;

// Reads the volume count and each volume's path (the platform's wide
// characters, without terminator).
// A negative count reads as none; a volume whose handle cannot be read, is
// empty or cannot be locked is left out. Every handle is given back.
std::vector<std::wstring> ReadScratchVolumes(CRastrixPlugin& plugin);

}  // namespace Vireo
