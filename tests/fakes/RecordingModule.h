//===- tests/fakes/RecordingModule.h - A host module record that records --===//
//
// Implements the host's `IDesignerModule` (and `IOTAModule`, which a module
// record must also answer to) the way a host with a source file would, and
// records every call in the log. Methods "in the source" are a list a test can
// fill; `CheckWritable` refuses while `ReadOnly` is set; each source request
// (create, rename, show a method; rename a component; validate a root name;
// chain a call; insert pasted methods) is logged as it arrives and raises when
// its name is in `Refuse`, so a test sees the exact conversation an IDE would,
// failures included.
//
// Example:
//   IPtr<TRecordingModule> Module = New<TRecordingModule>("Unit1.kfm", &Log);
//   Module->Refuse.insert("RenameComponent");   // the next rename is refused
//   ... Button->SetName("OkButton") ...         // raises "The host refused RenameComponent"
//   EXPECT_EQ(Log.Calls.back(), "RenameComponent(Button1,OkButton)");
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"
#include "core/ToolUtils.h"
#include "tests/fakes/CallLog.h"

#include <set>

namespace formkit::fakes {

class TRecordingModule : public TInterfacedObject, public IDesignerViewModule, public IOTAModule {
  FK_CLASS(TRecordingModule, TInterfacedObject)
  // The view operations are here for `TViewRecordingModule`, which alone answers for them.
  FK_INTERFACES(IDesignerModule, IOTAModule)

  explicit TRecordingModule(String FileName = "Unit1.kfm", TCallLog* Log = nullptr)
      : FLog(Log ? Log : &FOwnLog), FFileName(std::move(FileName)) {}
  TCallLog& Log() { return *FLog; }

  // What the host answers.
  String ModuleIdentifier;
  String UnitName = "Unit1";
  bool ReadOnly = false;
  /// The methods of the source, in order.
  std::vector<String> SourceMethods;
  /// The names of the modules (and units) the module may link to.
  std::vector<String> LinkedModules;
  /// Source requests the host refuses: "CreateMethod", "RenameMethod", "ShowMethod",
  /// "RenameComponent", "ValidateComponentName", "ChainCall", "InsertMethodSource". A
  /// refused request is logged, then raises `EComponentDesignerException` "The host
  /// refused <request>".
  std::set<String> Refuse;
  /// Pasted methods the host leaves out of the source (by their final name).
  std::set<String> SkipInsert;
  /// The last method text a paste offered, as it arrived.
  String InsertedText;
  /// What the host was told of the last object in a rename: "<qualified class> <name
  /// path> [<event>=<handler>,...]" (events without a handler are left out).
  String LastCompInfo;
  /// What the source declares as the class's ancestor ("TForm1"); empty for none.
  String AncestorClassName;

  void Activate(bool) override { FLog->Add("Activate"); }
  void CreateMethod(const String& Name, const IPtr<IEventInfo>&) override {
    Request("CreateMethod", "CreateMethod(" + Name + ")");
    SourceMethods.push_back(Name);
  }
  void Modified() override { FLog->Add("Modified"); }
  String GetModuleIdentifier() override { return ModuleIdentifier; }
  String GetCompUnitName() override { return UnitName; }
  String GetAncestorClassName(const String&) override { return AncestorClassName; }
  void GetMethods(const IPtr<IEventInfo>&, const TGetStrProc& Proc) override {
    for (const String& M : SourceMethods) Proc(M);
  }
  void GetAncestorMethods(const IPtr<IEventInfo>&, const TGetStrProc&) override {}
  bool IsMethodInherited(const String&) override { return false; }
  void ShowSource() override {}
  void ModuleResurrected() override { FLog->Add("ModuleResurrected"); }
  bool MethodExists(const String& Name, const IPtr<IEventInfo>&) override { return IndexOfMethod(Name) >= 0; }
  void RenameComponent(const IPtr<ICompInfo>& Info, const String& CurName, const String& NewName) override {
    LastCompInfo = Describe(Info);
    Request("RenameComponent", "RenameComponent(" + CurName + "," + NewName + ")");
  }
  void ValidateComponentName(const IPtr<ICompInfo>& Info, const String& NewName) override {
    LastCompInfo = Describe(Info);
    Request("ValidateComponentName", "ValidateComponentName(" + NewName + ")");
  }
  void RenameMethod(const String& CurName, const String& NewName) override {
    Request("RenameMethod", "RenameMethod(" + CurName + "," + NewName + ")");
    if (int I = IndexOfMethod(CurName); I >= 0) SourceMethods[static_cast<size_t>(I)] = NewName;
  }
  void ShowMethod(const String& Name) override { Request("ShowMethod", "ShowMethod(" + Name + ")"); }
  void GetComponentNames(const TGetStrProc& Proc) override {
    for (const String& Name : LinkedModules) Proc(Name);
  }
  void MakeComponentLinkable(const String& RootName) override { FLog->Add("MakeComponentLinkable(" + RootName + ")"); }
  void BeforeSave() override { FLog->Add("BeforeSave"); }
  void Notify(TNotifyCode Code) override { FLog->Add("Notify(" + GetEnumName(TypeInfo<TNotifyCode>(), Code) + ")"); }
  void ViewAsText() override { FLog->Add("ViewAsText"); }
  String GetMethodSource(const String& Name) override { return "procedure " + Name + ";\n"; }
  /// Takes each "procedure <Name>;" line of `Text`, renamed as `Renames` says, into the
  /// source unless it is there already or listed in `SkipInsert`, and names it in
  /// `Inserted`.
  void InsertMethodSource(const String& Text, TStrings* Renames, TStrings* Inserted) override {
    InsertedText = Text;
    Request("InsertMethodSource", "InsertMethodSource(" + Renames->CommaText() + ")");
    TObjectGuard<TStringList> Lines(new TStringList);
    Lines->SetText(Text);
    for (int I = 0; I < Lines->Count(); ++I) {
      String Name = MethodOfLine(Lines->Get(I));
      if (Name.empty()) continue;
      if (String Target = Renames->Values(Name); !Target.empty()) Name = Target;
      if (SkipInsert.count(Name) || IndexOfMethod(Name) >= 0) continue;
      SourceMethods.push_back(Name);
      Inserted->Add(Name);
    }
  }
  void GetProjectModules(const TGetModuleProc&) override {}
  bool GetReadOnly() override { return ReadOnly; }
  String GetUnitName() override { return UnitName; }
  void ChainCall(const String& MethodName, const String& InstanceName, const String& InstanceMethod,
                 const IPtr<IEventInfo>&) override {
    Request("ChainCall", "ChainCall(" + MethodName + "," + InstanceName + "," + InstanceMethod + ")");
  }
  void Save() override { FLog->Add("Save"); }
  String GetFileName() override { return FFileName; }
  void CheckWritable() override {
    FLog->Add("CheckWritable");
    if (ReadOnly) throw EComponentDesignerException("The module is read-only");
  }
  void Close() override { FLog->Add("Close"); }

