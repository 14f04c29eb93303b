# SPDX-License-Identifier: Apache-2.0
# What the scripts share. They run from the root of the source tree.
cd "$(dirname "$0")/.."

# Without a preference of the caller, compile through ccache when it is there.
if command -v ccache > /dev/null 2>&1; then
  export CMAKE_C_COMPILER_LAUNCHER="${CMAKE_C_COMPILER_LAUNCHER-ccache}"
  export CMAKE_CXX_COMPILER_LAUNCHER="${CMAKE_CXX_COMPILER_LAUNCHER-ccache}"
fi

say() { printf '\n== %s\n' "$*"; }

# A preset, and of it a target instead of everything.
build_preset() {
  say "Building preset $1"
  cmake --preset "$1" --log-level=WARNING && cmake --build --preset "$1" --target "${2:-all}"
}
