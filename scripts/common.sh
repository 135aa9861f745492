# Shared by the build scripts: configure and build one build tree.
#   kel_build DIR [cmake options...]
kel_build() {
  local dir=$1
  shift
  local launcher=()
  if command -v ccache >/dev/null; then
    launcher=(-DCMAKE_CXX_COMPILER_LAUNCHER=ccache -DCMAKE_C_COMPILER_LAUNCHER=ccache)
  fi
  cmake -S . -B "$dir" -G Ninja "${launcher[@]}" "$@"
  cmake --build "$dir" --parallel "$(nproc)"
  kel_link_compile_commands "$dir"
}

# Tools (clangd, clang-tidy) find the compile database at the top of the tree.
kel_link_compile_commands() {
  [[ -e compile_commands.json || -L compile_commands.json ]] || ln -s "$1/compile_commands.json" compile_commands.json
}
