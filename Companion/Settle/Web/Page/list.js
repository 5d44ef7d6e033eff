import { make, part } from "./dom.js";
import { propertyWords, splitName } from "./words.js";

const ROW_HEIGHT = 48;

/**
 * The list of conflicts, grouped by object. It is made of pieces: those in sight are filled, others are empty and as
 * high as their rows would be, so that any number can be scrolled through.
 */
export class ConflictList {
    /** @param {import("./state.js").PageState} page */
    constructor(page) {
        this.page = page;
        this.blocks = [];
        this.box = make("div", { id: "conflicts", role: "listbox", tabindex: "0", "aria-label": "Conflicts" });
        this.box.addEventListener("keydown", (event) => this.press(event));
        this.box.addEventListener("click", (event) => this.click(event));
        const margin = { root: this.box, rootMargin: "800px" };
        this.watcher = new IntersectionObserver((entries) => entries.forEach((entry) => this.enter(entry)), margin);
        part("list").append(make("h2", {}, "Conflicts"), this.box);
        page.addEventListener("session", () => this.renew());
        page.addEventListener("selection", () => this.select());
    }

    /** Keeps what is in sight until its new rows are there. */
    renew() {
        const { items } = this.page;
        part("list").hidden = items.total === 0;
        const wanted = Math.ceil(items.total / items.pieceSize);
        while (this.blocks.length > wanted) this.blocks.pop().remove();
        while (this.blocks.length < wanted) this.addBlock();
        this.blocks.filter((block) => block.dataset.near).forEach((block) => this.fill(block));
    }

    addBlock() {
        const { items } = this.page;
        const number = this.blocks.length;
        const rows = Math.min(items.pieceSize, items.total - number * items.pieceSize);
        const block = make("div", { role: "presentation", class: "block", "data-number": number });
        block.style.height = `${rows * ROW_HEIGHT}px`;
        this.blocks.push(block);
        this.box.append(block);
        this.watcher.observe(block);
    }

    enter({ target, isIntersecting }) {
        if (isIntersecting) {
            target.dataset.near = "1";
            if (!target.firstChild) this.fill(target);
        } else if (target.dataset.near) {
            delete target.dataset.near;
            target.style.height = `${target.offsetHeight}px`;
            target.replaceChildren();
        }
    }

    async fill(block) {
        const { items } = this.page;
        const session = this.page.session;
        const conflicts = await items.piece(Number(block.dataset.number)).catch(() => null);
        if (!conflicts || session !== this.page.session || !block.dataset.near) return;
        block.replaceChildren(...this.makeGroups(conflicts));
        block.style.height = "";
        this.markSelected();
    }

    makeGroups(conflicts) {
        const made = [];
        let last = null;
        for (const item of conflicts) {
            if (this.page.session.scenes.length > 1 && item.scene !== last?.scene)
                made.push(make("div", { class: "list-scene", role: "presentation" }, this.sceneWords(item.scene)));
            if (!last || item.scene !== last.scene || item.id !== last.id) made.push(makeGroup(item));
            made.at(-1).append(this.makeOption(item));
            last = item;
        }
        return made;
    }

    sceneWords(scene) {
        const { path, open } = this.page.session.scenes[scene];
        return `${path} · ${open ? `${open} open` : "settled"}`;
    }

    makeOption(item) {
        return make("div", {
            role: "option", id: `item-${item.index}`, "data-index": item.index, class: `option ${stateClass(item)}`,
            "aria-selected": "false", "aria-setsize": this.page.items.total, "aria-posinset": item.index + 1,
        }, make("span", { class: "option-property" }, propertyWords(item.property)), makeBadge(item),
        make("span", { class: "option-what" }, item.what));
    }

    click(event) {
        const option = event.target.closest("[data-index]");
        if (option) this.page.selectItem(Number(option.dataset.index));
    }

    press(event) {
        const total = this.page.items.total;
        const at = this.page.item?.index ?? -1;
        const page = Math.max(1, Math.floor(this.box.clientHeight / ROW_HEIGHT) - 1);
        const targets = {
            ArrowDown: at + 1, ArrowUp: at - 1, PageDown: at + page, PageUp: at - page, Home: 0, End: total - 1,
        };
        if (!(event.key in targets) || event.ctrlKey || event.altKey || event.metaKey) return;
        event.preventDefault();
        this.page.selectItem(Math.min(total - 1, Math.max(0, targets[event.key])));
    }

    async select() {
        const { item, items } = this.page;
        if (!item || !this.blocks.length) return this.markSelected();
        const block = this.blocks[Math.floor(item.index / items.pieceSize)];
        if (!block.firstChild) {
            block.dataset.near = "1";
            await this.fill(block);
        }
        this.markSelected();
        document.getElementById(`item-${item.index}`)?.scrollIntoView({ block: "nearest" });
    }

    markSelected() {
        for (const option of this.box.querySelectorAll('[aria-selected="true"]'))
            option.setAttribute("aria-selected", "false");
        const row = this.page.item && document.getElementById(`item-${this.page.item.index}`);
        if (row) row.setAttribute("aria-selected", "true");
        if (row) this.box.setAttribute("aria-activedescendant", row.id);
        else this.box.removeAttribute("aria-activedescendant");
    }
}

function makeGroup(item) {
    const name = splitName(item.object || "The order of fields");
    return make("div", { role: "group", class: "list-group", "aria-label": item.heading || name.own },
        make("div", { class: "list-object", title: item.heading, "aria-hidden": "true" },
            make("span", { class: "own" }, name.own),
            make("span", { class: "above" }, name.above && ` in ${name.above}`)));
}

function stateClass(item) {
    return item.isOpen ? "is-open" : "is-settled";
}

/** The state in words and a shape; "followed" where a decision elsewhere settled it. */
function makeBadge(item) {
    const words = item.isOpen ? openState(item) : item.decided ?? "followed";
    const sign = item.isOpen ? "◆" : "✓";
    return make("span", { class: `badge badge-${item.isOpen ? "open" : item.decided ?? "followed"}` },
        make("span", { "aria-hidden": "true" }, sign), ` ${words}`);
}

function openState({ decided, proposed }) {
    if (decided) return `open, took ${decided}`;
    return proposed ? `open, before: ${proposed}` : "open";
}
