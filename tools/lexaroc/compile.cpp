// SPDX-License-Identifier: Apache-2.0
#include "compile.hpp"

#include "pack_pool.hpp"

namespace lx::compiler {

namespace {

constexpr uint32_t kVersion1Format = uint32_t{kCodePageLayoutV1} << 28;

class Compiler {
 public:
  Compiler(const SourceTree& tree, Layout layout, Report& report) : tree_(tree), layout_(layout), report_(report) {}

  std::vector<CompiledFile> files() {
    for (const Language& object : tree_.languages) {
      add(ObjectType::language, object, kCurrentFormat, [&] { return Sections{pack_language(object)}; });
    }
    for (const Territory& object : tree_.territories) {
      add(ObjectType::territory, object, kCurrentFormat, [&] { return Sections{pack_territory(object)}; });
    }
    uint32_t format = layout_ == Layout::current ? kCurrentFormat : kVersion1Format;
    for (const CodePage& object : tree_.code_pages) {
      add(ObjectType::code_page, object, format, [&] { return pack_code_page(object, *tree_.unicode, layout_); });
    }
    for (const Sort& object : tree_.sorts) {
      add(ObjectType::sort, object, kCurrentFormat, [&] { return Sections{pack_sort(object.weights)}; });
    }
    files_.push_back({kAliasFile, tree_.alias_text});
    files_.push_back({kControlFile, make_object_file({pack_directory(tree_.entries())}, kCurrentFormat)});
    return std::move(files_);
  }

 private:
  template <class T, class Pack>
  void add(ObjectType type, const T& object, uint32_t format, Pack pack) {
    try {
      files_.push_back({object_stem(type, object.id) + ".nls", make_object_file(pack(), format)});
    } catch (const PackError& error) {
      report_.error(object.file, Spot{}, error.text);
    }
  }

  const SourceTree& tree_;
  Layout layout_;
  Report& report_;
  std::vector<CompiledFile> files_;
};

}  // namespace

std::vector<CompiledFile> compile(const SourceTree& tree, Layout layout, Report& report) {
  return Compiler(tree, layout, report).files();
}

}  // namespace lx::compiler
