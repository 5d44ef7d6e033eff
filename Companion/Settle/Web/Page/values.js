import { makeCard } from "./card.js";
import { make, makeButton, part, refill } from "./dom.js";
import { showValue } from "./value.js";
import { MARKS, capital, markWords, propertyWords, splitName } from "./words.js";

const STATES = {
    same: "unchanged", ours: "ours changed it", theirs: "theirs changed it", both: "both did the same", open: "open",
    settled: "settled",
};

/** The view of values: the selected conflict, and below it all fields of its object that differ. */
export class ValuesView {
    /**
     * @param {import("./state.js").PageState} page
     * @param {import("./steps.js").Steps} steps
     */
    constructor(page, steps) {
        Object.assign(this, { page, steps, panel: part("panel-values"), shown: null });
        this.follow = (id) => page.selectObject(page.scene, id);
        page.addEventListener("selection", () => this.show());
        page.addEventListener("view", () => this.show());
    }

    /** Shows at once what the list knows, and the values when they are there. */
    async show() {
        const { page } = this;
        if (page.view !== "values") return;
        const { scene, object, item } = page;
        const isCurrent = () => page.object === object && page.item === item && page.view === "values";
        const asked = object ? page.objectAt(scene, object) : Promise.resolve(null);
        const soon = await Promise.race([asked.catch(() => null), new Promise((done) => setTimeout(done, 60))]);
        if (!isCurrent()) return;
        this.render(soon ?? null, "");
        if (soon) return;
        const failure = await asked.then(() => "", (problem) => problem.message);
        if (isCurrent() && object) this.render(failure ? null : await asked, failure);
    }

    render(object, failure) {
        const { page, steps } = this;
        const row = object && page.item ? rowOf(object.rows, page.item.index) : null;
        const isOther = this.shown !== page.object;
        this.shown = page.object;
        const children = [];
        if (page.item) children.push(makeCard(page, steps, row, this.follow));
        if (object) children.push(this.makeObject(object, row));
        if (failure) children.push(make("p", { class: "empty" }, failure));
        if (!page.item && !page.object) children.push(make("p", { class: "empty" }, this.whatToSelect()));
        refill(this.panel, children, part("main"));
        if (isOther) this.panel.scrollTop = 0;
    }

    whatToSelect() {
        return "Nothing is selected. Choose an object in the hierarchy or on the map to see its values.";
    }

    /** The object with all fields but the one that stands above already. */
    makeObject(object, above) {
        const { page } = this;
        const { item } = page;
        const rows = object.rows.filter((row) => row !== above && (!item || row.item !== item.index));
        const none = above ? "No other field of it differs." : "None of its own fields differs.";
        // What another parent changes of a Transform is told of the object that it places.
        const isToldElsewhere = object.mark === "same" && object.rows.some(({ state }) => state !== "same");
        const mark = isToldElsewhere ? null : make("span", { class: `mark mark-${object.mark}` },
            make("span", { class: "sign", "aria-hidden": "true" }, MARKS[object.mark].sign),
            ` ${capital(markWords(object.mark, object.by, page.isComparison))}`);
        return make("section", { class: "object", "aria-labelledby": "object-title" },
            make("h2", { id: "object-title" }, above ? "Also in " : "", nameOf(object),
                make("span", { class: "label" }, ` ${object.id}`)), mark,
            makeButton("Show in the hierarchy", () => page.show("hierarchy"), { className: "quiet" }),
            this.makeWay(object), this.makeNames(object), this.makeParts(object),
            rows.length ? this.makeTable(rows) : make("p", { class: "empty" }, none),
            object.isShortened ? make("p", { class: "aside" }, "It has more fields than can be shown here.") : null);
    }

    makeWay(object) {
        const links = object.way.map(({ id, name }) => makeButton(name, () => this.follow(id), { className: "link" }));
        return links.length ? make("nav", { class: "way", "aria-label": "Stands in" },
            "in ", ...links.flatMap((link, at) => (at ? [" / ", link] : [link]))) : null;
    }

    /** The names that versions have for it; those of a component follow those of what it belongs to. */
    makeNames(object) {
        const columns = this.page.columns.filter(({ side }) => side in object.names);
        const names = new Set(columns.map(({ side }) => object.names[side]));
        const isPart = !names.has(null) && nameOf(object).includes(" · ");
        if (names.size < 2 || isPart) return null;
        const version = (title) => (this.page.isComparison ? title : `In ${title.toLowerCase()}`);
        return make("dl", { class: "names" }, ...columns.flatMap(({ side, title }) =>
            [make("dt", {}, version(title)), make("dd", {}, object.names[side] ?? "isn't there")]));
    }

    makeParts(object) {
        if (!object.parts.length) return null;
        const links = object.parts.map(({ id, name, mark, open }) => make("li", {},
            makeButton(name, () => this.follow(id), { className: "link" }),
            mark === "same" ? null
                : make("span", { class: `mark mark-${mark}` }, ` ${MARKS[mark].sign} ${MARKS[mark].word}`),
            open ? make("span", { class: "mark mark-open" }, ` ◆ ${open} open`) : null));
        return make("ul", { class: "parts", "aria-label": "Components" }, ...links);
    }

    makeTable(rows) {
        const { columns } = this.page;
        const heads = columns.map(({ side, title, label }) => make("th", { scope: "col", class: `head-${side}` }, title,
            label ? make("span", { class: "label" }, ` ${label}`) : null));
        return make("table", { class: "rows" },
            make("thead", {}, make("tr", {}, make("th", { scope: "col" }, "Field"), ...heads)),
            make("tbody", {}, ...rows.map((row) => this.makeRow(row, columns))));
    }

    makeRow(row, columns) {
        const { page } = this;
        const isSelected = row.item !== null && row.item === page.item?.index;
        const name = propertyWords(row.property);
        const title = row.item === null ? name
            : makeButton(name, () => page.selectItem(row.item), { className: "link", focus: `row-${row.item}` });
        const state = page.isComparison ? null : make("span", { class: `state state-${row.state}` }, STATES[row.state]);
        const cells = columns.map(({ side }) => this.makeCell(row, side));
        return make("tr", { class: `row-${row.state}`, "aria-current": isSelected ? "true" : null },
            make("th", { scope: "row" }, title, state), ...cells);
    }

    makeCell(row, side) {
        const value = row.values[side];
        const base = row.values.base;
        const isAsBase = side !== "base" && value && base && value.text === base.text;
        const before = side === "base" || side === "result" ? undefined : base;
        return make("td", { class: `cell-${side}${isAsBase ? " as-base" : ""}` },
            showValue(value, before, row.type, this.follow));
    }
}

/** The object's name in the version that comes first for people. */
function nameOf({ names, heading }) {
    return splitName(names.ours ?? names.theirs ?? names.base ?? heading).own;
}

/** The row of a conflict. Where it is about the id in a reference people see the whole reference. */
function rowOf(rows, item) {
    const row = rows.find((one) => one.item === item) ?? null;
    const whole = row?.property.endsWith(".fileID") ? row.property.slice(0, -".fileID".length) : null;
    return rows.find((one) => one.property === whole && one.type === "reference") ?? row;
}
