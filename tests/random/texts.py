"""Figures as the panes write them in English, with raw sizes."""

MEGABYTE = 1 << 20
WORD = 2**64


def single(number: int) -> int:
    """The number of single precision that is nearest; of two, the even one."""
    shift = max(number.bit_length() - 24, 0)
    half, rest = (1 << shift) >> 1, number & ((1 << shift) - 1)
    mantissa = number >> shift
    return (mantissa + (rest > half or (rest == half != 0 and mantissa & 1))) << shift


def size_text(number: int) -> str:
    """A number of bytes."""
    return f"{single(number)} B"


def songs_that_fit(sizes: list[int | None], limit_type: int, limit: int) -> tuple[int, str]:
    """How many of the first songs a limit lets through, and what they weigh. Sums go round as 64 bits do."""
    most_bytes = (limit * MEGABYTE) % WORD if limit_type == 0 else WORD - 1
    most_songs = limit if limit_type == 1 else len(sizes)
    fits = [0]
    for size in sizes[:most_songs]:
        total = (fits[-1] + (size or 0)) % WORD
        if total > most_bytes:
            break
        fits.append(total)
    return len(fits) - 1, size_text(fits[-1])


def status_beside(stage: int, progress: float) -> str:
    """What stands beside the synced playlist in the chooser."""
    percent = min(max(int(progress * 100), 1), 99)
    return ["Synced", "Sync Pending…", "Syncing…", f"{percent}% Synced…"][stage]
