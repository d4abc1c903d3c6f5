#!/usr/bin/env python3
"""Compares what five programs make of archives: peers.py PATH_TO_TALUTIL [--every N]

Makes hundreds of archives by other programs, by hand and by damaging some everywhere, and has each of them tested and
unpacked by talutil, unzip, 7z, bsdtar and Python, in throw-away folders and with time limits. Where they disagree,
EXPLANATIONS has to say what talutil answers for this class of archives, and why; anything else is a failure. --every
takes all of the first, and of the others each N-th. The last line is "N passed, N failed".
"""
import argparse
import collections
import concurrent.futures
import hashlib
import os
import pathlib
import re
import shutil
import signal
import struct
import subprocess
import sys
import tempfile
import zlib

PROGRAMS = ["talutil", "unzip", "7z", "bsdtar", "Python"]
PASSWORD = "secret"
LIMIT = 20  # Seconds for each program.

# ---- Archives by hand

TEXT = b"".join(b"line %d\r\n" % i for i in range(200))


class Part:
    """An entry. `local` and `central` change the fields of one header, `body` and `tail` what stands behind it."""

    def __init__(self, name, data=TEXT, method=8, flags=0, local=None, central=None, extra=b"", central_extra=b"",
                 tail=b"", mode=0o100644, body=None):
        self.name = name if isinstance(name, bytes) else name.encode()
        if not isinstance(name, bytes) and not name.isascii():
            flags |= 0x800
        packer = zlib.compressobj(9, zlib.DEFLATED, -15)
        self.body = body if body is not None else data if method == 0 else packer.compress(data) + packer.flush()
        self.extra, self.central_extra, self.tail = extra, central_extra, tail
        fields = dict(version=20, flags=flags, method=method, time=0x6000, date=0x3a7f, crc=zlib.crc32(data),
                      packed=len(self.body), size=len(data))
        self.local = {**fields, **(local or {})}
        self.central = {**fields, "made": 0x314, "disk": 0, "kind": 0, "attributes": mode << 16, **(central or {})}

    def local_bytes(self):
        f = self.local
        name = f.get("name", self.name)
        return struct.pack("<IHHHHHIIIHH", 0x04034b50, f["version"], f["flags"], f["method"], f["time"], f["date"],
                           f["crc"], f["packed"], f["size"], len(name), len(self.extra)) + name + self.extra + \
            self.body + self.tail

    def central_bytes(self, offset):
        f = self.central
        return struct.pack("<IHHHHHHIIIHHHHHII", 0x02014b50, f["made"], f["version"], f["flags"], f["method"],
                           f["time"], f["date"], f["crc"], f["packed"], f["size"], len(self.name),
                           len(self.central_extra), f.get("comment", 0), f["disk"], f["kind"], f["attributes"],
                           f.get("offset", offset)) + self.name + self.central_extra


def build(*parts, comment=b"", before=b"", behind=b"", end=None, zip64=False, counted=True):
    """An archive. `counted`: whether positions count the bytes before it; `end` changes fields of the end record."""
    data, directory = before, b""
    base = 0 if counted else len(before)
    for part in parts:
        directory += part.central_bytes(len(data) - base)
        data += part.local_bytes()
    start = len(data) - base
    data += directory
    f = dict(disk=0, first=0, here=len(parts), count=len(parts), size=len(directory), start=start,
             comment=len(comment)) | (end or {})
    if zip64:
        data += struct.pack("<IQHHIIQQQQ", 0x06064b50, 44, 45, 45, 0, 0, f["here"], f["count"], f["size"], f["start"])
        data += struct.pack("<IIQI", 0x07064b50, 0, start + len(directory), 1)
        f |= dict(here=0xFFFF, count=0xFFFF, size=0xFFFFFFFF, start=0xFFFFFFFF)
    return data + struct.pack("<IHHHHIIH", 0x06054b50, f["disk"], f["first"], f["here"], f["count"], f["size"],
                              f["start"], f["comment"]) + comment + behind


