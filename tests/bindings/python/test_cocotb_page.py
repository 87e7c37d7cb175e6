# SPDX-License-Identifier: MIT
"""The bench of the page runs against a device written in Python, with a stand-in for cocotb, which Debian lacks.

It shows that the coroutines drive, expect, collect and check in the right order, not that a simulator agrees.
"""

import asyncio
import re
import sys
import textwrap
import types
from pathlib import Path

import numpy as np
import pytest

import quarzel

PAGE = Path(__file__).parents[3] / "docs/cocotb.md"
K = 40


class TimeoutOfTheStandIn(Exception):
    pass


class Simulation:
    """A device with its clock. Everything happens at rising edges."""

    def __init__(self, answer, nanoseconds):
        self.answer = answer
        self.nanoseconds = nanoseconds
        self.now = 0
        self.waiting = []
        self.collected = []
        self.outgoing = []
        ports = ("clk", "sys", "par1", "par2", "in_valid", "out_valid", "out_bit")
        self.dut = types.SimpleNamespace(**{port: types.SimpleNamespace(value=0) for port in ports})

    def edge(self):
        dut = self.dut
        if dut.in_valid.value:
            self.collected.append((dut.sys.value, dut.par1.value, dut.par2.value))
        if len(self.collected) == K + 4:
            soft = np.array(self.collected, dtype=np.int8).T
            self.outgoing += self.answer(soft)
            self.collected = []
        dut.out_valid.value = int(bool(self.outgoing))
        dut.out_bit.value = int(self.outgoing.pop(0)) if self.outgoing else "x"

    async def run(self, bench):
        task = asyncio.ensure_future(bench(self.dut))
        while not task.done():
            self.edge()
            self.now += self.nanoseconds
            waiting, self.waiting = self.waiting, []
            for future in waiting:
                future.set_result(None)
            for _ in range(4):
                await asyncio.sleep(0)
        return await task

    def modules(self):
        """What the bench imports, for this simulation."""

        async def rising_edge():
            future = asyncio.get_running_loop().create_future()
            self.waiting.append(future)
            await future

        async def with_timeout(work, time, unit):
            end = self.now + time * {"ms": 1_000_000, "us": 1000}[unit]
            task = asyncio.ensure_future(work)
            while not task.done():
                if self.now > end:
                    task.cancel()
                    raise TimeoutOfTheStandIn
                await rising_edge()
            return await task

        async def nothing():
            pass

        cocotb = types.ModuleType("cocotb")
        cocotb.RANDOM_SEED = 1
        cocotb.test = lambda: lambda bench: bench
        cocotb.start_soon = asyncio.ensure_future
        clock = types.ModuleType("cocotb.clock")
        clock.Clock = lambda signal, period, units: types.SimpleNamespace(start=nothing)
        triggers = types.ModuleType("cocotb.triggers")
        triggers.RisingEdge = lambda signal: rising_edge()
        triggers.with_timeout = with_timeout
        return {"cocotb": cocotb, "cocotb.clock": clock, "cocotb.triggers": triggers}


def run_the_bench(monkeypatch, answer, nanoseconds=10):
    (code,) = re.findall(r"^    import cocotb\n(?:    .*\n|\n)+", PAGE.read_text(), re.MULTILINE)
    simulation = Simulation(answer, nanoseconds)
    for name, module in simulation.modules().items():
        monkeypatch.setitem(sys.modules, name, module)
    names = {}
    exec(compile(textwrap.dedent(code), PAGE.name, "exec"), names)
    asyncio.run(simulation.run(names["decodes_as_the_model"]))


def test_a_device_that_is_right_passes(monkeypatch):
    model = quarzel.Decoder(units=2)
    blocks = []

    def answer(soft):
        blocks.append(soft)
        return list(model.decode(soft))

    run_the_bench(monkeypatch, answer)
    assert len(blocks) == 100


def test_a_device_with_a_wrong_bit_fails(monkeypatch):
    model = quarzel.Decoder(units=2)
    blocks = []

    def answer(soft):
        blocks.append(soft)
        bits = model.decode(soft)
        bits[7] ^= len(blocks) == 3
        return list(bits)

    with pytest.raises(quarzel.Mismatch, match="block 2: bit 7 is"):
        run_the_bench(monkeypatch, answer)


def test_a_device_that_gives_nothing_back_runs_into_the_time_out(monkeypatch):
    with pytest.raises(TimeoutOfTheStandIn):
        run_the_bench(monkeypatch, lambda soft: [], nanoseconds=100_000)
