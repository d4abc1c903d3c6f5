; The setup of TALUtil: one program for 32- and 64-bit Windows, which installs for the machine or for the user alone.
;
;   makensis -DVERSION=1.0.0 -DINPUT=FOLDER -DOUTPUT=TALUtil-1.0.0-setup.exe talutil.nsi
;
; INPUT has NOTICES.txt and the folders 32 and 64, each with TALUtil.dll, TALUtil.manifest and printhelper.dll.
; -DSIGN=COMMAND signs the uninstaller. -DTARGET=amd64-unicode makes the setup itself a 64-bit program, for systems that
; run no other (64-bit Wine).
;
; Files are first written under temporary names. Only when all are there do they take the places of those of an earlier
; version, which are kept until the new ones are registered: whatever fails before that, the earlier version goes on.
Unicode true
!define /ifndef TARGET x86-unicode
Target ${TARGET}
SetCompressor /SOLID lzma
ManifestSupportedOS all
ManifestDPIAware true

!define NAME TALUtil
!define UNINSTALL_LIST "Software\Microsoft\Windows\CurrentVersion\Uninstall"
!define UNINSTALL_KEY "${UNINSTALL_LIST}\${NAME}"
!define LINE "$\r$\n"
!define USAGE "${NAME}-${VERSION}-setup.exe [OPTION]...${LINE}${LINE}\
/AllUsers, /CurrentUser: for whom to install${LINE}\
/S: without windows${LINE}\
/log=FILE: append what was done to a file${LINE}\
/force: replace a newer version${LINE}\
/D=FOLDER: the folder; must be the last option${LINE}${LINE}\
Exit codes: 0 done, 1 cancelled, 2 failed and taken back, 3 refused because a newer version is installed."

Name "${NAME} ${VERSION}"
Caption "${NAME} ${VERSION} Setup"
UninstallCaption "${NAME} Uninstall"
BrandingText "${NAME} ${VERSION}"
OutFile "${OUTPUT}"
!ifdef SIGN
  !uninstfinalize `${SIGN} "%1"` = 0
!endif
VIProductVersion "${VERSION}.0"
VIFileVersion "${VERSION}.0"
VIAddVersionKey ProductName "${NAME}"
VIAddVersionKey ProductVersion "${VERSION}"
VIAddVersionKey FileVersion "${VERSION}"
VIAddVersionKey FileDescription "${NAME} setup"
VIAddVersionKey InternalName "${NAME}-setup"
VIAddVersionKey OriginalFilename "${NAME}-${VERSION}-setup.exe"
VIAddVersionKey LegalCopyright "${NAME} contributors"

; One of the included files has a function for the uninstaller that is not needed here.
!pragma warning disable 6010
!define MULTIUSER_EXECUTIONLEVEL Highest
!define MULTIUSER_MUI
!define MULTIUSER_USE_PROGRAMFILES64
!define MULTIUSER_INSTALLMODE_COMMANDLINE
!define MULTIUSER_INSTALLMODE_INSTDIR "${NAME}"
!define MULTIUSER_INSTALLMODE_DEFAULT_REGISTRY_KEY "${UNINSTALL_KEY}"
!define MULTIUSER_INSTALLMODE_DEFAULT_REGISTRY_VALUENAME UninstallString
!define MULTIUSER_INSTALLMODE_INSTDIR_REGISTRY_KEY "${UNINSTALL_KEY}"
!define MULTIUSER_INSTALLMODE_INSTDIR_REGISTRY_VALUENAME InstallLocation
!include MultiUser.nsh
!include MUI2.nsh
!include x64.nsh
!include LogicLib.nsh
!include FileFunc.nsh
!include WordFunc.nsh
!include WinVer.nsh

