//===- core/root/RootViews.cpp - Alternate forms of one module ------------===//
//
// A module can be designed in several alternate forms, one per device or
// layout. The module's own root is the master; each alternate form is a view,
// a root of its own that inherits from the master as a descendant module
// inherits from its ancestor, so its file holds only its differences. Its file
// stands beside the master's ("Unit1.Tall.kfm"), its root component is named
// after both ("Form1_Tall").
//
// The host keeps the module's view list, lines "Name=Value", through
// `IDesignerViewModule`; the list and the master's views share their order, so
// an index into one is an index into the other. Operations called on a view
// that concern the set of views go to the master.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"

#include "core/DesignNotifications.h"
#include "core/IDECreators.h"
#include "platform/DeviceInfo.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(sInvalidViewName, "\"%s\" is not a valid view name");

namespace {

TComponentRoot* RootObject(const IPtr<IInternalRoot>& Root) {
  return Root ? dynamic_cast<TComponentRoot*>(Root->Implementor()) : nullptr;
}

} // namespace

//===----------------------------------------------------------------------===//
// Masters and views
//===----------------------------------------------------------------------===//

IPtr<IRoot> TComponentRoot::GetMasterView() {
  if (FAncestorRoot && FModule && FAncestorRoot->GetModule() == FModule) return IPtr<IRoot>(FAncestorRoot);
  return nullptr;
}

TComponentRoot* TComponentRoot::MasterOfView() {
  return GetMasterView() ? RootObject(FAncestorRoot) : nullptr;
}

void TComponentRoot::CheckViewIndex(int Index) const {
  if (Index < 0 || Index >= static_cast<int>(FDesignerViews.size())) throw EListError(SListIndexError, Index);
}

TObjectGuard<TStringList> TComponentRoot::FetchViewList() {
  TObjectGuard<TStringList> List(new TStringList);
  FViewModule->GetViewNames(List.Get());
  return List;
}

int TComponentRoot::GetViewCount() { return static_cast<int>(FDesignerViews.size()); }

IPtr<IRoot> TComponentRoot::GetView(int Index) {
  CheckViewIndex(Index);
  return IPtr<IRoot>(FDesignerViews[static_cast<std::size_t>(Index)].Root);
}

String TComponentRoot::GetViewName(int Index) {
  CheckViewIndex(Index);
  return FDesignerViews[static_cast<std::size_t>(Index)].Name;
}

int TComponentRoot::GetViewIndex(const String& Name) {
  if (TComponentRoot* Master = MasterOfView()) return Master->GetViewIndex(Name);
  for (std::size_t I = 0; I < FDesignerViews.size(); ++I)
    if (CompareText(FDesignerViews[I].Name, Name) == 0) return static_cast<int>(I);
  return -1;
}

//===----------------------------------------------------------------------===//
// Adding and removing
//===----------------------------------------------------------------------===//

int TComponentRoot::InternalAddView(const String& Name, bool Existing, const IPtr<IDatedStream>& Stream) {
  String FileName = Format("%s.%s%s", ChangeFileExt(FFileName, ""), Name, ExtractFileExt(FFileName));
  auto Designer = QueryAs<IBaseComponentDesigner>(FDesigner);
  IPtr<IRoot> View =
      Stream ? Designer->CreateRootFromStream(FModule, FileName, FFileSystem, Stream, AsRoot(), Name)
             : Designer->CreateRoot(FModule, FileName, Existing, Format("%s_%s", GetRootName(), Name), GetRootName(),
                                    FFileSystem, AsRoot(), Name);
  FDesignerViews.push_back({Name, QueryAs<IInternalRoot>(View)});
  return static_cast<int>(FDesignerViews.size()) - 1;
}

int TComponentRoot::AddView(const String& Name) {
  if (TComponentRoot* Master = MasterOfView()) return Master->AddView(Name);
  if (!FViewModule) return -1;
  TObjectGuard<TStringList> List = FetchViewList();
  if (List->IndexOfName(Name) >= 0) throw EComponentDesignerException(sDuplicateViewName, Name);
  // The view's name becomes part of a component name and of a file name.
  if (!IsValidIdent(Name)) throw EComponentDesignerException(sInvalidViewName, Name);
  String Attribute;
  FViewModule->GetDeviceAttributeName(Attribute);
  TDeviceInfo* Device = TDeviceInfo::GetDeviceByID(Name);
  String Value = Device && Device->HasAttribute(Attribute) ? Device->GetAttribute(Attribute) : String();
  // An empty value would delete the line and part the list from the views.
  List->SetValues(Name, Value.empty() ? " " : Value);
  int Index = InternalAddView(Name, false, nullptr);
  FViewModule->SetViewNames(List.Get());
  if (Index >= 0) DesignNotificationViewAdded(AsDesigner(), Name);
  return Index;
}

void TComponentRoot::RemoveView(const String& Name) {
  if (TComponentRoot* Master = MasterOfView()) return Master->RemoveView(Name);
  int Index = GetViewIndex(Name);
  if (Index < 0) throw EComponentDesignerException(sViewDoesntExist, Name);
  RemoveView(Index);
}

void TComponentRoot::RemoveView(int Index) {
  if (TComponentRoot* Master = MasterOfView()) return Master->RemoveView(Index);
  if (!FViewModule) return;
  CheckViewIndex(Index);
  TDesignerView View = FDesignerViews[static_cast<std::size_t>(Index)];
  TObjectGuard<TStringList> List = FetchViewList();
  String Name = View.Name;
  if (Index < List->Count()) {
    Name = List->Names(Index);
    List->Delete(Index);
  }
  View.Root->Close();
  FDesignerViews.erase(FDesignerViews.begin() + Index);
  View.Root = nullptr;
  FViewModule->SetViewNames(List.Get());
  DesignNotificationViewRemoved(AsDesigner(), Name);
}

