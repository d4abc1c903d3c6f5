// A client that reads the type library out of the DLL, as development tools do, and writes down what its types have:
// the same lines as in the published definition, which is made from the interface table. registration_client knows the
// identifiers of the types.
#include <sstream>

#include "library/interface_definition.hpp"
#include "slots.hpp"

using namespace talutil::hosts;

namespace {

std::wstring quoted(std::wstring_view text) {
  std::wstring result = L"\"";
  for (const wchar_t c : text) result += (c == L'"' || c == L'\\' ? L"\\" : L"") + std::wstring(1, c);
  return result + L"\"";
}

/// The name and the help string of a type or of one of its members.
std::pair<std::wstring, std::wstring> documentation(ITypeInfo* information, MEMBERID member = MEMBERID_NIL) {
  Text name;
  Text help;
  require(information->GetDocumentation(member, name, help, nullptr, nullptr), "GetDocumentation");
  return {std::wstring(name.view()), L"helpstring(" + quoted(help.view()) + L")"};
}

std::wstring type_text(ITypeInfo* information, const TYPEDESC& type) {
  constexpr std::pair<VARTYPE, const wchar_t*> names[] = {
      {VT_BOOL, L"VARIANT_BOOL"}, {VT_I2, L"short"},        {VT_I4, L"long"},
      {VT_R4, L"float"},          {VT_DATE, L"DATE"},       {VT_BSTR, L"BSTR"},
      {VT_UI1, L"unsigned char"}, {VT_VARIANT, L"VARIANT"}, {VT_HRESULT, L"HRESULT"}};
  if (type.vt == VT_PTR) return type_text(information, *type.lptdesc) + L"*";
  if (type.vt == VT_SAFEARRAY) return L"SAFEARRAY(" + type_text(information, *type.lptdesc) + L")";
  if (type.vt == VT_CARRAY) return type_text(information, type.lpadesc->tdescElem);
  if (type.vt == VT_USERDEFINED) {
    Pointer<ITypeInfo> other;
    require(information->GetRefTypeInfo(type.hreftype, other.receive()), "GetRefTypeInfo");
    return documentation(other.get()).first;
  }
  const auto* const found = std::ranges::find(names, type.vt, [](const auto& row) { return row.first; });
  return found == std::end(names) ? L"type " + std::to_wstring(type.vt) : found->second;
}

std::wstring parameter_text(ITypeInfo* information, const ELEMDESC& parameter, std::wstring_view name) {
  constexpr std::pair<USHORT, const wchar_t*> flags[] = {
      {PARAMFLAG_FIN, L"in"}, {PARAMFLAG_FOUT, L"out"}, {PARAMFLAG_FRETVAL, L"retval"}, {PARAMFLAG_FOPT, L"optional"}};
  std::wstring result;
  for (const auto& [flag, word] : flags) {
    if ((parameter.paramdesc.wParamFlags & flag) != 0) result += (result.empty() ? L"[" : L", ") + std::wstring(word);
  }
  if ((parameter.paramdesc.wParamFlags & PARAMFLAG_FHASDEFAULT) != 0) {
    VARIANT& value = parameter.paramdesc.pparamdescex->varDefaultValue;
    Value text;
    require(VariantChangeType(text, &value, 0, VT_BSTR), "VariantChangeType");
    check_equal(parameter.tdesc.lptdesc->vt, V_VT(&value), narrow(name) + ", the type of its default");
    result += L", defaultvalue(" + (V_VT(&value) == VT_BSTR ? quoted(text.text()) : std::wstring(text.text())) + L")";
  }
  return result + L"] " + type_text(information, parameter.tdesc) + L" " + std::wstring(name);
}

std::wstring function_text(ITypeInfo* information, UINT index) {
  FUNCDESC* function = nullptr;
  require(information->GetFuncDesc(index, &function), "GetFuncDesc");
  const auto [name, help] = documentation(information, function->memid);
  check_equal(sizeof(void*) * (7 + index), static_cast<std::size_t>(function->oVft), narrow(name) + ", its offset");
  std::array<BSTR, 16> names{};
  UINT count = 0;
  require(information->GetNames(function->memid, names.data(), static_cast<UINT>(names.size()), &count), "GetNames");
  std::wostringstream out;
  out << L"    [id(0x" << std::hex << function->memid << L")"
      << (function->invkind == INVOKE_PROPERTYGET   ? L", propget, "
          : function->invkind == INVOKE_PROPERTYPUT ? L", propput, "
                                                    : L", ")
      << help << L"]\n    " << type_text(information, function->elemdescFunc.tdesc) << L" " << name << L"(";
  for (short i = 0; i < function->cParams; ++i) {
    const ELEMDESC& parameter = function->lprgelemdescParam[i];
    const bool is_result = (parameter.paramdesc.wParamFlags & PARAMFLAG_FRETVAL) != 0;
    // Neither the name of a result is published nor that of a put's value.
    const std::wstring_view parameter_name = is_result                                 ? L"result"
                                             : function->invkind == INVOKE_PROPERTYPUT ? L"value"
                                                                                       : view(names[1 + i]);
    out << (i == 0 ? L"" : L", ") << parameter_text(information, parameter, parameter_name);
  }
  for (const BSTR text : names) SysFreeString(text);
  information->ReleaseFuncDesc(function);
  return out.str() + L");\n";
}

std::wstring interface_text(ITypeInfo* dual) {
  const Pointer<ITypeInfo> information = vtable_information(dual);
  std::wstring result;
  for (UINT i = 0; i < attributes_of(information.get()).cFuncs; ++i) result += function_text(information.get(), i);
  return result;
}

std::wstring record_text(ITypeInfo* record) {
  const TYPEATTR attributes = attributes_of(record);
  std::wstring result;
  for (UINT i = 0; i < attributes.cVars; ++i) {
    VARDESC* field = nullptr;
    require(record->GetVarDesc(i, &field), "GetVarDesc");
    const TYPEDESC& type = field->elemdescVar.tdesc;
    result += L"    " + type_text(record, type) + L" " + documentation(record, field->memid).first;
    if (type.vt == VT_CARRAY) result += L"[" + std::to_wstring(type.lpadesc->rgbounds[0].cElements) + L"]";
    result += L";\n";
    record->ReleaseVarDesc(field);
  }
  const std::wstring name = documentation(record).first;
  const ULONG size = name == L"FILETIME" ? 8 : 16;
  check_equal(size, attributes.cbSizeInstance, narrow(name) + ", its size");
  return result;
}

std::wstring class_text(ITypeInfo* information) {
  HREFTYPE reference = 0;
  int flags = 0;
  Pointer<ITypeInfo> first;
  require(information->GetRefTypeOfImplType(0, &reference), "GetRefTypeOfImplType");
  require(information->GetRefTypeInfo(reference, first.receive()), "GetRefTypeInfo");
  information->GetImplTypeFlags(0, &flags);
  return (flags == IMPLTYPEFLAG_FDEFAULT ? L"    [default] interface " : L"    interface ") +
         documentation(first.get()).first + L";\n";
}

std::wstring library_text(ITypeLib* library) {
  std::wstring result;
  for (UINT i = 0; i < library->GetTypeInfoCount(); ++i) {
    Pointer<ITypeInfo> information;
    require(library->GetTypeInfo(i, information.receive()), "GetTypeInfo");
    const TYPEKIND kind = attributes_of(information.get()).typekind;
    const auto write = kind == TKIND_RECORD ? record_text : kind == TKIND_COCLASS ? class_text : interface_text;
    result += write(information.get());
    // Tools look types up by their names.
    std::wstring type_name = documentation(information.get()).first;
    Pointer<ITypeInfo> found;
    MEMBERID member = 0;
    USHORT count = 1;
    library->FindName(type_name.data(), 0, found.receive(), &member, &count);
    check(count == 1 && documentation(found.get()).first == type_name, narrow(type_name) + " is found by its name");
  }
  return result;
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  return run_checks([&] {
    Pointer<ITypeLib> library;
    const std::wstring path = std::wstring(arguments[1]) + L"\\TALUtil.dll";
    require(LoadTypeLibEx(path.c_str(), REGKIND_NONE, library.receive()), "LoadTypeLibEx");
    std::istringstream published(talutil::interface_definition());
    std::wistringstream found(library_text(library.get()));
    std::string expected;
    std::wstring line;
    for (int number = 1; std::getline(published, expected); ++number) {
      if (!expected.starts_with("    ")) continue;
      std::getline(found, line);
      check_equal(std::wstring(expected.begin(), expected.end()), line, "line " + std::to_string(number));
    }
    check(!std::getline(found, line), "nothing after the last line");
  });
}
