//===- tests/platform/TypInfoTest.cpp - Published properties and methods -===//
#include "tests/platform/SampleComponents.h"

#include <gtest/gtest.h>

using namespace formkit;
using namespace formkit::sample;

namespace {

struct WidgetFixture : ::testing::Test {
  TSampleWidget* W = CreateComponentOf<TSampleWidget>(nullptr);
  ~WidgetFixture() override { W->Destroy(); }
  PPropInfo Prop(const char* Name) {
    PPropInfo P = GetPropInfo(W, Name);
    EXPECT_NE(P, nullptr) << Name;
    return P;
  }
};

std::vector<String> Names(const std::vector<PPropInfo>& List) {
  std::vector<String> Out;
  for (PPropInfo P : List) Out.push_back(P->Name);
  return Out;
}

} // namespace

TEST_F(WidgetFixture, PropertyListIsSortedWithoutRegardToCaseAndFilteredByKind) {
  PTypeInfo Info = W->ClassType()->TypeInfo();
  int Count = GetPropList(Info, tkProperties, nullptr);
  std::vector<PPropInfo> List;
  EXPECT_EQ(GetPropList(Info, tkProperties, &List), Count);
  EXPECT_EQ(Names(List), (std::vector<String>{"Big", "Buddy", "Caption", "Hint", "Items", "Letter", "Name",
                                              "OnPress", "Percent", "Ratio", "Service", "Shade", "Shades",
                                              "Small", "Tag", "Value", "Visible", "wide", "Width"}));

  // Declaration order puts the ancestors' properties first.
  std::vector<PPropInfo> Declared;
  GetPropList(Info, tkProperties, &Declared, false);
  EXPECT_EQ(Declared[0]->Name, "Name");
  EXPECT_EQ(Declared[1]->Name, "Tag");
  EXPECT_EQ(Declared[2]->Name, "Width");

  std::vector<PPropInfo> Classes;
  EXPECT_EQ(GetPropList(Info, TTypeKinds{tkClass}, &Classes), 2);
  EXPECT_EQ(Names(Classes), (std::vector<String>{"Buddy", "Items"}));
  EXPECT_EQ(GetPropList(Info, tkMethods, nullptr), 1);
}

TEST_F(WidgetFixture, CountOnlyCallLeavesTheListAlone) {
  std::vector<PPropInfo> List{nullptr};
  EXPECT_EQ(GetPropList(W->ClassType()->TypeInfo(), TTypeKinds{tkInteger}, nullptr), 4); // Width, Small, Percent, Tag
  EXPECT_EQ(List.size(), 1u);
}

TEST_F(WidgetFixture, KindsAndTypeRecords) {
  EXPECT_EQ(Prop("Width")->Kind(), tkInteger);
  EXPECT_EQ(Prop("Percent")->PropType()->Name, "TPercent");
  EXPECT_EQ(GetTypeData(Prop("Percent")->PropType())->MaxValue, 100);
  EXPECT_EQ(Prop("Letter")->Kind(), tkChar);
  EXPECT_EQ(Prop("WIDE")->Kind(), tkWChar);
  EXPECT_EQ(Prop("Shade")->Kind(), tkEnumeration);
  EXPECT_EQ(Prop("Visible")->PropType()->Name, "Boolean");
  EXPECT_EQ(Prop("Shades")->Kind(), tkSet);
  EXPECT_EQ(Prop("Ratio")->Kind(), tkFloat);
  EXPECT_EQ(Prop("Caption")->PropType()->Name, "TCaption");
  EXPECT_EQ(Prop("Hint")->Kind(), tkWString);
  EXPECT_EQ(Prop("Big")->Kind(), tkInt64);
  EXPECT_EQ(Prop("Buddy")->Kind(), tkClass);
  EXPECT_EQ(GetObjectPropClass(Prop("Items")), TOwnedCollection::StaticClass());
  EXPECT_EQ(Prop("OnPress")->Kind(), tkMethod);
  EXPECT_EQ(Prop("Value")->Kind(), tkVariant);
  EXPECT_EQ(Prop("Service")->Kind(), tkInterface);
  EXPECT_EQ(Prop("Service")->PropType()->Name, "ISampleService");
  EXPECT_EQ(GetPropInfo(W, "Width", TTypeKinds{tkUString}), nullptr);
  EXPECT_EQ(GetPropInfo(W, "Missing"), nullptr);
}

