; The installer for Windows, 64 bits, for all users. scripts/package-windows calls makensis with:
;   VERSION, FOLDER (what to install), REMOVAL (files that remove it), OUTPUT, ICON, SIGN (a command, or empty)
Target amd64-unicode
SetCompressor /SOLID lzma
!include MUI2.nsh
!include LogicLib.nsh
!include WinVer.nsh

!define PRODUCT "Tendril Configuration Utility"
!define UNINSTALL_KEY "Software\Microsoft\Windows\CurrentVersion\Uninstall\Tendril Configuration Utility"
; Exit codes, besides NSIS's own: 0 done, 1 cancelled.
!define EXIT_FAILED 2
!define EXIT_RUNNING 3      ; a program that runs is in the way
!define EXIT_OLD_WINDOWS 4
!define OLDEST_BUILD 15063  ; Qt's imports: SetProcessDpiAwarenessContext
!define OLDEST_WINDOWS "Windows 10 version 1703"

Name "${PRODUCT}"
OutFile "${OUTPUT}"
InstallDir "$PROGRAMFILES64\Tendril"
InstallDirRegKey HKLM "${UNINSTALL_KEY}" InstallLocation  ; an upgrade goes where the older version is
RequestExecutionLevel admin
AllowSkipFiles off
ManifestSupportedOS all
ManifestDPIAware true
ShowInstDetails nevershow
ShowUninstDetails nevershow
BrandingText " "
VIProductVersion "${VERSION}.0"
VIAddVersionKey CompanyName "Kelvane"
VIAddVersionKey FileDescription "Installs the ${PRODUCT}"
VIAddVersionKey FileVersion "${VERSION}"
VIAddVersionKey LegalCopyright ""
VIAddVersionKey ProductName "${PRODUCT}"
VIAddVersionKey ProductVersion "${VERSION}"
!if "${SIGN}" != ""
  !uninstfinalize '${SIGN} "%1"' = 0
!endif

!define MUI_ICON "${ICON}"
!define MUI_UNICON "${ICON}"
!define MUI_ABORTWARNING
!insertmacro MUI_PAGE_DIRECTORY
!define MUI_INSTFILESPAGE_FINISHHEADER_SUBTEXT "The ${PRODUCT} is in the Start menu."
!insertmacro MUI_PAGE_INSTFILES
!insertmacro MUI_UNPAGE_CONFIRM
!insertmacro MUI_UNPAGE_INSTFILES
!insertmacro MUI_LANGUAGE English

; A program that runs cannot be opened for writing. Asks to close it; silent, ends with an exit code.
!macro EndWhileRunning folder program
  ${Do}
    ${IfNot} ${FileExists} "${folder}\${program}.exe"
      ${ExitDo}
    ${EndIf}
    ClearErrors
    FileOpen $0 "${folder}\${program}.exe" a
    ${IfNot} ${Errors}
      FileClose $0
      ${ExitDo}
    ${EndIf}
    MessageBox MB_RETRYCANCEL|MB_ICONEXCLAMATION \
      "${program} is running. Close it, then press Retry." /SD IDCANCEL IDRETRY +3
    SetErrorLevel ${EXIT_RUNNING}
    Quit
  ${Loop}
!macroend

!macro EndWhileAnyRuns folder
  !insertmacro EndWhileRunning "${folder}" tendril-utility
  !insertmacro EndWhileRunning "${folder}" tendril-demo
  !insertmacro EndWhileRunning "${folder}" tendril-ctl
!macroend

; With "_?=" the uninstaller runs where it is, so its exit code is known, and it cannot remove itself.
!macro RemoveVersion folder
  ${If} ${FileExists} "${folder}\uninstall.exe"
    ExecWait '"${folder}\uninstall.exe" /S _?=${folder}' $0
    ${If} $0 <> 0
      MessageBox MB_OK|MB_ICONSTOP "The version that is installed cannot be removed." /SD IDOK
      SetErrorLevel $0
      Quit
    ${EndIf}
    Delete "${folder}\uninstall.exe"
    RMDir "${folder}"
  ${EndIf}