!define MUI_ABORTWARNING
!insertmacro MULTIUSER_PAGE_INSTALLMODE
!define MUI_PAGE_CUSTOMFUNCTION_PRE CheckBeforeFolder
!insertmacro MUI_PAGE_DIRECTORY
!insertmacro MUI_PAGE_INSTFILES
!insertmacro MUI_UNPAGE_CONFIRM
!insertmacro MUI_UNPAGE_INSTFILES
!insertmacro MUI_LANGUAGE English
ShowInstDetails show
ShowUninstDetails show

Var Log         ; The file that messages are appended to, or empty.
Var Reason      ; Why the setup cannot go on; empty as long as it can.
Var ExitCode    ; Of a setup that cannot go on.
Var Step        ; How far it is, for taking back: empty, staging, placing or recording.
Var OldVersion  ; The version that is replaced; empty if there is none.
Var Regsvr32    ; The registering programs for both kinds of library; empty for a kind that the system cannot run.
Var Regsvr64

; Inserts a macro for each installed file, with its folder and its name.
!macro EACH_OF_KIND MACRO BITS
  ${If} $Regsvr${BITS} != ""
    !insertmacro ${MACRO} "$INSTDIR\${BITS}" TALUtil.dll
    !insertmacro ${MACRO} "$INSTDIR\${BITS}" TALUtil.manifest
    !insertmacro ${MACRO} "$INSTDIR\${BITS}" printhelper.dll
  ${EndIf}
!macroend
!macro EACH_FILE MACRO
  !insertmacro EACH_OF_KIND ${MACRO} 64
  !insertmacro EACH_OF_KIND ${MACRO} 32
  !insertmacro ${MACRO} "$INSTDIR" NOTICES.txt
  !insertmacro ${MACRO} "$INSTDIR" uninstall.exe
!macroend

; What setup and uninstaller share.
!macro SHARED_FUNCTIONS UN

; Shows a message in the list of details and appends it to the log: Push MESSAGE
Function ${UN}Say
  Exch $0
  Push $1
  DetailPrint $0
  ${If} $Log != ""
    FileOpen $1 $Log a
    FileSeek $1 0 END
    FileWrite $1 "${NAME} ${VERSION}: $0$\r$\n"
    FileClose $1
  ${EndIf}
  Pop $1
  Pop $0
FunctionEnd

; Deletes a file: Push FILE. One that a program has open can still be renamed within its drive: it moves to the folder
; of temporary files or, from another drive, to an unused name in the folder of the setup, and goes with the next start
; of the system, if the user has the rights for that, or else with the next setup.
Function ${UN}Discard
  Exch $0
  Push $1
  Delete $0
  ${If} ${FileExists} $0
    GetTempFileName $1
    Delete $1
    Rename $0 $1
    ${If} ${FileExists} $0
      Delete $1
      StrCpy $1 0
      ${Do}
        IntOp $1 $1 + 1
      ${LoopWhile} ${FileExists} "$INSTDIR\TALUtil-old-$1.tmp"
      StrCpy $1 "$INSTDIR\TALUtil-old-$1.tmp"
      Rename $0 $1
    ${EndIf}
    Delete /REBOOTOK $1
    Push "in use, so removed later: $0"
    Call ${UN}Say
  ${EndIf}
  Pop $1
  Pop $0
FunctionEnd

; The registering program of a kind: 32-bit programs see that of 32-bit libraries in the system folder and the other one
; in Sysnative. A kind without one is left out, as on 32-bit systems and on servers without 32-bit support. On Windows
; for ARM the program in Sysnative cannot load x64 libraries.
Function ${UN}FindKinds
  !if "${TARGET}" == "amd64-unicode"
    StrCpy $Regsvr64 "$SYSDIR\regsvr32.exe"
    StrCpy $Regsvr32 "$WINDIR\SysWOW64\regsvr32.exe"
  !else
    StrCpy $Regsvr64 "$WINDIR\Sysnative\regsvr32.exe"
    StrCpy $Regsvr32 "$SYSDIR\regsvr32.exe"
    ${If} ${IsNativeARM64}
      StrCpy $Regsvr64 ""
    ${EndIf}
  !endif
  ${IfNot} ${FileExists} $Regsvr64
    StrCpy $Regsvr64 ""
  ${EndIf}
  ${IfNot} ${FileExists} $Regsvr32
    StrCpy $Regsvr32 ""
  ${EndIf}
