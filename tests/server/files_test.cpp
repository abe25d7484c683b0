// Whole-file byte transfer: round trips of byte arrays and text, empty and missing files, a file
// overwritten by fewer bytes, and data that are not bytes (which must leave the file alone).
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include "server/files.h"

namespace xal::server {
namespace {

namespace fs = std::filesystem;

class Files : public ::testing::Test {
 protected:
  void SetUp() override {
    dir_ = fs::temp_directory_path() /
           ("xalserver_files_" + std::string(::testing::UnitTest::GetInstance()->current_test_info()->name()));
    fs::remove_all(dir_);
    fs::create_directories(dir_);
  }
  void TearDown() override { fs::remove_all(dir_); }
  std::string File(const char* name) const { return (dir_ / name).string(); }
  static std::string Contents(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
  }
  static void Write(const std::string& path, const std::string& bytes) {
    std::ofstream(path, std::ios::binary) << bytes;
  }

  fs::path dir_;
};

Variant Bytes(std::vector<Variant> items, int32_t lower = 0) { return Variant(SafeArray::Vector(std::move(items), lower)); }

Variant IntegerBytes(std::initializer_list<int> values) {
  std::vector<Variant> items;
  for (int v : values) items.emplace_back(static_cast<int16_t>(v));
  return Bytes(std::move(items));
}

TEST_F(Files, WritesTheBytesOfEachKindOfData) {
  struct Row {
    const char* name;
    Variant data;
    std::string expected;  // the file's bytes
  } rows[] = {
      {"integers", IntegerBytes({0, 1, 127, 128, 255}), std::string("\x00\x01\x7f\x80\xff", 5)},
      {"longs", Bytes({Variant(int32_t{65}), Variant(int32_t{66})}), "AB"},
      {"whole doubles", Bytes({Variant(67.0), Variant(Currency::FromInt(68))}), "CD"},
      {"lower bound 1", Bytes({Variant(int16_t{69})}, 1), "E"},
      {"text", Variant("héllo"), "h\xc3\xa9llo"},  // a String is written as its UTF-8 bytes
      {"empty", Variant(), ""},
      {"empty array", Bytes({}), ""},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.name);
    const std::string path = File(r.name);
    EXPECT_TRUE(Bin2File(path, r.data));
    EXPECT_EQ(Contents(path), r.expected);
  }
}

TEST_F(Files, RoundTripGivesA0BasedIntegerArray) {
  const std::string path = File("round");
  const Variant data = IntegerBytes({200, 0, 13, 10, 255, 65});
  ASSERT_TRUE(Bin2File(path, data));
  const Variant back = File2Bin(path);
  ASSERT_TRUE(back.IsArray());
  EXPECT_EQ(back.AsArray().Dims(), 1);
  EXPECT_EQ(back.AsArray().LBound(), 0);
  EXPECT_EQ(back, data);  // same values and the same element type (Integer)
}

TEST_F(Files, ShorterDataLeavesNoStaleBytes) {
  const std::string path = File("shrink");
  Write(path, "0123456789");
  ASSERT_TRUE(Bin2File(path, IntegerBytes({97, 98, 99})));
  EXPECT_EQ(Contents(path), "abc");
  EXPECT_EQ(fs::file_size(path), 3u);
}

TEST_F(Files, DataThatAreNotBytesFailAndLeaveTheFile) {
  struct Row {
    const char* name;
    Variant data;
  } rows[] = {
      {"too big", IntegerBytes({1, 256})},                       // 256 does not fit a byte
      {"negative", IntegerBytes({-1})},
      {"text element", Bytes({Variant("A")})},                   // an element must be a number
      {"null", Variant::Null()},
      {"number", Variant(int32_t{65})},                          // a single number is no array
      {"two dimensions", Variant(SafeArray({{0, 1}, {0, 1}}))},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.name);
    const std::string path = File("keep");
    Write(path, "old");
    EXPECT_FALSE(Bin2File(path, r.data));
    EXPECT_EQ(Contents(path), "old");
  }
  EXPECT_FALSE(Bin2File(File("missing/dir/file"), IntegerBytes({1})));  // the folder does not exist
}

TEST_F(Files, NothingToReadIsEmpty) {
  Write(File("empty"), "");
  struct Row {
    const char* name;
    std::string path;
  } rows[] = {
      {"empty file", File("empty")},
      {"missing file", File("nope")},
      {"a directory", dir_.string()},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.name);
    EXPECT_TRUE(File2Bin(r.path).IsEmpty());
  }
}

}  // namespace
}  // namespace xal::server