  // IDesignerViewModule, answered by `TViewRecordingModule`
  /// The view list the host keeps, lines "Name=Value".
  std::vector<String> ViewList;
  /// The device attribute the view list takes its values from.
  String DeviceAttributeName = "Size";
  void GetViewNames(TStrings* Strings) override {
    Strings->Clear();
    for (const String& Line : ViewList) Strings->Add(Line);
  }
  void SetViewNames(TStrings* Strings) override {
    FLog->Add("SetViewNames(" + Strings->CommaText() + ")");
    ViewList.clear();
    for (int I = 0; I < Strings->Count(); ++I) ViewList.push_back(Strings->Get(I));
  }
  void GetDeviceAttributeName(String& Name) override { Name = DeviceAttributeName; }

  // IOTAModule
  int GetModuleFileCount() override { return 1; }
  String GetModuleFileName(int) override { return FFileName; }
  int AddNotifier(const IPtr<IOTAModuleNotifier>& Notifier) override {
    return AddToList(Notifiers, QueryAs<IInterface>(Notifier));
  }
  void RemoveNotifier(int Index) override { Notifiers->Put(Index, nullptr); }
  IPtr<IOTAEditor> GetModuleFileEditor(int) override { return nullptr; }
  bool Save(bool, bool) override {
    FLog->Add("SaveModule");
    return true;
  }
  bool CloseModule(bool) override {
    FLog->Add("CloseModule");
    return true;
  }
  void SetFileName(const String& Name) override { FLog->Add("SetFileName(" + Name + ")"); }
  void SetFileSystem(const String& Name) override { FLog->Add("SetFileSystem(" + Name + ")"); }
  /// The module goes away: each of its notifiers hears `Destroyed`.
  void TellDestroyed() { ForEach(Notifiers, &TOTAClass::NotifyDestroyed); }
  /// The module's notifiers; an index is a handle.
  IPtr<IInterfaceList> Notifiers = NewAs<IInterfaceList, TInterfaceList>();

  /// The description `LastCompInfo` holds of `Info`.
  static String Describe(const IPtr<ICompInfo>& Info) {
    String Events;
    for (int I = 0; I < Info->GetEventCount(); ++I)
      if (String Handler = Info->GetEventValue(I); !Handler.empty())
        Events += (Events.empty() ? "" : ",") + Info->GetEventName(I) + "=" + Handler;
    return Info->GetQualifiedClassName() + " " + Info->GetNamePath() + " [" + Events + "]";
  }

private:
  void Request(const String& Kind, const String& Call) {
    FLog->Add(Call);
    if (Refuse.count(Kind)) throw EComponentDesignerException("The host refused " + Kind);
  }
  int IndexOfMethod(const String& Name) const {
    for (size_t I = 0; I < SourceMethods.size(); ++I)
      if (SameText(SourceMethods[I], Name)) return static_cast<int>(I);
    return -1;
  }
  /// "Name" of a line "procedure Name;", else empty.
  static String MethodOfLine(const String& Line) {
    static const String Head = "procedure ";
    if (Line.compare(0, Head.size(), Head) != 0) return "";
    size_t End = Line.find(';', Head.size());
    return End == String::npos ? String() : Line.substr(Head.size(), End - Head.size());
  }

  TCallLog FOwnLog;
  TCallLog* FLog;
  String FFileName;
};

/// A recording module record that also keeps the module's views.
class TViewRecordingModule : public TRecordingModule {
  FK_CLASS(TViewRecordingModule, TRecordingModule)
  FK_INTERFACES(IDesignerViewModule)
  using TRecordingModule::TRecordingModule;
};

} // namespace formkit::fakes
