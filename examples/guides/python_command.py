"""TALUtil from Python on Linux, through the command talutil, which prints JSON."""

import json
import subprocess


def call(member, *arguments):
    """The result of a member and the arguments that it wrote back, by name."""
    command = ["talutil", "call", "--json", member, "--", *map(str, arguments)]
    done = subprocess.run(command, capture_output=True, text=True, check=True)
    answer = json.loads(done.stdout)
    return answer["result"], answer["arguments"]


print(call("VerifyTextData", 20, 1, "  Smith & Sons, Pty  ")[0])
count, changed = call("ReadCommaDelimStrToList", "red,green,blue,", "@empty")
print(count, changed["sFList"])
