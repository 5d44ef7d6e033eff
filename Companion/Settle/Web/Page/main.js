import { part } from "./dom.js";
import { Ending } from "./ending.js";
import { Header } from "./header.js";
import { Keys } from "./keys.js";
import { ConflictList } from "./list.js";
import { MapView } from "./map.js";
import { Notices } from "./notice.js";
import { showProblems } from "./problems.js";
import { openSource } from "./source.js";
import { PageState } from "./state.js";
import { Steps } from "./steps.js";
import { showStrip } from "./strip.js";
import { showTabs } from "./tabs.js";
import { TreeView } from "./tree.js";
import { ValuesView } from "./values.js";

/** Puts the parts of the page together and shows the first picture. */
async function startPage() {
    const page = new PageState(openSource());
    const notices = new Notices();
    try {
        await page.load();
    } catch (failure) {
        part("title").textContent = "Nothing can be shown";
        notices.alert(failure.message);
        return;
    }
    buildPage(page, notices);
    page.tell("session");
    notices.watch(page);
    await showFirst(page);
}

function buildPage(page, notices) {
    const steps = new Steps(page, notices);
    const ending = new Ending(page, steps, notices);
    const ways = {
        finish: () => ending.askToFinish(header.whyNotFinish()),
        leave: () => ending.askToLeave(),
        help: () => keys.help(),
    };
    const header = new Header(page, steps, ways);
    const keys = new Keys(page, steps, ways);
    showProblems(page, steps);
    showTabs(page);
    new ConflictList(page);
    new ValuesView(page, steps);
    new TreeView(page, notices);
    new MapView(page, notices);
    showStrip(page, steps);
}

/** The first conflict that is open, or the first one; where there are none, the first object that was touched. */
async function showFirst(page) {
    const { total } = page.session;
    page.show(total ? "values" : "hierarchy");
    const first = (await page.items.nextOpen(-1, 1)) ?? (total ? await page.items.at(0) : null);
    if (first) await page.selectItem(first.index);
    else await page.selectTouched();
    if (!part("list").hidden && page.canDecide) part("conflicts").focus();
}

startPage();
