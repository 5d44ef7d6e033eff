import { make, makeButton, part } from "./dom.js";
import { VIEWS } from "./tabs.js";

/**
 * All keys of the page: what they are called, what they do, and whether they need something to be decided.
 * @returns {Array<{keys: string[], words: string, act: function, isStep?: boolean, isHint?: string}>}
 */
function listKeys(page, steps, ways) {
    const next = (direction) => goToOpen(page, steps, direction);
    const sides = [["o", "ours"], ["t", "theirs"], ["b", "base"]];
    const views = VIEWS.map(([view, title], at) =>
        ({ keys: [String(at + 1)], words: `the view ${title.toLowerCase()}`, act: () => page.show(view) }));
    return [
        { keys: ["j", "n"], words: "next open conflict", act: () => next(1), isHint: "next open" },
        { keys: ["k", "p"], words: "previous open conflict", act: () => next(-1), isHint: "previous" },
        ...sides.map(([key, side]) =>
            ({ keys: [key], words: `take ${side}`, act: () => steps.take(side), isStep: true, isHint: side })),
        ...sides.map(([key, side]) => ({
            keys: [key.toUpperCase()], words: `${side} for this object and all below it`,
            act: () => steps.takeUnder(side), isStep: true,
        })),
        { keys: ["u"], words: "undo", act: () => steps.undo(), isStep: true, isHint: "undo" },
        { keys: ["r"], words: "redo", act: () => steps.redo(), isStep: true },
        ...views,
        { keys: ["/"], words: "search the hierarchy by name", act: () => goToSearch(page), isHint: "search" },
        { keys: ["f"], words: "finish: write what is settled", act: ways.finish, isStep: true },
        { keys: ["?"], words: "this help", act: ways.help },
    ];
}

const ELSEWHERE = [
    ["Tab", "from one control to the next"],
    ["↑ ↓ Home End", "in the list: another conflict, open or not; in the hierarchy: another object"],
    ["← →", "in the hierarchy: close and open a branch; on the map: move it"],
    ["Enter", "in the hierarchy: the object's values; on the map: select"],
    ["+ − 0 , .", "on the map: zoom in, zoom out, show all, previous and next mark"],
];

/** Makes keys work wherever the focus is, but for where text is typed. */
export class Keys {
    constructor(page, steps, ways) {
        this.page = page;
        this.isOn = true;
        this.list = listKeys(page, steps, ways);
        document.addEventListener("keydown", (event) => this.press(event));
        page.addEventListener("session", () => this.showHints());
    }

    offered() {
        const { page } = this;
        const hasConflicts = page.session.total > 0;
        const needsConflict = (key) => key.keys[0] === "j" || key.keys[0] === "k";
        return this.list.filter((key) => (page.canDecide || !key.isStep) && (hasConflicts || !needsConflict(key)));
    }

    press(event) {
        if (!this.page.session || document.querySelector("dialog[open]") || event.defaultPrevented) return;
        if (event.target.matches("input, select, textarea")) return;
        const isUndo = (event.ctrlKey || event.metaKey) && event.key.toLowerCase() === "z";
        const name = isUndo ? (event.shiftKey ? "r" : "u") : event.key;
        if (!isUndo && (!this.isOn || event.ctrlKey || event.altKey || event.metaKey)) return;
        const key = this.offered().find(({ keys }) => keys.includes(name));
        // Held down, a key that decides would decide everything.
        if (!key || (event.repeat && key.isStep)) return;
        event.preventDefault();
        key.act();
    }

    showHints() {
        if (part("hints").firstChild) return;
        part("hints").append(...this.offered().filter(({ isHint }) => isHint).flatMap(({ keys, isHint }) =>
            [make("kbd", {}, keys[0]), ` ${isHint} `]),
        makeButton("All keys", () => this.help(), { key: "?", className: "quiet" }));
    }

    /** Opens the help, which tells all of them and can switch them off. */
    help() {
        const dialog = part("help");
        const box = make("input", { type: "checkbox", onchange: () => (this.isOn = box.checked) });
        box.checked = this.isOn;
        const rows = [...this.offered().map(({ keys, words }) => [keys.join(" "), words]), ...ELSEWHERE];
        dialog.replaceChildren(make("h2", { id: "help-title" }, "Keys"),
            make("dl", { class: "keys" }, ...rows.flatMap(([keys, words]) =>
                [make("dt", {}, ...keys.split(" ").map((key) => make("kbd", {}, key))), make("dd", {}, words)])),
            make("label", {}, box, " Single letters are keys"),
            make("p", { class: "dialog-buttons" },
                makeButton("Close", () => dialog.close(), { className: "primary" })));
        dialog.showModal();
    }
}

async function goToOpen(page, steps, direction) {
    const found = await page.items.nextOpen(page.item?.index ?? (direction > 0 ? -1 : 0), direction);
    if (found) return page.selectItem(found.index);
    return steps.notices.happened("Nothing is open.");
}

function goToSearch(page) {
    page.show("hierarchy");
    const field = part("search");
    field.focus();
    field.select();
}
