//===- tests/inheritance/RandomInheritanceTest.cpp - Seeded edits over a family of forms ---===//
//
// Opens Form1, Form2 descending from it and Form3 from Form2 on the Kiln
// designer, then makes a few hundred edits drawn from a seeded generator,
// spread over the three modules, each followed by the module's `Modified` as a
// gesture would: property writes, moves to another parent, inserts, deletes and
// renames of what the module introduced itself, and reverts of a descendant's
// override. At the end each descendant must be what reading its own difference
// over the final ancestor into a fresh descendant module gives.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"
#include "inheritance/UpdateManager.h"
#include "platform/Filer.h"
#include "platform/TypInfo.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <optional>
#include <set>
#include <tuple>

namespace formkit::fakes {
namespace {

/// A small generator of its own, so that a seed gives the same edits everywhere.
class TSeededRandom {
public:
  explicit TSeededRandom(std::uint64_t Seed) : FState(Seed * 0x9E3779B97F4A7C15ull + 1) {}
  /// A value in [0, Bound).
  int Below(int Bound) { return static_cast<int>(Next() % static_cast<std::uint64_t>(Bound)); }

private:
  std::uint64_t Next() {
    std::uint64_t Z = (FState += 0x9E3779B97F4A7C15ull);
    Z = (Z ^ (Z >> 30)) * 0xBF58476D1CE4E5B9ull;
    Z = (Z ^ (Z >> 27)) * 0x94D049BB133111EBull;
    return Z ^ (Z >> 31);
  }
  std::uint64_t FState;
};

/// The text without its first line, which names the module's root and class.
String Body(const String& Text) { return Text.substr(Text.find('\n') + 1); }

const char* const EditedProperties[] = {"Left", "Top", "Caption", "Tag"};

/// An edited property of `Instance` in text, whichever its kind.
String ValueOf(TObject* Instance, const char* Name) {
  PPropInfo Prop = GetPropInfo(Instance, Name);
  return String(Name) == "Caption" ? GetStrProp(Instance, Prop) : std::to_string(GetOrdProp(Instance, Prop));
}

struct RandomInheritanceTest : KilnDesignFixture, ::testing::WithParamInterface<int> {
  /// The buttons and panels of a module, in the order of its components.
  static std::vector<TControl*> Controls(const IPtr<IRoot>& Form, bool OwnOnly) {
    std::vector<TControl*> Result;
    TComponent* Root = Form->GetRoot();
    for (int I = 0; I < Root->ComponentCount(); ++I) {
      TComponent* C = Root->Components(I);
      if (!dynamic_cast<TButton*>(C) && !dynamic_cast<TPanel*>(C)) continue;
      if (OwnOnly && C->ComponentState().Contains(csAncestor)) continue;
      Result.push_back(static_cast<TControl*>(C));
    }
    return Result;
  }
  /// The places a control of the module can stand in: the form and its panels.
  static std::vector<TWinControl*> Parents(const IPtr<IRoot>& Form) {
    std::vector<TWinControl*> Result{static_cast<TWinControl*>(Form->GetRoot())};
    for (TControl* C : Controls(Form, false))
      if (auto* P = dynamic_cast<TPanel*>(C)) Result.push_back(P);
    return Result;
  }
  static bool Contains(TControl* Outer, TControl* Inner) {
    for (TControl* C = Inner; C; C = C->Parent())
      if (C == Outer) return true;
    return false;
  }
  static bool HasChildren(TControl* C) {
    auto* W = dynamic_cast<TWinControl*>(C);
    return W && W->ControlCount() > 0;
  }
  template <class T> T* Pick(const std::vector<T*>& From) {
    return From.empty() ? nullptr : From[static_cast<size_t>(Random->Below(static_cast<int>(From.size())))];
  }

  // The edits; each says what it did, or nothing when it found nothing to do.
  String WriteProperty(const IPtr<IRoot>& Form) {
    TControl* C = Pick(Controls(Form, false));
    if (!C) return "";
    int Value = Random->Below(300);
    int Which = Random->Below(4);
    Overrides.insert({Form.Get(), C, EditedProperties[Which]});
    switch (Which) {
    case 0: C->SetLeft(Value); return C->Name() + ".Left";
    case 1: C->SetTop(Value); return C->Name() + ".Top";
    case 2: C->SetCaption("C" + std::to_string(Value)); return C->Name() + ".Caption";
    default: C->SetTag(Value); return C->Name() + ".Tag";
    }
  }
  String Move(const IPtr<IRoot>& Form) {
    TControl* C = Pick(Controls(Form, true));
    TWinControl* To = Pick(Parents(Form));
    if (!C || !To || Contains(C, To) || C->Parent() == To) return "";
    C->SetParent(To);
    return C->Name() + " into " + To->Name();
  }
  String Insert(const IPtr<IRoot>& Form) {
    TWinControl* Parent = Pick(Parents(Form));
    TClass Class = Random->Below(3) == 0 ? TPanel::StaticClass() : TButton::StaticClass();
    TComponent* C = KilnRoot(Form)->CreateComponent(Class, Parent, Random->Below(200), Random->Below(200), 75, 25);
    return C->Name() + " in " + Parent->Name();
  }
  String Delete(const IPtr<IRoot>& Form) {
    TControl* C = Pick(Controls(Form, true));
    if (!C || HasChildren(C)) return "";
    String Name = C->Name();
    C->Destroy();
    return Name;
  }
  String Rename(const IPtr<IRoot>& Form) {
    TControl* C = Pick(Controls(Form, true));
    if (!C) return "";
    String Old = C->Name();
    C->SetName("Renamed" + std::to_string(++Renames));
    return Old + " to " + C->Name();
  }
  String Revert(const IPtr<IRoot>& Form) {
    TControl* C = Pick(Controls(Form, false));
    if (!C) return "";
    PPropInfo Prop = GetPropInfo(C, EditedProperties[Random->Below(4)]);
    if (!KilnRoot(Form)->CanRevert(C, Prop)) return "";
    KilnRoot(Form)->Revert(C, Prop);
    Overrides.erase({Form.Get(), C, Prop->Name});
    return C->Name() + "." + Prop->Name;
  }

