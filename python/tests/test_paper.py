"""The example of the paper does what the paper shows."""

import doctest
import re

from conftest import SOURCE

import zorlyra


def test_paper(tmp_path, monkeypatch, samples):
    monkeypatch.setenv("XDG_CACHE_HOME", str(tmp_path / "cache"))
    (tmp_path / "samples").symlink_to(samples)
    blocks = re.findall(r"^```python\n(.*?)^```", (SOURCE / "docs/python.md").read_text(), re.S | re.M)
    assert len(blocks) >= 5
    lesson = doctest.DocTestParser().get_doctest("\n".join(blocks), {}, "python.md", "python.md", 0)
    told = []
    done = doctest.DocTestRunner().run(lesson, out=told.append)
    assert done.failed == 0, "".join(told)
    assert done.attempted > 20


def test_stub_names_what_the_module_has():
    stub = (SOURCE / "python/zorlyra/__init__.pyi").read_text()
    for name in zorlyra.__all__:
        thing = getattr(zorlyra, name)
        assert re.search(rf"^(class|def) {name}\b", stub, re.M), name
        assert thing.__doc__, name
        if isinstance(thing, type):
            body = re.search(rf"^class {name}\b.*?(?=^\S|\Z)", stub, re.S | re.M).group(0)
            for member in vars(thing):
                if not member.startswith("_"):
                    assert re.search(rf"\b{member}\b", body), f"{name}.{member}"