FunctionEnd

; Runs a registering program: Push BITS, Push PROGRAM, Push "" or "/u"; Pop the exit code, 0 for success.
Function ${UN}RunRegsvr
  Exch $0
  Exch
  Exch $1
  Exch 2
  Exch $2
  ${If} $MultiUser.InstallMode == CurrentUser
    StrCpy $0 "$0 /n /i:user"
  ${EndIf}
  ClearErrors
  ExecWait '"$1" /s $0 "$INSTDIR\$2\TALUtil.dll"' $0
  ${If} ${Errors}
    StrCpy $0 "none: $1 did not start"
  ${EndIf}
  Pop $2
  Exch
  Pop $1
  Exch $0
FunctionEnd

; The kinds of library, the log and the view of the registry, on which everything else depends. Sets the reason if the
; log cannot be written.
Function ${UN}Start
  !if "${TARGET}" != "amd64-unicode"
    ${If} ${RunningX64}
      SetRegView 64
    ${EndIf}
  !endif
  Call ${UN}FindKinds
  Push $0
  ${GetParameters} $0
  ClearErrors
  ${GetOptions} $0 "/log=" $Log
  ${If} ${Errors}
    StrCpy $Log ""
  ${Else}
    FileOpen $0 $Log a
    ${If} ${Errors}
      StrCpy $Reason "The log file $Log could not be opened. Name one in a folder that you can write to."
      StrCpy $Log ""
    ${Else}
      FileClose $0
    ${EndIf}
  ${EndIf}
  Pop $0
FunctionEnd

; Folders that are not empty stay: what is in them is not ours.
Function ${UN}RemoveFolders
  SetOutPath $TEMP  ; The current folder could not be removed.
  RMDir "$INSTDIR\64"
  RMDir "$INSTDIR\32"
  ${If} ${FileExists} "$INSTDIR\TALUtil-old-*.tmp"
    RMDir /REBOOTOK $INSTDIR
  ${Else}
    RMDir $INSTDIR
  ${EndIf}
  Push $0
  Push $1
  ; The folder of the user's programs, which the setup may have made.
  GetKnownFolderPath $0 {5CD7AEE2-2219-4A67-B85D-6C9CE15660CB}
  ${If} $0 == ""
    StrCpy $0 "$LOCALAPPDATA\Programs"
  ${EndIf}
  ${GetParent} $INSTDIR $1
  ${If} $0 == $1
    RMDir $0
  ${EndIf}
  Pop $1
  Pop $0
FunctionEnd
!macroend
!insertmacro SHARED_FUNCTIONS ""
!insertmacro SHARED_FUNCTIONS "un."

!macro REGISTER BITS UN ARGUMENTS RESULT
  Push ${BITS}
  Push $Regsvr${BITS}
  Push "${ARGUMENTS}"
  Call ${UN}RunRegsvr
  Pop ${RESULT}
!macroend

; Installing.

!macro CLEAR_AFTER_EARLIER_RUN FOLDER FILE
  ${If} ${FileExists} "${FOLDER}\${FILE}.old"
  ${AndIfNot} ${FileExists} "${FOLDER}\${FILE}"
    Rename "${FOLDER}\${FILE}.old" "${FOLDER}\${FILE}"
  ${EndIf}
  Push "${FOLDER}\${FILE}.old"
  Call Discard
!macroend

