// The patterns of `list --glob`: * and ? do not match a slash, ** does as a whole element.

/** The characters of a text. A surrogate without its partner is a character of its own. */
function charactersOf(part) {
    return Array.from(part, (character) => character.codePointAt(0));
}

/** @return the characters between brackets and the place behind them; null if the closing bracket is missing. */
function characterClass(pattern, from) {
    let at = from;
    const isNegated = pattern[at] === 33 || pattern[at] === 94; // ! ^
    at += isNegated ? 1 : 0;
    const ranges = [];
    const take = () => {
        const isQuoted = pattern[at] === 92 && at + 1 < pattern.length; // backslash
        at += isQuoted ? 2 : 1;
        return pattern[at - 1];
    };
    while (at < pattern.length && (ranges.length === 0 || pattern[at] !== 93)) { // ]
        const first = take();
        const isRange = at + 1 < pattern.length && pattern[at] === 45 && pattern[at + 1] !== 93; // -
        at += isRange ? 1 : 0;
        ranges.push([first, isRange ? take() : first]);
    }
    if (at >= pattern.length) {
        return null;
    }
    const isListed = (character) => ranges.some(([first, last]) => first <= character && character <= last);
    return {end: at + 1, isMatch: (character) => isListed(character) !== isNegated};
}

/** The signs of an element: 'any' for *, otherwise a predicate of one character. */
function signsOf(element) {
    const pattern = charactersOf(element);
    const signs = [];
    for (let at = 0; at < pattern.length; ++at) {
        let literal = pattern[at];
        const found = literal === 91 ? characterClass(pattern, at + 1) : null; // [
        if (literal === 42) { // *
            if (signs[signs.length - 1] !== 'any') {
                signs.push('any');
            }
        } else if (literal === 63) { // ?
            signs.push(() => true);
        } else if (found !== null) {
            signs.push(found.isMatch);
            at = found.end - 1;
        } else {
            if (literal === 92 && at + 1 < pattern.length) {
                literal = pattern[++at];
            }
            signs.push((character) => character === literal);
        }
    }
    return signs;
}

/** Matches items with signs, of which 'any' stands for any number of items.
    @param isNonemptyAtEnd whether 'any' as the last sign needs an item. */
function matchesSigns(items, signs, isMatch, isNonemptyAtEnd) {
    let item = 0;
    let sign = 0;
    let anySign = -1;
    let afterAny = 0;
    while (item < items.length || sign < signs.length) {
        if (sign < signs.length && signs[sign] === 'any') {
            anySign = sign++;
            afterAny = item;
            if (isNonemptyAtEnd && sign === signs.length) {
                return item < items.length;
            }
        } else if (sign < signs.length && item < items.length && isMatch(signs[sign], items[item])) {
            ++sign;
            ++item;
        } else if (anySign < 0 || afterAny >= items.length) {
            return false;
        } else {
            item = ++afterAny;
            sign = anySign + 1;
        }
    }
    return true;
}

/** @return a predicate of paths. */
function globPredicate(pattern) {
    const elements = pattern.split('/').map((element) => (element === '**' ? 'any' : signsOf(element)));
    const matchesName = (signs, name) =>
        matchesSigns(charactersOf(name), signs, (sign, character) => sign(character), false);
    return (path) => matchesSigns(path.split('/'), elements, matchesName, true);
}
