// Reads the resource directory of a 64-bit Windows module file.
#include "pe_resources.h"

#include <fstream>
#include <iterator>
#include <stdexcept>

namespace ResourceTest {
namespace {

constexpr std::uint16_t kOptionalHeaderMagicPe32Plus = 0x20B;
constexpr std::size_t kResourceDirectoryIndex = 2;
constexpr std::uint32_t kHighBit = 0x80000000U;
// A resource tree is type / name / language; deeper nesting means corruption.
constexpr int kLevels = 3;

struct Section {
  std::uint32_t virtualAddress = 0;
  std::uint32_t virtualSize = 0;
  std::uint32_t rawSize = 0;
  std::uint32_t rawOffset = 0;
};

class ResourceWalker {
 public:
  ResourceWalker(const Bytes& file, std::vector<Section> sections, std::uint32_t rootOffset,
                 std::uint32_t rootSize)
      : file_(file), sections_(std::move(sections)), root_(rootOffset), rootSize_(rootSize) {}

  std::vector<Resource> Walk() {
    std::vector<Resource> resources;
    Resource path;
    Directory(0, 0, path, resources);
    return resources;
  }

 private:
  void Directory(std::uint32_t offset, int level, Resource& path, std::vector<Resource>& out) {
    if (level >= kLevels) throw std::runtime_error("resource directory nested too deeply");
    ByteReader header(file_, Inside(offset, 16), root_ + rootSize_);
    header.Skip(12);
    const std::size_t named = header.U16();
    const std::size_t numbered = header.U16();
    const std::size_t entries = named + numbered;
    ByteReader reader(file_, Inside(offset + 16, entries * 8), root_ + rootSize_);
    for (std::size_t i = 0; i < entries; ++i) {
      const std::uint32_t nameField = reader.U32();
      const std::uint32_t target = reader.U32();
      const ResourceKey key = Key(nameField);
      if (level == 0) path.type = key;
      if (level == 1) path.name = key;
      if (level == 2) {
        if (key.isName) throw std::runtime_error("resource language given as a name");
        path.language = key.id;
      }
      if ((target & kHighBit) != 0) {
        Directory(target & ~kHighBit, level + 1, path, out);
      } else {
        if (level != 2) throw std::runtime_error("resource data above the language level");
        ByteReader entry(file_, Inside(target, 16), root_ + rootSize_);
        const std::uint32_t rva = entry.U32();
        const std::uint32_t size = entry.U32();
        Resource resource = path;
        ByteReader data(file_, FileOffset(rva, size), SIZE_MAX);
        resource.data = data.Take(size);
        out.push_back(std::move(resource));
      }
    }
  }

  ResourceKey Key(std::uint32_t field) const {
    ResourceKey key;
    if ((field & kHighBit) == 0) {
      if (field > 0xFFFF) throw std::runtime_error("resource identifier over 16 bits");
      key.id = static_cast<std::uint16_t>(field);
      return key;
    }
    key.isName = true;
    const std::uint32_t offset = field & ~kHighBit;
    ByteReader length(file_, Inside(offset, 2), root_ + rootSize_);
    const std::size_t units = length.U16();
    ByteReader text(file_, Inside(offset + 2, units * 2), root_ + rootSize_);
    for (std::size_t i = 0; i < units; ++i) {
      const std::uint16_t unit = text.U16();
      if (unit >= 0x80) throw std::runtime_error("resource name outside ASCII");
      key.name.push_back(static_cast<char>(unit));
    }
    return key;
  }

  // File offset of `size` bytes at `offset` inside the resource directory.
  std::size_t Inside(std::uint64_t offset, std::uint64_t size) const {
    if (offset + size > rootSize_)
      throw std::runtime_error("resource directory entry out of range");
    return root_ + static_cast<std::size_t>(offset);
  }

  std::size_t FileOffset(std::uint32_t rva, std::uint32_t size) const {
    for (const Section& s : sections_) {
      const std::uint64_t start = s.virtualAddress;
      if (rva >= start && std::uint64_t{rva} + size <= start + s.rawSize) {
        return s.rawOffset + (rva - s.virtualAddress);
      }
    }
    throw std::runtime_error("resource data outside every section");
  }

  const Bytes& file_;
  std::vector<Section> sections_;
  std::size_t root_;
  std::uint32_t rootSize_;
};

}  // namespace

std::string ResourceKey::ToString() const {
  if (isName) return name;
  std::string text = "#";
  text += std::to_string(id);
  return text;
}

std::vector<Resource> ReadPeResources(const Bytes& file) {
  ByteReader dos(file);
  if (dos.U16() != 0x5A4D) throw std::runtime_error("not a Windows module: no MZ header");
  ByteReader lfanew(file, 0x3C);
  const std::uint32_t peOffset = lfanew.U32();
  ByteReader pe(file, peOffset);
  if (pe.U32() != 0x00004550) throw std::runtime_error("no PE signature");
  pe.Skip(2);  // machine
  const std::uint16_t sectionCount = pe.U16();
  pe.Skip(12);
  const std::uint16_t optionalSize = pe.U16();
  pe.Skip(2);
  const std::size_t optionalStart = pe.Position();
  if (pe.U16() != kOptionalHeaderMagicPe32Plus) throw std::runtime_error("not a 64-bit module");
  ByteReader directories(file, optionalStart + 108, optionalStart + optionalSize);
  const std::uint32_t directoryCount = directories.U32();
  if (directoryCount <= kResourceDirectoryIndex) return {};
  directories.Skip(kResourceDirectoryIndex * 8);
  const std::uint32_t resourceRva = directories.U32();
  const std::uint32_t resourceSize = directories.U32();
  if (resourceRva == 0) return {};

  ByteReader table(file, optionalStart + optionalSize);
  std::vector<Section> sections;
  for (std::uint16_t i = 0; i < sectionCount; ++i) {
    table.Skip(8);  // name
    Section s;
    s.virtualSize = table.U32();
    s.virtualAddress = table.U32();
    s.rawSize = table.U32();
    s.rawOffset = table.U32();
    table.Skip(16);
    sections.push_back(s);
  }
  for (const Section& s : sections) {
    if (resourceRva >= s.virtualAddress &&
        std::uint64_t{resourceRva} + resourceSize <= std::uint64_t{s.virtualAddress} + s.rawSize) {
      const std::uint32_t root = s.rawOffset + (resourceRva - s.virtualAddress);
      if (std::uint64_t{root} + resourceSize > file.size()) {
        throw std::runtime_error("resource directory passes the end of the file");
      }
      return ResourceWalker(file, sections, root, resourceSize).Walk();
    }
  }
  throw std::runtime_error("resource directory outside every section");
}

Bytes ReadFileBytes(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) throw std::runtime_error("cannot open " + path);
  return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
}

}  // namespace ResourceTest
