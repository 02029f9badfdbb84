//===- tests/tools/ToolsAPICatalogueTest.cpp - Tool interface catalogue --===//
//
// Every tool interface is declared and found by name with its parent and its
// fixed identity; the units hold the published counts; parents follow the
// version chains; the newest member of a chain answers for every older one.
//
//===----------------------------------------------------------------------===//
#include "tools/ToolsAPI.Catalogue.h"

#include "tools/DebugAPI.h"
#include "tools/EditorViewAPI.h"
#include "tools/IDEHelpAPI.h"
#include "tools/ToolsAPI.h"

#include <gtest/gtest.h>

#include <cctype>
#include <map>
#include <set>
#include <string>

using namespace formkit;

namespace {

String Lower(std::string_view S) {
  String R(S);
  for (char& C : R) C = static_cast<char>(std::tolower(static_cast<unsigned char>(C)));
  return R;
}

String ChainBase(std::string_view Name) {
  size_t End = Name.size();
  while (End > 0 && std::isdigit(static_cast<unsigned char>(Name[End - 1]))) --End;
  return String(Name.substr(0, End));
}

bool EndsWith(std::string_view S, std::string_view Tail) {
  return S.size() >= Tail.size() && S.substr(S.size() - Tail.size()) == Tail;
}

//===----------------------------------------------------------------------===//
// Units and counts
//===----------------------------------------------------------------------===//

TEST(ToolInterfaceCatalogue, EachUnitHoldsItsPublishedCountInOrder) {
  const std::pair<const char*, int> Expected[] = {
      {"ToolsAPI", 376},
      {"ToolsAPI.Editor", 16},
      {"ToolsAPI.UI", 2},
      {"ToolsAPI.WelcomePage", 24},
      {"ToolsAPI.AI", 5},
      {"PaletteAPI", 22},
      {"PlatformAPI", 65},
      {"DebugAPI", 39},
      {"DeploymentAPI", 18},
      {"FileHistoryAPI", 11},
      {"CodeTemplateAPI", 16},
      {"PersonalityFileTraitsAPI", 2},
      {"ClassStructureViewAPI", 4},
      {"PropInspAPI", 14},
      {"EditorViewAPI", 1},
      {"WizardAPI", 26},
      {"ExplorerAPI", 4},
      {"DataExplorerAPI", 8},
      {"DesignInterfaces", 1},
      {"VisualizationServicesAPI", 18},
      {"IdentityAPI", 1},
      {"CodeQueryAPI", 3},
      {"CodeFormatAPI", 1},
      {"LSPInsightAPI", 9},
      {"TempLSPAdjust", 2},
      {"InternalAPI.Gallery", 1},
      {"InternalAPI.Stockroom", 3},
      {"InternalAPI.RecentFiles", 1},
      {"IDEHelp", 5},
      {"BrandingAPI", 4},
  };
  auto Units = ToolInterfaceUnits();
  ASSERT_EQ(Units.size(), std::size(Expected));
  int First = 0;
  for (size_t I = 0; I < Units.size(); ++I) {
    SCOPED_TRACE(Expected[I].first);
    EXPECT_STREQ(Units[I].Name, Expected[I].first);
    EXPECT_EQ(Units[I].Count, Expected[I].second);
    EXPECT_EQ(ToolInterfaceCount(Expected[I].first), Expected[I].second);
    EXPECT_EQ(Units[I].First, First);
    for (int J = Units[I].First; J < Units[I].First + Units[I].Count; ++J)
      EXPECT_STREQ(ToolInterfaces()[J].Unit, Units[I].Name);
    First += Units[I].Count;
  }
  EXPECT_EQ(ToolInterfaceCount(), 702);
  EXPECT_EQ(First, 702);

  // Units are found without regard to case; an unknown unit counts nothing.
  EXPECT_EQ(ToolInterfaceCount("toolsapi.editor"), 16);
  EXPECT_EQ(ToolInterfaceCount("ToolsAPI.Nothing"), 0);
  EXPECT_EQ(FindToolInterfaceUnit("ToolsAPI.Nothing"), nullptr);
}

TEST(ToolInterfaceCatalogue, UnitsKeepTheirDeclarationOrder) {
  // First and last of some units, as published.
  auto At = [](const char* Unit, int Offset) {
    const TToolInterfaceUnit* U = FindToolInterfaceUnit(Unit);
    return String(ToolInterfaces()[U->First + (Offset < 0 ? U->Count + Offset : Offset)].Name);
  };
  EXPECT_EQ(At("ToolsAPI", 0), "IOTAStrings");
  EXPECT_EQ(At("ToolsAPI", 1), "INTAStrings");
  EXPECT_EQ(At("ToolsAPI", 2), "IOTANotifier");
  EXPECT_EQ(At("ToolsAPI", -1), "IOTACodeInsightUIOverride");
  EXPECT_EQ(At("ToolsAPI.Editor", 0), "INTACodeEditorLineState280");
  EXPECT_EQ(At("ToolsAPI.Editor", -1), "INTACodeEditorServices");
  EXPECT_EQ(At("PaletteAPI", 9), "IOTABasePaletteItem270");
  EXPECT_EQ(At("PlatformAPI", -1), "IOTAAndroidServicesManager");
  EXPECT_EQ(At("DesignInterfaces", 0), "IWindowsSurface");
  EXPECT_EQ(At("BrandingAPI", -1), "IIDESharedCommonIcons");
}

//===----------------------------------------------------------------------===//
// Names, parents and identities
//===----------------------------------------------------------------------===//

TEST(ToolInterfaceCatalogue, EveryInterfaceIsFoundByNameWithParentIdentityAndTypeRecord) {
  std::set<String> Before;
  for (const TToolInterfaceInfo& Info : ToolInterfaces()) {
    SCOPED_TRACE(Info.Name);
    EXPECT_EQ(FindToolInterface(Info.Name), &Info);
    EXPECT_EQ(FindToolInterface(Lower(Info.Name)), &Info);
    EXPECT_EQ(FindToolInterface(Info.IID), &Info);

    // The parent is the root or an interface declared before this one.
    if (String(Info.Parent) != "IInterface") {
      EXPECT_TRUE(Before.count(Info.Parent));
    }
    Before.insert(Info.Name);

    // The compiled declaration agrees with the table.
    PTypeInfo Type = Info.TypeInfo();
    ASSERT_NE(Type, nullptr);
    EXPECT_EQ(Type->Kind, tkInterface);
    EXPECT_EQ(Type->Name, Info.Name);
    EXPECT_EQ(Type->Data.Guid, Info.IID);
    ASSERT_NE(Type->Data.IntfParent, nullptr);
    EXPECT_EQ(Type->Data.IntfParent()->Name, Info.Parent);
  }
  EXPECT_EQ(FindToolInterface("IOTANothing"), nullptr);
  EXPECT_EQ(FindToolInterface(""), nullptr);
  EXPECT_EQ(FindToolInterface(IInterface::IID), nullptr);
}

TEST(ToolInterfaceCatalogue, ParentsFollowVersionChainsAndNotifiers) {
  // In a version chain each member's parent is the member declared before it; the first
  // member of a notifier chain descends from IOTANotifier; the others from IInterface.
  const std::map<String, String> Stated = {{"IOTAFormEditor", "IOTAEditor"},
                                           {"INTACodeEditorEvents", "IOTANotifier"}};
  std::map<String, String> LastOfChain;
  for (const TToolInterfaceInfo& Info : ToolInterfaces()) {
    SCOPED_TRACE(Info.Name);
    String Base = ChainBase(Info.Name);
    String Expected;
    if (auto It = Stated.find(Info.Name); It != Stated.end()) Expected = It->second;
    else if (auto Prev = LastOfChain.find(Base); Prev != LastOfChain.end()) Expected = Prev->second;
    else if (EndsWith(Base, "Notifier") && Base != "IOTANotifier") Expected = "IOTANotifier";
    else Expected = "IInterface";
    EXPECT_EQ(Info.Parent, Expected);
    LastOfChain[Base] = Info.Name;
  }

  auto ParentOf = [](const char* Name) { return String(FindToolInterface(Name)->Parent); };
  EXPECT_EQ(ParentOf("IHalvernIDEServices"), "IHalvernIDEServices70");
  EXPECT_EQ(ParentOf("IHalvernIDEServices70"), "IInterface");
  EXPECT_EQ(ParentOf("IOTAModule"), "IOTAModule140");
  EXPECT_EQ(ParentOf("IOTAModule140"), "IOTAModule70");
  EXPECT_EQ(ParentOf("IOTAModule70"), "IOTAModule50");
  EXPECT_EQ(ParentOf("IOTAModule50"), "IOTAModule40");
  EXPECT_EQ(ParentOf("IOTAModuleNotifier90"), "IOTAModuleNotifier80");
  EXPECT_EQ(ParentOf("IOTAModuleNotifier80"), "IOTAModuleNotifier");
  EXPECT_EQ(ParentOf("IOTAModuleNotifier"), "IOTANotifier");
  EXPECT_EQ(ParentOf("IOTAFormNotifier"), "IOTANotifier");
  EXPECT_EQ(ParentOf("IOTANotifier"), "IInterface");
  EXPECT_EQ(ParentOf("IOTAFormEditor"), "IOTAEditor");
  EXPECT_EQ(ParentOf("IOTAEditView140"), "IOTAEditView40");
  EXPECT_EQ(ParentOf("IOTARemoteProfileNotifier170"), "IOTANotifier");
  EXPECT_EQ(ParentOf("IStockroomInstallerNotifier"), "IOTANotifier");
  EXPECT_EQ(ParentOf("IIDEHelpServiceTrait2"), "IIDEHelpServiceTrait");
}

TEST(ToolInterfaceCatalogue, IdentitiesAreDistinctAndNeverChange) {
  std::set<String> Seen;
  for (const TToolInterfaceInfo& Info : ToolInterfaces()) {
    EXPECT_TRUE(Seen.insert(Info.IID.ToString()).second) << Info.Name;
    EXPECT_FALSE(Info.IID == IInterface::IID) << Info.Name;
  }
  // Identities fixed by the interfaces' first publication.
  EXPECT_EQ(INTACustomEditorSubView::IID.ToString(), "{655AA26C-5898-4DB5-B21F-4F55E9B2B407}");
  EXPECT_EQ(INTAFileCustomEditorSubView::IID.ToString(), "{934069AC-A869-48A9-8092-B4F89BBE71D4}");
  // Identities assigned by this library; add-ins compile them in, so they stay as they are.
  EXPECT_EQ(IOTANotifier::IID.ToString(), "{1FB81D4B-A001-533D-B108-0C7DE21BDD6A}");
  EXPECT_EQ(IOTAStrings::IID.ToString(), "{2836083A-B309-59B2-A171-2BA6948D2F8E}");
  EXPECT_EQ(FindToolInterface("IHalvernIDEServices")->IID, IHalvernIDEServices::IID);
}

//===----------------------------------------------------------------------===//
// Version chains
//===----------------------------------------------------------------------===//

/// An object that implements `I`, the newest member of a chain without operations.
template <class I> class TChainObject : public TInterfacedObject, public I {
public:
  using inherited = TInterfacedObject;
  using ThisClass = TChainObject;
  FK_INTERFACES(I)
};

/// Asks `Obj`, which implements `Newest`, for every identity of `Newest`'s chain, walking
/// the type records from the newest member to the root; returns the names answered.
template <class Newest> std::vector<String> AnsweredChain(const IPtr<Newest>& Obj) {
  std::vector<String> Names;
  IPtr<IInterface> Self = QueryAs<IInterface>(Obj);
  for (PTypeInfo T = InterfaceTypeInfo<Newest>(); T && T->Name != "IInterface";
       T = T->Data.IntfParent ? T->Data.IntfParent() : nullptr) {
    const TToolInterfaceInfo* Info = FindToolInterface(T->Name);
    EXPECT_NE(Info, nullptr) << T->Name;
    if (!Info) break;
    void* Out = nullptr;
    EXPECT_TRUE(Obj->QueryInterface(Info->IID, &Out)) << T->Name;
    if (!Out) continue;
    auto* Answer = static_cast<IInterface*>(Out);
    EXPECT_TRUE(SameObject<IInterface>(Answer, Self.Get())) << T->Name;
    Answer->Release();
    Names.push_back(T->Name);
  }
  return Names;
}

TEST(ToolInterfaceVersionChains, NewestMemberAnswersForEveryOlderIdentity) {
  using Names = std::vector<String>;
  EXPECT_EQ(AnsweredChain(IPtr<IHalvernIDEServices>(New<TChainObject<IHalvernIDEServices>>())),
            (Names{"IHalvernIDEServices", "IHalvernIDEServices70"}));
  EXPECT_EQ(AnsweredChain(IPtr<INTAServices>(New<TChainObject<INTAServices>>())),
            (Names{"INTAServices", "INTAServices290", "INTAServices280", "INTAServices270",
                   "INTAServices120", "INTAServices90", "INTAServices70", "INTAServices40"}));
  // Chains whose plain name came first and whose numbered names are newer.
  EXPECT_EQ(
      AnsweredChain(IPtr<IOTAProjectCreator190>(New<TChainObject<IOTAProjectCreator190>>())),
      (Names{"IOTAProjectCreator190", "IOTAProjectCreator160", "IOTAProjectCreator80",
             "IOTAProjectCreator50", "IOTAProjectCreator"}));
  EXPECT_EQ(AnsweredChain(IPtr<IOTAAsyncCodeInsightManager290>(
                New<TChainObject<IOTAAsyncCodeInsightManager290>>())),
            (Names{"IOTAAsyncCodeInsightManager290", "IOTAAsyncCodeInsightManager270",
                   "IOTAAsyncCodeInsightManager"}));
  EXPECT_EQ(AnsweredChain(IPtr<IOTADebugger>(New<TChainObject<IOTADebugger>>())),
            (Names{"IOTADebugger", "IOTADebugger140", "IOTADebugger120", "IOTADebugger100",
                   "IOTADebugger90"}));
  EXPECT_EQ(AnsweredChain(IPtr<IIDEHelpServiceTrait2>(New<TChainObject<IIDEHelpServiceTrait2>>())),
            (Names{"IIDEHelpServiceTrait2", "IIDEHelpServiceTrait"}));
}

TEST(ToolInterfaceVersionChains, AnOlderMemberDoesNotAnswerForANewerOne) {
  IPtr<IHalvernIDEServices70> Old = New<TChainObject<IHalvernIDEServices70>>();
  EXPECT_FALSE(Supports<IHalvernIDEServices>(Old));
  EXPECT_TRUE(Supports<IHalvernIDEServices70>(Old));
  EXPECT_FALSE(Supports<IOTAModuleServices>(Old));
}

} // namespace
