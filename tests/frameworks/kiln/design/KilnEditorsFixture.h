//===- tests/frameworks/kiln/design/KilnEditorsFixture.h - Kiln value editors at work ===//
//
// A form on design with the Kiln designer package, a gadget holding one property
// of each Kiln value type an editor serves, the editor of a property as the
// inspector lists it, and a canvas whose record also tells the pen, brush and
// font each call was drawn with, so a test reads what was painted, and how.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "editors/DesignEditors.h"
#include "frameworks/kiln/KilnDialogs.h"
#include "frameworks/kiln/KilnFonts.h"
#include "frameworks/kiln/KilnMenus.h"
#include "frameworks/kiln/KilnStdDialogs.h"
#include "frameworks/kiln/design/KilnEditors.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include <map>

namespace formkit::fakes {

/// One property of each value type the Kiln editors serve.
class TValueGadget : public TComponent {
  FK_CLASS(TValueGadget, TComponent)
  bool Locked() const noexcept { return FLocked; }
  TColor FColor = clRed;
  TFontCharset FCharset = DEFAULT_CHARSET;
  String FIme;
  TShortCut FShortCut = 0;
  TModalResult FResult = 0;
  TBrushStyle FBrushStyle = bsSolid;
  TPenStyle FPenStyle = psSolid;
  String FFile;
  bool FFlag = false;
  bool FLocked = true;
  TFontStyles FStyles;
  double FDay = 0;
};

/// Follows a canvas's pen, brush and font: the state each recorded call was drawn in.
class TCanvasSpy : public TObject {
  FK_CLASS(TCanvasSpy, TObject)
  TCanvasSpy() = default;
  explicit TCanvasSpy(TCanvas* Canvas);
  /// The canvas's calls since the last `Clear`, each after the state it was drawn in
  /// where that differs from the one before: "Brush clRed bsSolid", "Pen clBlack psDot",
  /// "Font Serif".
  std::vector<String> Drawn() const;
  void Clear();

private:
  void Changed(TObject* Sender);
  TCanvas* FCanvas = nullptr;
  /// Each state with the number of calls recorded before it was set.
  std::vector<std::pair<size_t, String>> FStates;
  /// The states in force at the last `Clear`.
  std::map<String, String> FBaseline;
};

struct KilnEditorsFixture : KilnDesignFixture {
  IPtr<IRoot> Root;
  TKilnRoot* Kiln = nullptr;
  IPtr<IDesigner> FormDesigner;
  TObjectGuard<TCanvas> Canvas;
  TObjectGuard<TCanvasSpy> Spy;

  void SetUp() override;
  void TearDown() override;

  template <class T> T* Make() {
    return static_cast<T*>(Kiln->CreateComponent(T::StaticClass(), Root->GetRoot(), 8, 8, 75, 25));
  }
  /// A gadget owned by the form, named "Gadget1", "Gadget2", ...
  TValueGadget* MakeGadget();
  /// The editor of `Name` for `Objects` together, as the inspector lists it; null when the
  /// inspector shows no such property.
  IPtr<IProperty> PropertyOf(std::initializer_list<TPersistent*> Objects, const String& Name);
  /// The editor object behind `P`.
  template <class E> static E* EditorOf(const IPtr<IProperty>& P) { return dynamic_cast<E*>(P.Get()); }
  /// What `GetValues` offers.
  static std::vector<String> ValuesOf(const IPtr<IProperty>& P);
  /// The message of the exception of type `X` that `Fn` raises, or a note that none came.
  template <class X, class F> static String ErrorOf(F&& Fn) {
    try {
      Fn();
    } catch (const X& E) {
      return E.Message();
    }
    return "(nothing raised)";
  }
  /// What was drawn since the last call, and forgets it.
  std::vector<String> Drawn();
};

} // namespace formkit::fakes