TEST_F(WidgetFixture, GenericAccessReadsAndWritesEveryKind) {
  SetOrdProp(W, Prop("Width"), 120);
  SetOrdProp(W, Prop("Small"), -5);
  SetOrdProp(W, Prop("Letter"), 'z');
  SetOrdProp(W, Prop("wide"), 0x263A);
  SetOrdProp(W, Prop("Shade"), shBlack);
  SetOrdProp(W, Prop("Visible"), 0);
  SetOrdProp(W, Prop("Shades"), TShades{shNone, shDark}.Mask());
  SetFloatProp(W, Prop("Ratio"), 2.5);
  SetStrProp(W, Prop("Caption"), "Hello");
  SetWideStrProp(W, Prop("Hint"), u"\u00fcber");
  SetInt64Prop(W, Prop("Big"), 1LL << 40);
  SetVariantProp(W, Prop("Value"), TVariant(String("v")));
  IPtr<ISampleService> Service = New<TSampleService>();
  SetInterfaceProp(W, Prop("Service"), IPtr<IInterface>(QueryAs<IInterface>(Service)));

  EXPECT_EQ(W->FWidth, 120);
  EXPECT_EQ(GetOrdProp(W, Prop("Small")), -5);
  EXPECT_EQ(W->FLetter, 'z');
  EXPECT_EQ(W->FWide, u'\u263A');
  EXPECT_EQ(W->FShade, shBlack);
  EXPECT_FALSE(W->FVisible);
  EXPECT_TRUE(W->FShades.Contains(shDark));
  EXPECT_EQ(GetFloatProp(W, Prop("Ratio")), 2.5);
  EXPECT_EQ(GetStrProp(W, Prop("Caption")), "Hello");
  EXPECT_EQ(W->CaptionWrites, 1);
  EXPECT_EQ(GetStrProp(W, Prop("Hint")), "\xc3\xbc" "ber");
  EXPECT_EQ(GetInt64Prop(W, Prop("Big")), 1LL << 40);
  EXPECT_EQ(GetVariantProp(W, Prop("Value")).AsString(), "v");
  EXPECT_EQ(QueryAs<ISampleService>(GetInterfaceProp(W, Prop("Service")))->Answer(), 42);

  // A property of the wrong kind is refused with the platform's message.
  try {
    GetStrProp(W, Prop("Width"));
    FAIL();
  } catch (const EPropertyConvertError& E) {
    EXPECT_STREQ(E.what(), "Invalid property type: Integer");
  }
  try {
    FindPropInfo(W, "Nothing");
    FAIL();
  } catch (const EPropertyError& E) {
    EXPECT_STREQ(E.what(), "Unknown property: Nothing");
  }
}

TEST_F(WidgetFixture, ClassValuedPropertyIsAnOrdinalReference) {
  TSampleWidget* Other = CreateComponentOf<TSampleWidget>(nullptr);
  SetObjectProp(W, Prop("Buddy"), Other);
  EXPECT_EQ(GetOrdProp(W, Prop("Buddy")), reinterpret_cast<std::intptr_t>(static_cast<TObject*>(Other)));
  SetOrdProp(W, Prop("Buddy"), 0);
  EXPECT_EQ(W->FBuddy, nullptr);
  EXPECT_EQ(GetObjectProp(W, Prop("Items")), W->FItems);
  // An object of an unrelated class is refused.
  EXPECT_THROW(SetObjectProp(W, Prop("Items"), Other), EPropertyConvertError);
  Other->Destroy();
}

