import { make } from "./dom.js";
import { counted } from "./words.js";

const WAIT = 150;
const MOST_HITS = 50;

/**
 * A field that searches the scene by name, with the hits below it.
 * @param {import("./state.js").PageState} page
 * @param {function({id: string, way: string[]})} goTo
 */
export function makeSearch(page, goTo) {
    const input = make("input", {
        id: "search", type: "search", role: "combobox", placeholder: "Search by name  /", autocomplete: "off",
        "aria-label": "Search the scene by name", "aria-controls": "hits", "aria-autocomplete": "list",
        "aria-expanded": "false",
    });
    const hits = make("div", { id: "hits", role: "listbox", "aria-label": "Found", hidden: true });
    new Search(page, input, hits, goTo);
    return make("div", { class: "search" }, input, hits);
}

/** What a hit stands under, which tells it from others of its name. */
function whereOf(hit) {
    if (hit.names.length === 0) return "";
    return make("span", { class: "aside" }, ` in ${hit.names.join("/")}${hit.isShortened ? "/…" : ""}`);
}

class Search {
    constructor(page, input, hits, goTo) {
        Object.assign(this, { page, input, hits, goTo, found: [], at: -1, timer: 0 });
        input.addEventListener("input", () => this.askSoon());
        input.addEventListener("keydown", (event) => this.press(event));
        input.addEventListener("blur", () => this.close());
        hits.addEventListener("mousedown", (event) => this.click(event));
    }

    askSoon() {
        clearTimeout(this.timer);
        this.timer = setTimeout(() => this.ask(), WAIT);
    }

    async ask() {
        const text = this.input.value.trim();
        if (!text) return this.close();
        const query = { scene: this.page.scene, text, from: 0, count: MOST_HITS };
        const answer = await this.page.source.get("find", query).catch((failure) => ({ failure, total: 0, hits: [] }));
        if (text !== this.input.value.trim()) return;
        this.found = answer.hits;
        this.at = answer.hits.length ? 0 : -1;
        const rest = answer.total - answer.hits.length;
        this.show(answer.failure?.message ?? (answer.total === 0 ? "No object of this scene has such a name."
            : rest > 0 ? `… and ${counted(rest, "more object")}: type more of the name.` : ""));
    }

    show(words) {
        const options = this.found.map((hit, index) => make("div",
            { role: "option", id: `hit-${index}`, "data-at": index, "aria-selected": "false" }, hit.name, whereOf(hit)));
        this.hits.replaceChildren(...options, ...(words ? [make("p", { role: "status", class: "aside" }, words)] : []));
        this.hits.hidden = false;
        this.input.setAttribute("aria-expanded", "true");
        this.mark();
    }

    mark() {
        for (const option of this.hits.querySelectorAll('[role="option"]'))
            option.setAttribute("aria-selected", String(Number(option.dataset.at) === this.at));
        if (this.at < 0) return this.input.removeAttribute("aria-activedescendant");
        this.input.setAttribute("aria-activedescendant", `hit-${this.at}`);
        return document.getElementById(`hit-${this.at}`)?.scrollIntoView({ block: "nearest" });
    }

    press(event) {
        if (event.key === "Escape") this.close();
        else if (event.key === "Enter" && this.found[this.at]) this.take(this.found[this.at]);
        else if (event.key === "ArrowDown") this.at = Math.min(this.found.length - 1, this.at + 1);
        else if (event.key === "ArrowUp") this.at = Math.max(0, this.at - 1);
        else return;
        if (!this.hits.hidden) this.mark();
        event.preventDefault();
    }

    click(event) {
        event.preventDefault();
        const option = event.target.closest("[data-at]");
        if (option) this.take(this.found[Number(option.dataset.at)]);
    }

    take(hit) {
        this.close();
        this.goTo(hit);
    }

    close() {
        clearTimeout(this.timer);
        this.hits.hidden = true;
        this.input.setAttribute("aria-expanded", "false");
        this.input.removeAttribute("aria-activedescendant");
    }
}
