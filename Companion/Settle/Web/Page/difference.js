/**
 * What became of a text: by lines where there are several, within what differs by words, and by characters within a
 * single word. The work is bounded: texts that have too little in common are shown as one removed and one added.
 */

const MOST_EDITS = 400;
const MOST_TOKENS = 20000;
const LEAST_IN_COMMON = 0.3;

function cutLines(text) {
    return text.match(/[^\n]*\n|[^\n]+/g) ?? [];
}

function cutWords(text) {
    return text.match(/\s|[\p{L}\p{N}_.+-]+|[^\s\p{L}\p{N}_.+-]/gu) ?? [];
}

function commonStart(before, after) {
    let count = 0;
    while (count < before.length && count < after.length && before[count] === after[count]) ++count;
    return count;
}

function commonEnd(before, after, start) {
    let count = 0;
    const most = Math.min(before.length, after.length) - start;
    while (count < most && before[before.length - 1 - count] === after[after.length - 1 - count]) ++count;
    return count;
}

/**
 * The furthest ends of the paths of 0, 1, 2... edits on each diagonal, up to those that reach both ends; null if there
 * are too many edits. The greedy search of Myers.
 */
function searchEdits(before, after) {
    const furthest = new Map([[1, 0]]);
    const rounds = [];
    for (let edits = 0; edits <= MOST_EDITS; ++edits) {
        rounds.push(new Map(furthest));
        for (let diagonal = -edits; diagonal <= edits; diagonal += 2) {
            const down = stepsDown(furthest, diagonal, edits);
            let x = down ? furthest.get(diagonal + 1) : furthest.get(diagonal - 1) + 1;
            while (x < before.length && x - diagonal < after.length && before[x] === after[x - diagonal]) ++x;
            furthest.set(diagonal, x);
            if (x >= before.length && x - diagonal >= after.length) return rounds;
        }
    }
    return null;
}

function stepsDown(furthest, diagonal, edits) {
    if (diagonal === -edits) return true;
    return diagonal !== edits && furthest.get(diagonal - 1) < furthest.get(diagonal + 1);
}

/** The path back from both ends, as pieces from the last to the first. */
function followBack(rounds, before, after) {
    const pieces = [];
    let x = before.length;
    let y = after.length;
    for (let edits = rounds.length - 1; edits >= 0; --edits) {
        const diagonal = x - y;
        const down = stepsDown(rounds[edits], diagonal, edits);
        const fromDiagonal = down ? diagonal + 1 : diagonal - 1;
        const fromX = edits === 0 ? 0 : rounds[edits].get(fromDiagonal);
        const startX = edits === 0 ? 0 : down ? fromX : fromX + 1;
        while (x > startX) pieces.push(["same", before[--x]]), --y;
        if (edits === 0) break;
        if (down) pieces.push(["added", after[--y]]);
        else pieces.push(["removed", before[--x]]);
    }
    return pieces;
}

function middlePieces(before, after) {
    const whole = [["removed", before.join("")], ["added", after.join("")]];
    if (before.length === 0 || after.length === 0) return whole;
    if (before.length + after.length > MOST_TOKENS) return whole;
    const rounds = searchEdits(before, after);
    return rounds ? followBack(rounds, before, after).reverse() : whole;
}

function joinPieces(pieces) {
    const joined = [];
    for (const [kind, text] of pieces) {
        if (text === "") continue;
        if (joined.length && joined.at(-1)[0] === kind) joined.at(-1)[1] += text;
        else joined.push([kind, text]);
    }
    return joined;
}

function compareBy(cut, before, after) {
    const old = cut(before);
    const young = cut(after);
    const start = commonStart(old, young);
    const end = commonEnd(old, young, start);
    const middle = middlePieces(old.slice(start, old.length - end), young.slice(start, young.length - end));
    const head = ["same", old.slice(0, start).join("")];
    const tail = ["same", old.slice(old.length - end).join("")];
    return joinPieces([head, ...middle, tail]);
}

/** What has little in common is read more easily as one text in the place of the other. */
function compareInside(before, after) {
    const isWord = !/\s/.test((before + after).trim());
    const pieces = compareBy(isWord ? Array.from : cutWords, before, after);
    const common = pieces.reduce((sum, [kind, text]) => sum + (kind === "same" ? text.trim().length : 0), 0);
    const isOther = common < LEAST_IN_COMMON * Math.max(before.length, after.length);
    return isOther ? joinPieces([["removed", before], ["added", after]]) : pieces;
}

/**
 * @param {string} before
 * @param {string} after
 * @returns {Array<[("same"|"removed"|"added"), string]>} pieces in order, of which neighbours differ in kind
 */
export function differenceOf(before, after) {
    const pieces = [];
    for (const piece of compareBy(cutLines, before, after)) {
        const isReplaced = piece[0] === "added" && pieces.at(-1)?.[0] === "removed";
        if (isReplaced) pieces.push(...compareInside(pieces.pop()[1], piece[1]));
        else pieces.push(piece);
    }
    return joinPieces(pieces);
}
