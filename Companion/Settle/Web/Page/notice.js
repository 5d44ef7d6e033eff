import { make, makeButton, part } from "./dom.js";

const ANEW = {
    settle: ["The program behind this page has ended. All decisions are kept: ", "ovrin settle --web", " goes on."],
    review: ["The program behind this page has ended: ", "ovrin review", " shows more again."],
};

/** Tells what happened: in the line below, which screen readers read out, or as an alert that stays. */
export class Notices {
    constructor() {
        this.isOver = false;
    }

    /** @param {string} words */
    happened(words) {
        part("happened").textContent = words;
    }

    /** @param {string} words what went wrong and what to do */
    alert(words) {
        const close = makeButton("Close", () => this.clear(), { className: "quiet" });
        part("alert").replaceChildren(make("p", {}, words), close);
    }

    clear() {
        if (part("alert").contains(document.activeElement)) part("main").focus();
        part("alert").replaceChildren();
    }

    /** Tells when the program ends, and when it is there again. */
    watch(page) {
        page.source.watch((isThere) => this.connection(isThere, page.session.mode));
    }

    /**
     * @param {boolean} isThere whether the program is
     * @param {"settle"|"review"} mode
     */
    connection(isThere, mode) {
        if (this.isOver) return;
        const [what, command, then] = ANEW[mode];
        const words = make("p", {}, make("strong", {}, "Not connected. "), what, make("code", {}, command), then);
        part("lost").replaceChildren(...(isThere ? [] : [words]));
    }

    /** From now on nobody expects an answer. */
    end() {
        this.isOver = true;
        part("lost").replaceChildren();
        this.clear();
    }
}
