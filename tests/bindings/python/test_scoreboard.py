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


def test_a_mismatch_holds_the_block_and_traces_it(blocks):
    bits, soft = blocks
    scoreboard = quarzel.Scoreboard(quarzel.Decoder(8, "max-star"), stop_at_first=False)
    for block in soft:
        scoreboard.expect(block[0], block[1], block[2], iterations=3)
    assert scoreboard.check(bits[0])
    assert not scoreboard.check(1 - bits[1], tag=0)
    with pytest.raises(quarzel.Mismatch) as caught:
        scoreboard.finish()
    for mismatch in (scoreboard.first_mismatch, caught.value):
        assert mismatch.block == 1
        assert "".join(mismatch.bits) == "".join(map(str, 1 - bits[1]))
        assert np.array_equal(mismatch.expected, bits[1])
        assert np.array_equal(mismatch.soft, soft[1])
        assert mismatch.tag == 0
        assert mismatch.trace() == quarzel.Decoder(8, "max-star").trace(soft[1], iterations=3)
    assert scoreboard.check(bits[2])


def test_a_block_that_has_not_come_out_can_be_traced_and_one_too_many_cannot(blocks):
    scoreboard = board()
    scoreboard.expect(blocks[1][0])
    with pytest.raises(quarzel.Mismatch) as caught:
        scoreboard.finish()
    assert caught.value.block == 0
    assert caught.value.trace() == quarzel.Decoder().trace(blocks[1][0], iterations=2)
    with pytest.raises(quarzel.Mismatch) as caught:
        board().check(blocks[0][0])
    assert caught.value.block is None
    with pytest.raises(ValueError, match="no block to trace"):
        caught.value.trace()


def test_matches_by_tag_when_it_is_told_to(blocks):
    bits, soft = blocks
    scoreboard = board(by_tag=True)
    for block, tag in zip(soft, (5, 9, 5, 7)):
        scoreboard.expect(block, tag=tag)
    for number, tag in ((3, 7), (0, 5), (2, 5)):
        assert scoreboard.check(bits[number], tag=tag)
    with pytest.raises(ValueError, match="give check the tag"):
        scoreboard.check(bits[1])
    with pytest.raises(quarzel.Mismatch, match="tag 5: came out, but no block has gone in for it"):
        scoreboard.check(bits[1], tag=5)
    with pytest.raises(quarzel.Mismatch, match="block 1: bit 0"):
        scoreboard.check(1 - bits[1], tag=9)
    for width in (0, 32):
        with pytest.raises(ValueError, match=f"tag_width={width} gives every tag back as 0"):
            quarzel.Scoreboard(quarzel.Decoder(tag_width=width), by_tag=True)


def test_a_mistake_of_the_bench_is_no_mismatch_and_takes_no_block(blocks):
    bits, soft = blocks
    scoreboard = board()
    scoreboard.expect(soft[0])
    for wrong in (bits[0].astype(float), bits[0].astype(np.float32)):
        with pytest.raises(TypeError, match=r"not float.*; use bits\.astype\(numpy\.uint8\)"):
            scoreboard.check(wrong)
    with pytest.raises(TypeError, match="bits is one value"):
        scoreboard.check(12345)
    with pytest.raises(TypeError, match="bits is a masked array"):
        scoreboard.check(np.ma.array(bits[0]))
    packed = np.array([0, 1, 0, 170, 85], dtype=np.uint8)
    for values in (packed, packed.tobytes(), packed.tolist()):
        with pytest.raises(ValueError, match=r"5 bytes for 40 bits: .* numpy\.unpackbits"):
            scoreboard.check(values)
    assert (scoreboard.waiting, scoreboard.blocks) == (1, 0)
    assert scoreboard.check(bits[0].tolist())


def test_finish_fails_when_nothing_was_checked():
    with pytest.raises(quarzel.Mismatch, match="no block was checked; call expect"):
        board().finish()


def test_refuses_settings_that_are_none(blocks):
    with pytest.raises(TypeError, match="must be a quarzel.Decoder, not type"):
        quarzel.Scoreboard(quarzel.Decoder)
    with pytest.raises(ValueError, match="iterations must be a number from 1 to 15, not 0"):
        quarzel.Scoreboard(quarzel.Decoder(), 0)
    with pytest.raises(ValueError, match="tag must be a number from 0 to 4294967295"):
        board().expect(blocks[1][0], tag=-1)
    with pytest.raises(AttributeError, match="^iteration cannot be set; a scoreboard has decoder, iterations,"):
        board().iteration = 8


def test_needs_no_simulator():
    code = "import sys, quarzel; sys.exit('cocotb' in sys.modules)"
    assert subprocess.run([sys.executable, "-c", code]).returncode == 0
