# SPDX-License-Identifier: MIT
"""The scoreboard for test benches."""

import subprocess
import sys

import numpy as np
import pytest
from conftest import soft_of

import quarzel


@pytest.fixture
def blocks(rng):
    bits = rng.integers(0, 2, (4, 40), dtype=np.uint8)
    return bits, soft_of(quarzel.encode(bits))


def board(**options):
    return quarzel.Scoreboard(quarzel.Decoder(), iterations=2, **options)


def test_a_device_that_is_right_passes(blocks):
    scoreboard = board()
    for number, (bits, soft) in enumerate(zip(*blocks)):
        assert np.array_equal(scoreboard.expect(*soft, tag=number), bits)
    assert scoreboard.waiting == 4
    for number, bits in enumerate(blocks[0]):
        assert scoreboard.check(bits, tag=number)
    scoreboard.finish()
    assert (scoreboard.blocks, scoreboard.block_errors, scoreboard.bit_errors) == (4, 0, 0)


def test_names_the_first_wrong_block_and_bit(blocks):
    scoreboard = board()
    for soft in blocks[1]:
        scoreboard.expect(soft)
    scoreboard.check(blocks[0][0])
    wrong = blocks[0][1].copy()
    wrong[[7, 9]] ^= 1
    with pytest.raises(quarzel.Mismatch, match=rf"block 1: bit 7 is {wrong[7]}, .* {1 - wrong[7]}; 2 of 40 bits"):
        scoreboard.check(wrong)


def test_counts_on_when_it_is_told_to(blocks):
    scoreboard = board(stop_at_first=False)
    for soft in blocks[1]:
        scoreboard.expect(soft)
    assert not scoreboard.check(1 - blocks[0][0])
    assert scoreboard.check(blocks[0][1])
    with pytest.raises(quarzel.Mismatch, match="1 of 2 blocks differ, in 40 bits; first block 0: bit 0"):
        scoreboard.finish()


def test_takes_the_text_of_a_logic_vector_and_finds_an_x(blocks):
    scoreboard = board()
    scoreboard.expect(blocks[1][0])
    scoreboard.expect(blocks[1][1])
    assert scoreboard.check("".join(map(str, blocks[0][0])))
    text = "".join(map(str, blocks[0][1]))
    with pytest.raises(quarzel.Mismatch, match="bit 3 is x"):
        scoreboard.check(text[:3] + "x" + text[4:])


def test_wrong_length_tag_and_number_of_blocks_are_differences(blocks):
    bits, soft = blocks
    scoreboard = board()
    for block in soft[:3]:
        scoreboard.expect(block, tag=5)
    with pytest.raises(quarzel.Mismatch, match="block 0: has 39 bits, the model gives 40"):
        scoreboard.check(bits[0][:39])
    with pytest.raises(quarzel.Mismatch, match="block 1: the tag is 4, the model gives 5"):
        scoreboard.check(bits[1], tag=4)
    fresh = board()
    with pytest.raises(quarzel.Mismatch, match="block 0: came out, but no block has gone in"):
        fresh.check(bits[0])
    fresh = board()
    fresh.expect(soft[0])
    with pytest.raises(quarzel.Mismatch, match="1 of 1 blocks have not come out, the first is block 0"):
        fresh.finish()
    with pytest.raises(ValueError, match="one block"):
        fresh.expect(soft)


def test_needs_no_simulator():
    code = "import sys, quarzel; sys.exit('cocotb' in sys.modules)"
    assert subprocess.run([sys.executable, "-c", code]).returncode == 0
