//===- platform/Registry.h - A tree of keys with named values ------------===//
//
// The settings registry: a tree of keys, each holding named values that are
// text or integers. `TRegistryStore` is the tree, held in memory; a host that
// wants it to outlive the process gives it a file, which it loads at once and
// to which `Flush` writes it back. `TRegistry` is a cursor on a store: it opens
// one key at a time by path ("Software\\Formkit\\Colors", parts separated by
// backslashes, names compared without regard to case) and reads and writes the
// values of that key. `TRegistryIniFile` shows a key as a key file: its subkeys
// are the sections, their values the keys.
//
// Example:
//   RegistryStore().SetFileName("/home/me/.formkit/registry");   // loads it
//   TRegistry Reg;
//   if (Reg.OpenKey("Software\\Formkit\\Window", true)) {
//     Reg.WriteInteger("Left", 120);
//     Reg.ReadInteger("Left");          // 120
//     Reg.CloseKey();                   // the store's file is written
//   }
//
// Everything here runs on the host's user-interface thread.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/IniFiles.h"

#include <memory>
#include <vector>

namespace formkit {

//===----------------------------------------------------------------------===//
// Texts and errors
//===----------------------------------------------------------------------===//

/// Raised by a registry read or write that cannot be done; the tree is unchanged.
FK_EXCEPTION(ERegistryException, Exception);
FK_RESOURCESTRING(SRegGetDataFailed, "Failed to get data for '%s'");
FK_RESOURCESTRING(SRegInvalidDataType, "Invalid data type for '%s'");
FK_RESOURCESTRING(SRegNoKeyOpen, "No registry key is open to hold '%s'");
FK_RESOURCESTRING(SRegBadFile, "Registry file \"%s\" is damaged at line %d");

/// The kind of a value; `rdUnknown` for a name that has none.
FK_ENUM(TRegDataType, std::uint8_t, rdUnknown, rdString, rdInteger)

//===----------------------------------------------------------------------===//
// TRegistryStore
//===----------------------------------------------------------------------===//

namespace detail {
struct TRegKey;
} // namespace detail

/// The tree of keys. Owns every key and value. A key file, when the host gives one,
/// holds each key as a line "[Path]" followed by its values, "s:Name=Text" or
/// "i:Name=Number", with backslash, "=" and line breaks in names and texts escaped.
class FK_API TRegistryStore {
public:
  TRegistryStore();
  ~TRegistryStore();
  TRegistryStore(const TRegistryStore&) = delete;
  TRegistryStore& operator=(const TRegistryStore&) = delete;

  /// The file the store is kept in; empty (the start) keeps it in memory only.
  const String& FileName() const noexcept { return FFileName; }
  /// Takes `Value` as the store's file and replaces the tree by its content when it
  /// exists (a missing file leaves the tree as it is, to be written by `Flush`). Raises
  /// `ERegistryException` "Registry file \"%s\" is damaged at line %d" or the file's read
  /// error, and then both the tree and the file name stay as they were.
  void SetFileName(const String& Value);
  /// Writes the tree to the store's file when there is one and something changed since it
  /// was loaded or written. A failed write passes its `EFCreateError` up and keeps the
  /// tree marked as changed.
  void Flush();
  /// Replaces the tree by the content of a key file (see the class comment); on failure
  /// nothing changes.
  void LoadFromText(const String& Text, const String& Origin = String());
  /// The tree as a key file, keys in the order of their creation.
  [[nodiscard]] String SaveToText() const;
  /// Drops every key and value.
  void Clear();
  /// True when something changed since the last load or write.
  bool Modified() const noexcept { return FModified; }

  /// For `TRegistry`: the key at `Path` below the root, made when `Create` is true; null
  /// when it does not exist and may not be made. The key belongs to the store.
  detail::TRegKey* FindKey(const String& Path, bool Create);
  /// For `TRegistry`: `Path` of an existing key with the names as the keys were made.
  [[nodiscard]] String ExactPath(const String& Path) const;
  /// For `TRegistry`: removes the key at `Path` with all it holds; false when absent.
  bool RemoveKey(const String& Path);
  void MarkModified() noexcept { FModified = true; }

private:
  std::unique_ptr<detail::TRegKey> FRoot;
  String FFileName;
  bool FModified = false;
};

/// The process's store, made empty on first use and held in memory until a host gives
/// it a file.
FK_API TRegistryStore& RegistryStore();

//===----------------------------------------------------------------------===//
// TRegistry
//===----------------------------------------------------------------------===//

/// A cursor on a store: one open key and its values, a plain value made on the stack. Keeps only the path of the open key,
/// so a key deleted through another cursor is simply gone for this one: reads fail and
/// writes make it again. Does not own the store.
class FK_API TRegistry {
public:
  explicit TRegistry(TRegistryStore& Store = RegistryStore()) : FStore(&Store) {}

