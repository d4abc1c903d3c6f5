#!/usr/bin/env bash
# Runs the command and compares exit status and output: tests/cli/run.sh PATH_TO_TALUTIL
# The last line is "N passed, N failed".
set -uo pipefail
[ -x "${1:-}" ] || { echo "usage: tests/cli/run.sh PATH_TO_TALUTIL" >&2; exit 2; }
talutil=$(realpath "$1")
top=$(cd "$(dirname "${BASH_SOURCE[0]}")/../.." && pwd)
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cd "$work" || exit 2
export LC_ALL=C.UTF-8

. "$top/tests/verdict.sh"

# What a command line gives: the status, then everything printed. expect NAME STATUS OUTPUT ARGUMENT...
expect() {
  local name=$1 status=$2 output=$3 actual
  shift 3
  actual=$("$talutil" "$@" 2>&1 </dev/null)
  verdict "$name" "$status: $output" "$?: $actual"
}

# The same, where a part of the output is enough.
expect_part() {
  local actual found
  actual=$("$talutil" "${@:4}" 2>&1 </dev/null)
  found=$?
  [[ $actual == *"$3"* ]] && actual=$3
  verdict "$1" "$2: $3" "$found: $actual"
}

# The status and everything printed, in the form of `expect`, of a command that reads what it is given.
answer() { local text; text=$("$@" 2>&1); echo "$?: $text"; }

nl=$'\n'

# ---- call: results and what is written back
expect 'name in any case' 0 B call getdata A,B,C, 1 2
expect 'a dash begins a text' 0 -.5x call StripNulls -.5x
expect 'a subcommand as text' 0 list call StripNulls list
expect 'after -- an option is a text' 0 --json call StripNulls -- --json
expect 'optional argument as missing' 0 "2${nl}sFList = [\"A\", \"\"]" call ReadCommaDelimStrToList 'A,,B;' @empty @missing
expect 'written back though unchanged' 0 "0${nl}sFList = [\"x\"]" call ReadCommaDelimStrToList '' @list:x
expect 'JSON' 0 '{"result": "AB", "arguments": {"sCharacter": " "}}' call RemoveStringsFromNumber 2 'A B' '' --json
expect 'JSON escapes' 0 '{"result": "\"\\\r\nü😀", "arguments": {}}' call --json StringRestoreCRLF '"\xxü😀' x
expect 'JSON of Null' 0 '{"result": null, "arguments": {}}' call ConvertCase 0 @null --json
expect 'JSON of Empty' 0 '{"result": {"kind": "empty"}, "arguments": {}}' call ConvertCase 0 @empty --json
TZ=Australia/Brisbane expect 'JSON of a date' 0 '{"result": "2009-03-05T03:45:30", "arguments": {}}' \
  call LocalTimeToUTC '5/3/2009 13:45:30' --json
expect 'the result alone' 0 31/12/2009 call WeekYearToDate 60 2009 2 --result
expect_part 'a test of no Boolean' 2 'does not answer True or False' call GetYear 1/1/2009 --test

# ---- batch: state from line to line, errors, and lines of any length
batch() { "$talutil" batch "$@" 2>&1; }
verdict 'batch keeps settings' "0: {\"id\": 1, \"result\": {\"empty\": true}}$nl{\"result\": \"anne\"}" \
  "$(printf '\xEF\xBB\xBF{"call": "sUserName", "args": ["anne"], "id": 1}\r\n\n{"call": "sUserName"}' | answer batch)"
verdict 'batch goes on after a bad line' "1: refused$nl{\"result\": 0}${nl}talutil: standard input: 1 line was no call; its answer says why" \
  "$(printf 'x\n{"call": "iBranchID"}\n' | answer batch | sed 's/{"error": .*, "line": 1}}/refused/')"
verdict 'batch with 20 MB in a line' "20000000 x" \
  "$({ printf '{"call": "StripNulls", "args": ["'; head -c 20000000 /dev/zero | tr '\0' x; echo '"]}'; } | batch |
     tr -d -c x | sed -E 's/^(x*)$/\1/' | awk '{ print length($0), substr($0, 1, 1) }')"
# It answers before its input ends.
coproc waiting { "$talutil" batch 2>&1; }
echo '{"call": "GetData", "args": ["A,B,", 0, 1]}' >&"${waiting[1]}"
read -r -t 30 -u "${waiting[0]}" first
eval "exec ${waiting[1]}>&-"
wait "$waiting_PID"
verdict 'batch answers at once' '{"result": "A"}' "$first"
verdict 'batch in another code page' '{"result": "Ольга"}' \
  "$(echo '{"call": "VerifyTextData", "args": [0, 0, "Ольга?"]}' | batch --code-page 1251)"
