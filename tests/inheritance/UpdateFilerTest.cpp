//===- tests/inheritance/UpdateFilerTest.cpp - Defined properties that follow ---===//
//
// Pairs an ancestor and a descendant component that define a string and a binary
// property of their own, and checks which of them follow the ancestor and how the
// ancestor's values are carried over.
//
//===----------------------------------------------------------------------===//
#include "inheritance/UpdateFiler.h"
#include "inheritance/UpdateObjects.h"

#include <gtest/gtest.h>

#include <memory>

namespace formkit {
namespace {

/// A component with two defined properties, "Data" (a string) and "Blob" (bytes), and an
/// optional third, "Extra". `DataName` lets a test spell the first in another case.
class TDefinedThing : public TComponent {
  FK_CLASS(TDefinedThing, TComponent)
  String Data;
  String Blob;
  String Extra;
  bool DefineExtra = false;
  String DataName = "Data";
  int DataReads = 0;

  void DefineProperties(TFiler* Filer) override {
    inherited::DefineProperties(Filer);
    auto* Other = dynamic_cast<TDefinedThing*>(Filer->Ancestor());
    Filer->DefineProperty(
        DataName,
        [this](TReader* R) {
          Data = R->ReadString();
          ++DataReads;
        },
        [this](TWriter* W) { W->WriteString(Data); }, Other ? Data != Other->Data : !Data.empty());
    Filer->DefineBinaryProperty(
        "Blob",
        [this](TStream* S) {
          Blob.assign(static_cast<std::size_t>(S->Size()), '\0');
          S->ReadBuffer(Blob.data(), S->Size());
        },
        [this](TStream* S) { S->WriteBuffer(Blob.data(), static_cast<std::int64_t>(Blob.size())); },
        Other ? Blob != Other->Blob : !Blob.empty());
    if (DefineExtra)
      Filer->DefineProperty(
          "Extra", [this](TReader* R) { Extra = R->ReadString(); }, [this](TWriter* W) { W->WriteString(Extra); },
          Other ? Extra != Other->Extra : !Extra.empty());
  }
};
FK_IMPLEMENT(TDefinedThing, "UpdateFilerTest") {}

/// A persistent without defined properties.
class TPlainThing : public TPersistent {
  FK_CLASS(TPlainThing, TPersistent)
};
FK_IMPLEMENT(TPlainThing, "UpdateFilerTest") {}

struct TNoRun : TUpdateRun {
  void Updating(TComponent*) override {}
};

struct TComponentDeleter {
  void operator()(TComponent* C) const { C->Destroy(); }
};
using TComponentPtr = std::unique_ptr<TDefinedThing, TComponentDeleter>;

TComponentPtr MakeThing(const char* Name) {
  TComponentPtr Thing(CreateComponentOf<TDefinedThing>(nullptr));
  Thing->SetName(Name);
  return Thing;
}

/// An ancestor and a descendant with equal defined values, and the update object
/// of the pair (created comparing unless the test says otherwise).
class UpdateFilerTest : public ::testing::Test {
protected:
  TComponentPtr Ancestor = MakeThing("Base");
  TComponentPtr Descendant = MakeThing("Derived");
  std::unique_ptr<TUpdateObject> Pair;

