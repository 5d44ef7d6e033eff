const BRANCH_PIECE = 200;
const MOST_ASKED_AT_FIRST = 40;
const MOST_ROWS_AT_FIRST = 300;

/**
 * The branches of one scene's hierarchy that somebody opened: their nodes, fetched by pieces. Filters are "touched",
 * what was changed or is open; "open"; and "all".
 */
export class Branches {
    /**
     * @param {object} source
     * @param {number} scene
     * @param {string} filter
     */
    constructor(source, scene, filter) {
        Object.assign(this, { source, scene, filter, known: new Map(), opened: new Set() });
    }

    /** Opens what was touched, from the top down, as long as it isn't too much to look at. */
    async openTouched() {
        let rows = 0;
        let asked = 0;
        let level = [null];
        while (level.length && rows < MOST_ROWS_AT_FIRST && asked < MOST_ASKED_AT_FIRST) {
            level = level.slice(0, MOST_ASKED_AT_FIRST - asked);
            asked += level.length;
            const branches = await Promise.all(level.map((id) => this.load(id)));
            level.forEach((id) => id !== null && this.opened.add(id));
            const nodes = branches.flatMap((branch) => branch.nodes);
            rows += nodes.length;
            const isTouched = ({ children, below }) => children && below.changed + below.open > 0;
            level = nodes.filter(isTouched).map(({ id }) => id);
        }
    }

    /** Fetches the first piece of a branch, or one more of it. */
    async load(parent) {
        const branch = this.known.get(parent) ?? { total: Infinity, asked: 0, nodes: [] };
        this.known.set(parent, branch);
        if (branch.asked >= branch.total) return branch;
        const query = { scene: this.scene, from: branch.asked, count: BRANCH_PIECE };
        if (parent !== null) query.parent = parent;
        if (this.filter !== "all") query.changed = 1;
        const answer = await this.source.get("tree", query);
        const fits = (node) => this.filter !== "open" || node.open + node.below.open > 0;
        branch.asked = answer.nodes.length ? branch.asked + answer.nodes.length : answer.total;
        branch.total = answer.total;
        branch.nodes.push(...answer.nodes.filter(fits));
        return branch;
    }

    async open(id) {
        this.opened.add(id);
        if (!this.known.has(id)) await this.load(id);
    }

    close(id) {
        this.opened.delete(id);
    }

    /**
     * Opens the way to an object, and the pieces in which its parts stand.
     * @param {string[]} way ids from the top to its parent
     * @returns {Promise<boolean>} whether it is in sight now
     */
    async reveal(way, id) {
        let parent = null;
        for (const step of [...way, id]) {
            if (!(await this.find(parent, step))) return false;
            if (step !== id) await this.open(step);
            parent = step;
        }
        return true;
    }

    async find(parent, id) {
        let branch = this.known.get(parent) ?? await this.load(parent);
        while (!branch.nodes.some((node) => node.id === id)) {
            if (branch.asked >= branch.total) return false;
            branch = await this.load(parent);
        }
        return true;
    }

    /**
     * What is in sight, from top to bottom.
     * @returns {Array<{node: object|null, parent: string|null, level: number, at: number, of: number, rest: number}>}
     *     `node` is null for the row that stands for the `rest` of a branch
     */
    rows(parent = null, level = 1, rows = []) {
        const branch = this.known.get(parent);
        if (!branch) return rows;
        const rest = branch.total - branch.asked;
        const of = branch.nodes.length + rest;
        branch.nodes.forEach((node, index) => {
            rows.push({ node, parent, level, at: index + 1, of, rest: 0 });
            if (this.opened.has(node.id)) this.rows(node.id, level + 1, rows);
        });
        if (rest > 0) rows.push({ node: null, parent, level, at: branch.nodes.length + 1, of, rest });
        return rows;
    }

    /** The same branches, opened as these are, as they are after a step. */
    async renewed() {
        const renewed = new Branches(this.source, this.scene, this.filter);
        for (const [parent, branch] of this.known) {
            do await renewed.load(parent);
            while (renewed.known.get(parent).asked < Math.min(branch.asked, renewed.known.get(parent).total));
        }
        renewed.opened = this.opened;
        return renewed;
    }
}
