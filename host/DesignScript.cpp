//===- host/DesignScript.cpp - Scripts of design steps ---------------------===//
#include "host/DesignScript.h"

#include "core/DesignIntfClasses.h"
#include "frameworks/kiln/design/KilnDesign.h"
#include "host/DesignHost.h"
#include "platform/FormatSettings.h"
#include "platform/ScopeGuard.h"
#include "platform/TypInfo.h"

#include <filesystem>
#include <fstream>
#include <functional>
#include <ostream>
#include <sstream>

namespace formkit {

FK_RESOURCESTRING(sNoSuchComponent, "Module %s has no component named '%s'");
FK_RESOURCESTRING(sNoSuchProperty, "Component %s has no property '%s'");
FK_RESOURCESTRING(sNotPropertyPath, "'%s' is not of the form NAME.PROPERTY");
FK_RESOURCESTRING(sScriptNotFound, "Script %s not found");
FK_RESOURCESTRING(sScriptLine, "%s:%d: %s");
FK_RESOURCESTRING(sUnknownStep, "unknown step '%s'");
FK_RESOURCESTRING(sStepArguments, "'%s' needs %s");
FK_RESOURCESTRING(sNoModule, "no module is open");
FK_RESOURCESTRING(sNotANumber, "'%s' is not a number");
FK_RESOURCESTRING(sUnknownKey, "unknown key '%s'");
FK_RESOURCESTRING(sExpectation, "%s shows '%s', not '%s'");
FK_RESOURCESTRING(sUnknownHow, "unknown way '%s'");

//===----------------------------------------------------------------------===//
// Properties by path
//===----------------------------------------------------------------------===//

TComponent* ComponentNamed(const IPtr<IRoot>& Root, const String& Name) {
  TComponent* C = Root->GetRoot();
  if (!SameText(Name, Root->GetRootName())) {
    // "Frame11.Button3": a component of a nested frame, through the frame.
    std::istringstream Path(Name);
    for (String Part; C && std::getline(Path, Part, '.');) C = C->FindComponent(Part);
  }
  if (!C) throw EHostNotFound(sNoSuchComponent, Root->GetRootName(), Name);
  return C;
}

std::vector<IPtr<IProperty>> InspectorList(const IPtr<IRoot>& Root, TComponent* Component) {
  IPtr<IDesignerSelections> One = CreateSelectionList();
  One->Add(Component);
  std::vector<IPtr<IProperty>> List;
  GetComponentProperties(One, tkAny, Root->GetDesigner(), [&](const IPtr<IProperty>& P) { List.push_back(P); });
  return List;
}

IPtr<IProperty> InspectorProperty(const IPtr<IRoot>& Root, const String& Path) {
  std::size_t Dot = Path.rfind('.');
  if (Dot == String::npos || Dot == 0 || Dot + 1 == Path.size()) throw EHostError(sNotPropertyPath, Path);
  String Name = Path.substr(0, Dot), Property = Path.substr(Dot + 1);
  for (const IPtr<IProperty>& P : InspectorList(Root, ComponentNamed(Root, Name)))
    if (SameText(P->GetName(), Property)) return P;
  throw EHostNotFound(sNoSuchProperty, Name, Property);
}

void SetPropertyText(const IPtr<IRoot>& Root, const String& Path, const String& Value) {
  InspectorProperty(Root, Path)->SetValue(Value);
}

String PropertyText(const IPtr<IRoot>& Root, const String& Path) { return InspectorProperty(Root, Path)->GetValue(); }

//===----------------------------------------------------------------------===//
// TFileJournal
//===----------------------------------------------------------------------===//

void TFileJournal::Keep(const String& Path) {
  if (FOriginals.count(Path)) return;
  std::ifstream In(Path, std::ios::binary);
  if (!In) {
    FOriginals[Path] = std::nullopt;
    return;
  }
  FOriginals[Path] = std::vector<std::uint8_t>(std::istreambuf_iterator<char>(In), {});
}

void TFileJournal::Restore() noexcept {
  for (const auto& [Path, Bytes] : FOriginals) {
    std::error_code Ignored;
    if (!Bytes) {
      std::filesystem::remove(Path, Ignored);
      continue;
    }
    std::filesystem::permissions(Path, std::filesystem::perms::owner_write, std::filesystem::perm_options::add, Ignored);
    std::ofstream Out(Path, std::ios::binary | std::ios::trunc);
    Out.write(reinterpret_cast<const char*>(Bytes->data()), static_cast<std::streamsize>(Bytes->size()));
  }
}

//===----------------------------------------------------------------------===//
// The steps
//===----------------------------------------------------------------------===//

namespace detail {

class TScriptRun {
public:
  explicit TScriptRun(std::ostream& Out) : FOut(Out) {}

