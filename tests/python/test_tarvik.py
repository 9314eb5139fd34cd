#!/usr/bin/env python3
"""Tests of the package. Each runs in a process of its own, since a process has one manager."""

import contextlib
import io
import itertools
import logging
import os
import pathlib
import pickle
import shutil
import subprocess
import sys
import tempfile
import threading
import traceback
import unittest
import unittest.mock

import tarvik
from tarvik import Channel, Mode, Operation, Option, Output

DATABASE = {
    "base.acd": "DEVICE_SUPPORTED = finch,spi\n"
    "PROGRAM_OPTION_PACKAGE = finch\n"
    "BS = outputs,PARALLEL,USB2:families,finch\n"
    "NOT_SUPPORTED_PART_IN_MODE = BS_FN10_PQ\n"
    "IDCODE = FN10,0x0010\n",
    "finch.acd": b"OPERATION = PROGRAM,Bscan,USB2:EXPRESSQSVF,Bscan,USB2\n"
    b"PROGRAM_OPTION = ERASE,Bscan,USB2\n"
    b"PROPERTY = EMPTY,:PINS,44:PROGRAM,BS\n"
    b"PROPERTIES = VENDOR,2,Korvel,A\xff\xc3\xa9\n[FN10]\n",
    "spi.acd": "DEVICE_FAMILY = NV\nNV_DEVICES = FLA\nFLA_PROPERTY = SIZE,16:ERASABLE,TRUE\n"
    "TYPE_MB_SPI_NONE_LEAD = FLA\n",
}
DAMAGED = dict(DATABASE, **{"swift.acd": "OPERATION = PROGRAM\n[SW10]\n"})
DAMAGED["base.acd"] = DATABASE["base.acd"].replace("finch,spi", "finch,spi,swift")
PACKAGE = pathlib.Path(tarvik.__file__).parent


class InProcess(unittest.TestCase):
    """Runs each test in a copy of this process, whose set-up remains with this one."""

    def setUp(self):
        tarvik.set_message_callback(None)

    def run(self, result=None):
        test = getattr(self, self._testMethodName)

        def forked():
            reading, writing = os.pipe()
            process = os.fork()
            if process == 0:
                failure = b""
                try:
                    test()
                except BaseException:
                    failure = traceback.format_exc().encode("utf-8", "replace")
                finally:
                    os.write(writing, failure[-60000:])
                    os._exit(0 if not failure else 1)
            os.close(writing)
            with os.fdopen(reading, "rb") as pipe:
                failure = pipe.read().decode("utf-8")
            status = os.waitstatus_to_exitcode(os.waitpid(process, 0)[1])
            if status != 0:
                self.fail(failure or f"the process ended with {status}")

        setattr(self, self._testMethodName, forked)
        return super().run(result)


def python(code, **environment):
    """Runs a program of its own."""
    return subprocess.run(
        [sys.executable, "-c", code], env=dict(os.environ, **environment), capture_output=True, text=True, check=False
    )


