// TALUtil from C++, bound early. Link with ole32 and oleaut32.
#include <windows.h>

#include <cstdio>

#include "talutil.h"

namespace {

/// A text that members can take by reference, change and return.
class Text {
 public:
  explicit Text(const wchar_t* text = nullptr) : text_(SysAllocString(text)) {}
  Text(const Text&) = delete;
  Text& operator=(const Text&) = delete;
  ~Text() { SysFreeString(text_); }
  BSTR* get() { return &text_; }
  const wchar_t* c_str() const { return text_ == nullptr ? L"" : text_; }

 private:
  BSTR text_;
};

void use(TALUtil::_ORVUtils& utils) {
  Text list(L"red,green,blue,");
  Text element;
  long first = 1;
  long last = 2;
  if (SUCCEEDED(utils.GetData(list.get(), &first, &last, element.get()))) std::printf("%ls\n", element.c_str());

  // A call that fails returns the number of the run-time error; the thread's error object has its text.
  last = 0;
  Text unused;
  const HRESULT status = utils.GetData(list.get(), &first, &last, unused.get());
  IErrorInfo* info = nullptr;
  if (FAILED(status) && GetErrorInfo(0, &info) == S_OK) {
    Text description;
    info->GetDescription(description.get());
    info->Release();
    std::printf("error %ld: %ls\n", status & 0xFFFF, description.c_str());
  }
}

}  // namespace

int main() {
  if (FAILED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED))) return 1;
  TALUtil::_ORVUtils* utils = nullptr;
  const HRESULT status = CoCreateInstance(TALUtil::CLSID_ORVUtils, nullptr, CLSCTX_INPROC_SERVER,
                                          TALUtil::IID__ORVUtils, reinterpret_cast<void**>(&utils));
  if (SUCCEEDED(status)) {
    use(*utils);
    utils->Terminate();
    utils->Release();
  }
  CoUninitialize();
  return FAILED(status);
}
