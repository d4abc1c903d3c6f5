#pragma once

#include <cstdint>

#include "automation/boolean.hpp"
#include "automation/date.hpp"
#include "automation/object.hpp"
#include "automation/text.hpp"

namespace talutil {

/// The settings that hosts set in the library. There is one block per loaded library, regardless of the number of
/// objects; only the host, and the members named here, ever change it. The published names are kept as they are.
struct SharedSettings {
  Boolean AutomatedEndOfMonth;
  std::int32_t CounterGetCFG = 0;
  std::int32_t CounterSaveCFG = 0;
  std::int32_t CounterVerifyText = 0;
  std::int32_t CounterVerifyInt = 0;
  std::int32_t CounterVerifyDate = 0;
  std::int32_t CounterVerifyTime = 0;
  float GSTValue = 0;
  ObjectRef FolderBrowseForm;
  Date BookingScreenDate;
  ObjectRef SplashForm;
  ObjectRef DrawTextPictureBox;
  std::int32_t VersionMajor = 0;
  std::int32_t VersionMinor = 0;
  std::int32_t VersionRevision = 0;
  Text sNatPath;
  Boolean bIsProgrammer;
  std::int16_t DebugMode = 0;
  std::int16_t DebugJobSheet = 0;
  std::int16_t EventLog = 0;
  std::int16_t UserLevel = 0;
  Boolean bNewZealand;
  Text sDatabaseName;
  Text ComputerName;  ///< Set when the components window is loaded.
  Text sORVPath;
  Text sReportsDir;
  Text sGridPaperSize;
  Text sGridPaperDuplex;
  Text sPicturesDir;
  Text sDrawingsDir;
  Text sHelpDir;
  Text sTemplatesDir;
  Text sNatNameA;
  Text sNatNameB;
  Text sNatNameC;
  Text sNatNameD;
  Text sNatNameE;
  Text sORVDataName;
  Text sUserName;
  Text sAliasName;
  std::int16_t iCharactercase = 0;
  std::int16_t iCharacterCaseSuburbs = 0;
  std::int16_t iCharacterCaseIncludeEmployees = 0;
  std::int16_t iBranchID = 0;
  std::int32_t lLoginSessionID = 0;
  std::int32_t EmployeeArea1 = 0;
  std::int32_t EmployeeArea2 = 0;
  Boolean WriteServerPerformanceFile;
  Boolean bIsAES;
  Boolean bPGMSMT;
  Text sServerName;
  Text ORV3CFGName;

  // Not published: the screen's twips per pixel, set by the start-up routine.
  std::int32_t ScreenTwipsPerPixelX = 0;
  std::int32_t ScreenTwipsPerPixelY = 0;
};

}  // namespace talutil
