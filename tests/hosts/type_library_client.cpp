// A client that reads in the DLL's type library what the IDL compiler cannot write and the build mends: optional texts
// by reference, with their defaults, and the record GUID under its own name. All the rest is what the compiler makes of
// the definition (docs/TALUtil.idl): agreement_client calls each slot as it is described here, and registration_client
// knows the identifiers of the types.
#include "automation/late_call.hpp"
#include "library/interface_table.hpp"
#include "library/orv_utils.hpp"
#include "slots.hpp"

using namespace talutil::hosts;

namespace {

std::wstring wide(std::string_view text) { return {text.begin(), text.end()}; }

void default_is_described(const ELEMDESC& element, const talutil::Parameter& expected, const std::string& what) {
  constexpr USHORT in_optional_default = PARAMFLAG_FIN | PARAMFLAG_FOPT | PARAMFLAG_FHASDEFAULT;
  const USHORT flags = element.paramdesc.wParamFlags;
  if (!check_equal(expected.is_optional, (flags & in_optional_default) == in_optional_default, what)) return;
  if (!expected.is_optional) return;
  VARIANT& value = element.paramdesc.pparamdescex->varDefaultValue;
  Value text;
  require(VariantChangeType(text, &value, 0, VT_BSTR), "VariantChangeType");
  const bool is_text = expected.type == talutil::ValueType::text;
  check_equal(is_text ? wide(expected.default_text) : std::to_wstring(expected.default_number), text.text(), what);
  check(element.tdesc.vt == VT_PTR && (flags & PARAMFLAG_FOUT) != 0, what + " is passed by reference");
  check_equal(element.tdesc.lptdesc->vt, V_VT(&value), what + ", the type of its default");
}

void defaults_are_described(ITypeInfo* information) {
  const auto& members = talutil::late_interface<talutil::ORVUtils>().members;
  if (!check_equal(members.size(), std::size_t{attributes_of(information).cFuncs}, "members")) return;
  for (UINT index = 0; index < members.size(); ++index) {
    const talutil::Member& member = members[index];
    FUNCDESC* function = nullptr;
    require(information->GetFuncDesc(index, &function), "GetFuncDesc");
    check_equal(member.identifier, function->memid, std::string(member.name));
    for (std::size_t i = 0; i < member.parameter_count; ++i) {
      const talutil::Parameter& parameter = member.parameters()[i];
      const std::string what = std::string(member.name) + ": " + std::string(parameter.name);
      default_is_described(function->lprgelemdescParam[i], parameter, what);
    }
    information->ReleaseFuncDesc(function);
  }
}

/// Tools look types up by their names.
void guid_record_is_found(ITypeLib* library) {
  std::wstring name = L"GUID";
  Pointer<ITypeInfo> found;
  MEMBERID member = 0;
  USHORT count = 1;
  library->FindName(name.data(), 0, found.receive(), &member, &count);
  if (check(count == 1 && member == MEMBERID_NIL, "GUID is found by its name"))
    check_equal(ULONG{16}, attributes_of(found.get()).cbSizeInstance, "its size");
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  return run_checks([&] {
    Pointer<ITypeLib> library;
    Pointer<ITypeInfo> dual;
    const std::wstring path = std::wstring(arguments[1]) + L"\\TALUtil.dll";
    require(LoadTypeLibEx(path.c_str(), REGKIND_NONE, library.receive()), "LoadTypeLibEx");
    require(library->GetTypeInfoOfGuid(IID__ORVUtils, dual.receive()), "GetTypeInfoOfGuid");
    defaults_are_described(vtable_information(dual.get()).get());
    guid_record_is_found(library.get());
  });
}
