{ Makes a Pascal unit of a type library, by the importer that the compiler comes with.

    import_unit.exe LIBRARY FOLDER\ }
program import_unit;
{$mode objfpc}{$H+}

uses
  Classes, TypeLib;

var
  name, package, registration: string;
  dependencies, code: TStringList;

begin
  dependencies := TStringList.Create;
  code := TStringList.Create;
  code.Text := ImportTypelib(ParamStr(1), name, dependencies, False, False, False, package, registration);
  code.SaveToFile(ParamStr(2) + name + '.pas');
end.
