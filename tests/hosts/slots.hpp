#pragma once

#include "client.hpp"

/// An interface as its type library describes it, for clients that call whatever they find there.
namespace talutil::hosts {

struct SlotParameter {
  VARTYPE type;        ///< VT_PTR for one passed by reference.
  VARTYPE referenced;  ///< What a pointer points to; VT_EMPTY otherwise.
  [[nodiscard]] VARTYPE bare() const noexcept { return type == VT_PTR ? referenced : type; }
};

struct Slot {
  std::wstring name;
  DISPID identifier;
  WORD kind;
  short offset;  ///< Of the function within the vtable, in bytes.
  std::vector<SlotParameter> parameters;
  VARTYPE result = VT_EMPTY;
};

/// The vtable side of a dual interface.
inline Pointer<ITypeInfo> vtable_information(ITypeInfo* dual) {
  HREFTYPE reference = 0;
  Pointer<ITypeInfo> result;
  require(dual->GetRefTypeOfImplType(static_cast<UINT>(-1), &reference), "GetRefTypeOfImplType");
  require(dual->GetRefTypeInfo(reference, result.receive()), "GetRefTypeInfo");
  return result;
}

inline TYPEATTR attributes_of(ITypeInfo* information) {
  TYPEATTR* attributes = nullptr;
  require(information->GetTypeAttr(&attributes), "GetTypeAttr");
  const TYPEATTR result = *attributes;
  information->ReleaseTypeAttr(attributes);
  return result;
}

/// The members of an object's interface in the order of the type library, without those of IUnknown and IDispatch.
inline std::vector<Slot> slots_of(IDispatch* object) {
  Pointer<ITypeInfo> dual;
  require(object->GetTypeInfo(0, LOCALE_USER_DEFAULT, dual.receive()), "GetTypeInfo");
  const Pointer<ITypeInfo> information = vtable_information(dual.get());
  std::vector<Slot> result;
  for (UINT index = 0; index < attributes_of(information.get()).cFuncs; ++index) {
    FUNCDESC* function = nullptr;
    require(information->GetFuncDesc(index, &function), "GetFuncDesc");
    Text name;
    information->GetDocumentation(function->memid, name, nullptr, nullptr, nullptr);
    Slot slot{std::wstring(name.view()), function->memid, static_cast<WORD>(function->invkind), function->oVft, {}};
    for (short i = 0; i < function->cParams; ++i) {
      const ELEMDESC& element = function->lprgelemdescParam[i];
      const bool by_reference = element.tdesc.vt == VT_PTR;
      const SlotParameter parameter{element.tdesc.vt, by_reference ? element.tdesc.lptdesc->vt : VARTYPE{VT_EMPTY}};
      if ((element.paramdesc.wParamFlags & PARAMFLAG_FRETVAL) != 0)
        slot.result = parameter.referenced;
      else
        slot.parameters.push_back(parameter);
    }
    information->ReleaseFuncDesc(function);
    result.push_back(std::move(slot));
  }
  return result;
}

}  // namespace talutil::hosts
