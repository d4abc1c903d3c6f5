# TALUtil from PowerShell: powershell -File powershell.ps1
$u = New-Object -ComObject TALUtil.ORVUtils
$u.VerifyTextData(20, 1, '  Smith & Sons, Pty  ')

# [ref] passes a variable that the call changes.
$list = $null
$count = $u.ReadCommaDelimStrToList('red,green,blue,', [ref]$list)
"$count elements, the second is $($list[1])"
$week = [int16]60
$null = $u.WeekYearToDate([ref]$week, 2009, 1)
"week $week"

# An array of texts has to have that type.
$u.IndexInList([string[]]('Apple', 'Banana'), 'ban')

try {
    $null = $u.GetWeekNumber('tomorrow')
} catch {
    $failure = $_.Exception.GetBaseException()
    "error $($failure.HResult -band 0xFFFF): $($failure.Message)"
}
$u.Terminate()
[void][Runtime.InteropServices.Marshal]::FinalReleaseComObject($u)
