#include "controls/control_factory.hpp"

#include "automation/run_time_error.hpp"
#include "controls/common_dialog.hpp"
#include "controls/control.hpp"
#include "controls/crypto.hpp"
#include "controls/grid.hpp"
#include "controls/name_case_converter.hpp"
#include "controls/system_information.hpp"
#include "controls/zip_controls.hpp"
#include "preview/print_control.hpp"

namespace talutil {

namespace {

template <class Made>
ObjectRef make(const Platform& platform) {
  return std::make_shared<Made>(platform);
}

}  // namespace

ControlFactory::ControlFactory(const Platform& platform)
    : platform_(platform),
      makers_{
          {u"PolarCryptoLibCtl.Crypto", &make<Crypto>},
          {u"MSComDlg.CommonDialog", &make<CommonDialog>},
          {Text(Grid::class_name), &make<Grid>},
          {u"SystemInfoControl.MSysInfo", &make<SystemInformation>},
          {Text(NameCaseConverter::class_name), &make<NameCaseConverter>},
          {u"DUZACTXLibCtl.duzactxctrl", &make<UnzipControl>},
          {u"DZACTXLibCtl.dzactxctrl", &make<ZipControl>},
          {u"VSPrinter8LibCtl.VSPrinter", &make<PrintControl>},
          {u"VSPDF8LibCtl.VSPDF8", &make<PdfExport>},
      } {}

void ControlFactory::register_maker(TextView class_name, Maker maker) { makers_[Text(class_name)] = maker; }

ObjectRef ControlFactory::create(TextView class_name) const {
  if (ObjectRef theirs = platform_.control_makers.create(class_name)) return theirs;
  const auto found = makers_.find(class_name);
  if (found == makers_.end()) raise(ErrorNumber::cannot_create_object);
  return found->second(platform_);
}

}  // namespace talutil
