// Base64: decoding any text either fails or gives bytes that encode back to a text that
// decodes to the same bytes; any bytes survive an encode/decode round trip.
#include <kelcore/utility/Base64.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

using namespace kelcore;
using namespace kelcore::utility;

namespace {

void Check(bool condition) {
  if (!condition) std::abort();
}

ByteVector RoundTrip(const unsigned char* data, std::size_t size) {
  UTF8String encoded;
  Check(EncodeBinaryDataToUTF8String(data, static_cast<unsigned int>(size), encoded));
  ByteVector decoded;
  Check(DecodeBinaryDataFromUTF8String(encoded, decoded));
  return decoded;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const ByteVector original(data, data + size);
  Check(RoundTrip(data, size) == original);

  ByteVector decoded;
  const UTF8String text(data, size);
  if (DecodeBinaryDataFromUTF8String(text, decoded)) {
    Check(RoundTrip(decoded.data(), decoded.size()) == decoded);
  }
  return 0;
}
