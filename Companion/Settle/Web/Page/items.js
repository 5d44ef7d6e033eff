const LIST_PIECE = 200;
const FAR = 2000;

/** The list of conflicts, of which only those pieces are fetched that somebody wants to see. */
export class ConflictItems {
    constructor(source) {
        this.source = source;
        this.total = 0;
        this.pieces = new Map();
    }

    get pieceSize() {
        return LIST_PIECE;
    }

    /** A step may change any of them. */
    forget(total) {
        this.total = total;
        this.pieces = new Map();
    }

    /**
     * @param {number} number of the piece
     * @returns {Promise<object[]>}
     */
    piece(number) {
        const known = this.pieces.get(number);
        if (known) return known;
        const { pieces } = this;
        const query = { from: number * LIST_PIECE, count: LIST_PIECE };
        const asked = this.source.get("conflicts", query).then((answer) => answer.items);
        pieces.set(number, asked);
        asked.catch(() => pieces.delete(number));
        return asked;
    }

    /** @returns {Promise<object|undefined>} the item at that place */
    async at(index) {
        if (index < 0 || index >= this.total) return undefined;
        return (await this.piece(Math.floor(index / LIST_PIECE)))[index % LIST_PIECE];
    }

    /**
     * The next item that is open, going round; `from` itself comes last.
     * @param {number} from
     * @param {1|-1} step
     * @returns {Promise<object|undefined>}
     */
    async nextOpen(from, step) {
        for (let tried = 1; tried <= this.total; ++tried) {
            const index = (from + step * tried + this.total * 2) % this.total;
            const item = await this.at(index);
            if (item?.isOpen) return item;
        }
        return undefined;
    }

    /**
     * Where an item of an earlier list stands now; steps can add others ahead of it.
     * @param {{index: number, scene: number, path: string}} item
     */
    async findAgain(item) {
        for (let away = 0; away <= Math.min(FAR, this.total); ++away) {
            for (const index of away === 0 ? [item.index] : [item.index + away, item.index - away]) {
                const found = await this.at(index);
                if (found && found.scene === item.scene && found.path === item.path) return found;
            }
        }
        return this.at(Math.min(item.index, this.total - 1));
    }
}
