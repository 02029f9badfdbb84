//===- frameworks/kiln/KilnComCtrls.h - Status bars and their panels -----===//
//
// `TStatusBar` is a strip along the bottom of a form, divided into panels. Its
// panels are a collection (`TStatusPanels` of `TStatusPanel`), streamed as one
// property of the bar: a form file lists them as items, each with its text and
// width. With `SimplePanel` set the bar shows only `SimpleText`.
//
// Example:
//   auto* Bar = CreateComponentOf<TStatusBar>(Form);
//   Bar->SetParent(Form);                       // aligned to the bottom
//   auto* Panel = Bar->Panels()->Add();
//   Panel->SetText("Ready");
//   Panel->SetWidth(120);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"

namespace formkit {

class TStatusBar;

/// One panel of a status bar: a text in a cell of a given width.
class FK_API TStatusPanel : public TCollectionItem {
  FK_CLASS(TStatusPanel, TCollectionItem)

  const String& Text() const noexcept { return FText; }
  void SetText(const String& Value);
  int Width() const noexcept { return FWidth; }
  /// Raises `EInvalidOperation` for a negative width.
  void SetWidth(int Value);
  /// The text, or the class name while the panel has none.
  String GetDisplayName() override;
  /// Copies the text and the width of another panel.
  void Assign(TPersistent* Source) override;

private:
  String FText;
  int FWidth = 50;
};

/// The panels of one status bar, in the order they stand from the left.
class FK_API TStatusPanels : public TOwnedCollection {
  FK_CLASS(TStatusPanels, TOwnedCollection)
  TStatusPanels() = default;
  explicit TStatusPanels(TStatusBar* Bar);

  TStatusPanel* Add() { return static_cast<TStatusPanel*>(TCollection::Add()); }
  TStatusPanel* Items(int Index) const { return static_cast<TStatusPanel*>(TCollection::Items(Index)); }
};

/// A strip of panels at the bottom of its parent: height 19, aligned to the
/// bottom. Owns its panels.
class FK_API TStatusBar : public TCustomControl {
  FK_CLASS(TStatusBar, TCustomControl)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  TStatusPanels* Panels() const noexcept { return FPanels; }
  /// Replaces the panels with copies of `Value`'s.
  void SetPanels(TStatusPanels* Value);
  /// Whether the bar shows `SimpleText` across its width instead of its panels.
  bool SimplePanel() const noexcept { return FSimplePanel; }
  void SetSimplePanel(bool Value) noexcept { FSimplePanel = Value; }
  const String& SimpleText() const noexcept { return FSimpleText; }
  void SetSimpleText(const String& Value) { FSimpleText = Value; }
  /// Fills the bar and writes each panel's text in its cell, a line between
  /// cells; the last panel takes what is left of the width.
  void Paint(TCanvas* Canvas) override;

private:
  TStatusPanels* FPanels = nullptr;
  bool FSimplePanel = false;
  String FSimpleText;
};

} // namespace formkit
