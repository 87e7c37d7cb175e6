# SPDX-License-Identifier: MIT
"""The coded link of a sweep: how its blocks are sent and received."""

from __future__ import annotations

from typing import Any, Iterable, Optional, Union

from ._checks import real, whole

MODULATIONS = {"bpsk": 1, "qpsk": 2, "16qam": 4, "64qam": 6, "256qam": 8}
"""Bits of a symbol."""
CHANNELS = ("awgn", "rayleigh", "rayleigh-block")
DEMAPPINGS = ("maxlog", "exact")
STOPS = ("none", "crc")
USUAL: dict[str, Any] = {
    "transport_block": 0,
    "coded_bits": 0,
    "modulation": "bpsk",
    "channel": "awgn",
    "demapping": "maxlog",
    "redundancy_versions": (0,),
    "stop": "none",
}
"""What files leave out: code blocks alone, each code bit once, as BPSK over white Gaussian noise."""

_MOST_CODED_BITS = 2**24
_MOST_TRANSMISSIONS = 32
_LARGEST_TRANSPORT_BLOCK = 2**19 - 1


def listed(values: Any) -> list[Any]:
    """One value or several, as a list."""
    return list(values) if isinstance(values, Iterable) and not isinstance(values, str) else [values]


def names(what: str, values: Any, choices: Iterable[str]) -> list[str]:
    """Names out of a few.

    :raises ValueError: one is none of them
    """
    all_values = listed(values)
    for value in all_values:
        if value not in choices:
            raise ValueError(f"there is no {what} {value!r}; choose {', '.join(choices)}")
    return all_values


def link_configuration(
    *,
    block_size: Any,
    transport_block: Any,
    coded_bits: Any,
    code_rate: Any,
    modulation: Any,
    channel: Any,
    demapping: Any,
    rv: Union[int, Iterable[int], None],
    harq: Optional[int],
    stop: str,
) -> dict[str, Any]:
    """The link of a sweep as the extension takes it.

    :raises ValueError: a value is not possible, or values do not go together
    """
    transport_blocks = [] if transport_block is None else listed(transport_block)
    sizes: list[list[float]] = [[whole("coded_bits", bits, 1, _MOST_CODED_BITS), 0] for bits in _given(coded_bits)]
    sizes += [[0, real("code_rate", rate)] for rate in _given(code_rate)]
    if any(rate > 1 for _, rate in sizes):
        raise ValueError("a code rate is above 0 and up to 1")
    if transport_blocks and block_size is not None:
        raise ValueError("the sizes of code blocks follow from those of transport blocks; leave out block_size")
    if transport_blocks and not sizes:
        raise ValueError("the coded bits of a transmission are not told; give code_rate or coded_bits")
    return {
        "block_size": [whole("block_size", K, 40, 6144) for K in listed(1024 if block_size is None else block_size)],
        "transport_block": [whole("transport_block", A, 1, _LARGEST_TRANSPORT_BLOCK) for A in transport_blocks],
        "coded_size": sizes or [[0, 0]],
        "modulation": names("modulation", modulation, MODULATIONS),
        "channel": names("channel", channel, CHANNELS),
        "demapping": names("demapping", demapping, DEMAPPINGS),
        "redundancy_versions": _redundancy_versions(rv, harq),
        "stop": names("stop", stop, STOPS)[0],
    }


def _given(values: Any) -> list[Any]:
    return [] if values is None else listed(values)


def _redundancy_versions(rv: Union[int, Iterable[int], None], harq: Optional[int]) -> list[int]:
    """The redundancy version of each transmission: those given, in turn."""
    count = 0 if harq is None else whole("harq", harq, 1, _MOST_TRANSMISSIONS)
    turn = [whole("rv", version, 0, 3) for version in _given(rv)] or ([0, 2, 3, 1] if count > 1 else [0])
    return [turn[index % len(turn)] for index in range(count or len(turn))]


def sending_text(link: Any) -> str:
    """What differs from the usual link, but for the size of transport blocks: "2048 coded bits, qpsk"."""
    parts = {
        "coded_bits": f"{link.coded_bits} coded bits",
        "modulation": link.modulation,
        "channel": link.channel,
        "demapping": f"{link.demapping} demapping",
        "redundancy_versions": "rv " + " ".join(map(str, link.redundancy_versions)),
        "stop": f"stop {link.stop}",
    }
    return ", ".join(text for name, text in parts.items() if getattr(link, name) != USUAL[name])


def bits_per_symbol(link: Any) -> float:
    """Information bits that a symbol of the channel carries: Es/N0 over Eb/N0."""
    bits = MODULATIONS[link.modulation]
    return bits / 3 if link.coded_bits == 0 else bits * float(link.information_bits / link.coded_bits)
