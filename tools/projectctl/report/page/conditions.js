// The conditions of `list`, by the words of its options. A link carries them: "#filter=label=Status%3DOpen&kind=file".

const linkBegin = '#filter=';

function noConditions() {
    return {
        paths: [], labels: [], absentLabels: [], kind: '', glob: '', isEntryPoint: false, isUnlabelled: false,
        change: '', search: '', sort: 'path', unknown: [],
    };
}

/** A choice of a label, {category, label}, in the words of `--label`; a UUID where a name is not enough. */
function choiceWords(model, choice) {
    const isUnique = (list, name) => list.filter((item) => item.name === name).length === 1;
    const category = model.categories[choice.category];
    const isNamed = category.name !== '' && !category.isDeleted && !category.name.includes('=') &&
        isUnique(model.categories, category.name);
    const first = isNamed ? category.name : category.uuid;
    if (choice.label === null) {
        return first;
    }
    const label = model.labels[choice.label];
    const siblings = model.labels.filter((other) => other.category === choice.category);
    const isLabelNamed = label.name !== '' && !label.isDeleted && isUnique(siblings, label.name);
    return `${first}=${isLabelNamed ? label.name : label.uuid}`;
}

/** @return null if the project has no such label. */
function choiceOf(model, words) {
    const equals = words.indexOf('=');
    const named = (item, name) => item.uuid === name || item.name === name;
    const categoryWord = equals < 0 ? words : words.slice(0, equals);
    const category = model.categories.findIndex((item) => named(item, categoryWord));
    if (category < 0 || equals < 0) {
        return category < 0 ? null : {category, label: null};
    }
    const label = model.labels.findIndex((item) => item.category === category && named(item, words.slice(equals + 1)));
    return label < 0 ? null : {category, label};
}

function shownChoice(model, choice) {
    return choice.label === null ? text('AnyLabelOf', isolated(shownName(categoryName(model, choice.category))))
                                 : shownLabel(model, choice.label);
}

/** The conditions as pairs of an option and its value; null for a flag. */
function optionsOf(model, conditions) {
    const result = [];
    conditions.labels.forEach((choice) => result.push(['label', choiceWords(model, choice)]));
    conditions.absentLabels.forEach((choice) => result.push(['no-label', choiceWords(model, choice)]));
    if (conditions.kind !== '') {
        result.push(['kind', conditions.kind]);
    }
    if (conditions.glob !== '') {
        result.push(['glob', conditions.glob]);
    }
    if (conditions.isEntryPoint) {
        result.push(['entry-points', null]);
    }
    if (conditions.isUnlabelled) {
        result.push(['unlabelled', null]);
    }
    return result;
}

function linkOf(model, conditions) {
    const parts = optionsOf(model, conditions);
    conditions.paths.forEach((path) => parts.push(['path', path]));
    for (const word of ['change', 'search']) {
        if (conditions[word] !== '') {
            parts.push([word, conditions[word]]);
        }
    }
    if (conditions.sort !== 'path') {
        parts.push(['sort', conditions.sort]);
    }
    return linkBegin + parts.map(([word, value]) => (value === null ? word : `${word}=${encodeName(value)}`)).join('&');
}

/** The link to one file or folder. */
function linkToPath(path) {
    return `${linkBegin}path=${encodeName(path)}`;
}

/** The same conditions as a call of the tool, from the root of the project. */
function commandOf(model, conditions) {
    const words = ['projectctl', 'list'];
    for (const [word, value] of optionsOf(model, conditions)) {
        words.push(`--${word}`, ...(value === null ? [] : [shellWord(value)]));
    }
    conditions.paths.forEach((path) => words.push(shellWord(path.startsWith('-') ? `./${path}` : path)));
    return words.join(' ');
}

/** Reads a link. Labels that the project does not have are in the list `unknown`. */
function conditionsOf(model, link) {
    const result = noConditions();
    const takers = {
        'label': (value) => takeChoice(model, value, result.labels, result.unknown),
        'no-label': (value) => takeChoice(model, value, result.absentLabels, result.unknown),
        'kind': (value) => { result.kind = value === 'file' || value === 'folder' ? value : ''; },
        'glob': (value) => { result.glob = value; },
        'entry-points': () => { result.isEntryPoint = true; },
        'unlabelled': () => { result.isUnlabelled = true; },
        'path': (value) => { result.paths.push(value); },
        'change': (value) => { result.change = changeWords.includes(value) ? value : ''; },
        'search': (value) => { result.search = value; },
        'sort': (value) => { result.sort = value; },
    };
    for (const part of link.slice(linkBegin.length).split('&')) {
        const equals = part.indexOf('=');
        const word = equals < 0 ? part : part.slice(0, equals);
        if (Object.hasOwn(takers, word)) {
            takers[word](equals < 0 ? '' : decodeName(part.slice(equals + 1)));
        }
    }
    return result;
}

function takeChoice(model, words, choices, unknown) {
    const choice = choiceOf(model, words);
    if (choice === null) {
        unknown.push(words);
    } else {
        choices.push(choice);
    }
}

/** @return for each set of labels, whether it meets the conditions on labels. */
function matchingLabelSets(model, conditions) {
    const has = (set, choice) => set.some((label) =>
        model.labels[label].category === choice.category && (choice.label === null || choice.label === label));
    return model.labelSets.map((set) =>
        conditions.labels.every((choice) => has(set, choice)) &&
        !conditions.absentLabels.some((choice) => has(set, choice)) &&
        (!conditions.isUnlabelled || set.length === 0));
}

/** Finds the entries that meet all conditions, in the order of `list`. */
function findEntries(model, conditions) {
    const sets = matchingLabelSets(model, conditions);
    const isInGlob = conditions.glob === '' ? null : globPredicate(conditions.glob);
    const searched = conditions.search.toLowerCase();
    const change = changeWords.indexOf(conditions.change);
    const isWithin = (path) => conditions.paths.some((folder) =>
        folder === '' || folder === '.' || path === folder || path.startsWith(`${folder}/`));
    const holds = (entry) => {
        const path = model.paths[entry];
        return (change >= 0 ? model.changeOf?.[entry] === change : !model.isRemoved(entry)) &&
            (conditions.kind === '' || (conditions.kind === 'folder') === (model.isFolder[entry] === 1)) &&
            (!conditions.isEntryPoint || model.isEntryPoint[entry] === 1) &&
            sets[model.labelSetOf[entry]] &&
            (conditions.paths.length === 0 || isWithin(path)) &&
            (searched === '' || shownName(path).toLowerCase().includes(searched)) &&
            (isInGlob === null || isInGlob(path));
    };
    const result = [];
    for (let entry = 0; entry < model.count; ++entry) {
        if (holds(entry)) {
            result.push(entry);
        }
    }
    return result;
}
