"""What one does with results gives what the command gives."""

import json
import pathlib
import warnings

import pytest

import zorlyra

DIFF_CLASSES = ["new", "persisting", "changed", "resolved", "notComparable"]


@pytest.fixture(scope="module")
def pair(tmp_path_factory, lyra, samples):
    """A settled result, and one that was computed later and changed."""
    folder = tmp_path_factory.mktemp("pair")
    old, new = folder / "old.xml", folder / "new.xml"
    lyra.run("review", "set", samples / "as1.clash.xml", "--only", "product=bolt_1", "--status", "irrelevant",
             "--comment", "bolted", "-o", old)
    text = (samples / "as1.clash.xml").read_text()
    new.write_text(text.replace('Value="0"', 'Value="-2"', 3))
    return old, new


def test_diff(lyra, pair):
    old, new = pair
    printed = lyra.json("diff", "--json", old, new)
    diff = zorlyra.diff(old, zorlyra.read(new))
    assert diff.to_dict() == {name: printed[name] for name in DIFF_CLASSES}
    assert diff.has_differences and diff.changed and diff.persisting
    assert len(diff) == len(diff.entries) == sum(len(printed[name]) for name in DIFF_CLASSES)
    change = diff.changed[0].changes[0]
    assert change.what == "value" and change.before != change.after and change.is_substantial
    assert [row["class"] for row in diff.to_records()] == [entry.kind for entry in diff.entries]
    assert not zorlyra.diff(old, old).has_differences
    with pytest.raises(ValueError):
        zorlyra.diff(old, new, tolerance=-1)


@pytest.mark.parametrize("by", [["parts"], ["product", "place"], ["assemblies", "parts"]], ids="-".join)
def test_group(lyra, samples, by):
    path = samples / "dissonance.clash.xml"
    groups = zorlyra.group(path, by=by, distance=20)
    assert [group.to_dict() for group in groups] == lyra.json(
        "group", "--json", "--by", ",".join(by), "--distance", "20", path)
    assert groups[0].by == by[0] and len(groups[0]) == len(groups[0].members)
    with pytest.raises(ValueError, match="weight"):
        zorlyra.group(path, by=["weight"])


def test_gate(lyra, pair, samples, tmp_path):
    old, new = pair
    policy = samples / "policy.toml"
    code = lyra.run  # the exit code is the verdict
    gate = zorlyra.gate(new, policy, old)
    for name, report in [("text", gate.text()), ("junit", gate.junit()), ("sarif", gate.sarif())]:
        code("gate", new, "--policy", policy, "--baseline", old, "--report", f"{name}={tmp_path / name}",
             code={"passed": 0, "nothing judged": 1, "failed": 3}[gate.verdict])
        assert (tmp_path / name).read_text() == report
    assert gate.passed == (gate.verdict == "passed")
    assert len(gate.limits) == len(json.loads(gate.sarif())["runs"][0]["tool"]["driver"]["rules"]) > 0
    with pytest.raises(ValueError, match="baseline"):
        zorlyra.gate(new, policy)
    broken = tmp_path / "broken.toml"
    broken.write_text("[[limit]]\nname = 'a'\nmax = 'many'\n")
    with pytest.raises(zorlyra.Error) as raised:
        zorlyra.gate(new, broken)
    assert (raised.value.file, raised.value.line) == (str(broken), 3)


def test_carry(lyra, pair, tmp_path):
    old, new = pair
    carried = zorlyra.carry(old, new, tmp_path / "module.xml")
    lyra.run("carry", old, new, "-o", tmp_path / "command.xml")
    assert (tmp_path / "module.xml").read_bytes() == (tmp_path / "command.xml").read_bytes()
    assert carried.carried > 0
    before = (tmp_path / "module.xml").read_bytes()
    with pytest.raises(zorlyra.Error):
        zorlyra.carry(tmp_path / "none.xml", new, tmp_path / "module.xml")
    assert (tmp_path / "module.xml").read_bytes() == before


def test_merge(lyra, samples, tmp_path):
    files = [samples / "as1.clash.xml", samples / "dissonance.clash.xml"]
    trace = zorlyra.merge(files, tmp_path / "module.xml", sum_counts=True)
    lyra.run("merge", *files, "--sum-counts", "-o", tmp_path / "command.xml")
    assert (tmp_path / "module.xml").read_bytes() == (tmp_path / "command.xml").read_bytes()
    assert trace
    with pytest.raises(ValueError):
        zorlyra.merge(files[:1], tmp_path / "module.xml")


