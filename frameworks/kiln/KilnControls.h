//===- frameworks/kiln/KilnControls.h - Controls and windowed controls ---===//
//
// `TControl` is anything with bounds inside a parent; `TWinControl` is a control
// that holds other controls. Bounds are in the parent's client coordinates;
// screen coordinates are found by summing the offsets of the parents. Setting a
// control's parent moves it from one children list to the other and tells both
// parents (`CM_CONTROLCHANGE`) and the control (`CM_PARENTCHANGED`). Children
// with an `Align` other than `alNone` are laid out along the edges of their
// parent's client area whenever the parent's size or its children change.
//
// Streaming: a control is written under its parent; a windowed control lists
// the children that the root owns, in z-order (`GetChildren`), and the reader
// puts them back with `SetParentComponent` and `SetChildOrder`.
//
// Example:
//   auto* Panel = CreateComponentOf<TPanel>(Form);
//   Panel->SetParent(Form);
//   auto* Button = CreateComponentOf<TButton>(Form);
//   Button->SetParent(Panel);
//   Button->SetBounds(8, 8, 75, 25);
//   Button->ClientToScreen({0, 0});   // Form's client origin + Panel + (8, 8)
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnGraphics.h"
#include "frameworks/kiln/KilnMessages.h"

namespace formkit {

class TWinControl;

FK_ENUM(TAlign, std::uint8_t, alNone, alTop, alBottom, alLeft, alRight, alClient)
/// Behaviour flags of a control class. `csAcceptsControls`: a designer may drop
/// children on it. `csSetCaption`: the caption follows the name while they are equal.
/// `csOpaque`: it paints its whole area. `csNoDesignVisible`: hidden on a design surface.
FK_ENUM(TControlStyleFlag, std::uint8_t, csAcceptsControls, csCaptureMouse, csDesignInteractive,
        csClickEvents, csFramed, csSetCaption, csOpaque, csDoubleClicks, csFixedWidth,
        csFixedHeight, csNoDesignVisible, csReplicatable)
FK_SET(TControlStyle, TControlStyleFlag)
FK_ENUM(TMouseButton, std::uint8_t, mbLeft, mbRight, mbMiddle)

/// A mouse cursor: built-in shapes are negative.
using TCursor = std::int16_t;
FK_SUBRANGE(TCursor, std::int16_t, -32768, 32767)
inline constexpr TCursor crDefault = 0;
inline constexpr TCursor crNone = -1;
inline constexpr TCursor crArrow = -2;
inline constexpr TCursor crCross = -3;
inline constexpr TCursor crIBeam = -4;
inline constexpr TCursor crSizeNESW = -6;
inline constexpr TCursor crSizeNS = -7;
inline constexpr TCursor crSizeNWSE = -8;
inline constexpr TCursor crSizeWE = -9;
inline constexpr TCursor crDrag = -12;
inline constexpr TCursor crNoDrop = -13;
inline constexpr TCursor crHourGlass = -11;
inline constexpr TCursor crHandPoint = -21;
inline constexpr TCursor crSizeAll = -22;

/// The text a control shows: its type record lets editors tell captions from other strings.
FK_ALIAS(TCaption, tkUString)
/// Position among the windowed siblings; -1 without a parent. A parent may hold any
/// number of children, so the type spans every position a saved module can carry.
FK_SUBRANGE(TTabOrder, std::int32_t, -1, 2147483647)

/// The pixels per inch a control is laid out for when nothing else is known.
inline constexpr int DefaultPPI = 96;

/// Set by a host to tell the pixels per inch of the monitor a control shows on; when it
/// answers a positive number, `TControl::CurrentPPI` gives that.
FK_API extern std::function<int(const class TControl* Control)> ControlPPIHook;

//===----------------------------------------------------------------------===//
// TControl
//===----------------------------------------------------------------------===//

/// A rectangle inside a windowed parent.
class FK_API TControl : public TComponent, public TMessageTarget {
  FK_CLASS(TControl, TComponent)

  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  // Bounds ----------------------------------------------------------------
  int Left() const noexcept { return FLeft; }
  int Top() const noexcept { return FTop; }
  int Width() const noexcept { return FWidth; }
  int Height() const noexcept { return FHeight; }
  void SetLeft(int Value) { SetBounds(Value, FTop, FWidth, FHeight); }
  void SetTop(int Value) { SetBounds(FLeft, Value, FWidth, FHeight); }
  void SetWidth(int Value) { SetBounds(FLeft, FTop, Value, FHeight); }
  void SetHeight(int Value) { SetBounds(FLeft, FTop, FWidth, Value); }
  /// Moves and sizes in one step; negative sizes become 0. The parent re-aligns its
  /// children when an aligned child changes, and this control re-aligns its own
  /// children when its size changes.
  virtual void SetBounds(int ALeft, int ATop, int AWidth, int AHeight);
  /// The bounds in the parent's client coordinates.
  TRect BoundsRect() const noexcept { return Bounds(FLeft, FTop, FWidth, FHeight); }
  void SetBoundsRect(const TRect& R) { SetBounds(R.Left, R.Top, R.Width(), R.Height()); }
  /// The size of the client area; the bounds less any frame.
  virtual int ClientWidth() const { return FWidth; }
  virtual int ClientHeight() const { return FHeight; }
  void SetClientWidth(int Value);
  void SetClientHeight(int Value);
  /// (0, 0, ClientWidth, ClientHeight).
  TRect ClientRect() const { return Rect(0, 0, ClientWidth(), ClientHeight()); }
  /// Where the client area starts inside the bounds (a frame's width, a caption's height).
  virtual TPoint ClientOffset() const { return {0, 0}; }
  /// The screen position of the client area's top-left corner: the sum of the offsets of
  /// this control and all its parents.
  TPoint ClientOrigin() const;
  TPoint ClientToScreen(TPoint P) const;
  TPoint ScreenToClient(TPoint P) const;
  /// A point of this control's client area in the client coordinates of `AParent`, which
  /// must be this control or one of its parents; raises `EInvalidOperation` otherwise.
  TPoint ClientToParent(TPoint P, const TWinControl* AParent) const;
  TPoint ParentToClient(TPoint P, const TWinControl* AParent) const;