TEST_F(WidgetFixture, DefaultsStoredAndEnumerationNames) {
  EXPECT_TRUE(Prop("Width")->HasDefault);
  EXPECT_EQ(Prop("Width")->Default, 75);
  EXPECT_FALSE(Prop("Small")->HasDefault);
  EXPECT_EQ(Prop("Shades")->Default, static_cast<std::int64_t>(TShades{shLight}.Mask()));
  EXPECT_FALSE(IsStoredProp(W, Prop("Width")));
  W->FWidth = 80;
  EXPECT_TRUE(IsStoredProp(W, Prop("Width")));
  EXPECT_FALSE(IsStoredProp(W, Prop("Name")));

  PTypeInfo Shade = TypeInfo<TShade>();
  EXPECT_EQ(GetEnumName(Shade, 2), "shDark");
  EXPECT_EQ(GetEnumName(Shade, 9), "");
  EXPECT_EQ(GetEnumValue(Shade, "SHBLACK"), 3);
  EXPECT_EQ(GetEnumValue(Shade, "shGrey"), -1);
  EXPECT_EQ(GetEnumName(TypeInfo<bool>(), 1), "True");
  EXPECT_EQ(GetSetElementName(TypeInfo<TShades>(), 1), "shLight");
  const std::uint64_t NoneAndBlack = TShades{shNone, shBlack}.Mask();
  EXPECT_EQ(SetToString(TypeInfo<TShades>(), NoneAndBlack), "[shNone,shBlack]");
  const std::uint64_t DarkAndLight = TShades{shDark, shLight}.Mask();
  EXPECT_EQ(StringToSet(TypeInfo<TShades>(), "[shDark, shlight]"), DarkAndLight);
  try {
    StringToSet(TypeInfo<TShades>(), "[shGrey]");
    FAIL();
  } catch (const EPropertyConvertError& E) {
    EXPECT_STREQ(E.what(), "Invalid property element: shGrey");
  }
}

TEST_F(WidgetFixture, EventsBindPublishedMethodsByNameAndCarryTheirSignature) {
  // The event's type data: kind, parameters with flags, names and type names, result.
  const auto& Data = GetTypeData(Prop("OnPress")->PropType())->MethodData;
  std::vector<std::uint8_t> Expected{mkProcedure, 4};
  auto Put = [&](std::uint8_t Flags, const char* Name, const char* Type) {
    Expected.push_back(Flags);
    Expected.push_back(static_cast<std::uint8_t>(strlen(Name)));
    Expected.insert(Expected.end(), Name, Name + strlen(Name));
    Expected.push_back(static_cast<std::uint8_t>(strlen(Type)));
    Expected.insert(Expected.end(), Type, Type + strlen(Type));
  };
  Put(0, "Sender", "TObject");
  Put(0, "X", "Integer");
  Put(1 << pfVar, "Handled", "Integer");
  Put(1 << pfConst, "Why", "string");
  Expected.push_back(0);
  EXPECT_EQ(Data, Expected);
  const auto& Query = GetTypeData(TypeInfo<TQueryEvent>())->MethodData;
  EXPECT_EQ(Query[0], mkFunction);
  EXPECT_EQ(String(Query.end() - 7, Query.end()), "Boolean");

  TMethod M = BindMethodByName(W, "pressed", detail::SignatureId<TPressEvent::Signature>());
  ASSERT_TRUE(M.IsAssigned());
  SetMethodProp(W, Prop("OnPress"), M);
  int Handled = 0;
  W->FOnPress(W, 7, Handled, "why");
  EXPECT_EQ(W->LastX, 7);
  EXPECT_EQ(Handled, 1);
  EXPECT_EQ(GetMethodProp(W, Prop("OnPress")), M);
  EXPECT_EQ(W->MethodName(M.Code), "Pressed");
  EXPECT_EQ(W->MethodAddress("PRESSED"), M.Code);
  EXPECT_EQ(W->MethodName(reinterpret_cast<void*>(&TypeInfo<int>)), "");
  EXPECT_FALSE(BindMethodByName(W, "Absent", nullptr).IsAssigned());
  try {
    BindMethodByName(W, "Query", detail::SignatureId<TPressEvent::Signature>());
    FAIL();
  } catch (const EPropertyConvertError& E) {
    EXPECT_STREQ(E.what(), "Method Query does not fit");
  }
  // A compiled binding checks the signature at compile time and calls directly.
  auto Bound = TPressEvent::Bind<&TSampleWidget::Pressed>(W);
  Bound(W, 9, Handled, "");
  EXPECT_EQ(W->LastX, 9);
}

