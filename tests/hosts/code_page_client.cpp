// A client on a system with another code page: code_page_client FOLDER NUMBER. What its users write stays as it is, in
// members, in files and their names, in settings and in the registry.
#include <fstream>

#include "client.hpp"

using namespace talutil::hosts;

namespace {

std::string ansi(std::wstring_view text) {
  std::string bytes(4 * text.size(), '\0');
  const int length = WideCharToMultiByte(CP_ACP, 0, text.data(), static_cast<int>(text.size()), bytes.data(),
                                         static_cast<int>(bytes.size()), nullptr, nullptr);
  bytes.resize(static_cast<std::size_t>(length));
  return bytes;
}

std::string bytes_of(const std::wstring& path) {
  std::ifstream file(path.c_str(), std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

void everything_keeps(_ORVUtils* u, const std::wstring& name, const std::wstring& other) {
  const auto kept = [&](std::wstring_view expected, const Text& got, const char* what) {
    check_equal(expected, got.view(), what);
  };
  Text result;
  u->VerifyTextData(Number<short>{0}, Number<short>{0}, Value((L" " + name + L" #5? ").c_str()), result);
  kept(name + L" 5", result, "VerifyTextData");
  Text numbers;
  u->RemoveNumberFromString(Text(other + L" 5?"), numbers);
  kept(other, numbers, "RemoveNumberFromString");
  Text replaced;
  u->StringReplace(Text(name + L"?" + other), Text(L"?"), Text(L"-"), replaced);
  kept(name + L"-" + other, replaced, "StringReplace");

  const std::wstring folder = L"C:\\" + other + std::to_wstring(GetACP()) + L"\\";
  const std::wstring path = folder + name + L".txt";
  VARIANT_BOOL is_there = VARIANT_FALSE;
  u->VerifyFilePath(Text(folder));
  u->PathExists(Text(folder).release(), &is_there);
  check_equal(VARIANT_TRUE, is_there, "PathExists");
  check_equal(S_OK, u->SaveTextBox(Text(name + other), Text(path)), "SaveTextBox");
  check_equal(ansi(name + other) + "\r\n", bytes_of(path), "its bytes");
  Text loaded;
  u->LoadTextBox(Text(path), loaded);
  kept(name + other + L"\r\n", loaded, "LoadTextBox");

  const Text ini(folder + name + L".ini");
  VARIANT_BOOL in_file = VARIANT_TRUE;
  check_equal(S_OK, u->SaveCfgFileData(Text(name), Text(other), Text(name + other), Text(ini.view()), &in_file),
              "SaveCfgFileData");
  check_equal("[" + ansi(name) + "]\r\n" + ansi(other) + "=" + ansi(name + other) + "\r\n",
              bytes_of(std::wstring(ini.view())), "the settings file's bytes");
  Text setting;
  u->GetCfgFileData(Text(name), Text(other), Text(L"none"), Text(ini.view()), &in_file, setting);
  kept(name + other, setting, "GetCfgFileData");

  const Text key(L"Software\\" + name);
  Number<LONG> user{static_cast<LONG>(0x80000001)};
  u->REGISTRY_CreateNewKey(Text(key.view()), user);
  u->REGISTRY_SetKeyValue(Text(key.view()), Text(other), Value(name.c_str()), Number<LONG>{1});
  Text value;
  u->REGISTRY_ReturnValue(Text(key.view()), Text(other), value);
  kept(name, value, "REGISTRY_ReturnValue");

  VARIANT_BOOL yes = VARIANT_TRUE;
  const std::wstring archive = folder + other + L".zip";
  u->CallZIPFiles(Text(archive), Text(path), Number<short>{0}, Text(), &yes);
  check_equal(S_OK, u->CallUnZIPFiles(Text(archive), Text(folder + L"out\\"), Text(), &yes), "CallUnZIPFiles");
  check_equal(ansi(name + other) + "\r\n", bytes_of(folder + L"out\\" + name + L".txt"), "what was unpacked");
}

}  // namespace

int wmain(int count, wchar_t** arguments) {
  return run_checks([&] {
    const UINT page = count > 2 ? static_cast<UINT>(_wtoi(arguments[2])) : 0;
    check_equal(page, GetACP(), "the system's code page");
    const Pointer<_ORVUtils> u = create_object();
    // In code page 932, the second byte of one character is that of "\\".
    everything_keeps(u.get(), page == 932 ? L"\u65E5\u672C" : L"\u041E\u043B\u044C\u0433\u0430",
                     page == 932 ? L"\u8868\u793A" : L"\u0434\u043E\u043C");
  });
}
