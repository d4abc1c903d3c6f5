#include "window_objects.hpp"

#include <cmath>
#include <map>
#include <memory>

namespace {

constexpr LONG scale_twips = 1;

float twips(LONG pixels) { return static_cast<float>(pixels) * twips_per_pixel(); }
int pixels(float twips) { return static_cast<int>(std::lround(twips / twips_per_pixel())); }

RECT place_of(HWND window) {
  RECT place{};
  GetWindowRect(window, &place);
  MapWindowPoints(nullptr, GetAncestor(window, GA_PARENT), reinterpret_cast<POINT*>(&place), 2);
  return place;
}

void resize(HWND window, int width, int height) {
  SetWindowPos(window, nullptr, 0, 0, width, height, SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE);
}

/// What a picture box draws on, and what it remembers between drawings.
struct Picture {
  HDC context = CreateCompatibleDC(nullptr);
  HBITMAP bitmap = nullptr;
  HFONT fonts[2]{};
  int width = 0;
  int height = 0;
  float x = 0;
  float y = 0;
  COLORREF colour = 0;
  bool is_bold = false;

  Picture(int wide, int high) : width(wide), height(high) {
    const HDC screen = GetDC(nullptr);
    bitmap = CreateCompatibleBitmap(screen, width, height);
    ReleaseDC(nullptr, screen);
    SelectObject(context, bitmap);
    for (const bool bold : {false, true}) {
      fonts[bold ? 1 : 0] =
          CreateFontW(-16, 0, 0, 0, bold ? FW_BOLD : FW_NORMAL, FALSE, FALSE, FALSE, DEFAULT_CHARSET,
                      OUT_DEFAULT_PRECIS, CLIP_DEFAULT_PRECIS, DEFAULT_QUALITY, DEFAULT_PITCH, L"Arial");
    }
    const RECT all{0, 0, width, height};
    FillRect(context, &all, static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH)));
    SelectObject(context, fonts[0]);
    SetBkMode(context, TRANSPARENT);
  }
  Picture(const Picture&) = delete;
  Picture& operator=(const Picture&) = delete;
  ~Picture() {
    DeleteDC(context);
    DeleteObject(bitmap);
    for (HFONT font : fonts) DeleteObject(font);
  }

  [[nodiscard]] SIZE size_of(const std::wstring& text) const {
    SIZE size{};
    GetTextExtentPoint32W(context, text.c_str(), static_cast<int>(text.size()), &size);
    return size;
  }
};

std::map<HWND, std::shared_ptr<Picture>>& pictures() {
  static std::map<HWND, std::shared_ptr<Picture>> all;
  return all;
}

/// Objects that can be drawn on have a scale: twips, because this host has no other.
void add_scale(Scriptable& object) {
  object.property(L"ScaleMode", [] { return variant(scale_twips); });
  const auto same = [](const Scriptable::Arguments& arguments) { return variant(number_of(arguments.at(0))); };
  object.method(L"ScaleX", {1, 3}, same);
  object.method(L"ScaleY", {1, 3}, same);
}

}  // namespace

float twips_per_pixel() {
  const HDC screen = GetDC(nullptr);
  const int dots_per_inch = GetDeviceCaps(screen, LOGPIXELSX);
  ReleaseDC(nullptr, screen);
  return 1440.0F / static_cast<float>(dots_per_inch);
}

Scriptable* form_object(HWND window) {
  auto* const form = new Scriptable;
  const auto outer = [window] {
    RECT place{};
    GetWindowRect(window, &place);
    return place;
  };
  const auto inner = [window] {
    RECT place{};
    GetClientRect(window, &place);
    return place;
  };
  form->property(
      L"WindowState",
      [window] {
        return variant(static_cast<LONG>(IsIconic(window) != FALSE ? 1 : IsZoomed(window) != FALSE ? 2 : 0));
      },
      [window](const VARIANT& state) {
        constexpr int commands[] = {SW_SHOWNORMAL, SW_SHOWMINIMIZED, SW_SHOWMAXIMIZED};
        const auto index = static_cast<std::size_t>(number_of(state));
        ShowWindow(window, commands[index < 3 ? index : 0]);
      });
  form->property(
      L"Width", [outer] { return variant(twips(outer().right - outer().left)); },
      [window, outer](const VARIANT& width) {
        resize(window, pixels(number_of(width)), outer().bottom - outer().top);
      });
  form->property(
      L"Height", [outer] { return variant(twips(outer().bottom - outer().top)); },
      [window, outer](const VARIANT& height) {
        resize(window, outer().right - outer().left, pixels(number_of(height)));
      });
  form->property(L"ScaleWidth", [inner] { return variant(twips(inner().right)); });
  form->property(L"ScaleHeight", [inner] { return variant(twips(inner().bottom)); });
  add_scale(*form);
  form->property(L"hwnd", [window] { return variant(static_cast<LONG>(reinterpret_cast<LONG_PTR>(window))); });
  form->method(L"Refresh", {0, 0}, [window](const Scriptable::Arguments&) {
    RedrawWindow(window, nullptr, nullptr, RDW_INVALIDATE | RDW_UPDATENOW | RDW_ALLCHILDREN);
    return VARIANT{};
  });
  return form;
}

