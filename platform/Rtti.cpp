//===- platform/Rtti.cpp - Finding a type by its qualified name -----------===//
#include "platform/Rtti.h"

#include <mutex>
#include <unordered_map>

namespace formkit {

namespace {
struct TTypeTable {
  std::mutex Lock; // records are built on first use, possibly on any thread
  std::unordered_map<String, PTypeInfo> ByFoldedName;
};

TTypeTable& Types() {
  static auto* Table = new TTypeTable; // outlives every record, which are immortal too
  return *Table;
}

/// Builds the records of the language's own types, which every program has whether it
/// used them yet or not.
void MakeBuiltInTypes() {
  (void)FK_TypeInfo(static_cast<const std::int8_t*>(nullptr));
  (void)FK_TypeInfo(static_cast<const std::uint8_t*>(nullptr));
  (void)FK_TypeInfo(static_cast<const std::int16_t*>(nullptr));
  (void)FK_TypeInfo(static_cast<const std::uint16_t*>(nullptr));
  (void)FK_TypeInfo(static_cast<const std::int32_t*>(nullptr));
  (void)FK_TypeInfo(static_cast<const std::uint32_t*>(nullptr));
  (void)FK_TypeInfo(static_cast<const std::int64_t*>(nullptr));
  (void)FK_TypeInfo(static_cast<const bool*>(nullptr));
  (void)FK_TypeInfo(static_cast<const char*>(nullptr));
  (void)FK_TypeInfo(static_cast<const char16_t*>(nullptr));
  (void)FK_TypeInfo(static_cast<const double*>(nullptr));
  (void)FK_TypeInfo(static_cast<const float*>(nullptr));
  (void)FK_TypeInfo(static_cast<const String*>(nullptr));
  (void)FK_TypeInfo(static_cast<const WideString*>(nullptr));
  (void)FK_TypeInfo(static_cast<const TVariant*>(nullptr));
}
} // namespace

namespace detail {
void RememberType(PTypeInfo Info, const String& QualifiedName) {
  TTypeTable& Table = Types();
  std::lock_guard<std::mutex> Guard(Table.Lock);
  // The first record of a name stays: a later one of the same name cannot replace it.
  Table.ByFoldedName.emplace(LowerCase(QualifiedName), Info);
}
} // namespace detail

PTypeInfo TRttiContext::FindType(std::string_view QualifiedName) const {
  static const bool BuiltIns = (MakeBuiltInTypes(), true);
  (void)BuiltIns;
  TTypeTable& Table = Types();
  std::lock_guard<std::mutex> Guard(Table.Lock);
  auto Found = Table.ByFoldedName.find(LowerCase(String(QualifiedName)));
  return Found == Table.ByFoldedName.end() ? nullptr : Found->second;
}

} // namespace formkit