printf '{"process": 1, "call": "GetData", "args": ["A,B,", 0, 1], "result": "A"}\n{"process": 1, "call": "Get' >full.jsonl
expect 'the recording of a full disk' 1 "line 2: no record: byte 28: expected a closing quote, but the line ends
1 calls compared, 0 different${nl}talutil: full.jsonl: 1 lines are no records" batch --compare full.jsonl

# ---- call: written forms
expect 'number' 0 1.5 call VerifyIntData 0 @num:1.5
expect 'date, day first' 0 31/03/2009 call VerifyTextData 0 0 @date:31/3/2009
expect 'a date result and what is written back' 0 "31/12/2009${nl}iWeek = 52" call WeekYearToDate 60 2009 2
expect 'no date where one is due' 1 \
  'talutil: LocalTimeToUTC: the_date: "31/2/2009" is not a date; write DD/MM/YYYY, DD/MM/YYYY HH:MM or HH:MM' \
  call LocalTimeToUTC 31/2/2009
expect 'list with a comma in an element' 0 1 call IndexInList '@list:"a,b",Banana' ban
printf 'Apple\r\nBanana\n' >"$work/lines"
expect 'list from a file' 0 1 call IndexInList "@lines:$work/lines" ban
expect_part 'standard input twice' 2 'can be read only once' call StringReplaceWord @- @- x
expect 'two at signs' 0 @null call StripNulls @@null
printf 'a\0bü' >"$work/bytes"
expect 'numbers are numbers where anything is taken' 0 '' call GetMousePos 5 5 0 0 10 10 --test
expect 'unless they are texts' 3 '' call GetMousePos @text:5 @text:5 @text:0 @text:0 @text:10 @text:10 --test
expect 'or not written as numbers are' 0 007 call VerifyTextData 0 0 007
expect 'file' 0 a call StripNulls "@file:$work/bytes"
verdict 'control characters are raw' "61 00 62 c3 bc 0a" \
  "$("$talutil" call StringReplaceWord @- x y <"$work/bytes" | od -An -tx1 | sed 's/^ //')"
expect_part 'unknown form' 2 'StripNulls: s: "@nul" is not a written form; write "@@nul" for the text' call StripNulls @nul
expect_part 'form with a bad value' 2 'VerifyIntData: vData: "@int:x" is not a 32-bit whole number; write it like @int:5' \
  call VerifyIntData 0 @int:x
expect 'file that is not there' 1 \
  'talutil: StripNulls: s: cannot read "nowhere": No such file or directory' call StripNulls @file:nowhere
expect_part 'bytes that are not UTF-8' 2 'is not in UTF-8' call StripNulls $'\xff'

# ---- what docs/dates.md says of texts (its rows of texts are the only ones that begin with a backquote)
while IFS='`' read -r _ text answer; do
  answer=${answer#" | "}
  actual=$("$talutil" call --set "BookingScreenDate=$text" BookingScreenDate 2>&1)
  [[ $actual == *'is not a date'* ]] && actual='no date'
  verdict "docs/dates.md: $text" "${answer%" |"}" "$actual"
done < <(grep '^| `' "$top/docs/dates.md")

# ---- call: settings
expect 'put, put again, then read' 0 a=b call --set sUserName=x --set susername=a=b sUserName
expect_part 'a put says how long it lasts' 0 'iBranchID is set for this command only' call iBranchID 7
expect 'read only' 2 'talutil: ComputerName can only be read; leave its value out' call ComputerName x
expect 'put only' 2 'talutil: SplashForm can only be put; write its value after it' call SplashForm
expect 'setting out of range' 1 'talutil: iBranchID: "70000" is out of range; write -32768 to 32767' \
  call --set iBranchID=70000 iBranchID
expect 'setting without value' 2 'talutil: --set DebugMode: has no value; write --set DebugMode=VALUE' \
  call --set DebugMode Terminate
expect 'message box without a terminal' 0 'talutil: Closing ORVUtils Components form' call --set DebugMode=1 Terminate

# ---- call: errors
expect 'run-time error as JSON' 1 '{"error": {"status": 1, "message": "IncMonth: error 13: Type mismatch; vSrcDate = \"x\", iNum = \"1\"", "number": 13}}' \
  call IncMonth x 1 --json
expect 'a window without a screen' 1 'talutil: ShowSysInfo: error 445: There is no screen to show the window on' call ShowSysInfo
expect_part 'an input box on the terminal' 0 'Name: Who are you?' call MyInputBox Name 'Who are you?'
# A wrong answer brings a warning, which takes only yes or no; what follows the right one is left.
verdict 'an answer by a pipe' "True${nl}rest" "$(printf 'yes\r\nmaybe\ny\nYES\nrest' |
  { "$talutil" call CheckDeleteRecord 2>log; cat; })"
