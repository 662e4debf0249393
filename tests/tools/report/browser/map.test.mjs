import assert from 'node:assert/strict';
import {test} from 'node:test';
import {drawn, textOf, textsOf, useBrowser, withPage} from './browser.mjs';
import {createEngine, report} from './projects.mjs';

createEngine();
const engine = report('engine');
const compared = report('engine', ['--compare', 'HEAD']);
useBrowser();

/** Copies the canvas, since reading a canvas slows its drawing down. */
const copyCanvas = (page) => page.evaluate(() => {
    const {canvas} = shownPage.map;
    const copy = new OffscreenCanvas(canvas.width, canvas.height).getContext('2d', {willReadFrequently: true});
    copy.drawImage(canvas, 0, 0);
    window.copiedMap = copy;
});

/** The tiles and folders on the map, and the colour in the middle of each tile. */
const picture = (page) => copyCanvas(page).then(() => page.evaluate(() => {
    const {map} = shownPage;
    const context = window.copiedMap;
    const scale = map.drawing.scale;
    return map.root.descendants().slice(1).map((node) => {
        const [r, g, b] = context.getImageData(
            Math.round((node.x1 - 4) * scale), Math.round((node.y1 - 4) * scale), 1, 1).data;
        return {
            path: map.tree.path(node.data.node), isTile: !node.children, x0: node.x0, y0: node.y0, x1: node.x1, y1: node.y1,
            colour: `#${[r, g, b].map((value) => value.toString(16).padStart(2, '0')).join('')}`,
        };
    });
}));

const chooseColour = (page, title) => page.evaluate((wanted) => {
    const select = document.getElementById('mapColour');
    select.value = [...select.options].find((option) => option.textContent === wanted).value;
    select.dispatchEvent(new Event('change'));
}, title);

const crumbs = (page) => textsOf(page, '#mapPath > *');

test('the map has a tile for each file, inside its folder and beside the others', () => withPage(engine, {}, async (page) => {
    const all = await picture(page);
    assert.deepEqual(all.filter((node) => node.isTile).map((node) => node.path).sort(),
        ['docs/readme.md', 'src/io/pump.cpp', 'src/io/valve.cpp', 'src/main.cpp', 'src/new.cpp', 'tools/clean.py']);
    const overlap = (one, other) => one.x0 < other.x1 && other.x0 < one.x1 && one.y0 < other.y1 && other.y0 < one.y1;
    const tiles = all.filter((node) => node.isTile);
    tiles.forEach((one, i) => tiles.slice(i + 1).forEach((other) =>
        assert.ok(!overlap(one, other), `${one.path} ${other.path}`)));
    for (const node of all) {
        const folder = all.find((other) => other.path === node.path.slice(0, node.path.lastIndexOf('/')));
        assert.ok(folder === undefined || (folder.x0 <= node.x0 && node.x1 <= folder.x1 && folder.y0 <= node.y0 &&
            node.y1 <= folder.y1), node.path);
    }
}));

test('areas follow the chosen measure', () => withPage(engine, {}, async (page) => {
    await page.select('#mapMeasure', 'lines');
    const area = Object.fromEntries((await picture(page)).map((node) =>
        [node.path, (node.x1 - node.x0) * (node.y1 - node.y0)]));
    assert.ok(area['src/main.cpp'] > 1.5 * area['src/io/pump.cpp']);
    assert.ok(area['src/io/pump.cpp'] > area['src/io/valve.cpp']);
    await page.select('#mapMeasure', 'count');
    const counted = Object.fromEntries((await picture(page)).map((node) =>
        [node.path, (node.x1 - node.x0) * (node.y1 - node.y0)]));
    assert.ok(Math.abs(counted['src/main.cpp'] / counted['src/new.cpp'] - 1) < 0.35);
}));

test('tiles have the colours of the labels of the chosen category, and the legend explains them',
    () => withPage(engine, {}, async (page) => {
        await chooseColour(page, 'Status');
        await drawn(page);
        const legend = await page.$$eval('#legend li', (items) => Object.fromEntries(items.map((item) =>
            [item.querySelector('.groupName').textContent, item.querySelector('rect').getAttribute('fill')])));
        assert.deepEqual(Object.keys(legend).sort(), ['No label', 'Open', 'Reviewed']);
        const colours = Object.fromEntries((await picture(page)).map((node) => [node.path, node.colour]));
        assert.equal(colours['src/io/pump.cpp'], legend.Open);
        assert.equal(colours['src/main.cpp'], legend.Reviewed);
        assert.equal(colours['tools/clean.py'], legend['No label']);
    }));

test('a file with several labels of the category shows each of their colours', () => withPage(engine, {}, async (page) => {
    await chooseColour(page, 'Owner');
    await drawn(page);
    await copyCanvas(page);
    const seen = await page.evaluate(() => {
        const {map} = shownPage;
        const tile = map.root.leaves().find((node) => map.tree.path(node.data.node) === 'src/io/pump.cpp');
        const at = (share) => [...window.copiedMap.getImageData(
            Math.round((tile.x0 + (tile.x1 - tile.x0) * share) * map.drawing.scale),
            Math.round((tile.y1 - 4) * map.drawing.scale), 1, 1).data].join();
        return [at(0.25), at(0.75)];
    });
    assert.notEqual(seen[0], seen[1]);
}));

