//===- tools/ExpertFilterProperties.cpp - Property store, collections ----===//
//
// The values side of the template filter: property sets, collections and their
// current item, the condition stack, and the item name of a loop.
//
//===----------------------------------------------------------------------===//
#include "tools/ExpertFilterClasses.h"

#include "platform/TypInfoBuilder.h"

namespace formkit {

namespace {
/// The arrays of the store and of collections grow by this many entries.
constexpr std::size_t GrowBy = 5;

[[noreturn]] void IndexError(int AIndex) { throw EListError(sFilterListIndexError, AIndex); }
} // namespace

namespace detail {

String VarToStr(const TVariant& AValue) {
  switch (AValue.VarType()) {
  case varEmpty:
  case varNull:
  case varUnknown:
    return String();
  default:
    return AValue.AsString();
  }
}

IPtr<ICollectionProperty> VarToCollection(const TVariant& AValue) {
  if (AValue.VarType() != varUnknown) return nullptr;
  return QueryAs<ICollectionProperty>(AValue.AsInterface());
}

} // namespace detail

//===----------------------------------------------------------------------===//
// TPropertyValues
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TPropertyValues, "ExpertFilter") {}

IPtr<IPropertyValues> CoPropertyValues::Create() { return New<TPropertyValues>(); }

void TPropertyValues::SetProperty(const String& AKey, const TVariant& AValue) {
  for (int I = 0; I < FPropCount; ++I) {
    if (SameText(FPropArray[I].Key, AKey)) {
      FPropArray[I].Value = AValue;
      return;
    }
  }
  if (static_cast<std::size_t>(FPropCount) == FPropArray.size())
    FPropArray.resize(FPropArray.size() + GrowBy);
  FPropArray[FPropCount].Key = AKey;
  FPropArray[FPropCount].Value = AValue;
  ++FPropCount;
}

void TPropertyValues::SetCollectionProperty(const String& AKey,
                                            const IPtr<ICollectionProperty>& ACollection) {
  SetProperty(AKey, TVariant(IPtr<IInterface>(ACollection)));
}

TVariant TPropertyValues::GetProperty(int AIndex) {
  if (AIndex < 0 || AIndex >= FPropCount) IndexError(AIndex);
  return FPropArray[AIndex].Value;
}

TVariant TPropertyValues::GetProperty(const String& AKey) {
  std::size_t Dot = AKey.find('.');
  if (Dot != String::npos) {
    std::string_view Head(AKey.data(), Dot);
    for (int I = 0; I < FPropCount; ++I) {
      if (!SameText(FPropArray[I].Key, Head)) continue;
      if (IPtr<ICollectionProperty> Coll = detail::VarToCollection(FPropArray[I].Value))
        if (IPtr<IPropertyValues> Item = Coll->GetCurrentItem())
          return Item->GetProperty(AKey.substr(Dot + 1));
    }
  }
  for (int I = 0; I < FPropCount; ++I)
    if (SameText(FPropArray[I].Key, AKey)) return FPropArray[I].Value;
  return TVariant();
}

String TPropertyValues::GetPropertyKey(int AIndex) {
  if (AIndex < 0 || AIndex >= FPropCount) IndexError(AIndex);
  return FPropArray[AIndex].Key;
}

void TPropertyValues::ClearProperties() {
  FPropArray.clear();
  FPropCount = 0;
}

//===----------------------------------------------------------------------===//
// TCollectionProperty
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TCollectionProperty, "ExpertFilter") {}

IPtr<ICollectionProperty> CoCollectionProperty::Create() { return New<TCollectionProperty>(); }

void TCollectionProperty::AddItem(const IPtr<IPropertyValues>& AItem) {
  if (static_cast<std::size_t>(FCount) == FCollProperties.size())
    FCollProperties.resize(FCollProperties.size() + GrowBy);
  FCollProperties[FCount++] = AItem;
}

IPtr<IPropertyValues> TCollectionProperty::GetItem(int AIndex) {
  if (AIndex < 0 || AIndex >= FCount) IndexError(AIndex);
  return FCollProperties[AIndex];
}

IPtr<IPropertyValues> TCollectionProperty::GetCurrentItem() {
  if (!FCounter) return nullptr;
  int Index = FCounter->GetCurrentIteration();
  // Past the last item only while a loop ends; there is no current item then.
  if (Index < 0 || Index >= FCount) return nullptr;
  return FCollProperties[Index];
}

//===----------------------------------------------------------------------===//
// TBooleanStack
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TBooleanStack, "ExpertFilter") {}

void TBooleanStack::Report(const TResString& AMessage) {
  String Text = LoadResString(AMessage);
  if (!FErrorReporter) throw EExpertFilterError(Text);
  FErrorReporter->ReportError(Text);
}

void TBooleanStack::Cleanup() {
  FBoolArray.clear();
  FErrorReporter = nullptr;
}

bool TBooleanStack::AllTrue() {
  for (bool B : FBoolArray)
    if (!B) return false;
  return true;
}

bool TBooleanStack::GetTop() {
  if (FBoolArray.empty()) {
    Report(sTopEmptyStack);
    return false;
  }
  return FBoolArray.back();
}

bool TBooleanStack::Pop() {
  if (FBoolArray.empty()) {
    Report(sPopEmptyStack);
    return false;
  }
  bool Top = FBoolArray.back();
  FBoolArray.pop_back();
  return Top;
}

void TBooleanStack::ToggleTop() {
  if (FBoolArray.empty()) {
    Report(sTopEmptyStack);
    return;
  }
  FBoolArray.back() = !FBoolArray.back();
}

//===----------------------------------------------------------------------===//
// TItemNameOverrider
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TItemNameOverrider, "ExpertFilter") {}

IPtr<TItemNameOverrider> TItemNameOverrider::Create(const IPtr<IPropertyValues>& APropValues,
                                                    const String& AKeyName,
                                                    const TVariant& ANewValue) {
  IPtr<TItemNameOverrider> Result = New<TItemNameOverrider>();
  Result->FKeyName = AKeyName;
  Result->FPrevValue = APropValues->GetProperty(AKeyName);
  APropValues->SetProperty(AKeyName, ANewValue);
  Result->FPropValues = APropValues;
  return Result;
}

void TItemNameOverrider::Cleanup() {
  if (IPtr<IPropertyValues> Values = std::move(FPropValues)) {
    Values->SetProperty(FKeyName, FPrevValue);
    FPrevValue = TVariant();
  }
}

} // namespace formkit
