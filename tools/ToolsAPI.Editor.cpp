//===- tools/ToolsAPI.Editor.cpp - Code editor names and notifier base ---===//
//
// The names of the syntax elements of the code editor and the notifier base
// whose operations call its event fields.
//
//===----------------------------------------------------------------------===//
#include "tools/ToolsAPI.Editor.h"

namespace formkit {

String OTASyntaxCodeToStr(TOTASyntaxCode Code) {
  switch (Code) {
  case 0: return "atWhiteSpace";
  case 1: return "atComment";
  case 2: return "atReservedWord";
  case 3: return "atIdentifier";
  case 4: return "atSymbol";
  case 5: return "atString";
  case 6: return "atNumber";
  case 7: return "atFloat";
  case 8: return "atOctal";
  case 9: return "atHex";
  case 10: return "atBinary";
  case 11: return "atCharacter";
  case 12: return "atPreproc";
  case 13: return "atIllegal";
  case 14: return "atAssembler";
  case 15: return "SyntaxOff";
  case 16: return "MarkedBlock";
  case 17: return "SearchMatch";
  case 18: return "atHotLink";
  case 21: return "atTags";
  case 22: return "atAttrNames";
  case 23: return "atAttrValues";
  case 24: return "atScripts";
  case 25: return "atBraceHighlight";
  case 26: return "atLineHighlight";
  case 27: return "atSearchOtherMatchHighlight";
  case 38: return "RightMargin";
  case 40: return "atFolded";
  default: return Format("SyntaxCode %d", static_cast<int>(Code));
  }
}

//===----------------------------------------------------------------------===//
// TNTACodeEditorNotifier
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TNTACodeEditorNotifier, "ToolsAPI.Editor") {}

void TNTACodeEditorNotifier::AfterSave() { TNotifierObject::AfterSave(); }
void TNTACodeEditorNotifier::BeforeSave() { TNotifierObject::BeforeSave(); }
void TNTACodeEditorNotifier::Destroyed() { TNotifierObject::Destroyed(); }
void TNTACodeEditorNotifier::Modified() { TNotifierObject::Modified(); }

void TNTACodeEditorNotifier::BeginPaint(TComponent* Editor, bool ForceFullRepaint) {
  if (OnBeginPaint) OnBeginPaint(Editor, ForceFullRepaint);
}

void TNTACodeEditorNotifier::EndPaint(TComponent* Editor) {
  if (OnEndPaint) OnEndPaint(Editor);
}

void TNTACodeEditorNotifier::EditorResized(TComponent* Editor) {
  if (OnEditorResized) OnEditorResized(Editor);
}

void TNTACodeEditorNotifier::EditorScrolled(TComponent* Editor,
                                            TCodeEditorScrollDirection Direction) {
  if (OnEditorScrolled) OnEditorScrolled(Editor, Direction);
}

void TNTACodeEditorNotifier::EditorElided(TComponent* Editor, int LogicalLineNum) {
  if (OnEditorElided) OnEditorElided(Editor, LogicalLineNum);
}

void TNTACodeEditorNotifier::EditorUnElided(TComponent* Editor, int LogicalLineNum) {
  if (OnEditorUnElided) OnEditorUnElided(Editor, LogicalLineNum);
}

void TNTACodeEditorNotifier::EditorMouseDown(TComponent* Editor, TCodeEditorMouseButton Button,
                                             TCodeEditorShiftState Shift, int X, int Y) {
  if (OnEditorMouseDown) OnEditorMouseDown(Editor, Button, Shift, X, Y);
}

void TNTACodeEditorNotifier::EditorMouseMove(TComponent* Editor, TCodeEditorShiftState Shift,
                                             int X, int Y) {
  if (OnEditorMouseMove) OnEditorMouseMove(Editor, Shift, X, Y);
}

void TNTACodeEditorNotifier::EditorMouseUp(TComponent* Editor, TCodeEditorMouseButton Button,
                                           TCodeEditorShiftState Shift, int X, int Y) {
  if (OnEditorMouseUp) OnEditorMouseUp(Editor, Button, Shift, X, Y);
}

void TNTACodeEditorNotifier::PaintLine(const TRect& Rect, TPaintLineStage Stage,
                                       bool BeforeEvent, bool& AllowDefaultPainting,
                                       const IPtr<INTACodeEditorPaintContext>& Context) {
  if (OnPaintLine) OnPaintLine(Rect, Stage, BeforeEvent, AllowDefaultPainting, Context);
}

void TNTACodeEditorNotifier::PaintGutter(const TRect& Rect, TPaintGutterStage Stage,
                                         bool BeforeEvent, bool& AllowDefaultPainting,
                                         const IPtr<INTACodeEditorPaintContext>& Context) {
  if (OnPaintGutter) OnPaintGutter(Rect, Stage, BeforeEvent, AllowDefaultPainting, Context);
}

void TNTACodeEditorNotifier::PaintText(const TRect& Rect, int ColNum, const String& Text,
                                       TOTASyntaxCode SyntaxCode, bool Hilight,
                                       bool BeforeEvent, bool& AllowDefaultPainting,
                                       const IPtr<INTACodeEditorPaintContext>& Context) {
  if (OnPaintText)
    OnPaintText(Rect, ColNum, Text, SyntaxCode, Hilight, BeforeEvent, AllowDefaultPainting,
                Context);
}

TCodeEditorEvents TNTACodeEditorNotifier::AllowedEvents() { return {}; }
TPaintGutterStages TNTACodeEditorNotifier::AllowedGutterStages() { return {}; }
TPaintLineStages TNTACodeEditorNotifier::AllowedLineStages() { return {}; }
TCodeEditorUIOptions TNTACodeEditorNotifier::UIOptions() { return {}; }

} // namespace formkit
