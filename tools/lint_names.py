#!/usr/bin/env python3
"""lint_names.py FILE...: rules of names and headers that a compiler does not know. lint_names.py --share: the lines of the
tests for each line of the other code, without blanks and comments."""

import re
import subprocess
import sys

# An argument of a declaration: a type that is not alone, then its name, then a comma, a bracket or a default.
ARGUMENT = re.compile(
    r"[(,]\s*(?:const )?[A-Za-z_:][\w:<>]*(?: const)?(?:\s*[&*]+\s*|\s+)(\w+)(?=\s*(?:[,)]|= [\w{\"-]))"
)
# What stands in brackets and declares no argument.
NO_ARGUMENT = re.compile(r"^\s*(for|if|while|switch|catch|return|template|case|else|static_assert)\b|=.*\(|<=>|\s&\s|\bsizeof\b|\+=")


def code_of(i_Text):
    """The lines without comments, each at its number."""
    text = re.sub(r"/\*.*?\*/", lambda m: "\n" * m.group().count("\n"), i_Text, flags=re.S)
    return [re.sub(r"//.*", "", line) for line in text.split("\n")]


def findings(i_Path):
    with open(i_Path, encoding="utf-8") as file:
        lines = code_of(file.read())
    header = i_Path.endswith(".h")
    if header and next((line for line in lines if line.strip()), "") != "#pragma once":
        yield 1, "a header begins with #pragma once"
    for number, line in enumerate(lines, 1):
        if not header or not re.match(r"(src|host)/", i_Path):
            continue
        if re.match(r"using namespace\b", line):
            yield number, "no namespace is opened in a header"
        if NO_ARGUMENT.search(line):
            continue
        for argument in ARGUMENT.finditer(line):
            name = argument.group(1)
            if not re.match(r"(i|o|io)_|(const|noexcept|override)$|\d", name):
                yield number, f"an argument is called i_… or o_…: {name}"


def share():
    counts = {True: 0, False: 0}
    listed = subprocess.run(["git", "ls-files", "*.cpp", "*.h"], capture_output=True, text=True, check=True)
    for path in listed.stdout.split():
        if path.startswith(("benchmarks/", "fuzz/")):
            continue
        with open(path, encoding="utf-8") as file:
            counts[path.startswith("tests/")] += sum(1 for line in code_of(file.read()) if line.strip())
    print(f"{counts[True]} lines of tests for {counts[False]} of other code: {counts[True] / counts[False]:.3f}")


def main():
    if sys.argv[1:] == ["--share"]:
        return share()
    failed = False
    for path in sys.argv[1:]:
        for number, words in findings(path):
            print(f"{path}:{number}: {words}")
            failed = True
    return failed


sys.exit(main())
