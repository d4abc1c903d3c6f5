#include "infoforms/frm_sh_keys.hpp"

#include "automation/control.hpp"
#include "controls/control_factory.hpp"
#include "controls/table_object.hpp"
#include "infoforms/shortcut_keys.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

using Keys = FrmShKeys;
using namespace part_follows;

constexpr FormPart parts[] = {
    {.id = Keys::cmdPrint, .kind = PartKind::button, .place = {7, 5, 50, 14}, .caption = u"Print"},
    {.id = Keys::cmdCross,
     .kind = PartKind::button,
     .place = {60, 5, 50, 14},
     .caption = u"Cross",
     .tip = u"Cancel changes and exit"},
    {.id = Keys::keys_label, .kind = PartKind::label, .place = {7, 23, 80, 9}, .caption = u"Shortcut &keys:"},
    {.id = Keys::Text1, .kind = PartKind::rich_text, .follows = width | height, .place = {7, 34, 346, 270}},
};

constexpr FormDescription description{.parts = parts, .width = 360, .height = 311, .is_resizable = true};

}  // namespace

FrmShKeys::FrmShKeys(Library& library) : Form(library, description) {}

void FrmShKeys::fill(FormView& view) {
  // Two blanks, as users know it.
  view.set_caption(u"  Shortcut keys List");
  view.set_text(Text1, shortcut_keys_rich_text());
}

void FrmShKeys::show() {
  FormView& view = load();
  view.show();
  view.keep_on_top();
}

void FrmShKeys::print() {
  const Control print(library().controls().create(u"VSPrinter8LibCtl.VSPrinter"), library().locale());
  print.call(u"StartDoc");
  print.put(u"Text", load().text(Text1));
  print.call(u"EndDoc");
  print.call(u"PrintDoc", {Boolean(true)});
}

void FrmShKeys::close() {
  result_ = 0;
  unload();
}

void FrmShKeys::on_click(std::uint8_t part) {
  if (part == cmdPrint) print();
  // The window stays open until the user closes it by its close box.
  if (part == cmdCross) result_ = crossed;
}

void FrmShKeys::on_closing(CloseMode mode) {
  if (mode == CloseMode::control_menu) result_ = crossed;
}

void ORVUtils::ShowShortCutKeys() { library_.part<FrmShKeys>().show(); }

}  // namespace talutil