def zip64_part(name, data=TEXT):
    part = Part(name, data)
    sizes = struct.pack("<HHQQ", 1, 16, len(data), len(part.body))
    big = dict(version=45, packed=0xFFFFFFFF, size=0xFFFFFFFF)
    return Part(name, data, extra=sizes, central_extra=sizes, local=big, central=big)


def described_part(name, data=TEXT, signature=True, **changes):
    part = Part(name, data)
    tail = (b"PK\7\10" if signature else b"") + struct.pack(
        "<III", changes.get("crc", zlib.crc32(data)), len(part.body), len(data))
    return Part(name, data, flags=8, local=dict(crc=0, packed=0, size=0), tail=tail)


ODD_NAMES = {
    "outside": ["../up", "a/../../up", "..\\up", "/abs", "//server/share/x", "\\abs", "C:\\x", "C:x", "a/..", ".."],
    "not for Windows": ["a:b", "a?b", "a*b", "a|b", "a<b>", 'a"b', "dot.", "blank ", "a\tb", "d./x", "aux.c", "a\1b"],
    "empty part": ["", ".", "a//b", "a/./b"],
    "NUL": [b"a\0b", b"\0"],
    "long": ["n" * 255, "n" * 256, "\u4e2d" * 90, "d/" * 120 + "f"],
    "no UTF-8": [b"caf\x82", b"\xff\xfe"],
    "plain": ["a b", "\u017b\u00f3\u0142w", "\U0001f600", "-rf", "~", "$HOME", "a\u0301", "a/b/c/d"],
}


