//===- tests/platform/StreamingFixtures.h - Trees for streaming tests -----===//
//
// A small widget family as a framework would declare it for streaming: controls
// with a parent and children in stream order, a form that is a root, a
// non-visual component, a sub-object, a collection whose items hold
// references, a defined binary property, and a property of every kind.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Filer.h"

namespace formkit::streamtest {

FK_ENUM(TTone, std::uint8_t, toLow, toMid, toHigh)
FK_SET(TTones, TTone)
FK_EVENT(TPokeEvent, void(TObject* Sender));

/// A sub-object published through a read-only property.
class TLook : public TPersistent {
  FK_CLASS(TLook, TPersistent)
  int Size = 8;
  String Face;
};

class TRow : public TCollectionItem {
  FK_CLASS(TRow, TCollectionItem)
  String Caption;
  int Width = 0;
  TComponent* Link = nullptr;
};

/// A visual control: it has a parent and lists its children in stream order.
class TTestControl : public TComponent {
  FK_CLASS(TTestControl, TComponent)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;
  void Notification(TComponent* AComponent, TOperation Operation) override;
  TComponent* GetParentComponent() override { return FParent; }
  bool HasParent() override { return true; }
  void SetParentComponent(TComponent* AParent) override;
  void GetChildren(const TGetChildProc& Proc, TComponent* Root) override;
  void SetChildOrder(TComponent* Child, int Order) override;
  void DefineProperties(TFiler* Filer) override;
  void Loaded() override;
  void Poke(TObject*) { ++Pokes; }

  TTestControl* FParent = nullptr;
  std::vector<TTestControl*> FControls;
  int Left = 0;
  int Top = 0;
  int Width = 100;
  std::int8_t Small = 0;
  char Letter = 'a';
  char16_t Key = 0;
  TTone Tone = toMid;
  TTones Tones;
  bool Enabled = true;
  double Ratio = 0;
  float Scale = 0;
  String Caption;
  WideString Hint;
  std::int64_t Big = 0;
  TComponent* Buddy = nullptr;
  TVariant Value;
  IPtr<IInterface> Peer;
  TPokeEvent OnPoke;
  TLook* Look = nullptr;
  TOwnedCollection* Rows = nullptr;
  std::vector<std::uint8_t> Blob;
  int LoadedCalls = 0;
  int Pokes = 0;
};

/// A root: lists its parented controls, then its other components.
class TTestForm : public TTestControl {
  FK_CLASS(TTestForm, TTestControl)
  void GetChildren(const TGetChildProc& Proc, TComponent* Root) override;
  void SetChildOrder(TComponent* Child, int Order) override;
  void FormPoke(TObject*) {}
};

/// A second root class, for references across roots.
class TOtherForm : public TTestForm {
  FK_CLASS(TOtherForm, TTestForm)
};

/// A component without a parent: its design position streams as "Left" and "Top".
class TTicker : public TComponent {
  FK_CLASS(TTicker, TComponent)
  int Interval = 1000;
  int LoadedCalls = 0;
  void Loaded() override {
    inherited::Loaded();
    ++LoadedCalls;
  }
};

/// A class that is never registered: found only through `OnFindComponentClass`.
class THidden : public TTestControl {
  FK_CLASS(THidden, TTestControl)
};

/// Registers the classes; safe to call more than once.
void RegisterStreamingClasses();

/// Makes a control of `Class` named `Name`, owned by `Owner` and parented to `Parent`.
TTestControl* AddControl(TComponent* Owner, TTestControl* Parent, const String& Name,
                         TClass Class = TTestControl::StaticClass());

/// A form "Form1" with every kind of property set, a collection, a sub-object, a
/// binary property, a nested panel with two buttons, a ticker, references, an event.
TTestForm* BuildRichForm();

/// The bytes of `Root` written by a writer (no resource header), against `Ancestor`.
std::vector<std::uint8_t> WriteBytes(TComponent* Root, TComponent* Ancestor = nullptr);
/// Reads `Bytes` into `Root` (a new TTestForm when null) and returns it.
TComponent* ReadBytes(const std::vector<std::uint8_t>& Bytes, TComponent* Root = nullptr);
/// Binary data as text and back.
String BinaryToText(const std::vector<std::uint8_t>& Bytes);
std::vector<std::uint8_t> TextToBinary(const String& Text);
/// A stream's bytes.
std::vector<std::uint8_t> BytesOf(TMemoryStream* S);

} // namespace formkit::streamtest
