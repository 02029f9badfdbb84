//===- frameworks/kiln/KilnClipbrd.h - The clipboard ---------------------===//
//
// One process-wide clipboard holding a buffer of bytes per format. Formats are
// numbers: a few are built in, and `RegisterClipboardFormat` gives every other
// name its own number (the same number for the same name, whatever its case).
// As on a desktop, putting data on the clipboard replaces what it held, unless
// the data is put between one `Open` and `Close`: then all formats put in that
// session stay side by side.
//
// Example:
//   TClipFormat Fmt = RegisterClipboardFormat("Widget Data");
//   Clipboard()->Open();
//   Clipboard()->SetAsHandle(Fmt, Bytes);
//   Clipboard()->SetAsText("Widget1");
//   Clipboard()->Close();
//   Clipboard()->HasFormat(Fmt);   // true, and CF_TEXT too
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Classes.h"

namespace formkit {

/// A clipboard format number.
using TClipFormat = std::uint32_t;
/// Text in UTF-8.
inline constexpr TClipFormat CF_TEXT = 1;
/// The first number given to a registered name.
inline constexpr TClipFormat FirstRegisteredClipFormat = 0xC000;

/// The number of a named format; registers the name on first use. Raises
/// `EInvalidOperation` for an empty name.
FK_API TClipFormat RegisterClipboardFormat(const String& Name);
/// The name a format was registered with ("CF_TEXT" for text); empty when unknown.
FK_API String ClipboardFormatName(TClipFormat Format);

/// The clipboard: data by format, in the order it was put there.
class FK_API TClipboard : public TPersistent {
  FK_CLASS(TClipboard, TPersistent)

  /// Starts a session: formats put until the matching `Close` replace the old content
  /// together. Sessions nest.
  void Open();
  /// Ends a session; without one, does nothing.
  void Close();
  bool IsOpen() const noexcept { return FOpenCount > 0; }
  /// Empties the clipboard.
  void Clear();

  /// Puts `Data` under `Format`. Raises `EInvalidOperation` for a format that is neither
  /// built in nor registered.
  void SetAsHandle(TClipFormat Format, std::vector<std::uint8_t> Data);
  /// The data under `Format`; empty when the clipboard has none.
  std::vector<std::uint8_t> GetAsHandle(TClipFormat Format) const;
  bool HasFormat(TClipFormat Format) const noexcept;
  int FormatCount() const noexcept { return static_cast<int>(FData.size()); }
  /// The format at `Index`, in the order formats were put; raises `EListError` when out of range.
  TClipFormat Formats(int Index) const;
  /// Text as `CF_TEXT`.
  String AsText() const;
  void SetAsText(const String& Value);
  /// Counts every change of content, so a reader can tell whether it changed.
  int ChangeCount() const noexcept { return FChangeCount; }

private:
  void Adding();
  struct TEntry {
    TClipFormat Format;
    std::vector<std::uint8_t> Data;
  };
  std::vector<TEntry> FData;
  int FOpenCount = 0;
  bool FEmptied = false;
  int FChangeCount = 0;
};

/// The process's clipboard, made on first use.
FK_API TClipboard* Clipboard();

namespace detail {
/// Frees the clipboard; registered format names keep their numbers for the process.
FK_API void FreeClipboard() noexcept;
} // namespace detail

} // namespace formkit
