#pragma once

#include <cstdint>
#include <span>

#include "automation/text.hpp"
#include "platform/preview_view.hpp"

namespace talutil {

/// A choice of paper: the text of the setting for grids, the menu entry, and the platform's printing code.
struct PaperChoice {
  TextView setting;
  PreviewMenu item;
  std::int16_t code;
};

inline constexpr PaperChoice paper_sizes[] = {
    {u"A3", PreviewMenu::mnuA3, 8},
    {u"A4", PreviewMenu::mnuA4, 9},
};
inline constexpr std::int16_t paper_a4 = paper_sizes[1].code;

inline constexpr PaperChoice duplex_modes[] = {
    {u"Simplex", PreviewMenu::mnuSimplex, 1},
    {u"Vertical", PreviewMenu::mnuVertical, 2},
    {u"Horizontal", PreviewMenu::mnuHorizontal, 3},
};

/// Both, by the print control's property.
struct PaperChoices {
  TextView property;
  std::span<const PaperChoice> choices;
};
inline constexpr PaperChoices duplex_choices{u"Duplex", duplex_modes};
inline constexpr PaperChoices size_choices{u"PaperSize", paper_sizes};

}  // namespace talutil
