// Whole-file transfer between a file and a byte array (a 0-based 1-D array of whole numbers
// 0-255, or a String for its UTF-8 bytes), for scripts that keep attachments in the database.
#pragma once

#include <string>

#include "runtime/variant.h"

namespace xal::server {

// Writes the bytes of `pBinData` to the file, replacing it; False on any error.
bool Bin2File(const std::string& pFileName, const Variant& pBinData);
// The file's bytes as a 0-based Integer array; Empty for an empty, missing or unreadable file.
Variant File2Bin(const std::string& pFileName);

}  // namespace xal::server
