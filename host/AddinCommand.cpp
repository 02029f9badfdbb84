//===- host/AddinCommand.cpp - A module edited the way an add-in edits it -===//
#include "host/AddinCommand.h"

#include "core/root/ComponentRoot.h"
#include "host/DesignHost.h"
#include "platform/FormatSettings.h"
#include "platform/Variants.h"

#include <ostream>

namespace formkit {

namespace {

//===----------------------------------------------------------------------===//
// Components by name
//===----------------------------------------------------------------------===//

String NameOf(const IPtr<IOTAComponent>& Component) {
  String Name;
  if (Component) (void)Component->GetPropValueByName("Name", &Name);
  return Name;
}

/// The component `Name` of the module, the module's own name included.
IPtr<IOTAComponent> ComponentNamed(const IPtr<IOTAFormEditor>& Editor, const String& Name) {
  IPtr<IOTAComponent> Root = Editor->GetRootComponent();
  if (Root && SameText(NameOf(Root), Name)) return Root;
  if (IPtr<IOTAComponent> Found = Editor->FindComponent(Name)) return Found;
  throw EAddinError(sAddinNoComponent, Name);
}

/// "NAME.PROP" split at its first dot; a usage error without one.
std::pair<String, String> SplitPath(const char* Action, const String& Path) {
  std::size_t Dot = Path.find('.');
  if (Dot == String::npos || Dot == 0 || Dot + 1 == Path.size())
    throw EAddinUsageError(sAddinArguments, Action, "NAME.PROP");
  return {Path.substr(0, Dot), Path.substr(Dot + 1)};
}

//===----------------------------------------------------------------------===//
// Values by kind
//===----------------------------------------------------------------------===//

/// The property record behind a wrapper's property, for the names and widths of ordinals.
PPropInfo PropertyRecord(const IPtr<IOTAComponent>& Component, const String& Prop) {
  auto Native = QueryAs<INTAComponent>(Component);
  return Native ? GetPropInfo(Native->GetPersistent(), Prop) : nullptr;
}

TTypeKind KindOf(const IPtr<IOTAComponent>& Component, const String& Prop) {
  TTypeKind Kind = Component->GetPropTypeByName(Prop);
  if (Kind == tkUnknown) throw EAddinError(sAddinNoProperty, NameOf(Component), Prop);
  return Kind;
}

String OrdinalText(const IPtr<IOTAComponent>& Component, const String& Prop, TTypeKind Kind) {
  std::int32_t Value = 0;
  (void)Component->GetPropValueByName(Prop, &Value);
  switch (Kind) {
  case tkChar: return String(1, static_cast<char>(Value));
  case tkWChar: return Utf16ToUtf8(std::u16string(1, static_cast<char16_t>(Value)));
  case tkEnumeration: return GetEnumName(PropertyRecord(Component, Prop)->PropType(), Value);
  default: return IntToStr(Value);
  }
}

/// Reads `Text` as the ordinal value of property `Prop`; false when it is none.
bool ParseOrdinal(PPropInfo Record, TTypeKind Kind, const String& Text, std::int64_t& Value) {
  PTypeInfo Type = Record->PropType();
  switch (Kind) {
  case tkChar:
    Value = static_cast<unsigned char>(Text.empty() ? 0 : Text[0]);
    return Text.size() == 1;
  case tkWChar: {
    WideString Wide = Utf8ToUtf16(Text);
    Value = Wide.empty() ? 0 : Wide[0];
    return Wide.size() == 1;
  }
  case tkEnumeration:
    Value = GetEnumValue(Type, Text);
    return Value >= 0;
  case tkSet: return TryStrToInt64(Text, Value) && Value >= 0 && Value <= 0xFFFFFFFFll;
  default:
    return TryStrToInt64(Text, Value) && Value >= GetTypeData(Type)->MinValue &&
           Value <= GetTypeData(Type)->MaxValue;
  }
}

/// Sets an ordinal property in the width of its ordinal type.
bool SetOrdinal(const IPtr<IOTAComponent>& Component, const String& Prop, PPropInfo Record, std::int64_t Value) {
  switch (GetTypeData(Record->PropType())->OrdType) {
  case otSByte: {
    auto V = static_cast<std::int8_t>(Value);
    return Component->SetPropByName(Prop, &V);
  }
  case otUByte: {
    auto V = static_cast<std::uint8_t>(Value);
    return Component->SetPropByName(Prop, &V);
  }
  case otSWord: {
    auto V = static_cast<std::int16_t>(Value);
    return Component->SetPropByName(Prop, &V);
  }
  case otUWord: {
    auto V = static_cast<std::uint16_t>(Value);
    return Component->SetPropByName(Prop, &V);
  }
  default: {
    auto V = static_cast<std::uint32_t>(Value);
    return Component->SetPropByName(Prop, &V);
  }
  }
}

//===----------------------------------------------------------------------===//
// Actions
//===----------------------------------------------------------------------===//

void List(const IPtr<IOTAFormEditor>& Editor, std::ostream& Out) {
  IPtr<IOTAComponent> Root = Editor->GetRootComponent();
  Out << NameOf(Root) << "\t" << Root->GetComponentType() << "\t\n";
  for (int I = 0, N = Root->GetComponentCount(); I < N; ++I) {
    IPtr<IOTAComponent> Component = Root->GetComponent(I);
    Out << NameOf(Component) << "\t" << Component->GetComponentType() << "\t" << NameOf(Component->GetParent())
        << "\n";
  }
}

String Create(const IPtr<IOTAFormEditor>& Editor, const String& ClassName, const String& ParentName) {
  IPtr<IOTAComponent> Parent = ParentName.empty() ? nullptr : ComponentNamed(Editor, ParentName);
  // Without bounds the designer puts the component, at its class's own size, in the
  // middle of the container selected: the parent, or the form when none is given.
  (Parent ? Parent : Editor->GetRootComponent())->Select(false);
  IPtr<IOTAComponent> Made = Editor->CreateComponent(Parent, ClassName, 0, 0, 0, 0);
  if (!Made) throw EAddinError(sAddinCannotCreate, ClassName);
  return NameOf(Made);
}

void Delete(const IPtr<IOTAFormEditor>& Editor, const String& Name) {
  if (!ComponentNamed(Editor, Name)->Delete()) throw EAddinError(sAddinCannotDelete, Name);
}

/// From `Min` to `Max` arguments after the action, or a usage error.
void Expect(const std::vector<String>& Args, std::size_t Min, std::size_t Max, const char* Needs) {
  if (Args.size() < 2 + Min) throw EAddinUsageError(sAddinArguments, Args[1], Needs);
  if (Args.size() > 2 + Max) throw EAddinUsageError(sAddinExtraArgument, Args[2 + Max], Args[1]);
}

} // namespace

//===----------------------------------------------------------------------===//
// Properties
//===----------------------------------------------------------------------===//

String AddinPropertyText(const IPtr<IOTAComponent>& Component, const String& Prop) {
  TTypeKind Kind = KindOf(Component, Prop);
  switch (Kind) {
  case tkInteger:
  case tkChar:
  case tkEnumeration:
  case tkSet:
  case tkWChar: return OrdinalText(Component, Prop, Kind);
  case tkFloat: {
    long double Value = 0;
    (void)Component->GetPropValueByName(Prop, &Value);
    return FloatToStrF(static_cast<double>(Value), ffGeneral, 15, 0, TFormatSettings());
  }
  case tkString: {
    TOTAShortString Value;
    (void)Component->GetPropValueByName(Prop, &Value);
    return String(Value.Chars, Value.Length);
  }
  case tkLString:
  case tkUString: {
    String Value;
    (void)Component->GetPropValueByName(Prop, &Value);
    return Value;
  }
  case tkWString: {
    WideString Value;
    (void)Component->GetPropValueByName(Prop, &Value);
    return Utf16ToUtf8(Value);
  }
  case tkVariant: {
    TVariant Value;
    (void)Component->GetPropValueByName(Prop, &Value);
    return VarToStrDef(Value, "");
  }
  case tkClass: {
    IPtr<IOTAComponent> Value;
    (void)Component->GetPropValueByName(Prop, &Value);
    return Value ? "(" + Value->GetComponentType() + ")" : "(none)";
  }
  case tkMethod: {
    TMethod Value{};
    (void)Component->GetPropValueByName(Prop, &Value);
    return Value.Code ? "(assigned)" : "(none)";
  }
  default: throw EAddinError(sAddinNotSettable, NameOf(Component), Prop);
  }
}

void SetAddinProperty(const IPtr<IOTAComponent>& Component, const String& Prop, const String& Text) {
  TTypeKind Kind = KindOf(Component, Prop);
  const String Name = NameOf(Component);
  auto Bad = [&]() { return EAddinError(sAddinBadValue, Text, Name, Prop); };
  bool Done = false;
  switch (Kind) {
  case tkInteger:
  case tkChar:
  case tkEnumeration:
  case tkSet:
  case tkWChar: {
    PPropInfo Record = PropertyRecord(Component, Prop);
    std::int64_t Value = 0;
    if (!ParseOrdinal(Record, Kind, Text, Value)) throw Bad();
    Done = SetOrdinal(Component, Prop, Record, Value);
    break;
  }
  case tkFloat: {
    double Value = 0;
    if (!TryStrToFloat(Text, Value, TFormatSettings())) throw Bad();
    long double Extended = Value;
    Done = Component->SetPropByName(Prop, &Extended);
    break;
  }
  case tkString: {
    if (Text.size() > sizeof(TOTAShortString::Chars)) throw Bad();
    TOTAShortString Value;
    Value.Length = static_cast<std::uint8_t>(Text.size());
    Text.copy(Value.Chars, Text.size());
    Done = Component->SetPropByName(Prop, &Value);
    break;
  }
  case tkLString:
  case tkUString: Done = Component->SetPropByName(Prop, &Text); break;
  case tkWString: {
    WideString Value = Utf8ToUtf16(Text);
    Done = Component->SetPropByName(Prop, &Value);
    break;
  }
  case tkVariant: {
    TVariant Value(Text);
    Done = Component->SetPropByName(Prop, &Value);
    break;
  }
  default: break;
  }
  if (!Done) throw EAddinError(sAddinNotSettable, Name, Prop);
}

//===----------------------------------------------------------------------===//
// The command
//===----------------------------------------------------------------------===//

void RunAddinCommand(const std::vector<String>& Args, std::ostream& Out) {
  if (Args.size() < 2) throw EAddinUsageError(sAddinArguments, "FILE", "an ACTION");
  const String& Action = Args[1];
  if (Action != "list" && Action != "get" && Action != "set" && Action != "create" && Action != "delete")
    throw EAddinUsageError(sAddinBadAction, Action);
  if (Action == "list") Expect(Args, 0, 0, "");
  else if (Action == "get") Expect(Args, 1, 1, "NAME.PROP");
  else if (Action == "set") Expect(Args, 2, 2, "NAME.PROP VALUE");
  else if (Action == "create") Expect(Args, 1, 2, "CLASS [PARENT]");
  else Expect(Args, 1, 1, "NAME");
  std::pair<String, String> Path;
  if (Action == "get" || Action == "set") Path = SplitPath(Action.c_str(), Args[2]);

  TDesignSession Session;
  IPtr<IRoot> Root = Session.Open(Args[0]);
  IPtr<IOTAFormEditor> Editor = TDesignSession::RootOf(Root)->GetFormEditor();
  if (Action == "list") return List(Editor, Out);
  if (Action == "get") {
    Out << AddinPropertyText(ComponentNamed(Editor, Path.first), Path.second) << "\n";
    return;
  }
  if (Action == "set") SetAddinProperty(ComponentNamed(Editor, Path.first), Path.second, Args[3]);
  else if (Action == "create") Out << Create(Editor, Args[2], Args.size() > 3 ? Args[3] : "") << "\n";
  else Delete(Editor, Args[2]);
  Session.Save(Root);
}

} // namespace formkit
