//===- fuzz/property_text/PropertyTextFuzz.cpp - Arbitrary text in the inspector ===//
//
// The input is a list of records: one byte choosing an editor, one byte of length,
// then that many bytes of text given to the editor's `SetValue`. The editors are
// those of a selection of a Kiln button and a label, their font's and the font
// style's elements. A text an editor refuses must leave the value as it was shown;
// nothing may raise but the library's own exceptions.
//
//===----------------------------------------------------------------------===//
#include "core/DesignCore.h"
#include "editors/DesignEditors.h"
#include "frameworks/kiln/Kiln.h"

#include <cstdlib>

using namespace formkit;

namespace {

/// Every editor beneath `Props`, nested ones included.
void Flatten(const IPtr<IProperty>& P, std::vector<IPtr<IProperty>>& Out) {
  Out.push_back(P);
  if (P->GetAttributes().Contains(paSubProperties))
    P->GetProperties([&](const IPtr<IProperty>& Sub) { Flatten(Sub, Out); });
}

String ShownValue(const IPtr<IProperty>& P) {
  String Value;
  (void)P->GetEditValue(Value);
  return Value;
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  InitializeKiln();
  InitializeDesignEditors();
  StartDesignCore();
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* Data, size_t Size) {
  TObjectGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form->SetName("Form1");
  auto* Button = CreateComponentOf<TButton>(Form.Get());
  Button->SetName("Button1");
  Button->SetParent(Form.Get());
  auto* Label = CreateComponentOf<TLabel>(Form.Get());
  Label->SetName("Label1");
  Label->SetParent(Form.Get());
  std::vector<IPtr<IProperty>> Editors;
  for (TPersistent* Obj : {static_cast<TPersistent*>(Button), static_cast<TPersistent*>(Label)}) {
    IPtr<IDesignerSelections> One = CreateSelectionList();
    One->Add(Obj);
    GetComponentProperties(One, tkAny, nullptr, [&](const IPtr<IProperty>& P) { Flatten(P, Editors); });
  }
  IPtr<IDesignerSelections> Both = CreateSelectionList();
  Both->Add(Button);
  Both->Add(Label);
  GetComponentProperties(Both, tkAny, nullptr, [&](const IPtr<IProperty>& P) { Flatten(P, Editors); });

  size_t Pos = 0;
  while (Pos + 2 <= Size) {
    const IPtr<IProperty>& Editor = Editors[Data[Pos] % Editors.size()];
    size_t Length = std::min<size_t>(Data[Pos + 1], Size - Pos - 2);
    String Text(reinterpret_cast<const char*>(Data + Pos + 2), Length);
    Pos += 2 + Length;
    String Before = ShownValue(Editor);
    try {
      Editor->SetValue(Text);
    } catch (const EDesignPropertyError&) {
      if (ShownValue(Editor) != Before) std::abort(); // a refused text changed the value
    } catch (const Exception&) {
      // The control itself refused the value (a font size of 0, say): the library's own.
    }
    (void)ShownValue(Editor);
  }
  return 0;
}
