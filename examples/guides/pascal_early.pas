{ TALUtil from Free Pascal or Delphi, bound early through the unit that the importer makes of the type library. }
program pascal_early;
{$ifdef fpc}{$mode delphi}{$endif}{$H+}

uses
  SysUtils, Variants, ComObj, ActiveX, TALUtil_1_0_TLB;

procedure Example;
var
  u: _ORVUtils;
  list: PSafeArray = nil;
  text, delimiter: WideString;
  value: OleVariant;
  length, extras, week, year, day: SmallInt;
begin
  u := CoORVUtils.Create;

  { Parameters by reference take variables of exactly their types, and every argument has to be given. }
  length := 20;
  extras := 1;
  value := '  Smith & Sons, Pty  ';
  WriteLn(string(u.VerifyTextData(length, extras, value)));

  text := 'red,green,blue,';
  delimiter := ',';
  WriteLn(u.ReadCommaDelimStrToList(text, list, delimiter), ' elements');
  SafeArrayDestroy(list);

  week := 60;
  year := 2009;
  day := 1;
  u.WeekYearToDate(week, year, day);
  WriteLn('week ', week);

  value := 'tomorrow';
  try
    u.GetWeekNumber(value);
  except
    on E: EOleException do WriteLn('error ', E.ErrorCode and $FFFF, ': ', E.Message);
  end;
  u.Terminate;
end;

begin
  CoInitialize(nil);
  Example;
end.