verdict 'an answer that ends' False "$(printf yes | "$talutil" call CheckDeleteRecord 2>log)"
verdict 'requests are no answers' '{"result": false}x' \
  "$(printf '{"call": "CheckDeleteRecord"}\nYES\n' | "$talutil" batch 2>log | sed 's/{"error.*/x/' | paste -sd '')"
expect 'not a whole number' 1 \
  'talutil: GetData: iSt: "x" is not a whole number; write -2147483648 to 2147483647' call GetData A, x 2
expect_part 'too many, with optional' 2 'takes 2 to 3 arguments (sTemp, sFList, sDelimiter), not 4' \
  call ReadCommaDelimStrToList 1 2 3 4
expect 'no such subcommand below another' 2 'talutil: there is no subcommand "gte"; did you mean get?' config gte
expect_part 'no subcommand that is near' 2 'there are list, help, call, batch, clean' xyzzy
expect_part 'no member' 2 ': MEMBER is required; see' call -- GetYear
expect_part 'no such option' 2 'was not expected: --jsn; see "talutil list --help"' list --jsn

# ---- list, help
expect_part 'list: method' 0 \
  "${nl}call     ReadCommaDelimStrToList(sTemp As String, ByRef sFList As String(), [sDelimiter As String = \",\"]) As Long${nl}" list
expect_part 'list: nothing fits' 1 "no member's name fits" list xyzzy
expect_part 'help of a subcommand' 0 'talutil config unset [OPTIONS] SECTION ITEM' help config unset
expect_part 'help of a member by its call' 0 'GetData(sSrcStr As String' call GetData --help
verdict 'help fits the terminal' '' "$(for each in '' clean call report zip config; do COLUMNS=60 "$talutil" help $each; done |
  grep -v '^ *[^ ]*$' | awk 'length > 60 && !/^  talutil|^  [A-Za-z"]+  /')"
verdict 'docs/command.md has the pages of help' '' "$(for each in exit-codes environment; do "$talutil" help $each | tail -n +3; done |
  sed -E 's/^ +([^ ]+) .*/\1/' | while read -r word; do grep -qF "$word" "$top/docs/command.md" || echo "$word"; done)"
