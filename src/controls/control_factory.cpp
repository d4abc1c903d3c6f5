#include "controls/control_factory.hpp"

#include <algorithm>

#include "automation/run_time_error.hpp"
#include "controls/common_dialog.hpp"
#include "controls/crypto.hpp"
#include "controls/grid.hpp"
#include "controls/name_case_converter.hpp"
#include "controls/print_control.hpp"
#include "controls/system_information.hpp"
#include "controls/table_object.hpp"
#include "controls/zip_controls.hpp"

namespace talutil {

namespace {

template <class OwnControl>
ObjectRef make(const Platform& platform) {
  return std::make_shared<OwnControl>(platform);
}

constexpr struct {
  TextView class_name;
  ObjectRef (*make)(const Platform& platform);
} makers[] = {
    {u"PolarCryptoLibCtl.Crypto", &make<Crypto>},
    {u"MSComDlg.CommonDialog", &make<CommonDialog>},
    {u"VSFlex8Ctl.VSFlexGrid", &make<Grid>},
    {u"SystemInfoControl.MSysInfo", &make<SystemInformation>},
    {NameCaseConverter::class_name, &make<NameCaseConverter>},
    {u"DUZACTXLibCtl.duzactxctrl", &make<UnzipControl>},
    {u"DZACTXLibCtl.dzactxctrl", &make<ZipControl>},
    {u"VSPrinter8LibCtl.VSPrinter", &make<PrintControl>},
    {u"VSPDF8LibCtl.VSPDF8", &make<PdfExport>},
};

}  // namespace

ObjectRef ControlFactory::create(TextView class_name) const {
  if (ObjectRef theirs = platform_.control_makers.create(class_name)) return theirs;
  return create_own(class_name);
}

ObjectRef ControlFactory::create_own(TextView class_name) const {
  const auto* const own = std::ranges::find(makers, class_name, [](const auto& maker) { return maker.class_name; });
  if (own == std::end(makers)) raise(ErrorNumber::cannot_create_object);
  return own->make(platform_);
}

}  // namespace talutil
