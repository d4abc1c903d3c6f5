{ What members.vbs does, in a compiled host: bound late or, with -dearly, through the unit that the compiler's importer
  makes of the type library. Arguments are variables of their own types, passed by reference.

    client.exe CLIENT }
program client;
{$mode delphi}{$H+}

uses
  Windows, SysUtils, Variants, ComObj, ActiveX{$ifdef early}, TALUtil_1_0_TLB{$endif};

{$ifdef early}
type
  TUtils = _ORVUtils;
  TPosition = _cControlPosition;
  TList = PSafeArray;
{$else}
type
  TUtils = OleVariant;
  TPosition = OleVariant;
  TList = OleVariant;
{$endif}
  PWordBool = ^WordBool;

  { The members that combo boxes and grids are driven by. }
  THostControl = class(TInterfacedObject, IDispatch)
    Text: WideString;
    Widths: array[0..2] of Double;
    function GetTypeInfoCount(out count: LongInt): HResult; stdcall;
    function GetTypeInfo(index, locale: LongInt; out info): HResult; stdcall;
    function GetIDsOfNames(const id: TGUID; names: Pointer; count, locale: LongInt; ids: Pointer): HResult; stdcall;
    function Invoke(id: LongInt; const interface_id: TGUID; locale: LongInt; flags: Word; var params;
      answer, error, argument: Pointer): HResult; stdcall;
  end;

var
  u: TUtils;
  own_name, folder: WideString;

function THostControl.GetTypeInfoCount(out count: LongInt): HResult; stdcall;
begin
  count := 0;
  Result := S_OK;
end;

function THostControl.GetTypeInfo(index, locale: LongInt; out info): HResult; stdcall;
begin
  Result := DISP_E_BADINDEX;
end;

function THostControl.GetIDsOfNames(const id: TGUID; names: Pointer; count, locale: LongInt; ids: Pointer): HResult; stdcall;
const
  members: array[0..4] of WideString = ('Text', 'ListCount', 'ItemData', 'Cols', 'ColWidth');
var
  member: Integer;
begin
  for member := 0 to High(members) do
    if WideCompareText(PPWideChar(names)^, members[member]) = 0 then
    begin
      PLongInt(ids)^ := member;
      Exit(S_OK);
    end;
  Result := DISP_E_UNKNOWNNAME;
end;

{ Arguments come last one first. }
function THostControl.Invoke(id: LongInt; const interface_id: TGUID; locale: LongInt; flags: Word; var params;
  answer, error, argument: Pointer): HResult; stdcall;
var
  arguments: POleVariant;
  value: OleVariant;
begin
  arguments := POleVariant(TDispParams(params).rgvarg);
  Result := S_OK;
  if flags and DISPATCH_PROPERTYPUT <> 0 then
    case id of
      0: Text := arguments^;
      4: Widths[Integer((arguments + 1)^)] := arguments^;
    else
      Result := DISP_E_MEMBERNOTFOUND;
    end
  else
  begin
    case id of
      0: value := Text;
      1, 3: value := 3;
      2: if arguments^ = 0 then value := 7 else value := 12;
      4: value := Widths[Integer(arguments^)];
    end;
    POleVariant(answer)^ := value;
  end;
end;

{ Variables for arguments that are written once; they live as long as the program. }
function T(const value: WideString): PWideString; begin New(Result); Result^ := value; end;
function V(const value: OleVariant): POleVariant; begin New(Result); Result^ := value; end;
function I(value: SmallInt): PSmallInt; begin New(Result); Result^ := value; end;
function L(value: LongInt): PLongInt; begin New(Result); Result^ := value; end;
function B(value: WordBool): PWordBool; begin New(Result); Result^ := value; end;
function Day(year, month, day: Word): POleVariant; begin Result := V(TDateTime(EncodeDate(year, month, day))); end;

procedure Say(const name: string; const value: OleVariant);
begin
  WriteLn(name, '=', string(value));
end;

procedure TextsAndLists;
var
  list: TList{$ifdef early} = nil{$endif};
  items, names: OleVariant;
  character: WideString = '';