bash -n <("$talutil" completion bash)
verdict 'completion for bash' 0 $?
complete_line() { (. <("$talutil" completion bash); COMP_WORDS=("$@") COMP_CWORD=$(($# - 1)); _talutil; echo "${COMPREPLY[*]}"); }
verdict 'completion of a subcommand, an option, a member' 'clean unset --group GetDaysInPeriod' \
  "$(complete_line talutil cle) $(complete_line talutil config uns) $(complete_line talutil config get --gr) $(complete_line talutil call GetDaysInP)"
fish_line() { fish --no-config -c 'source (cat $argv[1] | psub); complete -C $argv[2]' <("$talutil" completion fish) "$1" | cut -f1; }
verdict 'completion for fish' 'clean unset --group --json GetDaysInPeriod' \
  "$(echo $(fish_line 'talutil cle') $(fish_line 'talutil config uns') $(fish_line 'talutil config get --gr') $(fish_line 'talutil list --json --js') $(fish_line 'talutil call GetDaysInP'))"
verdict 'completion for zsh' 0 "$(zsh -n <("$talutil" completion zsh); echo $?)"
verdict '-V' "$("$talutil" --version)" "$("$talutil" -V)"
verdict 'each name once' '' "$("$talutil" list | cut -c10- | sed 's/[( ].*//' | sort | uniq -d)"
expect_part 'help: default' 0 'sDelimiter  the delimiter, one character (String; "," when left out)' \
  help readcommadelimstrtolist
expect_part 'help of an indexed property' 0 'Grid.TextMatrix(Row As Long, Col As Long) As String' help grid.textmatrix
verdict 'help as JSON is the reference, of whose examples tests/examples runs each' True "$("$talutil" help --json | python3 -c '
import json, sys
classes = json.load(open(sys.argv[1]))["classes"]
print([each | {"class": of["name"]} for of in classes for each in of["members"]] == list(map(json.loads, sys.stdin)))' \
  <("$talutil" reference --json))"
expect_part 'help of a subcommand as JSON' 2 'help --json describes classes and members' help zip --json
expect_part 'help of a class' 0 'Created by CreateObject("TALUtil.ZipControl").' help TALUtil.ZipControl
expect 'help of a name that classes share' 2 \
  'talutil: "errorcode" is a member of several classes; write one of ZipControl.ErrorCode, UnzipControl.ErrorCode' \
  help errorcode

# ---- clean
plan="ID VerifyIntData 0${nl}# a remark${nl}Name VerifyTextData 8 0${nl}Tags list VerifyTextData 0 0${nl}"
plan+="Code StripNulls | AddZeros * 3 -1${nl}"
printf %s "$plan" >plan
# The CSV text is a format, for its NULs and code page 1252.
# shellcheck disable=SC2059
clean() { printf "$1" >in.csv; "$talutil" clean in.csv --plan plan --output out.sql --output-encoding 1252 --table 't "x"' 2>&1; }
inserts() { clean "$1" >log && iconv -f CP1252 out.sql | tr -d '\r'; }
opening='INSERT INTO "t ""x""" (ID, Name, Tags, Code) VALUES '

verdict 'quotes, line breaks, NUL, code page 1252' "$opening('1', 'M´ü', 'a´,b,', '07\"');" \
  "$(inserts 'ID,Name,Tags,Code\r\n1,"M'"'"'""\xfc\0""","a'"'"',b","7""\0x"\r\n')"
verdict 'line feeds alone, the last one missing, empty list' "$opening('0', '', '', 'a''b');$nl$opening('2', 'x', ',', '000');" \
  "$(inserts 'ID,Name,Tags,Code\n,,,a'"'"'b\n2,x,",",\r')"
verdict 'the counters' 'values cleaned: 3 texts (CounterVerifyText), 1 numbers (CounterVerifyInt)' \
  "$(clean 'ID,Name,Tags,Code\n0,x,"a,b",\n' | grep Counter)"

# Standard input to standard output; the summary goes elsewhere.
stream() { "$talutil" clean - --plan plan --table t --line-feeds "$@" 2>stream.log; }
utf8_row='1,Zoë,a,"7"""'
verdict 'a mark is no part of the first name' 'ID,Name,Tags,Code
1,Zoë,"a,","07"""' "$(printf '\xef\xbb\xbfID,Name,Tags,Code\n\n%s\n' "$utf8_row" | stream --format csv)"
verdict 'UTF-16, JSON lines, numbers, empty values' '{"ID": 1, "Name": "Zoë", "Tags": "a,", "Code": "07\""}
{"ID": 0, "Name": null, "Tags": null, "Code": "000"}' \
  "$(printf 'ID,Name,Tags,Code\r\n%s\r\n,,,\r\n' "$utf8_row" | iconv -t UTF-16 | stream --format jsonl --numbers ID,Code --empty-null)"
verdict 'JSON lines in' 'ID,Name,Tags,Code
1,é,,0😀
0,,,00b' "$(printf '%s\n' '{"ID": 1, "Name": "\u00e9", "Tags": null, "Code":"\ud83d\ude00"}' '' '{"Code": "b"}' |
  stream --input-format jsonl --format csv)"
verdict 'bad JSON lines' '1 talutil: standard input: line 2: has "X", which the first line has not' \
  "$(printf '%s\n' '{"ID": 1, "Name": 2, "Tags": 3, "Code": 4}' '{"X": 1}' | stream --input-format jsonl >log; echo "$? $(cat stream.log)")"
verdict 'UTF-16 out, in a transaction' "BEGIN;
INSERT INTO t (ID, Name, Tags, Code) VALUES ('2', 'é', '', '000');
COMMIT;" "$(printf 'ID,Name,Tags,Code\n2,é,,\n' | stream --output-encoding utf-16 --transaction | iconv -f UTF-16)"
verdict 'a guess is said' 'talutil: standard input: line 2 is not in UTF-8; read as code page 1252 (--encoding names another encoding)' \
  "$(printf 'ID,Name,Tags,Code\n2,\xe9,,\n' | stream >log; head -1 stream.log)"
verdict 'neither UTF-8 nor a code page' \
  '1 talutil: standard input: line 3 is not in UTF-8, although lines before it are; mend it, or name the encoding by --encoding' \
  "$(printf 'ID,Name,Tags,Code\n1,é,,\n2,\xe9,,\n' | stream >log; echo "$? $(cat stream.log)")"
# Rows that are longer than a piece of the input, and a quote that is never closed behind them.
long=$(head -c 300000 /dev/zero | tr '\0' x)
verdict 'bad rows are collected as they are' "4 $(printf 'ID,Name,Tags,Code\n1,"%s\n"y,,\n1,2\n3,"x,,\n' "$long" | cksum) 8" \
  "$(printf 'ID,Name,Tags,Code\n1,"%s\n",,\n1,"%s\n"y,,\n1,2\n3,"x,,\n' "${long}x" "$long" |
    stream --bad-rows bad.csv --format csv --set iCharactercase=0 >good.csv; echo "$? $(cksum <bad.csv) $(grep -o 'xx*' good.csv | tr -d '\n' | wc -c)")"
verdict 'the summary as JSON' '1 3' "$(clean 'ID,Name,Tags,Code\n' >log; printf 'ID,Name,Tags,Code\n,#,,\n' >in.csv
  "$talutil" clean in.csv --plan plan --output out.sql --json | python3 -c 'import json, sys; d = json.load(sys.stdin); print(d["rows"], sum(c["changed"] for c in d["columns"]))')"
[ -c /dev/full ] && verdict 'a full disk' '1: talutil: cannot write "/dev/full": error 61: Disk full' \
  "$(printf 'ID,Name,Tags,Code\n' >in.csv; answer "$talutil" clean in.csv --plan plan --transaction --output /dev/full)"

# ---- the code page of texts
TALUTIL_CODE_PAGE=932 expect 'by the environment' 0 '東 5' call VerifyTextData 0 0 'é東 5?'
TALUTIL_CODE_PAGE=932 expect 'the option counts more' 0 'é 5' call --code-page 1252 VerifyTextData 0 0 'é東 5?'
expect_part 'an unknown page' 2 '--code-page: 99 not in {874,932' call --code-page 99 VerifyTextData 0 0 x
TALUTIL_CODE_PAGE=1251x expect 'an unknown page in the environment' 1 \
  'talutil: TALUTIL_CODE_PAGE: "1251x" is no code page that there is; choose one of 874, 932, 936, 949, 950, 1250, 1251, 1252, 1253, 1254, 1255, 1256, 1257, 1258, 65001' \
  call VerifyTextData 0 0 x
iconv -t CP1251 <<<"Имя${nl}Ольга?" >in.csv
echo 'Имя VerifyTextData 0 0' >names
"$talutil" clean in.csv --plan names --code-page 1251 --output-encoding 1251 --output out.sql >log 2>&1
verdict 'files in another code page' 'INSERT INTO in ("Имя") VALUES ('"'Ольга');" "$(iconv -f CP1251 out.sql | tr -d '\r')"

refused() { verdict "$1" "1: talutil: in.csv: $2" "$(answer clean "$3")"; }  # name, message, CSV
refused 'open quote' 'line 2: a quote is never closed; double the quotes inside a field and close it with one' \
  'ID,Name,Tags,Code\n"1,2\n'
refused 'text after a quote' 'line 3: text after a closing quote; double the quotes inside a field' \
  'ID,Name,Tags,Code\n"1\n"x,2,3,4\n'
refused 'short row' 'line 4: the row has 2 fields, the header 4' 'ID,Name,Tags,Code\n"\n",,,\n1,2\n'
refused 'column without plan' 'column "Fax" has no line in plan' 'ID,Fax,Name,Tags,Code\n'
refused 'run-time error' \
  'line 2, column "ID": VerifyIntData: error 6: Overflow; the value is "1E999"' 'ID,Name,Tags,Code\n1E999,,,\n'
verdict 'nothing is written on errors' 'none' "$(rm -f out.sql; clean 'ID\n' >log; cat out.sql 2>/dev/null || echo none)"
verdict 'the CSV file is not overwritten' '2: talutil: --output ./in.csv is the input itself; name another file' \
  "$(printf 'ID\n' >in.csv; answer "$talutil" clean in.csv --plan plan --output ./in.csv)"

bad_plan() {  # name, message, line
  printf 'ID VerifyIntData 0\n%s\n' "$3" >plan
  verdict "$1" "2: talutil: plan: line 2: $2" "$(answer clean 'ID,Name\n')"
}
bad_plan 'plan: unknown member' 'there is no member "VerifyTextDat"; did you mean VerifyTextData?' 'Name VerifyTextDat 1 0'
bad_plan 'plan: count' \
  'VerifyTextData takes 3 arguments and got 2, the column'"'"'s value included; see "talutil help VerifyTextData"' 'Name VerifyTextData 1'
bad_plan 'plan: column twice' 'column "ID" stands twice' 'ID StripNulls'
bad_plan 'plan: no result' 'Terminate gives no value back; use a member that does' 'Name Terminate'

# ---- secrets
verdict 'encrypted and decrypted, the line break of echo apart' $'sécret' "$(echo 'sécret' | "$talutil" encrypt | "$talutil" decrypt)"
verdict 'to the byte' ' 20 61 0a 0a' "$(printf ' a\n\n' | "$talutil" encrypt --exact | "$talutil" decrypt --exact | od -An -tx1)"
verdict 'a foreign cipher text' '1: talutil: standard input: error 5: This is not a cipher text of this library, or it was changed' \
  "$(echo QUJD | answer "$talutil" decrypt)"
[[ $("$talutil" password --length 12 --mix hex --count 2) =~ ^[0-9A-F]{12}$'\n'[0-9A-F]{12}$ ]]
verdict 'passwords' 0 $?
mkdir archived && echo one >archived/one.txt && echo key >key.txt
expect 'zip' 0 'talutil: a.zip: 2 entries' zip a.zip archived --password-file key.txt --comment 'a comment'
expect 'zip of what is not there' 1 'talutil: b.zip: there is no "nosuch"; nothing was packed (code 12)' zip b.zip archived nosuch
expect 'zip --test without the password' 1 'talutil: a.zip: archived/one.txt: no password was given (code 9)' zip --test a.zip
expect_part 'unzip --list' 0 ' *archived/one.txt' unzip --list a.zip
echo wrong >wrong.txt
expect 'a wrong password' 1 'talutil: a.zip: archived/one.txt: the password is wrong (code 9)' \
  unzip a.zip --to unpacked --password-file wrong.txt
expect 'unzip' 0 'talutil: a.zip: 2 entries unpacked' unzip a.zip --to unpacked --password-file key.txt
expect 'unzip over existing files' 4 "talutil: a.zip: 1 existing files were kept; --overwrite replaces them, --keep keeps them silently${nl}talutil: a.zip: 1 entries unpacked" \
  unzip a.zip --to unpacked --password-file key.txt
mkdir links && ln -s /etc links/x && (cd links && zip -qy ../links.zip x)
expect 'unzip of a link' 1 "talutil: links.zip: \"x\" was left out: links are not unpacked${nl}talutil: links.zip: 1 entries were passed over, such as x (code 17)" \
  unzip links.zip --to unpacked
expect 'unzip as JSON' 0 '{"archive": "a.zip", "unpacked": 1, "kept": 1, "renamed": 0}' \
  unzip a.zip --to unpacked --password-file key.txt --keep --json
mkdir odd && touch odd/aux.c odd/plain
expect_part 'zip of a name that changes' 4 'talutil: "odd/aux.c" is unpacked as "odd/_aux.c"' zip odd.zip odd
expect_part 'unzip of it' 4 'talutil: "odd/aux.c" is unpacked as "odd/_aux.c"' unzip odd.zip --to unpacked
expect_part 'unzip of it alone' 4 'talutil: "odd/aux.c" is unpacked as "_aux.c"' unzip odd.zip aux.c --to unpacked --no-folders
expect 'unzip under its own name' 0 'talutil: odd.zip: 1 entries unpacked' unzip odd.zip aux.c --to own --own-names
verdict 'its own name' 'own/odd/aux.c' "$(find own -type f)"
python3 -c 'import zipfile
with zipfile.ZipFile("out.zip", "w") as archive:
    for name in "../up", "/root", "a\\..\\b", "x/../../up": archive.writestr(name, "")'
expect_part 'own names stay below the folder' 1 '"/root" is unpacked as "root"' unzip out.zip --to own/out --own-names
verdict 'what is unpacked of them' 'a\..\b root' "$(cd own && find . -path './out*' -type f -printf '%f\n' | sort | paste -sd' '; ls -d up ../up 2>/dev/null)"
expect_part 'zip without items' 2 'name what is to be packed' zip a.zip
expect_part 'AES without a password' 2 'give --encrypt or --password-file' zip a.zip archived --aes

# ---- tables
printf 'Name,Phone,Town\r\nAnne,1,"Cork, IE"\r\nBob,2,Kyle\r\nCy,3,Ayr\r\n' >table.csv
expect 'export' 0 '' export --from table.csv --hide 2 --rows 1-2 shown.txt
verdict 'the exported rows' $'Anne,"Cork, IE"\r\nBob,Kyle\r' "$(cat shown.txt)"
verdict 'export, streams' $'Name\r' "$(sed '1s/^/\xef\xbb\xbf/' table.csv | "$talutil" export --from - --hide 2,3 --rows 0 -)"
verdict 'what is behind standard output stays' $'before\nName\r' \
  "$(echo before >log; "$talutil" export --from table.csv --hide 2,3 --rows 0 /dev/stdout >>log; cat log)"
expect 'report' 0 'talutil: sales.pdf: 1 page' report table.csv --title 'Sales €' --landscape --pdf sales.pdf
verdict 'the words of the report' "Anne 1 Cork, IE" "$(pdftotext -layout sales.pdf - | grep Anne | tr -s ' ' | sed 's/^ //')"
words() { "$talutil" report "$@" --pdf - 2>report.log | pdftotext -layout - - | tr -s ' ' | sed 's/^ //' | grep -v '^$'; }
printf 'Name,Sum,Ölpreis\nZoë Ольга,"1,200.50",x\nTrần,3,😀\n' >sums.csv
printf 'N,T\n1,\u05d0\u05d1 \u05d2\n2,\u0628\u0628 \u0643\u0650\u062a\n' >hebrew.csv
verdict 'report: Hebrew and Arabic are found as they are read' '\u05d0\u05d1 \u05d2,\u0628\u0628 \u0643\u0650\u062a' \
  "$("$talutil" report hebrew.csv --columns T --pdf - 2>report.log | pdftotext - - | python3 -c '
import sys
print(",".join(ascii(line.strip("\u202b\u202c"))[1:-1] for line in sys.stdin.read().split("\n") if "\u202b" in line))')"
verdict 'report: columns, total, period' 'April 2009,Sum Name,1,200.50 Zoë Ольга,3 Trần,1,203.50 Total' \
  "$(words sums.csv --columns Sum,1 --total sum --period 'April 2009' | sed -n 2,6p | paste -sd,)"
verdict 'report: what no font has' 'talutil: 1 characters are in no font and are shown as boxes: 😀; --font-file names a TrueType font that has them' \
  "$(words sums.csv >log; head -1 report.log)"
verdict 'report: a name in capitals is a table' 'Name Sum Ölpreis' "$(cp sums.csv S.CSV; words S.CSV --font fixed | sed -n 2p)"
expect_part 'report: a program' 1 'is no text: ' report "$talutil" --pdf x.pdf --encoding 1252
expect_part 'report: paper' 0 '1 page' report sums.csv --paper letter --pdf x.pdf
expect 'report: no such column' 2 'talutil: --total: there is no column "x"; name one by its heading or by its number, 1 to 3' \
  report sums.csv --total x --pdf x.pdf
expect_part 'system information' 0 'Operating system' sysinfo
verdict 'system information in JSON' "file $(stat -c %s table.csv)" "$("$talutil" sysinfo --json table.csv |
  python3 -c 'import json, sys; item = json.load(sys.stdin); print(item["kind"], item["size"])')"
