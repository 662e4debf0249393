// The data of the page, as the tool wrote them, and what follows from them.

/** A column of numbers: as such, or as runs of a value and its count. */
function decodeColumn(column, length) {
    if (Array.isArray(column)) {
        return column;
    }
    const result = new Array(length);
    let at = 0;
    for (let i = 0; i < column.runs.length; i += 2) {
        result.fill(column.runs[i], at, at + column.runs[i + 1]);
        at += column.runs[i + 1];
    }
    return result;
}

/** Paths are stored as the length that each shares with the one before it, the rest, and the number of its ending. The
    rests are joined by slashes; before a rest that begins with a slash itself, there is an empty element. */
function decodePaths(entries) {
    const shared = decodeColumn(entries.shared, entries.count);
    const endingOf = decodeColumn(entries.endingOf, entries.count);
    const rests = decodeRests(entries);
    const result = new Array(entries.count);
    let previous = '';
    for (let i = 0; i < entries.count; ++i) {
        previous = previous.slice(0, shared[i]) + rests[i] + entries.endings[endingOf[i]];
        result[i] = previous;
    }
    return result;
}

function decodeRests(entries) {
    if (Array.isArray(entries.rests)) {
        return entries.rests;
    }
    const parts = entries.rests.split('/');
    const result = new Array(entries.count);
    for (let i = 0, at = 0; i < entries.count; ++i, ++at) {
        const isBelow = parts[at] === '';
        at += isBelow ? 1 : 0;
        result[i] = (isBelow ? '/' : '') + parts[at];
    }
    return result;
}

/** The nearest folder above each entry, -1 for the root. Entries are in the order of `list`: a folder is before its
    contents. */
function findParents(paths) {
    const result = new Int32Array(paths.length);
    const above = [];
    for (let i = 0; i < paths.length; ++i) {
        const path = paths[i];
        while (above.length > 0) {
            const folder = paths[above[above.length - 1]];
            if (path.charCodeAt(folder.length) === 47 && path.startsWith(folder)) {
                break;
            }
            above.pop();
        }
        result[i] = above.length > 0 ? above[above.length - 1] : -1;
        above.push(i);
    }
    return result;
}

/** A column that has values for files only; folders get 0. */
function spreadOverFiles(values, isFolder) {
    const result = new Float64Array(isFolder.length);
    for (let i = 0, at = 0; i < isFolder.length; ++i) {
        result[i] = isFolder[i] ? 0 : values[at++];
    }
    return result;
}

const changeWords = ['unchanged', 'added', 'removed', 'labels', 'content', 'renamed'];

function readModel() {
    const data = JSON.parse(document.getElementById('data').textContent);
    const {entries} = data;
    const {count} = entries;
    const paths = decodePaths(entries);
    const isFolder = Uint8Array.from(decodeColumn(entries.folders, count));
    const files = count - isFolder.reduce((sum, value) => sum + value, 0);
    const model = {
        ...data,
        count,
        paths,
        isFolder,
        parents: findParents(paths),
        sizes: spreadOverFiles(decodeColumn(entries.sizes, files), isFolder),
        lines: spreadOverFiles(decodeColumn(entries.lines, files), isFolder),
        labelSetOf: Uint32Array.from(decodeColumn(entries.labels, count)),
        changeOf: entries.changes ? Uint8Array.from(decodeColumn(entries.changes, count)) : null,
        setBefore: new Map(data.compare?.labelsBefore ?? []),
        pathBefore: new Map(data.compare?.pathsBefore ?? []),
        isEntryPoint: new Uint8Array(count),
    };
    const entryFiles = new Set(data.entryPoints.map((entry) => entry.path));
    paths.forEach((path, i) => {
        model.isEntryPoint[i] = entryFiles.has(path) ? 1 : 0;
    });
    model.labelsOf = (entry) => model.labelSets[model.labelSetOf[entry]];
    model.isRemoved = (entry) => model.changeOf !== null && model.changeOf[entry] === 2;
    return model;
}

function labelName(model, label) {
    const {name, uuid} = model.labels[label];
    return name === '' ? uuid : name;
}

function categoryName(model, category) {
    const {name, uuid} = model.categories[category];
    return name === '' ? uuid : name;
}

/** A label with its category. */
function shownLabel(model, label) {
    const category = shownName(categoryName(model, model.labels[label].category));
    return `${isolated(category)}: ${isolated(shownName(labelName(model, label)))}`;
}
