#pragma once

#include <string_view>

/// The identifiers by which hosts know the library. They must never change: early-bound hosts have them compiled in.
namespace talutil::identity {

inline constexpr std::string_view library_name = "TALUtil";
inline constexpr std::string_view library_help = "TALUtil: common toolkit for booking and job scheduling";
inline constexpr int type_library_major = 1;
inline constexpr int type_library_minor = 0;

inline constexpr std::string_view type_library = "BC9C637E-DB88-4022-B98F-6F65F8CE12E5";
inline constexpr std::string_view orv_utils_class = "13223AC3-C9F1-4A82-A6C4-951E12542E20";
inline constexpr std::string_view orv_utils_interface = "6AF6495B-C4A1-4417-92A9-AE87BC1F2674";
inline constexpr std::string_view control_position_class = "9039A04F-B619-4A0C-A9C9-AA2B3F5BC3DC";
inline constexpr std::string_view control_position_interface = "A4C65F71-CD15-4E50-82AF-25AFA4E6DC6C";
inline constexpr std::string_view grid_class = "EFA0E9FF-45AA-46F6-BBB2-3063E8B7A2DE";
inline constexpr std::string_view common_dialog_class = "E9CC8227-128B-48C9-A02E-1BC17C805690";
inline constexpr std::string_view zip_class = "B309A60B-34ED-465A-8D89-EEF1BDCEF4D9";
inline constexpr std::string_view unzip_class = "693CF6E8-135D-4AB3-BDB8-914A0200A933";
inline constexpr std::string_view system_time_record = "C6780E6B-35A2-4721-956C-E69341FE6005";
inline constexpr std::string_view file_time_record = "8D03EE90-01B1-4337-83ED-4CB17B55AEB5";
inline constexpr std::string_view guid_record = "F65737D6-9B83-4AA4-AEED-B8D0796FC2FC";
inline constexpr std::string_view rectangle_record = "D4D9ABDB-014B-48CA-9CC4-EEE480DFC273";

struct Class {
  std::string_view identifier;
  std::string_view program_id;
};

/// The classes that hosts create: the two in the type library, followed by the late-bound controls.
inline constexpr Class classes[] = {
    {orv_utils_class, "TALUtil.ORVUtils"}, {control_position_class, "TALUtil.cControlPosition"},
    {grid_class, "TALUtil.Grid"},          {common_dialog_class, "TALUtil.CommonDialog"},
    {zip_class, "TALUtil.ZipControl"},     {unzip_class, "TALUtil.UnzipControl"},
};

}  // namespace talutil::identity
