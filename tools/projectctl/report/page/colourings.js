// The ways to colour the map: by the labels of a category, or by the changes since a revision. A colouring has groups
// and assigns some of them to each file.

function categoryColouring(model, category) {
    const counts = new Map();
    model.labels.forEach((label, i) => label.category === category && counts.set(i, 0));
    for (let entry = 0; entry < model.count; ++entry) {
        if (!model.isFolder[entry] && !model.isRemoved(entry)) {
            model.labelsOf(entry).forEach((label) => counts.has(label) && counts.set(label, counts.get(label) + 1));
        }
    }
    const labels = [...counts.keys()].sort((left, right) => counts.get(right) - counts.get(left) || left - right);
    const groups = labels.map((label, i) => ({
        name: shownName(labelName(model, label)), choice: {category, label}, ...colourOfGroup(i),
    }));
    const none = groups.push({
        name: text('NoLabel'), choice: {category, label: null}, isNone: true, colour: noLabelColour, pattern: 'plain',
    }) - 1;
    const groupOfLabel = new Map(labels.map((label, i) => [label, i]));
    const groupsOfSet = model.labelSets.map((set) => {
        const found = set.filter((label) => groupOfLabel.has(label)).map((label) => groupOfLabel.get(label));
        return found.length > 0 ? found : [none];
    });
    return {
        title: shownName(categoryName(model, category)),
        groups,
        showsRemoved: false,
        groupsOf: (entry) => groupsOfSet[model.labelSetOf[entry]],
    };
}

function changeColouring(model) {
    const groups = changeWords.map((word) => ({
        name: text(`Change_${word}`), change: word, colour: changeColours[word],
        pattern: word === 'removed' ? 'hatched' : 'plain',
    }));
    return {title: text('Changes'), groups, showsRemoved: true, groupsOf: (entry) => [model.changeOf[entry]]};
}

function plainColouring() {
    return {
        title: text('NoCategories'),
        groups: [{name: text('NoLabel'), colour: noLabelColour, pattern: 'plain'}],
        showsRemoved: false,
        groupsOf: () => [0],
    };
}

/** All colourings of a project as {title, create}; the first one is the default. */
function colouringsOf(model) {
    const result = model.changeOf === null
        ? [] : [{title: text('Changes'), create: () => changeColouring(model)}];
    model.categories.forEach((category, i) => {
        result.push({title: shownName(categoryName(model, i)), create: () => categoryColouring(model, i)});
    });
    return result.length > 0 ? result : [{title: text('NoCategories'), create: plainColouring}];
}