namespace {

FK_ALIAS(TShortText, tkString)
FK_ALIAS(TAnsiText, tkLString)
FK_ALIAS(TTextAsVariant, tkVariant)

/// Text in each string kind, and properties of other kinds for the refusals.
class TTextHolder : public TPersistent {
  FK_CLASS(TTextHolder, TPersistent)
  String FShort, FAnsi, FText, FOdd;
  WideString FWide;
  int FCount = 7;
  String Fixed() const { return "fixed"; }
};
FK_IMPLEMENT(TTextHolder, "Tests") {
  B.Field("Short", &TTextHolder::FShort).Type(&TypeInfo_TShortText);
  B.Field("Ansi", &TTextHolder::FAnsi).Type(&TypeInfo_TAnsiText);
  B.Field("Text", &TTextHolder::FText);
  B.Field("Wide", &TTextHolder::FWide);
  B.Field("Odd", &TTextHolder::FOdd).Type(&TypeInfo_TTextAsVariant);
  B.Field("Count", &TTextHolder::FCount);
  B.Property("Fixed", &TTextHolder::Fixed);
}

} // namespace

TEST(AnsiStringAccess, EveryTextKindCarriesTheSameUtf8BytesAndOthersAreRefused) {
  TObjectGuard<TTextHolder> H(new TTextHolder);
  auto Prop = [&](const char* Name) { return GetPropInfo(H.Get(), Name); };
  EXPECT_EQ(Prop("Short")->Kind(), tkString);
  EXPECT_EQ(Prop("Ansi")->Kind(), tkLString);
  EXPECT_EQ(Prop("Text")->Kind(), tkUString);
  EXPECT_EQ(Prop("Wide")->Kind(), tkWString);

  // Letters beyond Latin-1, a sign beyond 8 bits and one beyond 16: nothing is narrowed.
  const String Text = "Gr\xC3\xBC\xC3\x9F" "e \xE2\x82\xAC \xF0\x9F\x98\x80";
  for (const char* Name : {"Short", "Ansi", "Text", "Wide"}) {
    SetAnsiStrProp(H.Get(), Prop(Name), Text);
    EXPECT_EQ(GetAnsiStrProp(H.Get(), Prop(Name)), Text) << Name;
    EXPECT_EQ(GetStrProp(H.Get(), Prop(Name)), Text) << Name;
  }
  EXPECT_EQ(H->FAnsi, Text);
  EXPECT_EQ(H->FWide, u"Gr\u00FC\u00DFe \u20AC \U0001F600");
  SetStrProp(H.Get(), Prop("Wide"), "plain");
  EXPECT_EQ(GetAnsiStrProp(H.Get(), Prop("Wide")), "plain");

  // A property of another kind is refused both ways and keeps its value, even a text
  // field whose type record names another kind.
  for (const char* Name : {"Count", "Odd"}) {
    String Expected = String("Invalid property type: ") + (Name == String("Count") ? "Integer" : "TTextAsVariant");
    try {
      SetAnsiStrProp(H.Get(), Prop(Name), "8");
      ADD_FAILURE() << Name;
    } catch (const EPropertyConvertError& E) {
      EXPECT_EQ(E.Message(), Expected);
    }
    try {
      (void)GetAnsiStrProp(H.Get(), Prop(Name));
      ADD_FAILURE() << Name;
    } catch (const EPropertyConvertError& E) {
      EXPECT_EQ(E.Message(), Expected);
    }
  }
  EXPECT_EQ(H->FCount, 7);
  EXPECT_EQ(H->FOdd, "");

  // A read-only text reads and refuses a write with the property's name.
  EXPECT_EQ(GetAnsiStrProp(H.Get(), Prop("Fixed")), "fixed");
  try {
    SetAnsiStrProp(H.Get(), Prop("Fixed"), "other");
    FAIL();
  } catch (const EPropertyError& E) {
    EXPECT_EQ(E.Message(), "Property Fixed is read-only");
  }
}