!macro STAGE FOLDER FILE SOURCE
  ${If} $Reason == ""
    ClearErrors
    SetOutPath "${FOLDER}"
    SetOverwrite try
    !if ${FILE} == uninstall.exe
      WriteUninstaller "${FOLDER}\${FILE}.new"
    !else
      File "/oname=${FILE}.new" "${INPUT}/${SOURCE}${FILE}"
    !endif
    ${If} ${Errors}
    ${OrIfNot} ${FileExists} "${FOLDER}\${FILE}.new"
      StrCpy $Reason "${FOLDER}\${FILE}.new could not be written. Check the rights to the folder and the room on the \
drive, or choose another folder."
    ${EndIf}
  ${EndIf}
!macroend
!macro STAGE_KIND BITS
  ${If} $Regsvr${BITS} != ""
    !insertmacro STAGE "$INSTDIR\${BITS}" TALUtil.dll ${BITS}/
    !insertmacro STAGE "$INSTDIR\${BITS}" TALUtil.manifest ${BITS}/
    !insertmacro STAGE "$INSTDIR\${BITS}" printhelper.dll ${BITS}/
  ${EndIf}
!macroend

!macro PLACE FOLDER FILE
  ${If} $Reason == ""
    ClearErrors
    ${If} ${FileExists} "${FOLDER}\${FILE}"
      Rename "${FOLDER}\${FILE}" "${FOLDER}\${FILE}.old"
    ${EndIf}
    Rename "${FOLDER}\${FILE}.new" "${FOLDER}\${FILE}"
    ${If} ${Errors}
      StrCpy $Reason "${FOLDER}\${FILE} could not be replaced. Close the programs that use it, and run the setup again."
    ${EndIf}
  ${EndIf}
!macroend

!macro REGISTER_NEW BITS
  ${If} $Reason == ""
  ${AndIf} $Regsvr${BITS} != ""
    !insertmacro REGISTER ${BITS} "" "" $0
    ${If} $0 == 0
      Push "registered $INSTDIR\${BITS}\TALUtil.dll"
      Call Say
    ${Else}
      StrCpy $Reason "$INSTDIR\${BITS}\TALUtil.dll could not be registered: $Regsvr${BITS} ended with code $0. Run it on \
a copy of the file to see its message, or install for the user alone (/CurrentUser)."
    ${EndIf}
  ${EndIf}
!macroend

!macro DISCARD_OLD FOLDER FILE
  Push "${FOLDER}\${FILE}.old"
  Call Discard
!macroend

Function CheckSystem
  ${IfNot} ${AtLeastWin7}
    StrCpy $Reason "${NAME} needs Windows 7 or later."
  ${ElseIf} "$Regsvr32$Regsvr64" == ""
    StrCpy $Reason "No library can be registered on this system: there is no $SYSDIR\regsvr32.exe. Repair the system, \
and run the setup again."
  ${EndIf}
FunctionEnd

; Sets the reason and the exit code if what is installed in the chosen scope is newer.
Function CheckVersion
  ReadRegStr $OldVersion SHCTX "${UNINSTALL_KEY}" DisplayVersion
  ${GetParameters} $0
  ClearErrors
  ${GetOptions} $0 "/force" $1
  ${If} ${Errors}
  ${AndIf} $OldVersion != ""
    ${VersionCompare} "${VERSION}" $OldVersion $0
    ${If} $0 == 2
      StrCpy $Reason "${NAME} $OldVersion is installed, which is newer than ${VERSION}. Uninstall it first, or start the \
setup with /force."
      StrCpy $ExitCode 3
    ${EndIf}
  ${EndIf}
  ClearErrors
FunctionEnd

; Ends a setup that has not changed anything yet.
Function Refuse
  Push "refused: $Reason"
  Call Say
  MessageBox MB_OK|MB_ICONSTOP $Reason /SD IDOK
  SetErrorLevel $ExitCode
  Quit
FunctionEnd

