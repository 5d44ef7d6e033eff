import { ConflictItems } from "./items.js";
import { capital } from "./words.js";

const MOST_OBJECTS = 60;
const DEEPEST_LOOK = 30;

/**
 * What the page shows: the session as the program tells it, and what is selected. Views listen to its events:
 *
 *     session     something was decided, or the session was read again
 *     selection   another conflict, object or scene is selected
 *     view        another view is shown
 */
export class PageState extends EventTarget {
    constructor(source) {
        super();
        this.source = source;
        this.session = null;
        this.items = new ConflictItems(source);
        this.objects = new Map();
        this.scene = 0;
        this.object = null;
        this.item = null;
        this.view = "values";
        this.wanted = 0;
    }

    async load() {
        this.accept(await this.source.get("session"));
    }

    /** Takes a session over in place of an earlier one. */
    accept(session) {
        this.session = session;
        this.items.forget(session.total);
        this.objects.clear();
        this.tell("session");
    }

    get canDecide() {
        return this.session.mode === "settle";
    }

    /** Two versions are compared, and there are no sides. */
    get isComparison() {
        return this.session.versions.length === 2;
    }

    /** The columns of values: whose value, its title and the branch or commit. */
    get columns() {
        const labels = this.session.scenes[this.scene]?.labels ?? {};
        const column = (side, title) => ({ side, title, label: labels[side] ?? "" });
        if (this.isComparison) return [column("base", "Before"), column("theirs", "After")];
        return [...this.session.versions.map((side) => column(side, capital(side))), column("result", "Result")];
    }

    /** Selects a conflict and its object. */
    async selectItem(index) {
        const wanted = ++this.wanted;
        const item = await this.items.at(index);
        if (item && wanted === this.wanted) this.select(item.scene, item.id || null, item);
    }

    /** Selects an object, and the first of its conflicts that is open, or else its first one. */
    async selectObject(scene, id) {
        const wanted = ++this.wanted;
        this.select(scene, id, null);
        const object = await this.objectAt(scene, id).catch(() => null);
        const about = (object?.rows ?? []).map((row) => row.item).filter((index) => index !== null);
        const items = (await Promise.all(about.slice(0, 20).map((index) => this.items.at(index)))).filter(Boolean);
        const item = items.find((one) => one.isOpen) ?? items[0];
        if (item && wanted === this.wanted) this.select(scene, id, item);
    }

    /** Selects the first object of the scene that was touched, from the top. */
    async selectTouched() {
        let query = { scene: this.scene, from: 0, count: 1, changed: 1 };
        for (let level = 0; level < DEEPEST_LOOK; ++level) {
            const { nodes } = await this.source.get("tree", query).catch(() => ({ nodes: [] }));
            if (!nodes.length) return undefined;
            if (nodes[0].mark !== "same") return this.selectObject(this.scene, nodes[0].id);
            query = { ...query, parent: nodes[0].id };
        }
        return undefined;
    }

    select(scene, object, item) {
        Object.assign(this, { scene, object, item });
        this.tell("selection");
    }

    /** Shows another scene, with its first conflict. */
    async selectScene(scene) {
        const { scenes, total } = this.session;
        const before = scenes.slice(0, scene).reduce((sum, one) => sum + one.open + one.settled, 0);
        const first = before < total ? await this.items.at(before) : undefined;
        if (first?.scene === scene) return this.selectItem(before);
        this.select(scene, null, null);
        return this.selectTouched();
    }

    /** Reads the selected conflict again, which a step may have moved. */
    async renewItem() {
        const wanted = ++this.wanted;
        const item = this.item && (await this.items.findAgain(this.item));
        if (wanted === this.wanted) this.select(this.scene, this.object, item ?? null);
    }

    /**
     * What the program tells of an object. It is asked once, until something is decided.
     * @returns {Promise<object>}
     */
    objectAt(scene, id) {
        const key = `${scene} ${id}`;
        const known = this.objects.get(key);
        if (known) return known;
        const asked = this.source.get("object", { scene, id });
        if (this.objects.size >= MOST_OBJECTS) this.objects.delete(this.objects.keys().next().value);
        this.objects.set(key, asked);
        asked.catch(() => this.objects.delete(key));
        return asked;
    }

    show(view) {
        this.view = view;
        this.tell("view");
    }

    tell(name) {
        this.dispatchEvent(new Event(name));
    }
}