  TDesignSession& Session() noexcept { return FSession; }
  const IPtr<IRoot>& CurrentOrNull() const noexcept { return FCurrent; }
  void Use(const IPtr<IRoot>& Module) { FCurrent = Module; }

  void Step(const std::vector<String>& Words, const String& Rest) {
    const String& Verb = Words[0];
    auto Need = [&](std::size_t Count, const char* What) {
      if (Words.size() < Count + 1) throw EHostError(sStepArguments, Verb, What);
    };
    if (Verb == "open") {
      Need(1, "a FILE");
      Use(FSession.Open(Words[1]));
    } else if (Verb == "new") {
      Need(1, "a FILE");
      Use(FSession.NewModule(Words[1], Words.size() > 2 ? Words[2] : String()));
    } else if (Verb == "use") {
      Need(1, "a module NAME");
      IPtr<IRoot> Found = FSession.Find(Words[1]);
      if (!Found) throw EHostNotFound(sNoModuleNamed, Words[1]);
      Use(Found);
    } else if (Verb == "select") {
      Need(1, "a component NAME");
      bool Add = false;
      for (std::size_t I = 1; I < Words.size(); ++I, Add = true)
        Root()->SelectComponent(ComponentNamed(Current(), Words[I]), Add);
    } else if (Verb == "press" || Verb == "move" || Verb == "release") {
      Need(2, "X Y");
      Mouse(Verb, Number(Words[1]), Number(Words[2]), ShiftOf(Words, 3));
    } else if (Verb == "drag") {
      Need(4, "X1 Y1 X2 Y2");
      Drag(Number(Words[1]), Number(Words[2]), Number(Words[3]), Number(Words[4]), ShiftOf(Words, 5));
    } else if (Verb == "key") {
      Need(1, "a KEY");
      Surface()->KeyDown(KeyOf(Words[1]), ShiftOf(Words, 2));
    } else if (Verb == "create") {
      Need(3, "CLASS X Y");
      TClass Class = GetClass(Words[1]);
      if (!Class) throw EHostNotFound(sUnknownClass, Words[1]);
      FSession.Environment().ToolClass = Class;
      auto Disarm = Finally([this]() noexcept { FSession.Environment().ToolClass = nullptr; });
      int X = Number(Words[2]), Y = Number(Words[3]);
      Drag(X, Y, Words.size() > 5 ? Number(Words[4]) : X, Words.size() > 5 ? Number(Words[5]) : Y, {});
    } else if (Verb == "set" || Verb == "bind") {
      Need(Verb == "set" ? 1 : 2, Verb == "set" ? "NAME.PROP VALUE" : "NAME.EVENT HANDLER");
      SetPropertyText(Current(), Words[1], Verb == "set" ? Rest : Words[2]);
    } else if (Verb == "expect") {
      Need(1, "NAME.PROP VALUE");
      if (String Shown = PropertyText(Current(), Words[1]); Shown != Rest)
        throw EHostError(sExpectation, Words[1], Shown, Rest);
    } else if (Verb == "rename") {
      Need(2, "NAME NEWNAME");
      SetPropertyText(Current(), Words[1] + ".Name", Words[2]);
    } else if (Verb == "copy" || Verb == "cut") {
      TObjectGuard<TMemoryStream> S(new TMemoryStream);
      Root()->CopySelectionToStream(S.Get());
      Root()->CopyStreamToClipboard(S.Get());
      if (Verb == "cut") Root()->DeleteSelection(false);
    } else if (Verb == "paste") {
      TObjectGuard<TMemoryStream> S(Root()->GetClipboardStream());
      TRect At = Words.size() > 2 ? Rect(Number(Words[1]), Number(Words[2]), Number(Words[1]) + 1, Number(Words[2]) + 1)
                                  : TRect{};
      Root()->Activate();
      Root()->PasteSelectionFromStream(S.Get(), nullptr, At);
    } else if (Verb == "delete") {
      Root()->DeleteSelection(false);
    } else if (Verb == "undelete") {
      Root()->Activate();
      Root()->DoUndelete();
    } else if (Verb == "align") {
      Need(1, "HOW");
      Root()->Align(static_cast<TOTAAffect>(EnumOf(TypeInfo<TOTAAffect>(), "af", Words[1])));
    } else if (Verb == "size") {
      Need(1, "HOW");
      Root()->Size(static_cast<TOTASizeAffect>(EnumOf(TypeInfo<TOTASizeAffect>(), "as", Words[1])),
                   Words.size() > 2 ? Number(Words[2]) : 0);
    } else if (Verb == "flip") {
      Root()->FlipChildren(!(Words.size() > 1 && SameText(Words[1], "all")));
    } else if (Verb == "revert") {
      Revert(Words.size() > 1 ? Words[1] : String());
    } else if (Verb == "view") {
      Need(2, "add|remove|show and a NAME");
      View(Words[1], Words[2]);
    } else if (Verb == "views") {
      PrintViews();
    } else if (Verb == "save") {
      Save(Current());
    } else if (Verb == "saveas") {
      Need(1, "a FILE");
      KeepFilesOf(Words[1]);
      FSession.SaveAs(Current(), Words[1]);
    } else if (Verb == "close") {
      FSession.Close(Current());
      FCurrent = FSession.Modules().empty() ? nullptr : FSession.Modules().back();
    } else {
      throw EHostError(sUnknownStep, Verb);
    }
  }