Function .onInit
  StrCpy $ExitCode 2
  Call Start
  ${GetParameters} $0
  ClearErrors
  ${GetOptions} $0 "/?" $1
  ${IfNot} ${Errors}
    MessageBox MB_OK "${USAGE}" /SD IDOK
    SetErrorLevel 0
    Quit
  ${EndIf}
  Call CheckSystem
  System::Call 'kernel32::CreateMutexW(p 0, i 0, w "TALUtil setup") p ?e'
  Pop $0
  ${If} $0 = 183  ; ERROR_ALREADY_EXISTS
    StrCpy $Reason "Another setup of ${NAME} is running. Wait for it to end, and start this one again."
  ${EndIf}
  ; Checked here as well, because the check below would show a window even in a silent setup.
  ${GetParameters} $0
  ClearErrors
  ${GetOptions} $0 "/AllUsers" $1
  ${IfNot} ${Errors}
    UserInfo::GetAccountType
    Pop $1
    ${If} $1 != Admin
      StrCpy $Reason "Installing for all users requires an administrator's rights. Start the setup as an administrator, \
or with /CurrentUser."
    ${EndIf}
  ${EndIf}
  ${If} $Reason != ""
    Call Refuse
  ${EndIf}
  StrCpy $R0 $INSTDIR  ; Empty, or the folder that /D names.
  !insertmacro MULTIUSER_INIT
  ReadRegStr $0 SHCTX "${UNINSTALL_KEY}" InstallLocation
  ; An installed version is replaced where it is: a second folder would be left behind by uninstalling.
  ${If} $R0 != ""
  ${AndIf} $0 == ""
    StrCpy $INSTDIR $R0
  ${EndIf}
  ${If} ${Silent}
    Call CheckVersion
    ${If} $Reason != ""
      Call Refuse
    ${EndIf}
  ${EndIf}
FunctionEnd

; The scope is known only after its page. An installed version also decides the folder.
Function CheckBeforeFolder
  Call CheckVersion
  ${If} $Reason != ""
    Call Refuse
  ${EndIf}
  ${If} $OldVersion != ""
    Abort
  ${EndIf}
FunctionEnd

; A copy for the user comes before one for the machine in all programs of the user that are not elevated.
Function SayWhoComesFirst
  ${If} $MultiUser.InstallMode == AllUsers
    ReadRegStr $0 HKCU "${UNINSTALL_KEY}" DisplayVersion
    ReadRegStr $1 HKCU "${UNINSTALL_KEY}" InstallLocation
  ${Else}
    ReadRegStr $0 HKLM "${UNINSTALL_KEY}" DisplayVersion
    StrCpy $1 $INSTDIR
  ${EndIf}
  ${If} $0 != ""
    Push "both the machine and this user have a copy; this user's programs use the one in $1, unless they are elevated"
    Call Say
  ${EndIf}
FunctionEnd

Function Record
  ClearErrors
  WriteRegStr SHCTX "${UNINSTALL_KEY}" DisplayName "${NAME}"
  WriteRegStr SHCTX "${UNINSTALL_KEY}" DisplayVersion "${VERSION}"
  WriteRegStr SHCTX "${UNINSTALL_KEY}" InstallLocation $INSTDIR
  WriteRegStr SHCTX "${UNINSTALL_KEY}" UninstallString '"$INSTDIR\uninstall.exe" /$MultiUser.InstallMode'
  WriteRegStr SHCTX "${UNINSTALL_KEY}" QuietUninstallString '"$INSTDIR\uninstall.exe" /$MultiUser.InstallMode /S'
  WriteRegDWORD SHCTX "${UNINSTALL_KEY}" NoModify 1
  WriteRegDWORD SHCTX "${UNINSTALL_KEY}" NoRepair 1
  ${If} ${Errors}
    StrCpy $Reason "The registry key ${UNINSTALL_KEY} could not be written. Check the rights to it."
  ${EndIf}
FunctionEnd

