// The block update of the IEEE CRC-32 register, for OCRCByteStream.
//
// UpdateCrc32Block(reg, data, size) returns the register after feeding `size` bytes to
// it, exactly as the byte-wise update reg = (reg >> 8) ^ table[(reg ^ b) & 0xFF] would.
// The register is the raw one (initial 0xFFFFFFFF, no final XOR applied). It uses
// carry-less multiplication where the processor has it and slicing-by-8 tables otherwise.
// Pure function of its arguments; any thread.
#pragma once

#include <cstddef>
#include <cstdint>

namespace kelcore::filesupport {

std::uint32_t UpdateCrc32Block(std::uint32_t reg, const unsigned char* data, std::size_t size);

// The portable table path alone (the reference for the carry-less path).
std::uint32_t UpdateCrc32Sliced(std::uint32_t reg, const unsigned char* data, std::size_t size);

}  // namespace kelcore::filesupport
