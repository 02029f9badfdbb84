//===- core/IDECreators.cpp - What a wizard hands the host -----------------===//
#include "core/IDECreators.h"

namespace formkit::IDECreators {

String FileToString(const IPtr<IFile>& File) {
  if (IPtr<IString> Text = QueryAs<IString>(File)) return Text->GetString();
  File->Open();
  String Out(static_cast<size_t>(File->GetSize()), '\0');
  std::int64_t Got = Out.empty() ? 0 : File->Read(Out.data(), static_cast<std::int64_t>(Out.size()));
  Out.resize(static_cast<size_t>(Got < 0 ? 0 : Got));
  return Out;
}

std::vector<std::uint8_t> FileToBytes(const IPtr<IFile>& File) {
  File->Open();
  std::vector<std::uint8_t> Out(static_cast<size_t>(File->GetSize()));
  std::int64_t Got = Out.empty() ? 0 : File->Read(Out.data(), static_cast<std::int64_t>(Out.size()));
  Out.resize(static_cast<size_t>(Got < 0 ? 0 : Got));
  return Out;
}

} // namespace formkit::IDECreators
