"""Keeps Wine's servers running while a test starts many short Windows programs.

The first program of a Wine session starts background servers, which inherit its output: whoever reads
that waits for their end, seconds later, and the next program starts everything anew. So one idle program
with no output of its own stands by while the test runs.
"""

import atexit
import subprocess


def keep_running(wrapper):
    """Call it once, with the words that stand in front of the program; only "wine" makes a difference."""
    if "wine" not in wrapper:
        return
    nothing = {"stdout": subprocess.DEVNULL, "stderr": subprocess.DEVNULL}
    idle = subprocess.Popen(["wine", "cmd", "/c", "set /p answer="], stdin=subprocess.PIPE, **nothing)
    # Returns when the servers are up.
    subprocess.run(["wine", "cmd", "/c", "rem"], stdin=subprocess.DEVNULL, check=True, timeout=300, **nothing)

    def stop():
        idle.stdin.close()
        try:
            idle.wait(timeout=10)
        except subprocess.TimeoutExpired:
            idle.kill()

    atexit.register(stop)
