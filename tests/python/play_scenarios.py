#!/usr/bin/env python3
"""Plays random calls against the package, and compares results, exceptions and messages with what is expected.

    play_scenarios.py WRITER

WRITER is the program that writes them (write_scenarios.cpp). Each scenario runs in a process of its own, since a process
has one manager. TARVIK_PROPERTY_CALLS sets the number of calls.
"""

import json
import os
import subprocess
import sys
import traceback

import tarvik

MANAGER_SOURCE = ("Tarvik", "../s/ConstraintsManager")
DATABASE_SOURCE = "host/database"
ANY_LINE = -1


def text_of(text):
    """A text of the package from one of the file, whose characters are bytes."""
    return None if text is None else text.encode("latin-1").decode("utf-8", "surrogateescape")


def bytes_of(text):
    return text.encode("utf-8", "surrogateescape").decode("latin-1")


def shown(value):
    """A result as the reference prints it."""
    if value is None:
        return "null"
    if isinstance(value, bool):
        return "true" if value else "false"
    if isinstance(value, int):
        return str(int(value))
    if isinstance(value, str):
        return '"' + bytes_of(value).replace("\n", "\\n").replace("\0", "\\0") + '"'
    if isinstance(value, frozenset):
        mask = sum(1 << element for element in value)
        return str(mask - (1 << 32) if mask >> 31 else mask)
    if isinstance(value, dict):
        return "{" + ", ".join(f"{shown(key)}: {shown(entry)}" for key, entry in value.items()) + "}"
    if isinstance(value, tuple):
        return "{" + ", ".join(map(shown, value)) + "}"
    raise TypeError(f"no result is {value!r}")


def operation_or_none(operation):
    """What C++ gives for an unknown operation is None here."""
    return 32 if operation is None else operation




CALLS = {
    "GET_CONSTRAINTS_MANAGER": lambda m: isinstance(tarvik.Manager(), tarvik.Manager),
    "SET_EXCEPTIONS": lambda m, on: m.set_exceptions(on),
    "GET_OPERATION_ORDERS": lambda m: m.get_operation_orders(),
    "GET_PROGRAM_OPTION_ORDERS": lambda m: m.get_program_option_orders(),
    "MODE_STRING_2_TYPE": lambda m, text: m.mode_string_to_type(text),
    "MODE_TYPE_2_STRING": lambda m, mode: m.mode_type_to_string(mode),
    "CABLE_STRING_2_TYPE": lambda m, text: m.cable_string_to_type(text),
    "CABLE_TYPE_2_STRING": lambda m, output: m.cable_type_to_string(output),
    "OPERATION_STRING_2_TYPE": lambda m, text: operation_or_none(m.operation_string_to_type(text)),
    "OPERATION_TYPE_2_STRING": lambda m, operation: m.operation_type_to_string(operation),
    "OPERATION_DISPLAY_STRING_2_TYPE": lambda m, text: operation_or_none(m.operation_display_string_to_type(text)),
    "OPERATION_TYPE_2_DISPLAY_STRING": lambda m, operation: m.operation_type_to_display_string(operation),
    "OPTION_STRING_2_TYPE": lambda m, text: m.option_string_to_type(text),
    "OPTION_TYPE_2_STRING": lambda m, option: m.option_type_to_string(option),
    "REMOVE_PACKAGE_NAME": lambda m, device: m.remove_package_name(device),
    "CHECK_OUTPUT": lambda m, mode, output: m.check_constraints(mode=mode, output=output),
    "CHECK_DEVICE": lambda m, mode, device, package: m.check_constraints(
        mode=mode, device=device or "", package=package
    ),
    "CHECK_OUTPUT_AND_DEVICE": lambda m, mode, output, device, package: m.check_constraints(
        mode=mode, output=output, device=device or "", package=package
    ),
    "CHECK_OPERATION": lambda m, mode, output, device, operation, family: m.check_constraints(
        mode=mode, output=output, device=device or "", operation=operation
    ),
    "CHECK_OPERATION_PROPERTY": lambda m, device, mode, operation, family: m.check_constraints(
        device=device or "", mode=mode, operation=operation
    ),
    "GET_DEVICE_OPERATIONS": lambda m, *arguments: m.get_device_operations(*arguments),
    "GET_PROGRAM_OPTIONS": lambda m, *arguments: m.get_program_options(*arguments),
    "GET_BSDL_OPERATIONS": lambda m, *arguments: m.get_bsdl_operations(*arguments),
    "GET_DEVICE_OPERATION_OPTIONS": lambda m, *arguments: m.get_device_operation_options(*arguments),
    "GET_DEVICE_STRING_PROPERTIES": lambda m, *arguments: m.get_device_string_properties(*arguments),
    "GET_DEVICE_STRING_PROPERTY": lambda m, *arguments: m.get_device_string_property(*arguments),
    "GET_DEVICE_BOOL_PROPERTY": lambda m, *arguments: m.get_device_bool_property(*arguments),
    "GET_DEVICE_LONG_PROPERTY": lambda m, *arguments: m.get_device_long_property(*arguments),
    "GET_PART_FAMILY": lambda m, *arguments: m.get_part_family(*arguments),
    "ADD_CACHED_DEVICE_FAMILY": lambda m, *arguments: m.add_cached_device_family(*arguments),
    "IS_KORVEL_DEVICE": lambda m, *arguments: m.is_korvel_device(*arguments),
    "GET_ALL_DEVICE_IDCODES": lambda m: m.get_all_device_idcodes(),
    "IS_SPI_DEVICE": lambda m, *arguments: m.is_spi_device(*arguments),
    "GET_SPI_DEVICE_STRING_PROPERTY": lambda m, *arguments: m.get_spi_device_string_property(*arguments),
    "GET_SPI_DEVICE_BOOL_PROPERTY": lambda m, *arguments: m.get_spi_device_bool_property(*arguments),
    "GET_SPI_DEVICE_LONG_PROPERTY": lambda m, *arguments: m.get_spi_device_long_property(*arguments),
    "IS_MB_BPI_SPI_SUPPORT": lambda m, *arguments: m.is_mb_bpi_spi_support(*arguments),
    "DUMP_OPERATIONS_TABLE": lambda m, recorder: m.dump_operations_table(as_messages=not recorder),
    "DUMP_BSDL_OPERATIONS_TABLE": lambda m, recorder: m.dump_bsdl_operations_table(as_messages=not recorder),
    "DUMP_PROGRAM_OPTIONS_TABLE": lambda m, recorder: m.dump_program_options_table(as_messages=not recorder),
    "DUMP_CACHED_DEVICE_FAMILIES": lambda m, recorder: m.dump_cached_device_families(as_messages=not recorder),
    "DUMP_MB_BPI_SPI": lambda m: m.dump_mb_bpi_spi(),
}
WITHOUT_RESULT = {"SET_EXCEPTIONS", "ADD_CACHED_DEVICE_FAMILY", "DUMP_MB_BPI_SPI"}