expect 'report over its own file' 2 'talutil: sales.pdf: give --pdf another name' report sales.pdf
expect 'export: no such column' 2 'talutil: --hide: there is no column 4; table.csv has columns 1 to 3' export --from table.csv --hide 1,4 x.txt

expect 'unknown mix' 2 'talutil: --mix x: there is no such mix; there are digits, letters, all and hex' password --mix x
expect_part 'password without length' 2 '--length: Value 0 not in range 1 to 32767' password --length 0

# ---- settings
export TALUTIL_HIVE=$work/hive.db
main() { "$talutil" config "$1" --database Main --user "${user:-anne}" "${@:2}" 2>&1; }
main set S 'k=]' $'a\\b\r\n x '
main set T name ' "q" '
verdict 'a setting to the byte' $'a\\b\r\n x ' "$(main get s 'K=]')"
verdict 'the database has it too' ' "q" ' "$("$talutil" config get --database Main --group database T name)"
verdict 'list of a section' $'[T]\nname=\\u0020"q"\\u0020' "$(main list t)"
verdict 'a setting is removed' "1: talutil: there is no x in [S]" "$(main set S x 1; main unset s X; answer main get S x)"
verdict 'export' 'talutil: 2 settings written to anne.ini' "$(main export anne.ini)"
verdict 'export twice' '1: talutil: anne.ini is there already; --force replaces it' "$(answer main export anne.ini)"
user=bob main set T name other
verdict 'import keeps what differs' "4: talutil: 1 settings added, 0 the same, 1 kept as they were; --force replaces them" \
  "$(user=bob answer main import anne.ini)"
