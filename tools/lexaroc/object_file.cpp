// SPDX-License-Identifier: Apache-2.0
#include "object_file.hpp"

#include "pack_pool.hpp"

namespace lx::compiler {

std::string make_object_file(const Sections& sections, uint32_t format) {
  constexpr size_t kAlignment = 4;
  FileHeader header{};
  header.magic = kFileMagic;
  header.format = format;
  std::string body;
  for (unsigned i = 0; i < kMaxSections; ++i) {
    const std::string& section = sections[i];
    if (section.size() > kLargestSection) {
      throw PackError(tool::message("section {0} would have {1} bytes", i + 1, section.size()));
    }
    if (section.empty()) continue;
    header.section_count = static_cast<uint16_t>(i + 1);
    body.resize((body.size() + kAlignment - 1) / kAlignment * kAlignment);
    auto size = static_cast<uint16_t>(section.size());
    auto offset = static_cast<uint32_t>(sizeof header + body.size());
    if (i == 0) {
      header.section1_size = size;
      header.section1_offset = offset;
    } else {
      header.more[i - 1].size = size;
      header.more[i - 1].offset = offset;
    }
    body += section;
  }
  return std::string(bytes_of(header)) + body;
}

ObjectFile split_object_file(std::string_view bytes) {
  if (bytes.size() < sizeof(FileHeader)) throw StructureError("the file is shorter than its header");
  auto header = record_at<FileHeader>(bytes, 0);
  if (header.magic != kFileMagic) throw StructureError("this is no compiled locale data");
  if (header.section_count < 1 || header.section_count > kMaxSections) {
    throw StructureError("the section count is not 1 to 4");
  }
  ObjectFile file;
  file.layout_version = header.layout_version();
  for (unsigned i = 0; i < header.section_count; ++i) {
    uint32_t offset = header.offset_of(i);
    uint32_t size = header.size_of(i);
    if (size == 0) continue;
    if (offset > bytes.size() || size > bytes.size() - offset) {
      throw StructureError(tool::message("section {0} reaches beyond the file", i + 1));
    }
    file.sections[i] = bytes.substr(offset, size);
  }
  return file;
}

}  // namespace lx::compiler
