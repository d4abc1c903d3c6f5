#include "calling/comparable.hpp"

#include <algorithm>
#include <iterator>

namespace talutil::calling {

namespace {

using View = std::string_view;

struct NotComparable {
  View member;
  View reason;
};

constexpr View time_zone = "the time zone";
constexpr View machine = "the machine";
constexpr View chance = "chance";
constexpr View files = "files";
constexpr View store = "the settings store";
constexpr View window = "a window";
constexpr View host = "an object of the host";

constexpr NotComparable not_comparable[] = {
    {"LocalTimeToUTC", time_zone},
    {"UTCToLocalTime", time_zone},
    {"ComputerName", machine},
    {"GetIpAddrTable", machine},
    {"ShowSysInfo", machine},
    {"GetNewGuid", chance},
    {"GenerateFilePassword", chance},
    {"CryptoEncryptString", chance},
    {"FileExists", files},
    {"CopyFileToBackupFile", files},
    {"SaveBigFile", files},
    {"GetFileCount", files},
    {"GetFileList", files},
    {"OpenBigFile", files},
    {"OpenFile", files},
    {"VerifyFilePath", files},
    {"SaveTextBox", files},
    {"LoadTextBox", files},
    {"CallZIPFiles", files},
    {"CallUnZIPFiles", files},
    {"DeleteFiles", files},
    {"AppendEventLog", files},
    {"PathExists", files},
    {"SetupFileFolders", files},
    {"ExportGridData", files},
    {"LoadGrid", files},
    {"SaveGrid", files},
    {"Action", files},
    {"ErrorCode", files},
    {"ErrorText", files},
    {"EntryCount", files},
    {"GetCfgFileData", store},
    {"SaveCfgFileData", store},
    {"LoadGridWidths", store},
    {"SaveGridWidths", store},
    {"LoadWindowState", store},
    {"SaveWindowState", store},
    {"REGISTRY_QueryValue", store},
    {"REGISTRY_ReturnValue", store},
    {"REGISTRY_SetKeyValue", store},
    {"REGISTRY_CreateNewKey", store},
    {"GetControlPosition", store},
    {"SaveControlPosition", store},
    {"Terminate", window},
    {"DrawShellExecuteError", window},
    {"CheckDeleteRecord", window},
    {"CheckModifyDatabase", window},
    {"ShowShortCutKeys", window},
    {"ShowCmdLineHelp", window},
    {"BrowseForFolder", window},
    {"MyInputBox", window},
    {"GridPrintPreview", window},
    {"TextBoxPrintPreview", window},
    {"ListBoxPrintPreview", window},
    {"SelectGridRows", window},
    {"CountGridSelectedRows", window},
    {"PrintScreen", window},
    {"ShowOpen", window},
    {"ShowSave", window},
    {"ShowPrinter", window},
    {"MyDrawText", host},
    {"DragControl", host},
    {"ExtractPathName", "the current folder"},
};

/// Settings that members change.
constexpr View changed_by_members[] = {
    "CounterVerifyText", "CounterVerifyInt", "CounterVerifyDate", "CounterVerifyTime", "sORVPath",
    "sReportsDir",       "sPicturesDir",     "sDrawingsDir",      "sHelpDir",          "sTemplatesDir"};

/// Values that the recording does not have. Their forms cannot stand within a text, where quotes are escaped.
View missing_value(View json) {
  if (json.find("{\"masked\": ") != View::npos) return "a masked text";
  if (json.find("{\"host_object\": ") != View::npos) return host;
  return {};
}

/// Mode 3 of VerifyNullDate shows the current time. Rather a few other modes too many than one of those.
bool may_ask_for_now(const RecordedLine& record) {
  return record.member == "VerifyNullDate" && record.args.find('3') < record.args.find(',');
}

}  // namespace

View why_not_comparable(const RecordedLine& record) {
  const auto* const found = std::ranges::find(not_comparable, record.member, &NotComparable::member);
  if (found != std::end(not_comparable)) return found->reason;
  for (const View part : {record.args, record.ending.result, record.ending.arguments}) {
    if (const View reason = missing_value(part); !reason.empty()) return reason;
  }
  return may_ask_for_now(record) ? "the time" : View();
}

bool is_changed_by_members(View setting) {
  return std::ranges::find(changed_by_members, setting) != std::end(changed_by_members);
}

}  // namespace talutil::calling
