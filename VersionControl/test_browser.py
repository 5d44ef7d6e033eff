"""Settles scenes on the page in a real browser, by mouse and by keys.

    pytest-3 VersionControl/test_browser.py --installed build/release/installed

Pictures of all views are left in the folder that OVRIN_PICTURES names, or beside the installed tree.
"""

import json
import os
import pathlib
import socket

import pytest

from car import car, merge_cars
from harbour import HEADER, Scene, harbour
from page import Page
from test_settle import CONTRADICTION, LOOP
from user import LEFT_OPEN

try:
    from sight import Sight, start_browser
except ImportError:
    start_browser = None

SETTLE = "settle", "--web", "--no-browser"
MARKUP = ["<script>window.struck=1</script>", "<img src=x onerror=window.struck=1>",
          "</script><svg onload=window.struck=1>", "javascript:window.struck=1", "\\\" onfocus=window.struck=1 autofocus x=\\\""]


@pytest.fixture(name="driver", scope="module")
def fixture_driver():
    if start_browser is None:
        pytest.skip("what drives a browser from Python isn't installed: python3-selenium")
    try:
        socket.getaddrinfo("localhost", None)
    except OSError:
        pytest.skip("localhost has no address here, and nothing else leads to the browser's driver")
    driver = start_browser()
    if driver is None:
        pytest.skip("no browser that can be driven is installed: chromium and chromium-driver")
    yield driver
    driver.quit()


@pytest.fixture(name="pictures")
def fixture_pictures(request):
    beside = pathlib.Path(request.config.getoption("--installed")).resolve().parent / "pictures"
    folder = pathlib.Path(os.environ.get("OVRIN_PICTURES", beside))
    folder.mkdir(parents=True, exist_ok=True)
    return folder


@pytest.fixture(name="harbour_user")
def fixture_harbour_user(user):
    user.name = "Harbour.ovrin"
    user.conflict(*harbour())
    return user


def open_conflicts(user):
    return json.loads(user.ovrin("settle", "--list", "--json", status=LEFT_OPEN))["scenes"][0]["conflicts"]