  // Parent ----------------------------------------------------------------
  TWinControl* Parent() const noexcept { return FParent; }
  /// Moves the control into `Value`'s children (or out of any with null). Raises
  /// `EInvalidOperation` when `Value` is this control or one of its children, and then
  /// nothing has changed.
  void SetParent(TWinControl* Value);
  /// True when this control is `Other` or lies inside it.
  bool HasAncestor(const TControl* Other) const noexcept;

  // State -----------------------------------------------------------------
  bool Visible() const noexcept { return FVisible; }
  void SetVisible(bool Value);
  void Show() { SetVisible(true); }
  void Hide() { SetVisible(false); }
  /// Visible, and every parent showing. A control without a parent shows when visible.
  bool Showing() const noexcept;
  bool Enabled() const noexcept { return FEnabled; }
  void SetEnabled(bool Value);
  TAlign Align() const noexcept { return FAlign; }
  void SetAlign(TAlign Value);
  /// The text the control shows; `Caption` and `Text` are two names of it.
  const String& Caption() const noexcept { return FText; }
  void SetCaption(const String& Value) { SetText(Value); }
  const String& Text() const noexcept { return FText; }
  void SetText(const String& Value);
  TColor Color() const noexcept { return FColor; }
  void SetColor(TColor Value);
  /// The control's font; owned. Changing it turns `ParentFont` off.
  TFont* Font() const noexcept { return FFont.Get(); }
  void SetFont(TFont* Value) { FFont->Assign(Value); }
  /// True while the control takes its parent's font.
  bool ParentFont() const noexcept { return FParentFont; }
  void SetParentFont(bool Value);
  const String& Hint() const noexcept { return FHint; }
  void SetHint(const String& Value) { FHint = Value; }
  TCursor Cursor() const noexcept { return FCursor; }
  void SetCursor(TCursor Value) { FCursor = Value; }
  TControlStyle ControlStyle() const noexcept { return FControlStyle; }
  void SetControlStyle(TControlStyle Value) noexcept { FControlStyle = Value; }
  /// The space the control keeps free around itself, as four widths (left, top, right,
  /// bottom); 3 on each side until set. Not published, and no layout reads it: it places
  /// the guides of a design surface.
  TRect Margins() const noexcept { return FMargins; }
  /// Raises `EInvalidOperation` for a negative width, and then the margins stay.
  void SetMargins(TRect Value);
  /// The pixels per inch the control is laid out for: the host's `ControlPPIHook` when
  /// it answers, else the control's own value (96 until `ScaleForPPI`).
  int CurrentPPI() const;
  /// Scales position and size (and a windowed control's children) from the control's own
  /// pixels per inch to `NewPPI`, which becomes its own. Raises `EInvalidOperation` for a
  /// value below 1.
  virtual void ScaleForPPI(int NewPPI);
  /// `MulDiv(Value, CurrentPPI, 96)`.
  int ScaleValue(int Value) const { return MulDiv(Value, CurrentPPI(), DefaultPPI); }