//===----------------------------------------------------------------------===//
// Opening and closing
//===----------------------------------------------------------------------===//

void TComponentRoot::CreateDesignerViews(const IPtr<IInterface>& Source) {
  if (!FViewModule || MasterOfView()) return;
  TObjectGuard<TStringList> List = FetchViewList();
  auto Creator = QueryAs<IDECreators::IDesignerViewsCreator>(Source);
  if (!Creator) {
    for (int L = 0; L < List->Count(); ++L) InternalAddView(List->Names(L), true, nullptr);
    return;
  }
  for (int I = 0, N = Creator->GetViewCount(); I < N; ++I) {
    String Name;
    Creator->GetViewName(I, Name);
    // A second file for one view would part the list from the views.
    if (GetViewIndex(Name) >= 0) continue;
    if (List->IndexOfName(Name) < 0) List->SetValues(Name, " ");
    IPtr<IInterface> File;
    Creator->GetViewFile(I, File);
    auto Aged = QueryAs<IDECreators::IFileAge>(File);
    if (!Aged) detail::RaiseIntfCastError();
    int Age = Aged->GetAge();
    auto* Bytes = new TBytesStream(IDECreators::FileToBytes(Aged));
    InternalAddView(Name, true, NewAs<IDatedStream, TDatedStreamAdapter>(Bytes, Age, soOwned));
  }
  if (Creator->GetAddListedViews())
    for (int L = 0; L < List->Count(); ++L)
      if (String Name = List->Names(L); GetViewIndex(Name) < 0) InternalAddView(Name, true, nullptr);
  // The creator's views came first: the views take the list's order, and the list keeps
  // only the lines of views that exist, so that an index still names one view in both.
  for (int L = List->Count() - 1; L >= 0; --L)
    if (GetViewIndex(List->Names(L)) < 0) List->Delete(L);
  std::stable_sort(FDesignerViews.begin(), FDesignerViews.end(), [&](const TDesignerView& A, const TDesignerView& B) {
    return List->IndexOfName(A.Name) < List->IndexOfName(B.Name);
  });
  FViewModule->SetViewNames(List.Get());
}

void TComponentRoot::CloseViews() {
  for (auto View = FDesignerViews.rbegin(); View != FDesignerViews.rend(); ++View) View->Root->Close();
}

//===----------------------------------------------------------------------===//
// The view shown
//===----------------------------------------------------------------------===//

IPtr<IRoot> TComponentRoot::GetActiveView() {
  if (TComponentRoot* Master = MasterOfView()) return Master->GetActiveView();
  if (FActiveView < 0) return AsRoot();
  CheckViewIndex(FActiveView);
  return IPtr<IRoot>(FDesignerViews[static_cast<std::size_t>(FActiveView)].Root);
}

void TComponentRoot::SetActiveView(const IPtr<IRoot>& View) {
  if (TComponentRoot* Master = MasterOfView()) return Master->SetActiveView(View);
  auto Internal = QueryAs<IInternalRoot>(View);
  if (!Internal) return;
  if (Internal->Implementor() == this) {
    FActiveView = -1;
    return;
  }
  for (std::size_t I = 0; I < FDesignerViews.size(); ++I)
    if (FDesignerViews[I].Root.Get() == Internal.Get()) {
      FActiveView = static_cast<int>(I);
      return;
    }
  throw EArgumentException(SArgumentInvalid);
}

void TComponentRoot::GetViewPreview(const String& ViewName, TPersistent* Bitmap) {
  if (TComponentRoot* Master = MasterOfView()) return Master->GetViewPreview(ViewName, Bitmap);
  if (int Index = GetViewIndex(ViewName); Index >= 0)
    FDesignerViews[static_cast<std::size_t>(Index)].Root->GetViewPreview(Bitmap);
  else if (!ViewName.empty())
    RenderViewPreview(ViewName, Bitmap);
}

//===----------------------------------------------------------------------===//
// Windows: a master shows its active view
//===----------------------------------------------------------------------===//

TComponentRoot* TComponentRoot::ShownRoot() {
  if (FActiveView < 0) return this;
  CheckViewIndex(FActiveView);
  return RootObject(FDesignerViews[static_cast<std::size_t>(FActiveView)].Root);
}

void TComponentRoot::Show() {
  if (TComponentRoot* Master = MasterOfView()) {
    Master->SetActiveView(AsRoot());
    ShowRootWindow();
    return;
  }
  ShownRoot()->ShowRootWindow();
}

void TComponentRoot::ShowAs(TShowState State) {
  if (TComponentRoot* Master = MasterOfView()) {
    Master->SetActiveView(AsRoot());
    ShowRootWindowAs(State);
    return;
  }
  if (TComponentRoot* Shown = ShownRoot(); Shown != this) Shown->ShowAs(State);
  else ShowRootWindowAs(State);
}

void TComponentRoot::Hide() {
  if (MasterOfView()) HideRootWindow();
  else ShownRoot()->HideRootWindow();
}

IPtr<IItem> TComponentRoot::GetMasterViewComponent(const IPtr<IItem>& Item) {
  TComponentRoot* Master = MasterOfView();
  if (!Master || !Master->FSurface) return Item;
  TComponent* Component = ExtractComponent(Item);
  TComponent* Target = (!Component || Component == FRoot) ? Master->FRoot
                                                          : Master->FRoot->FindComponent(Component->Name());
  return Target ? Master->FSurface->ItemFromComponent(Target) : nullptr;
}

} // namespace formkit
