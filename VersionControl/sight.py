"""A page as somebody sees and uses it in a real browser."""

import shutil
import time

from selenium import webdriver
from selenium.common.exceptions import NoSuchElementException, StaleElementReferenceException
from selenium.webdriver.chrome.service import Service
from selenium.webdriver.common.by import By
from selenium.webdriver.common.keys import Keys

SECONDS_TO_WAIT = 20

NAMELESS = """
const told = [];
for (const one of document.querySelectorAll(
    'button, select, input, [tabindex], [role=tree], [role=treeitem], [role=listbox], [role=option], [role=tabpanel]')) {
    if (!one.checkVisibility()) continue;
    const by = (name) => (one.getAttribute(name) ?? '').split(' ').map((id) => document.getElementById(id)?.textContent).join('');
    const name = one.getAttribute('aria-label') || by('aria-labelledby') || one.labels?.[0]?.textContent || one.textContent;
    const isForced = one.tabIndex < 0 && !one.hasAttribute('role');
    if (!isForced && !name.trim()) told.push(one.outerHTML);
}
return told;
"""

FOCUSED = """
const one = document.activeElement;
if (one === document.body) return null;
const style = getComputedStyle(one);
const isRinged = (place) => { const at = getComputedStyle(place); return at.outlineStyle !== 'none' || at.boxShadow !== 'none'; };
const box = one.getBoundingClientRect();
return { id: one.id, focus: one.dataset.focus ?? '', isSeen: box.width > 0 && box.left >= 0 && isRinged(one),
         key: one.outerHTML.slice(0, 200) };
"""


def start_browser():
    """A browser without a window, or None where none is installed."""
    program = shutil.which("chromium") or shutil.which("chromium-headless-shell")
    driver = shutil.which("chromedriver")
    if not program or not driver:
        return None
    options = webdriver.ChromeOptions()
    options.binary_location = program
    # Inside of containers the browser's own sandbox can't be had, and its shared memory is small.
    for argument in ("--headless=new", "--no-sandbox", "--disable-dev-shm-usage", "--disable-gpu", "--hide-scrollbars"):
        options.add_argument(argument)
    options.set_capability("goog:loggingPrefs", {"browser": "ALL"})
    return webdriver.Chrome(service=Service(driver), options=options)


class Sight:
    """What is done and seen on one page."""

    ENTER, HOME, END, LEFT, RIGHT = Keys.ENTER, Keys.HOME, Keys.END, Keys.ARROW_LEFT, Keys.ARROW_RIGHT

    def __init__(self, driver, address, dark=False):
        self.driver = driver
        driver.get("about:blank")
        driver.get_log("browser")
        driver.execute_cdp_cmd("Emulation.setDeviceMetricsOverride",
                               {"width": 1280, "height": 800, "deviceScaleFactor": 1, "mobile": False})
        scheme = {"name": "prefers-color-scheme", "value": "dark" if dark else "light"}
        driver.execute_cdp_cmd("Emulation.setEmulatedMedia", {"features": [scheme]})
        driver.get(address)
        self.wait_for(".card .result, .row")
        self.settle_down()

    def wait_until(self, holds):
        end = time.monotonic() + SECONDS_TO_WAIT
        while True:
            try:
                if holds():
                    return
            except (NoSuchElementException, StaleElementReferenceException):
                pass
            assert time.monotonic() < end, self.driver.find_element(By.TAG_NAME, "body").text
            time.sleep(0.02)

    def wait_for(self, selector):
        self.wait_until(lambda: self.driver.find_elements(By.CSS_SELECTOR, selector))

    def settle_down(self):
        """Waits until nothing changes any more."""
        seen = None
        while seen != (seen := self.run("return document.body.innerHTML")):
            time.sleep(0.25)

    def run(self, script):
        return self.driver.execute_script(script)

    def text(self, selector):
        return self.driver.find_element(By.CSS_SELECTOR, selector).text

    def heading(self, selector):
        self.wait_for(selector)
        return self.text(selector)

    def open_count(self):
        return self.text("#open-count")

    def wait_for_count(self, words):
        self.wait_until(lambda: self.open_count() == words)
        self.settle_down()

    def click(self, selector):
        self.driver.find_element(By.CSS_SELECTOR, selector).click()

    def click_on(self, words):
        """Clicks a button by what it says."""
        self.driver.find_element(By.XPATH, f"//button[text()='{words}']").click()

    def choose(self, name):
        """Selects the first conflict of an object by the mouse."""
        group = self.driver.find_element(By.XPATH, f"//div[@class='list-group'][div/span[text()='{name}']]")
        group.find_element(By.CSS_SELECTOR, "[role=option]").click()
        self.settle_down()

    def press(self, *keys):
        """Presses keys where the focus is; functions are called in between."""
        for key in keys:
            if callable(key):
                key()
            else:
                self.driver.switch_to.active_element.send_keys(key)

    def press_on_body(self, *keys):
        self.run("document.activeElement.blur()")
        self.press(*keys)

    def focus(self, selector):
        self.run(f"document.querySelector(`{selector}`).focus()")

    def focused(self, attribute):
        return self.driver.switch_to.active_element.get_attribute(attribute)

    def focused_text(self):
        return self.run("return document.activeElement.textContent")

    def views(self, *names):
        """The words of views, one after the other; all but what a page has that isn't a file."""
        told = []
        for name in names:
            self.click(f"#tab-{name}")
            self.settle_down()
            told.append(self.run(f"return document.querySelector('#panel-{name}').innerText.replace(/\\nEverything/, '').trim()"))
        return told

    def buttons(self):
        return set(self.run("return [...document.querySelectorAll('button')].map((one) => one.firstChild.textContent)"))

    def nameless(self):
        """The controls in sight that a screen reader could call nothing."""
        return self.run(NAMELESS)

    def tab_through(self):
        """What the tab key reaches, from the first to the last."""
        self.focus(".skip")
        reached = []
        while len(reached) < 200:
            self.press(Keys.TAB)
            place = self.run(FOCUSED)
            if place is None or place in reached:
                break
            reached.append(place)
        return reached

    def check_errors(self):
        """Nothing was refused by the content security policy or failed, as the browser tells."""
        told = [entry["message"] for entry in self.driver.get_log("browser") if entry["level"] != "DEBUG"]
        assert not told, told
