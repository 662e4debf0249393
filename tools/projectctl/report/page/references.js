// The references to other projects: a picture of the graph, and the same as tables.

const nodeWidth = 190;
const nodeHeight = 50;
const columnGap = 90;
const rowGap = 22;
const mostDrawnProjects = 150;

function showReferences(model) {
    const place = byId('referencesContent');
    const {projects, references, projectPath} = model.references;
    if (references.length === 0 && projectPath.length === 0) {
        place.append(element('p', {class: 'quiet'}, text('NoReferences')));
        return;
    }
    if (references.length > 0) {
        if (projects.length <= mostDrawnProjects) {
            place.append(element('div', {class: 'scroll picture', tabindex: 0, role: 'group', 'aria-label': text('GraphLabel')},
                graphPicture(projects, references)), graphKey());
        } else {
            place.append(element('p', {class: 'quiet'}, text('GraphTooLarge', projects.length)));
        }
        place.append(referenceTable(projects, references));
    }
    if (projectPath.length > 0) {
        place.append(table(text('ProjectPath'), [{title: text('Folder')}, {title: text('Type')}],
            projectPath.map(({text: path, type}) => [nameElement(path), shownName(type)])));
    }
}

function projectTitle(project) {
    return shownName(project.name || nameOfPath(project.folder) || project.folder);
}

function referenceTable(projects, references) {
    const rows = references.map((reference) => {
        const target = projects[reference.to];
        const remarks = [target.state === 'project' ? '' : text(`State_${target.state}`),
            reference.closesCycle ? text('ClosesCycle') : ''].filter((words) => words !== '');
        return [element('bdi', {}, projectTitle(projects[reference.from])), element('bdi', {}, projectTitle(target)),
            nameElement(reference.text), shownName(reference.type),
            element('span', {class: remarks.length > 0 ? 'fault' : null}, remarks.join(', ') || text('Sound'))];
    });
    const titles = ['From', 'To', 'StoredPath', 'Type', 'State'].map((key) => ({title: text(key)}));
    return element('div', {class: 'scroll', tabindex: 0, role: 'group', 'aria-label': text('References')},
        table(text('ReferencesCaption'), titles, rows));
}

function graphKey() {
    const line = (attributes) => svg('svg', {width: 34, height: 12, 'aria-hidden': 'true'},
        svg('path', {d: 'M1 6H33', ...attributes}));
    return element('p', {class: 'quiet key'}, line({class: 'edge'}), ` ${text('KeyReference')}  `,
        line({class: 'edge cycle'}), ` ${text('KeyCycle')}  `, line({class: 'edge missing'}), ` ${text('KeyMissing')}`);
}

function graphPicture(projects, references) {
    const columns = orderLayers(layersOf(projects.length, references), references);
    const tallest = Math.max(...columns.map((column) => column.length));
    const height = tallest * (nodeHeight + rowGap) + rowGap;
    const places = new Map();
    columns.forEach((column, layer) => {
        const top = (height - column.length * (nodeHeight + rowGap) + rowGap) / 2;
        column.forEach((node, i) => places.set(node,
            {x: 10 + layer * (nodeWidth + columnGap), y: top + i * (nodeHeight + rowGap)}));
    });
    const width = columns.length * (nodeWidth + columnGap) - columnGap + 60;
    const arrow = (id, kind) => svg('marker',
        {id, viewBox: '0 0 10 10', refX: 9, refY: 5, markerWidth: 7, markerHeight: 7, orient: 'auto-start-reverse'},
        svg('path', {d: 'M0 1L10 5L0 9z', class: kind}));
    const hasCycles = references.some((reference) => reference.closesCycle);
    return svg('svg', {width, height: height + (hasCycles ? 40 : 0), role: 'img', 'aria-label': text('GraphLabel'), class: 'graph'},
        svg('defs', {}, arrow('arrow', 'arrowHead'), arrow('cycleArrow', 'arrowHead cycle'),
            arrow('missingArrow', 'arrowHead missing')),
        ...references.map((reference) => edge(reference, places, projects, height)),
        ...projects.map((project, i) => graphNode(project, places.get(i), i === 0)));
}

function edge(reference, places, projects, height) {
    const from = places.get(reference.from);
    const to = places.get(reference.to);
    const isMissing = projects[reference.to].state !== 'project';
    const kind = reference.closesCycle ? 'cycle' : isMissing ? 'missing' : '';
    return svg('path', {
        d: to.x > from.x ? forwardWay(from, to) : backwardWay(from, to, height),
        class: `edge ${kind}`.trim(),
        'marker-end': `url(#${reference.closesCycle ? 'cycleArrow' : isMissing ? 'missingArrow' : 'arrow'})`,
    });
}

function forwardWay(from, to) {
    const [x1, y1] = [from.x + nodeWidth, from.y + nodeHeight / 2];
    const [x2, y2] = [to.x - 2, to.y + nodeHeight / 2];
    const bend = Math.max(40, (x2 - x1) / 2);
    return `M${x1} ${y1}C${x1 + bend} ${y1} ${x2 - bend} ${y2} ${x2} ${y2}`;
}

/** Around the right side and below all nodes. */
function backwardWay(from, to, height) {
    const [x1, y1] = [from.x + nodeWidth, from.y + nodeHeight / 2];
    const [x2, y2] = [to.x + nodeWidth / 2, to.y + nodeHeight + 2];
    const low = height + 12;
    return `M${x1} ${y1}C${x1 + 60} ${y1} ${x1 + 60} ${low} ${x1 - 20} ${low}L${x2 + 30} ${low}Q${x2} ${low} ${x2} ${y2}`;
}

function graphNode(project, place, isFirst) {
    const kind = project.state === 'project' ? (isFirst ? 'node first' : 'node') : 'node missing';
    const shorten = (words, most) => {
        const characters = Array.from(words);
        return characters.length > most ? `${characters.slice(0, most - 1).join('')}…` : words;
    };
    const below = project.state === 'project' ? shownName(project.folder) : text(`State_${project.state}`);
    return svg('g', {class: kind, transform: `translate(${place.x} ${place.y})`},
        svg('title', {}, `${projectTitle(project)} – ${shownName(project.folder)} ${shownName(project.problem)}`.trim()),
        svg('rect', {width: nodeWidth, height: nodeHeight, rx: 8}),
        svg('text', {x: 12, y: 21, class: 'nodeName'}, isolated(shorten(projectTitle(project), 24))),
        svg('text', {x: 12, y: 38, class: 'nodePlace'}, isolated(shorten(below, 28))));
}