  // Events ----------------------------------------------------------------
  TNotifyEvent OnClick;
  /// Calls `OnClick`, except on a design surface, where handlers are not live code.
  virtual void Click();

  // Messages --------------------------------------------------------------
  /// Handles a message; the base handles the framework's control messages.
  void WndProc(TMessage& Message) override;
  /// Sends a message to this control at once.
  std::intptr_t Perform(std::uint32_t Msg, std::intptr_t WParam = 0, std::intptr_t LParam = 0) {
    return SendMessage(this, Msg, WParam, LParam);
  }

  // Streaming -------------------------------------------------------------
  bool HasParent() override { return true; }
  TComponent* GetParentComponent() override;
  /// Raises `EInvalidOperation` for a parent that is not a windowed control.
  void SetParentComponent(TComponent* AParent) override;
  void SetName(const String& NewName) override;
  /// Whether Width and Height are written; forms write their client size instead.
  virtual bool IsSizeStored() const { return true; }

protected:
  /// Told of a change of the font or the text (through `CM_FONTCHANGED` and
  /// `CM_TEXTCHANGED`); the default does nothing. Overrides call the inherited handler.
  virtual void FontChanged() {}
  virtual void TextChanged() {}
  /// The size changed (after the new bounds are in place).
  virtual void Resized() {}
  /// Scales by `M / D` and takes `NewPPI` as the control's own pixels per inch.
  virtual void ChangeScale(int M, int D, int NewPPI);
  /// The control's own pixels per inch, which the host's hook does not change.
  int OwnPPI() const noexcept { return FPPI; }
  /// Declares the pixels per inch the bounds are given in, without scaling them.
  void SetOwnPPI(int Value);
  /// Sets the bounds without asking anyone to re-align: the parent's layout uses it.
  void UpdateBounds(int ALeft, int ATop, int AWidth, int AHeight);
  /// Asks the parent to lay out its aligned children, if this one is aligned.
  void RequestAlign();
  void FontChangedHandler(TObject* Sender);
  bool IsLoading() const noexcept { return ComponentState().Contains(csLoading); }

private:
  friend class TWinControl;
  /// Copies the parent's font into the control's, which stays a parent's font.
  void TakeParentFont();
  TWinControl* FParent = nullptr;
  int FLeft = 0;
  int FTop = 0;
  int FWidth = 0;
  int FHeight = 0;
  bool FVisible = true;
  bool FEnabled = true;
  bool FParentFont = true;
  bool FTakingParentFont = false;
  TAlign FAlign = alNone;
  String FText;
  String FHint;
  TColor FColor = clBtnFace;
  TCursor FCursor = crDefault;
  TObjectGuard<TFont> FFont;
  TControlStyle FControlStyle;
  int FPPI = DefaultPPI;
  TRect FMargins{3, 3, 3, 3};
};

//===----------------------------------------------------------------------===//
// TWinControl
//===----------------------------------------------------------------------===//

/// A control that holds controls. Its children are kept in z-order (the last one on
/// top); the windowed ones also in tab order.
class FK_API TWinControl : public TControl {
  FK_CLASS(TWinControl, TControl)

