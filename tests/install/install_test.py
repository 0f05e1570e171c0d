"""Installs the build into separate folders and runs it there; compares man pages and completions with --help."""
import os
import pathlib
import re
import struct
import subprocess
import sys
import tempfile
import unittest

SOURCE, BUILD = pathlib.Path(sys.argv[1]), pathlib.Path(sys.argv[2])
CMAKE = sys.argv[3]
PROGRAMS = ("kestrum-terminal", "kestrum-decode", "voxd")


def output(*command, **more):
    return subprocess.run(command, stdout=subprocess.PIPE, check=True, encoding="utf-8", **more).stdout


def help_of(program):
    return output(BUILD / "bin" / program, "--help")


def options_of(program):
    lines = [line for line in help_of(program).splitlines() if re.match(r" +-", line)]
    return set(re.findall(r"(?<![\w-])--?[a-z][a-z-]*", "\n".join(lines)))


def text(*path):
    return SOURCE.joinpath(*path).read_text(encoding="utf-8")


class Documents(unittest.TestCase):
    """A new option, scenario or variable must be found in them; one that is gone must not."""

    def test_man_pages_have_the_programs_options(self):
        for program in PROGRAMS:
            with self.subTest(program):
                page = text("docs", "man", program + ".1")
                described = {
                    "-" + name for line in re.findall(r"^\.It Fl .*", page, re.M) for name in re.findall(r"Fl (\S+)", line)
                }
                self.assertEqual(described, options_of(program))
                self.assertLessEqual({"-" + name for name in re.findall(r"Fl (-\S+)", page)}, options_of(program))

    def test_man_pages_have_the_exit_status_of_wrong_usage(self):
        for program in PROGRAMS:
            with self.subTest(program):
                run = subprocess.run([BUILD / "bin" / program, "--no-such-option"], capture_output=True, check=False)
                self.assertRegex(text("docs", "man", program + ".1"), rf"(?m)^\.It {run.returncode}$")

    def test_man_pages_have_every_variable_that_is_read(self):
        pages = "".join(page.read_text(encoding="utf-8") for page in SOURCE.glob("docs/man/*"))
        for folder in ("platform", "frontends", "tools", "voxd", "apps"):
            for file in (SOURCE / folder).rglob("*.cpp"):
                for name in re.findall(r'"(KESTRUM_[A-Z_]+)"', file.read_text(encoding="utf-8")):
                    with self.subTest(name):
                        self.assertIn(name, pages)

    def test_shells_complete_the_programs_options(self):
        for program in PROGRAMS:
            with self.subTest(program):
                options = options_of(program)
                self.assertEqual(set(completions(program, "-")), options)
                zsh = text("resources", "completions", "_" + program)
                self.assertEqual(set(re.findall(r"[')}{,](--?[a-z-]+)(?=[\[,}])", zsh)), options)
                fish = text("resources", "completions", program + ".fish")
                self.assertEqual(
                    {"-" + name for name in re.findall(r" -s (\w)", fish)}
                    | {"--" + name for name in re.findall(r" -l ([\w-]+)", fish)},
                    options,
                )

    def test_values_are_those_of_the_programs(self):
        decode = help_of("kestrum-decode")
        technologies, formats = (set(re.search(rf"--{name} .*?{{(.*?)}}", decode)[1].split(","))
                                 for name in ("technology", "format"))
        scenarios, faults = (set(re.findall(r"^ {8,}([a-z0-9-]+): ", help_of("voxd").split(f"\n  {option} ")[1]
                                            .split("\n  -")[0], re.M)) for option in ("--scenario", "--fault"))
        self.assertIn("lte", scenarios)
        self.assertIn("flood", faults)
        for program, option, values in (("voxd", "--scenario", scenarios), ("voxd", "--fault", faults),
                                        ("kestrum-decode", "--format", formats),
                                        ("kestrum-decode", "--technology", technologies)):
            with self.subTest(option):
                self.assertEqual(set(completions(program, option, "")), values)
                for file in ("_" + program, program + ".fish"):
                    offered = re.findall(r"(?::\(|-a '|_values -s , fault )([a-z0-9 -]+)", text("resources", "completions", file))
                    self.assertIn(values, [set(words.split()) for words in offered])
                page = text("docs", "man", program + ".1")
                item = page.split(f".It Fl -{option.strip('-')} ")[1].split(".It Fl ")[0]
                named = " ".join(line for line in item.splitlines() if re.match(r"\.(It )?Cm", line))
                self.assertLessEqual(values, set(re.findall(r"[a-z0-9-]+", named)))