def by_hand():
    """Pairs of a class and an archive."""
    for kind, names in ODD_NAMES.items():
        for name in names:
            yield f"name: {kind}", build(Part("first.txt"), Part(name, b"x", 0), Part("last.txt"))
    yield "name: no UTF-8, though said", build(Part("first.txt"), Part(b"a\xff", flags=0x800))
    yield "twins", build(Part("d/a", b"old"), Part("b"), Part("d/a", b"new"))
    yield "twins by case", build(Part("readme", b"1"), Part("README", b"2"))
    yield "file in the way of a folder", build(Part("a", b"1"), Part("a/b", b"2"))
    yield "folder in the way of a file", build(Part("a/b", b"1"), Part("a", b"2"))
    yield "empty archive", build()
    yield from (("no archive", data) for data in (b"", b"plain text", TEXT * 40))
    for length in (1, 22, 1000, 65535):
        yield "comment", build(Part("a"), comment=b"c" * length)
    yield "comment like an end record", build(Part("a"), comment=build())
    for size in (1, 4, 1000, 70000):
        yield "bytes before, counted", build(Part("a"), Part("b"), before=b"#" * size)
        yield "bytes before, not counted", build(Part("a"), Part("b"), before=b"#" * size, counted=False)
    for size in (1, 2, 22, 1000):
        yield "bytes behind", build(Part("a"), behind=b"\n" * size)
    yield "bytes behind, too many", build(Part("a"), behind=b"\n" * 70000)
    yield "archive behind", build(Part("a"), behind=build(Part("b")))
    for field, value in dict(crc=1, packed=5, size=5, method=0, time=0, date=0, version=63, flags=0x800).items():
        yield f"local {field} differs", build(Part("a", local={field: value}), Part("b"))
        yield f"directory's {field} differs", build(Part("a", central={field: value}), Part("b"))
    yield "local name differs", build(Part("a", local={"name": b"longer"}), Part("c"))
    for method in (1, 6, 9, 10, 12, 14, 93, 95, 97, 98, 99, 255):
        yield "unknown method", build(Part("a", method=method), Part("b"))
    yield "damaged data", build(Part("a", body=b"\xff" * 30), Part("b"))
    yield "damaged data", build(Part("a", TEXT, body=Part("a").body[:-9]), Part("b"))
    yield "more data than is said", build(Part("a", central=dict(size=100), local=dict(size=100)), Part("b"))
    yield "less data than is said", build(Part("a", central=dict(size=9999), local=dict(size=9999)), Part("b"))
    for signature in (True, False):
        yield "descriptor", build(described_part("a", signature=signature), Part("b"))
        yield "descriptor wrong", build(described_part("a", signature=signature, crc=1), Part("b"))
    yield "descriptor of stored data", build(
        Part("a", method=0, flags=8, tail=b"PK\7\10" + struct.pack("<III", zlib.crc32(TEXT), len(TEXT), len(TEXT))))
    yield "zip64", build(zip64_part("a"), Part("b"), zip64=True)
    yield "zip64", build(zip64_part("a"), Part("b"))
    yield "zip64", build(Part("a"), Part("b"), zip64=True)
    yield "zip64 without its field", build(Part("a", central=dict(size=0xFFFFFFFF)), Part("b"))
    for extra in (b"\1", b"\1\0", b"\1\0\xff\0", b"UT\5\0\1\0\0\0"):
        yield "extra field broken", build(Part("a", extra=extra, central_extra=extra), Part("b"))
    yield "extra field unknown", build(Part("a", extra=b"\x99\x99\2\0ab", central_extra=b"\x99\x99\2\0ab"))
    for field, value in dict(count=1, here=1, size=10, start=3, disk=1, first=1, comment=9).items():
        yield f"end record: {field} wrong", build(Part("a"), Part("b"), end={field: value})
    one = Part("a")
    yield "entries overlap", build(one, Part("b", central=dict(offset=0, packed=len(one.body), crc=zlib.crc32(TEXT))))
    yield "position outside", build(Part("a", central=dict(offset=5_000_000)), Part("b"))
    yield "position of data", build(Part("a", central=dict(offset=7)), Part("b"))
    yield "encrypted without its header", build(Part("a", flags=1, body=b"x"), Part("b"))
    yield "strong encryption", build(Part("a", flags=0x41), Part("b"))
    yield "patched data", build(Part("a", flags=0x21), Part("b"))
    yield "link", build(Part("a", b"b", 0, mode=0o120777), Part("b"))
    yield "link", build(Part("a", b"/etc/passwd", 0, mode=0o120777))
    yield "link on the way", build(Part("a", b"/tmp", 0, mode=0o120777), Part("a/b", b"x", 0))
    yield "device file", build(Part("a", b"", 0, mode=0o060644), Part("b"))
    yield "folder by attribute", build(Part("a", b"", 0, central=dict(attributes=0x10, made=20)), Part("a/b"))
    yield "folder with data", build(Part("d/", b"abc", 0, mode=0o040755), Part("b"))
    yield "date 0", build(Part("a", local=dict(date=0, time=0), central=dict(date=0, time=0)))
    yield "many", build(*(Part(f"f{i}", b"x", 0) for i in range(3000)))
    zeros = b"\0" * 30_000_000
    yield "uniform", build(Part("a", zeros))


# ---- Archives by programs