  void BeforeDestruction() override;

  // Children ----------------------------------------------------------------
  int ControlCount() const noexcept { return static_cast<int>(FControls.size()); }
  /// The child at `Index` in z-order; raises `EListError` when out of range.
  TControl* Controls(int Index) const;
  /// The index of `Control` among the children, or -1.
  int IndexOfControl(const TControl* Control) const noexcept;
  /// Makes `AControl` a child (same as `AControl->SetParent(this)`).
  void InsertControl(TControl* AControl);
  /// Takes `AControl` out of the children (same as `AControl->SetParent(nullptr)`);
  /// raises `EInvalidOperation` when it is not a child.
  void RemoveControl(TControl* AControl);
  /// True when a child is there.
  bool ContainsControl(const TControl* Control) const noexcept { return Control && Control->HasAncestor(this); }
  /// The topmost child at a point of the client area: visible (or on a design surface),
  /// enabled unless `AllowDisabled`, windowed only if `AllowWinControls`; with `AllLevels`
  /// the deepest such control. Null when none.
  TControl* ControlAtPos(TPoint Pos, bool AllowDisabled = false, bool AllowWinControls = true,
                         bool AllLevels = false) const;
  /// Moves a child in z-order; `Position` is clamped.
  void SetChildZOrder(TControl* Child, int Position);
  void BringToFront(TControl* Child) { SetChildZOrder(Child, ControlCount() - 1); }
  void SendToBack(TControl* Child) { SetChildZOrder(Child, 0); }
  /// Sends `Message` to each child, first to last, until one answers (a `Result` other
  /// than 0).
  void Broadcast(TMessage& Message);

  // Tab order ---------------------------------------------------------------
  /// The position among the parent's windowed children in tab order; -1 without parent.
  /// Complexity: O(1), after a renumbering of the siblings once the order changed.
  int TabOrder() const noexcept;
  /// Moves within the parent's tab order; the value is clamped. Without a parent it is
  /// kept and applied when the control gets one.
  void SetTabOrder(int Value);
  bool TabStop() const noexcept { return FTabStop; }
  void SetTabStop(bool Value) noexcept { FTabStop = Value; }
  /// The windowed children in tab order.
  const std::vector<TWinControl*>& TabList() const noexcept { return FTabList; }

  // Layout ------------------------------------------------------------------
  /// Lays out the aligned children now (unless disabled or loading).
  void Realign();
  /// Holds layout back until the matching `EnableAlign`, which lays out once.
  void DisableAlign() noexcept { ++FAlignLevel; }
  void EnableAlign();
  bool AlignDisabled() const noexcept { return FAlignLevel > 0; }
  /// The part of the client area that aligned children share; a bevel or border narrows it.
  virtual TRect AlignRect() const { return ClientRect(); }
  /// The space kept free inside the client area, as four widths (left, top, right,
  /// bottom); 0 until set. Not published, and no layout reads it: it places the guides
  /// of a design surface.
  TRect Padding() const noexcept { return FPadding; }
  /// Raises `EInvalidOperation` for a negative width, and then the padding stays.
  void SetPadding(TRect Value);

