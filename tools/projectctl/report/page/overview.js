// The overview: the name, the counts, the last change, and the findings.

const sectionsOfCodes = [[/^(entry|group)-/u, '#entries'], [/^reference-/u, '#references'], [/^(category|label)/u, '#map']];
const mostShownFindings = 100;

function showOverview(model) {
    const {project} = model;
    const title = byId('title');
    title.append(nameElement(project.name === '' ? text('NoName') : project.name));
    byId('description').textContent = shownName(project.description).replaceAll('\\n', '\n');
    byId('description').hidden = project.description === '';
    byId('counts').append(...countsOf(model).flatMap(([key, value, link]) =>
        [element('div', {}, element('dt', {}, text(key)),
            element('dd', {}, link === null ? value : element('a', {href: link}, value)))]));
    const {lastChange} = project;
    byId('lastChange').append(...(lastChange === null ? [text('NotInGit')] : [
        text('LastChange', shownDate(lastChange.date)), ' ', element('bdi', {}, shownName(lastChange.author)), ': ',
        element('bdi', {}, shownName(lastChange.subject)), ' ', element('code', {}, lastChange.commit.slice(0, 10))]));
    showFindings(model);
}

function countsOf(model) {
    let files = 0;
    let folders = 0;
    let size = 0;
    let lines = 0;
    let labelled = 0;
    for (let entry = 0; entry < model.count; ++entry) {
        if (model.isRemoved(entry)) {
            continue;
        }
        model.isFolder[entry] ? ++folders : ++files;
        size += model.sizes[entry];
        lines += model.lines[entry];
        labelled += !model.isFolder[entry] && model.labelsOf(entry).length > 0 ? 1 : 0;
    }
    const share = files === 0 ? '–' : shownPercent(labelled / files);
    const link = (conditions) => linkOf(model, {...noConditions(), ...conditions});
    return [
        ['Files', shownNumber(files), link({kind: 'file'})], ['Folders', shownNumber(folders), link({kind: 'folder'})],
        ['Size', shownBytes(size), link({sort: '-size'})], ['Lines', shownNumber(lines), link({sort: '-lines'})],
        ['LabelledFiles', share, '#map'], ['EntryPoints', shownNumber(model.entryPoints.length), '#entries'],
        ['References', shownNumber(model.references.references.filter((reference) => reference.from === 0).length),
            '#references'],
    ];
}

function showFindings(model) {
    const place = byId('findings');
    const faults = model.findings.filter((finding) => finding.isFault).length;
    place.append(element('h2', {}, text('Findings')));
    if (model.findings.length === 0) {
        place.append(element('p', {class: 'sound'}, text('NoFindings')));
        return;
    }
    place.append(element('p', {class: 'quiet'}, text('FindingCounts', faults,
        model.findings.length - faults + model.omittedFindings)));
    const items = model.findings.map((finding) => element('li', {},
        element('span', {class: finding.isFault ? 'weight fault' : 'weight note'},
            text(finding.isFault ? 'Fault' : 'Note')),
        element('span', {class: 'source'}, finding.source),
        element('bdi', {class: 'name'}, shownFinding(finding)),
        element('a', {href: linkOfFinding(finding)}, text('Show'), element('span', {class: 'unseen'},
            ` ${shownFinding(finding)}`))));
    place.append(element('ul', {class: 'findings'}, ...items.slice(0, mostShownFindings)));
    if (items.length > mostShownFindings) {
        const rest = element('ul', {class: 'findings'}, ...items.slice(mostShownFindings));
        place.append(element('details', {}, element('summary', {}, text('MoreFindings', items.length - mostShownFindings)),
            rest));
    }
    if (model.omittedFindings > 0) {
        place.append(element('p', {class: 'quiet'}, text('OmittedFindings', model.omittedFindings)));
    }
}

function shownFinding(finding) {
    return finding.text === '' ? text(`Found_${finding.code}`, shownName(finding.path)) : shownName(finding.text);
}

function linkOfFinding(finding) {
    const section = sectionsOfCodes.find(([codes]) => codes.test(finding.code));
    return section !== undefined && section[1] !== '#map' ? section[1]
        : finding.path !== '' ? linkToPath(finding.path)
        : section !== undefined ? section[1] : '#files';
}
