"""XML results of clash analyses: read, compared, settled, computed and published.

    import zorlyra

    result = zorlyra.read("as1.clash.xml")
    for interference in result.interferences:
        print(interference.index, interference.type, interference.value)
"""

from ._zorlyra import *  # noqa: F401,F403
from ._zorlyra import __version__  # noqa: F401

__all__ = [name for name in globals() if not name.startswith("_")]
