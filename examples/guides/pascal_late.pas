{ TALUtil from Free Pascal or Delphi, bound late. }
program pascal_late;
{$ifdef fpc}{$mode delphi}{$endif}{$H+}

uses
  SysUtils, Variants, ComObj, ActiveX;

procedure Example;
var
  u, list, names: OleVariant;
  text: WideString;
  week: SmallInt;
begin
  u := CreateOleObject('TALUtil.ORVUtils');
  WriteLn(string(u.VerifyTextData(20, 1, '  Smith & Sons, Pty  ')));

  { A variable is passed by reference, and a call may change it. }
  text := 'red,green,blue,';
  WriteLn(Integer(u.ReadCommaDelimStrToList(text, list)), ' elements, the second is ', string(list[1]));
  week := 60;
  u.WeekYearToDate(week, 2009, 1);
  WriteLn('week ', week);

  names := VarArrayCreate([0, 1], varOleStr);
  names[0] := WideString('Apple');
  names[1] := WideString('Banana');
  WriteLn(Integer(u.IndexInList(names, 'ban')));

  try
    u.GetWeekNumber('tomorrow');
  except
    on E: EOleException do WriteLn('error ', E.ErrorCode and $FFFF, ': ', E.Message);
  end;
  u.Terminate;
end;

begin
  CoInitialize(nil);
  Example;
end.
