//===- core/root/RootDormancy.cpp - A module kept as its stream -----------===//
//
// A dormant module keeps only its stream: the root component, the surface and
// the update managers are gone, while the module stays in its designer's list
// and still answers for its name, file, stream and ancestor. `Resurrect` reads
// the same object back to life from that stream.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"

#include "platform/Filer.h"
#include "platform/ScopeGuard.h"

namespace formkit {

void TComponentRoot::GoDormant() {
  if (!GetMasterView())
    for (int I = 0, N = GetViewCount(); I < N; ++I) GetView(I)->GoDormant();
  GetRootStream();
  // The written image becomes the dormant stream itself.
  FDormantStream = std::exchange(FRootStream, nullptr);
  Hide();
  InternalDeinitializeDesigner(true);
  FDesigner->RootGoingDormant(AsRoot());
}

void TComponentRoot::Resurrect() {
  FReadError = false;
  if (FResurrecting || FClosing || !FDormantStream) return;
  FResurrecting = true;
  TMemoryStream* Stream = FDormantStream;
  {
    // Whatever happens, the stream stays the module's until the module is live.
    auto Keep = Finally([this, Stream]() noexcept {
      FDormantStream = Stream;
      FResurrecting = false;
    });
    Stream->SetPosition(0);
    CreateFromStream(Stream, nullptr);
    auto Undo = OnFailure([this]() noexcept {
      FAllowNoSelection = true;
      RunIgnoringExceptions([this] { InternalDeinitializeDesigner(true); });
    });
    InternalInitializeDesigner(true);
    UpdateOptions();
    LoadDependentModules(FRoot);
    ResurrectDependentModules(FRoot);
  }
  FreeAndNil(FDormantStream);
  RejoinDescendants();
  if (FModule && (!FAncestorRoot || FAncestorRoot->GetModule() != FModule)) FModule->ModuleResurrected();
}

void TComponentRoot::RejoinDescendants() {
  if (!TRootHooks::UpdateManagerJoinAncestor || !FRootUpdateManager) return;
  for (int I = 0, N = FDesigner->GetRootsCount(); I < N; ++I) {
    auto Root = QueryAs<IInternalRoot>(FDesigner->GetRoots(I));
    auto Ancestor = Root ? QueryAs<IInternalRoot>(Root->GetAncestorRoot()) : nullptr;
    if (Ancestor && Ancestor->Implementor() == this && Root->GetUpdateManager())
      TRootHooks::UpdateManagerJoinAncestor(Root->GetUpdateManager(), FRoot, FRootUpdateManager);
  }
}

void TComponentRoot::ResurrectDependentModules(TComponent* Root) {
  std::vector<String> Names;
  GetFixupReferenceNames(Root, Names);
  for (const String& Name : Names)
    if (auto Found = QueryAs<IInternalRoot>(FDesigner->FindRoot(Name))) Found->Resurrect();
}

} // namespace formkit
