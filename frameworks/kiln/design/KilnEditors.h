//===- frameworks/kiln/design/KilnEditors.h - Editors of Kiln's own values ===//
//
// The property editors that know what a Kiln value means: colours, cursors,
// fonts and their faces and character sets, brush and pen styles, shortcuts,
// modal results, file names, dates, and Booleans and set elements shown as
// check boxes. They are where the inspector's owner drawing is defined: an
// editor may paint its value and name (`ICustomPropertyDrawing`), the items of
// its drop-down list (`ICustomPropertyListDrawing`) and react to the mouse
// (`ICustomPropertyMessage`). An inspector that does not ask for these
// interfaces shows the text forms.
//
// Example (an inspector drawing the Color row of a panel):
//   IPtr<IProperty> P = ...;                          // the editor of Panel1.Color
//   if (auto D = QueryAs<ICustomPropertyDrawing80>(P)) {
//     TRect Box = D->PropDrawValueRect(Row);          // the square at the left
//     D->PropDrawValue(Canvas, Box, false);           // the colour box
//   }
//   P->GetValue();                                    // "clBtnFace", written beside it
//
// The host sets `BaseRegistryKey` to keep the custom colours of the colour dialog
// in the registry, and may set `FontNamePropertyDisplayFontNames` and
// `PropertyDrawingOffset` at any time: each drawing reads them.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "editors/ScalarEditors.h"
#include "frameworks/kiln/KilnGraphics.h"
#include "frameworks/kiln/KilnCalendars.h"
#include "frameworks/kiln/KilnControls.h"