Scriptable* control_object(HWND window, IDispatch* container) {
  auto* const control = new Scriptable;
  control->property(L"left", [window] { return variant(twips(place_of(window).left)); });
  control->property(L"Top", [window] { return variant(twips(place_of(window).top)); });
  control->property(L"Width", [window] { return variant(twips(place_of(window).right - place_of(window).left)); });
  control->property(L"Height", [window] { return variant(twips(place_of(window).bottom - place_of(window).top)); });
  control->property(L"Container", [container] { return variant(container); });
  control->method(L"Move", {2, 2}, [window](const Scriptable::Arguments& arguments) {
    SetWindowPos(window, nullptr, pixels(number_of(arguments.at(0))), pixels(number_of(arguments.at(1))), 0, 0,
                 SWP_NOSIZE | SWP_NOZORDER);
    return VARIANT{};
  });
  return control;
}

Scriptable* combo_object(HWND window) {
  auto* const combo = new Scriptable;
  combo->property(
      L"Text",
      [window] {
        wchar_t text[256] = L"";
        GetWindowTextW(window, text, 256);
        return variant(std::wstring(text));
      },
      [window](const VARIANT& text) { SetWindowTextW(window, text_of(text).c_str()); });
  combo->property(L"ListCount",
                  [window] { return variant(static_cast<LONG>(SendMessageW(window, CB_GETCOUNT, 0, 0))); });
  combo->method(L"ItemData", {1, 1}, [window](const Scriptable::Arguments& arguments) {
    return variant(
        static_cast<LONG>(SendMessageW(window, CB_GETITEMDATA, static_cast<WPARAM>(number_of(arguments.at(0))), 0)));
  });
  combo->property(
      L"ListIndex", [window] { return variant(static_cast<LONG>(SendMessageW(window, CB_GETCURSEL, 0, 0))); },
      [window](const VARIANT& index) { SendMessageW(window, CB_SETCURSEL, static_cast<WPARAM>(number_of(index)), 0); });
  return combo;
}

Scriptable* picture_object(HWND window, int width, int height) {
  const auto picture = std::make_shared<Picture>(width, height);
  pictures()[window] = picture;
  auto* const box = new Scriptable;
  box->property(L"hDC", [picture] { return variant(static_cast<LONG>(reinterpret_cast<LONG_PTR>(picture->context))); });
  add_scale(*box);
  box->method(L"TextWidth", {1, 1}, [picture](const Scriptable::Arguments& arguments) {
    return variant(twips(picture->size_of(text_of(arguments.at(0))).cx));
  });
  box->method(L"TextHeight", {1, 1}, [picture](const Scriptable::Arguments& arguments) {
    return variant(twips(picture->size_of(text_of(arguments.at(0))).cy));
  });
  box->property(
      L"CurrentX", [picture] { return variant(picture->x); },
      [picture](const VARIANT& x) { picture->x = number_of(x); });
  box->property(
      L"CurrentY", [picture] { return variant(picture->y); },
      [picture](const VARIANT& y) { picture->y = number_of(y); });
  box->property(
      L"ForeColor", [picture] { return variant(static_cast<LONG>(picture->colour)); },
      [picture](const VARIANT& colour) { picture->colour = static_cast<COLORREF>(number_of(colour)); });
  box->property(
      L"FontBold", [picture] { return variant(picture->is_bold); },
      [picture](const VARIANT& bold) {
        picture->is_bold = number_of(bold) != 0;
        SelectObject(picture->context, picture->fonts[picture->is_bold ? 1 : 0]);
      });
  box->method(L"Print", {1, 1}, [picture, window](const Scriptable::Arguments& arguments) {
    const std::wstring text = text_of(arguments.at(0));
    SetTextColor(picture->context, picture->colour);
    TextOutW(picture->context, pixels(picture->x), pixels(picture->y), text.c_str(), static_cast<int>(text.size()));
    picture->x = 0;
    picture->y += twips(picture->size_of(text).cy);
    InvalidateRect(window, nullptr, FALSE);
    return VARIANT{};
  });
  return box;
}

void paint_picture(HWND window, HDC target) {
  const auto found = pictures().find(window);
  if (found == pictures().end()) return;
  const Picture& picture = *found->second;
  BitBlt(target, 0, 0, picture.width, picture.height, picture.context, 0, 0, SRCCOPY);
}