class Loading(InProcess):
    def test_names_every_place_that_was_tried(self):
        with tempfile.TemporaryDirectory() as directory:
            shutil.copytree(PACKAGE, f"{directory}/tarvik", ignore=shutil.ignore_patterns("lib", "__pycache__"))
            result = python("import tarvik", PYTHONPATH=directory, TARVIK_LIBRARY="", LD_LIBRARY_PATH="")
        self.assertIn("LibraryNotFoundError", result.stderr)
        self.assertIn(f"{directory}/tarvik/lib/libtarvik.so.1: ", result.stderr)
        self.assertIn("\n  libtarvik.so.1: ", result.stderr)
        self.assertIn("TARVIK_LIBRARY", result.stderr)

    def test_takes_the_file_that_is_named_and_no_other(self):
        result = python("import tarvik", TARVIK_LIBRARY="/nowhere/libtarvik.so")
        self.assertIn("/nowhere/libtarvik.so: ", result.stderr)
        self.assertNotIn(str(PACKAGE / "lib"), result.stderr)
        named = PACKAGE / "lib" / "libtarvik.so.1"
        with tempfile.TemporaryDirectory() as directory:
            shutil.copytree(PACKAGE, f"{directory}/tarvik", ignore=shutil.ignore_patterns("lib", "__pycache__"))
            result = python("import tarvik; print(tarvik.version())", PYTHONPATH=directory, TARVIK_LIBRARY=str(named))
        self.assertEqual(result.stdout, tarvik.version() + "\n", result.stderr)

    def test_finds_it_in_the_path_of_the_loader(self):
        with tempfile.TemporaryDirectory() as directory:
            shutil.copytree(PACKAGE, f"{directory}/tarvik", ignore=shutil.ignore_patterns("lib", "__pycache__"))
            result = python(
                "import tarvik; print(tarvik.version())",
                PYTHONPATH=directory, TARVIK_LIBRARY="", LD_LIBRARY_PATH=str(PACKAGE / "lib"),
            )
        self.assertEqual(result.stdout, tarvik.version() + "\n", result.stderr)

    def test_refuses_another_library_and_another_version(self):
        result = python("import tarvik", TARVIK_LIBRARY="libc.so.6")
        self.assertIn("libc.so.6: ", result.stderr)
        self.assertIn("LibraryNotFoundError", result.stderr)
        with unittest.mock.patch("tarvik._library.MAJOR_VERSION", 2):
            with self.assertRaisesRegex(tarvik.LibraryNotFoundError, r"has version \S+, but version 2 is needed"):
                tarvik._library._load()

    def test_the_demonstration_is_beside_the_package(self):
        self.assertTrue((tarvik.demonstration() / "base.acd").is_file())

    def test_a_missing_demonstration_is_said(self):
        with unittest.mock.patch("pathlib.Path.is_dir", return_value=False):
            with self.assertRaisesRegex(FileNotFoundError, "share/tarvik"):
                tarvik.demonstration()


class Databases(InProcess):
    def test_importing_makes_no_manager(self):
        result = python("import tarvik", TARVIK_DATABASE="/nowhere")
        self.assertEqual((result.returncode, result.stdout, result.stderr), (0, "", ""))

    def test_a_second_manager_is_the_same_one(self):
        first = tarvik.Manager(memory_files=DATABASE)
        first.add_cached_device_family("other", "finch")
        self.assertEqual(tarvik.Manager().get_part_family("other"), "finch")
        self.assertEqual(tarvik.Manager(memory_files=dict(DATABASE)).get_part_family("other"), "finch")

    def test_a_second_database_is_refused(self):
        tarvik.Manager(memory_files=DATABASE)
        for other in ({"directories": "/nowhere"}, {"memory_files": {}}, {"memory_files": DAMAGED}):
            with self.assertRaisesRegex(tarvik.StateError, "use a process for each"):
                tarvik.Manager(**other)

    def test_directories_and_files_exclude_each_other(self):
        with self.assertRaises(TypeError):
            tarvik.Manager("/nowhere", memory_files={})
        self.assertEqual(tarvik.Manager(memory_files=DATABASE).get_part_family("FN10"), "finch")

    def test_the_first_directory_is_on_top(self):
        with tempfile.TemporaryDirectory() as top, tempfile.TemporaryDirectory() as bottom:
            for name, text in DATABASE.items():
                pathlib.Path(bottom, name).write_bytes(text if isinstance(text, bytes) else text.encode())
            pathlib.Path(top, "finch.acd").write_text("[FN10]\nPROPERTY = PINS,84\n")
            manager = tarvik.Manager([pathlib.Path(top), bottom])
            self.assertEqual(manager.get_device_long_property("FN10", "PINS"), 84)
            self.assertEqual(manager.get_all_device_idcodes(), {"FN10": "0x0010"})

    def test_one_directory_needs_no_list(self):
        self.assertEqual(tarvik.Manager(str(tarvik.demonstration())).get_part_family("KS50"), "kestrel")

    def test_without_a_database_there_is_a_message_and_nothing_known(self):
        messages = []
        tarvik.set_message_callback(messages.append)
        manager = tarvik.Manager("/nowhere")
        self.assertIn("/nowhere", "".join(message.text for message in messages))
        self.assertEqual(manager.get_all_device_idcodes(), {})
        self.assertEqual(manager.get_operation_orders(), ())

    def test_wrong_directories_are_refused(self):
        for wrong in (5, [5], object()):
            with self.assertRaises(TypeError):
                tarvik.Manager(wrong)
        with self.assertRaises(ValueError):
            tarvik.Manager("a\0b")

    def test_the_environment_decides_otherwise(self):
        result = python(
            "import tarvik; print(tarvik.Manager().get_part_family('KS50'))",
            TARVIK_DATABASE=str(tarvik.demonstration()),
        )
        self.assertEqual(result.stdout, "kestrel\n", result.stderr)

    def test_a_removed_manager_answers_nothing(self):
        manager = tarvik.Manager(memory_files=DATABASE)
        operations = manager.get_device_operations("FN10", Mode.BS, Output.USB2)
        vendors = manager.get_device_string_properties("FN10", "VENDOR")
        manager.remove_constraints_manager()
        for call in (
            lambda: manager.get_part_family("FN10"),
            lambda: manager.set_exceptions(False),
            manager.dump_mb_bpi_spi,
            manager.remove_constraints_manager,
            tarvik.Manager,
        ):
            with self.assertRaisesRegex(tarvik.StateError, "was removed"):
                call()
        # Results are the caller's.
        self.assertEqual(operations, {Operation.PROGRAM, Operation.EXPRESSQSVF})
        self.assertEqual(vendors, ("A\udcff\u00e9", "Korvel"))
        self.assertEqual(mode_named("SS"), Mode.SS)


