#include "platform/win32/clipboard.hpp"

#include <algorithm>

#include "automation/run_time_error.hpp"
#include "platform/win32/handle.hpp"

namespace talutil::win32 {

void put_on_clipboard(HWND owner, TextView text) {
  const std::size_t size = (text.size() + 1) * sizeof(char16_t);
  // Another program may have the clipboard open briefly.
  Owned<kind::Clipboard> clipboard(OpenClipboard(owner));
  for (int tries = 0; !clipboard; ++tries) {
    constexpr std::int32_t cannot_open_clipboard = 521;
    if (tries == 10) throw RunTimeError(cannot_open_clipboard, u"Can't open Clipboard");
    Sleep(20);
    clipboard.reset(OpenClipboard(owner));
  }
  EmptyClipboard();
  Owned<kind::GlobalMemory> block(GlobalAlloc(GMEM_MOVEABLE, size));
  if (!block) return;
  {
    const Owned<kind::LockedMemory> locked = lock(block.get());
    *std::ranges::copy(text, static_cast<char16_t*>(locked.get())).out = u'\0';
  }
  // The system now owns the memory.
  if (SetClipboardData(CF_UNICODETEXT, block.get()) != nullptr) static_cast<void>(block.release());
}

}  // namespace talutil::win32
