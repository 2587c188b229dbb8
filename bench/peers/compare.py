"""The same work done by the plug-in, by libmodbus and by pymodbus, against one slave.

usage: compare.py PROGRAMS bare|paced|loaded|smoke [--rounds N] [--count N]

PROGRAMS is the folder of the built programs. The masters take turns, so that whatever else the
machine does hits all of them; each figure is the median over the rounds. Compare within one run.

bare    nothing takes time on the line: CPU, system calls, wake-ups, transactions a second
paced   characters take their time: one transaction against what the line itself needs
loaded  busy loops beside the masters: how many transactions are lost
smoke   a few transactions of each; only their values are looked at
"""

import argparse
import contextlib
import os
import statistics
import subprocess
import sys
from collections import namedtuple

from work import WORKS, check_sum

HERE = os.path.dirname(os.path.abspath(__file__))
CHARACTER_BITS = 1 + 8 + 1
CORE = max(os.sched_getaffinity(0))

# `equal`: the master that waits in the same way, to which the ratio refers.
Master = namedtuple("Master", "name program waiting equal")
GAP = Master("plug-in, gap", "peers_plugin", "silence", "libmodbus, silence")
LENGTH = Master("plug-in, length", "peers_plugin", "length", "libmodbus, silence")
LENGTH_AT_ONCE = Master("plug-in, length, no silence", "peers_plugin", "length-at-once", "libmodbus")
LIBMODBUS = Master("libmodbus", "peers_libmodbus", "at-once", "libmodbus")
LIBMODBUS_SILENT = Master("libmodbus, silence", "peers_libmodbus", "silence", "libmodbus, silence")
PYMODBUS = Master("pymodbus", "pymodbus_master.py", "own", "libmodbus, silence")
MASTERS = [LENGTH_AT_ONCE, LIBMODBUS, LENGTH, LIBMODBUS_SILENT, GAP, PYMODBUS]

# Of one run: CPU and time in microseconds.
Run = namedtuple("Run", "count lost wrong cpu time wakeups sum")


class Bench:
    def __init__(self, programs):
        self.programs = programs

    @contextlib.contextmanager
    def slave(self, baud):
        """@return the path of the line, served until the block ends."""
        with subprocess.Popen([os.path.join(self.programs, "peers_slave"), str(baud)], text=True,
                              stdin=subprocess.PIPE, stdout=subprocess.PIPE) as process:
            yield process.stdout.readline().strip()
            process.stdin.close()

    def command(self, master, port, baud, work, count):
        words = [port, str(baud), work, str(count), master.waiting]
        if master is PYMODBUS:
            return ["/usr/bin/python3", os.path.join(HERE, master.program)] + words
        program = [os.path.join(self.programs, master.program)] + words
        if master.program == "peers_plugin":
            program.append(os.path.join(self.programs, "libmrtu.so"))
        return program

    def run(self, master, port, baud, work, count):
        done = subprocess.run(self.command(master, port, baud, work, count), check=True, text=True,
                              stdout=subprocess.PIPE)
        count, lost, wrong, cpu, time, wakeups, values = map(int, done.stdout.split())
        if values != check_sum(WORKS[work][2]):
            sys.exit(f"{master.name}: wrong values of {work}")
        return Run(count, lost, wrong, cpu / 1000, time / 1000, wakeups, values)

    def calls(self, master, port, baud, work):
        """System calls of one transaction: what a longer run has more than a shorter one."""
        totals = []
        for count in (50, 150):
            traced = subprocess.run(["strace", "-f", "-c", "-o", "/dev/stdout"] +
                                    self.command(master, port, baud, work, count),
                                    check=True, text=True, stdout=subprocess.PIPE)
            total = [line.split() for line in traced.stdout.splitlines() if line.endswith(" total")]
            totals.append(int(total[0][3]))
        return (totals[1] - totals[0]) / 100


def waits(master):
    return master not in (LENGTH_AT_ONCE, LIBMODBUS)


def median(runs, figure):
    return statistics.median(figure(run) for run in runs)


def in_turns(bench, masters, port, baud, work, count, rounds):
    """@param count  For each master. @return the runs of each master, by its name."""
    runs = {master.name: [] for master in masters}
    for _ in range(rounds):
        for master in masters:
            runs[master.name].append(bench.run(master, port, baud, work, count(master)))
    return runs


def to_real_time():
    """Puts this process, and with it all that it starts, at real-time priority on one core."""
    os.sched_setaffinity(0, {CORE})
    try:
        os.sched_setscheduler(0, os.SCHED_FIFO, os.sched_param(10))
        print(f"Masters and slave at real-time priority (SCHED_FIFO 10) on core {CORE}.")
    except PermissionError:
        print(f"Masters and slave on core {CORE}; real-time priority was not permitted.")


def out_of_real_time():
    os.sched_setscheduler(0, os.SCHED_OTHER, os.sched_param(0))
    os.sched_setaffinity(0, range(os.cpu_count()))


