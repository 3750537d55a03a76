"""Documents are read as the command reads them."""

import gc
import os
import threading

import pytest
from conftest import SOURCE

import zorlyra

FILES = sorted(
    [
        *(SOURCE / "samples").glob("*.clash.xml"),
        *(SOURCE / "samples/detected").glob("*.xml"),
        *(SOURCE / "samples/corpus").glob("*.xml"),
        *(SOURCE / "tests/golden/inputs").glob("*.xml"),
    ]
)
# The fields of `lyra list --json` that hold numbers.
NUMBERS = {"value", "clearance", "curveLength", "focusDistance", "near", "far"}
TRIPLES = {"point", "sight"}


def number(text):
    try:
        return float(text.replace(",", "."))
    except ValueError:
        return None


def with_numbers(field, value):
    """A value as the command prints it, with its numbers as numbers."""
    if isinstance(value, dict):
        return {key: with_numbers(key, inner) for key, inner in value.items()}
    if field == "points":
        return [[number(text) for text in point] for point in value]
    if field in TRIPLES:
        return [number(text) for text in value]
    if isinstance(value, list):
        return [with_numbers(field if field == "position" else None, inner) for inner in value]
    return number(value) if field in NUMBERS else value


def test_samples_are_there():
    assert len(FILES) > 30


@pytest.mark.parametrize("path", FILES, ids=lambda path: path.name)
def test_records_are_those_of_the_command(lyra, path):
    complaint = lyra.complaint("list", "--json", path)
    if complaint is not None:
        with pytest.raises(zorlyra.Error) as raised:
            zorlyra.read(path).to_records()
        assert str(raised.value) == complaint
        assert raised.value.file == str(path)
        return
    document = zorlyra.read(path)
    printed = lyra.json("list", "--json", path)
    assert document.to_records(as_written=True) == printed
    records = document.to_records()
    assert list(map(list, records)) == list(map(list, printed))  # the order of keys too
    assert records == with_numbers(None, printed)
    assert document.info() == lyra.info(path)
    assert document.specifications() == lyra.json("specs", "--json", path)
    assert [group.to_dict() for group in zorlyra.group(document)] == lyra.json("group", "--json", path)


@pytest.mark.parametrize("name", ["components", "federator", "errors"])
def test_other_documents_are_those_of_the_command(lyra, name):
    path = SOURCE / f"tests/golden/inputs/{name}.xml"
    document = zorlyra.read(str(path))
    assert document.info() == lyra.info(path)
    if name == "components":
        assert document.components() == lyra.json("components", "--json", path) != []
    if name == "federator":
        assert document.links() == lyra.json("links", "--json", path) != []
        assert [link["check"] for link in document.links(check=True)]


def test_fields_are_typed(samples):
    document = zorlyra.read(samples / "as1.clash.xml")
    assert document.kind == "ClashElement" and document.file.endswith("as1.clash.xml")
    records = document.to_records()
    assert len(document.interferences) == len(records) == sum(s.declared for s in document.results) > 0
    for interference, record in zip(document.interferences, records):
        assert isinstance(interference.value, float) and interference.value == record["value"]
        assert (interference.index, interference.id) == (record["index"], record["id"])
        assert (interference.type, interference.status) == (record["type"], record["status"])
        assert [p.alias for p in interference.products] == [p["alias"] for p in record["products"]]
        assert all(len(p.position) == 12 for p in interference.products)
        assert interference.points == record["geometry"]["points"]
        assert interference.to_dict() == record
    one = document.interferences[-1]
    assert one.to_dict() == records[-1] and document.interferences[len(records) - 1].id == one.id
    assert [i.index for i in document.interferences[1:6:2]] == [2, 4, 6]
    with pytest.raises(IndexError):
        document.interferences[len(records)]


def test_result_sets_have_their_interferences():
    document = zorlyra.read(SOURCE / "tests/golden/inputs/two_sets.xml")
    assert len(document.results) == 2
    found = [i.index for s in document.results for i in s.interferences]
    assert found == [i.index for i in document.interferences]
    for result in document.results:
        assert {i.result for i in result.interferences} <= {result.name}


def test_missing_is_none():
    interference = zorlyra.read(SOURCE / "samples/corpus/valid-without-attributes.xml").interferences[0]
    assert interference.value is None and interference.rule.clearance is None
    assert interference.viewpoint is None and interference.distance is None


def test_errors_say_where(tmp_path):
    path = tmp_path / "cut.xml"
    path.write_text("<ClashElement>\n  <ClashResult>\n</ClashElement>\n")
    with pytest.raises(zorlyra.Error) as raised:
        zorlyra.read(path)
    error = raised.value
    assert (error.file, error.line) == (str(path), 3) and error.column > 1
    assert str(error).startswith(f"{path}:3:{error.column}: ")
    with pytest.raises(zorlyra.Error) as raised:
        zorlyra.read(tmp_path / "none.xml")
    assert raised.value.file == str(tmp_path / "none.xml")
    assert raised.value.line is None and raised.value.column is None
    with pytest.raises(TypeError):
        zorlyra.read(3)


def test_paths_are_any_bytes(tmp_path, samples):
    path = os.fsencode(tmp_path) + b"/caf\xe9.xml"
    with open(path, "wb") as copy:
        copy.write((samples / "as1.clash.xml").read_bytes())
    assert len(zorlyra.read(path).interferences) == len(zorlyra.read(samples / "as1.clash.xml").interferences)


def test_interferences_outlive_their_document(samples):
    document = zorlyra.read(samples / "as1.clash.xml")
    interference, product = document.interferences[2], document.interferences[2].products[1]
    expected = document.to_records()[2]
    del document
    gc.collect()
    assert interference.to_dict() == expected and product.alias == expected["products"][1]["alias"]


def test_threads_take_turns(samples):
    expected = zorlyra.read(samples / "dissonance.clash.xml").to_records()
    answers = [None] * 4

    def work(place):
        for _ in range(3):
            answers[place] = zorlyra.read(samples / "dissonance.clash.xml").to_records()

    threads = [threading.Thread(target=work, args=(place,)) for place in range(4)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    assert answers == [expected] * 4
