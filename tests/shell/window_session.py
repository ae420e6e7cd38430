"""What the tests that drive the desktop program's real window under Xvfb share: the
mouse and keys as a person uses them, and the end of the run."""
import shutil
import signal
import subprocess
import time


def xdotool(*args):
    return subprocess.run(["xdotool", *args], capture_output=True, timeout=30)


def click(window, at):
    """A left click at a point of the window. Without a window manager SDL takes a pointer
    move for motion only when it is relative, and Dear ImGui needs the pointer there for a
    frame before the button goes down."""
    xdotool("mousemove", "--window", window, str(at[0]), str(at[1]))
    time.sleep(0.1)
    xdotool("mousemove_relative", "1", "0")
    time.sleep(0.15)
    xdotool("mousedown", "1")
    time.sleep(0.1)
    xdotool("mouseup", "1")
    time.sleep(0.4)


def press(window, keys):
    """Keys for Dear ImGui's own controls, which see a key only if it is still down at the
    next frame (the program's shortcuts take xdotool's quick key presses)."""
    xdotool("keydown", "--window", window, keys)
    time.sleep(0.15)
    xdotool("keyup", "--window", window, keys)
    time.sleep(0.2)


def stop_by_signal(proc):
    """Ends the program with SIGTERM; its exit status, or "hung"."""
    proc.send_signal(signal.SIGTERM)
    try:
        return proc.wait(timeout=15)
    except subprocess.TimeoutExpired:
        proc.kill()
        return "hung"


def report(home, failures):
    """Prints the failures, keeping the files to look at; the exit status."""
    if not failures:
        shutil.rmtree(home, ignore_errors=True)
    for f in failures:
        print("FAIL", f)
    if failures:
        print(f"(files kept in {home})")
    return 1 if failures else 0
