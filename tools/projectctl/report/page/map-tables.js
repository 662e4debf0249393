// The legend beside the map, and the table of the shares of each group in each folder.

const mostShownFolders = 200;

function showLegend(map) {
    const {colouring, shares} = map;
    byId('legendTitle').textContent = colouring.title;
    const counts = shares.countsIn(0);
    byId('legend').replaceChildren(...colouring.groups.map((group, i) => {
        const row = [swatch(group), element('bdi', {class: 'groupName'}, group.name),
            element('span', {class: 'number'}, shownNumber(counts[i]))];
        const link = linkOfGroup(map.model, group);
        return element('li', {}, link === null ? element('span', {}, ...row) : element('a', {href: link}, ...row));
    }));
}

/** The link to the files of a group. */
function linkOfGroup(model, group) {
    const conditions = {...noConditions(), kind: 'file'};
    if (group.change !== undefined) {
        conditions.change = group.change;
    } else if (group.choice !== undefined) {
        (group.isNone ? conditions.absentLabels : conditions.labels).push(group.choice);
    } else {
        return null;
    }
    return linkOf(model, conditions);
}

function showShares(map) {
    const {tree, shares, colouring, focus} = map;
    byId('sharesTitle').textContent = text('SharesOf', colouring.title);
    const isShown = (node) => tree.isFolder(node) && (colouring.showsRemoved || !map.model.isRemoved(node - 1));
    const folders = [focus, ...tree.childrenOf(focus).filter(isShown)];
    const shown = folders.slice(0, mostShownFolders + 1);
    const columns = [{title: text('Folder')}, {title: text('Files'), isNumber: true},
        ...colouring.groups.map((group) => ({title: group.name, isNumber: true}))];
    const rows = shown.map((node) => {
        const files = shares.filesIn(node);
        const cells = Array.from(shares.countsIn(node), (count) => shareCell(count, files));
        return [folderCell(map, node), shownNumber(files), ...cells];
    });
    const note = folders.length > shown.length
        ? element('p', {class: 'quiet'}, text('FirstOf', mostShownFolders, folders.length - 1)) : '';
    byId('sharesTable').replaceChildren(table(text('SharesCaption'), columns, rows), note);
}

function shareCell(count, files) {
    return count === 0 ? element('span', {class: 'nothing'}, '–')
        : element('span', {title: shownNumber(count)}, shownPercent(count / files));
}

function folderCell(map, node) {
    const name = node === 0 ? text('WholeProject') : shownName(map.tree.path(node));
    return node === map.focus ? element('bdi', {class: 'name'}, name)
        : element('button', {type: 'button', class: 'link', onclick: () => map.zoomTo(node)},
            element('bdi', {class: 'name'}, name));
}
