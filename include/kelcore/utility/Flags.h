// Flags<T>: a small set of bits held in one unsigned integer.
//
// Used to pass option bits to functions (the number functions take a
// Flags<unsigned short>). A Flags converts implicitly from its integer type, so a
// caller may pass a plain constant such as 2 or kNumberPlainASCII | kNumberKeepCommas.
//
// Test(bits) is true when any of `bits` is set, TestAll(bits) when all of them are. Set,
// Clear and Toggle change the given bits and return the set for chaining. The bitwise
// operators work bit by bit, as they do on T. A Flags is a plain value: copying is free,
// and concurrent use of one object from several threads needs outside locking.
#pragma once

#include <type_traits>

namespace kelcore::utility {

template <typename T>
class Flags {
  static_assert(std::is_integral_v<T> && std::is_unsigned_v<T>,
                "Flags holds its bits in an unsigned integer type");

 public:
  using value_type = T;

  constexpr Flags() noexcept = default;
  constexpr Flags(T bits) noexcept : bits_(bits) {}  // NOLINT(google-explicit-constructor)

  constexpr T Bits() const noexcept { return bits_; }
  constexpr bool Test(T bits) const noexcept { return (bits_ & bits) != 0; }
  constexpr bool TestAll(T bits) const noexcept { return (bits_ & bits) == bits; }
  constexpr bool None() const noexcept { return bits_ == 0; }

  constexpr Flags& Set(T bits) noexcept {
    bits_ = static_cast<T>(bits_ | bits);
    return *this;
  }
  constexpr Flags& Clear(T bits) noexcept {
    bits_ = static_cast<T>(bits_ & ~bits);
    return *this;
  }
  constexpr Flags& Toggle(T bits) noexcept {
    bits_ = static_cast<T>(bits_ ^ bits);
    return *this;
  }
  // Sets the bits when `on` is true, clears them otherwise.
  constexpr Flags& Assign(T bits, bool on) noexcept { return on ? Set(bits) : Clear(bits); }

  constexpr Flags& operator|=(Flags other) noexcept { return Set(other.bits_); }
  constexpr Flags& operator&=(Flags other) noexcept {
    bits_ = static_cast<T>(bits_ & other.bits_);
    return *this;
  }
  constexpr Flags& operator^=(Flags other) noexcept { return Toggle(other.bits_); }

  friend constexpr Flags operator|(Flags a, Flags b) noexcept { return a |= b; }
  friend constexpr Flags operator&(Flags a, Flags b) noexcept { return a &= b; }
  friend constexpr Flags operator^(Flags a, Flags b) noexcept { return a ^= b; }
  constexpr Flags operator~() const noexcept { return Flags(static_cast<T>(~bits_)); }

  friend constexpr bool operator==(Flags a, Flags b) noexcept = default;

 private:
  T bits_ = 0;
};

}  // namespace kelcore::utility
