//===- frameworks/kiln/KilnCursors.cpp - Cursor names and the cursor table ===//
#include "frameworks/kiln/KilnCursors.h"

namespace formkit {

namespace {

struct TCursorName {
  TCursor Value;
  const char* Name;
};

// From crDefault downwards: the order the inspector offers them in.
constexpr TCursorName CursorNames[] = {
    {crDefault, "crDefault"},   {crNone, "crNone"},         {crArrow, "crArrow"},
    {crCross, "crCross"},       {crIBeam, "crIBeam"},
    {crSizeNESW, "crSizeNESW"}, {crSizeNS, "crSizeNS"},     {crSizeNWSE, "crSizeNWSE"},
    {crSizeWE, "crSizeWE"},     {crUpArrow, "crUpArrow"},   {crHourGlass, "crHourGlass"},
    {crDrag, "crDrag"},         {crNoDrop, "crNoDrop"},     {crHSplit, "crHSplit"},
    {crVSplit, "crVSplit"},     {crMultiDrag, "crMultiDrag"}, {crSQLWait, "crSQLWait"},
    {crNo, "crNo"},             {crAppStart, "crAppStart"}, {crHelp, "crHelp"},
    {crHandPoint, "crHandPoint"}, {crSizeAll, "crSizeAll"}};

} // namespace

bool CursorToIdent(int Cursor, String& Ident) {
  for (const TCursorName& C : CursorNames)
    if (C.Value == Cursor) {
      Ident = C.Name;
      return true;
    }
  return false;
}

bool IdentToCursor(std::string_view Ident, int& Cursor) {
  for (const TCursorName& C : CursorNames)
    if (SameText(C.Name, Ident)) {
      Cursor = C.Value;
      return true;
    }
  return false;
}

String CursorToString(TCursor Cursor) {
  String Name;
  return CursorToIdent(Cursor, Name) ? Name : IntToStr(Cursor);
}

TCursor StringToCursor(std::string_view Text) {
  int Cursor = 0;
  if (IdentToCursor(Text, Cursor)) return static_cast<TCursor>(Cursor);
  return static_cast<TCursor>(StrToInt(Text));
}

void GetCursorValues(const std::function<void(const String& Name)>& Proc) {
  for (const TCursorName& C : CursorNames) Proc(C.Name);
}

bool TCursorTable::Contains(int Cursor) const {
  String Name;
  return CursorToIdent(Cursor, Name) || FAdded.count(Cursor) != 0;
}

String TCursorTable::PictureName(int Cursor) const {
  String Name;
  if (CursorToIdent(Cursor, Name)) return Name;
  auto It = FAdded.find(Cursor);
  return It == FAdded.end() ? String() : It->second;
}

void TCursorTable::Add(int Cursor, const String& PictureName) {
  if (Cursor <= 0) throw EInvalidOperation(SCursorBuiltIn, Cursor);
  FAdded[Cursor] = PictureName;
}

TCursorTable& ScreenCursors() {
  static TCursorTable Table;
  return Table;
}

} // namespace formkit
