//===- platform/IniFiles.h - Key files of sections and values ------------===//
//
// A key file is text of sections, "[Name]", each followed by lines
// "Key=Value". `TCustomIniFile` is what readers and writers of settings
// program against: strings, lenient integers, Booleans as "1" and "0".
// `TMemIniFile` holds the whole file in memory, reads it at construction and
// writes it back only on `UpdateFile`. Section and key names compare without
// regard to case; their order is the order of first writing.
//
// Example:
//   TObjectGuard<TMemIniFile> Ini(new TMemIniFile("/home/me/layout.ini"));
//   Ini->WriteInteger("MainWindow", "Left", 120);
//   Ini->ReadBool("MainWindow", "Visible", false);
//   Ini->UpdateFile();   // the file now holds the section
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Lists.h"

#include <vector>

namespace formkit {

//===----------------------------------------------------------------------===//
// TCustomIniFile
//===----------------------------------------------------------------------===//

/// The settings-file contract. The typed reads are built on `ReadString` and never
/// raise on bad text: a value that is not a number reads as the default.
class FK_API TCustomIniFile : public TObject {
  FK_CLASS(TCustomIniFile, TObject)

  explicit TCustomIniFile(String FileName = String()) : FFileName(std::move(FileName)) {}

  /// The file this object reads and writes; empty for one held in memory only.
  const String& FileName() const noexcept { return FFileName; }

  /// The value of `Ident` in `Section`, or `Default` when there is none.
  virtual String ReadString(const String& Section, const String& Ident, const String& Default) = 0;
  /// Sets the value, adding the section and the key when they are new.
  virtual void WriteString(const String& Section, const String& Ident, const String& Value) = 0;
  /// The keys of `Section`, in file order, into `Strings` (cleared first).
  virtual void ReadSection(const String& Section, TStrings* Strings) = 0;
  /// The section names, in file order, into `Strings` (cleared first).
  virtual void ReadSections(TStrings* Strings) = 0;
  /// Removes a section with its keys; nothing when there is no such section.
  virtual void EraseSection(const String& Section) = 0;
  /// Removes one key; nothing when there is no such key.
  virtual void DeleteKey(const String& Section, const String& Ident) = 0;
  /// Writes what is held to the file.
  virtual void UpdateFile() = 0;

  /// Decimal or `$`-hexadecimal text; anything else, or no value, gives `Default`.
  int ReadInteger(const String& Section, const String& Ident, int Default);
  void WriteInteger(const String& Section, const String& Ident, int Value);
  /// A number other than 0 is true; no value or a bad number gives `Default`.
  bool ReadBool(const String& Section, const String& Ident, bool Default);
  /// Writes "1" or "0".
  void WriteBool(const String& Section, const String& Ident, bool Value);
  bool SectionExists(const String& Section);
  /// True when `Section` holds the key `Ident`, even with an empty value.
  virtual bool ValueExists(const String& Section, const String& Ident);

protected:
  void SetFileName(String Value) { FFileName = std::move(Value); }

private:
  String FFileName;
};

//===----------------------------------------------------------------------===//
// TMemIniFile
//===----------------------------------------------------------------------===//

/// A key file held in memory. Lines that are blank or start with ";" are not kept;
/// a line without "=" before any section is dropped, one inside a section is a key
/// with an empty value. Cost: lookups walk the section's keys.
class FK_API TMemIniFile : public TCustomIniFile {
  FK_CLASS(TMemIniFile, TCustomIniFile)

  /// Reads `FileName` when it exists; a missing file starts empty. Raises `EFOpenError`
  /// "Cannot open file \"%s\". %s" for a file that exists but cannot be read.
  explicit TMemIniFile(const String& FileName = String());

  String ReadString(const String& Section, const String& Ident, const String& Default) override;
  void WriteString(const String& Section, const String& Ident, const String& Value) override;
  void ReadSection(const String& Section, TStrings* Strings) override;
  void ReadSections(TStrings* Strings) override;
  void EraseSection(const String& Section) override;
  void DeleteKey(const String& Section, const String& Ident) override;
  bool ValueExists(const String& Section, const String& Ident) override;
  /// Writes the whole text through a temporary file beside the target, so a failure
  /// leaves the old file as it was; raises `EFCreateError` then. Nothing for an empty
  /// file name.
  void UpdateFile() override;

  /// The file as text: each section as "[Name]", its lines "Key=Value", a blank line.
  String Text() const;
  /// Replaces everything held by the sections and keys of `Value`.
  void SetText(const String& Value);
  /// Forgets every section.
  void Clear() noexcept { FSections.clear(); }
  /// Changes the file name; with `Reload`, replaces the contents by that file's (which
  /// must be readable; on failure the contents and the name stay).
  void Rename(const String& FileName, bool Reload);

private:
  struct TKey {
    String Name;
    String Value;
  };
  struct TSection {
    String Name;
    std::vector<TKey> Keys;
  };
  TSection* FindSection(const String& Name) noexcept;
  TKey* FindKey(const String& Section, const String& Ident) noexcept;
  std::vector<TSection> FSections;
};

/// The whole content of a file as bytes; raises `EFOpenError` when it cannot be read.
[[nodiscard]] FK_API String ReadFileText(const String& FileName);
/// Replaces a file's content through a temporary file beside it and a rename, so the old
/// file stays whole when the write fails; raises `EFCreateError` then.
FK_API void WriteFileText(const String& FileName, const String& Text);

} // namespace formkit