Section
  Call CheckVersion  ; For the version only; a refusal has ended the setup before.
  StrCpy $Reason ""
  Delete "$INSTDIR\TALUtil-old-*.tmp"
  !insertmacro EACH_FILE CLEAR_AFTER_EARLIER_RUN
  StrCpy $Step staging
  !insertmacro STAGE_KIND 64
  !insertmacro STAGE_KIND 32
  !insertmacro STAGE $INSTDIR NOTICES.txt ""
  !insertmacro STAGE $INSTDIR uninstall.exe ""
  ${If} $Reason == ""
    StrCpy $Step placing
    !insertmacro EACH_FILE PLACE
    !insertmacro REGISTER_NEW 64
    !insertmacro REGISTER_NEW 32
  ${EndIf}
  ${If} $Reason == ""
    StrCpy $Step recording
    Call Record
  ${EndIf}
  ${If} $Reason != ""
    SetErrorLevel 2
    MessageBox MB_OK|MB_ICONSTOP $Reason /SD IDOK
    Abort $Reason
  ${EndIf}
  StrCpy $Step ""
  !insertmacro EACH_FILE DISCARD_OLD
  SetOutPath $TEMP
  ${GetSize} $INSTDIR "/S=0K" $0 $1 $2
  WriteRegDWORD SHCTX "${UNINSTALL_KEY}" EstimatedSize $0
  Call SayWhoComesFirst
  ${If} $OldVersion == ""
    Push "installed in $INSTDIR ($MultiUser.InstallMode)"
  ${ElseIf} $OldVersion == "${VERSION}"
    Push "repaired in $INSTDIR ($MultiUser.InstallMode)"
  ${Else}
    Push "installed over $OldVersion in $INSTDIR ($MultiUser.InstallMode)"
  ${EndIf}
  Call Say
SectionEnd

; Taking back.

!macro UNREGISTER_NEW BITS
  ${If} $Regsvr${BITS} != ""
  ${AndIf} ${FileExists} "$INSTDIR\${BITS}\TALUtil.dll"
  ${AndIfNot} ${FileExists} "$INSTDIR\${BITS}\TALUtil.dll.old"
  ${AndIfNot} ${FileExists} "$INSTDIR\${BITS}\TALUtil.dll.new"
    !insertmacro REGISTER ${BITS} "" /u $0
  ${EndIf}
!macroend

; A file whose new version still waits has not been touched.
!macro RESTORE FOLDER FILE
  ${IfNot} ${FileExists} "${FOLDER}\${FILE}.new"
    Push "${FOLDER}\${FILE}"
    Call Discard
  ${EndIf}
  ${If} ${FileExists} "${FOLDER}\${FILE}.old"
    Rename "${FOLDER}\${FILE}.old" "${FOLDER}\${FILE}"
  ${EndIf}
!macroend

!macro REGISTER_OLD BITS
  ${If} $Regsvr${BITS} != ""
  ${AndIf} ${FileExists} "$INSTDIR\${BITS}\TALUtil.dll"
    !insertmacro REGISTER ${BITS} "" "" $0
    ${If} $0 != 0
      Push "version $OldVersion could not be registered again (code $0): run its setup"
      Call Say
    ${EndIf}
  ${EndIf}
!macroend

!macro DELETE_NEW FOLDER FILE
  Delete "${FOLDER}\${FILE}.new"
!macroend