@pytest.mark.skipif(not pathlib.Path(__file__).parents[2].joinpath("samples/as1-oc-214.stp").exists(), reason="no model")
def test_detect_and_publish(lyra, samples, tmp_path, monkeypatch):
    monkeypatch.setenv("SOURCE_DATE_EPOCH", "1700000000")
    monkeypatch.setenv("XDG_CACHE_HOME", str(tmp_path / "cache"))
    model = samples / "as1-oc-214.stp"
    seen = []
    found = zorlyra.detect(model, tmp_path / "module.xml", viewpoints=True, progress=lambda *step: seen.append(step))
    printed = lyra.run("detect", model, "--viewpoints", "-o", tmp_path / "command.xml")
    assert (tmp_path / "module.xml").read_bytes() == (tmp_path / "command.xml").read_bytes()
    assert printed.startswith(f"{found.clashes} clash")
    assert {work for work, _, _ in seen} == {"reading", "checking"}
    assert all(0 <= done <= most for _, done, most in seen)

    def stop(*_):
        raise InterruptedError("enough")

    with pytest.raises(InterruptedError, match="enough"):
        zorlyra.detect(model, tmp_path / "stopped.xml", progress=stop)
    assert not (tmp_path / "stopped.xml").exists()
    for wrong in [{"sheets": "paper"}, {"limit_time": 0}, {"limit_memory": 10**7}, {"jobs": 2000}]:
        with pytest.raises(ValueError, match=next(iter(wrong))):
            zorlyra.detect(model, tmp_path / "stopped.xml", **wrong)
    with pytest.raises(zorlyra.Error, match="takes more than 4 MB"):
        zorlyra.detect(model, tmp_path / "stopped.xml", limit_memory=4)
    settings = tmp_path / "settings"
    settings.mkdir()
    (settings / "ModelReading.toml").write_text("LimitMemory = 4\n")
    with monkeypatch.context() as other:
        other.setenv("ZOR_SETTINGS_PATH", str(settings))
        with pytest.raises(zorlyra.Error, match="takes more than 4 MB"):
            zorlyra.detect(model, tmp_path / "stopped.xml")
        zorlyra.detect(model, tmp_path / "limited.xml", viewpoints=True, limit_memory=2000, limit_time=100)
    assert (tmp_path / "limited.xml").read_bytes() == (tmp_path / "command.xml").read_bytes()

    seen.clear()
    only, size = ["type=contact"], (80, 60)
    made = zorlyra.publish(tmp_path / "module.xml", tmp_path / "module", model=model, only=only, size=size, jobs=2,
                           progress=lambda *step: seen.append(step))
    lyra.run("publish", tmp_path / "module.xml", "--model", model, "-o", tmp_path / "command", "--only", only[0],
             "--size", "80x60", "--jobs", "2")
    assert made.interferences == made.pictures == found.contacts > 0 and made.failures == 0
    files = sorted(p.relative_to(tmp_path / "command") for p in (tmp_path / "command").rglob("*") if p.is_file())
    assert len(files) > made.pictures
    for file in files:
        assert (tmp_path / "module" / file).read_bytes() == (tmp_path / "command" / file).read_bytes(), file
    assert seen[-1][0] == "drawing"
    sheet = tmp_path / "own.xsl"
    sheet.write_text('<xsl:stylesheet version="1.0" xmlns:xsl="http://www.w3.org/1999/XSL/Transform">'
                     '<xsl:template match="/"><html><body>own</body></html></xsl:template></xsl:stylesheet>')
    zorlyra.publish(tmp_path / "module.xml", tmp_path / "own", xsl=sheet, lang="fr")
    lyra.run("publish", tmp_path / "module.xml", "-o", tmp_path / "own-command", "--xsl", sheet, "--lang", "fr")
    assert (tmp_path / "own/index.html").read_bytes() == (tmp_path / "own-command/index.html").read_bytes()
    zorlyra.publish(tmp_path / "module.xml", tmp_path / "french", lang="fr", baseline=samples / "as1.clash.xml")
    lyra.run("publish", tmp_path / "module.xml", "-o", tmp_path / "french-command", "--lang", "fr",
             "--baseline", samples / "as1.clash.xml")
    french = (tmp_path / "french/index.html").read_bytes()
    assert french == (tmp_path / "french-command/index.html").read_bytes()
    with pytest.raises(ValueError, match="lang"):
        zorlyra.publish(tmp_path / "module.xml", tmp_path / "french", lang="latin")
    with pytest.raises(zorlyra.Error, match="no-model.stp"):
        zorlyra.publish(tmp_path / "module.xml", tmp_path / "twice", model=model, baseline=samples / "as1.clash.xml",
                        baseline_model=tmp_path / "no-model.stp", size=size)
    page = zorlyra.publish(tmp_path / "module.xml", tmp_path / "page.html").page
    assert pathlib.Path(page).read_bytes() != french
    assert pathlib.Path(page).read_bytes().startswith(b"<!DOCTYPE html>")
    with pytest.raises(InterruptedError):
        zorlyra.publish(tmp_path / "module.xml", tmp_path / "again", model=model, size=size, progress=stop)


def test_warnings_are_pythons_own(samples, tmp_path):
    model = tmp_path / "two.obj"
    model.write_text("mtllib missing.mtl\no a\nv 0 0 0\nv 1 0 0\nv 0 1 0\nf 1 2 3\n"
                     "o b\nv 0 0 1\nv 1 0 1\nv 0 1 1\nf 4 5 6\n")
    told = []
    zorlyra.detect(model, tmp_path / "two.xml", warn=told.append)
    with warnings.catch_warnings(record=True) as caught:
        warnings.simplefilter("always")
        zorlyra.detect(model, tmp_path / "two.xml")
    assert [str(warning.message) for warning in caught] == told
