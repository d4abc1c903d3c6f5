// A client on a system with another code page: code_page_client FOLDER NUMBER. What its users write stays as it is, in
// members, in files and their names, in settings and in the registry.
#include "client.hpp"

using namespace talutil::hosts;

namespace {

using U = _ORVUtils;

std::string ansi(std::wstring_view text) {
  std::string bytes(4 * text.size(), '\0');
  const int length = WideCharToMultiByte(CP_ACP, 0, text.data(), static_cast<int>(text.size()), bytes.data(),
                                         static_cast<int>(bytes.size()), nullptr, nullptr);
  bytes.resize(static_cast<std::size_t>(length));
  return bytes;
}

void texts_stay(U* u, const std::wstring& name, const std::wstring& other) {
  Value value(L" " + name + L" #5? ");
  check_equal(name + L" 5", text(u, &U::VerifyTextData, Short{}, Short{}, value), "VerifyTextData");
  check_equal(other, text(u, &U::RemoveNumberFromString, Text(other + L" 5?")), "RemoveNumberFromString");
}

void files_stay(U* u, const std::wstring& name, const std::wstring& other) {
  const std::wstring folder = L"C:\\" + other + std::to_wstring(GetACP()) + L"\\";
  const std::wstring path = folder + name + L".txt";
  const std::wstring both = name + other;
  Flag yes{VARIANT_TRUE};
  Flag is_there;
  u->VerifyFilePath(Text(folder));
  u->PathExists(Text(folder).release(), is_there);
  check_equal(VARIANT_TRUE, is_there.value, "PathExists");
  check_equal(S_OK, u->SaveTextBox(Text(both), Text(path)), "SaveTextBox");
  check_equal(ansi(both) + "\r\n", bytes_of(path), "its bytes");
  check_equal(both + L"\r\n", text(u, &U::LoadTextBox, Text(path)), "LoadTextBox");
  const std::wstring ini = folder + name + L".ini";
  check_equal(S_OK, u->SaveCfgFileData(Text(name), Text(other), Text(both), Text(ini), yes), "SaveCfgFileData");
  check_equal("[" + ansi(name) + "]\r\n" + ansi(other) + "=" + ansi(both) + "\r\n", bytes_of(ini), "its bytes");
  check_equal(both, text(u, &U::GetCfgFileData, Text(name), Text(other), Text(L"none"), Text(ini), yes), "the setting");
  const std::wstring archive = folder + other + L".zip";
  u->CallZIPFiles(Text(archive), Text(path), Short{}, Text(), yes);
  check_equal(S_OK, u->CallUnZIPFiles(Text(archive), Text(folder + L"out\\"), Text(), yes), "CallUnZIPFiles");
  check_equal(ansi(both) + "\r\n", bytes_of(folder + L"out\\" + name + L".txt"), "what was unpacked");
}

void the_registry_stays(U* u, const std::wstring& name, const std::wstring& other) {
  const Text key(L"Software\\" + name);
  u->REGISTRY_CreateNewKey(Text(key.view()), Long{static_cast<LONG>(0x80000001)});
  u->REGISTRY_SetKeyValue(Text(key.view()), Text(other), Value(std::wstring_view(name)), Long{1});
  check_equal(name, text(u, &U::REGISTRY_ReturnValue, Text(key.view()), Text(other)), "REGISTRY_ReturnValue");
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  return run_checks([&] {
    const UINT page = static_cast<UINT>(_wtoi(arguments[2]));
    check_equal(page, GetACP(), "the system's code page");
    const Pointer<U> u = create_object();
    // In code page 932, the second byte of one character is that of "\\".
    const std::wstring name = page == 932 ? L"\u65E5\u672C" : L"\u041E\u043B\u044C\u0433\u0430";
    const std::wstring other = page == 932 ? L"\u8868\u793A" : L"\u0434\u043E\u043C";
    for (const auto check_part : {texts_stay, files_stay, the_registry_stays}) check_part(u.get(), name, other);
  });
}
