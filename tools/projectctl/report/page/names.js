'use strict';

// Names are data: any sequence of UTF-16 code units, with a lone surrogate U+DC80..U+DCFF for each byte that is not
// valid UTF-8.

/** Characters that have no picture of their own, or that change the order of the text around them. */
const unshownCharacters =
    /[\u0000-\u001f\u007f-\u009f\u00ad\u061c\u200b-\u200f\u2028-\u202e\u2060-\u206f\ufeff\ufff9-\ufffb]/gu;
const loneSurrogates = /[\ud800-\udfff]/gu; // with the flag u, halves of a pair do not match

const letterEscapes = new Map([['\n', '\\n'], ['\r', '\\r'], ['\t', '\\t'], ['\b', '\\b'], ['\f', '\\f']]);

function hex(number, digits) {
    return number.toString(16).padStart(digits, '0');
}

/** The bytes of a name that are not valid UTF-8 appear as \x80, and invisible characters as escapes. */
function shownName(name) {
    return name
        .replace(unshownCharacters, (character) =>
            letterEscapes.get(character) ?? `\\u${hex(character.codePointAt(0), 4)}`)
        .replace(loneSurrogates, (surrogate) => {
            const code = surrogate.charCodeAt(0);
            return code >= 0xdc80 && code <= 0xdcff ? `\\x${hex(code - 0xdc00, 2)}` : '\ufffd';
        });
}

/** A text between others, whose direction then does not affect them. */
function isolated(shown) {
    return `\u2068${shown}\u2069`;
}

/** The last element of a path. */
function nameOfPath(path) {
    return path.slice(path.lastIndexOf('/') + 1);
}

/** A name in a link: the bytes that it has on disk, in percent encoding. */
function encodeName(name) {
    return name.replace(/[\ud800-\udfff]|[^\ud800-\udfff]+/gu, (part) => {
        const code = part.charCodeAt(0);
        const isByte = part.length === 1 && code >= 0xdc80 && code <= 0xdcff;
        const isLone = part.length === 1 && code >= 0xd800 && code <= 0xdfff;
        return isByte ? `%${hex(code - 0xdc00, 2)}` : encodeURIComponent(isLone ? '\ufffd' : part);
    });
}

function decodeName(encoded) {
    const bytes = [];
    for (const part of encoded.match(/%[0-9a-fA-F]{2}|[^%]+|%/gu) ?? []) {
        if (/^%[0-9a-fA-F]{2}$/u.test(part)) {
            bytes.push(parseInt(part.slice(1), 16));
        } else {
            bytes.push(...new TextEncoder().encode(part));
        }
    }
    return textOfBytes(Uint8Array.from(bytes));
}

/** The number of bytes that a valid character of UTF-8 has at a place; 0 if it is not valid. */
function lengthOfCharacter(bytes, at) {
    const first = bytes[at];
    const length = first < 0x80 ? 1 : first >= 0xf0 ? 4 : first >= 0xe0 ? 3 : 2;
    try {
        new TextDecoder('utf-8', {fatal: true}).decode(bytes.subarray(at, at + length));
        return length;
    } catch {
        return 0;
    }
}

function textOfBytes(bytes) {
    const decoder = new TextDecoder('utf-8', {fatal: true, ignoreBOM: true});
    let result = '';
    for (let at = 0; at < bytes.length;) {
        const length = lengthOfCharacter(bytes, at);
        result += length === 0 ? String.fromCharCode(0xdc00 + bytes[at])
                               : decoder.decode(bytes.subarray(at, at + length));
        at += Math.max(length, 1);
    }
    return result;
}

/** A word of a command line for a POSIX shell. */
function shellWord(word) {
    const hasBytes = /[\u0000-\u001f\u007f]|[\ud800-\udfff]/u.test(word);
    if (hasBytes) {
        const escaped = [...word].map((character) => {
            const code = character.codePointAt(0);
            if (code >= 0xdc80 && code <= 0xdcff) {
                return `\\x${hex(code - 0xdc00, 2)}`;
            }
            return code < 0x20 || code === 0x7f ? `\\x${hex(code, 2)}` : character.replace(/[\\']/u, '\\$&');
        });
        return `$'${escaped.join('')}'`;
    }
    return /^[\w@%+=:,.\/-]+$/u.test(word) ? word : `'${word.replaceAll("'", "'\\''")}'`;
}
