{ What a compiled host can do with the unit that the compiler's importer makes of the type library, and the guide for
  Pascal does not show: records, arrays, properties, the second class and typed variables in a variant. Each check that
  fails is a line; the last line is "N passed, N failed". }
program client;
{$mode delphi}{$H+}

uses
  SysUtils, Variants, ComObj, ActiveX, TALUtil_1_0_TLB;

var
  passed: Integer = 0;
  failed: Integer = 0;
  u: _ORVUtils;

procedure Check(const name, expected, actual: string);
begin
  if expected = actual then
    Inc(passed)
  else
  begin
    Inc(failed);
    WriteLn('FAILED ', name, ': expected ', expected, ', got ', actual);
  end;
end;

procedure UseLists;
var
  list: PSafeArray = nil;
  items: OleVariant;
  text: WideString = 'red,green,blue,';
  delimiter: WideString = ',';
begin
  Check('a list', '3', IntToStr(u.ReadCommaDelimStrToList(text, list, delimiter)));
  TVarData(items).VType := varArray or varOleStr;
  TVarData(items).VArray := PVarArray(list);
  Check('its items', 'red/green/blue', items[0] + '/' + items[1] + '/' + items[2]);
  text := 'gre';
  Check('an index in it', '1', IntToStr(u.IndexInList(list, text)));
end;

procedure UseDates;
var
  date, read_back: TDateTime;
  parts: TALUtil_1_0_TLB.SYSTEMTIME;
  none: SmallInt = 0;
  typed: WideString = '00:00:00';
  reference: OleVariant;
begin
  date := EncodeDate(2024, 3, 11) + EncodeTime(22, 0, 0, 0);
  u.DateToSystemTime(date, parts);
  Check('a record', '3-22', Format('%d-%d', [parts.wMonth, parts.wHour]));
  u.SystemTimeToDate(parts, read_back);
  Check('its date', '11/03/2024 22:00', FormatDateTime('dd/mm/yyyy hh:nn', read_back));
  Check('UTC and back', 'True', BoolToStr(TDateTime(u.UTCToLocalTime(u.LocalTimeToUTC(date))) = date, True));
  TVarData(reference).VType := varByRef or varOleStr;
  TVarData(reference).VPointer := @typed;
  u.VerifyNullDate(none, reference);
  Check('a text that a variant refers to', '01/01/1980', typed);
end;

procedure UseProperties;
var
  position: _cControlPosition;
begin
  u.iCharactercase := 1;
  u.sUserName := 'anne';
  Check('properties', '1 anne', IntToStr(u.iCharactercase) + ' ' + u.sUserName);
  position := CocControlPosition.Create;
  position.ControlName := 'client';
  position.left := 120;
  position.SaveControlPosition;
  position.left := 0;
  position.GetControlPosition;
  Check('a control position', '120', IntToStr(position.left));
end;

{ Late: the importer declares a variant by value as const, which 32-bit programs pass by reference. }
procedure PutNoObject;
begin
  try
    OleVariant(u).DrawTextPictureBox := WideString('a text');
  except
    on e: EOleException do
      Check('an error', '13 Type mismatch TALUtil.ORVUtils',
        IntToStr(e.ErrorCode and $FFFF) + ' ' + e.Message + ' ' + e.Source);
  end;
end;

begin
  CoInitialize(nil);
  u := CoORVUtils.Create;
  u.sDatabaseName := 'Clients';
  UseLists;
  UseDates;
  UseProperties;
  PutNoObject;
  u.Terminate;
  WriteLn(passed, ' passed, ', failed, ' failed');
end.
