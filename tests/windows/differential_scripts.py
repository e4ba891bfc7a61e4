#!/usr/bin/env python3
"""Writes random quorrel scripts for the differential check of the Linux and Windows builds.

    differential_scripts.py CATALOG SEEDDIR OUTDIR --seed S --count N

CATALOG is `quorrel list` output, the one table of actions and expressions (codes, names,
parameter types and descriptions); SEEDDIR holds the seed files a script reads; OUTDIR
gets 0.qs .. N-1.qs. Script K depends only on S and K, so the same seed gives the same
scripts. Every script is valid (right argument counts and types), so what differs
between builds is behaviour, never a parse error.

Sizes stay bounded, as in fuzz/targets/session.cpp and script.cpp: an index or boundary
that the array accepts only costs memory, so numbers that can be indexes are small,
negative or at/past the array's cap (refused); boundaries are at most 16 (a wider table
makes row indexes wrap in 32 bits and land anywhere below the cap); and a script reads
at most kMaxReads files, since reading back what it saved doubles the array each time.
"""
import argparse, os, random, re

INT32_MIN, INT32_MAX = -(2**31), 2**31 - 1
CAP = 67108864  # the array's element cap: an index at or past it is refused
MAX_READS = 4
EXTREMES = [-1, -2, INT32_MIN, INT32_MIN + 1, INT32_MAX, INT32_MAX - 1, CAP, CAP + 1, 1 << 30]

# Names written by scripts, besides the seed files. Windows rules keep these out, and so
# they are never generated: reserved device names (NUL, CON, AUX, PRN, COM1-9, LPT1-9,
# with any extension); the characters <>:"/\|?* and control bytes (a slash appears only
# as the separator both systems share); trailing dots and spaces (Windows strips them);
# names differing only in case (Wine's file system folds case), so every name is lower
# case; absolute paths and drive letters; backslashes; bytes past ASCII (the module hands
# a name's bytes to the system, which Windows reads in its ANSI code page and Linux takes
# as they are: \xc3\xa9 names two different files).
OUTPUTS = ["out.arr", "out.mmf", "out.csv", "out.ini", "out.bin", "two words.txt",
           "a.b.c", ".dot", "n" * 100 + ".csv", "sub/in.csv", "sub/new.arr",
           "nodir/x.csv", "", ".", "sub"]

TEXTS = ["", ",", ";;", "*", "?", "a?c*", "*x*", "x" * 300, "y" * 2000, "1,2,3",
         "-2147483648", "2147483647", "2147483648", "99999999999", " 42 ", "+7", "-0",
         "3.75", "1e3", "0x1F", '"q",""', "name", "score", "note", "Ann", "ann", "ANN",
         "\u00c4\u00d6\u00fc", "\udcc9T\udce9", "\udce9t\udce9", "a\tb", "line\r\nbreak", "[sec]", "k=v", "a;b;c",
         "a,\"b,c\",d", "\\"]
WORD_BYTES = 'abAB01 ,;*?="[]-'
LOADERS = {".arr": "loadFromFile", ".mmf": "loadFromHostArray", ".csv": "loadFromCsv",
           ".ini": "loadFromIni", ".bin": "appendFile"}


def catalog(path):
    """(kind, name, [(type, description)]) for each line of `quorrel list`."""
    entries = []
    for line in open(path, encoding="utf-8"):
        # A long entry's menu path goes on the next line.
        m = re.match(r"([AE])\d+ (\S+?)\((.*?)\)(?:  \[.*)?$", line.rstrip("\n"))
        if m:
            params = re.findall(r"(?:^|, )(text|number): ([^,]*)", m.group(3))
            entries.append((m.group(1), m.group(2), params))
    return entries


def quote(text):
    """The script's string syntax; lone surrogates stand for raw bytes."""
    escapes = {'"': '\\"', "\\": "\\\\", "\n": "\\n", "\r": "\\r", "\t": "\\t"}
    return '"' + "".join(escapes.get(chr(b)) or (chr(b) if 0x20 <= b < 0x7F else "\\x%02x" % b)
                         for b in text.encode("utf-8", "surrogateescape")) + '"'


def swapcase(text):
    """Other case in ASCII and in Latin-1 (raw bytes \\xc0..\\xfe, which Windows' own
    case folding would join): the module folds only A-Z, on every system."""
    def latin(c):
        letter = 0xDCC0 <= ord(c) <= 0xDCFE and ord(c) not in (0xDCD7, 0xDCF7)
        return chr(ord(c) ^ 0x20) if letter else c
    return "".join(latin(c) for c in text.swapcase())