  TFileJournal& Journal() noexcept { return FJournal; }

private:
  void Revert(const String& Answer) {
    if (!Answer.empty() && !SameText(Answer, "yes") && !SameText(Answer, "no")) throw EHostError(sUnknownHow, Answer);
    TDeleteWarnResult Given = Answer.empty() ? dwCancel : SameText(Answer, "yes") ? dwYes : dwNo;
    auto Before = std::exchange(TKilnRoot::DeleteWarningAnswer, [Given](const String&) { return Given; });
    auto Restore = Finally([&Before]() noexcept { TKilnRoot::DeleteWarningAnswer = std::move(Before); });
    Root()->Command(dmRevert);
  }
  /// The master of the current module: the module itself unless it is a view.
  IPtr<IRoot> Master() const {
    IPtr<IRoot> Master = Current()->GetMasterView();
    return Master ? Master : Current();
  }
  void View(const String& How, const String& Name) {
    IPtr<IRoot> Module = Master();
    if (How == "add") {
      Module->AddView(Name);
    } else if (How == "remove") {
      int Index = ViewIndex(Module, Name);
      IPtr<IRoot> Gone = Module->GetView(Index);
      // The master is shown in the place of the view that goes, and is worked on next.
      if (Module->GetActiveView().Get() == Gone.Get()) {
        TDesignSession::RootOf(Module)->SetActiveView(Module);
        Module->Show();
      }
      Module->RemoveView(Index);
      if (FCurrent.Get() == Gone.Get()) Use(Module);
    } else if (How == "show") {
      IPtr<IRoot> Shown = SameText(Name, "master") ? Module : Module->GetView(ViewIndex(Module, Name));
      Shown->Show();
      Use(Shown);
    } else {
      throw EHostError(sUnknownHow, How);
    }
  }
  static int ViewIndex(const IPtr<IRoot>& Module, const String& Name) {
    int Index = Module->GetViewIndex(Name);
    if (Index < 0) throw EComponentDesignerException(sViewDoesntExist, Name);
    return Index;
  }
  void PrintViews() {
    IPtr<IRoot> Module = Master();
    THostModule* Record = FSession.ModuleOf(Module);
    for (int I = 0, N = Module->GetViewCount(); I < N; ++I) {
      String Line = Record && I < static_cast<int>(Record->Source().Views.size()) ? Record->Source().Views[I] : String();
      String Size = Trim(Line.substr(std::min(Line.size(), Line.find('=') + 1)));
      FOut << Module->GetViewName(I) << "\t" << (Size.empty() ? "-" : Size) << "\t"
           << std::filesystem::path(Module->GetView(I)->GetFileName()).filename().string() << "\n";
    }
  }
  const IPtr<IRoot>& Current() const {
    if (!FCurrent || !FCurrent->GetRoot()) throw EHostError(sNoModule);
    return FCurrent;
  }
  TComponentRoot* Root() const { return TDesignSession::RootOf(Current()); }
  TKilnSurface* Surface() const { return KilnSurfaceOf(Current()); }

