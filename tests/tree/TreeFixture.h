//===- tests/tree/TreeFixture.h - Structure trees of real Kiln modules ---===//
//
// The Kiln designer at work with the structure tree joined to the design core
// and listening to the designers, a host structure view that records what it
// is told and whose selection a test sets, and helpers that draw a tree as
// indented text.
//
// Example:
//   IPtr<IRoot> Form1 = NewForm("Form1");
//   Add<TButton>(Form1);
//   EXPECT_EQ(Tree(Form1), "Form1\n  Button1\n");
//
//===----------------------------------------------------------------------===//
#pragma once

#include "tests/fakes/RecordingServices.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"
#include "tree/RootSprig.h"
#include "tree/SprigRegistry.h"

#include <gtest/gtest.h>

namespace formkit::fakes {

/// A node of the host's view standing for a sprig; its parent node is set by the test.
class TViewNode : public TInterfacedObject, public IOTAStructureNode, public ISprig {
  FK_CLASS(TViewNode, TInterfacedObject)
  FK_INTERFACES(IOTAStructureNode, ISprig)
  explicit TViewNode(TSprig* Sprig = nullptr, IPtr<IOTAStructureNode> Parent = nullptr)
      : FSprig(Sprig), FParent(std::move(Parent)) {}
  IPtr<IOTAStructureNode> GetParent() override { return FParent; }
  TSprig* GetSprig() override { return FSprig; }

private:
  TSprig* FSprig;
  IPtr<IOTAStructureNode> FParent;
};

/// A context of the host's view with nothing of its own.
class TViewContext : public TInterfacedObject, public IOTAStructureContext {
  FK_CLASS(TViewContext, TInterfacedObject)
  FK_INTERFACES(IOTAStructureContext)
};

/// The host's service object with a structure view: its context and selection are set by
/// the test, and what the tree tells it goes to the log.
class TStructureViewBase : public TInterfacedObject, public IHalvernIDEServices, public IOTAStructureView280 {
  FK_CLASS(TStructureViewBase, TInterfacedObject)
  FK_INTERFACES(IHalvernIDEServices, IOTAStructureView280)
};

class TStructureViewHost : public TStructureViewBase {
  FK_CLASS(TStructureViewHost, TStructureViewBase)
  explicit TStructureViewHost(TCallLog* Log) : FLog(Log) {}

  IPtr<IOTAStructureContext> Context;
  std::vector<IPtr<IOTAStructureNode>> Selected;
  /// The palette the host offers beside the view; none by default.
  IPtr<IOTAPaletteServices> Palette;

  void* GetInterfaceEntry(const TGUID& IID) override {
    if (Palette && detail::ChainHas<IOTAPaletteServices>(IID)) return Palette.Get();
    return inherited::GetInterfaceEntry(IID);
  }
  bool QueryInterface(const TGUID& IID, void** Obj) override {
    if (Palette && detail::ChainHas<IOTAPaletteServices>(IID)) return Palette->QueryInterface(IID, Obj);
    return GetInterface(IID, Obj);
  }

  IPtr<IOTAStructureContext> GetCurrentContext() override { return Context; }
  IPtr<IOTAStructureNode> GetFirstSelected() override { return Selected.empty() ? nullptr : Selected.front(); }
  IPtr<IOTAStructureNode> GetNextSelected(const IPtr<IOTAStructureNode>& Node) override {
    for (std::size_t I = 0; I + 1 < Selected.size(); ++I)
      if (Selected[I].Get() == Node.Get()) return Selected[I + 1];
    return nullptr;
  }
  int GetSelectedCount() override { return static_cast<int>(Selected.size()); }
  void StructureChanged(bool Deferred) override {
    FLog->Add(Deferred ? "View.StructureChanged(True)" : "View.StructureChanged(False)");
    Selected.clear(); // the view rebuilds its nodes and loses its selection
  }
  void SelectNode(const IPtr<IOTAStructureNode>& Node) override {
    FLog->Add("View.SelectNode");
    Selected.push_back(Node);
  }

private:
  TCallLog* FLog;
};

/// A host view with the update bracket, a busy flag and a selection the test sets.
class TBridgeView : public TInterfacedObject, public IHalvernIDEServices, public IOTAStructureView290 {
  FK_CLASS(TBridgeView, TInterfacedObject)
  FK_INTERFACES(IHalvernIDEServices, IOTAStructureView290)
  explicit TBridgeView(TCallLog* Log) : FLog(Log) {}

