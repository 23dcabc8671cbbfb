"""An X server of its own, for programs that show windows."""

import contextlib
import os
import shutil
import subprocess


def is_installed():
    return shutil.which("Xvfb") is not None


@contextlib.contextmanager
def running(width=1280, height=1024, framebuffer=None):
    """Gives the environment in which programs show their windows there. `framebuffer` is a folder where the server
    keeps its screen as a file, Xvfb_screen0, of the format XWD."""
    read, write = os.pipe()
    options = ["-screen", "0", f"{width}x{height}x24", "-nolisten", "tcp"]
    if framebuffer:
        options += ["-fbdir", str(framebuffer)]
    server = subprocess.Popen(["Xvfb", "-displayfd", str(write), *options], pass_fds=[write], stderr=subprocess.DEVNULL)
    os.close(write)
    try:
        with os.fdopen(read) as numbers:
            number = numbers.readline().strip()
        if not number:
            raise RuntimeError("Xvfb does not start")
        environment = dict(os.environ, DISPLAY=f":{number}", QXCORE_DISPLAY="sdl")
        environment.pop("XAUTHORITY", None)
        yield environment
    finally:
        server.terminate()
        server.wait()