verdict 'through standard streams' 'talutil: 0 settings added, 2 the same, 0 kept as they were; --force replaces them' \
  "$(main export - 2>log | main import - 2>&1)"
verdict 'import by force' 'talutil: 0 settings added, 1 the same, 1 replaced' "$(user=bob main import anne.ini --force)"
verdict 'all of it has moved' "$(main list)" "$(user=bob main list)"
printf '[S]\nk=\\x\n' >bad.ini
verdict 'a file that export did not write' '1: talutil: bad.ini: "\x" has a backslash that begins neither \\ nor \uXXXX' \
  "$(answer main import bad.ini)"
expect 'no database' 2 'talutil: name the database: --database NAME, or a profile file: --file FILE' config get S k
expect 'unknown group' 2 'talutil: --group x: there is no such group; there are user, database, previous and code' \
  config get --group x S k
expect_part 'what a profile cannot keep' 0 'is read as a missing one' config set --file a.ini S k '\\server'
"$talutil" config set --file a.ini S k v && chmod 444 a.ini
expect 'a read-only profile' 1 'talutil: cannot write k in [S] of a.ini: error 75: Path/File access error' \
  config set --file a.ini S k w
verdict 'a profile on a full disk' 'talutil: cannot write k in [S] of full.ini: error 61: Disk full' \
  "$( (ulimit -f 0; trap '' XFSZ; "$talutil" config set --file full.ini S k v) 2>&1)"
