import { Branches } from "./branches.js";
import { make, part } from "./dom.js";
import { makeTreeRow } from "./treerow.js";
import { makeSearch } from "./search.js";

const FILTERS = { touched: "What was changed or is open", open: "What is open", all: "Everything" };

/** The view of the hierarchy. */
export class TreeView {
    /**
     * @param {import("./state.js").PageState} page
     * @param {import("./notice.js").Notices} notices
     */
    constructor(page, notices) {
        Object.assign(this, { page, notices, filter: "touched", branches: null, isStale: true });
        Object.assign(this, { focused: null, revealed: null });
        this.tree = make("div", { id: "tree", role: "tree", "aria-label": "Hierarchy of the scene" });
        this.tree.addEventListener("click", (event) => this.click(event));
        this.tree.addEventListener("dblclick", () => this.page.object && this.page.show("values"));
        this.tree.addEventListener("keydown", (event) => this.press(event));
        const bar = make("div", { class: "view-bar" }, makeSearch(page, (hit) => this.goTo(hit)), this.makeFilter());
        part("panel-hierarchy").append(bar, this.tree);
        // A selection follows each step; what it shows is asked for first.
        page.addEventListener("session", () => (this.isStale = true));
        page.addEventListener("selection", () => this.follow());
        page.addEventListener("view", () => this.follow());
    }

    makeFilter() {
        const { session, source } = this.page;
        const filters = session.total ? FILTERS : { touched: "What was changed", all: FILTERS.all };
        const offered = Object.entries(filters).filter(([name]) => name !== "all" || source.isWhole);
        this.select = make("select", { id: "filter", onchange: () => this.setFilter(this.select.value) },
            ...offered.map(([name, words]) => make("option", { value: name }, words)));
        return make("label", {}, "Show ", this.select);
    }

    async setFilter(filter) {
        this.filter = this.select.value = filter;
        this.branches = null;
        await this.follow();
    }

    /** Brings the tree up to date, and the selected object into sight. One call at a time; the last one counts. */
    follow() {
        if (this.page.view !== "hierarchy") return this.running;
        this.running = (this.running ?? Promise.resolve()).then(() => this.update())
            .catch((failure) => this.notices.alert(`The hierarchy can't be shown: ${failure.message}`));
        return this.running;
    }

    async update() {
        const { page } = this;
        if (!this.branches || this.branches.scene !== page.scene) {
            this.branches = new Branches(page.source, page.scene, this.filter);
            await this.branches.openTouched();
        } else if (this.isStale) {
            this.branches = await this.branches.renewed();
        }
        this.isStale = false;
        if (page.object && page.object !== this.revealed) await this.reveal(page.object);
        this.render();
    }

    async reveal(id) {
        const known = this.branches.rows().some(({ node }) => node?.id === id);
        const object = known ? null : await this.page.objectAt(this.page.scene, id).catch(() => null);
        if (object) await this.branches.reveal(object.way.map((above) => above.id), id);
        this.focused = this.revealed = id;
        this.isScrolled = false;
    }

    render() {
        const rows = this.branches.rows();
        const hadFocus = this.tree.contains(document.activeElement);
        const isThere = rows.some(({ node }) => node?.id === this.focused);
        if (!isThere) this.focused = rows[0]?.node?.id ?? null;
        const made = rows.map((row) => makeTreeRow(row, {
            isOpened: row.node !== null && this.branches.opened.has(row.node.id),
            isSelected: row.node !== null && row.node.id === this.page.object,
            isReached: row.node !== null && row.node.id === this.focused,
            isComparison: this.page.isComparison,
        }));
        if (made.length === 0) made.push(make("p", { class: "empty" }, this.emptyWords()));
        this.tree.replaceChildren(...made);
        const reached = this.reached();
        if (hadFocus) reached?.focus({ preventScroll: true });
        if (!this.isScrolled) reached?.scrollIntoView({ block: "nearest" });
        this.isScrolled = true;
    }

    emptyWords() {
        if (this.filter === "open") return "Nothing is open in this scene.";
        return this.filter === "all" ? "The scene has no objects." : "Nothing was changed in this scene.";
    }

    reached() {
        return this.tree.querySelector('[tabindex="0"]');
    }

    async toggle(id) {
        if (this.branches.opened.has(id)) this.branches.close(id);
        else await this.branches.open(id);
        this.render();
    }

    async showMore(parent) {
        await this.branches.load(parent || null);
        this.render();
    }

    choose(row) {
        this.focused = this.revealed = row.dataset.id;
        this.page.selectObject(this.page.scene, row.dataset.id);
    }

    click(event) {
        const row = event.target.closest('[role="treeitem"]');
        if (!row) return;
        this.setReached(row);
        if (row.dataset.rest) this.showMore(row.dataset.parent);
        else if (event.target.closest(".twist")) this.toggle(row.dataset.id);
        else this.choose(row);
    }

    setReached(row) {
        this.reached()?.setAttribute("tabindex", "-1");
        row.setAttribute("tabindex", "0");
        row.focus();
        if (row.dataset.id) this.focused = row.dataset.id;
    }

    press(event) {
        const row = event.target.closest('[role="treeitem"]');
        if (!row || event.ctrlKey || event.altKey || event.metaKey) return;
        if (!this.act(event.key, row)) return;
        event.preventDefault();
        event.stopPropagation();
    }

    /** What a key does on a row; false for one that does nothing. */
    act(key, row) {
        const isOpened = row.getAttribute("aria-expanded");
        if (key === "Enter" || key === " ") this.enter(key, row);
        else if (key === "ArrowRight" && isOpened === "false") this.toggle(row.dataset.id);
        else if (key === "ArrowLeft" && isOpened === "true") this.toggle(row.dataset.id);
        else {
            const target = neighbour(key, row);
            if (target) this.setReached(target);
            return target !== undefined;
        }
        return true;
    }

    enter(key, row) {
        if (row.dataset.rest) return this.showMore(row.dataset.parent);
        this.choose(row);
        if (key === "Enter") this.page.show("values");
    }

    /** Shows what was searched for, also if the filter would hide it. */
    async goTo(hit) {
        if (!this.branches || !(await this.branches.reveal(hit.way, hit.id))) {
            if (!this.page.source.isWhole) return;
            await this.setFilter("all");
            await this.branches.reveal(hit.way, hit.id);
        }
        this.focused = this.revealed = hit.id;
        this.isScrolled = false;
        this.render();
        await this.page.selectObject(this.page.scene, hit.id);
        this.reached()?.focus();
    }
}

/** The row that a key goes to; null where there is none, undefined for other keys. */
function neighbour(key, row) {
    const rows = row.parentElement.children;
    const level = (one) => Number(one.getAttribute("aria-level"));
    if (key === "ArrowDown") return row.nextElementSibling;
    if (key === "ArrowUp") return row.previousElementSibling;
    if (key === "Home") return rows[0];
    if (key === "End") return rows[rows.length - 1];
    if (key === "ArrowRight") return level(row.nextElementSibling ?? row) > level(row) ? row.nextElementSibling : null;
    if (key !== "ArrowLeft") return undefined;
    let above = row.previousElementSibling;
    while (above && level(above) >= level(row)) above = above.previousElementSibling;
    return above;
}