begin
  Say('text', u.VerifyTextData(I(20)^, I(1)^, V('  Smith & "Sons", Pty #1  ')^));
  Say('text.apostrophe', Ord(WideString(u.VerifyTextData(I(0)^, I(0)^, V('O''Brien')^))[2]));
  Say('number', u.VerifyIntData(I(0)^, V('3.50kg')^));
  Say('number.null', u.VerifyIntData(I(1)^, V(Null)^));
  u.iCharactercase := 1;
  Say('case', u.ConvertCase(I(0)^, V('MARY SMITH-JONES')^));
  Say('list', u.ReadCommaDelimStrToList(T('red,green,blue,')^, list, T(',')^));
  names := VarArrayCreate([0, 1], varOleStr);
  names[0] := WideString('Apple');
  names[1] := WideString('Banana');
  {$ifdef early}
  TVarData(items).VType := varArray or varOleStr;
  TVarData(items).VArray := PVarArray(list);
  Say('list.index', u.IndexInList(PSafeArray(TVarData(names).VArray), T('ban')^));
  {$else}
  items := list;
  Say('list.index', u.IndexInList(names, T('ban')^));
  {$endif}
  Say('list.items', items[0] + '/' + items[1] + '/' + items[2]);
  Say('field', u.GetData(T('A,B,C,')^, L(1)^, L(2)^));
  Say('blanks', u.RemoveStringsFromNumber(I(2)^, T('A B')^, character));
  Say('blanks.back', '[' + character + ']');
end;

procedure DatesAndDurations;
var
  first, last, first_time, last_time, missing: OleVariant;
  week: SmallInt = 60;
  date, typed_time: TDateTime;
  {$ifdef early}parts: TALUtil_1_0_TLB.SYSTEMTIME;{$endif}
  typed_date: WideString = '00:00:00';
  hours: WideString = ' 1.5 ';
  reference, stored: OleVariant;
begin
  missing := '00:00:00';
  Say('date', FormatDateTime('yyyy', TDateTime(u.VerifyNullDate(I(0)^, missing))));
  Say('date.back', missing);
  TVarData(reference).VType := varByRef or varOleStr;
  TVarData(reference).VPointer := @typed_date;
  u.VerifyNullDate(I(0)^, reference);
  Say('date.typed', typed_date);
  Say('month', u.IncMonth(Day(2009, 1, 31)^, I(1)^));
  Say('week', u.GetWeekNumber(Day(2009, 12, 31)^));
  Say('week.start', FormatDateTime('m', TDateTime(u.WeekYearToDate(week, I(2009)^, I(1)^))));
  Say('week.back', week);
  first := Day(2024, 3, 10)^;
  last := Day(2024, 3, 11)^;
  first_time := EncodeTime(22, 0, 0, 0);
  last_time := EncodeTime(2, 0, 0, 0);
  Say('difference', u.GetTimeDifference(first, last, first_time, last_time));
  Say('difference.back', first + ' ' + last + ' ' + first_time + ' ' + last_time);
  date := EncodeDate(2024, 3, 11);
  Say('utc', BoolToStr(TDateTime(u.UTCToLocalTime(u.LocalTimeToUTC(date))) = date, True));
  typed_time := EncodeTime(22, 0, 0, 0);
  {$ifdef early}
  u.DateToSystemTime(date + typed_time, parts);
  u.SystemTimeToDate(parts, date);
  Say('record', Format('%d-%d ', [parts.wMonth, parts.wHour]) + FormatDateTime('dd/mm/yyyy hh:nn', date));
  {$else}
  Say('difference.typed', u.GetTimeDifference(date, date, typed_time, typed_time));
  Say('difference.typed.back', FormatDateTime('dd/mm/yyyy', date) + FormatDateTime(' hh:nn', typed_time));
  {$endif}
  Say('duration', u.DateTimeToDuration(V('2/1/1800 02:00')^));
  Say('duration.number', u.ConvertDurationToNumber(V('01:45')^));
  stored := u.DurToTime(hours);
  Say('duration.minutes', u.ConvertDatabaseDurationToMinutes(stored));
  Say('duration.back', '[' + hours + ']');
end;

procedure SettingsAndFiles;
var
  ini, key, output, secret: WideString;
