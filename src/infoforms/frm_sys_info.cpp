#include "infoforms/frm_sys_info.hpp"

#include <algorithm>

#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

using Info = FrmSysInfo;
using namespace part_follows;

constexpr FormPart parts[] = {
    {.id = Info::tabs,
     .kind = PartKind::tabs,
     .follows = width | height,
     .place = {7, 7, 386, 176},
     .caption = u"System information"},
    {.id = Info::path_label, .kind = PartKind::label, .place = {14, 29, 56, 9}, .caption = u"&Folder or file:"},
    {.id = Info::path, .kind = PartKind::entry, .follows = width, .place = {72, 27, 168, 13}},
    {.id = Info::show,
     .kind = PartKind::button,
     .follows = right,
     .is_default = true,
     .place = {244, 26, 44, 14},
     .caption = u"&Show"},
    {.id = Info::choose_folder,
     .kind = PartKind::button,
     .follows = right,
     .place = {292, 26, 46, 14},
     .caption = u"F&older..."},
    {.id = Info::choose_file,
     .kind = PartKind::button,
     .follows = right,
     .place = {342, 26, 44, 14},
     .caption = u"F&ile..."},
    {.id = Info::facts,
     .kind = PartKind::table,
     .follows = width | height,
     .place = {14, 27, 372, 149},
     .caption = u"Facts"},
    {.id = Info::details,
     .kind = PartKind::table,
     .follows = width | height,
     .place = {14, 46, 372, 130},
     .caption = u"Details"},
    {.id = Info::refresh,
     .kind = PartKind::button,
     .follows = bottom,
     .place = {7, 189, 56, 14},
     .caption = u"&Refresh"},
    {.id = Info::copy,
     .kind = PartKind::button,
     .follows = bottom,
     .place = {67, 189, 62, 14},
     .caption = u"&Copy as text"},
    {.id = Info::close,
     .kind = PartKind::button,
     .follows = right | bottom,
     .place = {337, 189, 56, 14},
     .caption = u"Close"},
};

constexpr FormDescription description{.parts = parts, .width = 400, .height = 210, .is_resizable = true};

constexpr TextView captions[] = {u"Drives", u"Memory", u"Processor", u"Operating system", u"Folder or file"};
constexpr std::int32_t drives_tab = 0;
constexpr std::int32_t item_tab = 4;

void fill_grid(Grid& grid, const FactTable& table) {
  constexpr std::int32_t wide_columns[] = {2400, 5600};
  constexpr std::int32_t narrow_columns[] = {1300, 1100, 1300, 1150, 1050, 1050, 1100};
  constexpr std::int16_t left = 1;
  constexpr std::int16_t right = 7;
  const auto is_size = [](TextView heading) { return heading == u"Total" || heading == u"Free"; };
  const bool is_list = table.columns.size() == 2;
  const std::span<const std::int32_t> widths =
      is_list ? std::span<const std::int32_t>(wide_columns) : std::span<const std::int32_t>(narrow_columns);
  grid.put_Rows(0);
  grid.put_Cols(static_cast<std::int32_t>(table.columns.size()));
  grid.put_Rows(static_cast<std::int32_t>(table.rows.size() + 1));
  grid.put_FixedRows(1);
  for (std::size_t c = 0; c < table.columns.size(); ++c) {
    const auto column = static_cast<std::int32_t>(c);
    grid.put_ColWidth(column, widths[c]);
    grid.put_ColAlignment(column, is_size(table.columns[c]) ? right : left);
    grid.put_cell(0, column, table.columns[c]);
    for (std::size_t r = 0; r < table.rows.size(); ++r) {
      grid.put_cell(static_cast<std::int32_t>(r + 1), column, table.rows[r][c]);
    }
  }
}

}  // namespace

FrmSysInfo::FrmSysInfo(Library& library)
    : Form(library, description), facts_(library.platform()), details_(library.platform()) {}

bool FrmSysInfo::is_item_shown() const noexcept { return tab_ == item_tab; }

void FrmSysInfo::read() {
  // Drives of a network that is gone take their time to say so.
  const auto hourglass = library().platform().form_windows.show_hourglass();
  Machine& machine = library().platform().machine;
  tables_ = {drive_table(machine), memory_table(machine), processor_table(machine), operating_system_table(machine)};
}

void FrmSysInfo::fill(FormView& view) {
  read();
  item_.reset();
  tab_ = 0;
  details_.put_Rows(0);
  view.set_caption(u"System Information");
  view.set_tabs(tabs, captions);
  show_tab(view);
}

void FrmSysInfo::show_tab(FormView& view) {
  for (const Part part : {path_label, path, show, choose_folder, choose_file, details}) {
    view.set_visible(part, is_item_shown());
  }
  view.set_visible(facts, !is_item_shown());
  if (is_item_shown()) {
    fill_grid(details_, item_ ? *item_ : FactTable{captions[item_tab], {u"Fact", u"Value"}, {}});
    view.set_table(details, details_, -1);
  } else {
    const FactTable& table = tables_[static_cast<std::size_t>(tab_)];
    fill_grid(facts_, table);
    view.set_table(facts, facts_, tab_ == drives_tab ? static_cast<std::int32_t>(table.columns.size()) - 1 : -1);
  }
}

void FrmSysInfo::on_tab(std::int32_t tab) {
  tab_ = std::clamp<std::int32_t>(tab, 0, item_tab);
  show_tab(load());
}

void FrmSysInfo::show_item(FormView& view, const Text& item_path) {
  view.set_text(path, item_path);
  item_ = item_table(library().platform(), item_path);
  show_tab(view);
}

void FrmSysInfo::on_click(std::uint8_t part) {
  FormView& view = load();
  const Platform& platform = library().platform();
  switch (part) {
    case show:
      if (const Text typed = view.text(path); is_item_shown() && !typed.empty()) show_item(view, typed);
      break;
    case choose_folder:
      if (const auto folder = platform.folder_picker.choose(u"Folder", view.dialog_owner())) {
        show_item(view, *folder);
      }
      break;
    case choose_file: {
      FileDialog dialog;
      dialog.title = u"File";
      dialog.filter = u"All Files *.*|*.*";
      dialog.flags = file_dialog_flag::file_must_exist | file_dialog_flag::hide_read_only;
      if (const auto file = platform.file_dialogs.choose(dialog)) show_item(view, file->path);
      break;
    }
    case refresh:
      read();
      // An item that no longer exists is reported and not shown any more.
      if (const Text typed = view.text(path); item_ && !typed.empty()) {
        item_.reset();
        show_tab(view);
        show_item(view, typed);
      } else {
        show_tab(view);
      }
      break;
    case copy: {
      std::vector<FactTable> all = tables_;
      if (item_) all.push_back(*item_);
      view.copy(as_text(all));
      break;
    }
    case close:
      unload();
      break;
    default:
      break;
  }
}

void ORVUtils::ShowSysInfo() { library_.part<FrmSysInfo>().show_window(); }

}  // namespace talutil