namespace formkit {

class TOpenDialog;

//===----------------------------------------------------------------------===//
// Settings the host sets and texts
//===----------------------------------------------------------------------===//

/// Draw each font name of the font name list in its own font. Starts false.
FK_API extern bool FontNamePropertyDisplayFontNames;
/// Left inset, in pixels, of drawn list values. Starts at 8.
FK_API extern int PropertyDrawingOffset;
/// The registry key under which the colour editor keeps the custom colours; empty (the
/// start, and again once the design core stops) keeps none.
FK_API extern String BaseRegistryKey;

/// What a shortcut of 0 shows.
FK_RESOURCESTRING(srNone, "(None)");
/// The filter of the plain file name editor.
FK_RESOURCESTRING(SAllFiles, "All Files (*.*)|*.*");
/// The filter of the media file name editor.
FK_RESOURCESTRING(SMPOpenFilter, "Media files (*.wav;*.mid;*.avi)|*.wav;*.mid;*.avi|All files (*.*)|*.*");
/// The registry section that holds the colour dialog's custom colours.
FK_RESOURCESTRING(SCustomColors, "Custom Colors");

/// The help contexts of the editors' dialogs.
inline constexpr int ColorDialogHelpContext = 25010;
inline constexpr int FontDialogHelpContext = 25000;
inline constexpr int MediaFileDialogHelpContext = 25020;

//===----------------------------------------------------------------------===//
// Owner drawing interfaces
//===----------------------------------------------------------------------===//

/// An editor that paints its name and value itself.
struct FK_API ICustomPropertyDrawing : IInterface {
  FK_INTERFACE(ICustomPropertyDrawing, IInterface, "{E1A50419-1288-4B26-9EFA-6608A35F0824}")
  virtual void PropDrawName(TCanvas* ACanvas, const TRect& ARect, bool ASelected) = 0;
  virtual void PropDrawValue(TCanvas* ACanvas, const TRect& ARect, bool ASelected) = 0;
};
/// Where the painting goes: the inspector draws the ordinary text in what is left.
struct FK_API ICustomPropertyDrawing80 : ICustomPropertyDrawing {
  FK_INTERFACE(ICustomPropertyDrawing80, ICustomPropertyDrawing, "{73100176-DF0B-4900-AA52-4E67D7D04895}")
  virtual TRect PropDrawNameRect(const TRect& ARect) = 0;
  virtual TRect PropDrawValueRect(const TRect& ARect) = 0;
};
/// An editor that measures and paints the items of its value list.
struct FK_API ICustomPropertyListDrawing : IInterface {
  FK_INTERFACE(ICustomPropertyListDrawing, IInterface, "{BE2B8CF7-DDCA-4D4B-BE26-2396B969F8E0}")
  virtual void ListMeasureWidth(const String& Value, TCanvas* ACanvas, int& AWidth) = 0;
  virtual void ListMeasureHeight(const String& Value, TCanvas* ACanvas, int& AHeight) = 0;
  virtual void ListDrawValue(const String& Value, TCanvas* ACanvas, const TRect& ARect, bool ASelected) = 0;
};

/// What a hint about to show says; an editor may change it.
struct THintInfo {
  TControl* HintControl = nullptr;
  TPoint CursorPos;
  TRect CursorRect;
  String HintStr;
  int HideTimeout = 0;
};

/// An editor that reacts to the mouse on its row.
struct FK_API ICustomPropertyMessage : IInterface {
  FK_INTERFACE(ICustomPropertyMessage, IInterface, "{60E3EB3A-23DD-459C-8936-0607A27D11A8}")
  virtual void MouseDown(TMouseButton Button, TShiftState Shift, int X, int Y, bool InNameRect,
                         const TRect& ItemRect, bool& Handled) = 0;
  virtual void MouseMove(TShiftState Shift, int X, int Y, bool InNameRect, const TRect& ItemRect, bool& Handled) = 0;
  virtual void MouseUp(TMouseButton Button, TShiftState Shift, int X, int Y, bool InNameRect,
                       const TRect& ItemRect, bool& Handled) = 0;
  virtual void HintShow(THintInfo& HintInfo, bool InNameRect, const TRect& ItemRect, bool& Handled) = 0;
};

/// What a selection editor may offer to the host; the host and the editor agree on its
/// one operation, which receives a message and answers whether it was handled.
struct FK_API ISelectionMessage : IInterface {
  FK_INTERFACE(ISelectionMessage, IInterface, "{58274878-BB87-406A-9220-904105C9E112}")
  virtual bool IsSelectionMessage(TControl* Sender, TMessage& Message) = 0;
};
struct FK_API ISelectionMessageList : IInterface {
  FK_INTERFACE(ISelectionMessageList, IInterface, "{C1360368-0099-4A7C-A4A8-7650503BA0C6}")
  virtual IPtr<ISelectionMessage> Get(int Index) = 0;
  virtual int GetCount() = 0;
};

/// The selection messages of a list of selection editors.
class FK_API TSelectionMessageList : public TInterfacedObject, public ISelectionMessageList {
  FK_CLASS(TSelectionMessageList, TInterfacedObject)
  FK_INTERFACES(ISelectionMessageList)
  TSelectionMessageList();
  IPtr<ISelectionMessage> Get(int Index) override;
  int GetCount() override;
  void Add(const IPtr<ISelectionMessage>& Message);

private:
  IPtr<IInterfaceList> FList;
};

//===----------------------------------------------------------------------===//
// Drawing helpers
//===----------------------------------------------------------------------===//

/// The value of `Prop` when its objects agree; empty for null or when they differ.
FK_API String GetDisplayValue(const IPtr<IProperty>& Prop);
/// The name of `Prop`, left aligned in `Rect` less `Offset` + 2 at the left.
FK_API void DefaultPropertyDrawName(TPropertyEditor* Prop, TCanvas* Canvas, const TRect& Rect, int Offset = 0);
/// `GetVisualValue` of `Prop`, left aligned in `Rect` less `Offset` + 1 at the left.
FK_API void DefaultPropertyDrawValue(TPropertyEditor* Prop, TCanvas* Canvas, const TRect& Rect, int Offset = 0);
/// Clears `Rect` with the canvas brush and writes `Value` with `Offset` + 1 at the left.
FK_API void DefaultPropertyListDrawValue(const String& Value, TCanvas* Canvas, const TRect& Rect, bool Selected,
                                         int Offset = 0);
/// The wide form: the text at (left + `Offset` + 1, top + 1), clipped to `Rect`.
FK_API void DefaultPropertyListDrawValue(const WideString& Value, TCanvas* Canvas, const TRect& Rect, bool Selected,
                                         int Offset = 0);
/// A check box filling `ARect`: mixed when not all objects agree, else checked or not;
/// disabled ones are drawn in the grey text colour.
FK_API void DrawCheckbox(TCanvas* ACanvas, const TRect& ARect, bool ASelected, bool AEnabled, bool AAllEqual,
                         bool AValue);
/// The editors of `SelectionEditorList` that answer to `ISelectionMessage`, in order;
/// empty for null.
FK_API IPtr<ISelectionMessageList> SelectionMessageListOf(const IPtr<ISelectionEditorList>& SelectionEditorList);

//===----------------------------------------------------------------------===//
// Fonts
//===----------------------------------------------------------------------===//

/// Font faces, offered from the screen's fonts; drawn in their own face when the host
/// asks for it.
class FK_API TFontNameProperty : public TStringProperty, public ICustomPropertyListDrawing {
  FK_CLASS(TFontNameProperty, TStringProperty)
  FK_INTERFACES(ICustomPropertyListDrawing)
  TPropertyAttributes GetAttributes() override;
  void GetValues(const TGetStrProc& Proc) override;
  void ListMeasureWidth(const String& Value, TCanvas* ACanvas, int& AWidth) override;
  void ListMeasureHeight(const String& Value, TCanvas* ACanvas, int& AHeight) override;
  void ListDrawValue(const String& Value, TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
};

/// Character sets by name ("RUSSIAN_CHARSET"), by number when they have none.
class FK_API TFontCharsetProperty : public TIntegerProperty {
  FK_CLASS(TFontCharsetProperty, TIntegerProperty)
  TPropertyAttributes GetAttributes() override;
  String GetValue() override;
  void GetValues(const TGetStrProc& Proc) override;
  /// A name, else the integer parse with its errors.
  void SetValue(const String& Value) override;
};

/// Input method names, offered from the screen's.
class FK_API TImeNameProperty : public TStringProperty {
  FK_CLASS(TImeNameProperty, TStringProperty)
  TPropertyAttributes GetAttributes() override;
  void GetValues(const TGetStrProc& Proc) override;
};

/// A font object: its properties nested, and the font dialog.
class FK_API TFontProperty : public TClassProperty {
  FK_CLASS(TFontProperty, TClassProperty)
  TPropertyAttributes GetAttributes() override;
  /// The font dialog on the present font; what it chooses is written to every object.
  void Edit() override;
};

//===----------------------------------------------------------------------===//
// Colours, brushes and pens
//===----------------------------------------------------------------------===//

/// Colours by name ("clRed") or number, with a colour box beside the text.
class FK_API TColorProperty : public TIntegerProperty, public ICustomPropertyDrawing80,
                              public ICustomPropertyListDrawing {
  FK_CLASS(TColorProperty, TIntegerProperty)
  FK_INTERFACES(ICustomPropertyDrawing, ICustomPropertyDrawing80, ICustomPropertyListDrawing)
  TPropertyAttributes GetAttributes() override;
  String GetValue() override;
  void GetValues(const TGetStrProc& Proc) override;
  /// A name or a colour number, else the integer parse with its errors.
  void SetValue(const String& Value) override;
  /// The colour dialog, with the custom colours kept under `BaseRegistryKey`.
  void Edit() override;

  void ListMeasureWidth(const String& Value, TCanvas* ACanvas, int& AWidth) override;
  void ListMeasureHeight(const String&, TCanvas*, int&) override {}
  void ListDrawValue(const String& Value, TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
  void PropDrawName(TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
  void PropDrawValue(TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
  TRect PropDrawNameRect(const TRect& ARect) override { return ARect; }
  TRect PropDrawValueRect(const TRect& ARect) override;

  /// Paints the colour box of the colour named by `Value` at the left of `Rect`; returns
  /// the part of `Rect` left for the text.
  static TRect PaintColorBox(const String& Value, TCanvas* ACanvas, const TRect& Rect, bool Selected);
};

/// Brush styles, each with a sample of the pattern.
class FK_API TBrushStyleProperty : public TEnumProperty, public ICustomPropertyDrawing,
                                   public ICustomPropertyListDrawing {
  FK_CLASS(TBrushStyleProperty, TEnumProperty)
  FK_INTERFACES(ICustomPropertyDrawing, ICustomPropertyListDrawing)
  void ListMeasureWidth(const String& Value, TCanvas* ACanvas, int& AWidth) override;
  void ListMeasureHeight(const String&, TCanvas*, int&) override {}
  void ListDrawValue(const String& Value, TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
  void PropDrawName(TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
  void PropDrawValue(TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
};

/// Pen styles, each with a sample line twice as wide as high.
class FK_API TPenStyleProperty : public TEnumProperty, public ICustomPropertyDrawing,
                                 public ICustomPropertyListDrawing {
  FK_CLASS(TPenStyleProperty, TEnumProperty)
  FK_INTERFACES(ICustomPropertyDrawing, ICustomPropertyListDrawing)
  /// The styles up to the last drawable one (those of ordinals 7 and 8, if the type has
  /// them, are left out).
  void GetValues(const TGetStrProc& Proc) override;
  void ListMeasureWidth(const String& Value, TCanvas* ACanvas, int& AWidth) override;
  void ListMeasureHeight(const String&, TCanvas*, int&) override {}
  void ListDrawValue(const String& Value, TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
  void PropDrawName(TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
  void PropDrawValue(TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
};

//===----------------------------------------------------------------------===//
// Cursors, shortcuts, modal results
//===----------------------------------------------------------------------===//

/// Cursors by name ("crHandPoint") or number, each drawn with its picture.
class FK_API TCursorProperty : public TIntegerProperty, public ICustomPropertyListDrawing {
  FK_CLASS(TCursorProperty, TIntegerProperty)
  FK_INTERFACES(ICustomPropertyListDrawing)
  TPropertyAttributes GetAttributes() override;
  String GetValue() override;
  void GetValues(const TGetStrProc& Proc) override;
  /// A name, else the integer parse with its errors.
  void SetValue(const String& Value) override;
  void ListMeasureWidth(const String& Value, TCanvas* ACanvas, int& AWidth) override;
  void ListMeasureHeight(const String& Value, TCanvas* ACanvas, int& AHeight) override;
  void ListDrawValue(const String& Value, TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
};

/// Shortcuts by their text ("Ctrl+S"), "(None)" for none.
class FK_API TShortCutProperty : public TOrdinalProperty {
  FK_CLASS(TShortCutProperty, TOrdinalProperty)
  TPropertyAttributes GetAttributes() override;
  String GetValue() override;
  /// "(None)" and the 108 usual shortcuts.
  void GetValues(const TGetStrProc& Proc) override;
  /// Empty text and "(None)" store 0; raises `EDesignPropertyError` "Invalid property
  /// value" for a text that is no shortcut.
  void SetValue(const String& Value) override;
};

/// Modal results by name ("mrOk"), by number beyond the names.
class FK_API TModalResultProperty : public TIntegerProperty {
  FK_CLASS(TModalResultProperty, TIntegerProperty)
  TPropertyAttributes GetAttributes() override;
  String GetValue() override;
  void GetValues(const TGetStrProc& Proc) override;
  /// Empty text stores 0, a name (without regard to case) its number; else the integer
  /// parse with its errors.
  void SetValue(const String& Value) override;
};

/// The names of the modal results 0 to 14, by value.
FK_API const std::vector<String>& ModalResultNames();

//===----------------------------------------------------------------------===//
// File names, tab orders, captions
//===----------------------------------------------------------------------===//

/// A file name chosen with the open dialog.
class FK_API TFileNameProperty : public TStringProperty {
  FK_CLASS(TFileNameProperty, TStringProperty)
  TPropertyAttributes GetAttributes() override;
  /// The open dialog, not started from the present value; its file name is written.
  void Edit() override;
  /// Sets the filter and options of the dialog; a derived editor overrides it.
  virtual void GetDialogOptions(TOpenDialog* Dialog);
};

/// The file name of a media file, chosen with the media open dialog.
class FK_API TMPFilenameProperty : public TStringProperty {
  FK_CLASS(TMPFilenameProperty, TStringProperty)
  TPropertyAttributes GetAttributes() override;
  /// The open dialog started at the present value.
  void Edit() override;
};

/// Tab orders: one object at a time, never reverted.
class FK_API TTabOrderProperty : public TIntegerProperty {
  FK_CLASS(TTabOrderProperty, TIntegerProperty)
  TPropertyAttributes GetAttributes() override { return {}; }
};

/// Captions: every keystroke is written at once.
class FK_API TCaptionProperty : public TStringProperty {
  FK_CLASS(TCaptionProperty, TStringProperty)
  TPropertyAttributes GetAttributes() override;
};

//===----------------------------------------------------------------------===//
// Check boxes
//===----------------------------------------------------------------------===//

/// Booleans drawn as a check box to the right of the rectangle given; a click on the box
/// toggles the value.
class FK_API TBooleanProperty : public TEnumProperty, public ICustomPropertyDrawing80,
                                public ICustomPropertyMessage {
  FK_CLASS(TBooleanProperty, TEnumProperty)
  FK_INTERFACES(ICustomPropertyDrawing, ICustomPropertyDrawing80, ICustomPropertyMessage)
  /// Where the box lies beside `ItemRect`.
  virtual TRect CBRect(const TRect& ItemRect);

  void PropDrawName(TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
  void PropDrawValue(TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
  TRect PropDrawNameRect(const TRect& ARect) override { return ARect; }
  TRect PropDrawValueRect(const TRect& ARect) override;
  void MouseDown(TMouseButton, TShiftState, int, int, bool, const TRect&, bool& Handled) override { Handled = false; }
  void MouseMove(TShiftState, int, int, bool, const TRect&, bool& Handled) override { Handled = false; }
  /// Toggles the value when the click is on the box, outside the name, and the editor
  /// is not read-only.
  void MouseUp(TMouseButton Button, TShiftState Shift, int X, int Y, bool InNameRect, const TRect& ItemRect,
               bool& Handled) override;
  void HintShow(THintInfo&, bool, const TRect&, bool& Handled) override { Handled = false; }
};

namespace KilnEditors {

// These share their names with the general classes they refine, as the unit's own
// versions of them; the unit's name qualifies them.

/// One element of a set, drawn as a check box.
class FK_API TSetElementProperty : public formkit::TSetElementProperty, public ICustomPropertyDrawing80,
                                   public ICustomPropertyMessage {
  FK_CLASS(TSetElementProperty, formkit::TSetElementProperty)
  FK_INTERFACES(ICustomPropertyDrawing, ICustomPropertyDrawing80, ICustomPropertyMessage)
  /// A new editor of element `Element` (its ordinal value) of `Parent`'s set.
  [[nodiscard]] static IPtr<IProperty> CreateFor(TPropertyEditor& Parent, int Element);

  /// Where the box lies beside `ItemRect`.
  TRect CBRect(const TRect& ItemRect);
  /// The element's bit number in the value.
  int Bit() const noexcept { return FBit; }

  void PropDrawName(TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
  /// Checked when the bit is below 32 and set in the value.
  void PropDrawValue(TCanvas* ACanvas, const TRect& ARect, bool ASelected) override;
  TRect PropDrawNameRect(const TRect& ARect) override { return ARect; }
  TRect PropDrawValueRect(const TRect& ARect) override;
  void MouseDown(TMouseButton, TShiftState, int, int, bool, const TRect&, bool& Handled) override { Handled = false; }
  void MouseMove(TShiftState, int, int, bool, const TRect&, bool& Handled) override { Handled = false; }
  /// Toggles the bit in the first object's value and writes the whole value to all.
  void MouseUp(TMouseButton Button, TShiftState Shift, int X, int Y, bool InNameRect, const TRect& ItemRect,
               bool& Handled) override;
  void HintShow(THintInfo&, bool, const TRect&, bool& Handled) override { Handled = false; }
};

/// Sets whose elements are edited by the check box editors of this unit.
class FK_API TSetProperty : public formkit::TSetProperty {
  FK_CLASS(TSetProperty, formkit::TSetProperty)
  void GetProperties(const TGetPropProc& Proc) override;
};

/// The calendar of the date editor's drop-down: it keeps the size set for it when the
/// resolution it shows at changes.
class FK_API TMonthCalendar : public formkit::TMonthCalendar {
  FK_CLASS(TMonthCalendar, formkit::TMonthCalendar)

protected:
  void ChangeScale(int, int, int) override {}
};

/// Dates, with a month calendar dropped down below the value.
class FK_API TDateProperty : public formkit::TDateProperty, public IProperty80 {
  FK_CLASS(TDateProperty, formkit::TDateProperty)
  FK_INTERFACES(IProperty80)
  /// Frees the calendar.
  void BeforeDestruction() override;
  /// The inherited ones and `paCustomDropDown`.
  TPropertyAttributes GetAttributes() override;
  /// Makes a new calendar on the value (today for 0), sized to its smallest rectangle,
  /// and has `Host` drop it down. A double click or Enter writes the calendar's date;
  /// Escape closes the drop-down.
  void Edit(const IPtr<IPropertyHost>& Host, bool DblClick) override;
  /// The calendar of the last drop-down; owned by the editor.
  TMonthCalendar* Calendar() const noexcept { return FControl.Get(); }

  // The operations this editor serves through both of its property interfaces.
  void Activate() override { formkit::TDateProperty::Activate(); }
  bool AllEqual() override { return formkit::TDateProperty::AllEqual(); }
  bool AutoFill() override { return formkit::TDateProperty::AutoFill(); }
  void Edit() override { formkit::TDateProperty::Edit(); }
  bool HasInstance(TPersistent* Instance) override { return formkit::TDateProperty::HasInstance(Instance); }
  int GetEditLimit() override { return formkit::TDateProperty::GetEditLimit(); }
  bool GetEditValue(String& Value) override { return formkit::TDateProperty::GetEditValue(Value); }
  String GetName() override { return formkit::TDateProperty::GetName(); }
  void GetProperties(const TGetPropProc& Proc) override { formkit::TDateProperty::GetProperties(Proc); }
  PPropInfo GetPropInfo() override { return formkit::TDateProperty::GetPropInfo(); }
  PTypeInfo GetPropType() override { return formkit::TDateProperty::GetPropType(); }
  String GetValue() override { return formkit::TDateProperty::GetValue(); }
  void GetValues(const TGetStrProc& Proc) override { formkit::TDateProperty::GetValues(Proc); }
  void Revert() override { formkit::TDateProperty::Revert(); }
  void SetValue(const String& Value) override { formkit::TDateProperty::SetValue(Value); }
  bool ValueAvailable() override { return formkit::TDateProperty::ValueAvailable(); }

private:
  void CalendarDblClick(TObject* Sender);
  void CalendarKeyPress(TObject* Sender, char& Key);
  TObjectGuard<TMonthCalendar> FControl;
  /// The inspector that shows the drop-down: a back reference, since the inspector holds
  /// this editor while the calendar is down.
  IPropertyHost* FHost = nullptr;
};

} // namespace KilnEditors

namespace detail {
/// Keeps a canvas's font, pen and brush and puts them back when it goes: the state an
/// owner-drawn value borrows.
class FK_API TSavedCanvasState {
public:
  explicit TSavedCanvasState(TCanvas* Canvas);
  ~TSavedCanvasState();
  TSavedCanvasState(const TSavedCanvasState&) = delete;
  TSavedCanvasState& operator=(const TSavedCanvasState&) = delete;

private:
  TCanvas* FCanvas;
  TObjectGuard<TFont> FFont;
  TObjectGuard<TPen> FPen;
  TObjectGuard<TBrush> FBrush;
};
/// Writes `Text` in `R` left aligned at `Left`, centred vertically.
FK_API void DrawTextLine(TCanvas* Canvas, const TRect& R, int Left, const String& Text);
} // namespace detail

//===----------------------------------------------------------------------===//
// Registration
//===----------------------------------------------------------------------===//

/// Registers the editors for Kiln's value types (colours, cursors, font faces, character
/// sets, input methods, brush and pen styles, shortcuts, modal results and a button's,
/// tab orders, captions, fonts, Booleans, font styles and open options, dates) in the
/// editor group in force, and joins the unit's finalisation to the stop of the core.
/// File name editors serve no type of their own: a package registers them by property.
FK_API void RegisterKilnEditors();
/// Clears `BaseRegistryKey`: the unit's finalisation, run when the design core stops.
FK_API void UnregisterKilnEditors() noexcept;

} // namespace formkit
