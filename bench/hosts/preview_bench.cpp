// Times the preview window: opening it with few and with many pages, drawing a page again, and what it leaves behind.
#include <cstdio>

#include "controls/print_control.hpp"
#include "platform/preview_view.hpp"
#include "platform/win32/win32_platform.hpp"
#include "tests/fakes/fake_platform.hpp"
#include "timing.hpp"

// The platform's macro of that name would hide the member.
#undef StartDoc

using namespace talutil;
using namespace talutil::hosts;

namespace {

/// Does something with the window once it is visible, and closes it.
struct Visitor final : PreviewEvents {
  PreviewView* view = nullptr;
  double shown_at = 0;
  std::int32_t redraws = 0;
  std::vector<double> redraw_times;

  void activated() noexcept override {
    const HWND window = GetActiveWindow();
    view->size_pages(view->inner_width(), view->inner_height());
    view->show_page();
    RedrawWindow(window, nullptr, nullptr, RDW_UPDATENOW | RDW_ALLCHILDREN);
    shown_at = now_in_microseconds();
    for (std::int32_t i = 0; i < redraws; ++i) {
      const double start = now_in_microseconds();
      RedrawWindow(window, nullptr, nullptr, RDW_INVALIDATE | RDW_UPDATENOW | RDW_ALLCHILDREN);
      redraw_times.push_back(now_in_microseconds() - start);
    }
    // Through its messages, like a user.
    PostMessageW(window, WM_CLOSE, 0, 0);
  }
  void resized() noexcept override {}
  void chosen(PreviewMenu /*item*/) noexcept override {}
  std::int32_t key_down(std::int32_t code) noexcept override { return code; }
  void closing() noexcept override {}
  void zoom_step(bool /*larger*/) noexcept override {}
};

std::shared_ptr<PrintControl> document_of(const Platform& platform, std::int32_t pages) {
  auto print = std::make_shared<PrintControl>(platform);
  Text page;
  for (int line = 0; line < 58; ++line) page += u"A line of a report with some sixty characters in it, as usual\r\n";
  print->StartDoc();
  for (std::int32_t i = 0; i < pages; ++i) print->put_Text(page + u"\f");
  print->EndDoc();
  print->put_Zoom(100);
  return print;
}

/// Milliseconds from requesting the window to its first page.
double open_window(PrintControl& print, Visitor& visitor) {
  win32::Win32FormWindows windows;
  const double start = now_in_microseconds();
  const auto view = windows.make_preview(visitor, &print);
  visitor.view = view.get();
  view->set_window_state(2);
  view->show_modal();
  // As a host's loop would between two windows.
  (void)win32::Win32MessagePump().handle_waiting();
  return (visitor.shown_at - start) / 1000;
}

}  // namespace

int main() {
  // Without a window manager, windows on the real screen would wait seconds for its answers.
  SetThreadDesktop(CreateDesktopW(L"TALUtilBench", nullptr, nullptr, 0, GENERIC_ALL, nullptr));
  testing::FakePlatform platform;
  const auto few = document_of(platform.platform(), 10);
  const auto many = document_of(platform.platform(), 1000);
  Visitor visitor;
  (void)open_window(*few, visitor);
  std::vector<double> few_times;
  std::vector<double> many_times;
  constexpr int repetitions = 11;
  for (int i = 0; i < repetitions; ++i) {
    few_times.push_back(open_window(*few, visitor));
    many_times.push_back(open_window(*many, visitor));
  }
  std::printf("opening the preview of 10 pages %.1f ms, of 1,000 pages %.1f ms, ratio %.2f (goal: at most 1)\n",
              median(few_times), median(many_times), median(many_times) / median(few_times));

  visitor.redraws = 50;
  (void)open_window(*many, visitor);
  std::printf("drawing a full page again at 100 %%: %.1f ms\n", median(visitor.redraw_times) / 1000);

  visitor.redraws = 0;
  const auto handles = [](DWORD kind) { return GetGuiResources(GetCurrentProcess(), kind); };
  const DWORD drawing = handles(GR_GDIOBJECTS);
  const DWORD windows = handles(GR_USEROBJECTS);
  constexpr int openings = 200;
  for (int i = 0; i < openings; ++i) (void)open_window(*few, visitor);
  std::printf("after %d openings: %ld drawing handles and %ld window handles more\n", openings,
              static_cast<long>(handles(GR_GDIOBJECTS)) - static_cast<long>(drawing),
              static_cast<long>(handles(GR_USEROBJECTS)) - static_cast<long>(windows));
  return 0;
}
