# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The command line: reads the arguments and calls the module that does the work.

Exit codes: 0 done, 1 failed (one line on stderr), 2 wrong usage. `run` gives the exit code of its
command, 128 + n when signal n ended it, and 125 when the phone could not be entered.

The modules are imported by the command that needs them: `run` stays quick.
"""

import os
import signal
import sys

from launcher.errors import PhoneError

USAGE = """\
usage: phone create CHIP DIR [--install SRC=DEST]...   build a phone in the new folder DIR
       phone up DIR [--adb [PORT]]                     boot it and start its service; --adb prints
             the serial number of the phone on adb
       phone down DIR                                  end everything that runs in it
       phone restart-service DIR                       kill the service and start it again
       phone run DIR COMMAND [ARG...]                  run a command in it, up or not
       phone fault DIR TOOL [--when PATTERN] ACTION... make a tool misbehave; ACTION is one of
             exit N | signal N | sleep SECONDS | wait | print FILE | missing
       phone fault DIR TOOL release                    let the tools at a wait go on
       phone fault DIR TOOL clear                      back to normal
CHIP is a name in simulator/phones, or the path (with a slash) of a description file.
"""


class UsageError(Exception):
    """Arguments that no command accepts."""


def main(arguments):
    commands = {
        "create": create,
        "up": up,
        "down": down,
        "restart-service": restart_service,
        "run": run,
        "fault": fault,
    }
    open_closed_streams()
    if arguments in (["--help"], ["-h"], ["help"]):
        print(USAGE, end="")
        return 0
    os.umask(0o022)
    signal.signal(signal.SIGCHLD, signal.SIG_DFL)  # ignored, it would take away the exit codes
    for number in (signal.SIGTERM, signal.SIGHUP):  # a command ended by them cleans up
        if signal.getsignal(number) != signal.SIG_IGN:
            signal.signal(number, signal.default_int_handler)
    name = arguments[0] if arguments else ""
    try:
        if name not in commands:
            raise UsageError
        return commands[name](arguments[1:])
    except UsageError:
        print(USAGE, end="", file=sys.stderr)
        return 2
    except (PhoneError, OSError) as error:
        if isinstance(error, OSError):
            error = f"{error.filename}: {error.strerror}" if error.filename else error.strerror
        print(f"phone: {error}", file=sys.stderr)
        return 125 if name == "run" else 1
    except KeyboardInterrupt:
        return 130


def open_closed_streams():
    """A closed standard stream becomes /dev/null: no file that is opened later takes its number."""
    while (stream := os.open(os.devnull, os.O_RDWR)) < 3:
        os.set_inheritable(stream, True)
    os.close(stream)
    if sys.stderr is None:
        sys.stderr = open(2, "w", encoding="utf-8")


def phone_folder(arguments):
    """The single argument of down and restart-service: an existing phone's folder."""
    if len(arguments) != 1:
        raise UsageError
    return checked_folder(arguments[0])


def checked_folder(folder):
    if not os.path.isdir(os.path.join(folder, "root", "phone")):
        raise PhoneError(f"{folder} is not a phone (phone create makes one)")
    if os.stat(os.path.join(folder, "root")).st_uid != os.geteuid():
        raise PhoneError(f"{folder} belongs to another user")
    return os.path.realpath(folder)


def create(arguments):
    from launcher import build

    positional, installs = [], []
    rest = iter(arguments)
    for argument in rest:
        if argument == "--install":
            argument = "--install=" + next(rest, "")
        if argument.startswith("--install="):
            installs.append(argument[len("--install="):])
        elif argument.startswith("-"):
            raise UsageError
        else:
            positional.append(argument)
    if len(positional) != 2:
        raise UsageError
    build.create(*positional, installs)
    return 0


def up(arguments):
    from launcher import power

    if "--adb" in arguments[1:]:
        return up_with_adb(arguments)
    power.up(phone_folder(arguments))
    return 0


def up_with_adb(arguments):
    from adb import control
    from launcher import power

    folder, option, *port = arguments
    if option != "--adb" or len(port) > 1:
        raise UsageError
    if port and not (port[0].isascii() and port[0].isdigit() and int(port[0]) < 65536):
        raise PhoneError(f"'{port[0]}' is no port: a number below 65536")
    folder = checked_folder(folder)
    if control.serial(folder):
        print(f"phone: {folder} is on adb already", file=sys.stderr)
        power.up(folder)
    else:
        control.start(folder, control.listen(int("".join(port) or 0)))
        try:
            power.up(folder)
        except BaseException:
            control.end(folder)
            raise
    print(control.serial(folder))
    return 0


def down(arguments):
    from adb import control
    from launcher import power

    folder = phone_folder(arguments)
    control.end(folder)
    power.down(folder)
    return 0


def restart_service(arguments):
    from launcher import power

    power.restart_service(phone_folder(arguments))
    return 0


def run(arguments):
    from launcher import process, sandbox

    if len(arguments) < 2:
        raise UsageError
    folder = checked_folder(arguments[0])
    return process.run(sandbox.chosen_kind(folder), folder, arguments[1:])


def fault(arguments):
    from launcher import faults

    if len(arguments) < 3:
        raise UsageError
    folder, tool, *actions = arguments
    faults.stage(checked_folder(folder), tool, actions)
    return 0