def test_twenty_conflicts_are_settled_by_mouse_and_by_keys(harbour_user, driver):
    user = harbour_user
    paths = [conflict["path"] for conflict in open_conflicts(user)]
    with Page(user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        assert sight.open_count() == "20 of 20 open"
        assert not sight.driver.find_element("id", "problems").is_displayed()
        sight.click(".choice.take-ours")
        sight.wait_for_count("19 of 20 open")
        for number, key in enumerate("tbot"):
            sight.press(key)
            sight.wait_for_count(f"{18 - number} of 20 open")
        decided = [item["decided"] for item in page.get("conflicts?count=5")["items"]]
        sight.click("[data-focus='all-theirs']")
        sight.wait_for_count("All 20 settled")
        sight.press("f", sight.ENTER)
        assert "settled and written" in sight.heading("main.over h1") and "git commit" in sight.text("main.over")
        assert page.end()[0] == 0
        sight.check_errors()
    by_page = user.read()
    assert decided == ["ours", "theirs", "base", "ours", "theirs"]
    user.git("commit", "-qm", "merged")
    assert user.committed() == by_page

    user.git("reset", "-q", "--hard", "HEAD~1")
    user.git("merge", "topic", fails=True)
    for path, side in zip(paths, decided):
        user.ovrin("settle", "--set", f"{path}={side}", status=LEFT_OPEN)
    user.ovrin("settle", "--take", "theirs")
    assert user.read() == by_page


def test_undo_goes_back_to_the_conflict_and_redo_on(harbour_user, driver):
    with Page(harbour_user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        first = sight.text("#card-title")
        sight.press("o")
        sight.wait_for_count("19 of 20 open")
        sight.wait_until(lambda: sight.text("#card-title") != first)
        sight.press("u")
        sight.wait_for_count("20 of 20 open")
        sight.wait_until(lambda: sight.text("#card-title") == first)
        sight.press("u")
        sight.wait_until(lambda: sight.text("#happened") == "There is nothing to take back.")
        sight.press("r")
        sight.wait_for_count("19 of 20 open")
        assert page.get("conflicts?count=1")["items"][0]["decided"] == "ours"


def test_focus_stays_on_the_button_that_was_pressed(harbour_user, driver):
    with Page(harbour_user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        for number in (19, 18, 17):
            sight.focus(".choice.take-theirs")
            sight.press(sight.ENTER)
            sight.wait_for_count(f"{number} of 20 open")
            sight.wait_until(lambda: sight.focused("data-focus") == "take-theirs")
        sight.focus("[data-focus='undo']")
        for number in (18, 19, 20):
            sight.press(sight.ENTER)
            sight.wait_for_count(f"{number} of 20 open")
        assert sight.focused("data-focus") == "undo" and sight.focused("aria-disabled") == "true"
        sight.press(sight.ENTER)
        sight.wait_until(lambda: "nothing to take back" in sight.text("#happened"))


def test_component_goes_with_what_it_requires(user, driver):
    merge_cars(user)
    with Page(user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        assert "Remove Car · Engine and what needs it" in sight.text("#panel-values")
        sight.press("t")
        sight.wait_for_count("Settled")
        sight.press("f", sight.ENTER)
        assert "settled and written" in sight.heading("main.over h1")
        sight.check_errors()
    assert user.read() == car()


def test_loop_of_parents_that_is_left_open_says_why(user, driver):
    user.conflict(*LOOP)
    user.ovrin("settle", *CONTRADICTION, status=LEFT_OPEN)
    with Page(user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        sight.wait_until(lambda: "would still be below each other" in sight.text("#panel-values"))
        sight.wait_until(lambda: "Show in the hierarchy" in sight.text("#panel-values"))
        assert "Unchanged" not in sight.text("#panel-values")


def test_what_cannot_be_finished_yet_says_why(harbour_user, driver):
    with Page(harbour_user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        sight.press("f")
        sight.wait_until(lambda: "20 conflicts are open" in sight.text("#happened"))
        sight.click("[data-focus='finish']")
        sight.click("[data-focus='leave']")
        sight.press(sight.ENTER)
        assert "decisions are kept" in sight.heading("main.over h1")
        assert page.end()[0] == 1


def markup_scene(side):
    scene = Scene()
    for number, text in enumerate(MARKUP, 1):
        scene.place(100 * number, f'"{text}"')
        scene.component(100 * number + 2, 100 * number, "MonoBehaviour", m_Text=f'"{text} {side}"')
        if side:
            scene[100 * number + 1]["m_LocalPosition"] = f"{{x: {side}, y: 0, z: {number}}}"
    return scene.text()


def look_for_elements_of_markup(sight):
    for view in "231":
        sight.press_on_body(view)
        sight.settle_down()
    sight.press("/", "script", sight.settle_down, sight.ENTER, sight.settle_down)
    assert "<script>window.struck=1" in sight.text("#tree")
    assert sight.run("return window.struck") is None
    assert sight.run("return document.querySelectorAll('img, [onload], [onerror], [onfocus]').length") == 0
    sight.check_errors()


def test_names_and_values_that_are_markup_stay_text(user, driver):
    user.conflict(*map(markup_scene, range(3)))
    with Page(user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        sight.press("o", "T", "u", sight.settle_down)
        assert "<script>window.struck=1" in sight.text("#conflicts")
        look_for_elements_of_markup(sight)


def test_markup_stays_text_in_a_page_that_is_a_file(user, driver):
    user.sides(*map(markup_scene, range(3)))
    user.ovrin("review", "--html", "review.html", "main", "topic")
    look_for_elements_of_markup(Sight(driver, (user.here / "review.html").as_uri()))


@pytest.mark.parametrize("versions", [("main~1", "topic"), ("--merge", "HEAD")], ids=["comparison", "merge"])
def test_review_is_the_same_served_and_as_a_file_and_decides_nothing(user, driver, versions):
    user.conflict(*harbour(), "Harbour.ovrin")
    user.ovrin("settle", "--take", "theirs")
    user.git("commit", "-qm", "merged")
    user.ovrin("review", "--html", "review.html", *versions, status=None)
    file = Sight(driver, (user.here / "review.html").as_uri())
    seen = [file.views("values", "hierarchy"), file.buttons()]
    with Page(user, "review", "--no-browser", *versions) as page:
        served = Sight(driver, page.address)
        for shown in zip(seen, [served.views("values", "hierarchy"), served.buttons()]):
            assert shown[0] == shown[1]
        assert not seen[1] & {"Finish", "Undo", "Ours", "Theirs", "Leave"}
        served.check_errors()


def test_every_control_has_a_name_and_can_be_reached(harbour_user, driver):
    with Page(harbour_user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        for view in "123":
            sight.press_on_body(view)
            sight.settle_down()
            assert sight.nameless() == []
            reached = sight.tab_through()
            assert {"undo", "finish", "leave", "all-ours"} <= {place["focus"] for place in reached}
            assert {"conflicts", f"tab-{('values', 'hierarchy', 'map')[int(view) - 1]}"} <= {place["id"] for place in reached}
            assert all(place["isSeen"] for place in reached)
        assert sight.run("return document.querySelector('#happened').getAttribute('role')") == "status"


def test_keys_walk_through_the_hierarchy(harbour_user, driver):
    with Page(harbour_user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        sight.press_on_body("2")
        sight.wait_for("[role=treeitem]")
        sight.focus("[role=treeitem][tabindex='0']")
        sight.press(sight.HOME)
        assert sight.focused_text().startswith("▾Harbour")
        sight.press(sight.LEFT)
        sight.wait_until(lambda: sight.focused("aria-expanded") == "false")
        sight.press(sight.RIGHT, sight.settle_down, sight.RIGHT)
        assert sight.focused("aria-level") == "2" and "Pier" in sight.focused_text()
        sight.press(sight.ENTER)
        sight.wait_until(lambda: "Pier" in sight.text("#object-title"))


def test_lost_connection_is_told_and_no_key_fails_in_silence(harbour_user, driver):
    with Page(harbour_user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        sight.press("o")
        sight.wait_for_count("19 of 20 open")
        page.process.kill()
        sight.wait_until(lambda: "All decisions are kept" in sight.text("#lost"))
        sight.press_on_body("o")
        sight.wait_until(lambda: "Nothing was decided" in sight.text("#alert"))
    assert sum(conflict["state"] == "open" for conflict in open_conflicts(harbour_user)) == 19


def test_what_another_page_decided_is_shown_before_anything_else_is(harbour_user, driver):
    with Page(harbour_user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        page.step("take", item=0, side="base")
        sight.press("o")
        sight.wait_for_count("19 of 20 open")
        assert "decided elsewhere" in sight.text("#alert")
        assert page.get("conflicts?count=1")["items"][0]["decided"] == "base"


def test_what_follows_is_told(harbour_user, driver):
    with Page(harbour_user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        sight.choose("Buoy · Light")
        sight.press("o")
        sight.wait_until(lambda: "1 more decision followed" in sight.text("#happened"))


def test_problem_of_the_result_is_mended_by_a_button(harbour_user, driver):
    with Page(harbour_user, *SETTLE) as page:
        items = page.get("conflicts")["items"]
        for item in items:
            if item["property"].startswith("m_Target"):
                page.step("take", item=item["index"], side="ours")
            if item["object"].startswith("Harbour/Buoy"):
                page.step("take", item=item["index"], side="theirs")
        sight = Sight(driver, page.address)
        assert "m_Target refers to Harbour/Buoy, which was removed by theirs" in sight.text("#problems")
        sight.click_on("Keep Harbour/Buoy, too")
        sight.wait_until(lambda: "m_Target" not in sight.text("#problems"))
        assert sight.text("#happened").startswith("Keep Harbour/Buoy, too.")


def test_thousands_of_conflicts_are_fetched_as_they_come_into_sight(user, driver):
    def scene(layer):
        return HEADER + "".join(f"--- !o!1 &{number}\nGameObject:\n  m_Layer: {layer}\n  m_Name: Boat {number}\n"
                                for number in range(1, 3001))

    user.conflict(scene(1), scene(2), scene(3))
    with Page(user, *SETTLE) as page:
        sight = Sight(driver, page.address)
        assert sight.open_count() == "3,000 of 3,000 open"
        assert sight.run("return document.querySelectorAll('[role=option]').length") < 1000
        sight.focus("#conflicts")
        sight.press(sight.END)
        sight.wait_until(lambda: "Boat 3000" in sight.text("#card-title"))
        assert "Boat 3000" in sight.run("return document.querySelector('.option[aria-selected=true]').parentElement.textContent")
        sight.press("o")
        sight.wait_until(lambda: "Boat 1 " in sight.text("#card-title"))
        assert sight.run("return document.querySelectorAll('[role=option]').length") < 1000


@pytest.mark.parametrize("dark", [False, True], ids=["light", "dark"])
def test_pictures_of_all_views(harbour_user, driver, pictures, dark):
    name = "dark" if dark else "light"
    with Page(harbour_user, *SETTLE) as page:
        sight = Sight(driver, page.address, dark)
        sight.choose("Harbour lantern · Light")
        for number, view in enumerate(("values", "hierarchy", "map"), 1):
            sight.press_on_body(str(number))
            sight.settle_down()
            assert sight.run("return document.documentElement.scrollWidth <= innerWidth")
            driver.save_screenshot(str(pictures / f"{view}-{name}.png"))
        sight.press_on_body("?")
        driver.save_screenshot(str(pictures / f"help-{name}.png"))
        sight.check_errors()
