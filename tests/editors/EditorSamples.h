//===- tests/editors/EditorSamples.h - Classes the editor tests inspect --===//
//
// A gadget with a property of every kind an editor serves (and the awkward ones:
// read-only, write-only, a getter that raises), a second class that shares some
// of its names with other types, and a recording editor for the registry tests.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "editors/DesignEditors.h"
#include "tests/fakes/FakeRoot.h"

#include <gtest/gtest.h>

namespace formkit::samples {

FK_ENUM(TTint, std::uint8_t, tiRed, tiGreen, tiBlue)
FK_SET(TTints, TTint)
FK_ENUM(TLevel, std::uint8_t, lvLow, lvMid, lvHigh, lvTop)
FK_SUBRANGE(TDigit, std::int32_t, 0, 9)
FK_SUBRANGE(TCardinal, std::uint32_t, 0, 4294967295)
FK_EVENT(TPingEvent, void(TObject* Sender));

/// A persistent held by a gadget: nested properties of an object property.
class TGadgetStyle : public TPersistent {
  FK_CLASS(TGadgetStyle, TPersistent)
  int FSize = 10;
  String FFace;
};

/// Every kind of property the standard editors serve.
class TGadget : public TComponent {
  FK_CLASS(TGadget, TComponent)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  int Fragile() const { throw EInvalidOperation("The gadget is unplugged"); }
  void SetFragile(int) {
    if (FBrittle) throw EInvalidOperation("The gadget broke");
    ++FFragileWrites;
  }
  TGadgetStyle* Style() const { return FStyle; }
  int Fixed() const { return 42; }
  void SetSecret(int Value) { FSecret = Value; }

  int FCount = 0;
  std::int32_t FDigit = 0;
  std::uint32_t FMask = 0;
  char FLetter = 'a';
  char16_t FGlyph = u'a';
  TTint FTint = tiRed;
  TLevel FLevel = lvLow;
  bool FFlag = false;
  TTints FTints{tiGreen};
  float FRatio = 0;
  double FScale = 0;
  String FCaption;
  WideString FTitle;
  std::int64_t FBig = 0;
  double FStamp = 0;
  int FSecret = 0;
  bool FBrittle = false;
  int FFragileWrites = 0;
  TGadget* FBuddy = nullptr;
  TPingEvent FOnPing;
  TGadgetStyle* FStyle = nullptr;
};

/// Shares "Count" and "Caption" with the gadget; "Tint" is of another type here.
class TOtherGadget : public TComponent {
  FK_CLASS(TOtherGadget, TComponent)
  int FCount = 0;
  String FCaption;
  int FTint = 0;
};

/// Events named to test the default editor's preference and the proposed handler names.
class TClicker : public TComponent {
  FK_CLASS(TClicker, TComponent)
  void Pressed(TObject*) {}
  TPingEvent FOnClick, FOnChange, FOnline, FClick;
};
class TCreator : public TComponent {
  FK_CLASS(TCreator, TComponent)
  TPingEvent FOnActivate, FOnCreate;
};
class TDropper : public TComponent {
  FK_CLASS(TDropper, TComponent)
  TPingEvent FOnEnter, FOnDrop;
};

/// A variant property and an interface reference.
class TVariantGadget : public TComponent {
  FK_CLASS(TVariantGadget, TComponent)
  TVariant FValue;
  IPtr<IInterface> FLink;
};

/// A gadget whose values may not be read at design time.
class TShyGadget : public TGadget {
  FK_CLASS(TShyGadget, TGadget)
  void Create(TComponent* AOwner) override;
};

/// An editor that counts its calls, to check the order the registry drives it in.
class TCountingProperty : public TIntegerProperty {
  FK_CLASS(TCountingProperty, TIntegerProperty)
  void Initialize() override { ++Initialized; }
  static inline int Initialized = 0;
};

/// Another integer editor, to tell registrations apart.
class TOtherIntegerProperty : public TIntegerProperty {
  FK_CLASS(TOtherIntegerProperty, TIntegerProperty)
};

/// A third one.
class TThirdIntegerProperty : public TIntegerProperty {
  FK_CLASS(TThirdIntegerProperty, TIntegerProperty)
};

/// The property record of `Name` of `Class`.
inline PPropInfo PropOf(TClass Class, std::string_view Name) { return GetPropInfo(Class->TypeInfo(), Name); }

/// Starts and stops the editor registries around each test, leaving no registration
/// behind, and makes gadgets owned by one root.
struct EditorFixture : ::testing::Test {
  TComponent* Owner = nullptr;
  IPtr<fakes::TFakeRoot> Root;

  void SetUp() override;
  void TearDown() override;
  template <class T> T* Make(const String& Name) {
    T* C = CreateComponentOf<T>(Owner);
    C->SetName(Name);
    return C;
  }
  /// The designer of the fake module, which records "Form1.Modified".
  IPtr<IDesigner> Designer() { return InterfaceOf<IDesigner>(Root.Get()); }
  /// The editors of `Objects` in the order the enumeration hands them over.
  std::vector<IPtr<IProperty>> PropertiesOf(std::initializer_list<TPersistent*> Objects,
                                            const IPtr<IDesigner>& D = nullptr,
                                            TTypeKinds Kinds = tkAny);
  /// An editor of the class the registry chooses for property `Name` of `Objects`, driven
  /// as the enumeration drives it.
  static IPtr<IProperty> EditorOf(std::initializer_list<TPersistent*> Objects, std::string_view Name,
                                  const IPtr<IDesigner>& D = nullptr);
  /// Expects `Run` to raise `EDesignPropertyError` with exactly `Message`.
  template <class F> static void ExpectRejected(F&& Run, const String& Message) {
    try {
      Run();
      ADD_FAILURE() << "accepted; expected: " << Message;
    } catch (const EDesignPropertyError& E) {
      EXPECT_EQ(E.Message(), Message);
    }
  }
  /// Their names.
  static std::vector<String> NamesOf(const std::vector<IPtr<IProperty>>& Props);
  /// The editor of `Name` among `Props`; fails the test when absent.
  static IPtr<IProperty> Find(const std::vector<IPtr<IProperty>>& Props, const String& Name);
  fakes::TCallLog Log;
};

} // namespace formkit::samples