begin
  ini := folder + 'client.ini';
  key := 'Software\TALUtil Clients\' + own_name;
  u.sDatabaseName := 'Clients';
  u.sUserName := own_name;
  u.SaveCfgFileData(T('Branch')^, T('Name')^, T('north')^, ini, B(True)^);
  Say('setting', u.GetCfgFileData(T('branch')^, T('name')^, T('none')^, ini, B(True)^));
  output := '\\server\share';
  u.SaveCfgFileData(T('Branch')^, T('Path')^, output, ini, B(True)^);
  Say('setting.back', output);
  u.SaveCfgFileData(own_name, T('Name')^, T('stored')^, T('any')^, B(False)^);
  Say('setting.store', u.GetCfgFileData(own_name, T('Name')^, T('none')^, T('any')^, B(False)^));
  u.REGISTRY_CreateNewKey(key, L(LongInt($80000001))^);
  u.REGISTRY_SetKeyValue(key, T('Number')^, V(42)^, L(4)^);
  Say('registry', u.REGISTRY_ReturnValue(key, T('Number')^));
  u.SaveTextBox(T('a line')^, T(folder + 'in\a.txt')^);
  u.SaveTextBox(T(u.CryptoEncryptString(T('branch 12')^))^, T(folder + 'in\b.txt')^);
  Say('files', u.GetFileList(T(',')^, T(folder + 'in\')^, T('*.txt')^));
  u.CallZIPFiles(T(folder + 'a.zip')^, T(folder + 'in')^, I(0)^, T('')^, B(False)^);
  u.CallUnZIPFiles(T(folder + 'a.zip')^, T(folder + 'out\')^, T('')^, B(False)^);
  Say('zip', Copy(WideString(u.LoadTextBox(T(folder + 'out\in\a.txt')^)), 1, 6));
  secret := u.LoadTextBox(T(folder + 'out\in\b.txt')^);
  Say('secret', u.CryptoDecryptString(T(Copy(secret, 1, Length(secret) - 2))^));
  u.sORVPath := folder;
  u.EventLog := 1;
  u.AppendEventLog(T('Saved')^, T('frmBooking')^);
  Say('log', BoolToStr(Pos(':Saved:frmBooking', u.LoadTextBox(T(folder + 'EventLog.txt')^)) > 0, True));
end;

procedure Controls;
var
  control: THostControl;
  reference: OleVariant;
  position: TPosition;
begin
  control := THostControl.Create;
  reference := control as IDispatch;
  control.Text := 'typed';
  Say('combo', u.GetComboListIndex(reference, L(12)^));
  Say('combo.text', '[' + control.Text + ']');
  control.Widths[1] := 480;
  control.Widths[2] := 1000;
  u.SaveGridWidths(reference, own_name, I(1)^);
  FillChar(control.Widths, SizeOf(control.Widths), 0);
  u.LoadGridWidths(reference, own_name, I(1)^);
  Say('widths', Format('%g %g %g', [control.Widths[0], control.Widths[1], control.Widths[2]]));
  position := {$ifdef early}CocControlPosition.Create{$else}CreateOleObject('TALUtil.cControlPosition'){$endif};
  position.ControlName := own_name;
  position.left := 120;
  position.SaveControlPosition;
  position.left := 0;
  position.GetControlPosition;
  Say('position', position.left);
end;

procedure Report;
const
  pdf = 'C:\TAL\ORV3\DATA\MONTHLYREPORTS\SalesReport.pdf';
var
  grid: OleVariant;
begin
  u.DeleteFiles(T(pdf)^);
  grid := CreateOleObject('TALUtil.Grid');
  grid.Cols := 2;
  grid.AddItem('Job'#9'Done');
  grid.FixedRows := 1;
  grid.AddItem('1001'#9'True');
  grid.ColDataType[1] := 11;
  Say('ticks', u.CountGridSelectedRows(L(1)^, grid));
  u.AutomatedEndOfMonth := True;
  u.GridPrintPreview(I(100)^, I(2)^, T('Sales')^, T('')^, grid, Day(2009, 3, 1)^, Day(2009, 3, 31)^, T('SalesReport')^);
  Say('report', Copy(WideString(u.LoadTextBox(T(pdf)^)), 1, 5));
end;

procedure Overflow; begin u.IncWeek(Day(2009, 3, 5)^, I(4682)^); end;
{ Late in both: the importer declares a variant by value as const, which 32-bit programs pass by reference. }
procedure NoObject; begin OleVariant(u).DrawTextPictureBox := WideString('a text'); end;
procedure OwnError; begin u.CryptoDecryptString(T('QUJD')^); end;

procedure SayError(const name: string; step: TProcedure);
begin
  try
    step();
    Say(name, 'no error');
  except
    on e: EOleException do
    begin
      Say(name, IntToStr(e.ErrorCode and $FFFF) + ' ' + e.Message);
      if e.Source <> 'TALUtil.ORVUtils' then Say(name + '.source', e.Source);
    end;
  end;
end;

begin
  CoInitialize(nil);
  own_name := ParamStr(1);
  folder := 'C:\clients\' + own_name + '\';
  u := {$ifdef early}CoORVUtils.Create{$else}CreateOleObject('TALUtil.ORVUtils'){$endif};
  u.VerifyFilePath(T(folder + 'in\')^);
  TextsAndLists;
  DatesAndDurations;
  SettingsAndFiles;
  Controls;
  Report;
  SayError('error.overflow', Overflow);
  SayError('error.object', NoObject);
  SayError('error.own', OwnError);
  u.Terminate;
  Say('done', 'True');
end.
