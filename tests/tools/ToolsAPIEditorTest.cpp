//===- tests/tools/ToolsAPIEditorTest.cpp - Code editor names, notifier --===//
//
// The names of the editor's syntax elements, and the notifier base whose
// operations call the event fields that are assigned.
//
//===----------------------------------------------------------------------===//
#include "tools/ToolsAPI.Editor.h"

#include <gtest/gtest.h>

#include <map>

using namespace formkit;

namespace {

TEST(ToolsAPIEditor, SyntaxCodesHaveTheirNames) {
  const std::map<int, const char*> Named = {
      {0, "atWhiteSpace"},      {1, "atComment"},       {2, "atReservedWord"},
      {3, "atIdentifier"},      {4, "atSymbol"},        {5, "atString"},
      {6, "atNumber"},          {7, "atFloat"},         {8, "atOctal"},
      {9, "atHex"},             {10, "atBinary"},       {11, "atCharacter"},
      {12, "atPreproc"},        {13, "atIllegal"},      {14, "atAssembler"},
      {15, "SyntaxOff"},        {16, "MarkedBlock"},    {17, "SearchMatch"},
      {18, "atHotLink"},        {21, "atTags"},         {22, "atAttrNames"},
      {23, "atAttrValues"},     {24, "atScripts"},      {25, "atBraceHighlight"},
      {26, "atLineHighlight"},  {27, "atSearchOtherMatchHighlight"},
      {38, "RightMargin"},      {40, "atFolded"},
  };
  for (int Code = 0; Code <= 255; ++Code) {
    auto It = Named.find(Code);
    String Expected =
        It != Named.end() ? String(It->second) : "SyntaxCode " + std::to_string(Code);
    EXPECT_EQ(OTASyntaxCodeToStr(static_cast<TOTASyntaxCode>(Code)), Expected);
  }
  EXPECT_EQ(OTASyntaxCodeToStr(19), "SyntaxCode 19");
  EXPECT_EQ(OTASyntaxCodeToStr(39), "SyntaxCode 39");
  EXPECT_EQ(OTASyntaxCodeToStr(41), "SyntaxCode 41");
}

/// Receives the notifier's events and writes down what came.
class TRecorder : public TObject {
public:
  void BeginPaint(TComponent* Editor, bool Force) {
    Log += Format("begin %p %s;", static_cast<void*>(Editor), Force ? "full" : "part");
  }
  void Resized(TComponent*) { Log += "resized;"; }
  void Scrolled(TComponent*, TCodeEditorScrollDirection D) {
    Log += Format("scrolled %d;", int(D));
  }
  void Elided(TComponent*, int Line) { Log += Format("elided %d;", Line); }
  void MouseDown(TComponent*, TCodeEditorMouseButton B, TCodeEditorShiftState S, int X, int Y) {
    Log += Format("down %d %d %d,%d;", int(B), int(S.Mask()), X, Y);
  }
  void MouseMove(TComponent*, TCodeEditorShiftState S, int X, int Y) {
    Log += Format("move %d %d,%d;", int(S.Mask()), X, Y);
  }
  void PaintLine(const TRect& R, TPaintLineStage Stage, bool Before, bool& AllowDefault,
                 const IPtr<INTACodeEditorPaintContext>&) {
    Log += Format("line %d %d %s;", R.Top, int(Stage), Before ? "before" : "after");
    AllowDefault = false;
  }
  void PaintText(const TRect&, int Col, const String& Text, TOTASyntaxCode Code, bool, bool,
                 bool& AllowDefault, const IPtr<INTACodeEditorPaintContext>&) {
    Log += Format("text %d '%s' %s;", Col, Text, OTASyntaxCodeToStr(Code));
    AllowDefault = false;
  }
  String Log;
};

TEST(ToolsAPIEditor, CodeEditorNotifierCallsOnlyAssignedEvents) {
  IPtr<TNTACodeEditorNotifier> Notifier = New<TNTACodeEditorNotifier>();
  IPtr<INTACodeEditorEvents> Events = InterfaceOf<INTACodeEditorEvents>(Notifier.Get());
  ASSERT_TRUE(Events);
  EXPECT_TRUE(Supports<IOTANotifier>(Events));

  // Nothing assigned: nothing happens, and default painting stays allowed.
  bool Allow = true;
  Events->BeginPaint(nullptr, true);
  Events->EndPaint(nullptr);
  Events->EditorResized(nullptr);
  Events->EditorScrolled(nullptr, csdVertical);
  Events->EditorElided(nullptr, 3);
  Events->EditorUnElided(nullptr, 3);
  Events->EditorMouseDown(nullptr, cmbLeft, {}, 1, 2);
  Events->EditorMouseMove(nullptr, {}, 1, 2);
  Events->EditorMouseUp(nullptr, cmbLeft, {}, 1, 2);
  Events->PaintLine(Rect(0, 0, 10, 10), plsText, true, Allow, nullptr);
  Events->PaintGutter(Rect(0, 0, 10, 10), pgsMarks, true, Allow, nullptr);
  Events->PaintText(Rect(0, 0, 10, 10), 1, "x", 2, false, true, Allow, nullptr);
  EXPECT_TRUE(Allow);

  TRecorder R;
  Notifier->OnBeginPaint = TCodeEditorBeginPaintEvent::Bind<&TRecorder::BeginPaint>(&R);
  Notifier->OnEditorResized = TCodeEditorNotifyEvent::Bind<&TRecorder::Resized>(&R);
  Notifier->OnEditorScrolled = TCodeEditorScrolledEvent::Bind<&TRecorder::Scrolled>(&R);
  Notifier->OnEditorUnElided = TCodeEditorElisionEvent::Bind<&TRecorder::Elided>(&R);
  Notifier->OnEditorMouseUp = TCodeEditorMouseButtonEvent::Bind<&TRecorder::MouseDown>(&R);
  Notifier->OnEditorMouseMove = TCodeEditorMouseMoveEvent::Bind<&TRecorder::MouseMove>(&R);
  Notifier->OnPaintLine = TCodeEditorPaintLineEvent::Bind<&TRecorder::PaintLine>(&R);
  Notifier->OnPaintText = TCodeEditorPaintTextEvent::Bind<&TRecorder::PaintText>(&R);

  Events->BeginPaint(nullptr, false);
  Events->EndPaint(nullptr);           // not assigned
  Events->EditorResized(nullptr);
  Events->EditorScrolled(nullptr, csdVertical);
  Events->EditorElided(nullptr, 4);    // not assigned
  Events->EditorUnElided(nullptr, 5);
  Events->EditorMouseDown(nullptr, cmbRight, {cskShift}, 7, 8); // not assigned
  Events->EditorMouseUp(nullptr, cmbRight, {cskShift, cskCtrl}, 7, 8);
  Events->EditorMouseMove(nullptr, {cskAlt}, 9, 10);
  Allow = true;
  Events->PaintGutter(Rect(0, 20, 10, 30), pgsMarks, true, Allow, nullptr); // not assigned
  EXPECT_TRUE(Allow);
  Events->PaintLine(Rect(0, 20, 10, 30), plsBackground, true, Allow, nullptr);
  EXPECT_FALSE(Allow);
  Allow = true;
  Events->PaintText(Rect(0, 20, 10, 30), 4, "begin", 2, false, false, Allow, nullptr);
  EXPECT_FALSE(Allow);

  EXPECT_EQ(R.Log, Format("begin %p part;", static_cast<void*>(nullptr)) +
                       "resized;scrolled 1;elided 5;down 1 5 7,8;move 2 9,10;line 20 1 before;"
                       "text 4 'begin' atReservedWord;");
}

TEST(ToolsAPIEditor, CodeEditorNotifierAsksForNothingByDefault) {
  IPtr<INTACodeEditorEvents> Events = NewAs<INTACodeEditorEvents, TNTACodeEditorNotifier>();
  EXPECT_TRUE(Events->AllowedEvents().Empty());
  EXPECT_TRUE(Events->AllowedGutterStages().Empty());
  EXPECT_TRUE(Events->AllowedLineStages().Empty());
  EXPECT_TRUE(Events->UIOptions().Empty());
}

} // namespace