  /// One edit of a module picked at random; the ancestor oftener, as it drives the rest.
  void Edit() {
    int Level = Random->Below(5);
    size_t Index = Level < 2 ? 0 : Level < 4 ? 1 : 2;
    const IPtr<IRoot>& Form = Forms[Index];
    String What;
    Trail += Form->GetRootName() + ": ";
    switch (int Kind = Random->Below(Index == 0 ? 12 : 13); Kind) {
    case 0: case 1: case 2: case 3: case 4: What = "write " + WriteProperty(Form); break;
    case 5: What = "move " + Move(Form); break;
    case 6: case 7: What = "insert " + Insert(Form); break;
    case 8: What = "delete " + Delete(Form); break;
    case 9: What = "rename " + Rename(Form); break;
    default: What = Index == 0 ? "write " + WriteProperty(Form) : "revert " + Revert(Form); break;
    }
    Trail += What + "\n";
    KilnRoot(Form)->Modified();
  }

  /// Every inherited property that `Index` never wrote since its last revert holds the
  /// value of its twin in the ancestor. A component an update made again is a new one,
  /// with nothing written.
  void ExpectFollowing(size_t Index) {
    TComponent* Ancestor = Forms[Index - 1]->GetRoot();
    for (TControl* C : Controls(Forms[Index], false)) {
      if (!C->ComponentState().Contains(csAncestor)) continue;
      TComponent* Twin = Ancestor->FindComponent(C->Name());
      ASSERT_NE(Twin, nullptr) << C->Name() << " of " << Forms[Index]->GetRootName() << " has no twin";
      for (const char* Name : EditedProperties) {
        if (Overrides.count({Forms[Index].Get(), C, Name})) continue;
        EXPECT_EQ(ValueOf(C, Name), ValueOf(Twin, Name))
            << Forms[Index]->GetRootName() << "." << C->Name() << "." << Name;
      }
    }
  }

  /// Reads the difference of `Index` over its ancestor into a fresh descendant and
  /// compares the two.
  void ExpectReadBackEqual(size_t Index) {
    TComponent* Ancestor = Forms[Index - 1]->GetRoot();
    String Difference = FormImage(Forms[Index]->GetRoot(), Ancestor);
    IPtr<IRoot> Fresh = NewDescendant("Fresh" + std::to_string(Index + 1), Forms[Index - 1]->GetRootName());
    TObjectGuard<TMemoryStream> Data(new TMemoryStream);
    {
      TObjectGuard<TWriter> Writer(new TWriter(Data.Get(), 4096));
      Writer->WriteDescendent(Forms[Index]->GetRoot(), Ancestor);
    }
    Data->SetPosition(0);
    {
      TObjectGuard<TReader> Reader(new TReader(Data.Get(), 4096));
      Reader->ReadRootComponent(Fresh->GetRoot());
    }
    EXPECT_EQ(Body(FormImage(Fresh->GetRoot(), Ancestor)), Body(Difference));
    EXPECT_EQ(Body(FormImage(Fresh->GetRoot(), nullptr)), Body(FormImage(Forms[Index]->GetRoot(), nullptr)));
  }

  std::optional<TSeededRandom> Random;
  std::vector<IPtr<IRoot>> Forms;
  int Renames = 0;
  /// The properties each module wrote on a component, until a revert.
  std::set<std::tuple<IRoot*, TComponent*, String>> Overrides;
  /// What was done so far, one edit a line; the last may be unfinished.
  String Trail;
};

TEST_P(RandomInheritanceTest, EveryDescendantIsWhatItsDifferenceReadsBackAs) {
  Random.emplace(static_cast<std::uint64_t>(GetParam()));
  Forms.push_back(NewForm("Form1"));
  Forms.push_back(NewDescendant("Form2", "Form1"));
  Forms.push_back(NewDescendant("Form3", "Form2"));
  try {
    for (int Step = 0; Step < 300; ++Step) Edit();
  } catch (const Exception& E) {
    FAIL() << E.Message() << "\nafter the edits:\n" << Trail;
  }
  SCOPED_TRACE("edits:\n" + Trail);
  ExpectFollowing(1);
  ExpectFollowing(2);
  ExpectReadBackEqual(1);
  ExpectReadBackEqual(2);
}

INSTANTIATE_TEST_SUITE_P(Seeds, RandomInheritanceTest, ::testing::Range(1, 9));

} // namespace
} // namespace formkit::fakes