  static int Number(const String& Text) {
    int Value = 0;
    if (!TryStrToInt(Text, Value)) throw EHostError(sNotANumber, Text);
    return Value;
  }
  /// The value of enumeration `Info` named `Prefix` + `Name`, without regard to case.
  static int EnumOf(PTypeInfo Info, const char* Prefix, const String& Name) {
    int Value = GetEnumValue(Info, Prefix + Name);
    if (Value < 0) throw EHostError(sUnknownHow, Name);
    return Value;
  }
  static TShiftState ShiftOf(const std::vector<String>& Words, std::size_t From) {
    TShiftState Shift;
    for (std::size_t I = From; I < Words.size(); ++I) {
      if (SameText(Words[I], "shift")) Shift.Include(ssShift);
      else if (SameText(Words[I], "ctrl")) Shift.Include(ssCtrl);
      else if (SameText(Words[I], "alt")) Shift.Include(ssAlt);
      else throw EHostError(sUnknownKey, Words[I]);
    }
    return Shift;
  }
  static TDesignKeyCode KeyOf(const String& Name) {
    static const std::pair<const char*, TDesignKeyCode> Keys[] = {
        {"left", dkLeft}, {"right", dkRight}, {"up", dkUp},         {"down", dkDown},
        {"tab", dkTab},   {"enter", dkEnter}, {"escape", dkEscape}, {"delete", dkDelete}};
    for (const auto& [Key, Code] : Keys)
      if (SameText(Name, Key)) return Code;
    throw EHostError(sUnknownKey, Name);
  }
  void Mouse(const String& Verb, int X, int Y, TShiftState Shift) {
    if (Verb == "press") Surface()->MouseDown(X, Y, Shift);
    else if (Verb == "move") Surface()->MouseMove(X, Y);
    else Surface()->MouseUp(X, Y);
  }
  void Drag(int X1, int Y1, int X2, int Y2, TShiftState Shift) {
    Surface()->MouseDown(X1, Y1, Shift);
    Surface()->MouseMove(X2, Y2);
    Surface()->MouseUp(X2, Y2);
  }
  /// The files a save of the module at `Path` may write.
  void KeepFilesOf(const String& Path) {
    std::filesystem::path P(Path);
    for (const char* Extension : {".kfm", ".~kfm", ".$$$", ".fks", ".fks.tmp"})
      FJournal.Keep(std::filesystem::path(P).replace_extension(Extension).string());
  }
  void Save(const IPtr<IRoot>& Module) {
    IPtr<IRoot> Saved = Module->GetMasterView() ? Module->GetMasterView() : Module;
    KeepFilesOf(Saved->GetFileName());
    for (int I = 0, N = Saved->GetViewCount(); I < N; ++I) KeepFilesOf(Saved->GetView(I)->GetFileName());
    FSession.Save(Saved);
  }

  std::ostream& FOut;
  TDesignSession FSession;
  TFileJournal FJournal;
  IPtr<IRoot> FCurrent;
};

} // namespace detail

namespace {

using detail::TScriptRun;

std::vector<String> WordsOf(const String& Line, String& Rest) {
  std::vector<String> Words;
  std::istringstream In(Line);
  for (String W; In >> W;) Words.push_back(W);
  // The rest of the line after the second word, as typed: a value may hold blanks.
  Rest.clear();
  std::size_t At = Line.find_first_not_of(" \t");
  for (int Skip = 0; Skip < 2 && At != String::npos; ++Skip) {
    At = Line.find_first_of(" \t", At);
    if (At != String::npos) At = Line.find_first_not_of(" \t", At);
  }
  if (At != String::npos) Rest = Line.substr(At, Line.find_last_not_of(" \t\r") + 1 - At);
  return Words;
}

} // namespace

//===----------------------------------------------------------------------===//
// TDesignSteps
//===----------------------------------------------------------------------===//

TDesignSteps::TDesignSteps(std::ostream& Out) : FRun(std::make_unique<TScriptRun>(Out)) {}
TDesignSteps::~TDesignSteps() = default;

void TDesignSteps::Step(const std::vector<String>& Words, const String& Rest) { FRun->Step(Words, Rest); }

void TDesignSteps::Step(const std::vector<String>& Words) {
  if (Words.empty()) return;
  String Rest;
  for (std::size_t I = 2; I < Words.size(); ++I) Rest += (I > 2 ? " " : "") + Words[I];
  FRun->Step(Words, Rest);
}

TDesignSession& TDesignSteps::Session() noexcept { return FRun->Session(); }
const IPtr<IRoot>& TDesignSteps::Current() const noexcept { return FRun->CurrentOrNull(); }
void TDesignSteps::Use(const IPtr<IRoot>& Module) { FRun->Use(Module); }
TFileJournal& TDesignSteps::Journal() noexcept { return FRun->Journal(); }

void RunDesignSteps(const std::vector<std::vector<String>>& Steps, std::ostream& Out) {
  TDesignSteps Run(Out);
  auto PutBack = OnFailure([&]() noexcept { Run.Journal().Restore(); });
  for (const std::vector<String>& Words : Steps) Run.Step(Words);
}

void RunDesignScript(const String& Path, std::ostream& Out) {
  std::ifstream In(Path);
  if (!In) throw EHostError(sScriptNotFound, Path);
  TScriptRun Run(Out);
  int LineNumber = 0;
  auto PutBack = OnFailure([&]() noexcept { Run.Journal().Restore(); });
  for (String Line; std::getline(In, Line);) {
    ++LineNumber;
    if (std::size_t Hash = Line.find('#'); Hash != String::npos && Line.compare(0, 4, "set ") != 0) Line.resize(Hash);
    String Rest;
    std::vector<String> Words = WordsOf(Line, Rest);
    if (Words.empty()) continue;
    try {
      Run.Step(Words, Rest);
    } catch (const Exception& E) {
      throw EHostError(sScriptLine, Path, LineNumber, E.Message());
    }
    Out << LineNumber << ": " << Line.substr(Line.find_first_not_of(" \t")) << "\n";
  }
}

} // namespace formkit
