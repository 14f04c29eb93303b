// SPDX-License-Identifier: Apache-2.0
#include "code_page_image.hpp"
#include "code_page_source.hpp"
#include "lint.hpp"
#include "pack_code_page.hpp"
#include "pack_pool.hpp"

namespace lx::compiler {

namespace {

class PageLint {
 public:
  PageLint(const CodePage& page, Report& report) : page_(page), report_(report) {}

  void run() {
    if (page_.family == Family::ascii) {
      ascii_invariants();
    } else {
      ebcdic_invariants();
    }
    control_bytes();
  }

 private:
  void error(const tool::Message& message) { report_.error(page_.file, page_.spot, message); }

  void expect(Code code, uint16_t unicode) {
    if (page_.unicode_of(code) != unicode || page_.exact_code(unicode) != code) {
      error(tool::message("on every page of this family, {0} is {1}, both ways", hex_text(code, 2),
                          unicode_name(unicode)));
    }
  }

  void ascii_invariants() {
    for (uint16_t c = 0; c < 0x80; ++c) expect(c, c);
  }

  // What the formatting code writes without a look at the page, and the controls that conversion relies on.
  void ebcdic_invariants() {
    for (uint16_t digit = 0; digit < 10; ++digit) expect(0xF0u + digit, static_cast<uint16_t>(U'0' + digit));
    constexpr struct {
      uint8_t byte;
      uint16_t unicode;
    } kFixed[] = {{0x40, 0x20}, {0x60, 0x2D}, {0x4E, 0x2B}, {0x5E, 0x3B}, {0x4D, 0x28}, {0x5D, 0x29}, {0x6C, 0x25},
                  {0x25, 0x0A}, {0x15, 0x85}, {0x0D, 0x0D}, {0x0B, 0x0B}, {0x0C, 0x0C}, {0x3F, 0x1A}};
    for (auto [byte, unicode] : kFixed) expect(byte, unicode);
  }

  // Text is searched for these bytes by character, so no longer character may contain them.
  void control_bytes() {
    for (unsigned i = 0; i < page_.line_bytes.size(); ++i) {
      uint8_t byte = page_.line_bytes[i];
      if (byte == 0 || page_.unicode_of(byte) == kUnassigned)
        error(tool::message("line end {0} is no character", hex_text(byte, 2)));
      for (unsigned j = 0; j < i; ++j) {
        if (page_.line_bytes[j] == byte) error(tool::message("line end {0} is given twice", hex_text(byte, 2)));
      }
      check_alone(byte, "line end {0} is part of the character {1}");
    }
    check_alone(page_.substitution, "substitution byte {0} is part of the character {1}");
    if (page_.mixed()) {
      for (uint8_t byte : {page_.enter_byte, page_.leave_byte}) {
        check_alone(byte, "shift byte {0} is part of the character {1}");
      }
    }
  }

  void check_alone(uint8_t byte, const char* error_text) {
    for (auto at = page_.to_unicode.lower_bound(0x100); at != page_.to_unicode.end(); ++at) {
      for (unsigned i = 0, length = code_length(at->first); i < length; ++i) {
        if (code_byte(at->first, length, i) != byte) continue;
        error(tool::message(error_text, hex_text(byte, 2), hex_text(at->first, 2 * length)));
        return;
      }
    }
  }

  const CodePage& page_;
  Report& report_;
};

}  // namespace

void lint_code_page(const CodePage& page, Report& report) { PageLint(page, report).run(); }

void lint_round_trip(const CodePage& page, const UnicodeTables& unicode, Report& report) {
  try {
    ObjectFile file{2, pack_code_page(page, unicode, Layout::current)};
    make_object_file(file.sections, kCurrentFormat);
    CodePageImage image = read_code_page_image(file, page.id);
    check_code_page_image(image);
    CodePage read = unpack_code_page(image);
    if (read.to_unicode != page.to_unicode || read.from_unicode != page.from_unicode) {
      report.error(page.file, page.spot, "the compiled page does not read back as its source");
    }
  } catch (const PackError& error) {
    report.error(page.file, page.spot, error.text);
  } catch (const StructureError& error) {
    report.error(page.file, page.spot, tool::message("the compiled page is broken: {0}", error.text));
  }
}

}  // namespace lx::compiler