; Called whenever the setup ends early, also by the system's own doing, as when a drive is full.
Function .onInstFailed
  SetErrorLevel 2
  ${If} $Reason == ""
    StrCpy $Reason "A file could not be written to $INSTDIR. Make room on the drive, or choose another folder."
  ${EndIf}
  ${If} $Step == recording
    ${If} $OldVersion == ""
      DeleteRegKey SHCTX "${UNINSTALL_KEY}"
      DeleteRegKey /ifempty HKCU "${UNINSTALL_LIST}"
    ${Else}
      WriteRegStr SHCTX "${UNINSTALL_KEY}" DisplayVersion $OldVersion
    ${EndIf}
    StrCpy $Step placing
  ${EndIf}
  ${If} $Step == placing
    !insertmacro UNREGISTER_NEW 64
    !insertmacro UNREGISTER_NEW 32
    !insertmacro EACH_FILE RESTORE
    !insertmacro REGISTER_OLD 64
    !insertmacro REGISTER_OLD 32
  ${EndIf}
  !insertmacro EACH_FILE DELETE_NEW
  Call RemoveFolders
  ${If} $OldVersion == ""
    Push "failed and taken back: $Reason"
  ${Else}
    Push "failed; $OldVersion stays installed: $Reason"
  ${EndIf}
  Call Say
FunctionEnd

; Uninstalling.

; The uninstaller removes the copy that it lies in.
Function un.onInit
  Call un.Start
  StrCpy $R0 $INSTDIR
  ReadRegStr $0 HKCU "${UNINSTALL_KEY}" InstallLocation
  UserInfo::GetAccountType
  Pop $1
  ${If} $0 == $R0
    Call un.MultiUser.InstallMode.CurrentUser
  ${ElseIf} $1 == Admin
    StrCpy $MultiUser.Privileges Admin
    Call un.MultiUser.InstallMode.AllUsers
  ${ElseIf} $Reason == ""
    StrCpy $Reason "The copy in $R0 belongs to the machine. Uninstall it as an administrator."
  ${EndIf}
  ${If} $Reason != ""
    MessageBox MB_OK|MB_ICONSTOP $Reason /SD IDOK
    SetErrorLevel 2
    Quit
  ${EndIf}
  StrCpy $INSTDIR $R0
FunctionEnd

; The uninstaller runs in a copy of itself. The program that has started the copy may need a moment to end.
Function un.WaitForParent
  StrCpy $0 0
  ${Do}
    Delete "$INSTDIR\uninstall.exe"
    ${IfNot} ${FileExists} "$INSTDIR\uninstall.exe"
      ${Break}
    ${EndIf}
    Sleep 100
    IntOp $0 $0 + 1
  ${LoopUntil} $0 = 50
FunctionEnd

!macro UNREGISTER BITS
  ${If} $Reason == ""
  ${AndIf} $Regsvr${BITS} != ""
  ${AndIf} ${FileExists} "$INSTDIR\${BITS}"
    !insertmacro REGISTER ${BITS} un. /u $0
    ${If} $0 != 0
      StrCpy $Reason "$INSTDIR\${BITS}\TALUtil.dll could not be removed from the registry (code $0). Run the setup \
again, which repairs it, and then uninstall."
    ${EndIf}
  ${EndIf}
!macroend

!macro REMOVE FOLDER FILE
  Push "${FOLDER}\${FILE}"
  Call un.Discard
!macroend

Section Uninstall
  !insertmacro UNREGISTER 64
  !insertmacro UNREGISTER 32
  ${If} $Reason != ""
    ; What has been unregistered before is registered again: a copy that stays has to work.
    ${If} $Regsvr64 != ""
      !insertmacro REGISTER 64 un. "" $0
    ${EndIf}
    Push "failed: $Reason"
    Call un.Say
    SetErrorLevel 2
    MessageBox MB_OK|MB_ICONSTOP $Reason /SD IDOK
    Abort $Reason
  ${EndIf}
  Call un.WaitForParent
  !insertmacro EACH_FILE REMOVE
  Delete /REBOOTOK "$INSTDIR\TALUtil-old-*.tmp"
  DeleteRegKey SHCTX "${UNINSTALL_KEY}"
  DeleteRegKey /ifempty HKCU "${UNINSTALL_LIST}"  ; Not every user has one.
  Call un.RemoveFolders
  Push "uninstalled from $INSTDIR ($MultiUser.InstallMode)"
  Call un.Say
SectionEnd
