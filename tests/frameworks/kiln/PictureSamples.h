//===- tests/frameworks/kiln/PictureSamples.h - Picture files for tests ---===//
//
// A test pattern of pixels, PNG files of it written by libpng itself (so that
// reading them tests the graphic classes against the library, not against
// themselves), and scratch file names that go with the test.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnPictures.h"

#include <gtest/gtest.h>
#include <png.h>

#include <cstdio>
#include <cstring>
#include <fstream>
#include <unistd.h>

namespace formkit::kilntest {

/// A file name of its own in the temporary directory, removed afterwards.
struct TTempFile {
  String Name;
  explicit TTempFile(const String& Ext)
      : Name(Format("/tmp/fk_pictures_%d_%d%s", static_cast<int>(::getpid()), Next++, Ext)) {}
  ~TTempFile() { std::remove(Name.c_str()); }
  TTempFile(const TTempFile&) = delete;
  TTempFile& operator=(const TTempFile&) = delete;
  static inline int Next = 0;
};

/// The test pattern at (X, Y) as 0xAARRGGBB: a colour of both coordinates, half
/// transparent on odd rows.
inline std::uint32_t PatternAt(int X, int Y) {
  std::uint32_t Alpha = (Y % 2) ? 0x80 : 0xFF;
  return Alpha << 24 | static_cast<std::uint32_t>(X * 20 % 256) << 16 | static_cast<std::uint32_t>(Y * 30 % 256) << 8 |
         0x40;
}

/// Writes a `Width` by `Height` PNG of the pattern with libpng.
inline void WritePatternPng(const String& FileName, int Width, int Height) {
  std::vector<std::uint8_t> Rgba;
  for (int Y = 0; Y < Height; ++Y)
    for (int X = 0; X < Width; ++X) {
      std::uint32_t P = PatternAt(X, Y);
      Rgba.insert(Rgba.end(), {static_cast<std::uint8_t>(P >> 16), static_cast<std::uint8_t>(P >> 8),
                               static_cast<std::uint8_t>(P), static_cast<std::uint8_t>(P >> 24)});
    }
  png_image Image;
  std::memset(&Image, 0, sizeof Image);
  Image.version = PNG_IMAGE_VERSION;
  Image.width = static_cast<png_uint_32>(Width);
  Image.height = static_cast<png_uint_32>(Height);
  Image.format = PNG_FORMAT_RGBA;
  ASSERT_TRUE(png_image_write_to_file(&Image, FileName.c_str(), 0, Rgba.data(), 0, nullptr)) << Image.message;
}

inline void WriteBytes(const String& FileName, const std::vector<std::uint8_t>& Bytes) {
  std::ofstream(FileName, std::ios::binary)
      .write(reinterpret_cast<const char*>(Bytes.data()), static_cast<std::streamsize>(Bytes.size()));
}

inline std::vector<std::uint8_t> ReadBytes(const String& FileName) {
  std::ifstream In(FileName, std::ios::binary);
  return std::vector<std::uint8_t>(std::istreambuf_iterator<char>(In), {});
}

/// Expects `G` to hold the pattern at `Width` by `Height`.
inline void ExpectPattern(const TGraphic* G, int Width, int Height) {
  ASSERT_TRUE(G);
  ASSERT_EQ(G->Width(), Width);
  ASSERT_EQ(G->Height(), Height);
  for (int Y = 0; Y < Height; ++Y)
    for (int X = 0; X < Width; ++X) ASSERT_EQ(G->Pixel(X, Y), PatternAt(X, Y)) << X << "," << Y;
}

} // namespace formkit::kilntest
