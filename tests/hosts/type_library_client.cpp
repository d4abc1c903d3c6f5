// A client that reads the type library out of the DLL, as development tools do, and compares it with the table.
#include "library/c_control_position.hpp"
#include "library/interface_table.hpp"
#include "slots.hpp"

using namespace talutil::hosts;

namespace {

using talutil::Access;
using talutil::Member;
using talutil::Parameter;
using talutil::Passing;
using talutil::ValueType;

Pointer<ITypeInfo> type_named(ITypeLib* library, const wchar_t* name) {
  Pointer<ITypeInfo> found;
  MEMBERID member = 0;
  USHORT count = 1;
  require(library->FindName(const_cast<wchar_t*>(name), 0, found.receive(), &member, &count), "FindName");
  return count == 0 ? Pointer<ITypeInfo>() : found;
}

TYPEATTR attributes_of(ITypeInfo* information) {
  TYPEATTR* attributes = nullptr;
  require(information->GetTypeAttr(&attributes), "GetTypeAttr");
  const TYPEATTR result = *attributes;
  information->ReleaseTypeAttr(attributes);
  return result;
}

std::wstring name_of(ITypeInfo* information) {
  Text name;
  information->GetDocumentation(MEMBERID_NIL, name, nullptr, nullptr, nullptr);
  return std::wstring(name.view());
}

void class_has_default_interface(ITypeLib* library, const CLSID& class_id, const IID& interface_id) {
  Pointer<ITypeInfo> information;
  require(library->GetTypeInfoOfGuid(class_id, information.receive()), "GetTypeInfoOfGuid");
  const std::string name = narrow(name_of(information.get()));
  check_equal(static_cast<int>(TKIND_COCLASS), static_cast<int>(attributes_of(information.get()).typekind), name);
  check((attributes_of(information.get()).wTypeFlags & TYPEFLAG_FCANCREATE) != 0, name + " can be created");
  int flags = 0;
  HREFTYPE reference = 0;
  Pointer<ITypeInfo> interface_information;
  information->GetImplTypeFlags(0, &flags);
  check_equal(IMPLTYPEFLAG_FDEFAULT, flags, name + ", its first interface");
  information->GetRefTypeOfImplType(0, &reference);
  require(information->GetRefTypeInfo(reference, interface_information.receive()), "GetRefTypeInfo");
  const TYPEATTR attributes = attributes_of(interface_information.get());
  check(attributes.guid == interface_id, name + ", the identifier of its interface");
  check((attributes.wTypeFlags & TYPEFLAG_FDUAL) != 0, name + ", its interface is dual");
}

struct RecordRow {
  const wchar_t* name;
  ULONG size;
  const wchar_t* fields;
};

void records_have_their_fields(ITypeLib* library) {
  const RecordRow rows[] = {
      {L"SYSTEMTIME", 16, L"wYear:2 wMonth:2 wDayOfWeek:2 wDay:2 wHour:2 wMinute:2 wSecond:2 wMilliseconds:2 "},
      {L"FILETIME", 8, L"dwLowDateTime:3 dwHighDateTime:3 "},
      {L"GUID", 16, L"Data1:3 Data2:2 Data3:2 Data4:28 "},
      {L"TRect", 16, L"left:3 Top:3 Right:3 Bottom:3 "},
  };
  for (const RecordRow& row : rows) {
    const Pointer<ITypeInfo> record = type_named(library, row.name);
    if (!check(record.get() != nullptr, "the record " + narrow(row.name))) continue;
    const TYPEATTR attributes = attributes_of(record.get());
    check_equal(static_cast<int>(TKIND_RECORD), static_cast<int>(attributes.typekind), narrow(row.name));
    check_equal(row.size, attributes.cbSizeInstance, narrow(row.name) + ", its size");
    std::wstring fields;
    for (UINT i = 0; i < attributes.cVars; ++i) {
      VARDESC* field = nullptr;
      require(record->GetVarDesc(i, &field), "GetVarDesc");
      Text name;
      record->GetDocumentation(field->memid, name, nullptr, nullptr, nullptr);
      fields += std::wstring(name.view()) + L":" + std::to_wstring(field->elemdescVar.tdesc.vt) + L" ";
      record->ReleaseVarDesc(field);
    }
    check_equal(row.fields, fields, narrow(row.name) + ", its fields and their types");
  }
}

VARTYPE automation_type(ValueType type) {
  switch (type) {
    case ValueType::boolean:
      return VT_BOOL;
    case ValueType::int16:
      return VT_I2;
    case ValueType::int32:
      return VT_I4;
    case ValueType::single:
      return VT_R4;
    case ValueType::date:
      return VT_DATE;
    case ValueType::text:
      return VT_BSTR;
    case ValueType::variant:
      return VT_VARIANT;
    case ValueType::text_array:
      return VT_SAFEARRAY;
    case ValueType::system_time:
      return VT_USERDEFINED;
    default:
      return VT_VOID;
  }
}

void parameter_is_as_in_the_table(const std::string& what, const Parameter& expected, const SlotParameter& got) {
  const bool by_value = expected.passing == Passing::by_value;
  check_equal(by_value ? automation_type(expected.type) : VARTYPE{VT_PTR}, got.type, what + ", its type");
  if (!by_value) check_equal(automation_type(expected.type), got.referenced, what + ", what it points to");
  const int direction = by_value ? PARAMFLAG_FIN : PARAMFLAG_FIN | PARAMFLAG_FOUT;
  const int optional = expected.is_optional ? PARAMFLAG_FOPT | PARAMFLAG_FHASDEFAULT : 0;
  check_equal(direction | optional, static_cast<int>(got.flags), what + ", its flags");
  if (!expected.is_optional) return;
  const std::wstring text(expected.default_text.begin(), expected.default_text.end());
  Value value = expected.type == ValueType::text ? Value(text) : Value(LONG{expected.default_number});
  require(VariantChangeType(value, value, 0, automation_type(expected.type)), "VariantChangeType");
  check_equal(typed_text(value.get()), got.default_value, what + ", its default");
}

void slot_is_as_in_the_table(const Member& expected, const Slot& slot, std::size_t index) {
  const std::string name(expected.name);
  const INVOKEKIND kinds[] = {INVOKE_FUNC, INVOKE_PROPERTYGET, INVOKE_PROPERTYPUT};
  check_equal("\"" + name + "\"", narrow(slot.name), "slot " + std::to_string(index));
  check_equal("\"" + std::string(expected.help) + "\"", narrow(slot.help), name + ", its help string");
  check(!slot.help.empty(), name + " has a help string");
  check_equal(static_cast<int>(kinds[static_cast<int>(expected.access)]), static_cast<int>(slot.kind),
              name + ", how it is used");
  check_equal(static_cast<short>(sizeof(void*) * (7 + index)), slot.offset, name + ", its offset in the vtable");
  check_equal(expected.identifier, slot.identifier, name + ", its identifier");
  const auto parameters = expected.parameters();
  const bool has_result = expected.result != ValueType::none;
  if (!check_equal(parameters.size() + (has_result ? 1 : 0), slot.parameters.size(), name + ", its parameters")) return;
  for (std::size_t i = 0; i < parameters.size(); ++i) {
    parameter_is_as_in_the_table(name + ", " + std::string(parameters[i].name), parameters[i], slot.parameters[i]);
    // The name of a put's value is not published.
    if (expected.access == Access::call && i < slot.names.size())
      check_equal("\"" + std::string(parameters[i].name) + "\"", narrow(slot.names[i]), name + ", a parameter's name");
  }
  if (!has_result) return;
  check_equal(automation_type(expected.result), slot.parameters.back().referenced, name + ", its result");
  check_equal(PARAMFLAG_FOUT | PARAMFLAG_FRETVAL, static_cast<int>(slot.parameters.back().flags),
              name + ", its result");
}

template <class Table>
void interface_is_as_in_the_table(ITypeLib* library, const IID& id, const Table& table) {
  Pointer<ITypeInfo> dual;
  require(library->GetTypeInfoOfGuid(id, dual.receive()), "GetTypeInfoOfGuid");
  const std::vector<Slot> slots = slots_of(vtable_information(dual.get()).get());
  if (!check_equal(table.size(), slots.size(), "slots")) return;
  for (std::size_t i = 0; i < slots.size(); ++i) slot_is_as_in_the_table(table[i], slots[i], i);
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  return run_checks([&] {
    Pointer<ITypeLib> library;
    const std::wstring path = std::wstring(arguments[1]) + L"\\TALUtil.dll";
    require(LoadTypeLibEx(path.c_str(), REGKIND_NONE, library.receive()), "LoadTypeLibEx");
    TLIBATTR* attributes = nullptr;
    require(library->GetLibAttr(&attributes), "GetLibAttr");
    check(attributes->guid == LIBID_TALUtil && attributes->wMajorVerNum == 1 && attributes->wMinorVerNum == 0,
          "identifier and version of the library");
    library->ReleaseTLibAttr(attributes);
    class_has_default_interface(library.get(), CLSID_ORVUtils, IID__ORVUtils);
    class_has_default_interface(library.get(), CLSID_cControlPosition, IID__cControlPosition);
    records_have_their_fields(library.get());
    interface_is_as_in_the_table(library.get(), IID__ORVUtils, talutil::described<talutil::ORVUtils>);
    interface_is_as_in_the_table(library.get(), IID__cControlPosition, talutil::described<talutil::cControlPosition>);
  });
}