def by_programs(work, talutil):
    """Triples of a class, an archive and the tree that it holds."""
    data = work / "data"
    (data / "sub" / "deep").mkdir(parents=True)
    (data / "none").mkdir()
    (data / "text.txt").write_bytes(TEXT * 30)
    (data / "noise.bin").write_bytes(hashlib.shake_128(b"noise").digest(100_000))
    (data / "zeros").write_bytes(b"\0" * 300_000)
    (data / "empty").write_bytes(b"")
    (data / "sub" / "deep" / "\u017b\u00f3\u0142w \u00e9.txt").write_text("wide")
    for i in range(20):
        (data / "sub" / f"{i}.txt").write_bytes(TEXT[: i * 50])
    expected = {"data": "folder"} | tree_of(work, "data")
    commands = []
    for level in "0 1 6 9".split():
        commands.append((f"zip -{level}", f"zip -qr -{level} OUT data"))
        commands.append((f"7z {level}", f"7z a -tzip -mx={level} OUT data"))
        commands.append((f"zip -P -{level}", f"zip -qr -{level} -P {PASSWORD} OUT data"))
    with_password = f"{talutil} zip OUT data --password-file password"
    commands += [
        ("talutil", f"{talutil} zip OUT data"), ("talutil, encrypted", with_password),
        ("talutil, AES", with_password + " --aes"),
        ("zip -fz", "zip -qr -fz OUT data"), ("zip, a pipe", "zip -qr - data | cat >OUT"),
        ("zip -fz, a pipe", "zip -qr -fz - data | cat >OUT"), ("zip -D", "zip -qrD OUT data"),
        ("zip, comment", "echo comment | zip -qrz OUT data"), ("zip -Z bzip2", "zip -qr -Z bzip2 OUT data"),
        ("zip, added to", "zip -q OUT data/empty && zip -qr OUT data"), ("zip -ll", "zip -qr -0 -fd OUT data"),
        ("zip, behind a program", "zip -qr X.zip data && cat /bin/true X.zip >OUT && zip -qA OUT"),
        ("advzip", "zip -qr OUT data && advzip -q -z -4 OUT"), ("advzip -a", "advzip -q -a -1 OUT data"),
        ("bsdtar", "bsdtar --format=zip -cf OUT data"), ("bsdtar, a pipe", "bsdtar --format=zip -cf - data >OUT"),
        ("bsdtar, stored, a pipe", "bsdtar --format=zip --options zip:compression=store -cf - data | cat >OUT"),
        ("bsdtar of .", "cd data && bsdtar --format=zip -cf OUT ."),
        ("bsdtar -P AES", f"bsdtar --format=zip --options zip:encryption=aes256 --passphrase {PASSWORD} -cf OUT data"),
        ("bsdtar -P", f"bsdtar --format=zip --options zip:encryption=traditional --passphrase {PASSWORD} -cf OUT data"),
        ("7z -mcu", "7z a -tzip -mcu=on OUT data"), ("7z -mcl", "7z a -tzip -mcl=on OUT data"),
        ("7z, BZip2", "7z a -tzip -mm=BZip2 OUT data"), ("7z, LZMA", "7z a -tzip -mm=LZMA OUT data"),
        ("7z, PPMd", "7z a -tzip -mm=PPMd OUT data"), ("7z, Deflate64", "7z a -tzip -mm=Deflate64 OUT data"),
        ("7z -p", f"7z a -tzip -p{PASSWORD} OUT data"), ("7z, AES128", f"7z a -tzip -mem=AES128 -p{PASSWORD} OUT data"),
        ("7z, AES192", f"7z a -tzip -mem=AES192 -p{PASSWORD} OUT data"),
        ("7z, AES256", f"7z a -tzip -mem=AES256 -p{PASSWORD} OUT data"),
        ("7z, AES256, BZip2", f"7z a -tzip -mm=BZip2 -mem=AES256 -p{PASSWORD} OUT data"),
    ]
    for number, (kind, command) in enumerate(commands):
        path = work / f"made{number}.zip"
        done = subprocess.run(["bash", "-euc", command.replace("OUT", str(path))], cwd=work, capture_output=True)
        if done.returncode != 0:
            sys.exit(f"{kind}: {command}: {done.stderr.decode()[-300:]}")
        keeps_empty = kind not in ("zip -D", "advzip -a")  # Folders with nothing in them.
        files = expected if "of ." not in kind else {k[5:]: v for k, v in expected.items() if k != "data"}
        yield kind, path.read_bytes(), {k: v for k, v in files.items() if keeps_empty or k != "data/none"}


# ---- Damage

def by_damage(work):
    """Pairs of a class and an archive: a bit flipped in every fifth byte. Which fields have to agree is shown by hand,
    and archives that are cut off by tests/archives/unpacking_test.cpp."""
    encrypted = work / "encrypted.zip"
    subprocess.run(["zip", "-qjP", PASSWORD, encrypted, work / "data/text.txt"], check=True)
    wholes = [build(Part("a.txt"), Part("b/c.txt", b"stored", 0)), build(described_part("a.txt"), Part("b.txt")),
              encrypted.read_bytes(), build(zip64_part("a"), Part("b"), zip64=True)]
    for whole in wholes:
        for at in range(0, len(whole), 5):
            damaged = bytearray(whole)
            damaged[at] ^= 1 << at % 8
            yield "flipped", bytes(damaged)


