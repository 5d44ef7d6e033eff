import { make, part } from "./dom.js";

/** The views, in the order of their keys. */
export const VIEWS = [["values", "Values"], ["hierarchy", "Hierarchy"], ["map", "Map"]];

/**
 * The tabs of the views. One is shown at a time, and keeps what it shows.
 * @param {import("./state.js").PageState} page
 */
export function showTabs(page) {
    const tabs = VIEWS.map(([view, title], at) => make("button", {
        type: "button", role: "tab", id: `tab-${view}`, "aria-controls": `panel-${view}`, title: `Key ${at + 1}`,
        "aria-keyshortcuts": String(at + 1), onclick: () => page.show(view),
    }, title, make("kbd", { "aria-hidden": "true" }, String(at + 1))));
    const list = part("tabs");
    list.append(...tabs);
    list.hidden = false;
    list.addEventListener("keydown", (event) => {
        const step = { ArrowRight: 1, ArrowLeft: -1 }[event.key];
        if (!step) return;
        const at = VIEWS.findIndex(([view]) => view === page.view);
        page.show(VIEWS[(at + step + VIEWS.length) % VIEWS.length][0]);
        document.getElementById(`tab-${page.view}`).focus();
        event.preventDefault();
    });
    page.addEventListener("view", () => markTab(page));
}

function markTab(page) {
    for (const [view] of VIEWS) {
        const isShown = view === page.view;
        const tab = part(`tab-${view}`);
        tab.setAttribute("aria-selected", String(isShown));
        tab.setAttribute("tabindex", isShown ? "0" : "-1");
        const panel = part(`panel-${view}`);
        if (!isShown && panel.contains(document.activeElement)) tab.focus();
        panel.hidden = !isShown;
    }
}