  // Streaming ---------------------------------------------------------------
  /// The children that `Root` owns, in z-order.
  void GetChildren(const TGetChildProc& Proc, TComponent* Root) override;
  void SetChildOrder(TComponent* Child, int Order) override;
  void Loaded() override;
  /// Reads the properties and children, then puts the children read into the tab order
  /// their stream gave: each position is only meaningful once all siblings are there.
  void ReadState(TReader* Reader) override;

protected:
  /// A child joined (`Inserting`) or left; the default re-aligns.
  virtual void ControlChange(TControl* Child, bool Inserting);
  void WndProc(TMessage& Message) override;
  void Resized() override;
  void FontChanged() override;
  void ChangeScale(int M, int D, int NewPPI) override;
  /// Lays out the aligned children inside `AlignRect`.
  virtual void AlignControls();

private:
  friend class TControl;
  void Attach(TControl* Child);
  void Detach(TControl* Child) noexcept;
  /// Makes room for one more child without copying the lists for each one.
  void ReserveForChild(bool Windowed);
  /// Brings each tab-list member's cached position up to date.
  void RenumberTabList() const noexcept;
  std::vector<TControl*> FControls;
  std::vector<TWinControl*> FTabList;
  /// This control's index in its parent's tab list while the parent's list is numbered.
  mutable int FTabIndex = -1;
  /// True while some member's `FTabIndex` may be stale.
  mutable bool FTabListStale = false;
  int FPendingTabOrder = -1;
  /// The tab position a stream gave while the parent was still reading its children.
  int FReadTabOrder = -1;
  /// Places the children that have a read tab position there, the others in the gaps.
  void FixupTabList();
  int FAlignLevel = 0;
  bool FAligning = false;
  bool FTabStop = false;
  TRect FPadding;
};

/// A control that paints itself and holds no children (a label, a shape).
class FK_API TGraphicControl : public TControl {
  FK_CLASS(TGraphicControl, TControl)
  /// Draws the control onto `Canvas`, in its own client coordinates.
  virtual void Paint(TCanvas* Canvas);
};

/// A windowed control that paints itself.
class FK_API TCustomControl : public TWinControl {
  FK_CLASS(TCustomControl, TWinControl)
  /// Draws the control onto `Canvas`, in its own client coordinates.
  virtual void Paint(TCanvas* Canvas);
};

namespace detail {
// The common published properties, each class choosing those it shows. Templates, so
// that the property records are made for the concrete class.
template <class T> void PublishAlign(TClassBuilder<T>& B) {
  B.Property("Align", &TControl::Align, &TControl::SetAlign).Default(alNone);
}
template <class T> void PublishCaption(TClassBuilder<T>& B) {
  B.Property("Caption", &TControl::Caption, &TControl::SetCaption).Type(&TypeInfo_TCaption);
}
template <class T> void PublishText(TClassBuilder<T>& B) {
  B.Property("Text", &TControl::Text, &TControl::SetText).Type(&TypeInfo_TCaption);
}
template <class T> void PublishColor(TClassBuilder<T>& B, TColor Default) {
  B.Property("Color", &TControl::Color, &TControl::SetColor).Type(&TypeInfo_TColor).Default(Default);
}
template <class T> void PublishEnabled(TClassBuilder<T>& B) {
  B.Property("Enabled", &TControl::Enabled, &TControl::SetEnabled).Default(true);
}
/// `Font` is written only while the control has a font of its own.
template <class T> void PublishFont(TClassBuilder<T>& B) {
  B.Property("Font", &TControl::Font, &TControl::SetFont)
      .Stored(+[](TObject* O) { return !static_cast<TControl*>(O)->ParentFont(); });
  B.Property("ParentFont", &TControl::ParentFont, &TControl::SetParentFont).Default(true);
}
template <class T> void PublishTabOrder(TClassBuilder<T>& B) {
  B.Property("TabOrder", &TWinControl::TabOrder, &TWinControl::SetTabOrder).Type(&TypeInfo_TTabOrder).Default(-1);
}
template <class T> void PublishVisible(TClassBuilder<T>& B, bool Default = true) {
  B.Property("Visible", &TControl::Visible, &TControl::SetVisible).Default(Default);
}
template <class T> void PublishOnClick(TClassBuilder<T>& B) { B.Event("OnClick", &TControl::OnClick); }
} // namespace detail

} // namespace formkit
