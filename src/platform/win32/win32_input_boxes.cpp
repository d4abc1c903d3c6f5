#include "platform/win32/win32_input_boxes.hpp"

#include <algorithm>
#include <cstring>
#include <vector>

#include "automation/run_time_error.hpp"
#include "platform/win32/visual_styles.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::win32 {

namespace {

constexpr WORD entry_id = 100;
constexpr WORD button_class = 0x80;
constexpr WORD edit_class = 0x81;
constexpr WORD static_class = 0x82;

/// A dialog template in memory: 16-bit words, items aligned to two words.
class DialogTemplate {
 public:
  DialogTemplate(short width, short height, WORD items, TextView title) {
    constexpr DWORD style =
        DS_MODALFRAME | DS_SETFONT | DS_CENTER | DS_SETFOREGROUND | WS_POPUP | WS_CAPTION | WS_SYSMENU;
    add(DLGTEMPLATE{style, 0, items, 0, 0, width, height});
    words_.insert(words_.end(), {0, 0});  // No menu, the standard dialog class.
    add_text(title);
    constexpr WORD points = 8;
    words_.push_back(points);
    add_text(u"MS Shell Dlg");
  }

  void add_item(DWORD style, const RECT& place, WORD id, WORD window_class, TextView text) {
    if (words_.size() % 2 != 0) words_.push_back(0);
    add(DLGITEMTEMPLATE{style | WS_CHILD | WS_VISIBLE, 0, static_cast<short>(place.left), static_cast<short>(place.top),
                        static_cast<short>(place.right), static_cast<short>(place.bottom), id});
    words_.insert(words_.end(), {0xFFFF, window_class});
    add_text(text);
    words_.push_back(0);
  }

  [[nodiscard]] const DLGTEMPLATE* get() const noexcept { return reinterpret_cast<const DLGTEMPLATE*>(words_.data()); }

 private:
  template <class Block>
  void add(const Block& block) {
    static_assert(sizeof block % sizeof(WORD) == 0);
    const std::size_t start = words_.size();
    words_.resize(start + sizeof block / sizeof(WORD));
    std::memcpy(&words_[start], &block, sizeof block);
  }

  void add_text(TextView text) {
    std::ranges::transform(up_to_nul(text), std::back_inserter(words_), [](char16_t unit) { return WORD{unit}; });
    words_.push_back(0);
  }

  std::vector<WORD> words_;
};

/// An estimate of the number of lines that a prompt takes in its label.
LONG lines_of(TextView prompt) {
  constexpr LONG characters_a_line = 40;
  constexpr LONG most_lines = 30;  // A higher box would not fit on small screens.
  const auto breaks = static_cast<LONG>(std::ranges::count(prompt, u'\n'));
  return std::min(most_lines, breaks + 1 + static_cast<LONG>(prompt.size()) / characters_a_line);
}

/// The typed text goes into the Text whose address the dialog was started with.
INT_PTR CALLBACK handle(HWND dialog, UINT message, WPARAM what, LPARAM value) noexcept {
  if (message == WM_INITDIALOG) {
    SetWindowLongPtrW(dialog, DWLP_USER, value);
    return TRUE;
  }
  if (message != WM_COMMAND || (LOWORD(what) != IDOK && LOWORD(what) != IDCANCEL)) return FALSE;
  if (LOWORD(what) == IDOK) {
    auto& answer = *reinterpret_cast<Text*>(GetWindowLongPtrW(dialog, DWLP_USER));
    constexpr int longest = 1024;
    answer.resize(longest);
    const UINT length =
        GetDlgItemTextW(dialog, entry_id, reinterpret_cast<wchar_t*>(answer.data()), static_cast<int>(answer.size()));
    answer.resize(length);
  }
  EndDialog(dialog, LOWORD(what));
  return TRUE;
}

}  // namespace

std::optional<Text> Win32InputBoxes::ask(TextView prompt, TextView title, Entry entry) {
  // In dialog units: a quarter of a character's width, an eighth of its height. The prompt is beside the buttons and
  // has room for four lines, or more if it is longer.
  constexpr LONG margin = 7;
  constexpr LONG prompt_width = 186;
  constexpr LONG button_width = 50;
  constexpr LONG line_height = 8;
  const LONG prompt_height = std::max<LONG>(4, lines_of(prompt)) * line_height;
  const LONG buttons_left = margin + prompt_width + margin;
  const LONG entry_top = margin + prompt_height + margin;
  const LONG width = buttons_left + button_width + margin;

  constexpr WORD items = 4;
  DialogTemplate box(static_cast<short>(width), static_cast<short>(entry_top + 13 + margin), items, title);
  box.add_item(SS_LEFT | SS_NOPREFIX, {margin, margin, prompt_width, prompt_height}, 0xFFFF, static_class, prompt);
  const DWORD masked = entry == Entry::masked ? ES_PASSWORD : 0;
  box.add_item(WS_TABSTOP | WS_BORDER | ES_AUTOHSCROLL | masked, {margin, entry_top, width - 2 * margin, 13}, entry_id,
               edit_class, {});
  box.add_item(WS_TABSTOP | BS_DEFPUSHBUTTON, {buttons_left, margin, button_width, 14}, IDOK, button_class, u"OK");
  box.add_item(WS_TABSTOP, {buttons_left, margin + 17, button_width, 14}, IDCANCEL, button_class, u"Cancel");
  Text answer;
  const VisualStyles styles;
  const INT_PTR end = DialogBoxIndirectParamW(GetModuleHandleW(nullptr), box.get(), GetActiveWindow(), &handle,
                                              reinterpret_cast<LPARAM>(&answer));
  return end == IDOK ? std::optional(std::move(answer)) : std::nullopt;
}

}  // namespace talutil::win32
