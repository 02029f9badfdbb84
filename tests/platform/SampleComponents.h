//===- tests/platform/SampleComponents.h - A hierarchy for the tests -----===//
//
// A small component family declared as a framework would declare it, with a
// published property of every kind, an event, a collection and published methods.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Classes.h"

namespace formkit::sample {

FK_ENUM(TShade, std::uint8_t, shNone, shLight, shDark, shBlack)
FK_SET(TShades, TShade)
FK_SUBRANGE(TPercent, std::uint8_t, 0, 100)
FK_ALIAS(TCaption, tkUString)
FK_EVENT(TPressEvent, void(TObject* Sender, int X, int& Handled, const String& Why));
FK_EVENT(TQueryEvent, bool(TObject* Sender));

/// An interface a property can hold.
struct ISampleService : IInterface {
  FK_INTERFACE(ISampleService, IInterface, "{3A7E0D51-7C2B-4D8F-9A61-0B5E2C8F1D42}")
  virtual int Answer() = 0;
};

class TSampleService : public TInterfacedObject, public ISampleService {
  FK_CLASS(TSampleService, TInterfacedObject)
  FK_INTERFACES(ISampleService)
  int Answer() override { return 42; }
};

class TSampleItem : public TCollectionItem {
  FK_CLASS(TSampleItem, TCollectionItem)
  void Assign(TPersistent* Source) override;
  String Text;
  int Weight = 0;
};

/// The base of the family: a counter of constructor runs and what the constructor saw.
class TSampleBase : public TComponent {
  FK_CLASS(TSampleBase, TComponent)
  void Create(TComponent* AOwner) override;
  bool SawDesigning = false;
  static inline int Constructed = 0;
};

/// Every published property kind.
class TSampleWidget : public TSampleBase {
  FK_CLASS(TSampleWidget, TSampleBase)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  String Caption() const { return FCaption; }
  void SetCaption(const String& Value) { FCaption = Value; ++CaptionWrites; }
  static bool IsWidthStored(TObject* Self) { return static_cast<TSampleWidget*>(Self)->FWidth != 75; }
  void Pressed(TObject* Sender, int X, int& Handled, const String& Why) {
    (void)Sender; (void)Why;
    LastX = X;
    Handled = 1;
  }
  bool Query(TObject*) { return true; }

  int FWidth = 75;
  std::int8_t FSmall = 0;
  std::uint8_t FPercent = 50;
  char FLetter = 'a';
  char16_t FWide = u'\u00e9';
  TShade FShade = shLight;
  bool FVisible = true;
  TShades FShades{shLight};
  double FRatio = 0;
  String FCaption;
  WideString FHint;
  std::int64_t FBig = 0;
  TComponent* FBuddy = nullptr;
  TOwnedCollection* FItems = nullptr;
  TVariant FValue;
  IPtr<ISampleService> FService;
  TPressEvent FOnPress;
  int CaptionWrites = 0;
  int LastX = 0;
};

/// A class that fails in its constructor.
class TFailingWidget : public TSampleWidget {
  FK_CLASS(TFailingWidget, TSampleWidget)
  void Create(TComponent* AOwner) override;
};

/// Records the notifications it receives.
class TListener : public TComponent {
  FK_CLASS(TListener, TComponent)
  void Notification(TComponent* AComponent, TOperation Operation) override;
  std::vector<std::pair<String, TOperation>> Heard;
  TComponent* Watched = nullptr;
};

/// Registers the sample classes; safe to call more than once.
void RegisterSampleClasses();

} // namespace formkit::sample
