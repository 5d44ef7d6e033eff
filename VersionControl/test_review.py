"""What "ovrin review" shows, as a file and as a page, in repositories of git and Mercurial and without any.

    pytest-3 VersionControl/test_review.py --installed build/release/installed
"""

import json
import os
import pathlib
import re
import shutil
import signal
import subprocess
import urllib.error
import urllib.request

import pytest

from systems import Mercurial
from test_systems import HEADER, game_object, scene
from user import LEFT_OPEN

ODD_NAME = "the scene's \"$x\" <script> Träger.ovrin"
HOSTILE = "</script><script>alert(1)</script> <!-- \u2028 & \\"


def data_of(page):
    """What stands in a page that is one file. Nothing of it may end the element that it stands in."""
    (text,) = re.findall(r'<script type="application/json" id="data">([^<>&\u2028\u2029]*)</script>', page)
    assert len(re.findall("<script", page)) == len(re.findall("</script", page)) == 2
    assert "src=" not in page and "<link" not in page and "default-src 'none'" in page
    return json.loads(text)


def review(user, *words, **options):
    user.ovrin("review", "--html", "page.html", *words, **options)
    return data_of(user.read("page.html"))


def seen(data):
    """Of each scene, by path: its counts and the names and marks of all touched objects."""
    session = data["session"]["scenes"]
    return {about["path"]: (about["counts"], [(node["name"], node["mark"], node["by"]) for node in shown["tree"]])
            for about, shown in zip(session, data["scenes"])}


def counts(added=0, removed=0, changed=0, moved=0):
    return {"added": added, "removed": removed, "changed": changed, "moved": moved}


def test_the_working_tree_is_shown_against_the_last_commit(user):
    user.start()
    user.commit(scene("1 Lantern 1 20"), ODD_NAME)
    user.write(scene("2 Lamp 1 30"), ODD_NAME)
    user.git("add", "--all")
    user.write("other words\n", "readme")
    data = review(user)
    expected = {ODD_NAME: (counts(1, 1, 1), [("Lamp", "changed", "theirs"), ("Boat", "added", "theirs"),
                                             ("Boat", "removed", "theirs")])}
    assert seen(data) == seen(review(user, "--staged")) == seen(review(user, "HEAD", "--", ODD_NAME)) == expected
    assert data["session"]["versions"] == ["before", "after"] and data["session"]["mode"] == "review"
    assert data["session"]["scenes"][0]["labels"] == {"base": "HEAD", "ours": "HEAD", "theirs": "the working tree"}
    assert "1 file is not shown" in user.ovrin("review", "--html", "-") + user.words()
    rows = {row["property"]: row["values"] for row in data["scenes"][0]["objects"]["10"]["rows"]}
    assert rows["m_Name"]["base"]["text"] == "Lantern" and rows["m_Name"]["result"]["text"] == "Lamp"


def test_revisions_are_those_of_diff(user):
    user.start()
    for words in ("1 Lantern 1", "2 Lantern 1", "2 Lamp 1"):
        user.commit(scene(words))
    assert seen(review(user, "HEAD~2..HEAD^")) == seen(review(user, "HEAD~2", "HEAD^"))
    assert review(user, "HEAD^", "HEAD")["scenes"][0]["tree"][0]["name"] == "Lamp"
    assert user.ovrin("review", "--html", "none.html", "HEAD") == "" and not user.exists("none.html")
    assert "Nothing to review" in user.words()
    user.ovrin("review", "--html", "none.html", "nowhere", status=2)
    assert "nowhere" in user.words() and not user.exists("none.html")


def test_a_merge_shows_its_sides_whatever_was_committed(user):
    user.conflict(scene("1 Lantern 1"), scene("2 Lantern 3"), scene("5 Lamp 1"))
    (unmerged,) = review(user, "--staged", status=LEFT_OPEN)["session"]["scenes"]
    assert "isn't merged yet" in unmerged["problem"] and unmerged["problem"] in user.words()
    user.ovrin("settle", "--take", "theirs")
    user.git("commit", "-qm", "merged")
    data = review(user, "--merge", "HEAD")
    (item,) = data["conflicts"]
    assert (item["property"], item["words"]) == ("m_Layer", {"base": "1", "ours": "5", "theirs": "2"})
    rows = {row["property"]: row for row in data["scenes"][0]["objects"]["10"]["rows"]}
    assert [rows[name]["state"] for name in ("m_Layer", "m_Name", "m_Visible")] == ["open", "ours", "theirs"]
    assert rows["m_Layer"]["item"] == 0 and rows["m_Layer"]["values"]["result"]["text"] == "5"
    labels = data["session"]["scenes"][0]["labels"]
    assert labels["theirs"] == "topic" and "theirs is topic" in data["session"]["scenes"][0]["sides"]
    assert seen(review(user, "--merge", "HEAD", "--", "scene.ovrin")) == seen(data)
    user.ovrin("review", "--merge", "HEAD^", "--html", "-", status=2)
    assert "is no merge" in user.words()
    user.ovrin("review", "--merge", "HEAD", "--html", "-", "--", "readme", status=2)


