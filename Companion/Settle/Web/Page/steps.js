import { capital, counted, fullName, openWords, propertyWords } from "./words.js";

const OUTDATED = "Something was decided elsewhere in the meantime, so nothing was changed now. " +
    "The page shows what holds; please decide again.";

/**
 * Makes steps one after the other: a key that is pressed while another step is on its way waits for it. Each step tells
 * what came of it.
 */
export class Steps {
    /**
     * @param {import("./state.js").PageState} page
     * @param {import("./notice.js").Notices} notices
     */
    constructor(page, notices) {
        this.page = page;
        this.notices = notices;
        this.queue = Promise.resolve();
        this.trail = [];
        this.position = 0;
    }

    /** Takes a side for the selected conflict, and goes on to the next one that is open. */
    take(side) {
        return this.inTurn(async () => {
            const { item } = this.page;
            if (!item) return this.notices.happened("No conflict is selected.");
            const name = fullName(item.object) || "the scene";
            const about = item.property ? propertyWords(item.property) : "The whole object";
            const what = `${about} of ${name}: ${side}.`;
            await this.step("take", { item: item.index, side }, what);
        });
    }

    /** The same for all open conflicts of the selected object and what stands under it. */
    takeUnder(side) {
        return this.inTurn(async () => {
            const { item } = this.page;
            if (!item) return this.notices.happened("No conflict is selected.");
            const words = `${fullName(item.object)} and what stands under it: ${side}.`;
            await this.step("take", { under: item.index, side }, words);
        });
    }

    takeAll(side) {
        return this.inTurn(() => this.step("take", { all: true, side }, `All that was open: ${side}.`));
    }

    takeProposed() {
        return this.inTurn(() => this.step("take", { proposed: true }, "Decided as before."));
    }

    /** Carries out what mends a problem of the result. */
    mend(problem, remedy, words) {
        return this.inTurn(() => this.step("take", { problem, remedy }, `${capital(words)}.`));
    }

    undo() {
        return this.inTurn(() => this.goBack("undo", "Taken back.", "There is nothing to take back.", -1));
    }

    redo() {
        return this.inTurn(() => this.goBack("redo", "Done again.", "There is nothing to do again.", 1));
    }

    inTurn(act) {
        this.queue = this.queue.then(act).catch((failure) => this.fail(failure));
        return this.queue;
    }

    async step(name, body, words) {
        const { page } = this;
        const from = page.item;
        const answer = await this.post(name, body);
        this.trail.splice(this.position, Infinity, from);
        this.position = this.trail.length;
        page.accept(answer.session);
        this.tell(words, answer);
        const next = from?.isOpen ? await page.items.nextOpen(from.index, 1) : undefined;
        if (next) await page.selectItem(next.index);
        else await page.renewItem();
    }

    async goBack(name, words, nothing, direction) {
        const { page } = this;
        if (!(name === "undo" ? page.session.canUndo : page.session.canRedo)) return this.notices.happened(nothing);
        const answer = await this.post(name, {});
        page.accept(answer.session);
        this.tell(words, answer);
        const at = direction < 0 ? this.position - 1 : this.position;
        this.position = Math.min(this.trail.length, Math.max(0, this.position + direction));
        if (this.trail[at]) page.item = this.trail[at];
        await page.renewItem();
        if (page.item) page.select(page.item.scene, page.item.id || null, page.item);
    }

    post(name, body) {
        this.notices.clear();
        return this.page.source.post(name, { ...body, revision: this.page.session.revision });
    }

    tell(words, answer) {
        const followed = answer.followed ? ` ${counted(answer.followed, "more decision")} followed from it.` : "";
        const finish = answer.session.isSettled ? " Finish (key F) writes the result." : "";
        this.notices.happened(`${words}${followed} ${openWords(answer.session)}.${finish}`);
    }

    async fail(failure) {
        if (failure.status === 409) {
            await this.page.load().catch(() => null);
            await this.page.renewItem().catch(() => null);
            return this.notices.alert(OUTDATED);
        }
        if (failure.status === 0) this.notices.connection(false, this.page.session.mode);
        return this.notices.alert(`Nothing was decided: ${failure.message}`);
    }
}