verdict 'list of a profile by a Windows path' $'[S]\nk=v' "$("$talutil" config list --file "Z:${work//\//\\}\\A.INI")"
echo 'not a database, but a file long enough to be taken for something else' >bad.db
TALUTIL_HIVE=bad.db expect 'a damaged store is named' 1 \
  'talutil: error 57: Cannot use the settings in bad.db: file is not a database' config list --database Main --user anne

# ---- files: drives below a folder, and the event log
export TALUTIL_DRIVES=$work/drives
expect 'the current folder' 0 "Z:${PWD//\//\\}\\${nl}vSpecIn = a.txt" call ExtractPathName a.txt
expect 'no terminal, no folder' 0 '' call BrowseForFolder Choose
expect 'standard folders on a machine without drives' 0 '' call SetupFileFolders
verdict 'and what they are' 'BinTemp Data Drawings Help Pictures Reports Templates' "$(ls drives/c/TAL/ORV3 | xargs)"
for event in First Second "Third Jürgen"; do
  "$talutil" call --set EventLog=1 --set sUserName=anne --set 'sORVPath=C:\TAL\ORV3' AppendEventLog "$event" frm
done
stamps() { sed -E "s/:[0-9]{14}:/:STAMP:/; s/$(date +%Y-%m-%d)([ T])[0-9:]{8}/DAY\1TIME/"; }
verdict 'log tail, the folder given' "anne:STAMP:Second:frm${nl}anne:STAMP:Third Jürgen:frm" \
  "$("$talutil" log tail --raw -n 2 'C:\TAL\ORV3' | stamps)"
verdict 'log tail for people and programs' 'DAY TIME  anne  Third Jürgen  (frm) {"time": "DAYTTIME", "user": "anne", "text": "Third Jürgen", "form": "frm"}' \
  "$("$talutil" log tail -n 1 drives/c/TAL/ORV3 | stamps) $("$talutil" log tail -n 1 drives/c/TAL/ORV3 --json | stamps)"
verdict 'log tail ends with its reader' 'DAY' "$(timeout 20 "$talutil" log tail -f -n 1 drives/c/TAL/ORV3 | head -1 | stamps | cut -c1-3)"

# ---- interruption: no temporary files stay, and the old file does
# Asynchronous commands ignore SIGINT unless somebody resets it.
as_in_front='import os, signal, sys; signal.signal(signal.SIGINT, signal.SIG_DFL); os.execv(sys.argv[1], sys.argv[1:])'
interrupted() {  # signal
  rm -f pipe && mkfifo pipe && echo old >out.sql && echo 'ID VerifyIntData 0' >plan
  python3 -c "$as_in_front" "$talutil" clean pipe --plan plan --output out.sql 2>log &
  local command=$! status
  exec 9>pipe
  { echo ID && seq 50; } >&9
  until compgen -G '.talutil-*' >log || ! kill -0 $command 2>/dev/null; do sleep 0.01; done
  kill "-$1" $command
  wait $command 2>/dev/null
  status=$?
  exec 9>&-
  echo "$status $(cat out.sql)$(compgen -G '.talutil-*')"
}
verdict 'Ctrl-C' '130 old' "$(interrupted INT)"
verdict 'SIGTERM' '143 old' "$(interrupted TERM)"

verdict 'log tail of fewer lines than asked for' 3 "$("$talutil" log tail drives/c/TAL/ORV3/EventLog.txt | wc -l)"
expect_part 'log tail of no log' 1 'cannot read the event log "Q:\x": error 76: Path not found' log tail 'Q:\x'
expect 'log tail of no lines' 2 'talutil: --lines 0: write 1 or more' log tail -n 0 drives

cmp -s "$top/examples/data/customers.csv" <("${CXX:-g++}" -std=c++20 -o make "$top/tools/make_customers.cpp" && ./make)
verdict 'customers.csv is what make_customers writes' 0 $?

close_counts
