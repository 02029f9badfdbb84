//===- tools/PasSym.cpp - Reserved words of Pascal ------------------------===//
#include "tools/PasSym.h"

#include "platform/TypInfoBuilder.h"

namespace formkit {

FK_IMPLEMENT(TPascalSymbol, "PasSym") {}

TSymbolTable* PascalSymbols = nullptr;

namespace {

// In table order: the order of insertion decides the order within a bucket.
constexpr detail::TReservedWord PascalWords[] = {
    {4, "AND"},          {5, "ARRAY"},           {4, "AS"},          {135, "ASM"},
    {33, "AUTOMATED"},   {20, "BEGIN"},          {27, "CASE"},       {31, "CLASS"},
    {15, "CONST"},       {21, "CONSTRUCTOR"},    {22, "DESTRUCTOR"}, {131, "DISPINTERFACE"},
    {4, "DIV"},          {4, "DO"},              {4, "DOWNTO"},      {4, "ELSE"},
    {13, "END"},         {4, "EXCEPT"},          {137, "EXPORTS"},   {17, "FILE"},
    {139, "FINALIZATION"}, {4, "FINALLY"},       {140, "FOR"},       {8, "FUNCTION"},
    {4, "GOTO"},         {4, "IF"},              {30, "IMPLEMENTATION"}, {138, "IN"},
    {29, "INHERITED"},   {24, "INITIALIZATION"}, {4, "INLINE"},      {128, "INTERFACE"},
    {4, "IS"},           {136, "LABEL"},         {4, "LIBRARY"},     {4, "MOD"},
    {4, "NIL"},          {4, "NOT"},             {130, "OBJECT"},    {6, "OF"},
    {4, "ON"},           {141, "OPERATOR"},      {4, "OR"},          {132, "PACKED"},
    {9, "PRIVATE"},      {10, "PROTECTED"},      {7, "PROCEDURE"},   {4, "PROGRAM"},
    {32, "PROPERTY"},    {11, "PUBLIC"},         {12, "PUBLISHED"},  {4, "RAISE"},
    {25, "RECORD"},      {133, "RESOURCESTRING"}, {142, "REPEAT"},   {34, "SET"},
    {4, "SHL"},          {4, "SHR"},             {16, "STRING"},     {4, "THEN"},
    {26, "THREADVAR"},   {4, "TO"},              {28, "TRY"},        {23, "TYPE"},
    {4, "UNIT"},         {143, "UNTIL"},         {129, "USES"},      {14, "VAR"},
    {4, "WHILE"},        {4, "WITH"},            {4, "XOR"},
};
static_assert(std::size(PascalWords) == 71);

std::size_t MaxPasSymLength = 0;

} // namespace

void InitializePasSym() {
  if (PascalSymbols) return;
  PascalSymbols = detail::BuildReservedWords<TPascalSymbol>(PascalWords, stInsensitive, MaxPasSymLength);
}

void FinalizePasSym() noexcept {
  FreeAndNil(PascalSymbols);
  MaxPasSymLength = 0;
}

namespace {
/// The table exists from the start of a program that links this unit, before anything asks.
const detail::TUnitLifetime<InitializePasSym, FinalizePasSym> PasSymUnit;
} // namespace

namespace PasSym {

std::size_t MaxWordLength() noexcept { return MaxPasSymLength; }

bool IsReservedWord(const detail::ShortString& AWord) {
  if (!PascalSymbols) detail::RaiseReservedWordsNotLoaded("Pascal");
  return PascalSymbols->Find(AWord) != nullptr;
}

bool IsReservedWord(std::string_view AWord) {
  if (!PascalSymbols) detail::RaiseReservedWordsNotLoaded("Pascal");
  detail::ShortString Key;
  return detail::ReservedWordKey(AWord, MaxPasSymLength, Key) && IsReservedWord(Key);
}

} // namespace PasSym

} // namespace formkit