def completions(program, *words):
    """What bash offers behind these words."""
    script = """
        program=$1; shift
        source "resources/completions/$program.bash"
        COMP_WORDS=("$program" "$@"); COMP_CWORD=$#
        "_${program//-/_}" && printf '%s\\n' "${COMPREPLY[@]}"
    """
    return output("bash", "--norc", "-c", script, "bash", program, *words, cwd=SOURCE).split()


class Installation(unittest.TestCase):
    def setUp(self):
        scratch = tempfile.TemporaryDirectory(prefix="kestrum test ")
        self.addCleanup(scratch.cleanup)
        self.scratch = pathlib.Path(scratch.name)

    def install(self, prefix, **environment):
        output(CMAKE, "--install", BUILD, "--prefix", prefix, env={**os.environ, **environment})

    def test_programs_find_their_templates_in_any_prefix_and_where_it_is_moved(self):
        self.install(self.scratch / "prefix")
        moved = (self.scratch / "prefix").rename(self.scratch / "another prefix")
        tree = output(moved / "bin/kestrum-decode", SOURCE / "captures/lte.kcap")
        self.assertEqual(tree, text("captures", "lte.tree"))
        (moved / "share/kestrum/LTE.plist").unlink()
        self.assertNotEqual(subprocess.run([moved / "bin/kestrum-decode", SOURCE / "captures/lte.kcap"],
                                           capture_output=True, check=False).stdout.decode(), tree)

    def test_the_unit_starts_the_installed_program(self):
        prefix = self.scratch / "prefix"
        self.install(prefix)
        unit = (prefix / "lib/systemd/user/voxd.service").read_text(encoding="utf-8")
        self.assertIn(f'ExecStart="{prefix}/bin/voxd" $VOXD_OPTIONS\n', unit)
        self.assertEqual(output(prefix / "bin/voxd", "--version").split()[0], "voxd")

    def test_destdir_is_put_before_the_prefix_and_into_no_file(self):
        self.install("/usr", DESTDIR=str(self.scratch))
        self.assertEqual([entry.name for entry in self.scratch.iterdir()], ["usr"])
        unit = (self.scratch / "usr/lib/systemd/user/voxd.service").read_text(encoding="utf-8")
        self.assertIn('ExecStart="/usr/bin/voxd" $VOXD_OPTIONS\n', unit)

    def test_examples_of_policies_are_documents_and_not_in_use(self):
        self.install("/usr", DESTDIR=str(self.scratch))
        examples = {path.name for path in SOURCE.glob("resources/modem/*")}
        self.assertIn("kestrum-modem.conf", examples)
        self.assertEqual({path.name for path in self.scratch.glob("usr/share/doc/kestrum/examples/*")}, examples)
        installed = [str(path.relative_to(self.scratch)) for path in self.scratch.rglob("*")]
        self.assertEqual([path for path in installed if re.search("dbus-1|polkit-1|^etc", path)], [])

    def test_icons_stand_in_every_size_under_the_name_that_the_desktop_file_has(self):
        self.install(self.scratch)
        share = self.scratch / "share"
        name = re.search(r"^Icon=(.*)$", (share / "applications/kestrum.desktop").read_text(encoding="utf-8"), re.M)[1]
        icons = share / "icons/hicolor"
        self.assertTrue((icons / f"scalable/apps/{name}.svg").is_file())
        for size in (16, 22, 24, 32, 48, 64, 128, 256):
            picture = (icons / f"{size}x{size}/apps/{name}.png").read_bytes()
            self.assertEqual(struct.unpack(">II", picture[16:24]), (size, size))


if __name__ == "__main__":
    unittest.main(argv=sys.argv[:1], verbosity=2)
