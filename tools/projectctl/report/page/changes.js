// The changes of the definition since a revision.

function showChanges(model) {
    if (model.compare === null) {
        return;
    }
    byId('changes').hidden = false;
    const {compare} = model;
    const counts = changeWords.map((word, i) => ({word, count: countChange(model, i)})).slice(1);
    const place = byId('changesContent');
    place.append(
        element('p', {class: 'quiet'}, text('ComparedWith', shownName(compare.revision), compare.commit.slice(0, 10),
            shownDate(compare.date))),
        element('dl', {class: 'counts'}, ...counts.map(({word, count}) => element('div', {},
            element('dt', {}, text(`Change_${word}`)),
            element('dd', {}, element('a', {href: `${linkBegin}change=${word}`}, shownNumber(count)))))));
    const link = (entry) => element('a', {href: linkToPath(model.paths[entry])}, nameElement(model.paths[entry]));
    addTable('RenamedCaption', ['PathBefore', 'PathNow'], model.pathBefore,
        ([entry, before]) => [nameElement(before), link(entry)]);
    addTable('RelabelledCaption', ['Path', 'LabelsBefore', 'LabelsNow'], model.setBefore,
        ([entry, before]) => [link(entry), shownSet(model, model.labelSets[before]), shownSet(model, model.labelsOf(entry))]);
    if (compare.other.length > 0) {
        const rows = compare.other.map((change) =>
            [text(`What_${change.what}`), text(`Change_${change.change}`), shownSubject(change)]);
        place.append(table(text('OtherChanges'), [{title: text('What')}, {title: text('Change')}, {title: text('Name')}],
            rows));
    }

    function addTable(caption, titles, entries, rowOf) {
        if (entries.size > 0) {
            const rows = [...entries].slice(0, mostShownFindings).map(rowOf);
            const title = text(caption, rows.length, entries.size);
            place.append(element('div', {class: 'scroll', tabindex: 0, role: 'group', 'aria-label': title},
                table(title, titles.map((name) => ({title: text(name)})), rows)));
        }
    }
}

function countChange(model, change) {
    let result = 0;
    for (let entry = 0; entry < model.count; ++entry) {
        result += model.changeOf[entry] === change ? 1 : 0;
    }
    return result;
}

/** The name of something that changed, with its category and its earlier name if it has them. */
function shownSubject({name, category, earlier}) {
    const now = isolated(shownName(name));
    const whole = category === undefined ? now : `${isolated(shownName(category))}: ${now}`;
    return element('bdi', {}, earlier === undefined ? whole : text('NameBefore', whole, isolated(shownName(earlier))));
}

function shownSet(model, set) {
    const names = set.map((label) => shownLabel(model, label));
    return element('bdi', {}, names.length === 0 ? text('NoLabel') : names.join(', '));
}
