//===- tests/frameworks/kiln/design/NamesFixture.h - Modules whose names and handlers matter ===//
//
// The Kiln designer at work, with listeners that write what they hear into the
// shared log: the global rename event as "Ev.Renamed(<module>,
// Cur,New)" and the form editor as "FormEditor.Renamed(<module>,Cur,New)".
// `WithInheritance` adds descendants that copy their ancestor and an update
// manager for each module's family.
//
// Example:
//   TEST_F(NamesFixture, Something) {
//     IPtr<IRoot> Form1 = NewForm("Form1");
//     TButton* Ok = Add<TButton>(Form1);           // "Button1"
//     TMethod Click = KilnRoot(Form1)->CreateMethod("OkClick", NotifyEvent());
//   }
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/Events.h"
#include "platform/Filer.h"
#include "tests/fakes/Messages.h"
#include "tests/frameworks/kiln/design/ClassFamily.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include <memory>

namespace formkit::fakes {

/// Writes the global rename event into a log.
class TRenameListener : public TObject {
  FK_CLASS(TRenameListener, TObject)
  TRenameListener() = default;
  explicit TRenameListener(TCallLog* Log) : FLog(Log) {}
  void Renamed(TObject* Sender, const String& CurName, const String& NewName) {
    auto* Root = dynamic_cast<TComponentRoot*>(Sender);
    FLog->Add("Ev.Renamed(" + (Root ? Root->GetRootName() : String("?")) + "," + CurName + "," + NewName + ")");
  }

private:
  TCallLog* FLog = nullptr;
};

struct NamesFixture : KilnDesignFixture {
  std::unique_ptr<TInheritance> Inheritance;
  TObjectGuard<TRenameListener> Listener;

  void SetUp() override {
    KilnDesignFixture::SetUp();
    Listener.Reset(new TRenameListener(&Log));
    EvComponentRenamedEvent->Add(TComponentRenamedEvent::Bind<&TRenameListener::Renamed>(Listener.Get()));
    TRootHooks::NotifyFormEditorRenamed = [this](TComponentRoot& Root, TComponent*, const String& Cur,
                                                 const String& New) {
      Log.Add("FormEditor.Renamed(" + Root.GetRootName() + "," + Cur + "," + New + ")");
    };
  }
  void TearDown() override {
    TRootHooks::NotifyFormEditorRenamed = nullptr;
    TRootHooks::UpdateManagerCanRevert = nullptr;
    TRootHooks::UpdateManagerRevert = nullptr;
    TRootHooks::IsProxyClass = nullptr;
    TRootHooks::ChangeToProxyClass = nullptr;
    KilnDesignFixture::TearDown(); // closes the modules, frees the events and the classes
    Inheritance.reset();
    Listener.Reset();
  }

  /// Descendants copy their ancestor; every module gets its family's update manager.
  void WithInheritance() { Inheritance = std::make_unique<TInheritance>(&Log); }

  /// A new module "Name" inheriting from the open module "AncestorName".
  IPtr<IRoot> NewDescendant(const String& Name, const String& AncestorName, IPtr<TRecordingModule>* ModuleOut = nullptr) {
    return OpenModule(Name, AncestorName, ModuleOut);
  }
  /// A new frame module "Name".
  IPtr<IRoot> NewFrame(const String& Name) { return OpenModule(Name, "Frame"); }
  /// Nests frame module `Frame` in module `Form`, as the reader of modules does.
  TComponent* NestFrame(const IPtr<IRoot>& Frame, const IPtr<IRoot>& Form) {
    TClass Proxy = Frame->GetRoot()->ClassType();
    TRootHooks::IsProxyClass = [Proxy](TClass C) { return C == Proxy; };
    TRootHooks::ChangeToProxyClass = [](TComponent* Instance, TClass Class) { Instance->SetClassType(Class); };
    return KilnRoot(Form)->FrameCreateComponent(Proxy, Form->GetRoot());
  }

  /// A new `T` in module `Root`, under `Parent` (the root for null), named as the module
  /// names it.
  template <class T> T* Add(const IPtr<IRoot>& Root, TComponent* Parent = nullptr, int Top = 8) {
    return static_cast<T*>(
        KilnRoot(Root)->CreateComponent(T::StaticClass(), Parent ? Parent : Root->GetRoot(), 8, Top, 75, 25));
  }
  static const TTypeData* NotifyEvent() { return GetTypeData(TypeInfo<TNotifyEvent>()); }
  static TMethod OnClickOf(TComponent* C) { return GetMethodProp(C, GetPropInfo(C, "OnClick")); }
  static void SetOnClick(TComponent* C, const TMethod& M) { SetMethodProp(C, GetPropInfo(C, "OnClick"), M); }
  /// The calls of the log that start with one of `Prefixes`, in order.
  std::vector<String> CallsOf(std::initializer_list<std::string_view> Prefixes) const {
    std::vector<String> Out;
    for (const String& C : Log.Calls)
      for (std::string_view P : Prefixes)
        if (C.compare(0, P.size(), P) == 0) {
          Out.push_back(C);
          break;
        }
    return Out;
  }
};

} // namespace formkit::fakes
