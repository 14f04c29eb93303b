// SPDX-License-Identifier: Apache-2.0
// The library on the collation directory, for all cases of a program.
#pragma once

#include "collate/text_form.hpp"

namespace lx::test {

class CollationTest : public testing::Test {
 protected:
  CollationTest() : session_(directory().path()) { EXPECT_EQ(session_.status, LX_OK); }

 private:
  static const DataDirectory& directory() {
    static const DataDirectory directory;
    static const bool written = [] { return write_collation_directory(directory), true; }();
    return written ? directory : directory;
  }
  Session session_;
};

}  // namespace lx::test