# ---- The programs

def tree_of(folder, below="."):
    tree = {}
    for path in sorted((folder / below).rglob("*")):
        name = str(path.relative_to(folder))
        if path.is_symlink():
            tree[name] = "link"
        elif path.is_dir():
            tree[name] = "folder"
        elif not path.is_file():
            tree[name] = "device"
        else:
            path.chmod(0o600)
            with path.open("rb") as file:
                tree[name] = hashlib.file_digest(file, "sha1").hexdigest()
    return tree


PYTHON = """
import sys, zipfile
archive = zipfile.ZipFile(sys.argv[1])
archive.setpassword(b"%s")
sys.exit(archive.testzip() is not None) if sys.argv[2] == "-t" else archive.extractall(sys.argv[2])
""" % PASSWORD


def commands_of(program, talutil, archive, out):
    return {
        "talutil": ([talutil, "zip", "--test", archive, "--password-file", archive.parent.parent / "password"],
                    [talutil, "unzip", archive, "--to", out, "--password-file", archive.parent.parent / "password"]),
        "unzip": (["unzip", "-tqP", PASSWORD, archive], ["unzip", "-qoP", PASSWORD, archive, "-d", out]),
        "7z": (["7z", "t", "-p" + PASSWORD, archive], ["7z", "x", "-y", "-p" + PASSWORD, f"-o{out}", archive]),
        "bsdtar": (["bsdtar", "--passphrase", PASSWORD, "-xOf", archive],
                   ["bsdtar", "--passphrase", PASSWORD, "-xf", archive, "-C", out]),
        "Python": ([sys.executable, "-c", PYTHON, archive, "-t"], [sys.executable, "-c", PYTHON, archive, out]),
    }[program]


def runs(command, folder):
    try:
        # Damaged sizes make some programs write without end.
        limited = ["prlimit", "--fsize=100000000", *map(str, command)]
        return subprocess.run(limited, cwd=folder, stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL,
                              stderr=subprocess.DEVNULL, timeout=LIMIT).returncode
    except subprocess.TimeoutExpired:
        return None


def answers_of(talutil, number, archive, work):
    """For each program: "slow", "crash", "bad", or "good" and the tree that it has made. And whether talutil has
    written outside of its folder."""
    answers = {}
    folder = work / f"case{number}"
    is_outside = False
    for program in PROGRAMS:
        here = folder / program
        out = here / "cage" / "out"
        out.mkdir(parents=True)
        path = folder / "x.zip"
        path.write_bytes(archive)
        test, unpack = (runs(command, here) for command in commands_of(program, talutil, path, out))
        made = tree_of(out)
        if program == "talutil":
            is_outside = any(p != here / "cage" and p != out and out not in p.parents for p in here.rglob("*"))
        if test is None or unpack is None:
            answers[program] = "slow", made
        elif {test, unpack} & {-signal.SIGSEGV, -signal.SIGABRT, -signal.SIGBUS, -signal.SIGFPE}:
            answers[program] = "crash", made
        else:
            # unzip's 1 is a warning, as is our 4: a name has changed.
            is_good = (test == 0 or (program == "unzip" and test == 1)) and \
                (unpack == 0 or (program, unpack) in (("unzip", 1), ("talutil", 4)))
            answers[program] = "good" if is_good else "bad", made
    shutil.rmtree(folder)
    return answers, is_outside


def words_of(answers, expected):
    """One word per program; a program that is content with another tree than most says "other"."""
    trees = collections.Counter(repr(sorted(made.items())) for word, made in answers.values() if word == "good")
    usual = repr(sorted(expected.items())) if expected is not None else trees.most_common(1)[0][0] if trees else ""
    return tuple("other" if word == "good" and repr(sorted(made.items())) != usual else word
                 for word, made in answers.values())


