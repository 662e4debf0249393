// The entry points by their groups.

function showEntries(model) {
    const place = byId('entriesContent');
    if (model.entryPoints.length === 0) {
        place.append(element('p', {class: 'quiet'}, text('NoEntryPoints')));
    }
    const known = new Set(model.groups.map((group) => group.uuid));
    const groups = [...model.groups, ...unknownGroups(model, known)];
    for (const group of groups) {
        const members = model.entryPoints.filter((entry) => entry.group === group.uuid);
        if (members.length > 0 || !group.isDefault) {
            place.append(groupTable(group, members));
        }
    }
}

function unknownGroups(model, known) {
    const uuids = new Set(model.entryPoints.map((entry) => entry.group).filter((uuid) => !known.has(uuid)));
    return [...uuids].map((uuid) => ({uuid, name: uuid, isDefault: false, isMissing: true}));
}

function groupTable(group, members) {
    const title = group.isMissing ? text('MissingGroup', shownName(group.name))
        : group.name === '' ? text('DefaultGroup') : shownName(group.name);
    const rows = members.map((entry) => [
        element('a', {href: linkToPath(entry.path)}, nameElement(entry.path)), nameElement(entry.name),
        shownName(entry.type), entry.isVisible ? '' : text('Hidden')]);
    return element('div', {class: 'scroll', tabindex: 0, role: 'group', 'aria-label': title},
        members.length === 0 ? element('p', {}, element('strong', {}, title), ` – ${text('EmptyGroup')}`)
            : table(title, [{title: text('File')}, {title: text('Name')}, {title: text('Type')},
                {title: text('Visibility')}], rows));
}