def faults(runs):
    lost, wrong = sum(run.lost for run in runs), sum(run.wrong for run in runs)
    return f" ({lost} lost, {wrong} wrong)" if lost or wrong else ""


def compare_bare(bench, count, rounds):
    baud = 115200
    with bench.slave(0) as port:
        calls = {(work, master.name): bench.calls(master, port, baud, work)
                 for work in WORKS for master in MASTERS}
    to_real_time()
    print(f"A bare pseudo terminal, {baud} baud set; medians of {rounds} runs of {count} each, of "
          f"{10 * count} without waiting.\n")
    print("| work | master | CPU, us | to libmodbus | system calls | wake-ups | per second |")
    print("|---|---|---|---|---|---|---|")
    for work in WORKS:
        with bench.slave(0) as port:
            runs = in_turns(bench, MASTERS, port, baud, work,
                            lambda master: count if waits(master) else 10 * count, rounds)
        cpu = {name: median(of, lambda run: run.cpu / run.count) for name, of in runs.items()}
        for master in MASTERS:
            mine = runs[master.name]
            print(f"| {work} | {master.name}{faults(mine)} | {cpu[master.name]:.1f} "
                  f"| {cpu[master.name] / cpu[master.equal]:.2f} "
                  f"| {calls[work, master.name]:.1f} "
                  f"| {median(mine, lambda run: run.wakeups / run.count):.1f} "
                  f"| {median(mine, lambda run: run.count / run.time * 1e6):.0f} |", flush=True)
    out_of_real_time()


def line_time(work, baud):
    """Microseconds: all characters and twice the silence of 3.5 characters."""
    character = CHARACTER_BITS / baud * 1e6
    request, reply, _ = WORKS[work]
    silence = 1750 if baud > 19200 else 3.5 * character
    return (request + reply) * character + 2 * silence


def compare_paced(bench, count, rounds):
    to_real_time()
    print(f"Characters of {CHARACTER_BITS} bits at the line's speed, the slave keeps 3.5 characters;"
          f" medians of {rounds} runs.\n")
    print("| baud | work | line time, ms | master | ms | to line time | wake-ups per byte received |")
    print("|---|---|---|---|---|---|---|")
    masters = [LENGTH, GAP, LIBMODBUS_SILENT, LIBMODBUS, PYMODBUS]
    for baud in (9600, 19200, 115200):
        for work in ("read-1-register", "read-125-registers"):
            least = line_time(work, baud)
            some = max(3, min(count, int(1e6 / least)))
            with bench.slave(baud) as port:
                runs = in_turns(bench, masters, port, baud, work, lambda _: some, rounds)
            for master in masters:
                mine = runs[master.name]
                time = median(mine, lambda run: run.time / run.count)
                wakeups = median(mine, lambda run: run.wakeups / run.count) / WORKS[work][1]
                print(f"| {baud} | {work} | {least / 1000:.2f} | {master.name}{faults(mine)} "
                      f"| {time / 1000:.2f} | {time / least:.3f} | {wakeups:.2f} |", flush=True)
    out_of_real_time()


@contextlib.contextmanager
def busy_loops(number):
    loops = [subprocess.Popen([sys.executable, "-c", "while True: pass"]) for _ in range(number)]
    try:
        yield
    finally:
        for loop in loops:
            loop.kill()
            loop.wait()


def compare_loaded(bench, count, _rounds):
    number = 2 * os.cpu_count()
    print(f"{number} busy loops on {os.cpu_count()} cores beside; usual priority; no repetition.\n")
    print("| line | master | work | transactions | lost | wrong | per second |")
    print("|---|---|---|---|---|---|---|")
    lines = [(0, "bare", "read-125-registers", count, (LENGTH_AT_ONCE, LENGTH, LIBMODBUS)),
             (115200, "115,200 baud", "read-125-registers", count // 50, (LENGTH, GAP, LIBMODBUS))]
    with busy_loops(number):
        for baud, line, work, some, masters in lines:
            for master in masters:
                with bench.slave(baud) as port:
                    run = bench.run(master, port, 115200, work, some)
                print(f"| {line} | {master.name} | {work} | {some} | {run.lost} | {run.wrong} "
                      f"| {run.count / run.time * 1e6:.0f} |", flush=True)


def smoke(bench, count, _rounds):
    with bench.slave(0) as port:
        for work in WORKS:
            for master in MASTERS:
                run = bench.run(master, port, 115200, work, count)
                if run.count != count or run.lost or run.wrong:
                    sys.exit(f"{master.name}, {work}: {run.lost} lost, {run.wrong} wrong")


MODES = {"bare": (compare_bare, 500), "paced": (compare_paced, 50),
         "loaded": (compare_loaded, 100000), "smoke": (smoke, 3)}


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("programs")
    parser.add_argument("mode", choices=MODES)
    parser.add_argument("--rounds", type=int, default=5)
    parser.add_argument("--count", type=int)
    arguments = parser.parse_args()
    compare, count = MODES[arguments.mode]
    compare(Bench(arguments.programs), arguments.count or count, arguments.rounds)


main()