def mode_named(text):
    return tarvik.Manager.mode_string_to_type(text)


class Answers(InProcess):
    def setUp(self):
        self.messages = []
        tarvik.set_message_callback(lambda message: self.messages.append(message.text))

    def manager(self):
        return tarvik.Manager(memory_files=DATABASE)

    def test_masks_are_sets_of_enumerators(self):
        operations = self.manager().get_device_operations("FN10", Mode.BS, Output.USB2)
        self.assertIsInstance(operations, frozenset)
        self.assertEqual(operations, {Operation.PROGRAM, Operation.EXPRESSQSVF})
        self.assertTrue(all(isinstance(operation, Operation) for operation in operations))
        self.assertEqual(self.manager().get_program_options("FN10", Mode.BS, Output.USB2), {Option.ERASE})
        self.assertEqual(self.manager().get_bsdl_operations("FN10", Output.USB2), frozenset())

    def test_each_check_has_its_arguments(self):
        manager = self.manager()
        check = manager.check_constraints
        self.assertIs(check(mode=Mode.BS, output=Output.USB2), True)
        self.assertIs(check(mode=Mode.BS, device="FN10"), True)
        self.assertIs(check(mode=Mode.BS, device="FN10", package="PQ"), False)
        self.assertIs(check(mode=Mode.BS, output=Output.SVF, device="FN10"), False)
        self.assertIs(check(mode=Mode.BS, output=Output.USB2, device="FN10", package="PQ"), False)
        self.assertIs(check(mode=Mode.BS, output=Output.USB2, device="FN10", operation=Operation.PROGRAM), True)
        self.assertIs(check(mode=Mode.BS, device="FN10", operation=Operation.PROGRAM), True)
        self.assertIs(check(mode=Mode.BS, device="FN10", operation=Operation.VERIFY), False)
        self.assertEqual(self.messages[0], "FN10_PQ is not supported in Boundary Scan mode\n")

    def test_other_combinations_are_refused(self):
        check = self.manager().check_constraints
        given = {"output": Output.USB2, "device": "FN10", "package": "PQ", "operation": Operation.PROGRAM}
        valid = [{"output"}, {"device"}, {"device", "package"}, {"output", "device"},
                 {"output", "device", "package"}, {"output", "device", "operation"}, {"device", "operation"}]
        for count in range(len(given) + 1):
            for names in itertools.combinations(given, count):
                arguments = {name: given[name] for name in names}
                if set(names) in valid:
                    self.assertIsInstance(check(mode=Mode.BS, **arguments), bool)
                else:
                    with self.assertRaises(TypeError, msg=names):
                        check(mode=Mode.BS, **arguments)
        with self.assertRaises(TypeError):
            check(output=Output.USB2)
        with self.assertRaises(TypeError):
            check(Mode.BS, Output.USB2)

    def test_exceptions_have_a_line_and_a_cause(self):
        with self.assertRaises(tarvik.DataNotFoundException) as caught:
            self.manager().get_device_string_property("FN10", "NONE")
        error = caught.exception
        self.assertEqual((error.line, error.product, error.source), (437, "Tarvik", "../s/ConstraintsManager"))
        self.assertTrue(error.cause.startswith("DataNotFoundException"))
        self.assertEqual(str(error), error.cause)
        self.assertIsInstance(error, tarvik.LogicException)
        self.assertIsInstance(error, tarvik.TarvikException)
        copy = pickle.loads(pickle.dumps(error))
        self.assertEqual((type(copy), copy.args, copy.line), (type(error), error.args, 437))

    def test_each_exception_has_its_class(self):
        manager = tarvik.Manager(memory_files=DAMAGED)
        with self.assertRaises(tarvik.DataMismatchException) as caught:
            manager.get_device_operations("SW10", Mode.BS, Output.USB2)
        self.assertIn("swift.acd:1:", str(caught.exception))  # where the record is
        with self.assertRaises(tarvik.OutOfRangeException) as caught:
            manager.get_device_operations("nobody", Mode.BS, Output.USB2)
        self.assertEqual(caught.exception.line, 2024)
        with self.assertRaises(tarvik.DataMismatchException) as caught:
            manager.option_type_to_string(24)
        self.assertEqual(caught.exception.line, 1413)

    def test_exceptions_are_off_in_a_block(self):
        manager = self.manager()
        with manager.exceptions(False):
            self.assertIsNone(manager.get_device_string_property("FN10", "NONE"))
            self.assertEqual(manager.get_device_long_property("FN10", "NONE"), -1)
            with manager.exceptions(True):
                with self.assertRaises(tarvik.DataNotFoundException):
                    manager.get_device_string_property("FN10", "NONE")
            self.assertIsNone(manager.get_device_string_property("FN10", "NONE"))
        with self.assertRaises(tarvik.DataNotFoundException):
            manager.get_device_string_property("FN10", "NONE")
        with contextlib.suppress(ZeroDivisionError):
            with manager.exceptions(False):
                raise ZeroDivisionError
        with self.assertRaises(tarvik.DataNotFoundException):
            manager.get_device_string_property("FN10", "NONE")
        manager.set_exceptions(False)
        with manager.exceptions(True):
            pass
        self.assertIsNone(manager.get_device_string_property("FN10", "NONE"))

    def test_bytes_over_127_come_and_go(self):
        manager = self.manager()
        strange = "A\udcff\u00e9"
        self.assertEqual(manager.get_device_string_property("FN10", "VENDOR"), strange)
        self.assertFalse(manager.check_constraints(mode=Mode.BS, device=strange))
        self.assertEqual(self.messages[-1], strange + " is not supported in Boundary Scan mode\n")
        with self.assertRaises(UnicodeEncodeError):
            manager.get_part_family("\ud800")

    def test_wrong_arguments_are_refused(self):
        manager = self.manager()
        for wrong in (5, b"FN10", object(), ["FN10"]):
            with self.assertRaises(TypeError):
                manager.get_part_family(wrong)
        with self.assertRaises(ValueError):
            manager.get_part_family("FN10\0_PQ")
        for wrong in ("BS", 1.0, None, object()):
            with self.assertRaises(TypeError):
                manager.get_device_operations("FN10", wrong, Output.USB2)
        for wrong in (1 << 31, -(1 << 31) - 1, 1 << 32, 1 << 200):
            with self.assertRaises(OverflowError):
                manager.get_device_operations("FN10", wrong, Output.USB2)
            with self.assertRaises(OverflowError):
                manager.mode_type_to_string(wrong)
        self.assertEqual(manager.get_device_operations("FN10", (1 << 31) - 1, Output.USB2), frozenset())

    def test_huge_and_empty_texts_are_names(self):
        manager = self.manager()
        for name in ("x" * (1 << 20), "", None, "%n%s", "../base"):
            self.assertEqual(manager.get_part_family(name), "base")
            self.assertFalse(manager.is_spi_device(name))
            self.assertEqual(manager.get_spi_device_string_property(name, name), "")
        self.assertEqual(manager.remove_package_name("x" * 100_000 + "_PQ"), "x" * 100_000)

    def test_an_unknown_operation_is_none(self):
        self.assertIsNone(tarvik.Manager.operation_string_to_type("nothing"))
        self.assertIsNone(tarvik.Manager.operation_display_string_to_type("nothing"))
        self.assertEqual(self.messages, ["Operation nothing is not defined.\n"] * 2)
        self.assertIs(tarvik.Manager.operation_string_to_type("verify"), Operation.VERIFY)

    def test_dumps_are_texts_or_messages(self):
        manager = self.manager()
        manager.get_device_operations("FN10", Mode.BS, Output.USB2)
        for dump in (manager.dump_operations_table, manager.dump_cached_device_families):
            table = dump()
            self.assertIn("finch", table)
            self.assertEqual(self.messages, [])
            self.assertEqual(dump(as_messages=True), "")
            self.assertEqual("".join(self.messages), table)
            self.messages.clear()

    def test_multiboot_and_flash(self):
        manager = self.manager()
        self.assertTrue(manager.is_mb_bpi_spi_support("fla", "TYPE_MB_SPI", "NONE", True))
        self.assertFalse(manager.is_mb_bpi_spi_support("fla", "TYPE_MB_SPI", "NONE", False))
        self.assertTrue(manager.is_spi_device("fla"))
        self.assertEqual(manager.get_spi_device_long_property("fla", "size"), 16)
        self.assertTrue(manager.get_spi_device_bool_property("fla", "erasable"))

    def test_threads_take_turns(self):
        manager = self.manager()
        wrong = []

        def ask():
            for _ in range(500):
                answers = (
                    manager.get_device_operations("FN10", Mode.BS, Output.USB2),
                    manager.check_constraints(mode=Mode.BS, output=Output.SVF),
                    manager.get_device_string_property("FN10", "PINS"),
                )
                if answers != ({Operation.PROGRAM, Operation.EXPRESSQSVF}, False, "44"):
                    wrong.append(answers)

        before = sys.getswitchinterval()
        sys.setswitchinterval(1e-6)
        threads = [threading.Thread(target=ask) for _ in range(4)]
        for thread in threads:
            thread.start()
        for thread in threads:
            thread.join()
        sys.setswitchinterval(before)
        self.assertEqual(wrong, [])
        self.assertEqual(len(self.messages), 4 * 500)


