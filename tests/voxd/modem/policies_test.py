"""The examples of policies against ModemManager's own policies, on a private bus."""
import os
import pathlib
import re
import subprocess
import sys
import tempfile
import unittest
import xml.etree.ElementTree as xml

EXAMPLES = pathlib.Path(sys.argv[1]) / "resources" / "modem"
MODEM_MANAGER = "org.freedesktop.ModemManager1"


def installed(*places):
    return next(pathlib.Path(place) for place in places if pathlib.Path(place).exists())


# Debian 12 and Debian 13.
BUS_POLICY = installed(f"/etc/dbus-1/system.d/{MODEM_MANAGER}.conf", f"/usr/share/dbus-1/system.d/{MODEM_MANAGER}.conf")
ACTIONS = pathlib.Path(f"/usr/share/polkit-1/actions/{MODEM_MANAGER}.policy")


class BusPolicy(unittest.TestCase):
    def bus_with(self, *policies):
        """Starts a bus with these policies and something that answers for ModemManager. Everybody is an ordinary user."""
        scratch = tempfile.TemporaryDirectory(prefix="kestrum-bus-")
        self.addCleanup(scratch.cleanup)
        config = pathlib.Path(scratch.name) / "bus.conf"
        config.write_text(f"""<busconfig>
            <type>session</type><listen>unix:dir={scratch.name}</listen><auth>EXTERNAL</auth>
            <policy context="default">
                <allow send_destination="*" eavesdrop="true"/><allow eavesdrop="true"/><allow own="*"/>
            </policy>
            {"".join(policies)}
        </busconfig>""", encoding="utf-8")
        # pylint: disable=consider-using-with  # the cleanups end them
        bus = subprocess.Popen(["dbus-daemon", "--nofork", "--nosyslog", "--print-address", "--config-file", config],
                               stdout=subprocess.PIPE, encoding="utf-8")
        self.addCleanup(self.end, bus)
        environment = {**os.environ, "DBUS_SYSTEM_BUS_ADDRESS": bus.stdout.readline().strip()}
        answering = subprocess.Popen(
            ["/usr/bin/python3", "-m", "dbusmock", "--system", MODEM_MANAGER, "/", "org.example.Nothing"],
            env=environment, stdout=subprocess.DEVNULL)
        self.addCleanup(self.end, answering)
        while "true" not in self.send(environment, "org.freedesktop.DBus", "/", "org.freedesktop.DBus.NameHasOwner",
                                      f"string:{MODEM_MANAGER}"):
            self.assertIsNone(answering.poll())
        return environment

    @staticmethod
    def end(process):
        process.terminate()
        process.wait()
        if process.stdout:
            process.stdout.close()

    @staticmethod
    def send(environment, destination, *call):
        return subprocess.run(["dbus-send", "--system", "--print-reply", f"--dest={destination}", *call], env=environment,
                              stdout=subprocess.PIPE, stderr=subprocess.STDOUT, encoding="utf-8", check=False).stdout

    def is_denied(self, environment, method):
        answer = self.send(environment, MODEM_MANAGER, "/", f"{MODEM_MANAGER}.{method}")
        self.assertRegex(answer, "AccessDenied|UnknownMethod|UnknownInterface")
        return "AccessDenied" in answer

    def setUp(self):
        # Without the exception for root: the test may be run by root.
        own = xml.parse(BUS_POLICY).getroot()
        self.daemons = "".join(xml.tostring(policy, encoding="unicode") for policy in own if "user" not in policy.attrib)
        text = (EXAMPLES / "kestrum-modem.conf").read_text(encoding="utf-8")
        root = xml.fromstring(text)
        self.groups = {policy.get("group") for policy in root}
        for policy in root:
            policy.set("group", str(os.getgid()))
        self.example = "".join(xml.tostring(policy, encoding="unicode") for policy in root)

    def test_without_the_example_the_cells_are_refused_and_with_it_they_are_not(self):
        self.assertTrue(self.is_denied(self.bus_with(self.daemons), "Modem.GetCellInfo"))
        self.assertFalse(self.is_denied(self.bus_with(self.daemons, self.example), "Modem.GetCellInfo"))

    def test_it_allows_nothing_else(self):
        self.assertTrue(self.is_denied(self.bus_with(self.daemons, self.example), "Modem.SomethingElse"))

    def test_what_else_the_service_calls_is_allowed_without_it(self):
        environment = self.bus_with(self.daemons)
        for method in ("Modem.Signal.Setup", "Modem.Location.Setup", "Modem.Location.GetLocation"):
            self.assertFalse(self.is_denied(environment, method), method)

    def test_it_is_for_the_group_that_the_rule_is_for(self):
        rule = (EXAMPLES / "50-kestrum-modem.rules").read_text(encoding="utf-8")
        self.assertEqual(set(re.findall(r'isInGroup\("(.*?)"\)', rule)), self.groups)


class PolkitRule(unittest.TestCase):
    def test_its_actions_are_those_of_modem_manager(self):
        rule = (EXAMPLES / "50-kestrum-modem.rules").read_text(encoding="utf-8")
        named = set(re.findall(rf'"({MODEM_MANAGER}\.[\w.]+)"', rule))
        self.assertEqual(named, {f"{MODEM_MANAGER}.Device.Control", f"{MODEM_MANAGER}.Location"})
        self.assertLessEqual(named, {action.get("id") for action in xml.parse(ACTIONS).getroot().iter("action")})


if __name__ == "__main__":
    unittest.main(argv=sys.argv[:1], verbosity=2)