  IPtr<IOTAStructureContext> Context;
  std::vector<IPtr<IOTAStructureNode>> Selected;
  bool Busy = false;

  IPtr<IOTAStructureContext> GetCurrentContext() override { return Context; }
  IPtr<IOTAStructureNode> GetFirstSelected() override { return Selected.empty() ? nullptr : Selected.front(); }
  IPtr<IOTAStructureNode> GetNextSelected(const IPtr<IOTAStructureNode>& Node) override {
    for (std::size_t I = 0; I + 1 < Selected.size(); ++I)
      if (Selected[I].Get() == Node.Get()) return Selected[I + 1];
    return nullptr;
  }
  int GetSelectedCount() override { return static_cast<int>(Selected.size()); }
  void StructureChanged(bool Deferred) override {
    FLog->Add(Deferred ? "View.StructureChanged(True)" : "View.StructureChanged(False)");
  }
  void SelectNode(const IPtr<IOTAStructureNode>& Node) override {
    FLog->Add("View.SelectNode");
    Selected.push_back(Node);
  }
  void BeginUpdate() override { FLog->Add("View.BeginUpdate"); }
  void EndUpdate() override { FLog->Add("View.EndUpdate"); }
  void ClearSelection() override {
    FLog->Add("View.ClearSelection");
    Selected.clear();
  }
  TOTABool GetBusy() override { return ToOTABool(Busy); }

private:
  TCallLog* FLog;
};

struct TreeFixture : KilnDesignFixture {
  /// Whether the Kiln package's own sprigs stay registered; without them the tree shows
  /// what the core's default sprigs make of a module.
  bool FrameworkSprigs = false;

  void SetUp() override {
    InitializeStructureTree();
    KilnDesignFixture::SetUp();
    if (!FrameworkSprigs) {
      detail::StopSprigRegistries();
      detail::StartSprigRegistries();
      detail::RegisterDefaultSprigs();
    }
    InitDesignNotification();
  }
  void TearDown() override {
    HalvernIDEServices = nullptr;
    KilnDesignFixture::TearDown();
    GShowClassNameInTreeView = false;
    EXPECT_EQ(RootSprigList()->Count(), 0) << "a closed module's tree outlived it";
    DoneDesignNotification();
  }

  template <class T> T* Add(const IPtr<IRoot>& Root, TComponent* Parent = nullptr) {
    return static_cast<T*>(
        KilnRoot(Root)->CreateComponent(T::StaticClass(), Parent ? Parent : Root->GetRoot(), 8, 8, 75, 25));
  }
  static IPtr<IDesigner> DesignerOf(const IPtr<IRoot>& Root) { return QueryAs<IDesigner>(Root); }
  /// The root sprig of the module, refreshed.
  static TRootSprig* RootOf(const IPtr<IRoot>& Root) {
    TRootSprig* Sprig = nullptr;
    if (!RootSprigList()->FindRoot(DesignerOf(Root), Sprig)) return nullptr;
    Sprig->RefreshTreeView();
    return Sprig;
  }
  /// The tree as captions, two blanks of indentation a level.
  static String Draw(TSprig* Sprig, int Depth = 0) {
    String Text = String(static_cast<std::size_t>(Depth) * 2, ' ') + Sprig->Caption() + "\n";
    for (int I = 0; I < Sprig->Count(); ++I) Text += Draw(Sprig->Items(I), Depth + 1);
    return Text;
  }
  static String Tree(const IPtr<IRoot>& Root) {
    TRootSprig* Sprig = RootOf(Root);
    return Sprig ? Draw(Sprig) : String("<no tree>");
  }
  /// Offers the host's structure view through the service object.
  IPtr<TStructureViewHost> OfferView() {
    IPtr<TStructureViewHost> View = New<TStructureViewHost>(&Log);
    HalvernIDEServices = InterfaceOf<IHalvernIDEServices>(View.Get());
    return View;
  }
  /// A node of the view for `Sprig`, which the sprig knows as its own.
  static IPtr<IOTAStructureNode> NodeFor(TSprig* Sprig, IPtr<IOTAStructureNode> Parent = nullptr) {
    IPtr<IOTAStructureNode> Node = InterfaceOf<IOTAStructureNode>(New<TViewNode>(Sprig, std::move(Parent)).Get());
    Sprig->SetStructureNode(Node);
    return Node;
  }
};

} // namespace formkit::fakes