# What talutil answers where not all programs agree, and why. What a class begins with; the last row that fits counts.
EXPLANATIONS = [
    ("zip|advzip|7z -mcl", ["good"], "Python does not read the field with the name in Unicode"),
    ("7z, (LZMA|PPMd|Deflate64)", ["bad"], "not read: its method is passed over, code 17"),
    ("7z, AES|bsdtar -P AES|talutil, AES", ["good"], "AES is read; not by unzip and Python"),
    ("archive behind", ["good"], "the last archive counts"),
    ("bytes before, not counted", ["good"], "positions are moved by the bytes before"),
    ("bytes behind, too many", ["bad"], "an end record is looked for as far back as a comment can reach"),
    ("comment like an end record", ["good"], "the end record that reaches to the end counts"),
    ("device file", ["good"], "becomes an empty file; bsdtar makes the device"),
    ("directory's", ["bad"], "the directory and the data disagree"),
    ("directory's version", ["good"], "the version that is needed is not compared, as the method tells the same"),
    ("end record:", ["bad"], "the end record and the directory disagree"),
    ("entries overlap", ["bad"], "refused, as small archives that unpack to terabytes are made so"),
    ("extra field broken", ["good"], "such fields are passed over"),
    ("flipped", ["good", "bad"], "found where it matters to the data: not in dates, nor in fields that stand twice"),
    ("folder by attribute", ["good"], "the attribute of MS-DOS makes a folder, as on Windows"),
    ("(less|more) data than is said|zip64 without its field", ["bad"], "damage"),
    ("link", ["bad"], "links are passed over, code 17, since they can lead out of the folder"),
    ("local", ["bad"], "the local header and the directory disagree"),
    ("name: NUL", ["bad"], "refused"),
    ("name: empty part", ["bad", "other"], "an empty name is refused, empty parts are left out"),
    ("name: no UTF-8", ["good", "other"], "read as code page 437; others take the bytes"),
    ("name: not for Windows", ["other"], "gets an underscore, so that Windows can restore it"),
    ("name: outside", ["bad", "other"], "stays in the folder or is refused"),
    ("name: plain", ["good"], "bsdtar needs another locale"),
    ("no archive", ["bad"], "bsdtar reads an empty file as an empty archive"),
    ("patched data|strong encryption|unknown method", ["bad"], "not read"),
]


def explanation_of(kind):
    return next((row[1:] for row in reversed(EXPLANATIONS) if re.match(row[0], kind)), ((), ""))


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("talutil", type=pathlib.Path)
    parser.add_argument("--every", type=int, default=1)
    options = parser.parse_args()
    talutil = options.talutil.resolve()
    # What a sanitizer finds is no plain failure.
    os.environ["ASAN_OPTIONS"] = os.environ["UBSAN_OPTIONS"] = "abort_on_error=1"
    passed, failures = 0, []
    with tempfile.TemporaryDirectory() as folder:
        work = pathlib.Path(folder)
        (work / "password").write_text(PASSWORD + "\n")
        cases = list(by_programs(work, talutil))
        cases += [(*case, None) for case in [*by_hand(), *by_damage(work)][::options.every]]
        with concurrent.futures.ThreadPoolExecutor(2) as pool:
            results = pool.map(lambda each: answers_of(talutil, each[0], each[1][1], work), enumerate(cases))
            for (kind, _, expected), (answers, is_outside) in zip(cases, results):
                words = words_of(answers, expected)
                agree = len(set(words)) == 1 and words[0] in ("good", "bad")
                allowed, why = (("good", "bad"), "") if agree else explanation_of(kind)
                if words[0] in allowed and not is_outside:
                    passed += 1
                else:
                    known = f"; expected {' or '.join(allowed)}: {why}" if why else ""
                    failures.append(f"{kind}: {dict(zip(PROGRAMS, words))}{known}{', outside' if is_outside else ''}")
    for failure in failures[:40]:
        print("FAILED:", failure)
    print(f"{passed} passed, {len(failures)} failed")
    sys.exit(bool(failures))


if __name__ == "__main__":
    main()
