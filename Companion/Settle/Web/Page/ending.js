import { make, makeButton, part } from "./dom.js";
import { counted, readyScenes } from "./words.js";

/** How a session ends: what is settled is written, or everything is kept for another time. */
export class Ending {
    /**
     * @param {import("./state.js").PageState} page
     * @param {import("./steps.js").Steps} steps
     * @param {import("./notice.js").Notices} notices
     */
    constructor(page, steps, notices) {
        Object.assign(this, { page, steps, notices });
    }

    /** Asks whether the result is to be written. */
    askToFinish(reason) {
        if (reason) return this.notices.happened(reason);
        const ready = readyScenes(this.page.session);
        const { open, problems } = this.page.session;
        const left = problems.length ? `Left in it: ${counted(problems.length, "problem")}, told on top of the page.` : "";
        const words = open ? `${counted(open, "conflict")} in other scenes stay${open === 1 ? "s" : ""} open.` : "";
        return this.ask(`Write ${ready.length === 1 ? "the result" : counted(ready.length, "result")}?`, [
            make("p", {}, "Each takes the place of its scene's file, and version control is told that it is settled:"),
            make("ul", {}, ...ready.map(({ path }) => make("li", {}, path))),
            words ? make("p", {}, words) : null, left ? make("p", {}, make("strong", {}, left)) : null,
        ], makeButton("Write", () => this.finish(false), { className: "primary" }));
    }

    askToLeave() {
        const { session } = this.page;
        const settled = session.total - session.open;
        const kept = settled ? `What is decided (${settled} of ${session.total}) is kept.` : "Nothing is decided yet.";
        this.ask("Leave?", [make("p", {}, `${kept} The files stay as they are, and you can go on at any time.`)],
            makeButton("Leave", () => this.leave(), { className: "primary" }));
    }

    ask(title, told, button) {
        const dialog = part("ending");
        dialog.replaceChildren(make("h2", { id: "ending-title" }, title), ...told.filter(Boolean),
            make("p", { class: "dialog-buttons" }, button, makeButton("Not yet", () => dialog.close())));
        dialog.showModal();
        button.focus();
    }

    finish(overwrite) {
        part("ending").close();
        return this.steps.inTurn(async () => {
            const answer = await this.askLast(() => this.steps.post("finish", { overwrite }));
            if (answer.isOver) return this.end(finishedWords(answer.finished), answer);
            await this.page.load();
            await this.page.renewItem();
            return this.tellRest(answer, overwrite);
        });
    }

    /** Asks for what the program may end with, which is no loss of the connection then. */
    async askLast(ask) {
        let answer = null;
        this.page.source.stopWatching();
        try {
            answer = await ask();
        } finally {
            if (!answer?.isOver) this.notices.watch(this.page);
        }
        return answer;
    }

    /** What was written, what wasn't and why, where the session goes on. */
    tellRest(answer, overwrite) {
        const title = answer.finished.length ? finishedWords(answer.finished) : "Nothing was written";
        const close = makeButton("Go on", () => part("ending").close());
        const force = makeButton("Replace what was changed by hand", () => this.finish(true));
        part("ending").replaceChildren(make("h2", { id: "ending-title" }, title), listOf(answer.finished),
            listOf(answer.remarks), make("p", { class: "dialog-buttons" },
                ...(answer.changedByHand && !overwrite ? [force] : []), close));
        part("ending").showModal();
        close.focus();
    }

    leave() {
        part("ending").close();
        return this.steps.inTurn(async () => {
            const leave = async () => ({ ...await this.page.source.post("leave", {}), isOver: true });
            const { next } = await this.askLast(leave);
            this.end("You left; all decisions are kept", { finished: [], remarks: [], next });
        });
    }

    /** Takes everything from the page but what it came to. */
    end(title, { finished, remarks, next }) {
        this.notices.end();
        document.title = title;
        const heading = make("h1", { tabindex: "-1" }, title);
        document.body.replaceChildren(make("main", { class: "over" }, heading, listOf(finished), listOf(remarks),
            ...next.map((line) => make("p", {}, line)), make("p", { class: "aside" }, "This page may be closed.")));
        heading.focus();
    }
}

function finishedWords(finished) {
    const what = finished.length === 1 ? "The scene is" : `${finished.length} scenes are`;
    return `${what} settled and written`;
}

function listOf(lines) {
    return lines.length ? make("ul", {}, ...lines.map((line) => make("li", {}, line))) : null;
}
