// SPDX-License-Identifier: Apache-2.0
#include "sort_source.hpp"

#include <memory>

#include "collation_host.hpp"
#include "collation_rules.hpp"
#include "field_file.hpp"
#include "sort_weights.hpp"

namespace lx::compiler {

namespace {

class SortReader {
 public:
  SortReader(const SourceFile& source, const SortContext& context, Report& report)
      : source_(source), context_(context), report_(report) {}

  std::optional<Sort> read() {
    size_t errors = report_.count();
    sort_.file = source_.name();
    source_.for_each_line(report_, [this](Cursor& cursor) { line(cursor); });
    if (report_.count() == errors) finish();
    if (report_.count() != errors) return std::nullopt;
    return std::move(sort_);
  }

 private:
  void line(Cursor& cursor) {
    if (weights_) {
      weights_->line(cursor);
      return;
    }
    Cursor start = cursor;
    std::string key = cursor.word("a keyword");
    if (key == "&" || key == "follow" || key == "option") {
      tailor(start, key, cursor);
    } else if (key == "block") {
      block(start, cursor);
    } else {
      if (!seen_.insert(key).second) start.fail(tool::message("\"{0}\" is given twice", key));
      header(start, key, cursor);
    }
  }

  void header(Cursor& start, const std::string& key, Cursor& cursor) {
    if (key == "id") {
      cursor.expect(U' ');
      sort_.id = static_cast<uint16_t>(cursor.decimal(65535));
      cursor.end();
    } else if (key == "name") {
      cursor.expect(U' ');
      sort_.spot = cursor.spot();
      sort_.name = object_name(cursor);
    } else if (key == "base" || key == "order-of" || key == "weights") {
      if (has_form_) start.fail("a sort is made by one of base, order-of and weights");
      has_form_ = true;
      form_failed_ = true;
      form(start, key, cursor);
      form_failed_ = false;
    } else {
      start.fail(tool::message("unknown keyword \"{0}\"", key));
    }
  }

  void form(const Cursor& start, const std::string& key, Cursor& cursor) {
    if (key == "weights") {
      cursor.end();
      weights_ = std::make_unique<SortWeightsReader>();
    } else if (key == "base") {
      if (!cursor.accept(" root")) cursor.fail("expected \" root\"");
      cursor.end();
      const Collation* root = context_.root();
      if (root == nullptr) start.fail("the collation root is missing or has errors");
      tailoring_ = std::make_unique<Tailoring>(*root);
    } else {
      if (!cursor.accept(" codepage ")) cursor.fail("expected \" codepage \" and a number");
      host_spot_ = cursor.spot();
      auto id = static_cast<uint16_t>(cursor.decimal(65535));
      cursor.end();
      host_ = context_.code_page(id);
      if (host_ == nullptr) throw SourceError(host_spot_, "the code page is missing or has errors");
    }
  }

  void tailor(const Cursor& start, const std::string& key, Cursor& cursor) {
    if (form_failed_) return;
    if (!tailoring_) start.fail("rules want \"base root\" before them");
    cursor.expect(U' ');
    if (key == "&") {
      tailoring_->rule(cursor);
    } else if (key == "follow") {
      tailoring_->follow(cursor);
    } else {
      tailoring_->option(cursor);
    }
  }

  // "block 4541 4E-9F F9-FA"
  void block(const Cursor& start, Cursor& cursor) {
    if (form_failed_) return;
    if (host_ == nullptr) start.fail("\"block\" wants \"order-of\" before it");
    HostBlock block;
    cursor.expect(U' ');
    block.spot = cursor.spot();
    unsigned length = 0;
    block.place = cursor.hex_bytes(length);
    if (!blocks_.empty() && block.place <= blocks_.back().place)
      throw SourceError(block.spot, "blocks must be in order");
    block.pages = read_pages(cursor);
    blocks_.push_back(block);
  }

  void finish() {
    auto need = [this](bool condition, const char* message) {
      if (!condition) report_.error(source_.name(), source_.end(), message);
    };
    need(seen_.count("id") != 0, "\"id\" is missing");
    need(seen_.count("name") != 0, "\"name\" is missing");
    need(has_form_, "one of base, order-of and weights is missing");
    if (!has_form_) return;
    try {
      if (weights_) {
        sort_.weights = weights_->take(source_.end());
      } else if (tailoring_) {
        check_distinct(tailoring_->result());
        sort_.weights = number_weights(tailoring_->result());
      } else {
        sort_.weights = order_of_code_page(*host_, blocks_, host_spot_);
      }
    } catch (const SourceError& error) {
      report_.error(source_.name(), error);
    }
  }

  const SourceFile& source_;
  const SortContext& context_;
  Report& report_;
  Sort sort_;
  std::set<std::string> seen_;  // header keys
  bool has_form_ = false;
  bool form_failed_ = false;  // what follows it is not worth a message
  std::unique_ptr<Tailoring> tailoring_;
  std::unique_ptr<SortWeightsReader> weights_;
  const CodePage* host_ = nullptr;
  Spot host_spot_;
  std::vector<HostBlock> blocks_;
};

}  // namespace

std::optional<Sort> read_sort(const SourceFile& source, const SortContext& context, Report& report) {
  return SortReader(source, context, report).read();
}

std::string write_sort(const Sort& sort) {
  return "id " + std::to_string(sort.id) + "\nname " + sort.name + "\nweights\n" + write_sort_weights(sort.weights);
}

}  // namespace lx::compiler