  /// Opens `Key`: a path from the root when it starts with a backslash, else below the
  /// open key. With `CanCreate` the missing keys of the path are made. False, and the
  /// open key unchanged, when the key does not exist and may not be made, or for an
  /// empty part in the path ("a\\\\b") or a part holding a line break.
  [[nodiscard]] bool OpenKey(const String& Key, bool CanCreate);
  /// `OpenKey` that never creates; writes through this cursor then raise.
  [[nodiscard]] bool OpenKeyReadOnly(const String& Key);
  /// Closes the open key and flushes the store when this cursor changed something.
  /// Destroying a cursor does not flush: whoever writes through it closes it.
  void CloseKey();
  /// The path of the open key from the root, with the names as the keys were made and
  /// without a leading backslash; empty when no key is open (or the root is).
  const String& CurrentPath() const noexcept { return FCurrentPath; }
  bool HasKeyOpen() const noexcept { return FOpen; }

  // Keys ---------------------------------------------------------------------
  bool KeyExists(const String& Key);
  /// Makes `Key` and the keys on its path; false for an invalid path.
  bool CreateKey(const String& Key);
  /// Removes `Key` with everything below it; false when it does not exist.
  bool DeleteKey(const String& Key);
  /// The names of the open key's subkeys, in the order of their creation.
  void GetKeyNames(TStrings* Strings);
  bool HasSubKeys();

  // Values of the open key ----------------------------------------------------
  bool ValueExists(const String& Name);
  TRegDataType GetDataType(const String& Name);
  /// The names of the open key's values, in the order of their creation.
  void GetValueNames(TStrings* Strings);
  /// Removes a value; false when there is none.
  bool DeleteValue(const String& Name);
  /// The text of value `Name`; empty when there is none. Raises `ERegistryException`
  /// "Invalid data type for '%s'" for an integer value.
  String ReadString(const String& Name);
  /// The number of value `Name`. Raises "Failed to get data for '%s'" when there is none
  /// and "Invalid data type for '%s'" for a text value.
  int ReadInteger(const String& Name);
  /// `ReadInteger` other than 0.
  bool ReadBool(const String& Name) { return ReadInteger(Name) != 0; }
  /// Sets (or replaces, whatever its kind) value `Name`. Raises "No registry key is open
  /// to hold '%s'" without an open key, or with one opened read-only.
  void WriteString(const String& Name, const String& Value);
  void WriteInteger(const String& Name, int Value);
  void WriteBool(const String& Name, bool Value) { WriteInteger(Name, Value ? 1 : 0); }

private:
  detail::TRegKey* OpenedKey(bool Create);
  detail::TRegKey* WritableKey(const String& Name);
  [[nodiscard]] String Resolve(const String& Key, bool& Valid) const;

  TRegistryStore* FStore;
  String FCurrentPath;
  bool FOpen = false;
  bool FReadOnly = false;
  bool FChanged = false;
};

//===----------------------------------------------------------------------===//
// TRegistryIniFile
//===----------------------------------------------------------------------===//

/// A key of a store seen as a key file: the key's subkeys are its sections, their values
/// its keys; an integer value reads as its decimal text. The key is made on the first
/// write. `UpdateFile` flushes the store.
class FK_API TRegistryIniFile : public TCustomIniFile {
  FK_CLASS(TRegistryIniFile, TCustomIniFile)

  /// The key file at key `Key` (a path from the root) of `Store`.
  explicit TRegistryIniFile(const String& Key, TRegistryStore& Store = RegistryStore());

  String ReadString(const String& Section, const String& Ident, const String& Default) override;
  void WriteString(const String& Section, const String& Ident, const String& Value) override;
  void ReadSection(const String& Section, TStrings* Strings) override;
  void ReadSections(TStrings* Strings) override;
  void EraseSection(const String& Section) override;
  void DeleteKey(const String& Section, const String& Ident) override;
  bool ValueExists(const String& Section, const String& Ident) override;
  void UpdateFile() override { FStore->Flush(); }

private:
  /// A cursor on `Section`, opened when it exists (or, with `Create`, made).
  bool OpenSection(TRegistry& Reg, const String& Section, bool Create);
  TRegistryStore* FStore;
};

} // namespace formkit
