//===- frameworks/kiln/KilnCursors.h - Cursor names and the cursor table --===//
//
// The names of the built-in cursors ("crArrow") and their conversions both
// ways, and the screen's cursor table: the cursors a program may show, each a
// picture of the platform's cursor size. The built-in cursors are always in
// the table; a program adds its own under positive numbers.
//
// Example:
//   CursorToString(crHandPoint);          // "crHandPoint"
//   CursorToString(5);                    // "5"
//   TCursor C;
//   IdentToCursor("CRIBEAM", C);          // true, C == crIBeam
//   ScreenCursors().Add(1, "Pencil");     // a cursor of the program's own
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"

#include <map>

namespace formkit {

//===----------------------------------------------------------------------===//
// Built-in cursors beside those the controls use
//===----------------------------------------------------------------------===//

inline constexpr TCursor crUpArrow = -10;
inline constexpr TCursor crHSplit = -14;
inline constexpr TCursor crVSplit = -15;
inline constexpr TCursor crMultiDrag = -16;
inline constexpr TCursor crSQLWait = -17;
inline constexpr TCursor crNo = -18;
inline constexpr TCursor crAppStart = -19;
inline constexpr TCursor crHelp = -20;

/// The side in pixels of a cursor picture on this platform.
inline constexpr int PlatformCursorSize = 32;

//===----------------------------------------------------------------------===//
// Names
//===----------------------------------------------------------------------===//

/// The name of a built-in cursor; false for any other value.
FK_API bool CursorToIdent(int Cursor, String& Ident);
/// The cursor of a name, without regard to case; false when the name is unknown.
FK_API bool IdentToCursor(std::string_view Ident, int& Cursor);
/// The name of a built-in cursor, else the number in decimal.
FK_API String CursorToString(TCursor Cursor);
/// A cursor name or a decimal number; raises `EConvertError` "'%s' is not a valid integer
/// value" for anything else.
FK_API TCursor StringToCursor(std::string_view Text);
/// Calls `Proc` with the name of every built-in cursor, from `crDefault` downwards.
FK_API void GetCursorValues(const std::function<void(const String& Name)>& Proc);

//===----------------------------------------------------------------------===//
// The cursor table
//===----------------------------------------------------------------------===//

/// The cursors the screen can show: the built-in ones and those a program added, each by
/// the name of its picture.
class FK_API TCursorTable {
public:
  /// True for a built-in cursor and for one added.
  bool Contains(int Cursor) const;
  /// The name of the cursor's picture: the built-in cursor's name, or the name given to
  /// `Add`; empty for a cursor not in the table.
  String PictureName(int Cursor) const;
  /// Adds (or replaces) cursor `Cursor`, which must be positive, with its picture. Raises
  /// `EInvalidOperation` "Cursor %d is built in" for 0 and below.
  void Add(int Cursor, const String& PictureName);
  /// Forgets every cursor added.
  void Clear() noexcept { FAdded.clear(); }

private:
  std::map<int, String> FAdded;
};

/// The process's cursor table.
FK_API TCursorTable& ScreenCursors();

FK_RESOURCESTRING(SCursorBuiltIn, "Cursor %d is built in");

} // namespace formkit