  void SetUp() override {
    Ancestor->Data = Descendant->Data = "shared";
    Ancestor->Blob = Descendant->Blob = String("\x01\x02", 2);
  }
  TUpdateFiler& Pairing(bool Compare = true) {
    Pair = std::make_unique<TUpdateObject>(nullptr, Descendant.get(), Ancestor.get(), nullptr, Compare, true);
    return Pair->UpdateFiler();
  }
  static std::vector<String> Listed(const TUpdateFiler& Filer) {
    std::vector<String> Result;
    for (int I = 0; I < Filer.PropertyList().Count(); ++I) Result.push_back(Filer.PropertyList().Get(I));
    return Result;
  }
};

using Names = std::vector<String>;

TEST_F(UpdateFilerTest, FirstPassCollectsEveryDefinedPropertyThatEqualsTheAncestor) {
  TUpdateFiler& Filer = Pairing();
  EXPECT_EQ(Listed(Filer), (Names{"Left", "Top", "Data", "Blob"}));
  EXPECT_FALSE(Filer.Empty());
  EXPECT_EQ(Filer.State(), usFilter);
}

TEST_F(UpdateFilerTest, ADefinedPropertyThatDiffersAtTheFirstPassIsNeverFollowed) {
  Descendant->Data = "mine";
  TUpdateFiler& Filer = Pairing(true);
  EXPECT_EQ(Listed(Filer), (Names{"Left", "Top", "Blob"}));
  Descendant->Data = "shared";   // equal again: still out for good
  Filer.Filter();
  Ancestor->Data = "changed";
  Filer.Update();
  EXPECT_EQ(Descendant->Data, "shared");
}

TEST_F(UpdateFilerTest, WithoutComparingEveryDefinedPropertyFollowsUntilTheNextFilter) {
  Descendant->Data = "mine";
  TUpdateFiler& Filer = Pairing(false);
  EXPECT_EQ(Listed(Filer), (Names{"Left", "Top", "Data", "Blob"}));
  Filer.Filter();
  EXPECT_EQ(Listed(Filer), (Names{"Left", "Top", "Blob"}));
}

TEST_F(UpdateFilerTest, ALaterFilterOnlyRemovesNames) {
  TUpdateFiler& Filer = Pairing();
  Descendant->Blob = "other";
  Descendant->DefineExtra = true;   // a property the object gained is not added
  Filer.Filter();
  EXPECT_EQ(Listed(Filer), (Names{"Left", "Top", "Data"}));
  Descendant->SetDesignInfo(5);     // moved: Left differs now
  Filer.Filter();
  EXPECT_EQ(Listed(Filer), (Names{"Top", "Data"}));
}

TEST_F(UpdateFilerTest, UpdateCopiesTheAncestorsValuesOfWhatStillFollows) {
  TUpdateFiler& Filer = Pairing();
  Descendant->Blob = "own bytes";
  Filer.Filter();
  Ancestor->Data = "from the ancestor";
  Ancestor->Blob = "new ancestor bytes";
  Ancestor->SetDesignInfo(3 | (4 << 16));
  Filer.Update();
  EXPECT_EQ(Descendant->Data, "from the ancestor");
  EXPECT_EQ(Descendant->Blob, "own bytes");
  EXPECT_EQ(Descendant->DesignInfo(), 3 | (4 << 16));
  EXPECT_EQ(Filer.State(), usReading);
  EXPECT_EQ(Listed(Filer), (Names{"Left", "Top", "Data"}));
}

TEST_F(UpdateFilerTest, UpdateWritesOnlyWhatDiffersFromTheDescendant) {
  TUpdateFiler& Filer = Pairing();
  Filer.Update();   // nothing differs: nothing is read
  EXPECT_EQ(Descendant->DataReads, 0);
  Ancestor->Data = "x";
  Filer.Update();
  EXPECT_EQ(Descendant->DataReads, 1);
  EXPECT_EQ(Descendant->Data, "x");
}

TEST_F(UpdateFilerTest, ABinaryPropertyFollowsTheAncestorByteForByte) {
  TUpdateFiler& Filer = Pairing();
  Ancestor->Blob = String("\0\xff\x10 bytes", 9);
  Filer.Update();
  EXPECT_EQ(Descendant->Blob, String("\0\xff\x10 bytes", 9));
  Ancestor->Blob.clear();
  Filer.Update();
  EXPECT_EQ(Descendant->Blob, "");
}

TEST_F(UpdateFilerTest, ANameIsReadWithoutRegardToCase) {
  TUpdateFiler& Filer = Pairing();
  Descendant->DataName = "DATA";
  Ancestor->Data = "case";
  Filer.Update();
  EXPECT_EQ(Descendant->Data, "case");
}

TEST_F(UpdateFilerTest, AValueThatTheObjectNoLongerDefinesIsAReadError) {
  Ancestor->DefineExtra = Descendant->DefineExtra = true;
  TUpdateFiler& Filer = Pairing();
  EXPECT_EQ(Listed(Filer), (Names{"Left", "Top", "Data", "Blob", "Extra"}));
  Descendant->DefineExtra = false;
  Ancestor->Extra = "gone";
  try {
    Filer.Update();
    FAIL() << "an unread value was accepted";
  } catch (const EReadError& E) {
    EXPECT_EQ(E.Message(), "Property Extra does not exist");
  }
  // The filer stays usable.
  Descendant->DefineExtra = true;
  Filer.Update();
  EXPECT_EQ(Descendant->Extra, "gone");
}

TEST_F(UpdateFilerTest, AnObjectWithoutDefinedPropertiesHasAnEmptyList) {
  TPlainThing* A = new TPlainThing;
  TPlainThing* D = new TPlainThing;
  {
    TUpdateObject Plain(nullptr, D, A, nullptr, true, true);
    EXPECT_TRUE(Plain.UpdateFiler().Empty());
    Plain.UpdateFiler().Filter();
    Plain.UpdateFiler().Update();
    EXPECT_TRUE(Plain.UpdateFiler().Empty());
    EXPECT_EQ(Plain.UpdateFiler().State(), usFilter);
  }
  A->Destroy();
  D->Destroy();
}

TEST_F(UpdateFilerTest, FlushBufferDoesNothing) {
  TUpdateFiler& Filer = Pairing();
  Filer.FlushBuffer();
  EXPECT_EQ(Filer.Stream(), nullptr);
  EXPECT_EQ(Listed(Filer), (Names{"Left", "Top", "Data", "Blob"}));
}

} // namespace
} // namespace formkit
