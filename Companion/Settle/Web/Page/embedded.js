import { RequestFailure } from "./failure.js";

/** Answers requests from what the page itself holds: a review that is a single file, and decides nothing. */
export class EmbeddedSource {
    /** It holds what was touched, and what that stands under; nothing else can be asked for. */
    isWhole = false;

    /** @param {{session: object, conflicts: object[], scenes: object[]}} data */
    constructor(data) {
        this.data = data;
        this.children = data.scenes.map((scene) => byParent(scene.tree));
        this.nodes = data.scenes.map((scene) => new Map(scene.tree.map((node) => [node.id, node])));
    }

    /** Answers as ServerSource.get does. */
    async get(name, query = {}) {
        const { data } = this;
        if (name === "session") return data.session;
        if (name === "conflicts") return piece("items", data.conflicts, query);
        if (name === "tree") return piece("nodes", this.children[query.scene].get(query.parent ?? null) ?? [], query);
        if (name === "find") return this.find(query);
        if (name === "object") return this.object(query);
        return this.map(query);
    }

    /** Nobody is at the other end, and nobody is missed. */
    watch() {}

    find(query) {
        const text = query.text.toLocaleLowerCase();
        const found = this.data.scenes[query.scene].tree.filter((node) => node.name.toLocaleLowerCase().includes(text));
        const nameOf = (id) => this.nodes[query.scene].get(id)?.name ?? id;
        const hits = found.map((node) => {
            const way = this.wayTo(query.scene, node);
            return { id: node.id, name: node.name, way, names: way.map(nameOf) };
        });
        return piece("hits", hits, query);
    }

    wayTo(scene, node) {
        const way = [];
        for (let above = node.parent; above && !way.includes(above); above = this.nodes[scene].get(above)?.parent)
            way.unshift(above);
        return way;
    }

    /** The whole map from one side; of a scene that couldn't be read there is nothing. */
    map(query) {
        const { map } = this.data.scenes[query.scene];
        return map[query.view] ?? map;
    }

    object(query) {
        const object = this.data.scenes[query.scene].objects[query.id];
        if (!object) throw new RequestFailure("It is unchanged, and this file holds only what was changed.", 404);
        return object;
    }
}

function byParent(nodes) {
    const children = new Map();
    for (const node of nodes) {
        const parent = node.parent ?? null;
        if (!children.has(parent)) children.set(parent, []);
        children.get(parent).push(node);
    }
    return children;
}

function piece(name, all, query) {
    const from = query.from ?? 0;
    return { total: all.length, [name]: all.slice(from, from + (query.count ?? all.length)) };
}
