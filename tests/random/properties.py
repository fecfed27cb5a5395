"""What must hold, whatever happens."""

from typing import Callable, Iterator

import of_news
import of_panes
import of_replies
import of_time
from story import Trial

Property = Callable[[Trial], Iterator[str]]

PROPERTIES: list[Property] = [
    *of_replies.PROPERTIES, *of_panes.PROPERTIES, *of_news.PROPERTIES, *of_time.PROPERTIES
]


def broken_by(trial: Trial) -> tuple[Property, str] | None:
    """The first property that does not hold, and what breaks it."""
    for each in PROPERTIES:
        if problem := problem_of(each, trial):
            return each, problem
    return None


def problem_of(each: Property, trial: Trial) -> str | None:
    """What breaks a property, if anything does. Replies that it cannot read do."""
    try:
        return next(each(trial), None)
    except (LookupError, TypeError, ValueError) as error:
        return f"a reply is not as it should be: {error!r}"


def sentence(each: Property) -> str:
    """The name of a property as a sentence."""
    return each.__name__.replace("_", " ")
