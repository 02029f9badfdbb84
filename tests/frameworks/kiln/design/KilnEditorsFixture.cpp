//===- tests/frameworks/kiln/design/KilnEditorsFixture.cpp - Kiln value editors at work ===//
#include "tests/frameworks/kiln/design/KilnEditorsFixture.h"

namespace formkit::fakes {

FK_IMPLEMENT(TValueGadget, "KilnEditorsTest") {
  B.Field("Color", &TValueGadget::FColor).Type(&TypeInfo_TColor);
  B.Field("Charset", &TValueGadget::FCharset).Type(&TypeInfo_TFontCharset);
  B.Field("Ime", &TValueGadget::FIme).Type(&TypeInfo_TImeName);
  B.Field("ShortCut", &TValueGadget::FShortCut).Type(&TypeInfo_TShortCut);
  B.Field("Result", &TValueGadget::FResult).Type(&TypeInfo_TModalResult);
  B.Field("BrushStyle", &TValueGadget::FBrushStyle);
  B.Field("PenStyle", &TValueGadget::FPenStyle);
  B.Field("File", &TValueGadget::FFile);
  B.Field("Flag", &TValueGadget::FFlag);
  B.Property("Locked", &TValueGadget::Locked);
  B.Field("Styles", &TValueGadget::FStyles);
  B.Field("Day", &TValueGadget::FDay).Type(&TypeInfo_TDate);
}

FK_IMPLEMENT(TCanvasSpy, "KilnEditorsTest") {}

TCanvasSpy::TCanvasSpy(TCanvas* Canvas) : FCanvas(Canvas) {
  Canvas->Brush()->OnChange = TNotifyEvent::Bind<&TCanvasSpy::Changed>(this);
  Canvas->Pen()->OnChange = TNotifyEvent::Bind<&TCanvasSpy::Changed>(this);
  Canvas->Font()->OnChange = TNotifyEvent::Bind<&TCanvasSpy::Changed>(this);
}

namespace {
String StateOf(TObject* Sender) {
  if (auto* Brush = dynamic_cast<TBrush*>(Sender))
    return "Brush " + ColorToString(Brush->Color()) + " " + GetEnumName(TypeInfo<TBrushStyle>(), Brush->Style());
  if (auto* Pen = dynamic_cast<TPen*>(Sender))
    return "Pen " + ColorToString(Pen->Color()) + " " + GetEnumName(TypeInfo<TPenStyle>(), Pen->Style());
  auto* Font = static_cast<TFont*>(Sender);
  return "Font " + Font->Name();
}
String KindOf(const String& State) { return State.substr(0, State.find(' ')); }
} // namespace

void TCanvasSpy::Changed(TObject* Sender) { FStates.emplace_back(FCanvas->Lines().size(), StateOf(Sender)); }

std::vector<String> TCanvasSpy::Drawn() const {
  std::vector<String> Result;
  std::map<String, String> Shown = FBaseline; // the last state shown of each object, by kind
  auto State = FStates.begin();
  const auto& Lines = FCanvas->Lines();
  for (size_t I = 0; I < Lines.size(); ++I) {
    std::map<String, String> Now = Shown;
    for (; State != FStates.end() && State->first <= I; ++State)
      Now[KindOf(State->second)] = State->second;
    for (const auto& [Kind, Text] : Now)
      if (Shown[Kind] != Text) Result.push_back(Text);
    Shown = std::move(Now);
    Result.push_back(Lines[I]);
  }
  return Result;
}

void TCanvasSpy::Clear() {
  FCanvas->ClearLines();
  FStates.clear();
  // What is in force now is taken as known: only changes are shown.
  FBaseline.clear();
  for (TObject* O : {static_cast<TObject*>(FCanvas->Brush()), static_cast<TObject*>(FCanvas->Pen()),
                     static_cast<TObject*>(FCanvas->Font())})
    FBaseline[KindOf(StateOf(O))] = StateOf(O);
}

void KilnEditorsFixture::SetUp() {
  KilnDesignFixture::SetUp();
  Root = NewForm("Form1");
  Kiln = KilnRoot(Root);
  FormDesigner = Kiln->AsDesigner();
  Canvas.Reset(new TCanvas);
  Spy.Reset(new TCanvasSpy(Canvas.Get()));
  Spy->Clear();
  DialogScript().Clear();
}

void KilnEditorsFixture::TearDown() {
  EXPECT_EQ(DialogScript().PendingAnswers(), 0) << "a scripted dialog never opened";
  DialogScript().Clear();
  FontNamePropertyDisplayFontNames = false;
  PropertyDrawingOffset = 8;
  Spy.Reset();
  Canvas.Reset();
  FormDesigner = nullptr;
  Root = nullptr;
  KilnDesignFixture::TearDown();
}

TValueGadget* KilnEditorsFixture::MakeGadget() {
  auto* G = CreateComponentOf<TValueGadget>(Root->GetRoot());
  G->SetName(Format("Gadget%d", Root->GetRoot()->ComponentCount()));
  return G;
}

IPtr<IProperty> KilnEditorsFixture::PropertyOf(std::initializer_list<TPersistent*> Objects, const String& Name) {
  IPtr<IDesignerSelections> List = CreateSelectionList();
  for (TPersistent* O : Objects) List->Add(O);
  IPtr<IProperty> Found;
  GetComponentProperties(List, tkAny, FormDesigner, [&](const IPtr<IProperty>& P) {
    if (SameText(P->GetName(), Name)) Found = P;
  });
  return Found;
}

std::vector<String> KilnEditorsFixture::ValuesOf(const IPtr<IProperty>& P) {
  std::vector<String> Values;
  P->GetValues([&](const String& S) { Values.push_back(S); });
  return Values;
}

std::vector<String> KilnEditorsFixture::Drawn() {
  std::vector<String> Result = Spy->Drawn();
  Spy->Clear();
  return Result;
}

} // namespace formkit::fakes
