#pragma once

#include "client.hpp"

/// An interface as its type library describes it, for clients that call whatever they find there.
namespace talutil::hosts {

struct SlotParameter {
  VARTYPE type;                ///< VT_PTR for one passed by reference.
  VARTYPE referenced;          ///< What a pointer points to; VT_EMPTY otherwise.
  WORD flags;                  ///< PARAMFLAG_...
  std::wstring default_value;  ///< Its type and, as a text, the value of one that can be left out.
};

struct Slot {
  std::wstring name;
  std::wstring help;
  DISPID identifier;
  INVOKEKIND kind;
  short offset;  ///< Of the function within the vtable, in bytes.
  std::vector<std::wstring> names;
  std::vector<SlotParameter> parameters;  ///< The result is the last, flagged PARAMFLAG_FRETVAL.
};

/// "3: 7" of a 32-bit 7.
inline std::wstring typed_text(const VARIANT& value) {
  Value text;
  require(VariantChangeType(text, const_cast<VARIANT*>(&value), 0, VT_BSTR), "VariantChangeType");
  return std::to_wstring(V_VT(&value)) + L": " + std::wstring(text.text());
}

inline Slot slot_of(ITypeInfo* information, UINT index) {
  FUNCDESC* function = nullptr;
  require(information->GetFuncDesc(index, &function), "GetFuncDesc");
  Slot slot{{}, {}, function->memid, function->invkind, function->oVft, {}, {}};
  std::array<BSTR, 16> names{};
  UINT count = 0;
  require(information->GetNames(function->memid, names.data(), static_cast<UINT>(names.size()), &count), "GetNames");
  Text help;
  information->GetDocumentation(function->memid, nullptr, help, nullptr, nullptr);
  slot.help = help.view();
  for (UINT i = 0; i < count; ++i) {
    if (i == 0)
      slot.name = view(names[i]);
    else
      slot.names.emplace_back(view(names[i]));
    SysFreeString(names[i]);
  }
  for (short i = 0; i < function->cParams; ++i) {
    const ELEMDESC& element = function->lprgelemdescParam[i];
    const bool by_reference = element.tdesc.vt == VT_PTR;
    const PARAMDESC& described = element.paramdesc;
    slot.parameters.push_back(
        {element.tdesc.vt, by_reference ? element.tdesc.lptdesc->vt : VARTYPE{VT_EMPTY}, described.wParamFlags, {}});
    if ((described.wParamFlags & PARAMFLAG_FHASDEFAULT) == 0) continue;
    slot.parameters.back().default_value = typed_text(described.pparamdescex->varDefaultValue);
  }
  information->ReleaseFuncDesc(function);
  return slot;
}

/// The vtable side of a dual interface.
inline Pointer<ITypeInfo> vtable_information(ITypeInfo* dual) {
  HREFTYPE reference = 0;
  Pointer<ITypeInfo> result;
  require(dual->GetRefTypeOfImplType(static_cast<UINT>(-1), &reference), "GetRefTypeOfImplType");
  require(dual->GetRefTypeInfo(reference, result.receive()), "GetRefTypeInfo");
  return result;
}

/// The members of an interface in the order of the type library, without those of IUnknown and IDispatch.
inline std::vector<Slot> slots_of(ITypeInfo* information) {
  TYPEATTR* attributes = nullptr;
  require(information->GetTypeAttr(&attributes), "GetTypeAttr");
  const UINT count = attributes->cFuncs;
  information->ReleaseTypeAttr(attributes);
  std::vector<Slot> result;
  for (UINT i = 0; i < count; ++i) result.push_back(slot_of(information, i));
  return result;
}

inline std::vector<Slot> slots_of(IDispatch* object) {
  Pointer<ITypeInfo> information;
  require(object->GetTypeInfo(0, LOCALE_USER_DEFAULT, information.receive()), "GetTypeInfo");
  return slots_of(vtable_information(information.get()).get());
}

}  // namespace talutil::hosts
