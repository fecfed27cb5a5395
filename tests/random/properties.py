"""What must hold, whatever happens."""

from typing import Callable, Iterator

import of_panes
import of_replies
import of_time
from story import Trial

Property = Callable[[Trial], Iterator[str]]

PROPERTIES: list[Property] = of_replies.PROPERTIES + of_panes.PROPERTIES + of_time.PROPERTIES


def broken_by(trial: Trial) -> tuple[Property, str] | None:
    """The first property that does not hold, and what breaks it; none looks at replies that are missing."""
    for each in PROPERTIES:
        if problem := next(each(trial), None):
            return each, problem
    return None


def sentence(each: Property) -> str:
    """The name of a property as a sentence."""
    return each.__name__.replace("_", " ")
