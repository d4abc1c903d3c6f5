' A host that embeds scripts: hands its own object to a script control, which runs the script of a file.
'
'   cscript //nologo script_control.vbs FILE
Option Explicit

Dim control
Set control = CreateObject("MSScriptControl.ScriptControl")
control.Language = "VBScript"
control.AllowUI = False
control.AddObject "WScript", WScript, False
control.AddCode CreateObject("Scripting.FileSystemObject").OpenTextFile(WScript.Arguments(0)).ReadAll
