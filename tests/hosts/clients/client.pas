{ What members.vbs does as far as its double line, in a compiled host: bound late or, with -dearly, through the unit that
  the compiler's importer makes of the type library. Arguments are variables of their own types, passed by reference.

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

var
  u: TUtils;
  own_name, folder: WideString;

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

procedure SettingsAndControls;
var
  ini, output: WideString;
  grid: OleVariant;
  position: TPosition;
begin
  ini := folder + 'client.ini';
  u.sDatabaseName := 'Clients';
  u.sUserName := own_name;
  u.SaveCfgFileData(T('Branch')^, T('Name')^, T('north')^, ini, B(True)^);
  Say('setting', u.GetCfgFileData(T('branch')^, T('name')^, T('none')^, ini, B(True)^));
  output := '\\server\share';
  u.SaveCfgFileData(T('Branch')^, T('Path')^, output, ini, B(True)^);
  Say('setting.back', output);
  grid := CreateOleObject('TALUtil.Grid');
  grid.Cols := 3;
  grid.ColWidth[1] := 480;
  u.SaveGridWidths(grid, own_name, I(1)^);
  grid.ColWidth[0] := 0;
  grid.ColWidth[1] := 0;
  u.LoadGridWidths(grid, own_name, I(1)^);
  Say('widths', string(grid.ColWidth[0]) + ' ' + string(grid.ColWidth[1]) + ' ' + string(grid.ColWidth[2]));
  position := {$ifdef early}CocControlPosition.Create{$else}CreateOleObject('TALUtil.cControlPosition'){$endif};
  position.ControlName := own_name;
  position.left := 120;
  position.SaveControlPosition;
  position.left := 0;
  position.GetControlPosition;
  Say('position', position.left);
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
  SettingsAndControls;
  SayError('error.overflow', Overflow);
  SayError('error.object', NoObject);
  SayError('error.own', OwnError);
  u.Terminate;
  Say('done', 'True');
end.
