#!/usr/bin/env python3
"""Sweeps faults through the nls2 command: tool_faults.py NLS2 SHIM SECONDS

Each command runs on a short input while its 1st, 2nd, ... request to the heap fails, alone and with
all that follow, or a call of ICU's, or an open, read, write, close, fsync, rename or link, until a run
without a fault. A fault must be absorbed (the usual output, exit code and nothing on standard error) or
reported: a message, and exit code 1, or 2 where 1 means "no". An output file is whole or not there.
"""

import errno
import os
import subprocess
import sys
import tempfile
import time
from collections import Counter
from concurrent.futures import ThreadPoolExecutor

TRANSLATE = ["translate", "--from", "37", "--to", "1208", "--read", "fixed:80"]
# arguments, and the exit codes of a failure
COMMANDS = [
    (TRANSLATE + ["--write", "lines", "IN", "-o", "OUT"], (1,)),
    (["translate", "--from", "37", "--read", "fixed:80", "--write", "csv", "--fields", "1-10;11-20=hex",
      "--sync", "IN", "-o", "OUT"], (1,)),
    (TRANSLATE + ["--write", "prefixed", "--verify", "--report", "REPORT", "IN", "-o", "OUT"], (1,)),
    (["cat", "--encoding", "ibm-37", "IN"], (2,)),
    (["dump", "--from", "37", "IN"], (1,)),
    (TRANSLATE[:-1] + ["lines", "--write", "joined", "--on-error", "reject", "--rejects", "OUT", "TEXT"],
     (1,)),
    (["codepages", "37", "--json"], (1,)),
    (["codepages", "--chart", "37"], (1,)),
    (["locales", "de_DE"], (1,)),
    (["detect", "IN"], (2,)),
    (["compare", "--locale", "de_DE", "a", "a"], (2,)),
    (["find", "--locale", "de_DE", "--ignore-case", "zulu", "TEXT"], (2,)),
    (["sort", "--locale", "de_DE", "TEXT"], (1,)),
]
IO_FAULTS = [(kind, how) for kind in ("open", "read", "write", "close", "fsync", "rename", "link")
             for how in (errno.EIO, errno.ENOSPC, errno.EINTR)] + [("read", 0), ("write", 0)]
ICU_FAULTS = [("icu", 7)]  # no memory


class Sweep:
    def __init__(self, tool, shim, folder):
        self.tool, self.shim, self.folder = tool, shim, folder
        self.counts, self.wrong = Counter(), []

    def run(self, arguments, fault, name):
        """Exit code, output, file written (or None), messages, what the shim logged."""
        place = os.path.join(self.folder, name)
        files = {"IN": self.folder + "/in", "TEXT": self.folder + "/text", "OUT": place + ".out",
                 "REPORT": place + ".report"}
        environment = {"LC_ALL": "de_DE.UTF-8", "PATH": "/usr/bin:/bin", "FAULT_LOG": place}
        environment.update(fault)
        for path in (place, files["OUT"]):
            if os.path.exists(path):
                os.unlink(path)
        words = ["timeout", "-s", "ABRT", "20", "env", "LD_PRELOAD=" + self.shim, self.tool] + [files.get(w, w) for w in arguments]
        done = subprocess.run(words, env=environment, capture_output=True, check=False)
        read = [open(path, "rb").read() if os.path.exists(path) else None
                for path in (files["OUT"], place)]
        return done.returncode, done.stdout, read[0], done.stderr, (read[1] or b"").decode()

    def judge(self, usual, result, codes):
        code, output, file, messages, log = result
        crash = log.partition("crash in ")[2].strip()
        if (code, output, file) == usual and not messages:
            return "absorbed"
        whole = file is None or file == usual[2]
        return "reported" if code in codes and messages and whole else "wrong " + crash

    def sweep(self, command, kind, how, on, until):
        arguments, codes = command
        codes = (1, 2) if kind == "icu" else codes  # 2: the page that an option names does not open
        name = f"{COMMANDS.index(command)}-{kind}-{how}-{on}"
        usual = self.run(arguments, {}, name)[:3]
        for at in range(1, 100000):
            if time.monotonic() > until:
                self.counts["not tried: out of time"] += 1
                return
            fault = {"FAULT_KIND": kind, "FAULT_HOW": str(how), "FAULT_AT": str(at)}
            result = self.run(arguments, fault | ({"FAULT_ON": "1"} if on else {}), name)
            if "reached" not in result[4]:
                return
            verdict = self.judge(usual, result, codes)
            self.counts[verdict.split()[0]] += 1
            if verdict.startswith("wrong"):
                self.wrong.append(f"{' '.join(arguments)}: {fault}{' on' if on else ''}: exit code "
                                  f"{result[0]}, {result[3][:100]!r} {verdict[6:]}")


def main():
    tool, shim, seconds = os.path.abspath(sys.argv[1]), os.path.abspath(sys.argv[2]), int(sys.argv[3])
    until = time.monotonic() + seconds
    with tempfile.TemporaryDirectory() as folder:
        with open(folder + "/in", "wb") as file:
            file.write(b"\xC1\xC2" * 15 + b"\x40" * 50 + b"\xD1" * 80)
        with open(folder + "/text", "w", encoding="utf-8") as file:
            file.write("Zulu\nÄpfel\nazulul\n")
        sweep = Sweep(tool, shim, folder)
        jobs = [(c, "heap", errno.ENOMEM, on) for c in COMMANDS for on in (0, 1)]
        jobs += [(c, kind, how, 0) for kind, how in ICU_FAULTS for c in COMMANDS]
        jobs += [(c, kind, how, on) for kind, how in IO_FAULTS for c in COMMANDS for on in (0, 1)
                 if how != errno.EINTR or not on]
        with ThreadPoolExecutor(os.cpu_count()) as pool:
            list(pool.map(lambda job: sweep.sweep(*job, until), jobs))
    for line in sweep.wrong[:int(os.environ.get("SHOW", "20"))]:
        print("WRONG:", line)
    injected = sum(count for verdict, count in sweep.counts.items() if "not" not in verdict)
    print(f"command: {injected} faults injected:", dict(sweep.counts))
    return 1 if sweep.wrong or injected < 100 else 0


if __name__ == "__main__":
    sys.exit(main())
