#!/usr/bin/env python3
"""Compares what TALUtil.dll writes with what the same calls write natively.

  compare.py write TALUTIL FOLDER DRIVE     writes natively in FOLDER, and prepares DRIVE, the folder that is drive C of
                                            a script host, and script.vbs in FOLDER for that host to run
  compare.py compare TALUTIL FOLDER DRIVE   compares what both have written

There is one file of each kind that the library writes. The bytes have to be the same, but for dates in the document and,
in the archive, the order of the folder's files and their rights. Archives and cipher texts that chance makes different
each time are opened by the other side. The last line is "N passed, N failed".
"""
import os
import pathlib
import re
import shutil
import sys
import zipfile

TOP = pathlib.Path(__file__).resolve().parents[2]
sys.path.insert(0, str(TOP / "tests/examples"))
import language
import run

PLACE = "C:\\EXAMPLES\\Equality"
REPORT = "TAL/ORV3/DATA/MONTHLYREPORTS/SalesReport.pdf"
SECRET = "three \u20ac"
LOCKED = f"""
text = u.CryptoEncryptString("{SECRET}")
u.SaveCfgFileData "Secrets", "Text", text, folder & "\\locked.ini", True
Set zip = CreateObject("TALUtil.ZipControl")
zip.ItemList = folder & "\\in"
zip.RecurseSubdirectories = True
zip.CompressionLevel = 9
zip.Comment = "5 \u20ac"
zip.ZIPFile = folder & "\\plain.zip"
zip.Action = 4
zip.Encrypt = True
zip.StrongEncryption = True
zip.Password = "{SECRET}"
zip.ZIPFile = folder & "\\locked.zip"
zip.Action = 4
"""
OPENING = f"""
text = u.GetCfgFileData("Secrets", "Text", "", folder & "\\foreign.ini", True)
u.SaveTextBox u.CryptoDecryptString(text), folder & "\\opened.txt"
Set unzip = CreateObject("TALUtil.UnzipControl")
unzip.ZIPFile = folder & "\\foreign.zip"
unzip.Password = "{SECRET}"
unzip.Destination = folder & "\\out"
unzip.Action = 8
"""
# What the script's code page lacks, by the names of its variables.
TEXTS = {"hebrew": "\u05e9\u05dc\u05d5\u05dd (\u05d0\u05b8\u05d1) 12.50 abc",
         "arabic": "\u0645\u0631\u062d\u0628\u0627 50%",
         "mixed": "No 7 \u0627\u0644\u0633\u0644\u0627\u0645, \u05d0!"}
REPORT_OF_GRID = """
grid.FixedRows = 1
u.AutomatedEndOfMonth = True
u.GridPrintPreview 100, 1, "Bookings", "", grid, "1/3/2009", "31/3/2009", "SalesReport"
"""


def writing():
    """Calls in the language of the examples."""
    for section in ("Reports", "Windows", "Reports"):
        for item in ("Paper", "Caf\u00e9 \u2013 5 \u20ac", "Empty", "Paper"):
            yield f'text = "{section} = {item};"' if item != "Empty" else 'text = ""'
            yield f'u.SaveCfgFileData "{section}", "{item}", text, folder & "\\settings.ini", True'
    yield LOCKED + 'Set grid = CreateObject("TALUtil.Grid")\ngrid.Cols = 4'
    for row in range(120):
        yield "grid.AddItem " + " & vbTab & ".join(f'"Cell {row * 7919 + i}, 5 \u20ac"' for i in range(4))
    yield "grid.AddItem " + " & vbTab & ".join(TEXTS)
    yield REPORT_OF_GRID


def prepare(drive):
    """The inputs, with a fixed time, in an empty folder."""
    folder = drive / "EXAMPLES/Equality"
    shutil.rmtree(folder, ignore_errors=True)
    shutil.copytree(TOP / "examples/data", folder / "in")
    (folder / "in/deep").mkdir()
    (folder / "in/deep/numbers.txt").write_text("".join(f"{number}\n" for number in range(3000)))
    (folder / "in/empty").touch()
    for path in [folder / "in", *(folder / "in").rglob("*")]:
        os.utime(path, (1237043366, 1237043366))
    (drive / REPORT).parent.mkdir(parents=True, exist_ok=True)
    (drive / REPORT).unlink(missing_ok=True)
    return folder


def entries(path):
    """Those of an archive in the order of their names, with everything but the system and its rights, and with the
    packed bytes."""
    with open(path, "rb") as file, zipfile.ZipFile(file) as archive:
        found = [archive.comment]
        for entry in sorted(archive.infolist(), key=lambda entry: entry.filename):
            file.seek(entry.header_offset)
            header = file.read(30)
            name, extra = (int.from_bytes(header[i:i + 2], "little") for i in (26, 28))
            file.seek(name + extra, 1)
            found.append((entry.filename, header, entry.flag_bits, entry.extract_version, entry.extra,
                          file.read(entry.compress_size)))
        return found


def without_dates(path):
    return re.sub(rb"\(D:\d{14}[^)]*\)", b"(D:)", path.read_bytes())


def tree(folder):
    return {str(path.relative_to(folder)): path.is_file() and path.read_bytes() for path in folder.rglob("*")}


def run_natively(talutil, classes, folder, code):
    batch = run.Batch(talutil, classes, folder)
    language.Interpreter(batch, {"u": {"object": 0}, "folder": PLACE, **TEXTS}).run(language.read(code))
    batch.close()


def hand_over(maker, opener):
    for kind in ("zip", "ini"):
        shutil.copy(maker / f"locked.{kind}", opener / f"foreign.{kind}")


def write(talutil, classes, folder, drive):
    native, other = prepare(folder / "drives/c"), prepare(drive)
    code = "\n".join(writing())
    run_natively(talutil, classes, folder, code)
    hand_over(native, other)
    (other / "texts.txt").write_text("\n".join(TEXTS.values()), encoding="utf-16")
    beginning = f'Set u = CreateObject("TALUtil.ORVUtils")\nfolder = "{PLACE}"\n'
    beginning += 'Set files = CreateObject("Scripting.FileSystemObject")\n'
    beginning += 'Set texts = files.OpenTextFile(folder & "\\texts.txt", 1, False, -1)\n'
    beginning += "".join(f"{name} = texts.ReadLine\n" for name in TEXTS)
    (folder / "script.vbs").write_text(beginning + code + OPENING, encoding="cp1252")


def compare(talutil, classes, folder, drive):
    native, other = (place / "EXAMPLES/Equality" for place in (folder / "drives/c", drive))
    hand_over(other, native)
    run_natively(talutil, classes, folder, OPENING)
    verdicts = run.Verdicts()
    verdicts.check("settings.ini", (native / "settings.ini").read_bytes() == (other / "settings.ini").read_bytes())
    verdicts.check("plain.zip", entries(native / "plain.zip") == entries(other / "plain.zip"))
    verdicts.check("the report", without_dates(folder / "drives/c" / REPORT) == without_dates(drive / REPORT))
    for side in (native, other):
        opened = (side / "opened.txt").read_text(encoding="cp1252")
        verdicts.check(f"the cipher text in {side}", opened == SECRET + "\n")
        verdicts.check(f"what was unpacked in {side}", tree(side / "in") == tree(side / "out/in"))
    return verdicts.close()


if __name__ == "__main__":
    action, command, *folders = sys.argv[1:]
    actions = {"write": write, "compare": compare}
    sys.exit(actions[action](command, run.read_reference(command), *map(pathlib.Path, folders)))