test('with a comparison, tiles have the colours of the changes, and removed files have tiles too',
    () => withPage(compared, {}, async (page) => {
        await page.select('#mapMeasure', 'count');
        const all = await picture(page);
        const colours = Object.fromEntries(all.map((node) => [node.path, node.colour]));
        const expected = await page.evaluate(() => changeColours);
        assert.equal(colours['src/new.cpp'], expected.added);
        assert.equal(colours['src/main.cpp'], expected.labels);
        assert.equal(colours['docs/readme.md'], expected.content);
        assert.equal(colours['src/io/pump.cpp'], expected.unchanged);
        assert.ok(all.some((node) => node.isTile && node.path === 'docs/old.md'));
        await chooseColour(page, 'Status');
        await drawn(page);
        assert.ok(!(await picture(page)).some((node) => node.path === 'docs/old.md'));
    }));

test('a table has the share of each label in each folder', () => withPage(engine, {}, async (page) => {
    await chooseColour(page, 'Status');
    const rows = await page.$$eval('#sharesTable tr', (all) =>
        all.map((row) => [...row.cells].map((cell) => cell.textContent)));
    assert.deepEqual(rows, [
        ['Folder', 'Files', 'Reviewed', 'Open', 'No label'],
        ['Whole project', '6', '33.3%', '16.7%', '50%'],
        ['docs', '1', '–', '–', '100%'],
        ['src', '4', '50%', '25%', '25%'],
        ['tools', '1', '–', '–', '100%'],
    ]);
}));

test('a click zooms to a folder, and a step of the path zooms back', () => withPage(engine, {}, async (page) => {
    const place = await page.evaluate(() => {
        const {map} = shownPage;
        const tile = map.root.leaves().find((node) => map.tree.path(node.data.node) === 'src/io/pump.cpp');
        map.canvas.scrollIntoView();
        const box = map.canvas.getBoundingClientRect();
        return {x: box.left + (tile.x0 + tile.x1) / 2, y: box.top + (tile.y0 + tile.y1) / 2};
    });
    await page.mouse.click(place.x, place.y);
    assert.deepEqual(await crumbs(page), ['Whole project', 'src', 'io']);
    assert.deepEqual((await picture(page)).map((node) => node.path).sort(), ['src/io/pump.cpp', 'src/io/valve.cpp']);
    await page.evaluate(() => document.getElementById('map').scrollIntoView());
    await page.click('#mapPath button');
    assert.deepEqual(await crumbs(page), ['Whole project']);
}));

test('an outline leaves nothing behind, and another measure lays out every folder again', () =>
    withPage(engine, {}, async (page) => {
        const pixels = () => page.evaluate(() => {
            const {canvas} = shownPage.map;
            const copy = new OffscreenCanvas(canvas.width, canvas.height).getContext('2d');
            copy.drawImage(canvas, 0, 0);
            return [...copy.getImageData(0, 0, canvas.width, canvas.height).data].reduce((sum, value, i) =>
                (sum * 31 + value * (i % 7 + 1)) % 2147483647, 0);
        });
        const plain = await pixels();
        await page.evaluate(() => shownPage.map.select(shownPage.map.root.children[0]));
        assert.notEqual(await pixels(), plain);
        await page.evaluate(() => shownPage.map.select(null));
        assert.equal(await pixels(), plain);
        await page.evaluate(() => shownPage.map.zoomTo(shownPage.model.paths.indexOf('src') + 1));
        await page.select('#mapMeasure', 'count');
        await page.evaluate(() => shownPage.map.zoomTo(0));
        assert.notEqual(await pixels(), plain);
        await page.select('#mapMeasure', 'size');
        assert.equal(await pixels(), plain);
    }));

test('the pointer shows the path, the size and the labels of a file', () => withPage(engine, {}, async (page) => {
    await chooseColour(page, 'Status');
    const place = await page.evaluate(() => {
        const {map} = shownPage;
        const tile = map.root.leaves().find((node) => map.tree.path(node.data.node) === 'src/main.cpp');
        map.canvas.scrollIntoView();
        const box = map.canvas.getBoundingClientRect();
        return {x: box.left + (tile.x0 + tile.x1) / 2, y: box.top + (tile.y0 + tile.y1) / 2};
    });
    await page.mouse.move(place.x, place.y);
    const tip = (await textOf(page, '#mapTip')).replace(/[\u2068\u2069]/gu, '');
    assert.equal(tip, 'src/main.cpp · 450 B · Reviewed');
}));

test('the keyboard selects, zooms in and out, and says where it is', () => withPage(engine, {}, async (page) => {
    await page.focus('#mapCanvas');
    assert.match(await textOf(page, '#mapHere'), /^src\//u);
    const seen = new Set([await textOf(page, '#mapHere')]);
    for (const key of ['ArrowRight', 'ArrowDown', 'ArrowLeft', 'ArrowUp']) {
        await page.keyboard.press(key);
        seen.add(await textOf(page, '#mapHere'));
    }
    assert.ok(seen.size >= 2, [...seen].join('; '));
    await page.evaluate(() => shownPage.map.select(shownPage.map.root.children[0]));
    await page.keyboard.press('Enter');
    assert.deepEqual(await crumbs(page), ['Whole project', 'src']);
    await page.keyboard.press('Enter');
    await page.keyboard.press('Escape');
    await page.keyboard.press('Escape');
    assert.deepEqual(await crumbs(page), ['Whole project']);
    assert.match(await textOf(page, '#mapHere'), /^src\//u);
    await page.evaluate(() => shownPage.map.zoomTo(shownPage.model.paths.indexOf('src/io') + 1));
    await page.keyboard.press('Home');
    assert.deepEqual(await crumbs(page), ['Whole project']);
}));

test('with more labels than colours, each has a colour and pattern of its own', () => withPage(engine, {}, async (page) => {
    const looks = await page.evaluate(() => Array.from({length: 24}, (_, i) => JSON.stringify(colourOfGroup(i))));
    assert.equal(new Set(looks).size, 24);
}));
