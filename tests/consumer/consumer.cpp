// A host program that only knows the installed kelcore: the umbrella header and the
// exported symbols must be enough.
#include <kelcore/kelcore.h>

#include <cstdio>

int main() {
  using namespace kelcore;
  const UTF16String text = utility::UTF8to16(UTF8String(utility::AsciiToUTF8Impl("h\xC3\xA9llo")),
                                             nullptr, nullptr);
  void* block = utility::SmallBlockAllocator::Allocate(48);
  utility::SmallBlockAllocator::Dispose(block, 48);
  if (text.size() != 5 || utility::UTF16to8(text).size() != 6) {
    std::puts("consumer: conversion gave the wrong result");
    return 1;
  }
  std::puts("consumer: ok");
  return 0;
}