TEST(ClassRecords, NamesInheritanceAndGeneratedClasses) {
  TClass C = TSampleWidget::StaticClass();
  EXPECT_EQ(C->ClassName, "TSampleWidget");
  EXPECT_EQ(C->UnitName, "SampleUnit");
  EXPECT_EQ(C->QualifiedClassName(), "SampleUnit.TSampleWidget");
  EXPECT_TRUE(C->ClassNameIs("tsamplewidget"));
  EXPECT_TRUE(C->InheritsFrom(TComponent::StaticClass()));
  EXPECT_FALSE(TComponent::StaticClass()->InheritsFrom(C));
  EXPECT_EQ(TObject::StaticClass()->Parent, nullptr);

  // A record made at run time on a compiled parent: own names and methods, the
  // parent's properties and C++ type, hooks at destruction and notification.
  TGeneratedClass GenRecord = TClassRec::NewGeneratedClass(C, "TForm1", "Unit1");
  TClass Gen = GenRecord.get();
  Gen->Methods.push_back({"Button1Click", reinterpret_cast<void*>(std::uintptr_t(3)), nullptr, nullptr});
  int Destroyed = 0, Notified = 0;
  Gen->OnDestroy = [&](TObject*) { ++Destroyed; };
  Gen->OnNotification = [&](TComponent*, TComponent*, TOperation) { ++Notified; };
  auto* Obj = static_cast<TSampleWidget*>(Gen->NewInstance());
  RunConstructor(Obj, nullptr);
  EXPECT_EQ(Obj->ClassName(), "TForm1");
  EXPECT_EQ(Obj->QualifiedClassName(), "Unit1.TForm1");
  EXPECT_EQ(Obj->CompiledClass(), C);
  EXPECT_TRUE(Obj->InheritsFrom(C));
  EXPECT_NE(GetPropInfo(Obj, "Caption"), nullptr);
  EXPECT_EQ(Obj->MethodName(reinterpret_cast<void*>(std::uintptr_t(3))), "Button1Click");
  EXPECT_NE(Obj->MethodAddress("Pressed"), nullptr);

  // Calling a token of a generated class raises instead of jumping to it.
  Obj->FOnPress = TPressEvent(TMethod{reinterpret_cast<void*>(std::uintptr_t(3)), Obj});
  int Handled = 0;
  try {
    Obj->FOnPress(Obj, 1, Handled, "");
    FAIL();
  } catch (const EMethodTokenCall& E) {
    EXPECT_STREQ(E.what(), "Method Button1Click of a generated class cannot be called");
  }
  TComponent* Child = CreateComponentOf<TComponent>(Obj);
  Child->Destroy();
  EXPECT_EQ(Notified, 2); // the insertion and the removal
  // Re-classing back to the compiled class and forth again.
  Obj->SetClassType(C);
  EXPECT_EQ(Obj->ClassName(), "TSampleWidget");
  Obj->SetClassType(Gen);
  EXPECT_THROW(Obj->SetClassType(TListener::StaticClass()), EInvalidCast);
  Obj->Destroy();
  EXPECT_EQ(Destroyed, 1);
}
