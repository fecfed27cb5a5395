"""The engine as a service of systemd: how much it is held to, and that it works so."""

import os
import pathlib
import shutil
import subprocess
import tempfile
import unittest

HERE = pathlib.Path(__file__).resolve().parent
ROOT = HERE.parents[1]
BUILD = pathlib.Path(os.environ["BUILD"])
UNIT = ROOT / "resources/systemd/quorl-syncd.service.in"

ALLOWED_EXPOSURE = "20"  # tenths; 100 is a service that nothing holds
NOT_HERE = 77


def unit_that_starts(program, **others):
    """The engine's unit with another program in it, and with some of its other settings changed."""
    changed = {"ExecStart": program, **others}
    lines = [line for line in UNIT.read_text().splitlines() if line.split("=")[0] not in changed]
    settings = [f"{name}={value}" for name, value in changed.items()]
    service = lines.index("[Service]") + 1
    return "\n".join(lines[:service] + settings + lines[service:]) + "\n"


# Its sanitizer cannot look for leaks where ptrace is forbidden.
ENGINE = unit_that_starts(f"{BUILD}/bin/quorl-syncd", Environment="ASAN_OPTIONS=detect_leaks=0")

SYNC = f"""
line_with() {{ grep --max-count=1 --fixed-strings "$1" < <(tail --follow --lines=+1 "$2"); }}
touch "$HOME"/told "$HOME"/shown
gdbus monitor --session --dest org.quorl.Velora.Sync >"$HOME/told" &
line_with 'does not have an owner' "$HOME/told"
{ROOT}/tools/make-demo-library "$HOME/Music" 2>&1
systemctl --user start quorl-syncd
grep -E '^(NoNewPrivs|Seccomp):' "/proc/$(systemctl --user show --property MainPID --value quorl-syncd)/status"
{{ echo 1; line_with '6  Road Trip' "$HOME/shown" >/dev/null; echo 6; line_with 'Session.Completed' "$HOME/told" >/dev/null; }} |
    ASAN_OPTIONS=detect_leaks=0 {BUILD}/bin/quorl --text >"$HOME/shown"
line_with 'Session.Completed' "$HOME/told"
ls "$HOME/.local/share/quorl/wearable/Music"
"""

# Says what it may do: its output is a list of words.
PROBE = """
import os, pathlib, socket
home = pathlib.Path.home()
def attempt(word, action):
    try:
        action()
        print(word, file=said)
    except OSError:
        pass
with open(home / "said", "w") as said:
    attempt("chosen-folder", (home / "Chosen/song").touch)
    attempt("settings", (home / ".config/autostart").touch)
    attempt("keys", (home / ".ssh/authorized_keys").touch)
    attempt("temporary", pathlib.Path("/var/tmp/quorl-probe").touch)
    attempt("local-socket", lambda: socket.socket(socket.AF_UNIX))
    attempt("internet-socket", lambda: socket.socket(socket.AF_INET))
    attempt("priority", lambda: os.setpriority(os.PRIO_PROCESS, 0, 19))
    attempt("another-root", lambda: os.chroot("/"))
    for line in pathlib.Path("/proc/self/net/dev").read_text().splitlines()[2:]:
        print(line.split(":")[0], file=said)
"""


class Confinement(unittest.TestCase):
    def setUp(self):
        temporary = tempfile.TemporaryDirectory()
        self.addCleanup(temporary.cleanup)
        self.folder = pathlib.Path(temporary.name)

    def session(self, unit, command):
        """What a shell command prints in a session that has this unit for the engine's."""
        (self.folder / "units").mkdir()
        (self.folder / "units" / UNIT.stem).write_text(unit)
        result = subprocess.run([HERE / "user-manager", self.folder, "bash", "-euc", command],
                                stdin=subprocess.DEVNULL, capture_output=True, text=True)
        if result.returncode == NOT_HERE:
            self.skipTest(result.stderr.strip())
        self.assertEqual(result.returncode, 0, result.stdout + result.stderr)
        return result.stdout

    @unittest.skipUnless(shutil.which("systemd-analyze"), "systemd-analyze is missing")
    def test_leaves_little_exposed(self):
        unit = self.folder / UNIT.stem
        unit.write_text(unit_that_starts("/bin/true"))
        result = subprocess.run(
            ["systemd-analyze", "security", "--no-pager", "--offline=true",
             f"--threshold={ALLOWED_EXPOSURE}", unit], capture_output=True, text=True)
        self.assertEqual(result.returncode, 0, result.stdout + result.stderr)

    def test_lets_the_engine_sync(self):
        said = self.session(ENGINE, SYNC)
        self.assertRegex(said, r"NoNewPrivs:\t1\nSeccomp:\t2\n")
        self.assertIn("(true, '12 songs synced", said)
        self.assertIn(".wav", said)

    def test_lets_nobody_else_s_folder_be_written_and_no_network_be_reached(self):
        (self.folder / "probe.py").write_text(PROBE)
        self.session(
            unit_that_starts(f"/usr/bin/python3 {self.folder}/probe.py", Type="oneshot", Restart="no"),
            'mkdir -p "$HOME"/{Chosen,.config,.ssh,.local/bin} && systemctl --user start quorl-syncd')
        said = (self.folder / "home/said").read_text().split()
        self.assertEqual(said, ["chosen-folder", "local-socket", "lo"])


if __name__ == "__main__":
    unittest.main()