class Script:
    def __init__(self, rng, seeds):
        self.rng, self.seeds, self.reads, self.written = rng, seeds, 0, []
        # A few texts recur through the script, so that finds, keys and labels hit.
        self.vocabulary = [self.fresh_text() for _ in range(4)]

    def index(self):
        r = self.rng.random()
        if r < 0.5:
            return self.rng.randrange(25)
        if r < 0.8:
            return self.rng.choice(EXTREMES)
        # Random but refused: negative, or at or past the cap.
        return self.rng.choice([self.rng.randint(INT32_MIN, -1), self.rng.randint(CAP, INT32_MAX)])

    def value(self):
        r = self.rng.random()
        return self.rng.randint(-100, 100) if r < 0.5 else self.index() if r < 0.8 else \
            self.rng.randint(INT32_MIN, INT32_MAX)

    def boundary(self):
        return self.rng.choice([-1, INT32_MIN, self.rng.randint(INT32_MIN, -1), 16] +
                               list(range(7)) * 2)

    def text(self):
        if self.rng.random() < 0.6:
            word = self.rng.choice(self.vocabulary)
            return swapcase(word) if self.rng.random() < 0.5 else word
        return self.fresh_text()

    def fresh_text(self):
        if self.rng.random() < 0.4:
            return "".join(self.rng.choice(WORD_BYTES) for _ in range(self.rng.randrange(9)))
        return self.rng.choice(TEXTS)

    def path(self, reads):
        # Often a file this script wrote, so that saves are read back and appended to.
        if self.written and self.rng.random() < 0.4:
            name = self.rng.choice(self.written)
        else:
            name = self.rng.choice(self.seeds + OUTPUTS if reads else OUTPUTS + self.seeds[:2])
        if reads:
            self.reads += 1
        elif name not in self.written:
            self.written.append(name)
        return name

    def argument(self, type_, description):
        if type_ == "text":
            if description.startswith("path of the file"):
                return quote(self.path(description.endswith("to read")))
            return quote(self.text())
        if "boundary" in description:
            return str(self.boundary())
        if "dimension" in description:
            return str(self.rng.choice([-1, 0, 1, 2, 3, 4, 12, INT32_MIN, INT32_MAX]))
        if re.search("value|number|not used", description):
            return str(self.value())
        return str(self.index())

    def new(self):
        fields = ["dims=%d" % self.rng.choice([-1, 0, 1, 2, 3, 4, INT32_MIN]),
                  "x=%d" % self.boundary(), "y=%d" % self.boundary(),
                  "case=%d" % self.rng.choice([0, 1, 2]), "wildcard=%d" % self.rng.choice([0, 1, 2]),
                  "autoselect=%d" % self.rng.choice([0, 1, 2]), "delimiter=" + quote(self.text()[:1023])]
        return "new " + " ".join(self.rng.sample(fields, self.rng.randrange(len(fields) + 1)))

    def call(self, entry):
        kind, name, params = entry
        reads = any(t == "text" and d.endswith("to read") for t, d in params)
        if reads and self.reads >= MAX_READS:
            return None
        args = [self.argument(t, d) for t, d in params]
        return " ".join([kind, name if kind == "A" else name + "("] + args)


def script(seed, k, entries, seeds):
    rng = random.Random("%d:%d" % (seed, k))
    s = Script(rng, seeds)
    lines = [s.new()] if rng.random() < 0.5 else []
    if rng.random() < 0.7:  # most scripts start from data
        name = rng.choice(seeds)
        lines.append("A %s %s" % (LOADERS[os.path.splitext(name)[1]], quote(name)))
        s.reads += 1
    length = rng.randint(10, 80)
    for i in range(rng.randrange(4)):  # a table whose labels and cells later calls look up
        lines.append("A setLabel %s %d" % (quote(rng.choice(s.vocabulary)), i))
        lines.append("A appendRowFromList " + quote(",".join(rng.sample(s.vocabulary, 3))))
    # Calls that add elements come twice as often, so that arrays are seldom empty.
    entries = entries + [e for e in entries if re.match("append|insert", e[1])]
    while len(lines) < length:
        line = s.new() if rng.random() < 0.03 else s.call(rng.choice(entries))
        if line:
            lines.append(line)
    return "\n".join(lines) + "\n"


def main():
    parser = argparse.ArgumentParser(description=__doc__.split("\n")[0])
    for name in ("catalog", "seeddir", "outdir"):
        parser.add_argument(name)
    parser.add_argument("--seed", type=int, default=1)
    parser.add_argument("--count", type=int, default=100)
    args = parser.parse_args()
    entries = catalog(args.catalog)
    if len(entries) < 100:
        raise SystemExit("%s: only %d actions and expressions" % (args.catalog, len(entries)))
    seeds = sorted(os.path.relpath(os.path.join(d, f), args.seeddir)
                   for d, _, files in os.walk(args.seeddir) for f in files)
    os.makedirs(args.outdir, exist_ok=True)
    for k in range(args.count):
        with open(os.path.join(args.outdir, "%d.qs" % k), "w", encoding="utf-8") as f:
            f.write(script(args.seed, k, entries, seeds))


if __name__ == "__main__":
    main()
