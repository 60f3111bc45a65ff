#!/usr/bin/python3 -B
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Makes the files installed beside the client from its own help: manual.py CLIENT page|completion.

Prints the manual page (section 1) or the completion for bash. CLIENT is the built client; it is
asked for its help and its list of methods, and calls nothing.
"""

import json
import os
import re
import subprocess
import sys

import explained
import script

NAME = "bex-wifi-client"


def ask(client, *arguments):
    """What the client prints. Outside of a phone its help names no chip family."""
    environment = {name: value for name, value in os.environ.items() if name != "HIDL_HOST_ROOT"}
    return subprocess.run([client, *arguments], env=environment, check=True, text=True,
                          stdout=subprocess.PIPE).stdout


def roff(text):
    """Text as a line of a manual page."""
    text = text.replace("\\", "\\e").replace("-", "\\-")
    return "\\&" + text if text[:1] in (".", "'") else text


def body(help_text):
    """Help as a manual page has it: a line that ends in a colon is a heading, two blanks in front
    make an entry of a table, and more of them go on with the one before."""
    lines = []
    for line in help_text.splitlines():
        entry = re.fullmatch(r"  (\S.*?)(?:  +(\S.*))?", line)
        if re.fullmatch(r"\S.*:", line):
            lines.append(f".SH {roff(line[:-1].upper())}")
        elif entry:
            lines += described(entry[1], [entry[2] or ""])
        elif line:
            lines.append(roff(line.strip()))
        elif lines[-1] != ".PP":
            lines.append(".PP")
    # A heading begins a paragraph by itself.
    return [line for line, following in zip(lines, [*lines[1:], ".SH"])
            if line != ".PP" or not following.startswith(".SH")]


def described(name, texts):
    return [".TP", f"\\fB{roff(name)}\\fR", *[roff(text) for text in texts if text]]


def method_lines(method):
    """A method of `list --json`, with its arguments and its result."""
    names = [argument["name"] for argument in method["arguments"]]
    lines = [f".SS {method['name']}", f"\\fB{roff(' '.join([method['name'], *names]))}\\fR",
             ".PP", roff(method["summary"])]
    for argument in method["arguments"]:
        unit = f"unit: {argument['unit']}" if argument["unit"] else ""
        facts = [fact for fact in (argument["meaning"], unit, argument["accepted"]) if fact]
        lines += described(argument["name"], ["; ".join(facts)])
    result = method["result"]
    return [*lines, *described(f"Result ({result['type']})", [result["meaning"]])]


def page(client):
    methods = json.loads(ask(client, "list", "--json"))["methods"]
    text = [f".TH {NAME.upper()} 1", ".SH NAME",
            f"{roff(NAME)} \\- calls the Wi\\-Fi radio test service", ".SH DESCRIPTION",
            *body(ask(client, "--help")), ".SH THE METHODS ONE BY ONE",
            *[line for method in methods for line in method_lines(method)]]
    return "\n".join([*text, ""])


COMPLETION = """\
# Completion for {name}, written from the client's own help.

_bex_wifi_client() {{
    local current=${{COMP_WORDS[COMP_CWORD]}} command="" place=0 candidates="" i
    for ((i = 1; i < COMP_CWORD; i++)); do
        case ${{COMP_WORDS[i]}} in
            --timeout) i=$((i + 1)) ;;
            --*) ;;
            *) if [ "$command" ]; then place=$((place + 1)); else command=${{COMP_WORDS[i]}}; fi ;;
        esac
    done
    COMPREPLY=()
    # Any number of seconds is possible: there is nothing to complete.
    [ "${{COMP_WORDS[COMP_CWORD - 1]}}" != --timeout ] || return 0
    case $command:$place in
        :0) candidates="{commands}" ;;
        help:0) candidates="{methods}" ;;
{cases}
    esac
    [[ $current != -* ]] || candidates="{options}"
    mapfile -t COMPREPLY < <(compgen -W "$candidates" -- "$current")
}}
complete -F _bex_wifi_client {name}
"""


def completion(client):
    usage = ask(client, "--help")
    methods = explained.read_methods(ask(client, "list", "--json"))
    subcommands = re.findall(rf"^  {NAME} ([a-z]+)\b", usage, re.M)
    options = re.findall(rf"^  (?:{NAME} )?(--[a-z-]+)", usage, re.M)
    names = " ".join(method.name for method in methods)
    cases = [f'        {method.name}:{place}) candidates="{" ".join(argument.choices())}" ;;'
             for method in methods for place, argument in enumerate(method.arguments)
             if argument.choices()]
    return COMPLETION.format(
        name=NAME, cases="\n".join(cases), options=" ".join(options),
        commands=" ".join([*subcommands, names]), methods=names)


def main():
    makers = {"page": page, "completion": completion}
    if len(sys.argv) != 3 or sys.argv[2] not in makers:
        sys.exit("usage: manual.py CLIENT page|completion")
    print(makers[sys.argv[2]](sys.argv[1]), end="")


if __name__ == "__main__":
    script.run(main)
