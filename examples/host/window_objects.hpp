#pragma once

#include "scriptable.hpp"

/// This host's windows as objects for the library. Sizes and positions are in twips (1/1440 inch).

/// A form: WindowState, Width, Height, ScaleWidth, ScaleHeight, ScaleMode, ScaleX, ScaleY, hwnd, Refresh.
Scriptable* form_object(HWND window);

/// A control on a form: left, Top, Width, Height, Container, Move.
Scriptable* control_object(HWND window, IDispatch* container);

/// A combo box: Text, ListCount, ItemData(i), ListIndex.
Scriptable* combo_object(HWND window);

/// A picture box over a bitmap: hDC, ScaleMode, ScaleX, ScaleY, TextWidth, TextHeight, CurrentX, CurrentY, ForeColor,
/// FontBold, Print. The owner paints the window from the bitmap with `paint_picture`.
Scriptable* picture_object(HWND window, int width, int height);
void paint_picture(HWND window, HDC target);

/// The size of a screen pixel in twips.
float twips_per_pixel();