def outcome(manager, call):
    arguments = [text_of(a) if isinstance(a, str) else a for a in call["arguments"]]
    try:
        result = CALLS[call["method"]](manager, *arguments)
    except tarvik.TarvikException as error:
        text = f"{type(error).__name__} {error.line}"
        if (error.product, error.source) != MANAGER_SOURCE:
            text += f" from {error.product} {error.source}"
        return text
    return "" if call["method"] in WITHOUT_RESULT else shown(result)


def matches(expected, actual):
    channel, line, text = expected
    return (
        channel == actual[0]
        and line in (ANY_LINE, actual[1])
        and (text is None or text == actual[2])
    )


def agree(expected, actual):
    return len(expected) == len(actual) and all(map(matches, expected, actual))


def play(scenario):
    """Plays one scenario, and prints the first difference.

    Returns whether there was none."""
    messages = []

    def receive(message):
        if message.source != DATABASE_SOURCE:
            origin = (message.product, message.source)
            debug = message.channel == tarvik.Channel.DEBUG
            suffix = "" if debug or origin == MANAGER_SOURCE else f" from {origin}"
            messages.append((int(message.channel), message.line, bytes_of(message.text) + suffix))

    tarvik.set_message_callback(receive)
    files = {name: text.encode("latin-1") for name, text in scenario["files"].items()}
    manager = tarvik.Manager(memory_files=files)
    if not agree(scenario["start"], messages):
        print(f"the start-up\n  expected {scenario['start']}\n  got      {messages}")
        return False
    for call in scenario["calls"]:
        messages.clear()
        result = outcome(manager, call)
        if result != call["result"] or not agree(call["messages"], messages):
            print(f"{call['method']} {call['arguments']}")
            print(f"  expected {call['result']} {call['messages']}")
            print(f"  got      {result} {messages}")
            return False
    return True


def play_in_process(line):
    process = os.fork()
    if process == 0:
        status = 2
        try:
            status = 0 if play(json.loads(line)) else 1
        except BaseException:  # the parent must not go on twice
            traceback.print_exc()
        finally:
            sys.stdout.flush()
            os._exit(status)
    return os.waitstatus_to_exitcode(os.waitpid(process, 0)[1])


def main():
    wanted = int(os.environ.get("TARVIK_PROPERTY_CALLS", "100000"))
    played = 0
    with subprocess.Popen([sys.argv[1], str(wanted)], stdout=subprocess.PIPE) as writer:
        for number, line in enumerate(writer.stdout):
            if play_in_process(line) != 0:
                writer.kill()
                sys.exit(f"scenario {number} differs")
            played += len(json.loads(line)["calls"])
    if writer.returncode != 0 or played < wanted:
        sys.exit(f"only {played} calls were played")
    print(f"{played} calls agree")


if __name__ == "__main__":
    main()
