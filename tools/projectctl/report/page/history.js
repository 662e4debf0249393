// The history of the definition: files and labels over time, from the revisions of its text.

const chart = {width: 860, height: 230, left: 56, right: 12, top: 12, bottom: 28};

function showHistory(model) {
    const place = byId('historyContent');
    const {versions, omitted} = model.history;
    if (versions.length === 0) {
        place.append(element('p', {class: 'quiet'}, text('NoHistory')));
        return;
    }
    place.append(lineChart(text('FilesOverTime'), versions, [
        {title: text('Files'), colour: groupColours[0], values: versions.map((version) => version.files)},
        {title: text('Folders'), colour: groupColours[1], values: versions.map((version) => version.folders)}]));
    const lines = labelLines(model);
    if (lines.length > 0) {
        place.append(lineChart(text('LabelsOverTime'), versions, lines));
    }
    if (omitted > 0) {
        place.append(element('p', {class: 'quiet'}, text('OmittedVersions', omitted)));
    }
    place.append(element('details', {}, element('summary', {}, text('HistoryTable')), historyTable(model)));
}

/** The labels that most files had, in any version. */
function labelLines(model) {
    const {versions, labels} = model.history;
    const most = labels.map((_, i) => Math.max(...versions.map((version) => countOfLabel(version, i))));
    return labels.map((_, i) => i).filter((i) => most[i] > 0).sort((left, right) => most[right] - most[left])
        .slice(0, groupColours.length).map((label, i) => ({
            title: `${isolated(shownName(labels[label].category))}: ${isolated(shownName(labels[label].name))}`,
            colour: groupColours[i],
            values: versions.map((version) => countOfLabel(version, label)),
        }));
}

function countOfLabel(version, label) {
    return version.labels.find(([index]) => index === label)?.[1] ?? 0;
}

function historyTable(model) {
    const rows = model.history.versions.map((version) => [
        shownDate(version.date), element('code', {}, version.commit.slice(0, 10)),
        element('bdi', {}, shownName(version.author)), element('bdi', {}, shownName(version.subject)),
        shownNumber(version.files), shownNumber(version.folders),
        shownNumber(version.labels.reduce((sum, [, count]) => sum + count, 0))]).reverse();
    const columns = ['Date', 'Commit', 'Author', 'Subject'].map((key) => ({title: text(key)}));
    const numbers = ['Files', 'Folders', 'LabelsOnFiles'].map((key) => ({title: text(key), isNumber: true}));
    return element('div', {class: 'scroll', tabindex: 0, role: 'group', 'aria-label': text('History')},
        table(text('HistoryCaption'), [...columns, ...numbers], rows));
}

/** A round number of steps up to at least a value. */
function axisSteps(most) {
    const rough = Math.max(most, 1) / 4;
    const power = 10 ** Math.floor(Math.log10(rough));
    const step = Math.max(1, [1, 2, 5, 10].map((factor) => factor * power).find((size) => size >= rough));
    return Array.from({length: Math.ceil(Math.max(most, 1) / step) + 1}, (_, i) => i * step);
}

/** Lines over time: from one version to the next, a value does not change. */
function lineChart(title, versions, lines) {
    const times = versions.map((version) => Date.parse(version.date));
    const [begin, end] = [Math.min(...times), Math.max(...times)];
    const steps = axisSteps(Math.max(...lines.flatMap((line) => line.values)));
    const innerWidth = chart.width - chart.left - chart.right;
    const innerHeight = chart.height - chart.top - chart.bottom;
    const x = (time) => chart.left + (end === begin ? innerWidth : ((time - begin) / (end - begin)) * innerWidth);
    const y = (value) => chart.top + innerHeight * (1 - value / steps[steps.length - 1]);
    const way = (values) => values.map((value, i) => {
        const [px, py] = [x(times[i]).toFixed(1), y(value).toFixed(1)];
        return i === 0 ? `M${chart.left} ${py}H${px}` : `H${px}V${py}`;
    }).join('');
    const grid = steps.flatMap((step) => [
        svg('path', {class: 'gridLine', d: `M${chart.left} ${y(step)}H${chart.width - chart.right}`}),
        svg('text', {class: 'axis', x: chart.left - 8, y: y(step) + 4, 'text-anchor': 'end'}, shownNumber(step))]);
    const dates = [
        svg('text', {class: 'axis', x: chart.left, y: chart.height - 8}, shownDate(versions[times.indexOf(begin)].date)),
        svg('text', {class: 'axis', x: chart.width - chart.right, y: chart.height - 8, 'text-anchor': 'end'},
            shownDate(versions[times.indexOf(end)].date))];
    const marks = lines.flatMap((line) => line.values.map((value, i) =>
        svg('circle', {cx: x(times[i]).toFixed(1), cy: y(value).toFixed(1), r: 3, fill: line.colour},
            svg('title', {}, `${line.title}: ${shownNumber(value)} – ${shownDate(versions[i].date)}`))));
    return element('figure', {class: 'chart'}, element('figcaption', {}, title),
        svg('svg', {viewBox: `0 0 ${chart.width} ${chart.height}`, role: 'img', 'aria-label': title}, ...grid, ...dates,
            ...lines.map((line) => svg('path', {class: 'line', stroke: line.colour, d: way(line.values)})), ...marks),
        element('ul', {class: 'key'}, ...lines.map((line) => element('li', {},
            swatch({colour: line.colour, pattern: 'plain'}), element('bdi', {}, line.title)))));
}
