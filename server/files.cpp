// Whole-file transfer between a file and a byte array, for scripts that store attachments and
// exported documents in the database. The runtime has no Byte type, so a byte array is a 0-based
// 1-D array of Integer (16-bit) elements holding 0-255; Bin2File takes that, any array of whole
// numbers 0-255, or a String (its UTF-8 bytes). Both trap every error and answer False / Empty.
#include <fstream>
#include <iterator>
#include <vector>

#include "runtime/convert.h"
#include "runtime/trap.h"
#include "server/files.h"

namespace xal::server {

namespace {

// The bytes a value stands for. Empty stands for no bytes; an element that is not a whole number
// 0-255 overflows as a Byte conversion would; Null, objects and arrays of more than one dimension
// cannot be bytes.
std::vector<char> BytesOf(const Variant& data) {
  std::vector<char> bytes;
  if (data.IsEmpty()) return bytes;
  if (data.IsString()) return std::vector<char>(data.AsString().begin(), data.AsString().end());
  if (data.IsNull()) Raise(kErrInvalidNull);
  if (!data.IsArray()) Raise(kErrTypeMismatch);
  const SafeArray& a = data.AsArray();
  if (a.Dims() != 1) Raise(kErrTypeMismatch);
  bytes.reserve(a.Size());
  for (const Variant& e : a.Elements()) {
    if (e.IsString() || e.IsObject() || e.IsArray()) Raise(kErrTypeMismatch);
    const int32_t b = CLng(e);
    if (b < 0 || b > 255) Raise(kErrOverflow);
    bytes.push_back(static_cast<char>(static_cast<unsigned char>(b)));
  }
  return bytes;
}

}  // namespace

bool Bin2File(const std::string& pFileName, const Variant& pBinData) {
  // Conversion errors and stream failures alike give False.
  return TryOr(
      [&] {
        // Converted before the file is opened, so bad data leaves an existing file untouched.
        const std::vector<char> bytes = BytesOf(pBinData);
        // Truncated on open: a shorter array written over a longer file leaves no stale bytes behind.
        std::ofstream out(pFileName, std::ios::binary | std::ios::trunc);
        if (!out) return false;
        out.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
        out.close();
        return !out.fail();
      },
      false);
}

Variant File2Bin(const std::string& pFileName) {
  return TryOr(
      [&] {
        std::ifstream in(pFileName, std::ios::binary);
        if (!in) return Variant();
        // A directory opens but fails on the first read (the stream buffer throws); an empty file
        // has nothing to give. Both are Empty.
        const std::vector<char> bytes{std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
        if (in.bad() || bytes.empty()) return Variant();
        std::vector<Variant> items;
        items.reserve(bytes.size());
        for (char c : bytes) items.emplace_back(static_cast<int16_t>(static_cast<unsigned char>(c)));
        return Variant(SafeArray::Vector(std::move(items), 0));
      },
      Variant());
}

}  // namespace xal::server
