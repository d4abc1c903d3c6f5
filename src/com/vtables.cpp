// In a separate file, because instantiating the functions of all slots takes the compiler a while.
#include "com/classes.hpp"
#include "com/thunks.hpp"

namespace talutil::com {

namespace {

template <class C, class Functions>
struct Table;

template <class C, auto... Functions>
struct Table<C, SlotList<Functions...>> {
  static const Slot slots[];
};

// Read-only data: every entry is an address known at link time.
template <class C, auto... Functions>
const Slot Table<C, SlotList<Functions...>>::slots[] = {
    reinterpret_cast<Slot>(&ComObject<C>::query_interface),
    reinterpret_cast<Slot>(&ComObject<C>::add_reference),
    reinterpret_cast<Slot>(&ComObject<C>::release),
    reinterpret_cast<Slot>(&ComObject<C>::type_information_count),
    reinterpret_cast<Slot>(&ComObject<C>::get_type_information),
    reinterpret_cast<Slot>(&ComObject<C>::get_identifiers),
    reinterpret_cast<Slot>(&ComObject<C>::invoke_member),
    reinterpret_cast<Slot>(Functions)...,
};

}  // namespace

template <class C>
const Slot* vtable_of() noexcept {
  return Table<C, SlotsOf<C>>::slots;
}

template const Slot* vtable_of<ORVUtils>() noexcept;
template const Slot* vtable_of<cControlPosition>() noexcept;

}  // namespace talutil::com
