import { make, makeButton, part, refill } from "./dom.js";
import { MARKS, SIDES, capital, counted, openWords, readyScenes } from "./words.js";

/** What sides are whose branch isn't known. */
const UNNAMED = { base: "before both", ours: "yours", theirs: "what is merged in" };

/** The line on top: which scene, how many conflicts are open, what the sides are, and what concerns all of them. */
export class Header {
    /**
     * @param {import("./state.js").PageState} page
     * @param {import("./steps.js").Steps} steps
     * @param {{finish: function, leave: function}} more
     */
    constructor(page, steps, more) {
        Object.assign(this, { page, steps, more });
        page.addEventListener("session", () => this.show());
        page.addEventListener("selection", () => this.showScene());
    }

    show() {
        const { page } = this;
        const title = page.canDecide ? "Settle conflicts" : page.isComparison ? "What changed" : "Review of a merge";
        part("title").textContent = title;
        document.title = page.session.total ? `${openWords(page.session)} · ${title}` : title;
        this.showScene();
        this.showCount();
        this.showSides();
        refill(part("steps"), this.makeSteps(), part("main"));
    }

    showScene() {
        const { session, scene } = this.page;
        if (session.scenes.length < 2) {
            refill(part("scenes"), session.scenes.map(({ path }) => make("span", { class: "scene" }, path)));
        } else {
            const choose = (event) => this.page.selectScene(Number(event.target.value));
            const select = make("select", { "aria-label": "Scene", "data-focus": "scene", onchange: choose },
                ...session.scenes.map((scene, at) => makeSceneOption(session, scene, at)));
            select.value = String(scene);
            refill(part("scenes"), [select]);
        }
        if (this.shownScene === scene) return;
        this.shownScene = scene;
        this.showSides();
    }

    showCount() {
        const { session } = this.page;
        const value = session.total - session.open;
        part("changes").replaceChildren(...this.makeChangeCounts());
        part("count").replaceChildren(...(session.total ? [make("strong", { id: "open-count" }, openWords(session)),
            make("progress", { max: session.total, value, "aria-label": "Settled conflicts" })] : []));
    }

    makeChangeCounts() {
        const sum = (mark) => this.page.session.scenes.reduce((all, { counts }) => all + (counts?.[mark] ?? 0), 0);
        const told = ["added", "removed", "changed", "moved"].filter((mark) => sum(mark) > 0);
        return told.map((mark) => make("span", { class: `mark mark-${mark}` },
            make("span", { class: "sign", "aria-hidden": "true" }, MARKS[mark].sign),
            `${sum(mark).toLocaleString("en")} ${MARKS[mark].word} `));
    }

    showSides() {
        const { page } = this;
        const scene = page.session.scenes[page.scene];
        const columns = page.columns.filter(({ side }) => side !== "result");
        const chips = columns.map(({ side, title, label }) => make("span", { class: `chip chip-${side}` },
            make("strong", {}, title), ` — ${label || UNNAMED[side]}`));
        part("sides").replaceChildren(...chips);
        part("sentence").textContent = scene?.sides ?? "";
    }

    makeSteps() {
        const { page, steps, more } = this;
        if (!page.canDecide) return [];
        const refuse = (reason) => steps.notices.happened(reason);
        const { canUndo, canRedo } = page.session;
        const undone = canUndo ? "" : "There is nothing to take back.";
        const redone = canRedo ? "" : "There is nothing to do again.";
        return [
            makeButton("Undo", () => steps.undo(), { key: "U", focus: "undo", reason: undone, onRefused: refuse }),
            makeButton("Redo", () => steps.redo(), { key: "R", focus: "redo", reason: redone, onRefused: refuse }),
            this.makeAllButtons(refuse), this.makeProposalButton(),
            makeButton("Leave", more.leave, { focus: "leave", title: "Stop here; all decisions are kept" }),
            makeButton("Finish", more.finish, { key: "F", focus: "finish", className: "primary",
                reason: this.whyNotFinish(), onRefused: refuse, title: "Write what is settled" }),
        ];
    }

    makeAllButtons(refuse) {
        const reason = this.page.session.open ? "" : "Nothing is open.";
        const buttons = SIDES.map((side) => makeButton(capital(side), () => this.steps.takeAll(side), {
            className: `take-${side}`, focus: `all-${side}`, reason, onRefused: refuse,
            title: `Take ${side} for all that is open`,
        }));
        return make("span", { class: "group", role: "group", "aria-label": "Take for all that is open" },
            make("span", { class: "group-name" }, "All open:"), ...buttons);
    }

    makeProposalButton() {
        const { proposed } = this.page.session;
        if (!proposed) return null;
        const title = "The same values were decided before; take the same sides again";
        const words = `Take ${proposed.toLocaleString("en")} as before`;
        return makeButton(words, () => this.steps.takeProposed(), { focus: "proposed", title, className: "proposal" });
    }

    /** Why there is nothing to write; empty if there is. */
    whyNotFinish() {
        const { open } = this.page.session;
        if (readyScenes(this.page.session).length) return "";
        if (open === 0) return "Both sides added the scene: look through it, and take it as it is, above.";
        return `${counted(open, "conflict")} ${open === 1 ? "is" : "are"} open. Decide ${open === 1 ? "it" : "them"} ` +
            "first, or leave: what is decided is kept.";
    }
}

/** One that can't be read is told by the problems, and can't be chosen. */
function makeSceneOption({ total }, { path, open, problem }, at) {
    const words = total ? `${path} (${open} open)` : path;
    return make("option", { value: String(at), disabled: Boolean(problem) }, words);
}