def test_files_need_no_version_control(user):
    user.write(scene("1 Lantern 1"), "base.ovrin")
    user.write(scene("2 Lantern 1"), "ours.ovrin")
    user.write(HEADER + game_object(10, 3, json.dumps(HOSTILE), 1), "theirs.ovrin")
    (node,) = review(user, "base.ovrin", "theirs.ovrin")["scenes"][0]["tree"]
    assert node["name"].replace("\\u2028", "\u2028") == HOSTILE
    data = review(user, "base.ovrin", "ours.ovrin", "theirs.ovrin")
    assert data["session"]["versions"] == ["base", "ours", "theirs"] and data["session"]["open"] == 1
    assert seen(review(user, "/dev/null", "ours.ovrin"))["ours.ovrin"][0] == counts(added=1)
    user.write("<<<<<<< ours\n" + scene("2 Lantern 1"), "broken.ovrin")
    assert review(user, "base.ovrin", "broken.ovrin", status=LEFT_OPEN)["session"]["scenes"][0]["problem"]
    user.write(scene("1 Lantern 1") + "--- !o!1 &11\nGameObject: {\n", "broken.ovrin")
    assert "can't be read" in review(user, "base.ovrin", "broken.ovrin",
                                     status=LEFT_OPEN)["session"]["scenes"][0]["problem"]


def test_many_scenes_are_numbered_through(user):
    names = [f"s{number}.ovrin" for number in range(7)]
    user.start()
    for name in names:
        user.commit(scene("1 Lantern 1"), name)
    user.git("checkout", "-qb", "topic")
    for number, name in enumerate(names):
        user.commit(scene(f"2 Lantern {number}"), name)
    user.git("checkout", "-q", "main")
    for name in names:
        user.commit(scene("5 Lantern 9"), name)
    user.git("merge", "topic", fails=True)
    user.ovrin("settle", "--take", "ours")
    user.git("commit", "-qm", "merged")
    data = review(user, "--merge", "HEAD")
    assert [item["index"] for item in data["conflicts"]] == list(range(14 - 1))  # where both have 9 there is none
    assert [item["scene"] for item in data["conflicts"]] == sorted(item["scene"] for item in data["conflicts"])
    for item in data["conflicts"]:
        rows = data["scenes"][item["scene"]]["objects"]["10"]["rows"]
        assert [row["item"] for row in rows if row["property"] == item["property"]] == [item["index"]]


def test_mercurial_is_known(request, tmp_path):
    if not shutil.which("hg"):
        pytest.skip("hg is not installed")
    hg = Mercurial(os.path.abspath(request.config.getoption("--installed")), tmp_path)
    hg.start()
    hg.commit(scene("1 Lantern 1"), "a.ovrin")
    hg.write(scene("2 Lantern 1"), "a.ovrin")
    data = data_of(hg.run("ovrin", "review", "--html", "-"))
    assert seen(data) == {"a.ovrin": (counts(changed=1), [("Lantern", "changed", "theirs")])}
    assert data["session"]["scenes"][0]["labels"]["theirs"] == "the working copy"


@pytest.fixture(name="served")
def fixture_served(request, user):
    """A page of five scenes, as a function that asks for what stands below its address."""
    if not (pathlib.Path(request.config.getoption("--installed")) / "lib/ovrinmerge/ovrin-web").exists():
        pytest.skip("ovrin-web is not installed")
    user.start()
    for number in range(5):
        user.commit(scene(f"{number} Lantern 1"), f"s{number}.ovrin")
    for number in range(5):
        user.write(scene(f"{number} Lamp{number} 1"), f"s{number}.ovrin")
    with subprocess.Popen(["ovrin", "review", "--no-browser"], cwd=user.here, env=user.environment,
                          stderr=subprocess.PIPE, text=True) as process:
        address = re.search(r"http\S+", process.stderr.readline()).group()

        def ask(path):
            try:
                with urllib.request.urlopen(address + path, timeout=30) as answer:
                    return answer.status, answer.read().decode()
            except urllib.error.HTTPError as error:
                return error.code, error.read().decode()

        ask.process, ask.user = process, user
        yield ask
        process.send_signal(signal.SIGINT)
        process.wait(30)


def test_the_page_is_served_with_its_data(served):
    assert served("")[1].startswith("<!doctype html>") and "import " in served("main.js")[1]
    session = json.loads(served("api/session")[1])
    assert [about["path"] for about in session["scenes"]] == [f"s{number}.ovrin" for number in range(5)]
    for _ in range(2):
        for number in range(5):
            node = json.loads(served(f"api/tree?scene={number}")[1])["nodes"][0]
            assert (node["name"], node["mark"]) == (f"Lamp{number}", "changed")
    assert json.loads(served("api/object?scene=1&id=10")[1])["rows"][0]["values"]["base"]["text"] == "Lantern"
    assert json.loads(served("api/conflicts")[1]) == {"total": 0, "items": []}
    assert served("api/tree?scene=5")[0] == served("api/nothing?scene=0")[0] == served("readme")[0] == 404


def test_a_scene_whose_process_died_is_read_again(served):
    assert served("api/tree?scene=0")[0] == 200
    children = subprocess.run(["pgrep", "-P", str(served.process.pid), "-x", "ovrin"], stdout=subprocess.PIPE,
                              text=True, check=True).stdout.split()
    for child in children:
        os.kill(int(child), signal.SIGKILL)
    status, words = served("api/tree?scene=0")
    assert (status, "came to its end" in words) == (400, True)
    assert served("api/tree?scene=0")[0] == 200


def test_a_scene_that_was_changed_meanwhile_has_its_present_values(served):
    served.user.write("no scene\n", "s3.ovrin")
    status, words = served("api/tree?scene=3")
    assert status == 409 and "s3.ovrin" in words
    assert served("api/tree?scene=2")[0] == 200