!macroend

Function .onInit
  SetShellVarContext all
  ${IfNot} ${AtLeastBuild} ${OLDEST_BUILD}
    MessageBox MB_OK|MB_ICONSTOP "The ${PRODUCT} needs ${OLDEST_WINDOWS} or newer." /SD IDOK
    SetErrorLevel ${EXIT_OLD_WINDOWS}
    Quit
  ${EndIf}
FunctionEnd

Function un.onInit
  SetShellVarContext all
FunctionEnd

Section
  ; An older version may be in another folder.
  ReadRegStr $1 HKLM "${UNINSTALL_KEY}" InstallLocation
  ${If} $1 == ""
    StrCpy $1 $INSTDIR
  ${EndIf}
  !insertmacro EndWhileAnyRuns "$1"
  !insertmacro EndWhileAnyRuns "$INSTDIR"
  !insertmacro RemoveVersion "$1"
  !insertmacro RemoveVersion "$INSTDIR"

  ; First what removes an installation: it may fail in the middle.
  SetOutPath "$INSTDIR"
  WriteUninstaller "$INSTDIR\uninstall.exe"
  WriteRegStr HKLM "${UNINSTALL_KEY}" DisplayName "${PRODUCT}"
  WriteRegStr HKLM "${UNINSTALL_KEY}" DisplayVersion "${VERSION}"
  WriteRegStr HKLM "${UNINSTALL_KEY}" DisplayIcon "$INSTDIR\tendril-utility.exe"
  WriteRegStr HKLM "${UNINSTALL_KEY}" Publisher "Kelvane"
  WriteRegStr HKLM "${UNINSTALL_KEY}" InstallLocation "$INSTDIR"
  WriteRegStr HKLM "${UNINSTALL_KEY}" UninstallString '"$INSTDIR\uninstall.exe"'
  WriteRegStr HKLM "${UNINSTALL_KEY}" QuietUninstallString '"$INSTDIR\uninstall.exe" /S'
  WriteRegDWORD HKLM "${UNINSTALL_KEY}" NoModify 1
  WriteRegDWORD HKLM "${UNINSTALL_KEY}" NoRepair 1
  SectionGetSize 0 $0
  WriteRegDWORD HKLM "${UNINSTALL_KEY}" EstimatedSize $0

  File /r "${FOLDER}/*"
  CreateDirectory "$SMPROGRAMS\${PRODUCT}"
  CreateShortcut "$SMPROGRAMS\${PRODUCT}\${PRODUCT}.lnk" "$INSTDIR\tendril-utility.exe"
  CreateShortcut "$SMPROGRAMS\${PRODUCT}\Tendril Demonstration.lnk" "$INSTDIR\tendril-demo.exe"
  CreateShortcut "$SMPROGRAMS\${PRODUCT}\Manual.lnk" "$INSTDIR\docs\manual\index.html"
SectionEnd

Section Uninstall
  !insertmacro EndWhileAnyRuns "$INSTDIR"
  ; Each file by its name: what the user has put there stays.
  ClearErrors
  !include "${REMOVAL}/files.nsh"
  ${If} ${Errors}
    MessageBox MB_OK|MB_ICONSTOP "Some files are in use. Restart Windows, and uninstall again." /SD IDOK
    SetErrorLevel ${EXIT_FAILED}
    Quit
  ${EndIf}
  !include "${REMOVAL}/folders.nsh"
  Delete "$INSTDIR\uninstall.exe"
  RMDir "$INSTDIR"
  Delete "$SMPROGRAMS\${PRODUCT}\${PRODUCT}.lnk"
  Delete "$SMPROGRAMS\${PRODUCT}\Tendril Demonstration.lnk"
  Delete "$SMPROGRAMS\${PRODUCT}\Manual.lnk"
  RMDir "$SMPROGRAMS\${PRODUCT}"
  DeleteRegKey HKLM "${UNINSTALL_KEY}"
SectionEnd