class Messages(InProcess):
    def refuse(self):
        return tarvik.Manager(memory_files=DATABASE).check_constraints(mode=Mode.BS, output=Output.SVF)

    def test_go_to_logging(self):
        with self.assertLogs("tarvik", logging.INFO) as logs:
            self.assertFalse(self.refuse())
        self.assertEqual(logs.output, ["INFO:tarvik:SVF is not supported in Boundary Scan mode"])
        message = logs.records[0].tarvik
        self.assertEqual((message.channel, message.product), (Channel.INFO, "Tarvik"))
        with self.assertLogs("tarvik", logging.DEBUG) as logs:
            tarvik.Manager().get_bsdl_operations("FN10", 10)
        self.assertEqual(logs.records[0].levelno, logging.DEBUG)

    def test_percent_signs_are_no_formats(self):
        with self.assertLogs("tarvik", logging.INFO) as logs:
            tarvik.Manager.operation_string_to_type("%s%d")
        self.assertEqual(logs.output, ["INFO:tarvik:Operation %s%d is not defined."])

    def test_nothing_is_printed_by_default(self):
        result = python("import tarvik; tarvik.Manager.operation_string_to_type('nothing')")
        self.assertEqual((result.returncode, result.stdout, result.stderr), (0, "", ""))

    def test_the_callback_has_all_parts(self):
        messages = []
        tarvik.set_message_callback(messages.append)
        self.refuse()
        (message,) = messages
        self.assertIsInstance(message, tarvik.Message)
        self.assertEqual(
            (message.channel, message.text, message.product, message.source),
            (Channel.INFO, "SVF is not supported in Boundary Scan mode\n", "Tarvik", "../s/ConstraintsManager"),
        )
        self.assertGreater(message.line, 0)

    def test_what_a_callback_raises_is_raised_by_the_call(self):
        manager = tarvik.Manager(memory_files=DATABASE)
        for kind in (ZeroDivisionError, KeyboardInterrupt, SystemExit):
            def fail(message):
                raise kind("full")

            tarvik.set_message_callback(fail)
            with self.assertRaises(kind):
                self.refuse()
            self.assertTrue(manager.check_constraints(mode=Mode.BS, output=Output.USB2))

    def test_a_failure_is_the_cause_of_what_the_callback_raised(self):
        manager = tarvik.Manager(memory_files=DATABASE)

        def fail(message):
            raise ZeroDivisionError

        tarvik.set_message_callback(fail)
        with self.assertRaises(ZeroDivisionError) as caught:
            manager.get_device_string_property("FN10", "NONE")
        self.assertIsInstance(caught.exception.__cause__, tarvik.DataNotFoundException)

    def test_the_manager_cannot_be_used_in_a_callback(self):
        manager = tarvik.Manager(memory_files=DATABASE)
        tarvik.set_message_callback(lambda message: manager.get_part_family("FN10"))
        with self.assertRaisesRegex(tarvik.StateError, "callback"):
            self.refuse()
        tarvik.set_message_callback(lambda message: self.assertEqual(mode_named("SM"), Mode.SM))
        self.assertFalse(self.refuse())

    def test_none_restores_logging(self):
        tarvik.set_message_callback(lambda message: self.fail())
        tarvik.set_message_callback(None)
        with self.assertLogs("tarvik", logging.INFO):
            self.refuse()
        with self.assertRaises(TypeError):
            tarvik.set_message_callback(5)

    def test_the_end_of_the_interpreter_is_the_end_of_messages(self):
        result = python(
            "import atexit, ctypes\n"
            "@atexit.register\n"  # runs after what the package registered
            "def late():\n"
            "    library.tarvik_operation_string_to_type(b'late', ctypes.byref(ctypes.c_int()))\n"
            "import tarvik\n"
            "library = tarvik._library.library\n"
            "tarvik.set_message_callback(print)\n"
        )
        self.assertEqual((result.returncode, result.stdout), (0, ""), result.stderr)
        self.assertEqual(result.stderr, "Operation late is not defined.\n")


