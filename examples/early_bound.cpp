// A C++ program that is bound early: the calls of the README's script through the vtable, with the types of talutil.h.
// Any compiler for Windows builds it, for 32 or 64 bit; the library is registered or has its manifest in the program's:
//
//   x86_64-w64-mingw32-g++ -std=c++11 -static -Iinclude -o early_bound.exe early_bound.cpp -lole32 -loleaut32
//   cl /EHsc /Iinclude early_bound.cpp ole32.lib oleaut32.lib
#include <talutil.h>

#include <cstdio>
#include <stdexcept>
#include <string>

namespace {

/// A text as an argument or a result of a call. The library takes texts by reference.
class Text {
 public:
  explicit Text(const wchar_t* text = nullptr) : value_(SysAllocString(text)) {}
  Text(const Text&) = delete;
  Text& operator=(const Text&) = delete;
  ~Text() { SysFreeString(value_); }

  BSTR* reference() { return &value_; }
  const wchar_t* characters() const { return value_ == nullptr ? L"" : value_; }

 private:
  BSTR value_;
};

std::string in_ansi(const wchar_t* text) {
  std::string result(2 * std::char_traits<wchar_t>::length(text) + 1, '\0');
  const int size =
      WideCharToMultiByte(CP_ACP, 0, text, -1, &result[0], static_cast<int>(result.size()), nullptr, nullptr);
  result.resize(size > 0 ? size - 1 : 0);
  return result;
}

/// Throws the text of the run-time error that a call has returned.
void check(HRESULT result) {
  if (SUCCEEDED(result)) return;
  std::string message = "error " + std::to_string(result & 0xFFFF);
  IErrorInfo* information = nullptr;
  if (GetErrorInfo(0, &information) == S_OK) {
    Text description;
    if (SUCCEEDED(information->GetDescription(description.reference()))) {
      message += ": " + in_ansi(description.characters());
    }
    information->Release();
  }
  throw std::runtime_error(message);
}

void clean(TALUtil::_ORVUtils& toolkit) {
  short length = 10;
  short extras = 0;
  VARIANT value = {};
  V_VT(&value) = VT_BSTR;
  V_BSTR(&value) = SysAllocString(L"  O'Brien & Sons  ");
  Text cleaned;
  const HRESULT result = toolkit.VerifyTextData(&length, &extras, &value, cleaned.reference());
  VariantClear(&value);
  check(result);
  std::printf("%s\n", in_ansi(cleaned.characters()).c_str());
}

void split(TALUtil::_ORVUtils& toolkit) {
  Text colours(L"red,green,blue,");
  Text comma(L",");
  SAFEARRAY* list = nullptr;
  long count = 0;
  check(toolkit.ReadCommaDelimStrToList(colours.reference(), &list, comma.reference(), &count));
  std::printf("%ld %s\n", count, in_ansi(static_cast<BSTR*>(list->pvData)[1]).c_str());
  SafeArrayDestroy(list);
}

void fail(TALUtil::_ORVUtils& toolkit) {
  Text word(L"a");
  Text empty;
  Text result;
  try {
    check(toolkit.StringReplace(word.reference(), empty.reference(), empty.reference(), result.reference()));
  } catch (const std::runtime_error& error) {
    std::printf("%s\n", error.what());
  }
}

}  // namespace

int main() {
  CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED);
  int status = 1;
  TALUtil::_ORVUtils* toolkit = nullptr;
  try {
    check(CoCreateInstance(TALUtil::CLSID_ORVUtils, nullptr, CLSCTX_INPROC_SERVER, TALUtil::IID__ORVUtils,
                           reinterpret_cast<void**>(&toolkit)));
    clean(*toolkit);
    split(*toolkit);
    fail(*toolkit);
    check(toolkit->Terminate());
    status = 0;
  } catch (const std::exception& error) {
    std::fprintf(stderr, "early_bound: %s\n", error.what());
  }
  if (toolkit != nullptr) toolkit->Release();
  CoUninitialize();
  return status;
}
