//===- host/ModuleSource.h - The source file beside a module --------------===//
//
// Every module file (`Form1.kfm`) has a source file beside it (`Form1.fks`) that
// holds what a code editor would: the module's class with its ancestor, one
// field per component the module owns, and the event handler methods with
// their bodies. The host keeps it in step with the designer: a component named
// or renamed renames its field, a handler created or renamed changes its
// method, pasted handlers arrive with their bodies.
//
// The text form:
//
//   class TForm2 : TForm1
//     field Edit2: TEdit
//     view Phone=360x640
//   handler Button1Click(Sender: TObject)
//   begin
//   end
//
// Example:
//   TModuleSource Source;
//   Source.Load("Form2.fks");        // a missing file is an empty source
//   Source.AddMethod("Button1Click", "Sender: TObject");
//   Source.Save("Form2.fks");
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

#include <functional>
#include <vector>

namespace formkit {

FK_EXCEPTION(ESourceFileError, Exception);

/// One handler of the source: its name, its parameter list and its body lines.
struct TSourceMethod {
  String Name;
  String Params;
  std::vector<String> Body{"begin", "end"};
};

/// The source of one module. Plain data: it reads and writes its file when asked.
class FK_API TModuleSource {
public:
  // The class -----------------------------------------------------------------------
  String ClassName;
  /// The class it descends from ("TForm" for a form of its own, "TForm1" for a descendant).
  String AncestorClass;
  /// The module's views, lines "Name=Value" in their order; Value is the device's size,
  /// or a single blank.
  std::vector<String> Views;

  // Reading and writing -------------------------------------------------------------
  /// Reads `Path`; a file that does not exist gives an empty source. Raises
  /// `ESourceFileError` "Source file %s is malformed at line %d" for a line it cannot take.
  void Load(const String& Path);
  /// Writes the source to `Path` through a temporary file, so a failure leaves the old
  /// file. Raises `ESourceFileError` "Cannot write source file %s".
  void Save(const String& Path) const;
  /// The text form (the file's content).
  [[nodiscard]] String Text() const;
  /// Takes the text form; raises as `Load` does.
  void SetText(const String& Text, const String& Origin);

  // Fields --------------------------------------------------------------------------
  const std::vector<std::pair<String, String>>& Fields() const noexcept { return FFields; }
  /// Renames field `CurName` (of class `ClassName`) to `NewName`: an empty `CurName`
  /// adds it, an empty `NewName` removes it.
  void RenameField(const String& CurName, const String& NewName, const String& FieldClass);

  // Methods -------------------------------------------------------------------------
  const std::vector<TSourceMethod>& Methods() const noexcept { return FMethods; }
  /// The method named `Name` (without regard to case), or null.
  [[nodiscard]] const TSourceMethod* FindMethod(const String& Name) const;
  /// Adds an empty handler unless one of that name is there.
  void AddMethod(const String& Name, const String& Params);
  /// Renames a method; false when there is none of that name.
  bool RenameMethod(const String& CurName, const String& NewName);
  /// The text of one method, as pasted components carry it; empty when there is none.
  [[nodiscard]] String MethodText(const String& Name) const;
  /// Takes the methods in `Text` (several method texts one after the other), each renamed
  /// by `Rename` first; a method that is there already is left alone. Returns the names
  /// taken.
  std::vector<String> InsertMethods(const String& Text, const std::function<String(const String&)>& Rename);

private:
  std::vector<std::pair<String, String>> FFields;
  std::vector<TSourceMethod> FMethods;
};

} // namespace formkit