class Enumerations(InProcess):
    def test_are_those_of_the_library(self):
        generator = pathlib.Path(__file__).resolve().parents[2] / "python" / "generate_enumerations.py"
        library = os.environ.get("TARVIK_LIBRARY") or str(PACKAGE / "lib" / "libtarvik.so.1")
        result = subprocess.run([sys.executable, generator, library], capture_output=True, text=True, check=True)
        self.assertEqual(result.stdout, (PACKAGE / "_enumerations.py").read_text(encoding="utf-8"))

    def test_have_the_names_that_the_manager_gives(self):
        convert = tarvik.Manager
        for enumeration, to_string in (
            (Mode, convert.mode_type_to_string),
            (Output, convert.cable_type_to_string),
            (Operation, convert.operation_type_to_string),
            (Option, convert.option_type_to_string),
        ):
            self.assertEqual([to_string(value) for value in enumeration], [value.name for value in enumeration])


class Help(InProcess):
    def test_reads_well(self):
        text = io.StringIO()
        with contextlib.redirect_stdout(text):
            help(tarvik.Manager)
        shown = text.getvalue()
        self.assertIn("There is only one", shown)
        self.assertIn("get_device_operations(self, device: str, mode: int, output: int)", shown)
        self.assertNotIn("ctypes", shown)

    def test_every_public_name_is_described(self):
        for name in tarvik.__all__:
            self.assertTrue(getattr(tarvik, name).__doc__, name)
        for name, member in vars(tarvik.Manager).items():
            if not name.startswith("_"):
                self.assertTrue(getattr(tarvik.Manager, name).__doc__, name)


if __name__ == "__main__":
    unittest.main()
