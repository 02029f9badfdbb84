//===- frameworks/kiln/KilnMemo.h - A multi-line edit control -------------===//
//
// `TMemo`, a text box of many lines: its text lives in `Lines`, a string list
// of its own, and every change of the lines is told through `OnChange`
// (outside design and loading). The caret is a character offset into the
// text, from which the caret's line and column follow. Keys reach it through
// `KeyDown`, as the message loop delivers them. The lines go to form files as
// "Lines.Strings".
//
// Example:
//   TMemo* Memo = CreateComponentOf<TMemo>(Form);
//   Memo->Lines()->SetText("one\r\ntwo");
//   Memo->SetSelStart(6);
//   Memo->CaretLine();        // 1: the second line
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"
#include "frameworks/kiln/KilnMenus.h"
#include "platform/Lists.h"

namespace formkit {

/// Which scroll bars a text control shows.
FK_ENUM(TScrollStyle, std::uint8_t, ssNone, ssHorizontal, ssVertical, ssBoth)
/// A key went down over a control; a handler may clear `Key` to swallow it.
FK_EVENT(TKeyEvent, void(TObject* Sender, std::uint16_t& Key, TShiftState Shift));

/// The lines of a text control: a string list that goes to form files as the list
/// property "Strings" when it differs from the ancestor's (or, without one, is not empty).
class FK_API TStoredStrings : public TStringList {
  FK_CLASS(TStoredStrings, TStringList)
  void DefineProperties(TFiler* Filer) override;

private:
  void ReadLines(TReader* Reader);
  void WriteLines(TWriter* Writer);
};

/// A multi-line text box: 185 by 89.
class FK_API TMemo : public TWinControl {
  FK_CLASS(TMemo, TWinControl)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// The lines, the memo's own.
  TStrings* Lines() const noexcept { return FLines.Get(); }
  /// Copies `Value`'s lines.
  void SetLines(TStrings* Value) { FLines->Assign(Value); }
  bool WordWrap() const noexcept { return FWordWrap; }
  void SetWordWrap(bool Value) noexcept { FWordWrap = Value; }
  TScrollStyle ScrollBars() const noexcept { return FScrollBars; }
  void SetScrollBars(TScrollStyle Value) noexcept { FScrollBars = Value; }
  bool ReadOnly() const noexcept { return FReadOnly; }
  void SetReadOnly(bool Value) noexcept { FReadOnly = Value; }

  /// The caret as a byte offset into the lines' text.
  int SelStart() const noexcept { return FSelStart; }
  /// Moves the caret, kept inside the text; a move is told through `OnSelectionChange`.
  void SetSelStart(int Value);
  /// The line of the caret, from 0.
  int CaretLine() const;
  /// The caret's offset from the start of its line.
  int CaretColumn() const;

  /// A key went down: `OnKeyDown` hears it.
  void KeyDown(std::uint16_t& Key, TShiftState Shift);

  /// Called after the lines changed, outside design and loading.
  TNotifyEvent OnChange;
  /// Called after the caret moved, outside design and loading.
  TNotifyEvent OnSelectionChange;
  TKeyEvent OnKeyDown;

private:
  void LinesChanged(TObject* Sender);
  /// Tells `Event` unless on design or loading.
  void Tell(const TNotifyEvent& Event);
  /// The offset at which line `Line` starts in the text.
  int LineStart(int Line) const;

  TObjectGuard<TStoredStrings> FLines;
  bool FWordWrap = true;
  TScrollStyle FScrollBars = ssNone;
  bool FReadOnly = false;
  int FSelStart = 0;
};

} // namespace formkit
